// Placing the watermark being added or edited: anchors, offsets and unit,
// worked on the add/edit dialog's preview record only.
#include "resources/resource.h"
#include "watermark/renderer.h"
#include "watermark/dyntext.h"
#include "watermarkui/wmdialogs.h"
#include "watermarkui/wmpage.h"

#include <commctrl.h>
#include <strsafe.h>
#include <cmath>
#include <cwchar>
#include <cstdlib>
#include <initializer_list>

namespace {

constexpr double kMmPerInch = 25.4;
constexpr double kInchPerMm = 0.03937007874015748;

BOOL g_inches = TRUE;       // unit in force
int g_writeDepth = 0;       // > 0 while this dialog writes an offset field
WNDPROC g_prevPreviewProc = nullptr;

WATERMARK* Record(HWND hwnd)
{
    PAGECONTEXT* ctx = DialogContext(hwnd);
    return ctx ? ctx->pPreviewRecord : nullptr;
}

double Limit(BOOL inches) { return inches ? kMaxOffsetInches : kMaxOffsetMm; }

void WriteOffset(HWND hwnd, int id, double v, size_t cch = 11)
{
    WCHAR text[32];
    StringCchPrintfW(text, cch < 32 ? cch : 32, L"%.1f", v);
    ++g_writeDepth;
    SetDlgItemTextW(hwnd, id, text);
    --g_writeDepth;
}

double ReadFieldNumber(HWND hwnd, int id)
{
    WCHAR text[11] = {};
    GetDlgItemTextW(hwnd, id, text, 11);
    return std::wcstod(text, nullptr);
}

double& OffsetOf(WATERMARK& wm, int id) { return id == IDC_WMPL_VOFFSET ? wm.dVertOffset : wm.dHorzOffset; }

void Repaint(HWND hwnd) { InvalidateRect(GetDlgItem(hwnd, IDC_WMPL_PREVIEW), nullptr, TRUE); }

void ReadPlacementRadios(HWND hwnd, WATERMARK& wm)
{
    auto checked = [hwnd](int id) { return IsDlgButtonChecked(hwnd, id) == BST_CHECKED; };
    wm.iVertPos = checked(IDC_WMPL_TOP) ? WM_VPOS_TOP : checked(IDC_WMPL_VCENTRE) ? WM_POS_CENTRE : WM_VPOS_BOTTOM;
    wm.iHorzPos = checked(IDC_WMPL_LEFT) ? WM_HPOS_LEFT : checked(IDC_WMPL_HCENTRE) ? WM_POS_CENTRE : WM_HPOS_RIGHT;
    wm.iUnits = checked(IDC_WMPL_INCHES) ? WM_UNITS_INCHES : WM_UNITS_MM;
}

// Stored data this dialog did not write may hold offsets beyond the unit's
// limits (or no number at all); they are brought into range once, here, so
// that the fields' spring-back always lands on a valid text.
double InRange(double v, BOOL inches)
{
    if (std::isnan(v))
        return 0.0;
    const double lim = Limit(inches);
    return v > lim ? lim : v < -lim ? -lim : v;
}

LRESULT CALLBACK PreviewProc(HWND hwnd, UINT msg, WPARAM wParam, LPARAM lParam)
{
    if (msg != WM_PAINT)
        return CallWindowProcW(g_prevPreviewProc, hwnd, msg, wParam, lParam);
    return PaintWatermarkPreview(hwnd, ReadPlacementRadios);
}

void OnInit(HWND hwnd, PAGECONTEXT* ctx)
{
    SetWindowLongPtrW(hwnd, GWLP_USERDATA, reinterpret_cast<LONG_PTR>(ctx));
    HWND preview = GetDlgItem(hwnd, IDC_WMPL_PREVIEW);
    SetWindowLongPtrW(preview, GWLP_USERDATA, reinterpret_cast<LONG_PTR>(ctx));
    g_prevPreviewProc =
        reinterpret_cast<WNDPROC>(SetWindowLongPtrW(preview, GWLP_WNDPROC, reinterpret_cast<LONG_PTR>(PreviewProc)));
    if (!ctx || !ctx->pPreviewRecord)
        return;
    WATERMARK& wm = *ctx->pPreviewRecord;
    CheckRadioButton(hwnd, IDC_WMPL_TOP, IDC_WMPL_BOTTOM,
                     wm.iVertPos == WM_VPOS_TOP ? IDC_WMPL_TOP : wm.iVertPos == WM_POS_CENTRE ? IDC_WMPL_VCENTRE : IDC_WMPL_BOTTOM);
    CheckRadioButton(hwnd, IDC_WMPL_LEFT, IDC_WMPL_RIGHT,
                     wm.iHorzPos == WM_HPOS_LEFT ? IDC_WMPL_LEFT : wm.iHorzPos == WM_POS_CENTRE ? IDC_WMPL_HCENTRE : IDC_WMPL_RIGHT);
    g_inches = wm.iUnits == WM_UNITS_INCHES;
    CheckRadioButton(hwnd, IDC_WMPL_INCHES, IDC_WMPL_MM, g_inches ? IDC_WMPL_INCHES : IDC_WMPL_MM);
    SendDlgItemMessageW(hwnd, IDC_WMPL_HOFFSET, EM_LIMITTEXT, 10, 0);
    SendDlgItemMessageW(hwnd, IDC_WMPL_VOFFSET, EM_LIMITTEXT, 10, 0);
    wm.dHorzOffset = InRange(wm.dHorzOffset, g_inches);
    wm.dVertOffset = InRange(wm.dVertOffset, g_inches);
    WriteOffset(hwnd, IDC_WMPL_HOFFSET, wm.dHorzOffset);
    WriteOffset(hwnd, IDC_WMPL_VOFFSET, wm.dVertOffset);
}

void OnOffsetUpdate(HWND hwnd, int id)
{
    WATERMARK* wm = Record(hwnd);
    if (!wm)
        return;
    WCHAR text[11] = {};
    GetDlgItemTextW(hwnd, id, text, 11);
    if (IsValidOffsetText(text, g_inches)) {
        OffsetOf(*wm, id) = std::wcstod(text, nullptr);
        Repaint(hwnd);
        return;
    }
    // A write of ours that still does not parse must not start another.
    if (g_writeDepth > 1)
        return;
    WriteOffset(hwnd, id, std::trunc(OffsetOf(*wm, id) * 10.0) * 0.1);
}

void SwitchUnit(HWND hwnd, BOOL toInches)
{
    WATERMARK* wm = Record(hwnd);
    if (!wm)
        return;
    if (g_inches != toInches) {
        wm->iUnits = toInches ? WM_UNITS_INCHES : WM_UNITS_MM;
        g_inches = toInches;
        for (int id : {IDC_WMPL_HOFFSET, IDC_WMPL_VOFFSET}) {
            double v = ReadFieldNumber(hwnd, id) * (toInches ? kInchPerMm : kMmPerInch);
            if (toInches)
                v = InRange(v, TRUE);
            OffsetOf(*wm, id) = v;
            WriteOffset(hwnd, id, v, 10);
        }
    }
    Repaint(hwnd);
}

void OnCentre(HWND hwnd)
{
    CheckRadioButton(hwnd, IDC_WMPL_TOP, IDC_WMPL_BOTTOM, IDC_WMPL_VCENTRE);
    CheckRadioButton(hwnd, IDC_WMPL_LEFT, IDC_WMPL_RIGHT, IDC_WMPL_HCENTRE);
    if (WATERMARK* wm = Record(hwnd)) {
        wm->dHorzOffset = 0.0;
        wm->dVertOffset = 0.0;
    }
    WriteOffset(hwnd, IDC_WMPL_HOFFSET, 0.0);
    WriteOffset(hwnd, IDC_WMPL_VOFFSET, 0.0);
    Repaint(hwnd);
}

void OnSpin(HWND hwnd, const NMUPDOWN* nm)
{
    const int field = nm->hdr.idFrom == IDC_WMPL_VOFFSET_SPIN ? IDC_WMPL_VOFFSET : IDC_WMPL_HOFFSET;
    WATERMARK* wm = Record(hwnd);
    if (!wm)
        return;
    const double step = IsDlgButtonChecked(hwnd, IDC_WMPL_INCHES) == BST_CHECKED ? 0.1 : 1.0;
    double v = ReadFieldNumber(hwnd, field) + (nm->iDelta < 0 ? step : -step);
    const double lim = Limit(g_inches);
    if (v > lim || v < -lim)
        v = OffsetOf(*wm, field);
    WriteOffset(hwnd, field, v);
    OffsetOf(*wm, field) = v;
    Repaint(hwnd);
}

}  // namespace

BOOL IsValidOffsetText(LPCWSTR text, BOOL bInches)
{
    if (!text || !text[0] || lstrcmpW(text, L"-") == 0)
        return FALSE;
    int minus = 0, points = 0;
    for (const WCHAR* p = text; *p; ++p) {
        if (*p == L'-') {
            if (p != text)
                return FALSE;
            ++minus;
        } else if (*p == L'.') {
            ++points;
        } else if (*p < L'0' || *p > L'9') {
            return FALSE;
        }
    }
    if (minus > 1 || points > 1)
        return FALSE;
    const double v = std::wcstod(text, nullptr);
    const double lim = Limit(bInches);
    return v <= lim && v >= -lim;
}

INT_PTR CALLBACK PlacementDialogProc(HWND hwnd, UINT msg, WPARAM wParam, LPARAM lParam)
{
    switch (msg) {
    case WM_INITDIALOG:
        OnInit(hwnd, reinterpret_cast<PAGECONTEXT*>(lParam));
        return TRUE;
    case WM_NOTIFY: {
        auto* nm = reinterpret_cast<const NMHDR*>(lParam);
        if (nm->code == UDN_DELTAPOS && (nm->idFrom == IDC_WMPL_VOFFSET_SPIN || nm->idFrom == IDC_WMPL_HOFFSET_SPIN)) {
            OnSpin(hwnd, reinterpret_cast<const NMUPDOWN*>(lParam));
            SetWindowLongPtrW(hwnd, DWLP_MSGRESULT, 0);
            return TRUE;
        }
        return FALSE;
    }
    case WM_COMMAND: {
        const int id = LOWORD(wParam), code = HIWORD(wParam);
        switch (id) {
        case IDC_WMPL_VOFFSET:
        case IDC_WMPL_HOFFSET:
            if (code == EN_UPDATE)
                OnOffsetUpdate(hwnd, id);
            return TRUE;
        case IDC_WMPL_INCHES:
        case IDC_WMPL_MM:
            if (code == BN_CLICKED)
                SwitchUnit(hwnd, id == IDC_WMPL_INCHES);
            return TRUE;
        case IDC_WMPL_TOP: case IDC_WMPL_VCENTRE: case IDC_WMPL_BOTTOM:
        case IDC_WMPL_LEFT: case IDC_WMPL_HCENTRE: case IDC_WMPL_RIGHT:
            if (code == BN_CLICKED)
                Repaint(hwnd);
            return TRUE;
        case IDC_WMPL_CENTRE:
            if (code == BN_CLICKED)
                OnCentre(hwnd);
            return TRUE;
        case IDOK:
            if (WATERMARK* wm = Record(hwnd))
                ReadPlacementRadios(hwnd, *wm);
            EndDialog(hwnd, 1);
            return TRUE;
        case IDCANCEL:
            EndDialog(hwnd, 2);
            return TRUE;
        default:
            return FALSE;
        }
    }
    default:
        return FALSE;
    }
}
