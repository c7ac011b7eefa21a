// Defining one watermark: name, text, font, size, colour, style, intensity,
// angle and placement, with a live preview drawn by the renderer.
#include "frame/dialogutil.h"
#include "frame/module.h"
#include "frame/uimessages.h"
#include "resources/resource.h"
#include "watermark/dyntext.h"
#include "watermark/renderer.h"
#include "watermarkui/wmdialogs.h"
#include "watermarkui/wmpage.h"

#include <commctrl.h>
#include <strsafe.h>
#include <cstdlib>
#include <cstring>

namespace {

struct ColourEntry {
    UINT idName;
    COLORREF colour;
};

const ColourEntry kColours[] = {
    {153, 0xFFFF00}, {11, 0x000000}, {6, 0xFF0000},  {25, 0x004080},  {150, 0xCDCDCD},
    {7, 0x00FF00},   {8, 0x800000},  {152, 0x1191EE}, {24, 0xA264F8}, {9, 0xDF00B4},
    {4, 0x0000FF},   {151, 0xFFFFFF}, {10, 0x00FFFF},
};
constexpr int kColourCount = sizeof(kColours) / sizeof(kColours[0]);
constexpr int kBlackEntry = 1;

// Values the field checks fall back to, shared by every opening.
int g_lastSize = 72, g_lastShortSize = 72, g_lastIntensity = 100, g_lastAngle = 0;
// > 0 while a spin writes its buddy field, so that the change notification
// this raises ends without writing the field again.
int g_spinWriting = 0;
WNDPROC g_prevPreviewProc = nullptr;

BOOL Checked(HWND hwnd, int id) { return IsDlgButtonChecked(hwnd, id) == BST_CHECKED; }

void Repaint(HWND hwnd) { InvalidateRect(GetDlgItem(hwnd, IDC_WMED_PREVIEW), nullptr, TRUE); }

void SetSpin(HWND hwnd, int spin, int v)
{
    ++g_spinWriting;
    SendDlgItemMessageW(hwnd, spin, UDM_SETPOS32, 0, v);
    --g_spinWriting;
}

int SpinPos(HWND hwnd, int spin) { return static_cast<int>(SendDlgItemMessageW(hwnd, spin, UDM_GETPOS32, 0, 0)); }

void SetNumber(HWND hwnd, int id, int v)
{
    WCHAR text[16];
    StringCchPrintfW(text, 16, L"%d", v);
    SetDlgItemTextW(hwnd, id, text);
}

int FieldNumber(HWND hwnd, int id, int cchMax, WCHAR* text)
{
    GetDlgItemTextW(hwnd, id, text, cchMax + 1);
    return _wtoi(text);
}

BOOL IsBlankOrEmpty(const WCHAR* s)
{
    for (; *s; ++s)
        if (*s != L' ')
            return FALSE;
    return TRUE;
}

// The watermark page that opened this dialog, directly or through the
// choose-to-edit dialog; modal owners are top-level, so the sheet may stand
// in for the page.
HWND WatermarkPageOf(HWND hwnd)
{
    HWND owner = GetWindow(hwnd, GW_OWNER);
    if (owner && GetDlgItem(owner, IDC_WM_EDIT))
        return owner;
    HWND page = owner ? PropSheet_GetCurrentPageHwnd(owner) : nullptr;
    return page && GetDlgItem(page, IDC_WM_EDIT) ? page : nullptr;
}

void ResetPlacement(WATERMARK& wm)
{
    wm.iVertPos = WM_POS_CENTRE;
    wm.iHorzPos = WM_POS_CENTRE;
    wm.iUnits = WM_UNITS_INCHES;
    wm.dHorzOffset = 0.0;
    wm.dVertOffset = 0.0;
}

void CopyPlacement(WATERMARK& dst, const WATERMARK& src)
{
    dst.iVertPos = src.iVertPos;
    dst.iHorzPos = src.iHorzPos;
    dst.iUnits = src.iUnits;
    dst.dHorzOffset = src.dHorzOffset;
    dst.dVertOffset = src.dVertOffset;
}

// Font, size, style, intensity, colour and angle from the controls; a font
// or colour not chosen keeps the record's own.
void ReadAppearance(HWND hwnd, WATERMARK& wm, int cchAngle)
{
    // A face that is not installed shows no selection; the record keeps it.
    if (SendDlgItemMessageW(hwnd, IDC_WMED_FONT, CB_GETCURSEL, 0, 0) != CB_ERR) {
        std::memset(wm.lfFont.lfFaceName, 0, sizeof(wm.lfFont.lfFaceName));
        GetDlgItemTextW(hwnd, IDC_WMED_FONT, wm.lfFont.lfFaceName, LF_FACESIZE);
    }
    wm.lfFont.lfCharSet = DEFAULT_CHARSET;
    WCHAR num[16];
    wm.iPointSize = FieldNumber(hwnd, IDC_WMED_SIZE, 3, num);
    wm.lfFont.lfStrikeOut = Checked(hwnd, IDC_WMED_STRIKEOUT) ? 1 : 0;
    wm.lfFont.lfItalic = Checked(hwnd, IDC_WMED_ITALIC) ? 1 : 0;
    wm.lfFont.lfUnderline = Checked(hwnd, IDC_WMED_UNDERLINE) ? 1 : 0;
    wm.bOutline = Checked(hwnd, IDC_WMED_OUTLINE) ? 1 : 0;
    wm.bDynamic = Checked(hwnd, IDC_WMED_DYNAMIC) ? 1 : 0;
    wm.lfFont.lfWeight = Checked(hwnd, IDC_WMED_BOLD) ? FW_BOLD : FW_NORMAL;
    wm.bIntensity = static_cast<BYTE>(SpinPos(hwnd, IDC_WMED_INTENSITY_SPIN) & 0xFF);
    const LRESULT colour = SendDlgItemMessageW(hwnd, IDC_WMED_COLOUR, CB_GETCURSEL, 0, 0);
    if (colour >= 0 && colour < kColourCount)
        wm.crColor = kColours[colour].colour;
    const int angle = FieldNumber(hwnd, IDC_WMED_ANGLE, cchAngle, num) * 10;
    wm.lfFont.lfEscapement = angle;
    wm.lfFont.lfOrientation = angle;
}

void RefreshPreviewRecord(HWND hwnd, WATERMARK& wm)
{
    GetDlgItemTextW(hwnd, IDC_WMED_NAME, wm.szName, 128);
    GetDlgItemTextW(hwnd, IDC_WMED_TEXT, wm.szText, 128);
    ReadAppearance(hwnd, wm, 9);
}

LRESULT CALLBACK PreviewProc(HWND hwnd, UINT msg, WPARAM wParam, LPARAM lParam)
{
    if (msg != WM_PAINT)
        return CallWindowProcW(g_prevPreviewProc, hwnd, msg, wParam, lParam);
    return PaintWatermarkPreview(hwnd, RefreshPreviewRecord);
}

// ---- initialisation ---------------------------------------------------------

int CALLBACK AddTrueTypeFace(const LOGFONTW* lf, const TEXTMETRICW*, DWORD type, LPARAM lParam)
{
    if (!(type & TRUETYPE_FONTTYPE))
        return 1;
    HWND combo = reinterpret_cast<HWND>(lParam);
    if (SendMessageW(combo, CB_FINDSTRINGEXACT, static_cast<WPARAM>(-1), reinterpret_cast<LPARAM>(lf->lfFaceName)) ==
        CB_ERR)
        SendMessageW(combo, CB_ADDSTRING, 0, reinterpret_cast<LPARAM>(lf->lfFaceName));
    return 1;
}

void FillFonts(HWND hwnd, const WATERMARK* edited)
{
    HWND combo = GetDlgItem(hwnd, IDC_WMED_FONT);
    if (HDC dc = GetDC(hwnd)) {
        LOGFONTW lf = {};
        lf.lfCharSet = DEFAULT_CHARSET;
        EnumFontFamiliesExW(dc, &lf, AddTrueTypeFace, reinterpret_cast<LPARAM>(combo), 0);
        ReleaseDC(hwnd, dc);
    }
    WCHAR face[LF_FACESIZE];
    if (edited) {
        StringCchCopyNW(face, LF_FACESIZE, edited->lfFont.lfFaceName, LF_FACESIZE - 1);
    } else {
        LoadPluginString(IDS_STR_232, face, LF_FACESIZE, L"Arial");
    }
    LRESULT i = SendMessageW(combo, CB_FINDSTRINGEXACT, static_cast<WPARAM>(-1), reinterpret_cast<LPARAM>(face));
    if (i == CB_ERR && !edited)
        i = 0;
    SendMessageW(combo, CB_SETCURSEL, i == CB_ERR ? static_cast<WPARAM>(-1) : static_cast<WPARAM>(i), 0);
}

void FillColours(HWND hwnd, const WATERMARK* edited)
{
    HWND combo = GetDlgItem(hwnd, IDC_WMED_COLOUR);
    WCHAR name[32];
    int chosen = edited ? -1 : kBlackEntry;
    for (int i = 0; i < kColourCount; ++i) {
        LoadPluginString(kColours[i].idName, name, 32);
        SendMessageW(combo, CB_ADDSTRING, 0, reinterpret_cast<LPARAM>(name));
        if (edited && chosen < 0 && kColours[i].colour == edited->crColor)
            chosen = i;
    }
    SendMessageW(combo, CB_SETCURSEL, static_cast<WPARAM>(chosen), 0);
}

void FillSizes(HWND hwnd, const WATERMARK* edited)
{
    HWND combo = GetDlgItem(hwnd, IDC_WMED_SIZE);
    WCHAR text[16];
    for (int size = 8; size <= 72; size += 2) {
        StringCchPrintfW(text, 16, L"%d", size);
        SendMessageW(combo, CB_ADDSTRING, 0, reinterpret_cast<LPARAM>(text));
    }
    StringCchPrintfW(text, 16, L"%d", edited ? edited->iPointSize : 72);
    LRESULT i = SendMessageW(combo, CB_FINDSTRINGEXACT, static_cast<WPARAM>(-1), reinterpret_cast<LPARAM>(text));
    if (i != CB_ERR)
        SendMessageW(combo, CB_SETCURSEL, static_cast<WPARAM>(i), 0);
    else if (edited)
        SetWindowTextW(combo, text);
    else
        SendMessageW(combo, CB_SETCURSEL, 0, 0);
}

void OnInit(HWND hwnd, PAGECONTEXT* ctx)
{
    SetWindowLongPtrW(hwnd, GWLP_USERDATA, reinterpret_cast<LONG_PTR>(ctx));
    if (!ctx)
        return;
    auto* preview = static_cast<WATERMARK*>(HeapAlloc(GetProcessHeap(), HEAP_ZERO_MEMORY, sizeof(WATERMARK)));
    if (preview)
        ResetPlacement(*preview);
    ctx->pPreviewRecord = preview;
    const WATERMARK* edited =
        ctx->dwDialogMode == DLGMODE_EDIT && ctx->pEditedRecord ? &ctx->pEditedRecord->wm : nullptr;

    EnableWindow(GetDlgItem(hwnd, IDOK), FALSE);
    SendDlgItemMessageW(hwnd, IDC_WMED_SIZE, CB_LIMITTEXT, 3, 0);
    SendDlgItemMessageW(hwnd, IDC_WMED_NAME, EM_LIMITTEXT, 127, 0);
    SendDlgItemMessageW(hwnd, IDC_WMED_TEXT, EM_LIMITTEXT, 127, 0);
    SendDlgItemMessageW(hwnd, IDC_WMED_ANGLE, EM_LIMITTEXT, 4, 0);
    SendDlgItemMessageW(hwnd, IDC_WMED_ANGLE_SPIN, UDM_SETRANGE32, static_cast<WPARAM>(-180), 180);

    WCHAR caption[64];
    if (edited) {
        LoadPluginString(IDS_STR_148, caption, 64, L"Edit Watermark");
        EnableWindow(GetDlgItem(hwnd, IDOK), TRUE);
        WCHAR text[128];
        RecordName(*edited, text);
        SetDlgItemTextW(hwnd, IDC_WMED_NAME, text);
        StringCchCopyNW(text, 128, edited->szText, 127);
        SetDlgItemTextW(hwnd, IDC_WMED_TEXT, text);
        if (preview)
            CopyPlacement(*preview, *edited);
    } else {
        LoadPluginString(IDS_STR_147, caption, 64, L"Add Watermark");
    }
    SetWindowTextW(hwnd, caption);
    FillFonts(hwnd, edited);

    SendDlgItemMessageW(hwnd, IDC_WMED_INTENSITY_SPIN, UDM_SETRANGE32, 1, 100);
    SendDlgItemMessageW(hwnd, IDC_WMED_INTENSITY, EM_LIMITTEXT, 3, 0);
    const int intensity = edited ? edited->bIntensity : 100;
    const int angle = edited ? edited->lfFont.lfOrientation / 10 : 0;
    ++g_spinWriting;  // the values shown first are taken as they are
    SetNumber(hwnd, IDC_WMED_INTENSITY, intensity);
    SendDlgItemMessageW(hwnd, IDC_WMED_INTENSITY_SPIN, UDM_SETPOS32, 0, intensity);
    if (edited)
        SendDlgItemMessageW(hwnd, IDC_WMED_ANGLE_SPIN, UDM_SETPOS32, 0, angle);
    else
        SetNumber(hwnd, IDC_WMED_ANGLE, 0);
    --g_spinWriting;
    if (edited && edited->bDynamic)
        CheckDlgButton(hwnd, IDC_WMED_DYNAMIC, BST_CHECKED);
    EnableWindow(GetDlgItem(hwnd, IDC_WMED_DYNSETUP), Checked(hwnd, IDC_WMED_DYNAMIC));

    FillColours(hwnd, edited);
    FillSizes(hwnd, edited);
    if (edited) {
        CheckDlgButton(hwnd, IDC_WMED_ITALIC, edited->lfFont.lfItalic ? BST_CHECKED : BST_UNCHECKED);
        CheckDlgButton(hwnd, IDC_WMED_OUTLINE, edited->bOutline ? BST_CHECKED : BST_UNCHECKED);
        CheckDlgButton(hwnd, IDC_WMED_UNDERLINE, edited->lfFont.lfUnderline ? BST_CHECKED : BST_UNCHECKED);
        CheckDlgButton(hwnd, IDC_WMED_BOLD, edited->lfFont.lfWeight == FW_BOLD ? BST_CHECKED : BST_UNCHECKED);
        CheckDlgButton(hwnd, IDC_WMED_STRIKEOUT, edited->lfFont.lfStrikeOut ? BST_CHECKED : BST_UNCHECKED);
    }
    g_lastSize = g_lastShortSize = edited ? edited->iPointSize : 72;
    g_lastIntensity = intensity;
    g_lastAngle = angle;

    HWND previewWnd = GetDlgItem(hwnd, IDC_WMED_PREVIEW);
    SetWindowLongPtrW(previewWnd, GWLP_USERDATA, reinterpret_cast<LONG_PTR>(ctx));
    g_prevPreviewProc = reinterpret_cast<WNDPROC>(
        SetWindowLongPtrW(previewWnd, GWLP_WNDPROC, reinterpret_cast<LONG_PTR>(PreviewProc)));
}

// ---- field checks -----------------------------------------------------------

void UpdateOkButton(HWND hwnd)
{
    WCHAR name[128], text[128];
    GetDlgItemTextW(hwnd, IDC_WMED_NAME, name, 128);
    GetDlgItemTextW(hwnd, IDC_WMED_TEXT, text, 128);
    EnableWindow(GetDlgItem(hwnd, IDOK), !IsBlankOrEmpty(name) && !IsBlankOrEmpty(text));
}

void CheckSizeField(HWND hwnd)
{
    HWND combo = GetDlgItem(hwnd, IDC_WMED_SIZE);
    WCHAR text[8] = {};
    GetWindowTextW(combo, text, 4);
    for (WCHAR* p = text; *p; ++p) {
        if (*p < L'0' || *p > L'9') {
            std::memmove(p, p + 1, (lstrlenW(p + 1) + 1) * sizeof(WCHAR));
            SetWindowTextW(combo, text);
            const int end = lstrlenW(text);
            SendMessageW(combo, CB_SETEDITSEL, 0, MAKELPARAM(end, end));
            break;
        }
    }
    int v = _wtoi(text);
    if (!text[0]) {
        v = g_lastShortSize;
        SetNumber(hwnd, IDC_WMED_SIZE, v);
    } else if (v > 500 || v < 1) {
        v = g_lastSize;
        SetNumber(hwnd, IDC_WMED_SIZE, v);
    }
    if (GetWindowTextLengthW(combo) < 2)
        g_lastShortSize = v;
    g_lastSize = v;
}

void CheckIntensityField(HWND hwnd)
{
    WCHAR text[8];
    int v = FieldNumber(hwnd, IDC_WMED_INTENSITY, 3, text);
    if (v > 100 || v < 1 || !text[0])
        v = g_lastIntensity;
    SetSpin(hwnd, IDC_WMED_INTENSITY_SPIN, v);
    g_lastIntensity = v;
}

void CheckAngleField(HWND hwnd)
{
    WCHAR text[8];
    int v = FieldNumber(hwnd, IDC_WMED_ANGLE, 5, text);
    const BOOL lone = lstrcmpW(text, L"-") == 0;
    if (v > 180 || v < -180 || !text[0] || lone)
        v = g_lastAngle;
    ++g_spinWriting;
    if (!text[0] || (lone && v == 0))
        SetDlgItemTextW(hwnd, IDC_WMED_ANGLE, L"0");
    --g_spinWriting;
    SetSpin(hwnd, IDC_WMED_ANGLE_SPIN, v);
    g_lastAngle = v;
}

// ---- commands ---------------------------------------------------------------

void OnDynamicVariables(HWND hwnd, PAGECONTEXT* ctx)
{
    GetDlgItemTextW(hwnd, IDC_WMED_TEXT, ctx->szTextBuffer, 128);
    if (IsolatedDialogBoxParam(ModuleInstance(), MAKEINTRESOURCEW(IDD_101), hwnd, DynamicVariablesDialogProc,
                               reinterpret_cast<LPARAM>(ctx)) == 1) {
        ctx->dwDialogOutcome = DLGOUTCOME_CHANGED;
        ctx->szTextBuffer[127] = 0;
        SetDlgItemTextW(hwnd, IDC_WMED_TEXT, ctx->szTextBuffer);
        Repaint(hwnd);
    }
}

void OnPlacement(HWND hwnd, PAGECONTEXT* ctx)
{
    WATERMARK* preview = ctx->pPreviewRecord;
    if (!preview)
        return;
    RefreshPreviewRecord(hwnd, *preview);
    if (IsolatedDialogBoxParam(ModuleInstance(), MAKEINTRESOURCEW(IDD_220), hwnd, PlacementDialogProc,
                               reinterpret_cast<LPARAM>(ctx)) == 1) {
        ctx->dwDialogOutcome = DLGOUTCOME_CHANGED;
        Repaint(hwnd);
        return;
    }
    ctx->dwDialogOutcome = DLGOUTCOME_UNCHANGED;
    if (ctx->dwDialogMode == DLGMODE_EDIT && ctx->pEditedRecord)
        CopyPlacement(*preview, ctx->pEditedRecord->wm);
    else
        ResetPlacement(*preview);
}

BOOL Fail(HWND hwnd, UINT idText, int focus = 0)
{
    ShowPluginMessage(hwnd, idText, IDS_STR_12, MB_ICONHAND);
    if (focus)
        SetFocus(GetDlgItem(hwnd, focus));
    return FALSE;
}

BOOL CheckName(HWND hwnd, PAGECONTEXT* ctx, const WCHAR* name)
{
    WCHAR none[25], other[128];
    LoadNoneText(none);
    for (const WatermarkNode* n = ctx->pWatermarkList; n; n = n->next) {
        if (n == ctx->pEditedRecord)
            continue;
        RecordName(n->wm, other);
        if (lstrcmpiW(other, name) == 0)
            return Fail(hwnd, IDS_STR_98, IDC_WMED_NAME);
        if (lstrcmpW(name, none) == 0)
            return Fail(hwnd, IDS_STR_160, IDC_WMED_NAME);
    }
    if (lstrcmpW(name, L"(Нет)") == 0)
        return Fail(hwnd, IDS_STR_160, IDC_WMED_NAME);
    return TRUE;
}

void OnOk(HWND hwnd, PAGECONTEXT* ctx)
{
    WCHAR name[128], text[128], intensity[8];
    GetDlgItemTextW(hwnd, IDC_WMED_NAME, name, 128);
    for (int n = lstrlenW(name); n > 0 && name[n - 1] == L' '; --n)
        name[n - 1] = 0;
    if (!CheckName(hwnd, ctx, name))
        return;
    if (!name[0]) {
        Fail(hwnd, IDS_STR_14);
        return;
    }
    if (GetDlgItemTextW(hwnd, IDC_WMED_TEXT, text, 128) == 0) {
        Fail(hwnd, IDS_STR_15);
        return;
    }
    if (GetDlgItemTextW(hwnd, IDC_WMED_INTENSITY, intensity, 8) == 0) {
        Fail(hwnd, IDS_STR_16);
        return;
    }
    if (Checked(hwnd, IDC_WMED_DYNAMIC)) {
        WCHAR check[DYNTEXT_CCH];
        StringCchCopyW(check, DYNTEXT_CCH, text);
        if (!ExpandDynamicText(nullptr, nullptr, check, nullptr, ctx->szPrinterName, ctx->szDriverName, 1,
                               WMDRAW_PREVIEW)) {
            Fail(hwnd, IDS_STR_173, IDC_WMED_TEXT);
            return;
        }
    }
    if (ctx->dwDialogMode != DLGMODE_EDIT || !ctx->pEditedRecord) {
        WatermarkNode* node = AppendWatermarkNode(&ctx->pWatermarkList, GetProcessHeap());
        if (!node)
            return;  // out of memory: the dialog stays open, nothing half-added
        ctx->pEditedRecord = node;
    }
    WATERMARK& wm = ctx->pEditedRecord->wm;
    std::memset(wm.szName, 0, sizeof(wm.szName));
    std::memset(wm.szText, 0, sizeof(wm.szText));
    StringCchCopyW(wm.szName, 128, name);
    StringCchCopyW(wm.szText, 128, text);
    ReadAppearance(hwnd, wm, 4);
    if (ctx->pPreviewRecord)
        CopyPlacement(wm, *ctx->pPreviewRecord);
    ctx->dwDialogOutcome = DLGOUTCOME_CHANGED;
    if (HWND page = WatermarkPageOf(hwnd))
        EnableEditDeleteButtons(page, TRUE);
    EndDialog(hwnd, 1);
}

void OnCommand(HWND hwnd, PAGECONTEXT* ctx, int id, int code)
{
    switch (id) {
    case IDC_WMED_NAME:
        if (code == EN_CHANGE)
            UpdateOkButton(hwnd);
        break;
    case IDC_WMED_TEXT:
        if (code == EN_UPDATE) {
            UpdateOkButton(hwnd);
            Repaint(hwnd);
        }
        break;
    case IDC_WMED_SIZE:
        if (code == CBN_EDITCHANGE)
            CheckSizeField(hwnd);
        Repaint(hwnd);
        break;
    case IDC_WMED_INTENSITY:
        if (code == EN_CHANGE && !g_spinWriting) {
            CheckIntensityField(hwnd);
            Repaint(hwnd);
        }
        break;
    case IDC_WMED_ANGLE:
        if (code == EN_CHANGE && !g_spinWriting) {
            CheckAngleField(hwnd);
            Repaint(hwnd);
        }
        break;
    case IDC_WMED_FONT:
    case IDC_WMED_COLOUR:
        if (code == CBN_SELCHANGE)
            Repaint(hwnd);
        break;
    case IDC_WMED_BOLD:
    case IDC_WMED_ITALIC:
    case IDC_WMED_STRIKEOUT:
    case IDC_WMED_UNDERLINE:
    case IDC_WMED_OUTLINE:
    case IDC_WMED_DYNAMIC:
        if (code == BN_CLICKED) {
            EnableWindow(GetDlgItem(hwnd, IDC_WMED_DYNSETUP), Checked(hwnd, IDC_WMED_DYNAMIC));
            Repaint(hwnd);
        }
        break;
    case IDC_WMED_DYNSETUP:
        if (code == BN_CLICKED)
            OnDynamicVariables(hwnd, ctx);
        break;
    case IDC_WMED_PLACE:
        if (code == BN_CLICKED)
            OnPlacement(hwnd, ctx);
        break;
    case IDOK:
        OnOk(hwnd, ctx);
        break;
    case IDCANCEL:
        EndDialog(hwnd, 1);
        break;
    default:
        break;
    }
}

BOOL OnDrawColour(const DRAWITEMSTRUCT* di)
{
    HDC dc = di->hDC;
    COLORREF back, fore;
    if (di->itemState & ODS_FOCUS) {
        back = GetSysColor(COLOR_HIGHLIGHT);
        fore = GetSysColor(COLOR_WINDOW);
    } else if (di->itemState & ODS_SELECTED) {
        back = GetSysColor(COLOR_HIGHLIGHT);
        fore = GetSysColor(COLOR_HIGHLIGHTTEXT);
    } else {
        back = GetSysColor(COLOR_WINDOW);
        fore = GetSysColor(COLOR_WINDOWTEXT);
    }
    RECT rc = di->rcItem;
    HBRUSH backBrush = CreateSolidBrush(back);
    if (backBrush) {
        FillRect(dc, &rc, backBrush);
        DeleteObject(backBrush);
    }
    if (di->itemID >= static_cast<UINT>(kColourCount))
        return TRUE;
    const ColourEntry& entry = kColours[di->itemID];
    if (HBRUSH swatch = CreateSolidBrush(entry.colour)) {
        HGDIOBJ old = SelectObject(dc, swatch);
        Rectangle(dc, rc.left + 2, rc.top + 2, rc.left + 18, rc.bottom - 2);
        RECT inner = {rc.left + 3, rc.top + 3, rc.left + 17, rc.bottom - 3};
        FillRect(dc, &inner, swatch);
        SelectObject(dc, old);
        DeleteObject(swatch);
    }
    SetTextColor(dc, fore);
    SetBkColor(dc, back);
    WCHAR name[32];
    LoadPluginString(entry.idName, name, 32);
    rc.left += 28;
    DrawTextW(dc, name, -1, &rc, DT_SINGLELINE | DT_VCENTER);
    return TRUE;
}

void FreePreview(PAGECONTEXT* ctx)
{
    if (ctx && ctx->pPreviewRecord) {
        HeapFree(GetProcessHeap(), 0, ctx->pPreviewRecord);
        ctx->pPreviewRecord = nullptr;
    }
}

}  // namespace

INT_PTR CALLBACK WatermarkEditDialogProc(HWND hwnd, UINT msg, WPARAM wParam, LPARAM lParam)
{
    if (msg == WM_INITDIALOG) {
        OnInit(hwnd, reinterpret_cast<PAGECONTEXT*>(lParam));
        return TRUE;
    }
    PAGECONTEXT* ctx = DialogContext(hwnd);
    if (!ctx)
        return FALSE;
    switch (msg) {
    case WM_DRAWITEM:
        if (wParam == IDC_WMED_COLOUR)
            return OnDrawColour(reinterpret_cast<const DRAWITEMSTRUCT*>(lParam));
        return FALSE;
    case WM_NOTIFY: {
        auto* nm = reinterpret_cast<const NMHDR*>(lParam);
        if (nm->idFrom == IDC_WMED_INTENSITY_SPIN && nm->code == UDN_DELTAPOS)
            Repaint(hwnd);
        return FALSE;
    }
    case WM_COMMAND:
        OnCommand(hwnd, ctx, LOWORD(wParam), HIWORD(wParam));
        return TRUE;
    case WM_DESTROY:
        // Every way out of the dialog returns the scratch record.
        FreePreview(ctx);
        return FALSE;
    default:
        return FALSE;
    }
}
