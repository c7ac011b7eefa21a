#include "pages/aboutpage.h"

#include "frame/dialogutil.h"
#include "frame/module.h"
#include "frame/spooler.h"
#include "frame/uimessages.h"
#include "resources/resource.h"

#include <strsafe.h>
#include <wchar.h>

namespace {

const WCHAR kPluginVersion[] = L"1.0";
const size_t kLineUnits = 100;       // driver and version lines
const int kFormatUnits = 1024;       // their formats from the string table
const int kHeadingUnits = 150;
const int kNoVersionUnits = 400;
const size_t kFileNameUnits = 260;
const size_t kVersionUnits = 260;

// ---- the driver and version lines --------------------------------------------

void SetFormattedLine(HWND hwnd, int id, UINT idFormat, LPCWSTR value)
{
    WCHAR format[kFormatUnits];
    LoadPluginString(idFormat, format, kFormatUnits);
    WCHAR line[kLineUnits] = {};
    // A cut line is still terminated; the rest is simply not shown.
    StringCchPrintfW(line, kLineUnits, format, value);
    SetDlgItemTextW(hwnd, id, line);
}

void ShowDriverAndVersion(HWND hwnd, HANDLE hPrinter)
{
    WCHAR driver[kLineUnits] = {};
    HeapBuffer buf;
    if (PRINTER_INFO_2W* pi = ReadPrinterInfo2(hPrinter, buf))
        CopySpoolerString(driver, kLineUnits, pi->pDriverName);
    SetFormattedLine(hwnd, IDC_ABOUT_DRIVER, IDS_STR_167, driver);
    SetFormattedLine(hwnd, IDC_ABOUT_VERSION, IDS_STR_168, kPluginVersion);
}

// ---- the file-version list ---------------------------------------------------

BOOL AddColumn(HWND list, int index, UINT idHeading, int width)
{
    WCHAR heading[kHeadingUnits];
    LoadPluginString(idHeading, heading, kHeadingUnits);
    LVCOLUMNW col = {};
    col.mask = LVCF_FMT | LVCF_WIDTH | LVCF_TEXT | LVCF_SUBITEM;
    col.fmt = LVCFMT_LEFT;
    col.cx = width > 0 ? width : 0;
    col.pszText = heading;
    col.iSubItem = index;
    return ListView_InsertColumn(list, index, &col) >= 0;
}

// The two columns share the list's width less room for the frame and a
// vertical scroll bar; the file names get a third of it and 20 pixels more.
void AddColumns(HWND list, int width)
{
    const int room = width - 21;
    const int first = room / 3 + 20;
    AddColumn(list, 0, IDS_STR_56, first);
    AddColumn(list, 1, IDS_STR_57, room - first);
}

// The driver's DRIVER_INFO_3 in buf, with room for two terminators beyond
// what the spooler filled, so that a list it left unterminated still ends.
DRIVER_INFO_3W* ReadDriverInfo3(HANDLE hPrinter, HeapBuffer& buf, DWORD* pcb)
{
    DWORD cb = 0;
    GetPrinterDriverW(hPrinter, nullptr, 3, nullptr, 0, &cb);
    if (cb < sizeof(DRIVER_INFO_3W) || !buf.alloc(static_cast<SIZE_T>(cb) + 2 * sizeof(WCHAR)))
        return nullptr;
    DWORD got = 0;
    if (!GetPrinterDriverW(hPrinter, nullptr, 3, buf.get<BYTE>(), cb, &got))
        return nullptr;
    *pcb = cb;
    return buf.get<DRIVER_INFO_3W>();
}

// The version string of the first translation of a file's version resource;
// FALSE when the resource has no translation or no such string.
BOOL ReadFileVersionString(LPCWSTR path, DWORD cbInfo, WCHAR* out, size_t cchOut)
{
    HeapBuffer info;
    if (!info.alloc(cbInfo) || !GetFileVersionInfoW(path, 0, cbInfo, info.get()))
        return FALSE;
    void* pTranslation = nullptr;
    UINT cbTranslation = 0;
    if (!VerQueryValueW(info.get(), L"\\VarFileInfo\\Translation", &pTranslation, &cbTranslation) ||
        !pTranslation || cbTranslation < 2 * sizeof(WORD))
        return FALSE;
    const WORD* pair = static_cast<const WORD*>(pTranslation);
    const DWORD block = (static_cast<DWORD>(pair[0]) << 16) | pair[1];
    WCHAR query[64];
    if (FAILED(StringCchPrintfW(query, 64, L"\\StringFileInfo\\%08lx\\FileVersion", block)))
        return FALSE;
    void* pValue = nullptr;
    UINT cchValue = 0;
    if (!VerQueryValueW(info.get(), query, &pValue, &cchValue) || !pValue || cchValue == 0)
        return FALSE;
    const WCHAR* value = static_cast<const WCHAR*>(pValue);
    if (!value[0])
        return FALSE;
    StringCchCopyNW(out, cchOut, value, cchValue);
    return TRUE;
}

// The text of the version column for one file: its version string, or
// string 55 when it has no version information at all.
BOOL VersionTextOf(LPCWSTR path, WCHAR* out, size_t cchOut)
{
    DWORD unused = 0;
    const DWORD cbInfo = GetFileVersionInfoSizeW(path, &unused);
    if (cbInfo)
        return ReadFileVersionString(path, cbInfo, out, cchOut);
    WCHAR none[kNoVersionUnits];
    if (LoadStringW(ModuleInstance(), IDS_STR_55, none, kNoVersionUnits) <= 0)
        return FALSE;
    StringCchCopyW(out, cchOut, none);
    return TRUE;
}

LPCWSTR FileNameOf(LPCWSTR path)
{
    LPCWSTR slash = wcsrchr(path, L'\\');
    return slash ? slash + 1 : path;
}

void AddFileRow(HWND list, int row, LPCWSTR path, LPCWSTR version)
{
    WCHAR name[kFileNameUnits];
    CopySpoolerString(name, kFileNameUnits, FileNameOf(path));
    LVITEMW item = {};
    item.mask = LVIF_TEXT;
    item.iItem = row;
    item.pszText = name;
    // The list sorts itself, so the row lands where its name belongs.
    const int at = ListView_InsertItem(list, &item);
    if (at >= 0)
        ListView_SetItemText(list, at, 1, const_cast<LPWSTR>(version));
}

// Walks the dependent-file list without leaving the spooler's buffer: each
// string is bounded by what is left of it, and the list ends at an empty one.
void AddDependentFiles(HWND list, const BYTE* base, SIZE_T cbBuffer, LPCWSTR files)
{
    const BYTE* at = reinterpret_cast<const BYTE*>(files);
    if (at < base || at >= base + cbBuffer)
        return;
    const WCHAR* p = files;
    const WCHAR* end = reinterpret_cast<const WCHAR*>(base + cbBuffer);
    int row = 0;
    while (p < end && *p) {
        const size_t len = wcsnlen(p, static_cast<size_t>(end - p));
        if (p + len >= end)
            break;
        WCHAR version[kVersionUnits];
        if (VersionTextOf(p, version, kVersionUnits)) {
            AddFileRow(list, row, p, version);
            ++row;
        }
        p += len + 1;
    }
}

// ---- message handlers --------------------------------------------------------

BOOL OnInitDialog(HWND hwnd, PAGECONTEXT* ctx)
{
    SetWindowLongPtrW(hwnd, GWLP_USERDATA, reinterpret_cast<LONG_PTR>(ctx));
    IsolatedInitCommonControls();
    if (!ctx)
        return TRUE;
    if (ctx->hPrinter) {
        ShowDriverAndVersion(hwnd, ctx->hPrinter);
        FillFileVersionList(hwnd, ctx->hPrinter);
    }
    if (ctx->bNoPermission)
        DisableAllChildren(hwnd);
    return TRUE;
}

// The sheet's context-help button has nothing to explain on this page: it
// goes while the page is shown and comes back when the user leaves.
void SetSheetContextHelp(HWND hwndPage, BOOL on)
{
    HWND sheet = GetParent(hwndPage);
    if (!sheet)
        return;
    const LONG_PTR ex = GetWindowLongPtrW(sheet, GWL_EXSTYLE);
    const BOOL has = (ex & WS_EX_CONTEXTHELP) != 0;
    if (has == on)
        return;
    SetWindowLongPtrW(sheet, GWL_EXSTYLE, on ? (ex | WS_EX_CONTEXTHELP) : (ex & ~WS_EX_CONTEXTHELP));
    SendMessageW(sheet, WM_NCPAINT, 1, 0);
}

void OnNotify(HWND hwnd, const NMHDR* nm)
{
    PAGECONTEXT* ctx = PageContextOf(hwnd);
    switch (nm->code) {
    case PSN_SETACTIVE:
        SetSheetContextHelp(hwnd, FALSE);
        if (ctx && ctx->bNoPermission)
            DisableAllChildren(hwnd);
        break;
    case PSN_KILLACTIVE:
        SetSheetContextHelp(hwnd, TRUE);
        break;
    case PSN_HELP:
        if (ctx)
            ShowDriverHelp(hwnd, ctx->hPrinter);
        break;
    default:
        break;
    }
}

}  // namespace

void FillFileVersionList(HWND hwndPage, HANDLE hPrinter)
{
    HWND list = GetDlgItem(hwndPage, IDC_ABOUT_FILES);
    RECT r = {};
    if (!list || !GetWindowRect(list, &r))
        return;
    AddColumns(list, r.right - r.left);
    HeapBuffer buf;
    DWORD cb = 0;
    const DRIVER_INFO_3W* di = ReadDriverInfo3(hPrinter, buf, &cb);
    if (!di || !di->pDependentFiles)
        return;
    AddDependentFiles(list, buf.get<BYTE>(), buf.size(), di->pDependentFiles);
}

INT_PTR CALLBACK AboutPageProc(HWND hwnd, UINT msg, WPARAM wParam, LPARAM lParam)
{
    switch (msg) {
    case WM_INITDIALOG: {
        auto* psp = reinterpret_cast<const PROPSHEETPAGEW*>(lParam);
        return OnInitDialog(hwnd, psp ? reinterpret_cast<PAGECONTEXT*>(psp->lParam) : nullptr);
    }
    case WM_COMMAND:
        if (LOWORD(wParam) == IDOK) {
            EndDialog(hwnd, static_cast<INT_PTR>(wParam));
            return TRUE;
        }
        return FALSE;
    case WM_NOTIFY:
        if (lParam)
            OnNotify(hwnd, reinterpret_cast<const NMHDR*>(lParam));
        return FALSE;
    default:
        return FALSE;
    }
}
