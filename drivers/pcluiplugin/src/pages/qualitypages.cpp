// The black-and-white print-quality page and the RGB print-quality dialog:
// brightness, contrast, saturation, grey correction and thin-line enhancement.
#include "pages/qualitypages.h"

#include "frame/pagenotify.h"
#include "frame/dialogutil.h"
#include "resources/resource.h"

#include <cstring>

namespace {

struct Range {
    INT lo, hi;
};
constexpr Range kBrightnessRange = {-6, 6};
constexpr Range kLevelRange = {0, 5};  // contrast and saturation

const int kMonoTrackbars[] = {IDC_BWQ_BRIGHTNESS, IDC_BWQ_CONTRAST};
const int kRgbTrackbars[] = {IDC_RGBQ_BRIGHTNESS, IDC_RGBQ_CONTRAST, IDC_RGBQ_SATURATION};

void SetUpTrackbar(HWND hwnd, int id, Range r)
{
    HWND tb = GetDlgItem(hwnd, id);
    SendMessageW(tb, TBM_SETRANGEMIN, FALSE, r.lo);
    SendMessageW(tb, TBM_SETRANGEMAX, TRUE, r.hi);
    SendMessageW(tb, TBM_SETLINESIZE, 0, 1);
    SendMessageW(tb, TBM_SETTICFREQ, 1, 0);
    SendMessageW(tb, TBM_SETPAGESIZE, 0, 1);
}

// Stored values are not trusted: one outside the range shows at its nearest end.
void SetTrackbarPos(HWND hwnd, int id, Range r, INT value)
{
    const INT pos = value < r.lo ? r.lo : (value > r.hi ? r.hi : value);
    SendDlgItemMessageW(hwnd, id, TBM_SETPOS, TRUE, pos);
}

INT TrackbarPos(HWND hwnd, int id) { return static_cast<INT>(SendDlgItemMessageW(hwnd, id, TBM_GETPOS, 0, 0)); }

void Check(HWND hwnd, int id, INT on) { CheckDlgButton(hwnd, id, on ? BST_CHECKED : BST_UNCHECKED); }

INT Checked(HWND hwnd, int id) { return IsDlgButtonChecked(hwnd, id) == BST_CHECKED ? 1 : 0; }

template <size_t N> BOOL IsOneOf(UINT_PTR id, const int (&ids)[N])
{
    for (int i : ids)
        if (static_cast<UINT_PTR>(i) == id)
            return TRUE;
    return FALSE;
}

// ---- black-and-white print-quality page (229) --------------------------------

struct MonoQuality {
    INT Brightness, Contrast, GrayCorr, EnhanceLines;
};

void EnableMonoTrackbars(HWND hwnd, BOOL on)
{
    for (int id : kMonoTrackbars)
        EnableWindow(GetDlgItem(hwnd, id), on);
}

void ShowMonoQuality(HWND hwnd, const MonoQuality& q)
{
    SetUpTrackbar(hwnd, IDC_BWQ_BRIGHTNESS, kBrightnessRange);
    SetUpTrackbar(hwnd, IDC_BWQ_CONTRAST, kLevelRange);
    SetTrackbarPos(hwnd, IDC_BWQ_BRIGHTNESS, kBrightnessRange, q.Brightness);
    SetTrackbarPos(hwnd, IDC_BWQ_CONTRAST, kLevelRange, q.Contrast);
    Check(hwnd, IDC_BWQ_GRAYCORR, q.GrayCorr);
    Check(hwnd, IDC_BWQ_ENHANCE, q.EnhanceLines);
    // Without grey correction the levels keep their positions but cannot be moved.
    EnableMonoTrackbars(hwnd, q.GrayCorr != 0);
}

MonoQuality ReadMonoQuality(HWND hwnd)
{
    return {TrackbarPos(hwnd, IDC_BWQ_BRIGHTNESS), TrackbarPos(hwnd, IDC_BWQ_CONTRAST),
            Checked(hwnd, IDC_BWQ_GRAYCORR), Checked(hwnd, IDC_BWQ_ENHANCE)};
}

void MarkPageChanged(HWND hwnd) { PropSheet_Changed(GetParent(hwnd), hwnd); }

BOOL OnMonoInitDialog(HWND hwnd, PAGECONTEXT* ctx)
{
    IsolatedInitCommonControls();
    SetWindowLongPtrW(hwnd, GWLP_USERDATA, reinterpret_cast<LONG_PTR>(ctx));
    if (!ctx)
        return TRUE;
    if (const OEMDEV* oem = ctx->pOemDevmode)
        ShowMonoQuality(hwnd, {oem->Brightness, oem->Contrast, oem->GrayCorr, oem->EnhanceLines});
    else
        ShowMonoQuality(hwnd, {ctx->ws.Brightness, ctx->ws.Contrast, ctx->ws.GrayCorr, ctx->ws.EnhanceLines});
    if (ctx->bNoPermission)
        DisableAllChildren(hwnd);
    return TRUE;
}

BOOL OnMonoSetActive(HWND hwnd, PAGECONTEXT* ctx)
{
    const WORKINGSETTINGS& ws = ctx->ws;
    ShowMonoQuality(hwnd, {ws.Brightness, ws.Contrast, ws.GrayCorr, ws.EnhanceLines});
    if (ctx->bNoPermission)
        DisableAllChildren(hwnd);
    return FALSE;
}

BOOL OnMonoKillActive(HWND hwnd, PAGECONTEXT* ctx)
{
    if (ctx->bNoPermission)
        return FALSE;
    const MonoQuality q = ReadMonoQuality(hwnd);
    ctx->ws.Brightness = q.Brightness;
    ctx->ws.Contrast = q.Contrast;
    ctx->ws.GrayCorr = q.GrayCorr;
    ctx->ws.EnhanceLines = q.EnhanceLines;
    ctx->bApplied = 1;
    return FALSE;
}

BOOL OnMonoApply(HWND hwnd, PAGECONTEXT* ctx)
{
    if (ctx->bNoPermission)
        return FALSE;
    if (OEMDEV* oem = ctx->pOemDevmode) {
        const MonoQuality q = ReadMonoQuality(hwnd);
        oem->Brightness = q.Brightness;
        oem->Contrast = q.Contrast;
        oem->GrayCorr = q.GrayCorr;
        oem->EnhanceLines = q.EnhanceLines;
    }
    ctx->bApplied = 1;
    return FALSE;
}

BOOL OnMonoNotify(HWND hwnd, PAGECONTEXT* ctx, const NMHDR* nm)
{
    if (nm->code == NM_RELEASEDCAPTURE) {
        if (IsOneOf(nm->idFrom, kMonoTrackbars))
            MarkPageChanged(hwnd);
        return FALSE;
    }
    static const PageHandlers handlers = {OnMonoSetActive, OnMonoKillActive, OnMonoApply};
    return DispatchPageNotify(hwnd, ctx, nm, handlers);
}

// ---- RGB print-quality dialog (231) -----------------------------------------

// TRUE when the driver's current "ColorMode" option is "Mono"; a driver that
// cannot answer counts as colour.
BOOL IsMonoColourMode(const PAGECONTEXT* ctx)
{
    if (!ctx->pDriverUI || !ctx->pParam)
        return FALSE;
    char option[10] = {};
    DWORD cbNeeded = 0, cOptions = 0;
    if (ctx->pDriverUI->DrvGetDriverSetting(ctx->pParam->poemuiobj, "ColorMode", option, sizeof(option), &cbNeeded,
                                            &cOptions) != S_OK)
        return FALSE;
    return std::memcmp(option, "Mono", sizeof("Mono")) == 0;
}

// Tells the sheet that owns the dialog that its current page changed.
void MarkOwnerChanged(HWND hwnd)
{
    HWND owner = GetWindow(hwnd, GW_OWNER);
    if (!owner)
        return;
    HWND page = PropSheet_GetCurrentPageHwnd(owner);
    SendMessageW(owner, PSM_CHANGED, reinterpret_cast<WPARAM>(page ? page : hwnd), 0);
}

BOOL OnRgbInitDialog(HWND hwnd, PAGECONTEXT* ctx)
{
    if (!ctx)
        return TRUE;
    SetWindowLongPtrW(hwnd, GWLP_USERDATA, reinterpret_cast<LONG_PTR>(ctx));
    const WORKINGSETTINGS& ws = ctx->ws;
    SetUpTrackbar(hwnd, IDC_RGBQ_BRIGHTNESS, kBrightnessRange);
    SetUpTrackbar(hwnd, IDC_RGBQ_CONTRAST, kLevelRange);
    SetUpTrackbar(hwnd, IDC_RGBQ_SATURATION, kLevelRange);
    SetTrackbarPos(hwnd, IDC_RGBQ_BRIGHTNESS, kBrightnessRange, ws.Brightness);
    SetTrackbarPos(hwnd, IDC_RGBQ_CONTRAST, kLevelRange, ws.Contrast);
    SetTrackbarPos(hwnd, IDC_RGBQ_SATURATION, kLevelRange, ws.ImageSaturation);
    if (IsMonoColourMode(ctx))
        EnableWindow(GetDlgItem(hwnd, IDC_RGBQ_SATURATION), FALSE);
    Check(hwnd, IDC_RGBQ_ENHANCE, ws.EnhanceLines);
    if (ctx->bNoPermission) {
        DisableAllChildren(hwnd);
        // A modal dialog must still be closable; Cancel stores nothing.
        EnableWindow(GetDlgItem(hwnd, IDCANCEL), TRUE);
    }
    return TRUE;
}

void OnRgbOk(HWND hwnd, PAGECONTEXT* ctx)
{
    if (!ctx || ctx->bNoPermission) {
        EndDialog(hwnd, 2);
        return;
    }
    ctx->ws.Brightness = TrackbarPos(hwnd, IDC_RGBQ_BRIGHTNESS);
    ctx->ws.Contrast = TrackbarPos(hwnd, IDC_RGBQ_CONTRAST);
    ctx->ws.ImageSaturation = TrackbarPos(hwnd, IDC_RGBQ_SATURATION);
    ctx->ws.EnhanceLines = Checked(hwnd, IDC_RGBQ_ENHANCE);
    EndDialog(hwnd, 1);
}

}  // namespace

INT_PTR CALLBACK MonoQualityPageProc(HWND hwnd, UINT msg, WPARAM wParam, LPARAM lParam)
{
    if (msg == WM_INITDIALOG) {
        return OnMonoInitDialog(hwnd, PageContextFromInit(lParam));
    }
    PAGECONTEXT* ctx = PageContextOf(hwnd);
    if (!ctx)
        return FALSE;
    switch (msg) {
    case WM_COMMAND:
        // A click on one of the page's controls.
        if (HIWORD(wParam) == BN_CLICKED && lParam) {
            EnableMonoTrackbars(hwnd, IsDlgButtonChecked(hwnd, IDC_BWQ_GRAYCORR) == BST_CHECKED);
            MarkPageChanged(hwnd);
        }
        return FALSE;
    case WM_HSCROLL:
        if (lParam)
            MarkPageChanged(hwnd);
        return FALSE;
    case WM_NOTIFY:
        return OnMonoNotify(hwnd, ctx, reinterpret_cast<const NMHDR*>(lParam));
    default:
        return FALSE;
    }
}

INT_PTR CALLBACK RgbQualityDialogProc(HWND hwnd, UINT msg, WPARAM wParam, LPARAM lParam)
{
    if (msg == WM_INITDIALOG)
        return OnRgbInitDialog(hwnd, reinterpret_cast<PAGECONTEXT*>(lParam));
    PAGECONTEXT* ctx = PageContextOf(hwnd);
    switch (msg) {
    case WM_COMMAND:
        switch (LOWORD(wParam)) {
        case IDOK:
            OnRgbOk(hwnd, ctx);
            return TRUE;
        case IDCANCEL:
            EndDialog(hwnd, 2);
            return TRUE;
        default:
            if (ctx && HIWORD(wParam) == BN_CLICKED && lParam)
                MarkOwnerChanged(hwnd);
            return FALSE;
        }
    case WM_HSCROLL:
        if (ctx && lParam)
            MarkOwnerChanged(hwnd);
        return FALSE;
    case WM_NOTIFY:
        if (ctx && reinterpret_cast<const NMHDR*>(lParam)->code == NM_RELEASEDCAPTURE &&
            IsOneOf(reinterpret_cast<const NMHDR*>(lParam)->idFrom, kRgbTrackbars))
            MarkOwnerChanged(hwnd);
        return FALSE;
    case WM_HELP:
        if (ctx)
            ShowDriverHelp(hwnd, ctx->hPrinter);
        return TRUE;
    default:
        return FALSE;
    }
}
