#include "pages/pnhpage.h"

#include "frame/pagenotify.h"
#include "frame/dialogutil.h"
#include "frame/module.h"
#include "resources/resource.h"
#include "watermark/wmrecord.h"

#include <lmcons.h>
#include <strsafe.h>

#include <cstring>
#include <cwchar>

namespace {

// List texts in list order: the list index is the output type.
const UINT kOutputTexts[] = {IDS_STR_64, IDS_STR_60, IDS_STR_61, IDS_STR_62, IDS_STR_63};
const DWORD kOutputTypeCount = ARRAYSIZE(kOutputTexts);
const DWORD kOutputPrinter = 0;
const DWORD kOutputConfidential = 1;

constexpr int kUserCch = sizeof(PNHDATA::szUserName) / sizeof(WCHAR);  // 24 characters and the terminator
constexpr int kPinCch = sizeof(PNHDATA::szPIN) / sizeof(WCHAR);        // 4 characters and the terminator
const WCHAR kPinDigits[] = L"1234567890";

// What the page keeps between messages, one per page window (DWLP_USER),
// so that two open sheets never share a block.
struct PnHPageState {
    PNHDATA block;  // loaded on activation, written back on deactivation
    BOOL bLoading;  // the page itself is filling the controls
};

struct EnableFlags {
    BOOL pin;
    BOOL user;
    BOOL keep;
};

// The controls that make sense for an output type.
EnableFlags EnableRule(DWORD outputType)
{
    switch (outputType) {
    case kOutputPrinter:
        return {FALSE, FALSE, FALSE};
    case kOutputConfidential:
        return {TRUE, TRUE, TRUE};
    case 2:
    case 3:
    case 4:
        return {FALSE, TRUE, TRUE};
    default:  // nothing selected
        return {FALSE, FALSE, TRUE};
    }
}

PnHPageState* StateOf(HWND hwnd) { return reinterpret_cast<PnHPageState*>(GetWindowLongPtrW(hwnd, DWLP_USER)); }

// A string field copied up to its terminator but never past cch units of
// either field (blocks from devmodes and profiles need not be terminated);
// the units behind the terminator keep what dst held.
void CopyBoundedString(WCHAR* dst, const WCHAR* src, size_t cch)
{
    size_t n = BoundedLength(src, cch);
    if (n >= cch)
        n = cch - 1;
    std::memmove(dst, src, n * sizeof(WCHAR));
    dst[n] = 0;
}

// The copy rule of every block this page writes: offset 68 always repeats
// the keep-previous flag.
void CopyBlock(PNHDATA* dst, const PNHDATA* src)
{
    dst->dwOutputType = src->dwOutputType;
    CopyBoundedString(dst->szUserName, src->szUserName, kUserCch);
    CopyBoundedString(dst->szPIN, src->szPIN, kPinCch);
    dst->dwKeepPrevious = src->dwKeepPrevious;
    dst->dwKeepPrevious2 = src->dwKeepPrevious;
}

DWORD SelectedOutputType(HWND hwnd)
{
    // LB_ERR (no selection) becomes the list's no-selection value 0xFFFFFFFF.
    return static_cast<DWORD>(SendDlgItemMessageW(hwnd, IDC_PNH_OUTPUT, LB_GETCURSEL, 0, 0));
}

void MarkChanged(HWND hwnd) { PropSheet_Changed(GetParent(hwnd), hwnd); }

void Enable(HWND hwnd, int id, BOOL on) { EnableWindow(GetDlgItem(hwnd, id), on); }

void ShowEnableRule(HWND hwnd, const PAGECONTEXT* ctx, DWORD outputType)
{
    if (ctx->bNoPermission) {
        // Nothing may be changed, whatever the output type would allow.
        DisableAllChildren(hwnd);
        return;
    }
    const EnableFlags f = EnableRule(outputType);
    Enable(hwnd, IDC_PNH_PIN, f.pin);
    Enable(hwnd, IDC_PNH_PIN_LABEL, f.pin);
    Enable(hwnd, IDC_PNH_USER, f.user);
    Enable(hwnd, IDC_PNH_USER_LABEL, f.user);
    if (ctx->bKeepPrevious)
        Enable(hwnd, IDC_PNH_KEEP, f.keep);
}

// The logged-in user's name, cut to what the field can hold so that the page
// stores what it shows.
void LoggedInUserName(WCHAR name[kUserCch])
{
    WCHAR full[UNLEN + 1] = {};
    DWORD cch = ARRAYSIZE(full);
    name[0] = 0;
    if (GetUserNameW(full, &cch))
        StringCchCopyNW(name, kUserCch, full, kUserCch - 1);
}

void FillOutputList(HWND list)
{
    SendMessageW(list, LB_RESETCONTENT, 0, 0);
    for (DWORD type = 0; type < kOutputTypeCount; ++type) {
        WCHAR text[64];
        if (LoadStringW(ModuleInstance(), kOutputTexts[type], text, ARRAYSIZE(text)) <= 0)
            text[0] = 0;
        const LRESULT i = SendMessageW(list, LB_ADDSTRING, 0, reinterpret_cast<LPARAM>(text));
        if (i >= 0)
            SendMessageW(list, LB_SETITEMDATA, i, type);
    }
}

// Shows the page block: steps shared by initialisation and activation.
void ShowBlock(HWND hwnd, const PAGECONTEXT* ctx, const PNHDATA& block)
{
    if (ctx->bKeepPrevious)
        CheckDlgButton(hwnd, IDC_PNH_KEEP, block.dwKeepPrevious ? BST_CHECKED : BST_UNCHECKED);
    else
        ShowWindow(GetDlgItem(hwnd, IDC_PNH_KEEP), SW_HIDE);

    const WPARAM sel = block.dwOutputType < kOutputTypeCount ? block.dwOutputType : static_cast<WPARAM>(-1);
    SendDlgItemMessageW(hwnd, IDC_PNH_OUTPUT, LB_SETCURSEL, sel, 0);

    WCHAR user[kUserCch];
    CopyBoundedString(user, block.szUserName, kUserCch);
    if (!user[0])
        LoggedInUserName(user);
    SetDlgItemTextW(hwnd, IDC_PNH_USER, user);

    WCHAR pin[kPinCch];
    CopyBoundedString(pin, block.szPIN, kPinCch);
    SetDlgItemTextW(hwnd, IDC_PNH_PIN, pin);
}

// Loads the working block into the page block and the controls.
void LoadPage(HWND hwnd, const PAGECONTEXT* ctx, PnHPageState* state)
{
    PNHDATA scratch = {};
    PNHDATA* block = state ? &state->block : &scratch;
    CopyBlock(block, &ctx->ws.PnHData);
    if (state)
        state->bLoading = TRUE;
    ShowBlock(hwnd, ctx, *block);
    if (state)
        state->bLoading = FALSE;
    ShowEnableRule(hwnd, ctx, block->dwOutputType);
}

// The page block as the controls give it. Without a state of its own the
// page keeps the working block's user name.
void BuildBlock(HWND hwnd, const PAGECONTEXT* ctx, PNHDATA* block)
{
    const DWORD type = SelectedOutputType(hwnd);
    const EnableFlags f = EnableRule(type);
    block->dwOutputType = type;
    if (f.user) {
        WCHAR user[kUserCch] = {};
        GetDlgItemTextW(hwnd, IDC_PNH_USER, user, kUserCch);
        CopyBoundedString(block->szUserName, user, kUserCch);
    }
    if (f.pin) {
        WCHAR pin[kPinCch] = {};
        GetDlgItemTextW(hwnd, IDC_PNH_PIN, pin, kPinCch);
        CopyBoundedString(block->szPIN, pin, kPinCch);
    } else {
        block->szPIN[0] = 0;
    }
    block->dwKeepPrevious =
        ctx->bKeepPrevious && f.keep && IsDlgButtonChecked(hwnd, IDC_PNH_KEEP) == BST_CHECKED ? 1 : 0;
    block->dwKeepPrevious2 = block->dwKeepPrevious;
}

PNHDATA* PageBlock(HWND hwnd, const PAGECONTEXT* ctx, PNHDATA* scratch)
{
    if (PnHPageState* state = StateOf(hwnd))
        return &state->block;
    std::memset(scratch, 0, sizeof(*scratch));
    CopyBlock(scratch, &ctx->ws.PnHData);
    return scratch;
}

// An error box with caption 12; nothing is shown when a text is missing.
void ReportError(HWND hwnd, UINT idText)
{
    WCHAR text[256];
    WCHAR caption[64];
    if (LoadStringW(ModuleInstance(), idText, text, ARRAYSIZE(text)) <= 0 ||
        LoadStringW(ModuleInstance(), IDS_CAPTION_ERROR, caption, ARRAYSIZE(caption)) <= 0)
        return;
    MessageBoxW(hwnd, text, caption, MB_OK | MB_ICONERROR);
}

BOOL Refuse(HWND hwnd, UINT idText, int idField)
{
    ReportError(hwnd, idText);
    SetFocus(GetDlgItem(hwnd, idField));
    SetWindowLongPtrW(hwnd, DWLP_MSGRESULT, TRUE);
    return TRUE;
}

BOOL OnlySpaces(const WCHAR* s)
{
    for (; *s; ++s)
        if (*s != L' ')
            return FALSE;
    return TRUE;
}

// 0 when the enabled fields are acceptable, else the string that says why not.
UINT ValidateFields(HWND hwnd, int* idField)
{
    const EnableFlags f = EnableRule(SelectedOutputType(hwnd));
    if (f.user) {
        WCHAR user[kUserCch] = {};
        GetDlgItemTextW(hwnd, IDC_PNH_USER, user, kUserCch);
        *idField = IDC_PNH_USER;
        if (std::wcschr(user, L'"'))
            return IDS_STR_165;
        if (OnlySpaces(user))
            return IDS_STR_80;
    }
    if (f.pin) {
        WCHAR pin[kPinCch] = {};
        GetDlgItemTextW(hwnd, IDC_PNH_PIN, pin, kPinCch);
        *idField = IDC_PNH_PIN;
        if (lstrlenW(pin) < kPinCch - 1)
            return IDS_STR_79;
        if (std::wcsspn(pin, kPinDigits) != static_cast<size_t>(lstrlenW(pin)))
            return IDS_STR_66;
    }
    return 0;
}

// ---- message handlers -------------------------------------------------------

BOOL OnInitDialog(HWND hwnd, PAGECONTEXT* ctx)
{
    SetWindowLongPtrW(hwnd, GWLP_USERDATA, reinterpret_cast<LONG_PTR>(ctx));
    IsolatedInitCommonControls();
    if (!ctx)
        return TRUE;
    // Without a state of its own the page still works, on the working block.
    auto* state = static_cast<PnHPageState*>(HeapAlloc(GetProcessHeap(), HEAP_ZERO_MEMORY, sizeof(PnHPageState)));
    SetWindowLongPtrW(hwnd, DWLP_USER, reinterpret_cast<LONG_PTR>(state));

    SendDlgItemMessageW(hwnd, IDC_PNH_PIN, EM_LIMITTEXT, kPinCch - 1, 0);
    SendDlgItemMessageW(hwnd, IDC_PNH_USER, EM_LIMITTEXT, kUserCch - 1, 0);
    if (HWND list = GetDlgItem(hwnd, IDC_PNH_OUTPUT)) {
        FillOutputList(list);
        LoadPage(hwnd, ctx, state);
    } else if (ctx->bNoPermission) {
        DisableAllChildren(hwnd);
    }
    return TRUE;
}

void OnDestroy(HWND hwnd)
{
    if (PnHPageState* state = StateOf(hwnd)) {
        SetWindowLongPtrW(hwnd, DWLP_USER, 0);
        HeapFree(GetProcessHeap(), 0, state);
    }
}

void OnCommand(HWND hwnd, PAGECONTEXT* ctx, int id, int code, HWND control)
{
    const PnHPageState* state = StateOf(hwnd);
    if (!control || (state && state->bLoading))
        return;  // not from a control, or the page is filling its controls
    if (id == IDC_PNH_OUTPUT && code == LBN_SELCHANGE) {
        ShowEnableRule(hwnd, ctx, SelectedOutputType(hwnd));
        MarkChanged(hwnd);
    } else if ((id == IDC_PNH_USER || id == IDC_PNH_PIN) && code == EN_CHANGE) {
        MarkChanged(hwnd);
    } else if (code == BN_CLICKED) {
        MarkChanged(hwnd);
    }
}

BOOL OnSetActive(HWND hwnd, PAGECONTEXT* ctx)
{
    HWND sheet = GetParent(hwnd);
    const LONG_PTR ex = GetWindowLongPtrW(sheet, GWL_EXSTYLE);
    if (ex & WS_EX_CONTEXTHELP) {
        SetWindowLongPtrW(sheet, GWL_EXSTYLE, ex & ~WS_EX_CONTEXTHELP);
        SendMessageW(sheet, WM_NCPAINT, 1, 0);
    }
    LoadPage(hwnd, ctx, StateOf(hwnd));
    SetWindowLongPtrW(hwnd, DWLP_MSGRESULT, 0);
    return TRUE;
}

BOOL OnKillActive(HWND hwnd, PAGECONTEXT* ctx)
{
    SetWindowLongPtrW(hwnd, DWLP_MSGRESULT, FALSE);
    if (ctx->bNoPermission)
        return TRUE;  // nothing could be changed, so nothing is stored
    int idField = 0;
    if (UINT idText = ValidateFields(hwnd, &idField))
        return Refuse(hwnd, idText, idField);
    PNHDATA scratch;
    PNHDATA* block = PageBlock(hwnd, ctx, &scratch);
    BuildBlock(hwnd, ctx, block);
    CopyBlock(&ctx->ws.PnHData, block);
    return TRUE;
}

BOOL OnApply(HWND hwnd, PAGECONTEXT* ctx)
{
    SetWindowLongPtrW(hwnd, DWLP_MSGRESULT, PSNRET_NOERROR);
    if (ctx->bNoPermission)
        return TRUE;
    PNHDATA scratch;
    PNHDATA* block = PageBlock(hwnd, ctx, &scratch);
    BuildBlock(hwnd, ctx, block);
    if (ctx->pOemDevmode)
        CopyBlock(&ctx->pOemDevmode->PnHData, block);
    ctx->bApplied = 1;
    return TRUE;
}

BOOL OnNotify(HWND hwnd, PAGECONTEXT* ctx, const NMHDR* nm)
{
    static const PageHandlers handlers = {OnSetActive, OnKillActive, OnApply};
    return DispatchPageNotify(hwnd, ctx, nm, handlers);
}

}  // namespace

INT_PTR CALLBACK PrintAndHoldPageProc(HWND hwnd, UINT msg, WPARAM wParam, LPARAM lParam)
{
    if (msg == WM_INITDIALOG) {
        return OnInitDialog(hwnd, PageContextFromInit(lParam));
    }
    if (msg == WM_NCDESTROY) {
        OnDestroy(hwnd);
        return FALSE;
    }
    PAGECONTEXT* ctx = PageContextOf(hwnd);
    if (!ctx)
        return FALSE;
    switch (msg) {
    case WM_COMMAND:
        OnCommand(hwnd, ctx, LOWORD(wParam), HIWORD(wParam), reinterpret_cast<HWND>(lParam));
        return FALSE;
    case WM_NOTIFY:
        return OnNotify(hwnd, ctx, reinterpret_cast<const NMHDR*>(lParam));
    default:
        return FALSE;
    }
}
