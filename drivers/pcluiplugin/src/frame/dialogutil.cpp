#include "frame/dialogutil.h"

#include "frame/module.h"
#include "frame/scoped.h"

#include <strsafe.h>
#include <wchar.h>

namespace {

const size_t kPathUnits = 260;
const WORD kManifestResourceId = 2;
const WORD kNoStaticImportManifestResourceId = 3;
const UINT kHtmlHelpDisplayIndex = 2;  // HH_DISPLAY_INDEX
const WORD kHtmlHelpOrdinal = 15;      // HtmlHelpW in the HTML Help control
const char kHtmlHelpServerKey[] =
    "CLSID\\{ADB880A6-D8FF-11CF-9377-00AA003B7A11}\\InprocServer32";
const DWORD kHtmlHelpPathBytes = 260;

// ---- activation-context functions -----------------------------------------

// Resolved once from kernel32 so that a system without them still runs the
// wrapped functions, only without isolation.
struct ActCtxApi {
    HANDLE(WINAPI* create)(PCACTCTXW);
    BOOL(WINAPI* activate)(HANDLE, ULONG_PTR*);
    BOOL(WINAPI* deactivate)(DWORD, ULONG_PTR);
    BOOL(WINAPI* query)(DWORD, HANDLE, PVOID, ULONG, PVOID, SIZE_T, SIZE_T*);
};

template <class T> void Resolve(HMODULE hKernel, const char* name, T& fn)
{
    fn = reinterpret_cast<T>(reinterpret_cast<void*>(GetProcAddress(hKernel, name)));
}

const ActCtxApi& ActCtxFunctions()
{
    static ActCtxApi api;
    static volatile LONG resolved = 0;
    if (!InterlockedCompareExchange(&resolved, 0, 0)) {
        HMODULE hKernel = GetModuleHandleW(L"kernel32.dll");
        ActCtxApi found = {};
        if (hKernel) {
            Resolve(hKernel, "CreateActCtxW", found.create);
            Resolve(hKernel, "ActivateActCtx", found.activate);
            Resolve(hKernel, "DeactivateActCtx", found.deactivate);
            Resolve(hKernel, "QueryActCtxW", found.query);
        }
        api = found;
        InterlockedExchange(&resolved, 1);
    }
    return api;
}

// The module's file name in a buffer that grows until the name fits.
BOOL ReadModuleFileName(HMODULE hModule, HeapBuffer& buf)
{
    DWORD cch = kPathUnits;
    for (int attempt = 0; attempt < 10; ++attempt, cch *= 2) {
        if (!buf.alloc(cch * sizeof(WCHAR)))
            return FALSE;
        DWORD got = GetModuleFileNameW(hModule, buf.get<WCHAR>(), cch);
        if (got == 0)
            break;
        if (got < cch)
            return TRUE;
    }
    buf.reset();
    return FALSE;
}

HANDLE CreateModuleContext(WORD resourceId)
{
    const ActCtxApi& api = ActCtxFunctions();
    HeapBuffer name;
    if (!api.create || !ReadModuleFileName(ModuleInstance(), name))
        return INVALID_HANDLE_VALUE;
    ACTCTXW ctx = {};
    ctx.cbSize = sizeof(ctx);
    ctx.dwFlags = ACTCTX_FLAG_RESOURCE_NAME_VALID;
    ctx.lpSource = name.get<WCHAR>();
    ctx.lpResourceName = MAKEINTRESOURCEW(resourceId);
    return api.create(&ctx);
}

// ---- isolation context of the wrappers -------------------------------------

enum : LONG { ISOLATION_UNKNOWN = 0, ISOLATION_CONTEXT = 1, ISOLATION_DIRECT = 2 };
volatile LONG g_isolationState = ISOLATION_UNKNOWN;
// Null means the process default. A context created from resource 3 lives
// as long as the process, as the loader's own would.
HANDLE g_hIsolationContext = nullptr;

// The context the loader associated with the module when it loaded it; the
// loader keeps it as long as the module, so no reference is taken.
HANDLE LoaderContextOfModule()
{
    const ActCtxApi& api = ActCtxFunctions();
    if (!api.query)
        return nullptr;
    ACTIVATION_CONTEXT_BASIC_INFORMATION info = {};
    if (!api.query(QUERY_ACTCTX_FLAG_ACTCTX_IS_HMODULE | QUERY_ACTCTX_FLAG_NO_ADDREF, nullptr,
                   ModuleInstance(), ActivationContextBasicInformation, &info, sizeof(info),
                   nullptr))
        return nullptr;
    return info.hActCtx == INVALID_HANDLE_VALUE ? nullptr : info.hActCtx;
}

// A context of the module's own that is not used for its static imports.
HANDLE NoStaticImportContext()
{
    if (!FindResourceW(ModuleInstance(), MAKEINTRESOURCEW(kNoStaticImportManifestResourceId),
                       RT_MANIFEST))
        return nullptr;
    HANDLE h = CreateModuleContext(kNoStaticImportManifestResourceId);
    return h == INVALID_HANDLE_VALUE ? nullptr : h;
}

void DetermineIsolationContext()
{
    const ActCtxApi& api = ActCtxFunctions();
    if (!api.activate || !api.deactivate) {
        InterlockedCompareExchange(&g_isolationState, ISOLATION_DIRECT, ISOLATION_UNKNOWN);
        return;
    }
    HANDLE h = LoaderContextOfModule();
    if (!h)
        h = NoStaticImportContext();
    g_hIsolationContext = h;
    InterlockedExchange(&g_isolationState, ISOLATION_CONTEXT);
}

// Activates the isolation context for the life of the object. The error code
// of the wrapped call survives the deactivation.
class IsolationScope {
public:
    IsolationScope()
    {
        if (InterlockedCompareExchange(&g_isolationState, 0, 0) == ISOLATION_UNKNOWN)
            DetermineIsolationContext();
        if (g_isolationState == ISOLATION_DIRECT) {
            entered_ = true;
            return;
        }
        entered_ = active_ = ActCtxFunctions().activate(g_hIsolationContext, &cookie_) != FALSE;
    }
    ~IsolationScope()
    {
        if (!active_)
            return;
        DWORD err = GetLastError();
        ActCtxFunctions().deactivate(0, cookie_);
        SetLastError(err);
    }
    IsolationScope(const IsolationScope&) = delete;
    IsolationScope& operator=(const IsolationScope&) = delete;
    bool entered() const { return entered_; }

private:
    ULONG_PTR cookie_ = 0;
    bool entered_ = false;
    bool active_ = false;
};

// ---- help files ------------------------------------------------------------

DRIVER_INFO_6W* ReadDriverInfo6(HANDLE hPrinter, HeapBuffer& buf)
{
    if (!hPrinter)
        return nullptr;
    DWORD cbNeeded = 0;
    GetPrinterDriverW(hPrinter, nullptr, 6, nullptr, 0, &cbNeeded);
    if (cbNeeded < sizeof(DRIVER_INFO_6W) || !buf.alloc(cbNeeded))
        return nullptr;
    DWORD cbGot = 0;
    if (!GetPrinterDriverW(hPrinter, nullptr, 6, buf.get<BYTE>(), cbNeeded, &cbGot)) {
        buf.reset();
        return nullptr;
    }
    return buf.get<DRIVER_INFO_6W>();
}

// Units of a string at p before its terminator, never looking past cchLeft.
size_t BoundedLength(const WCHAR* p, size_t cchLeft)
{
    size_t n = 0;
    while (n < cchLeft && p[n])
        ++n;
    return n;
}

bool HasHelpExtension(const WCHAR* path)
{
    return wcsstr(path, L".chm") || wcsstr(path, L".hlp");
}

// ---- HTML Help control -----------------------------------------------------

typedef HWND(WINAPI* HtmlHelpProc)(HWND, LPCWSTR, UINT, DWORD_PTR);

HMODULE g_hHtmlHelp = nullptr;
HtmlHelpProc g_pfnHtmlHelp = nullptr;
BOOL g_bHtmlHelpFailed = FALSE;

// The registered path of the HTML Help control, or an empty string. The
// value is 8-bit, limited to 260 bytes and may come without a terminator.
void ReadHtmlHelpServerPath(char (&path)[kHtmlHelpPathBytes + 1])
{
    path[0] = 0;
    ScopedRegKey key;
    if (RegOpenKeyExA(HKEY_CLASSES_ROOT, kHtmlHelpServerKey, 0, KEY_READ, key.out()) !=
        ERROR_SUCCESS)
        return;
    DWORD type = 0;
    DWORD cb = kHtmlHelpPathBytes;
    if (RegQueryValueExA(key.get(), nullptr, nullptr, &type, reinterpret_cast<BYTE*>(path),
                         &cb) != ERROR_SUCCESS ||
        (type != REG_SZ && type != REG_EXPAND_SZ)) {
        path[0] = 0;
        return;
    }
    path[cb < kHtmlHelpPathBytes ? cb : kHtmlHelpPathBytes] = 0;
}

HMODULE LoadHtmlHelpModule()
{
    char path[kHtmlHelpPathBytes + 1];
    ReadHtmlHelpServerPath(path);
    HMODULE h = path[0] ? LoadLibraryA(path) : nullptr;
    return h ? h : LoadLibraryW(L"hhctrl.ocx");
}

}  // namespace

void FindDriverHelpFile(HANDLE hPrinter, WCHAR path[260])
{
    HeapBuffer buf;
    const DRIVER_INFO_6W* info = ReadDriverInfo6(hPrinter, buf);
    if (!info)
        return;
    // The list comes from the driver package: walk it only inside the block
    // the spooler filled, whether or not its final empty string is there.
    const BYTE* base = buf.get<BYTE>();
    const BYTE* end = base + buf.size();
    const BYTE* list = reinterpret_cast<const BYTE*>(info->pDependentFiles);
    if (!list || list < base || list >= end)
        return;
    const WCHAR* p = info->pDependentFiles;
    size_t cchLeft = size_t(end - list) / sizeof(WCHAR);
    while (cchLeft && *p) {
        size_t cch = BoundedLength(p, cchLeft);
        StringCchCopyNW(path, kPathUnits, p, cch < kPathUnits - 1 ? cch : kPathUnits - 1);
        size_t cchPath = 0;
        StringCchLengthW(path, kPathUnits, &cchPath);
        CharLowerBuffW(path, DWORD(cchPath));
        if (HasHelpExtension(path) || cch >= cchLeft)
            return;
        p += cch + 1;
        cchLeft -= cch + 1;
    }
}

void ShowDriverHelp(HWND hwndPage, HANDLE hPrinter)
{
    WCHAR path[kPathUnits] = {};
    FindDriverHelpFile(hPrinter, path);
    if (wcsstr(path, L".chm")) {
        HWND hwndHelp = HtmlHelpW(hwndPage, path, kHtmlHelpDisplayIndex, 0);
        if (hwndHelp)
            PlaceBesideHelp(GetAncestor(hwndPage, GA_ROOT), hwndHelp);
    } else if (wcsstr(path, L".hlp")) {
        WinHelpW(hwndPage, path, HELP_FINDER, 0);
    }
}

HWND HtmlHelpW(HWND hwndCaller, LPCWSTR pszFile, UINT uCommand, DWORD_PTR dwData)
{
    if (g_bHtmlHelpFailed)
        return nullptr;
    if (!g_hHtmlHelp) {
        g_hHtmlHelp = LoadHtmlHelpModule();
        if (!g_hHtmlHelp) {
            g_bHtmlHelpFailed = TRUE;
            return nullptr;
        }
    }
    if (!g_pfnHtmlHelp) {
        g_pfnHtmlHelp = reinterpret_cast<HtmlHelpProc>(reinterpret_cast<void*>(
            GetProcAddress(g_hHtmlHelp, MAKEINTRESOURCEA(kHtmlHelpOrdinal))));
        if (!g_pfnHtmlHelp) {
            g_bHtmlHelpFailed = TRUE;
            return nullptr;
        }
    }
    return g_pfnHtmlHelp(hwndCaller, pszFile, uCommand, dwData);
}

void PlaceBesideHelp(HWND hwndSheet, HWND hwndHelp)
{
    WINDOWPLACEMENT sheet = {sizeof(sheet)};
    WINDOWPLACEMENT help = {sizeof(help)};
    WINDOWPLACEMENT desktop = {sizeof(desktop)};
    if (!GetWindowPlacement(hwndSheet, &sheet) || !GetWindowPlacement(hwndHelp, &help) ||
        !GetWindowPlacement(GetDesktopWindow(), &desktop))
        return;
    const RECT d = desktop.rcNormalPosition;
    RECT& s = sheet.rcNormalPosition;
    const LONG width = s.right - s.left;

    LONG left = (d.right - d.left) / 2 - width;
    s.left = left < 0 ? 0 : left;
    s.right = s.left + width;
    sheet.showCmd = SW_SHOWNA;
    sheet.flags = 0;

    RECT& h = help.rcNormalPosition;
    h.left = s.right;
    h.top = s.top;
    h.bottom = s.bottom;
    h.right = s.right + width < d.right ? s.right + width : d.right;
    help.showCmd = SW_SHOW;
    help.flags = 0;

    SetWindowPlacement(hwndSheet, &sheet);
    SetWindowPlacement(hwndHelp, &help);
}

namespace {
BOOL CALLBACK DisableChild(HWND hwnd, LPARAM)
{
    EnableWindow(hwnd, FALSE);
    return TRUE;
}
}  // namespace

void DisableAllChildren(HWND hwnd)
{
    // EnumChildWindows of a null window would walk every top-level window.
    if (hwnd)
        EnumChildWindows(hwnd, DisableChild, 0);
}

HANDLE ModuleActivationContext()
{
    HANDLE* slot = ModuleActivationContextSlot();
    if (*slot == INVALID_HANDLE_VALUE)
        *slot = CreateModuleContext(kManifestResourceId);
    return *slot;
}

INT_PTR IsolatedDialogBoxParam(HINSTANCE hInst, LPCWSTR pszTemplate, HWND hwndOwner, DLGPROC pfn,
                               LPARAM lParam)
{
    IsolationScope scope;
    if (!scope.entered())
        return -1;
    return DialogBoxParamW(hInst, pszTemplate, hwndOwner, pfn, lParam);
}

void IsolatedInitCommonControls()
{
    IsolationScope scope;
    if (scope.entered())
        InitCommonControls();
}

HMODULE IsolatedLoadLibraryW(LPCWSTR pszFile)
{
    IsolationScope scope;
    return scope.entered() ? LoadLibraryW(pszFile) : nullptr;
}

HPROPSHEETPAGE IsolatedCreatePropertySheetPageW(LPCPROPSHEETPAGEW ppsp)
{
    IsolationScope scope;
    return scope.entered() ? CreatePropertySheetPageW(ppsp) : nullptr;
}

INT_PTR IsolatedPropertySheetW(LPCPROPSHEETHEADERW ppsh)
{
    IsolationScope scope;
    return scope.entered() ? PropertySheetW(ppsh) : -1;
}

BOOL IsolatedGetOpenFileNameW(LPOPENFILENAMEW pofn)
{
    IsolationScope scope;
    return scope.entered() ? GetOpenFileNameW(pofn) : FALSE;
}
