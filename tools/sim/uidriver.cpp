#include "uidriver.h"

#include "iathook.h"

#include <commctrl.h>
#include <deque>

namespace {

std::vector<RecordedMessageBox> g_boxes;
std::deque<int> g_answers;
std::deque<DialogScript> g_scripts;
HHOOK g_hook = nullptr;
HWND g_runner = nullptr;
constexpr UINT kRunScript = WM_APP + 17;

int WINAPI RecordMessageBox(HWND owner, LPCWSTR text, LPCWSTR caption, UINT type)
{
    g_boxes.push_back({text ? text : L"", caption ? caption : L"", type, owner});
    if (!g_answers.empty()) {
        const int a = g_answers.front();
        g_answers.pop_front();
        return a;
    }
    return (type & 0xF) == MB_YESNO ? IDYES : IDOK;
}

LRESULT CALLBACK RunnerProc(HWND hwnd, UINT msg, WPARAM wParam, LPARAM lParam)
{
    if (msg == kRunScript && !g_scripts.empty()) {
        DialogScript script = std::move(g_scripts.front());
        g_scripts.pop_front();
        script(reinterpret_cast<HWND>(lParam));
        return 0;
    }
    return DefWindowProcW(hwnd, msg, wParam, lParam);
}

bool IsModalDialog(HWND hwnd)
{
    WCHAR cls[16] = {};
    GetClassNameW(hwnd, cls, 16);
    return lstrcmpW(cls, L"#32770") == 0 && !(GetWindowLongW(hwnd, GWL_STYLE) & WS_CHILD) &&
           !FindWindowExW(hwnd, nullptr, WC_TABCONTROLW, nullptr);
}

LRESULT CALLBACK WatchInit(int code, WPARAM wParam, LPARAM lParam)
{
    if (code == HC_ACTION) {
        const auto* m = reinterpret_cast<const CWPRETSTRUCT*>(lParam);
        if (m->message == WM_INITDIALOG && !g_scripts.empty() && IsModalDialog(m->hwnd))
            PostMessageW(g_runner, kRunScript, 0, reinterpret_cast<LPARAM>(m->hwnd));
    }
    return CallNextHookEx(g_hook, code, wParam, lParam);
}

void EnsureWatcher()
{
    if (!g_runner) {
        WNDCLASSW wc = {};
        wc.lpfnWndProc = RunnerProc;
        wc.hInstance = GetModuleHandleW(nullptr);
        wc.lpszClassName = L"NorvaneUiDriverRunner";
        RegisterClassW(&wc);
        g_runner = CreateWindowW(wc.lpszClassName, L"", 0, 0, 0, 0, 0, HWND_MESSAGE, nullptr, wc.hInstance, nullptr);
    }
    if (!g_hook)
        g_hook = SetWindowsHookExW(WH_CALLWNDPROCRET, WatchInit, nullptr, GetCurrentThreadId());
}

}  // namespace

void InstallMessageBoxRecorder(HMODULE mod)
{
    PatchImport(mod, "user32.dll", "MessageBoxW", reinterpret_cast<void*>(RecordMessageBox));
}

std::vector<RecordedMessageBox>& TheMessageBoxes() { return g_boxes; }
void QueueMessageBoxAnswer(int answer) { g_answers.push_back(answer); }

void QueueDialog(DialogScript script)
{
    EnsureWatcher();
    g_scripts.push_back(std::move(script));
}

size_t PendingDialogScripts() { return g_scripts.size(); }
void ClearDialogScripts() { g_scripts.clear(); }

std::wstring WindowText(HWND hwnd)
{
    const int n = GetWindowTextLengthW(hwnd);
    std::wstring s(static_cast<size_t>(n) + 1, L'\0');
    GetWindowTextW(hwnd, &s[0], n + 1);
    s.resize(static_cast<size_t>(lstrlenW(s.c_str())));
    return s;
}

std::wstring ItemText(HWND dialog, int id) { return WindowText(GetDlgItem(dialog, id)); }

void Click(HWND dialog, int id)
{
    // Wine's BM_CLICK also presses a disabled button; a user's click does not.
    HWND button = GetDlgItem(dialog, id);
    if (IsWindowEnabled(button))
        SendMessageW(button, BM_CLICK, 0, 0);
}

static HWND EditOf(HWND dialog, int id)
{
    HWND ctl = GetDlgItem(dialog, id);
    WCHAR cls[16] = {};
    GetClassNameW(ctl, cls, 16);
    if (lstrcmpiW(cls, L"ComboBox") == 0) {
        COMBOBOXINFO ci = {sizeof(ci)};
        if (GetComboBoxInfo(ctl, &ci) && ci.hwndItem)
            return ci.hwndItem;
    }
    return ctl;
}

void TypeInto(HWND dialog, int id, const std::wstring& text)
{
    HWND edit = EditOf(dialog, id);
    // The first key replaces the selected old text, as when a user types over it.
    SendMessageW(edit, EM_SETSEL, 0, -1);
    if (text.empty())
        SendMessageW(edit, WM_CHAR, VK_BACK, 0);
    for (wchar_t c : text)
        SendMessageW(edit, WM_CHAR, c, 0);
}

void TypeAtEnd(HWND dialog, int id, const std::wstring& keys)
{
    HWND edit = EditOf(dialog, id);
    for (wchar_t c : keys) {
        const LRESULT end = GetWindowTextLengthW(edit);
        SendMessageW(edit, EM_SETSEL, end, end);
        SendMessageW(edit, WM_CHAR, c, 0);
    }
}

void TypeAtStart(HWND dialog, int id, const std::wstring& keys)
{
    HWND edit = EditOf(dialog, id);
    for (wchar_t c : keys) {
        SendMessageW(edit, EM_SETSEL, 0, 0);
        SendMessageW(edit, WM_CHAR, c, 0);
    }
}

void SetFieldText(HWND dialog, int id, const std::wstring& text) { SetWindowTextW(EditOf(dialog, id), text.c_str()); }

void PressKey(HWND target, UINT vk)
{
    SendMessageW(target, WM_KEYDOWN, vk, 1);
    SendMessageW(target, WM_KEYUP, vk, 0xC0000001);
}

void SelectListItem(HWND dialog, int id, int index)
{
    HWND ctl = GetDlgItem(dialog, id);
    WCHAR cls[16] = {};
    GetClassNameW(ctl, cls, 16);
    const bool combo = lstrcmpiW(cls, L"ComboBox") == 0;
    SendMessageW(ctl, combo ? CB_SETCURSEL : LB_SETCURSEL, index, 0);
    SendMessageW(dialog, WM_COMMAND, MAKEWPARAM(id, combo ? CBN_SELCHANGE : LBN_SELCHANGE),
                 reinterpret_cast<LPARAM>(ctl));
}

void ToggleMultiSelect(HWND dialog, int id, int index)
{
    HWND ctl = GetDlgItem(dialog, id);
    const BOOL selected = SendMessageW(ctl, LB_GETSEL, index, 0) > 0;
    SendMessageW(ctl, LB_SETSEL, !selected, index);
    SendMessageW(dialog, WM_COMMAND, MAKEWPARAM(id, LBN_SELCHANGE), reinterpret_cast<LPARAM>(ctl));
}

std::vector<std::wstring> ListItems(HWND dialog, int id)
{
    HWND ctl = GetDlgItem(dialog, id);
    WCHAR cls[16] = {};
    GetClassNameW(ctl, cls, 16);
    const bool combo = lstrcmpiW(cls, L"ComboBox") == 0;
    std::vector<std::wstring> items;
    const LRESULT n = SendMessageW(ctl, combo ? CB_GETCOUNT : LB_GETCOUNT, 0, 0);
    for (LRESULT i = 0; i < n; ++i) {
        const LRESULT len = SendMessageW(ctl, combo ? CB_GETLBTEXTLEN : LB_GETTEXTLEN, i, 0);
        std::wstring s(static_cast<size_t>(len > 0 ? len : 0) + 1, L'\0');
        SendMessageW(ctl, combo ? CB_GETLBTEXT : LB_GETTEXT, i, reinterpret_cast<LPARAM>(&s[0]));
        s.resize(static_cast<size_t>(lstrlenW(s.c_str())));
        items.push_back(s);
    }
    return items;
}

int ListSelection(HWND dialog, int id)
{
    HWND ctl = GetDlgItem(dialog, id);
    WCHAR cls[16] = {};
    GetClassNameW(ctl, cls, 16);
    return static_cast<int>(SendMessageW(ctl, lstrcmpiW(cls, L"ComboBox") == 0 ? CB_GETCURSEL : LB_GETCURSEL, 0, 0));
}

bool IsEnabled(HWND dialog, int id) { return IsWindowEnabled(GetDlgItem(dialog, id)) != FALSE; }
bool IsChecked(HWND dialog, int id) { return IsDlgButtonChecked(dialog, id) == BST_CHECKED; }

void PumpMessages()
{
    MSG msg;
    while (PeekMessageW(&msg, nullptr, 0, 0, PM_REMOVE)) {
        TranslateMessage(&msg);
        DispatchMessageW(&msg);
    }
}
