#include "watermark/renderer.h"

#include "frame/scoped.h"
#include "watermark/escapes.h"

#include <cmath>
#include <cstring>

namespace {

constexpr double DEG_TO_RAD = 0.017453292519943295;
constexpr double MM_TO_INCH = 0.03937007874015748;
constexpr int DEFAULT_PRINT_DPI = 600;

int Half(int v) { return v / 2; }

// The job's settings that size and place the text at print time.
struct PrintGeometry {
    int dpi = 0;
    int scalePercent = 100;
    int orientation = 0;
};

PrintGeometry ReadPrintGeometry(HDC hdc)
{
    DEVMODEW dm;
    PrintGeometry g;
    FetchPublicDevmode(hdc, &dm);
    g.dpi = dm.dmPrintQuality;
    if (g.dpi < 0)
        g.dpi = DEFAULT_PRINT_DPI;  // a resolution code, not dots per inch
    if (g.dpi == 0)
        g.dpi = GetDeviceCaps(hdc, LOGPIXELSY);  // no devmode: the device's own resolution
    // A zero or negative scale would print nothing or a mirror image.
    g.scalePercent = dm.dmScale > 0 ? dm.dmScale : 100;
    g.orientation = dm.dmOrientation;
    return g;
}

BYTE FadeChannel(BYTE c, BYTE intensity)
{
    int v = 255 - MulDiv(255 - c, intensity, 100);
    return static_cast<BYTE>(v < 0 ? 0 : (v > 255 ? 255 : v));
}

COLORREF FadedColour(const WATERMARK& wm)
{
    return RGB(FadeChannel(GetRValue(wm.crColor), wm.bIntensity), FadeChannel(GetGValue(wm.crColor), wm.bIntensity),
               FadeChannel(GetBValue(wm.crColor), wm.bIntensity));
}

struct TextBox {
    double c, s, theta;
    int cx, cy;
};

// Start point of one of the three corner rows that rotate about a corner
// other than the text's own origin: d is the distance, phi its angle.
struct Polar {
    double d, phi;
};
Polar CentreBottom(const TextBox& t)
{
    double d = std::sqrt((t.cx * 0.5) * (t.cx * 0.5) + double(t.cy) * t.cy);
    return {d, d > 0 ? t.theta - std::asin(t.cy / d) : 0};
}
Polar RightCentre(const TextBox& t)
{
    double d = std::sqrt(double(t.cx) * t.cx + (t.cy * 0.5) * (t.cy * 0.5));
    return {d, d > 0 ? t.theta + std::asin(t.cx / d) : 0};
}
Polar RightBottom(const TextBox& t)
{
    double d = std::sqrt(double(t.cx) * t.cx + double(t.cy) * t.cy);
    return {d, d > 0 ? t.theta - std::asin(t.cy / d) : 0};
}

POINT PreviewStart(HDC hdc, const WATERMARK& wm, const RECT& rc, const TextBox& t, double horzMm, double vertMm)
{
    const int offV = RoundHalfAway(RoundHalfAway(GetDeviceCaps(hdc, LOGPIXELSY) * vertMm * PREVIEW_SCALE) * MM_TO_INCH);
    const int offH = RoundHalfAway(RoundHalfAway(GetDeviceCaps(hdc, LOGPIXELSX) * horzMm * PREVIEW_SCALE) * MM_TO_INCH);
    const int L = rc.left, T = rc.top, R = rc.right, B = rc.bottom;
    const int Xc = L + Half(R - L), Yc = T + Half(B - T);
    const double c = t.c, s = t.s, cx = t.cx, cy = t.cy;
    int x, y;
    const int h = wm.iHorzPos, v = wm.iVertPos;
    if (h == WM_HPOS_LEFT && v == WM_VPOS_TOP) {
        x = L; y = T;
    } else if (h == WM_HPOS_LEFT && v == WM_POS_CENTRE) {
        x = L - RoundHalfAway(s * cy * 0.5); y = Yc - RoundHalfAway(c * cy * 0.5);
    } else if (h == WM_HPOS_LEFT && v == WM_VPOS_BOTTOM) {
        x = L - RoundHalfAway(s * cy); y = B - RoundHalfAway(c * cy);
    } else if (h == WM_POS_CENTRE && v == WM_VPOS_TOP) {
        x = Xc - RoundHalfAway(c * cx * 0.5); y = T + RoundHalfAway(s * cx * 0.5);
    } else if (h == WM_POS_CENTRE && v == WM_VPOS_BOTTOM) {
        Polar p = CentreBottom(t);
        if (p.d > 0) { x = Xc - RoundHalfAway(std::cos(p.phi) * p.d); y = B + RoundHalfAway(std::sin(p.phi) * p.d); }
        else { x = Xc; y = B; }
    } else if (h == WM_HPOS_RIGHT && v == WM_VPOS_TOP) {
        x = R - RoundHalfAway(c * cx); y = T + RoundHalfAway(s * cx);
    } else if (h == WM_HPOS_RIGHT && v == WM_POS_CENTRE) {
        Polar p = RightCentre(t);
        if (p.d > 0) { x = R - RoundHalfAway(std::sin(p.phi) * p.d); y = Yc - RoundHalfAway(std::cos(p.phi) * p.d); }
        else { x = Xc; y = Yc; }
    } else if (h == WM_HPOS_RIGHT && v == WM_VPOS_BOTTOM) {
        Polar p = RightBottom(t);
        if (p.d > 0) { x = R - RoundHalfAway(std::cos(p.phi) * p.d); y = B + RoundHalfAway(std::sin(p.phi) * p.d); }
        else { x = R; y = B; }
    } else {
        x = Xc - RoundHalfAway(RoundHalfAway(c * cx) * 0.5) - RoundHalfAway(RoundHalfAway(s * cy) * 0.5);
        y = Yc + RoundHalfAway(RoundHalfAway(s * cx) * 0.5) - RoundHalfAway(RoundHalfAway(c * cy) * 0.5);
    }
    return {x + offH, y - offV};
}

struct PrintPlacement {
    const PrintGeometry* geo;
    const RECT* area;
    FLOAT scale;
    DWORD orientationCode;
    DWORD layoutActive;
};

POINT PrintStart(HDC hdc, const WATERMARK& wm, const PrintPlacement& pp, const TextBox& t, double horzMm,
                 double vertMm)
{
    const int dpi = pp.geo->dpi;
    const bool k = pp.orientationCode == 0 || pp.orientationCode == 1;
    const int cq = RoundHalfAway(t.c * 10000), sq = RoundHalfAway(t.s * 10000);
    const int cxc = MulDiv(t.cx, cq, 10000), cxs = MulDiv(t.cx, sq, 10000);
    const int cys = MulDiv(t.cy, sq, 10000), cyc = MulDiv(t.cy, cq, 10000);
    const int offV = RoundHalfAway(RoundHalfAway(dpi * vertMm) * MM_TO_INCH);
    const int offH = RoundHalfAway(RoundHalfAway(dpi * horzMm) * MM_TO_INCH);

    const int pox = GetDeviceCaps(hdc, PHYSICALOFFSETX), poy = GetDeviceCaps(hdc, PHYSICALOFFSETY);
    int W, H, A, Bp;
    const bool shrunk = pp.scale < 1.0f;
    if (!pp.layoutActive) {
        W = GetDeviceCaps(hdc, PHYSICALWIDTH);
        H = GetDeviceCaps(hdc, PHYSICALHEIGHT);
        A = pox;
        Bp = poy;
    } else {
        W = pp.area->right - pp.area->left;
        H = std::abs(pp.area->bottom - pp.area->top);
        A = shrunk ? 0 : pox;
        Bp = shrunk ? pox : poy;
    }
    if ((pp.geo->orientation == DMORIENT_LANDSCAPE && H > W) || (pp.geo->orientation == DMORIENT_PORTRAIT && H < W)) {
        int tmp = W; W = H; H = tmp;
        A = poy;
        Bp = (pp.layoutActive && shrunk) ? 0 : pox;
    }
    const int W2 = Half(W), H2 = Half(H);
    const double c = t.c, s = t.s, cx = t.cx, cy = t.cy;
    const int h = wm.iHorzPos, v = wm.iVertPos;
    const int marginX = RoundHalfAway(dpi * 0.07), marginY = RoundHalfAway(dpi * 0.1);
    const bool margins = !pp.layoutActive;
    int x, y;
    if (h == WM_HPOS_LEFT && v == WM_VPOS_TOP) {
        x = 0; y = 0;
        if (k) { x = A; y = Bp; }
    } else if (h == WM_HPOS_LEFT && v == WM_POS_CENTRE) {
        x = -RoundHalfAway(s * cy * 0.5); y = H2 - RoundHalfAway(c * cy * 0.5);
        if (k) { x += A; y -= Bp; }
    } else if (h == WM_HPOS_LEFT && v == WM_VPOS_BOTTOM) {
        x = -RoundHalfAway(s * cy); y = H - RoundHalfAway(c * cy);
        if (k) { x += A; y -= 2 * Bp; }
    } else if (h == WM_POS_CENTRE && v == WM_VPOS_TOP) {
        x = W2 - RoundHalfAway(c * cx * 0.5); y = RoundHalfAway(s * cx * 0.5);
        if (k) { x += A; y += Bp; }
    } else if (h == WM_POS_CENTRE && v == WM_VPOS_BOTTOM) {
        Polar p = CentreBottom(t);
        if (p.d > 0) { x = W2 - RoundHalfAway(std::cos(p.phi) * p.d); y = H + RoundHalfAway(std::sin(p.phi) * p.d); }
        else { x = W2 - Half(t.cx); y = H - 2 * t.cy; }
        if (k) { x += A; y -= 2 * Bp; }
    } else if (h == WM_HPOS_RIGHT && v == WM_VPOS_TOP) {
        x = W - RoundHalfAway(c * cx); y = RoundHalfAway(s * cx);
        if (k) { x -= 2 * A; y += Bp; }
    } else if (h == WM_HPOS_RIGHT && v == WM_POS_CENTRE) {
        Polar p = RightCentre(t);
        if (p.d > 0) { x = W - RoundHalfAway(std::sin(p.phi) * p.d); y = H2 - RoundHalfAway(std::cos(p.phi) * p.d); }
        else { x = W2; y = H2; }
        if (k) { x -= 2 * A; y -= Bp; }
    } else if (h == WM_HPOS_RIGHT && v == WM_VPOS_BOTTOM) {
        Polar p = RightBottom(t);
        if (p.d > 0) { x = W - RoundHalfAway(std::cos(p.phi) * p.d); y = H + RoundHalfAway(std::sin(p.phi) * p.d); }
        else { x = W; y = H; }
        if (k) { x -= 2 * A; y -= 2 * Bp; }
        if (margins) { x -= marginX; y -= marginY; }
    } else {
        x = W2 + Half(-(cxc + cys)); y = H2 + Half(cxs - cyc);
        if (k) { x -= A; y -= Bp; }
    }
    if (margins) {
        if (h == WM_HPOS_RIGHT && v >= 1 && v <= 3)
            x -= marginX;
        if (v == WM_VPOS_BOTTOM && h >= 1 && h <= 3)
            y -= marginY;
    }
    const int scale = pp.geo->scalePercent;
    return {MulDiv(10 * (x + offH), scale, 1000), MulDiv(10 * (y - offV), scale, 1000)};
}

void PaintText(HDC hdc, const WATERMARK& wm, const WCHAR* text, int cch, POINT pt, const RECT& rc, DWORD dwMode,
              COLORREF colour)
{
    SetBkMode(hdc, TRANSPARENT);
    SetBkColor(hdc, RGB(255, 255, 255));
    SetTextColor(hdc, colour);
    SetROP2(hdc, (dwMode & WMDRAW_UNDER) ? R2_MASKPEN : R2_COPYPEN);
    SetPolyFillMode(hdc, WINDING);
    const bool preview = (dwMode & WMDRAW_PREVIEW) != 0;
    if (!wm.bOutline) {
        if (preview) {
            ExtTextOutW(hdc, pt.x, pt.y, ETO_CLIPPED, &rc, text, cch, nullptr);
        } else {
            BeginPath(hdc);
            TextOutW(hdc, pt.x, pt.y, text, cch);
            EndPath(hdc);
            StrokeAndFillPath(hdc);
        }
        return;
    }
    BeginPath(hdc);
    TextOutW(hdc, pt.x, pt.y, text, cch);
    EndPath(hdc);
    HGDIOBJ dcPen = GetStockObject(DC_PEN);
    HGDIOBJ old = dcPen ? SelectObject(hdc, dcPen) : nullptr;
    if (!old || old == HGDI_ERROR)
        return;
    SetDCPenColor(hdc, colour);
    StrokePath(hdc);
    SelectObject(hdc, old);
}

}  // namespace

int RoundHalfAway(double v)
{
    const double a = std::floor(std::fabs(v) + 0.5);
    return static_cast<int>(v < 0 ? -a : a);
}

void DrawWatermark(HDC hdc, HANDLE hPrinter, const WATERMARK* pWm, const RECT* prcArea, DWORD dwMode, FLOAT fScale,
                   LPCWSTR pszPrinter, LPCWSTR pszModel, INT iPage, DWORD dwOrientation, DWORD dwLayoutActive)
{
    if (!hdc || !pWm || !prcArea)
        return;
    const WATERMARK& wm = *pWm;
    const RECT rc = *prcArea;
    const bool preview = (dwMode & WMDRAW_PREVIEW) != 0;

    const int saved = SaveDC(hdc);
    if (!saved)
        return;
    SetGraphicsMode(hdc, GM_ADVANCED);
    LOGFONTW lf = wm.lfFont;
    lf.lfFaceName[LF_FACESIZE - 1] = L'\0';  // the record may come from an untrusted store
    lf.lfEscapement = lf.lfOrientation;

    PrintGeometry geo;
    if (preview) {
        int h = RoundHalfAway(MulDiv(10 * wm.iPointSize, GetDeviceCaps(hdc, LOGPIXELSY), 720) * double(fScale));
        lf.lfHeight = h >= 1 ? -h : -1;
    } else {
        geo = ReadPrintGeometry(hdc);
        int h = MulDiv(-10 * wm.iPointSize, geo.dpi, 720);
        h = RoundHalfAway(h * double(fScale));
        lf.lfHeight = MulDiv(10 * h, geo.scalePercent, 1000);
    }

    WCHAR text[DYNTEXT_CCH];
    size_t cchText = BoundedLength(wm.szText, DYNTEXT_CCH);
    if (cchText >= DYNTEXT_CCH)
        cchText = DYNTEXT_CCH - 1;
    std::memcpy(text, wm.szText, cchText * sizeof(WCHAR));
    text[cchText] = L'\0';
    if (wm.bDynamic && !ExpandDynamicText(hdc, hPrinter, text, nullptr, pszPrinter, pszModel, iPage, dwMode))
        text[0] = L'\0';
    const int cch = lstrlenW(text);

    lf.lfOutPrecision = 0;
    lf.lfClipPrecision = 0;
    lf.lfQuality = 0;
    lf.lfPitchAndFamily = 0;
    ScopedGdiObject<HFONT> font(CreateFontIndirectW(&lf));
    const COLORREF colour = FadedColour(wm);
    LOGBRUSH lb = {wm.bOutline ? static_cast<UINT>(BS_NULL) : static_cast<UINT>(BS_SOLID), colour, 0};
    ScopedGdiObject<HBRUSH> brush(CreateBrushIndirect(&lb));
    LOGPEN lp = {PS_NULL, {0, 0}, 0};
    ScopedGdiObject<HPEN> pen(CreatePenIndirect(&lp));
    ScopedGdiObject<HRGN> clip(CreateRectRgn(rc.left + 1, rc.top + 1, rc.right - 1, rc.bottom - 1));

    if (font.get()) {
        SelectObject(hdc, font.get());
        if (preview)
            Rectangle(hdc, rc.left, rc.top, rc.right, rc.bottom);
        if (clip.get())
            SelectClipRgn(hdc, clip.get());

        TextBox t;
        t.theta = (lf.lfOrientation / 10) * DEG_TO_RAD;
        t.c = std::cos(t.theta);
        t.s = std::sin(t.theta);
        SIZE ext = {0, 0};
        GetTextExtentPoint32W(hdc, text, cch, &ext);
        t.cx = ext.cx;
        t.cy = ext.cy;

        double horzMm = wm.dHorzOffset, vertMm = wm.dVertOffset;
        if (wm.iUnits == WM_UNITS_INCHES) {
            horzMm *= 25.4;
            vertMm *= 25.4;
        }
        // NaN or huge offsets from a damaged record must not overflow the
        // integer geometry below.
        if (!(std::fabs(horzMm) < 1e5)) horzMm = 0;
        if (!(std::fabs(vertMm) < 1e5)) vertMm = 0;
        POINT pt;
        if (preview) {
            pt = PreviewStart(hdc, wm, rc, t, horzMm, vertMm);
        } else {
            horzMm *= fScale;
            vertMm *= fScale;
            const PrintPlacement pp{&geo, &rc, fScale, dwOrientation, dwLayoutActive};
            pt = PrintStart(hdc, wm, pp, t, horzMm, vertMm);
        }
        if (brush.get() && pen.get() && cch > 0) {
            SelectObject(hdc, brush.get());
            SelectObject(hdc, pen.get());
            PaintText(hdc, wm, text, cch, pt, rc, dwMode, colour);
        }
    }
    RestoreDC(hdc, saved);
}
