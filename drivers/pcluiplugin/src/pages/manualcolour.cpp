// The manual colour page: colour correction method, the treatment of RGB
// images, text and graphics, and the toner saver, kept in the ManColData block.
#include "pages/qualitypages.h"

#include "frame/pagenotify.h"
#include "frame/dialogutil.h"
#include "frame/module.h"
#include "resources/resource.h"

#include <cstddef>

// The block is a stored format shared with profiles, DCF files and the render side.
static_assert(offsetof(MANCOLDATA, dwMethod) == 0 && offsetof(MANCOLDATA, dwRGBImages) == 4 &&
                  offsetof(MANCOLDATA, dwRGBText) == 8 && offsetof(MANCOLDATA, dwRGBGraphics) == 12 &&
                  offsetof(MANCOLDATA, dwTonerSaver) == 16,
              "MANCOLDATA offsets");

namespace {

struct ListEntry {
    UINT idString;
    DWORD value;
};

constexpr DWORD kManualMethod = 3;

const ListEntry kMethodEntries[] = {{IDS_STR_104, 0}, {IDS_STR_144, 1}, {IDS_STR_138, 2}, {IDS_STR_108, 3}};
// Display order, not value order: "true black" comes before "off".
const ListEntry kRgbEntries[] = {{IDS_STR_104, 0}, {IDS_STR_139, 1}, {IDS_STR_140, 2},
                                 {IDS_STR_141, 3}, {IDS_STR_219, 5}, {IDS_STR_144, 4}};
const ListEntry kTonerEntries[] = {{IDS_STR_104, 0}, {IDS_STR_105, 2}, {IDS_STR_144, 1}};

// The five lists and the block field each one edits.
struct ListField {
    int id;
    DWORD MANCOLDATA::*field;
};
const ListField kLists[] = {{IDC_MC_METHOD, &MANCOLDATA::dwMethod},
                            {IDC_MC_IMAGES, &MANCOLDATA::dwRGBImages},
                            {IDC_MC_TEXT, &MANCOLDATA::dwRGBText},
                            {IDC_MC_GRAPHICS, &MANCOLDATA::dwRGBGraphics},
                            {IDC_MC_TONER, &MANCOLDATA::dwTonerSaver}};

// Controls that only matter for manual correction.
const int kManualControls[] = {IDC_MC_IMAGES_LABEL, IDC_MC_IMAGES, IDC_MC_TEXT_LABEL,
                               IDC_MC_TEXT,         IDC_MC_GRAPHICS_LABEL, IDC_MC_GRAPHICS};

// Appends every entry whose string loads, with its value as item data.
template <size_t N> void FillList(HWND hwnd, int id, const ListEntry (&entries)[N], WCHAR* text, int cch)
{
    for (const ListEntry& e : entries) {
        if (LoadStringW(ModuleInstance(), e.idString, text, cch) <= 0)
            continue;
        const LRESULT i = SendDlgItemMessageW(hwnd, id, CB_ADDSTRING, 0, reinterpret_cast<LPARAM>(text));
        if (i >= 0)
            SendDlgItemMessageW(hwnd, id, CB_SETITEMDATA, static_cast<WPARAM>(i), e.value);
    }
}

// The value of the selected entry; 0 when nothing is selected.
DWORD ReadList(HWND hwnd, int id)
{
    const LRESULT sel = SendDlgItemMessageW(hwnd, id, CB_GETCURSEL, 0, 0);
    if (sel < 0)
        return 0;
    const LRESULT data = SendDlgItemMessageW(hwnd, id, CB_GETITEMDATA, static_cast<WPARAM>(sel), 0);
    return data == CB_ERR ? 0 : static_cast<DWORD>(data);
}

// Selects the first entry carrying value; a value no entry carries (the
// devmode is not trusted) leaves the selection as it was.
void SelectByValue(HWND hwnd, int id, DWORD value)
{
    const LRESULT count = SendDlgItemMessageW(hwnd, id, CB_GETCOUNT, 0, 0);
    for (LRESULT i = 0; i < count; ++i) {
        const LRESULT data = SendDlgItemMessageW(hwnd, id, CB_GETITEMDATA, static_cast<WPARAM>(i), 0);
        if (data != CB_ERR && static_cast<DWORD>(data) == value) {
            SendDlgItemMessageW(hwnd, id, CB_SETCURSEL, static_cast<WPARAM>(i), 0);
            return;
        }
    }
}

void ShowManColData(HWND hwnd, const MANCOLDATA& data)
{
    for (const ListField& l : kLists)
        SelectByValue(hwnd, l.id, data.*l.field);
}

void ReadManColData(HWND hwnd, MANCOLDATA* data)
{
    for (const ListField& l : kLists)
        data->*l.field = ReadList(hwnd, l.id);
}

void ApplyEnableRule(HWND hwnd, DWORD method)
{
    for (int id : kManualControls)
        EnableWindow(GetDlgItem(hwnd, id), method == kManualMethod);
}

void MarkChanged(HWND hwnd) { PropSheet_Changed(GetParent(hwnd), hwnd); }

// ---- message handlers -------------------------------------------------------

BOOL OnInitDialog(HWND hwnd, PAGECONTEXT* ctx)
{
    IsolatedInitCommonControls();
    SetWindowLongPtrW(hwnd, GWLP_USERDATA, reinterpret_cast<LONG_PTR>(ctx));
    if (!ctx)
        return TRUE;
    WCHAR text[1024];
    const MANCOLDATA& data = ctx->ws.ManColData;
    FillList(hwnd, IDC_MC_METHOD, kMethodEntries, text, 1024);
    SelectByValue(hwnd, IDC_MC_METHOD, data.dwMethod);
    ApplyEnableRule(hwnd, data.dwMethod);
    FillList(hwnd, IDC_MC_IMAGES, kRgbEntries, text, 1024);
    FillList(hwnd, IDC_MC_TEXT, kRgbEntries, text, 1024);
    FillList(hwnd, IDC_MC_GRAPHICS, kRgbEntries, text, 1024);
    FillList(hwnd, IDC_MC_TONER, kTonerEntries, text, 1024);
    SelectByValue(hwnd, IDC_MC_IMAGES, data.dwRGBImages);
    SelectByValue(hwnd, IDC_MC_TEXT, data.dwRGBText);
    SelectByValue(hwnd, IDC_MC_GRAPHICS, data.dwRGBGraphics);
    SelectByValue(hwnd, IDC_MC_TONER, data.dwTonerSaver);
    if (ctx->bNoPermission)
        DisableAllChildren(hwnd);
    return TRUE;
}

void OnQualityButton(HWND hwnd, PAGECONTEXT* ctx)
{
    const INT_PTR end = IsolatedDialogBoxParam(ModuleInstance(), MAKEINTRESOURCEW(IDD_231), hwnd,
                                               RgbQualityDialogProc, reinterpret_cast<LPARAM>(ctx));
    if (end == 1)
        MarkChanged(hwnd);
}

void OnCommand(HWND hwnd, PAGECONTEXT* ctx, int id, int code)
{
    if (id == IDC_MC_QUALITY) {
        if (code == BN_CLICKED)
            OnQualityButton(hwnd, ctx);
        return;
    }
    if (code != CBN_SELCHANGE)
        return;
    for (const ListField& l : kLists) {
        if (l.id != id)
            continue;
        if (id == IDC_MC_METHOD)
            ApplyEnableRule(hwnd, ReadList(hwnd, IDC_MC_METHOD));
        MarkChanged(hwnd);
        return;
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
    ShowManColData(hwnd, ctx->ws.ManColData);
    ApplyEnableRule(hwnd, ctx->ws.ManColData.dwMethod);
    if (ctx->bNoPermission) {
        DisableAllChildren(hwnd);
        return FALSE;
    }
    // A stored value no entry carries becomes what the list shows.
    ReadManColData(hwnd, &ctx->ws.ManColData);
    ctx->bApplied = 1;
    return FALSE;
}

BOOL OnKillActive(HWND hwnd, PAGECONTEXT* ctx)
{
    if (ctx->bNoPermission)
        return FALSE;
    ReadManColData(hwnd, &ctx->ws.ManColData);
    ctx->bApplied = 1;
    return FALSE;
}

BOOL OnApply(HWND hwnd, PAGECONTEXT* ctx)
{
    if (ctx->bNoPermission)
        return FALSE;
    if (OEMDEV* oem = ctx->pOemDevmode) {
        ReadManColData(hwnd, &oem->ManColData);
        // What the RGB quality dialog chose travels with this page; grey
        // correction belongs to the black-and-white page.
        const WORKINGSETTINGS& ws = ctx->ws;
        oem->EnhanceLines = ws.EnhanceLines;
        oem->Brightness = ws.Brightness;
        oem->Contrast = ws.Contrast;
        oem->ImageSaturation = ws.ImageSaturation;
        oem->HasPrintQuality = ws.HasPrintQuality;
    }
    ctx->bApplied = 1;
    return FALSE;
}

BOOL OnNotify(HWND hwnd, PAGECONTEXT* ctx, const NMHDR* nm)
{
    static const PageHandlers handlers = {OnSetActive, OnKillActive, OnApply};
    return DispatchPageNotify(hwnd, ctx, nm, handlers);
}

}  // namespace

INT_PTR CALLBACK ManualColourPageProc(HWND hwnd, UINT msg, WPARAM wParam, LPARAM lParam)
{
    if (msg == WM_INITDIALOG) {
        return OnInitDialog(hwnd, PageContextFromInit(lParam));
    }
    PAGECONTEXT* ctx = PageContextOf(hwnd);
    if (!ctx)
        return FALSE;
    switch (msg) {
    case WM_COMMAND:
        OnCommand(hwnd, ctx, LOWORD(wParam), HIWORD(wParam));
        return FALSE;
    case WM_NOTIFY:
        return OnNotify(hwnd, ctx, reinterpret_cast<const NMHDR*>(lParam));
    default:
        return FALSE;
    }
}
