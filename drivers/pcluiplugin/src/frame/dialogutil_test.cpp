// Help files, the help window beside the sheet, disabled pages and the
// isolated dialog wrappers, through real windows, the registry and the
// simulated spooler.
#include "frame/dialogutil.h"
#include "frame/module.h"
#include "resources/resource.h"
#include "simspooler.h"

#include "../../tests/fixtures/hhfixture.h"

#include <gtest/gtest.h>
#include <strsafe.h>
#include <string>
#include <vector>

namespace {

const char kServerKey[] = "CLSID\\{ADB880A6-D8FF-11CF-9377-00AA003B7A11}\\InprocServer32";

HANDLE PrinterWithFiles(const std::vector<std::wstring>& files)
{
    SimPrinter p;
    p.name = L"DialogUtil Printer";
    p.driver = L"Norvane PCL Test";
    p.dependentFiles = files;
    return SimAddPrinter(p);
}

std::wstring HelpFileOf(const std::vector<std::wstring>& files)
{
    WCHAR path[260] = {};
    FindDriverHelpFile(PrinterWithFiles(files), path);
    return path;
}

std::wstring ProgramDir()
{
    WCHAR path[MAX_PATH] = {};
    GetModuleFileNameW(nullptr, path, MAX_PATH);
    std::wstring dir(path);
    return dir.substr(0, dir.find_last_of(L'\\') + 1);
}

std::string AnsiPath(const std::wstring& path)
{
    char out[MAX_PATH] = {};
    WideCharToMultiByte(CP_ACP, 0, path.c_str(), -1, out, MAX_PATH, nullptr, nullptr);
    return out;
}

// Plain top-level and child windows that the tests own.
const WCHAR* TestWindowClass()
{
    static ATOM atom = 0;
    if (!atom) {
        WNDCLASSW wc = {};
        wc.lpfnWndProc = DefWindowProcW;
        wc.hInstance = GetModuleHandleW(nullptr);
        wc.lpszClassName = L"DialogUtilTestWindow";
        atom = RegisterClassW(&wc);
    }
    return L"DialogUtilTestWindow";
}

class Window {
public:
    Window(int x, int y, int cx, int cy, HWND parent = nullptr)
        : h_(CreateWindowExW(0, TestWindowClass(), L"", parent ? WS_CHILD : WS_OVERLAPPEDWINDOW,
                             x, y, cx, cy, parent, nullptr, GetModuleHandleW(nullptr), nullptr))
    {
    }
    ~Window() { if (h_) DestroyWindow(h_); }
    Window(const Window&) = delete;
    Window& operator=(const Window&) = delete;
    HWND get() const { return h_; }

private:
    HWND h_;
};

RECT NormalRect(HWND hwnd)
{
    WINDOWPLACEMENT wp = {sizeof(wp)};
    GetWindowPlacement(hwnd, &wp);
    return wp.rcNormalPosition;
}

RECT DesktopRect()
{
    RECT rc = {};
    GetWindowRect(GetDesktopWindow(), &rc);
    return rc;
}

// Points the HTML Help control's registration at another module and puts the
// original value back afterwards; the Wine prefix is shared by all tests.
class HtmlHelpServerOverride {
public:
    HtmlHelpServerOverride()
    {
        RegCreateKeyExA(HKEY_CLASSES_ROOT, kServerKey, 0, nullptr, 0, KEY_READ | KEY_WRITE,
                        nullptr, &key_, nullptr);
        DWORD cb = sizeof(saved_);
        had_ = key_ && RegQueryValueExA(key_, nullptr, nullptr, &type_, saved_, &cb) ==
                           ERROR_SUCCESS;
        cbSaved_ = cb;
    }
    ~HtmlHelpServerOverride()
    {
        if (!key_)
            return;
        if (had_)
            RegSetValueExA(key_, nullptr, 0, type_, saved_, cbSaved_);
        else
            RegDeleteValueA(key_, nullptr);
        RegCloseKey(key_);
    }
    HtmlHelpServerOverride(const HtmlHelpServerOverride&) = delete;
    HtmlHelpServerOverride& operator=(const HtmlHelpServerOverride&) = delete;
    bool set(const std::string& path)
    {
        return key_ && RegSetValueExA(key_, nullptr, 0, REG_SZ,
                                      reinterpret_cast<const BYTE*>(path.c_str()),
                                      DWORD(path.size() + 1)) == ERROR_SUCCESS;
    }

private:
    HKEY key_ = nullptr;
    bool had_ = false;
    DWORD type_ = 0;
    BYTE saved_[1024] = {};
    DWORD cbSaved_ = 0;
};

struct HtmlHelpFixture {
    HMODULE module = nullptr;
    PFN_HtmlHelpFixtureLastCall lastCall = nullptr;
    PFN_HtmlHelpFixtureSetResult setResult = nullptr;
};

HtmlHelpFixture LoadFixture(const wchar_t* name)
{
    HtmlHelpFixture f;
    f.module = LoadLibraryW((ProgramDir() + name).c_str());
    if (f.module) {
        f.lastCall = reinterpret_cast<PFN_HtmlHelpFixtureLastCall>(
            reinterpret_cast<void*>(GetProcAddress(f.module, "HtmlHelpFixtureLastCall")));
        f.setResult = reinterpret_cast<PFN_HtmlHelpFixtureSetResult>(
            reinterpret_cast<void*>(GetProcAddress(f.module, "HtmlHelpFixtureSetResult")));
    }
    return f;
}

std::wstring ChildResultFile()
{
    WCHAR dir[MAX_PATH] = {};
    GetTempPathW(MAX_PATH, dir);
    return std::wstring(dir) + L"dialogutil_htmlhelp_child.txt";
}

class ScopedModule {
public:
    explicit ScopedModule(HMODULE h) : h_(h) {}
    ~ScopedModule() { if (h_) FreeLibrary(h_); }
    ScopedModule(const ScopedModule&) = delete;
    ScopedModule& operator=(const ScopedModule&) = delete;
    HMODULE get() const { return h_; }

private:
    HMODULE h_;
};

// Makes another module the plug-in's module for one test, with a fresh
// activation context slot. The plug-in's own manifest names the 32-bit
// common controls, which a 64-bit test process cannot resolve, so the
// successful builds use a module whose manifest fits.
class AttachedModule {
public:
    explicit AttachedModule(HMODULE h) : saved_(ModuleInstance()), savedCtx_(*ModuleActivationContextSlot())
    {
        *ModuleActivationContextSlot() = INVALID_HANDLE_VALUE;
        ModuleAttach(h);
    }
    ~AttachedModule()
    {
        HANDLE* slot = ModuleActivationContextSlot();
        if (*slot != INVALID_HANDLE_VALUE)
            ReleaseActCtx(*slot);
        *slot = savedCtx_;
        ModuleAttach(saved_);
    }
    AttachedModule(const AttachedModule&) = delete;
    AttachedModule& operator=(const AttachedModule&) = delete;

private:
    HINSTANCE saved_;
    HANDLE savedCtx_;
};

// True when, inside ctx, comctl32.dll is redirected to a side-by-side copy.
bool ContextRedirectsCommonControls(HANDLE ctx)
{
    ULONG_PTR cookie = 0;
    if (!ActivateActCtx(ctx, &cookie))
        return false;
    ACTCTX_SECTION_KEYED_DATA data = {sizeof(data)};
    BOOL found = FindActCtxSectionStringW(0, nullptr, ACTIVATION_CONTEXT_SECTION_DLL_REDIRECTION,
                                          L"comctl32.dll", &data);
    DeactivateActCtx(0, cookie);
    return found != FALSE;
}

INT_PTR CALLBACK EndAtInit(HWND hwnd, UINT msg, WPARAM, LPARAM lParam)
{
    if (msg == WM_INITDIALOG) {
        EndDialog(hwnd, static_cast<INT_PTR>(lParam));
        return TRUE;
    }
    return FALSE;
}

}  // namespace

TEST(DialogUtilHelpFile, PicksTheFirstHelpFileOrLeavesTheLastFile)
{
    SimResetSpooler();
    EXPECT_EQ(HelpFileOf({L"X:\\DRV\\UNIDRV.DLL", L"X:\\DRV\\NVPCLUI.DLL", L"X:\\DRV\\HELP.CHM"}),
              L"x:\\drv\\help.chm");
    EXPECT_EQ(HelpFileOf({L"X:\\DRV\\UNIDRV.DLL", L"X:\\DRV\\NvPclUi.DLL"}), L"x:\\drv\\nvpclui.dll")
        << "no help file: the last one examined stays";
    EXPECT_EQ(HelpFileOf({L"X:\\DRV\\OLD.HLP", L"X:\\DRV\\NEW.CHM"}), L"x:\\drv\\old.hlp");
    EXPECT_EQ(HelpFileOf({L"X:\\DRV\\UNIDRV.HLP.DLL", L"X:\\DRV\\NEW.CHM"}), L"x:\\drv\\unidrv.hlp.dll")
        << "the extension is found anywhere in the name";

    WCHAR untouched[260] = {};
    FindDriverHelpFile(PrinterWithFiles({}), untouched);
    for (WCHAR c : untouched)
        ASSERT_EQ(c, 0) << "an empty list leaves the buffer alone";
    FindDriverHelpFile(nullptr, untouched);
    EXPECT_EQ(untouched[0], 0);
    SimResetSpooler();
}

TEST(DialogUtilHelpFile, LongNamesAreCutToTheBuffer)
{
    SimResetSpooler();
    const std::wstring longName = L"X:\\" + std::wstring(280, L'A') + L".CHM";
    WCHAR path[261];
    for (WCHAR& c : path)
        c = L'#';
    path[260] = L'!';
    FindDriverHelpFile(PrinterWithFiles({longName}), path);
    EXPECT_EQ(path[259], 0);
    EXPECT_EQ(path[260], L'!') << "nothing written past the 260 units";
    EXPECT_EQ(std::wstring(path), L"x:\\" + std::wstring(256, L'a'))
        << "cut to 259 units, so the extension is gone";

    // A cut name does not qualify; the next file is examined.
    EXPECT_EQ(HelpFileOf({longName, L"Y:\\H.HLP"}), L"y:\\h.hlp");
    SimResetSpooler();
}

TEST(DialogUtilPlacement, SheetEndsAtTheMiddleAndHelpStandsRightOfIt)
{
    const RECT d = DesktopRect();
    const LONG dw = d.right - d.left;
    ASSERT_GT(dw, 200);

    {
        const LONG w = dw / 4;
        Window sheet(30, 40, w, 300), help(5, 5, 100, 100);
        ASSERT_TRUE(sheet.get() && help.get());
        PlaceBesideHelp(sheet.get(), help.get());
        RECT s = NormalRect(sheet.get()), h = NormalRect(help.get());
        EXPECT_EQ(s.left, dw / 2 - w);
        EXPECT_EQ(s.right, dw / 2);
        EXPECT_EQ(s.top, 40);
        EXPECT_EQ(s.bottom, 340);
        EXPECT_EQ(h.left, dw / 2);
        EXPECT_EQ(h.right, dw / 2 + w) << "help window as wide as the sheet";
        EXPECT_EQ(h.top, 40);
        EXPECT_EQ(h.bottom, 340);
        EXPECT_TRUE(IsWindowVisible(sheet.get()));
        EXPECT_TRUE(IsWindowVisible(help.get()));
    }
    {
        const LONG w = dw * 3 / 4;
        Window sheet(50, 20, w, 200), help(5, 5, 100, 100);
        ASSERT_TRUE(sheet.get() && help.get());
        PlaceBesideHelp(sheet.get(), help.get());
        RECT s = NormalRect(sheet.get()), h = NormalRect(help.get());
        EXPECT_EQ(s.left, 0);
        EXPECT_EQ(s.right, w);
        EXPECT_EQ(h.left, w);
        EXPECT_EQ(h.right, d.right) << "clipped at the desktop's right edge";
        EXPECT_EQ(h.top, 20);
        EXPECT_EQ(h.bottom, 220);
    }
}

TEST(DialogUtilHtmlHelp, ChmIsShownThroughTheRegisteredControlBesideTheSheet)
{
    SimResetSpooler();
    HtmlHelpFixture fixture = LoadFixture(L"hhfixture.dll");
    ASSERT_TRUE(fixture.module && fixture.lastCall && fixture.setResult);
    WCHAR modulePath[MAX_PATH] = {};
    GetModuleFileNameW(fixture.module, modulePath, MAX_PATH);

    const RECT d = DesktopRect();
    const LONG w = (d.right - d.left) / 4;
    Window sheet(10, 30, w, 250), help(0, 0, 80, 80);
    Window page(5, 5, 50, 50, sheet.get());
    ASSERT_TRUE(sheet.get() && help.get() && page.get());
    fixture.setResult(help.get());

    HtmlHelpServerOverride server;
    ASSERT_TRUE(server.set(AnsiPath(modulePath)));

    // A list without help files shows nothing and does not load the control.
    ShowDriverHelp(page.get(), PrinterWithFiles({L"X:\\DRV\\UNIDRV.DLL"}));
    EXPECT_EQ(fixture.lastCall()->cCalls, 0);

    ShowDriverHelp(page.get(),
                   PrinterWithFiles({L"X:\\DRV\\UNIDRV.DLL", L"X:\\DRV\\NVPCLUI.DLL", L"X:\\DRV\\HELP.CHM"}));
    const HtmlHelpFixtureCall* call = fixture.lastCall();
    ASSERT_EQ(call->cCalls, 1);
    EXPECT_EQ(call->hwndCaller, page.get());
    EXPECT_STREQ(call->szFile, L"x:\\drv\\help.chm");
    EXPECT_EQ(call->uCommand, 2u) << "HH_DISPLAY_INDEX";
    EXPECT_EQ(call->dwData, 0u);

    RECT s = NormalRect(sheet.get()), h = NormalRect(help.get());
    EXPECT_EQ(s.left, (d.right - d.left) / 2 - w) << "the root window of the page was placed";
    EXPECT_EQ(h.left, s.right);
    EXPECT_EQ(h.right, s.right + w);
    EXPECT_EQ(h.top, 30);

    // The entry point stays loaded: another call reaches the same module.
    EXPECT_EQ(HtmlHelpW(nullptr, L"y.chm", 1, 7), help.get());
    EXPECT_EQ(call->cCalls, 2);
    EXPECT_EQ(call->uCommand, 1u);
    EXPECT_EQ(call->dwData, 7u);
    SimResetSpooler();
}

// A control without the HtmlHelpW export is a failure remembered for the rest
// of the process. The loader state is process-wide, so this runs in a fresh
// process of this program.
TEST(DialogUtilHtmlHelp, MissingEntryPointIsNotTriedAgain)
{
    const std::wstring resultFile = ChildResultFile();
    DeleteFileW(resultFile.c_str());
    WCHAR exe[MAX_PATH] = {};
    GetModuleFileNameW(nullptr, exe, MAX_PATH);
    std::wstring cmd = L"\"" + std::wstring(exe) +
                       L"\" --gtest_filter=DialogUtilHtmlHelpChild.DISABLED_MissingEntryPoint"
                       L" --gtest_also_run_disabled_tests";
    std::vector<WCHAR> cmdLine(cmd.begin(), cmd.end());
    cmdLine.push_back(0);
    STARTUPINFOW si = {sizeof(si)};
    PROCESS_INFORMATION pi = {};
    ASSERT_TRUE(CreateProcessW(exe, cmdLine.data(), nullptr, nullptr, FALSE, 0, nullptr, nullptr,
                               &si, &pi));
    WaitForSingleObject(pi.hProcess, INFINITE);
    DWORD code = 1;
    GetExitCodeProcess(pi.hProcess, &code);
    CloseHandle(pi.hThread);
    CloseHandle(pi.hProcess);
    EXPECT_EQ(code, 0u);

    char text[8] = {};
    DWORD got = 0;
    HANDLE f = CreateFileW(resultFile.c_str(), GENERIC_READ, 0, nullptr, OPEN_EXISTING, 0, nullptr);
    if (f != INVALID_HANDLE_VALUE) {
        ReadFile(f, text, sizeof(text) - 1, &got, nullptr);
        CloseHandle(f);
    }
    DeleteFileW(resultFile.c_str());
    EXPECT_STREQ(text, "ok") << "the child process did not run its checks to the end";
}

// Run only by the test above, in its own process.
TEST(DialogUtilHtmlHelpChild, DISABLED_MissingEntryPoint)
{
    HtmlHelpFixture noEntry = LoadFixture(L"hhnoentry.dll");
    ASSERT_TRUE(noEntry.module);
    WCHAR noEntryPath[MAX_PATH] = {}, fixturePath[MAX_PATH] = {};
    GetModuleFileNameW(noEntry.module, noEntryPath, MAX_PATH);
    std::wstring dir(noEntryPath);
    dir = dir.substr(0, dir.find_last_of(L'\\') + 1);
    StringCchCopyW(fixturePath, MAX_PATH, (dir + L"hhfixture.dll").c_str());
    ASSERT_NE(GetFileAttributesW(fixturePath), INVALID_FILE_ATTRIBUTES);

    {
        HtmlHelpServerOverride server;
        ASSERT_TRUE(server.set(AnsiPath(noEntryPath)));
        EXPECT_EQ(HtmlHelpW(nullptr, L"x.chm", 2, 0), nullptr);

        // Now a working control is registered, but the failure is remembered.
        ASSERT_TRUE(server.set(AnsiPath(fixturePath)));
        EXPECT_EQ(HtmlHelpW(nullptr, L"x.chm", 2, 0), nullptr);
        EXPECT_EQ(GetModuleHandleW(fixturePath), nullptr) << "no second load was attempted";
    }

    if (!HasFailure()) {
        HANDLE f = CreateFileW(ChildResultFile().c_str(), GENERIC_WRITE, 0, nullptr, CREATE_ALWAYS,
                               0, nullptr);
        DWORD put = 0;
        WriteFile(f, "ok", 2, &put, nullptr);
        CloseHandle(f);
    }
}

TEST(DialogUtilChildren, AllDescendantsAreDisabled)
{
    Window top(0, 0, 300, 300);
    Window a(0, 0, 100, 100, top.get()), c(100, 0, 100, 100, top.get());
    Window b(0, 0, 50, 50, a.get());
    Window b2(0, 0, 20, 20, b.get());
    ASSERT_TRUE(top.get() && a.get() && b.get() && b2.get() && c.get());

    DisableAllChildren(top.get());
    EXPECT_FALSE(IsWindowEnabled(a.get()));
    EXPECT_FALSE(IsWindowEnabled(b.get()));
    EXPECT_FALSE(IsWindowEnabled(b2.get()));
    EXPECT_FALSE(IsWindowEnabled(c.get()));
    EXPECT_TRUE(IsWindowEnabled(top.get())) << "the window itself stays enabled";

    // A null window must not reach the top-level windows.
    Window other(0, 0, 100, 100);
    DisableAllChildren(nullptr);
    EXPECT_TRUE(IsWindowEnabled(other.get()));
    EXPECT_TRUE(IsWindowEnabled(top.get()));
}

TEST(DialogUtilActivation, ContextFromTheModuleManifestIsBuiltOnce)
{
    ScopedModule fixture(LoadLibraryW((ProgramDir() + L"manifestfixture.dll").c_str()));
    ASSERT_TRUE(fixture.get());
    AttachedModule attached(fixture.get());

    HANDLE first = ModuleActivationContext();
    ASSERT_NE(first, INVALID_HANDLE_VALUE);
    ASSERT_NE(first, nullptr);
    EXPECT_EQ(ModuleActivationContext(), first);
    EXPECT_EQ(*ModuleActivationContextSlot(), first) << "kept for release at detach";
    EXPECT_TRUE(ContextRedirectsCommonControls(first));
}

TEST(DialogUtilActivation, ContextThatCannotBeBuiltIsTriedAgain)
{
    ScopedModule noManifest(LoadLibraryW((ProgramDir() + L"hhnoentry.dll").c_str()));
    ScopedModule fixture(LoadLibraryW((ProgramDir() + L"manifestfixture.dll").c_str()));
    ASSERT_TRUE(noManifest.get() && fixture.get());
    AttachedModule attached(noManifest.get());
    EXPECT_EQ(ModuleActivationContext(), INVALID_HANDLE_VALUE);
    EXPECT_EQ(*ModuleActivationContextSlot(), INVALID_HANDLE_VALUE);

    ModuleAttach(fixture.get());
    HANDLE later = ModuleActivationContext();
    EXPECT_NE(later, INVALID_HANDLE_VALUE) << "a failure is not remembered";
    EXPECT_EQ(*ModuleActivationContextSlot(), later);
}

TEST(DialogUtilActivation, ModuleNameLongerThanAPathIsRead)
{
    WCHAR temp[MAX_PATH] = {};
    GetTempPathW(MAX_PATH, temp);
    std::wstring dir = std::wstring(L"\\\\?\\") + temp + L"dialogutil-long";
    std::vector<std::wstring> made;
    const std::wstring segment(60, L'd');
    bool ok = CreateDirectoryW(dir.c_str(), nullptr) || GetLastError() == ERROR_ALREADY_EXISTS;
    made.push_back(dir);
    for (int i = 0; ok && i < 6; ++i) {
        dir += L"\\" + segment;
        ok = CreateDirectoryW(dir.c_str(), nullptr) || GetLastError() == ERROR_ALREADY_EXISTS;
        made.push_back(dir);
    }
    const std::wstring copy = dir + L"\\manifestfixture.dll";
    ok = ok && CopyFileW((ProgramDir() + L"manifestfixture.dll").c_str(), copy.c_str(), FALSE);
    EXPECT_TRUE(ok);
    {
        ScopedModule fixture(ok ? LoadLibraryW(copy.c_str()) : nullptr);
        if (fixture.get()) {
            WCHAR name[1024] = {};
            ASSERT_GT(GetModuleFileNameW(fixture.get(), name, 1024), 260u);
            AttachedModule attached(fixture.get());
            HANDLE ctx = ModuleActivationContext();
            EXPECT_NE(ctx, INVALID_HANDLE_VALUE);
            EXPECT_TRUE(ContextRedirectsCommonControls(ctx));
        } else {
            ADD_FAILURE() << "the copy in the long directory does not load";
        }
    }
    DeleteFileW(copy.c_str());
    for (auto it = made.rbegin(); it != made.rend(); ++it)
        RemoveDirectoryW(it->c_str());
}

TEST(DialogUtilDialog, RunsTheTemplateAndReturnsItsEndValue)
{
    IsolatedInitCommonControls();
    EXPECT_EQ(IsolatedDialogBoxParam(ModuleInstance(), MAKEINTRESOURCEW(IDD_135), nullptr,
                                     EndAtInit, 4242),
              4242);
}

TEST(DialogUtilDialog, MissingTemplateGivesMinusOneWithThePlatformError)
{
    SetLastError(0);
    INT_PTR direct = DialogBoxParamW(ModuleInstance(), MAKEINTRESOURCEW(9999), nullptr, EndAtInit, 1);
    DWORD expected = GetLastError();
    ASSERT_EQ(direct, -1);
    ASSERT_NE(expected, 0u);

    SetLastError(0);
    EXPECT_EQ(IsolatedDialogBoxParam(ModuleInstance(), MAKEINTRESOURCEW(9999), nullptr, EndAtInit, 1),
              -1);
    EXPECT_EQ(GetLastError(), expected);
}

