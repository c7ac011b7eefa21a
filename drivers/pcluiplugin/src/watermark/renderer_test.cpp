// The renderer on real DIB sections: colours by pixels, sizes and start
// points by the fonts and text origins GDI was asked for.
#include "watermark/renderer.h"

#include "gdirecorder.h"
#include "simrender.h"

#include <gtest/gtest.h>
#include <cmath>
#include <cstring>

namespace {

WATERMARK Record(LPCWSTR text, int pointSize, int angle, int horz, int vert, COLORREF colour = RGB(0, 0, 0))
{
    WATERMARK wm = {};
    lstrcpynW(wm.szName, L"test", 128);
    lstrcpynW(wm.szText, text, 128);
    wm.crColor = colour;
    wm.bIntensity = 100;
    wm.lfFont.lfOrientation = angle;
    wm.lfFont.lfWeight = FW_BOLD;
    lstrcpynW(wm.lfFont.lfFaceName, L"Arial", LF_FACESIZE);
    wm.iPointSize = pointSize;
    wm.iHorzPos = horz;
    wm.iVertPos = vert;
    wm.iUnits = WM_UNITS_MM;
    wm.bSelected = 1;
    return wm;
}

struct RendererTest : ::testing::Test {
    void SetUp() override
    {
        InstallGdiRecorder(GetModuleHandleW(nullptr));
        TheGdiRecord().Clear();
        SimSetA4(job, 100);
    }
    // Prints wm onto a plain page, as page-time printing does.
    void Print(SimPage& page, const WATERMARK& wm, DWORD extraMode = WMDRAW_OVER)
    {
        RECT area = {job.offsetX, job.offsetY, job.physicalWidth - job.offsetX, job.physicalHeight - job.offsetY};
        DrawWatermark(page.dc(), nullptr, &wm, &area, WMDRAW_PRINT | extraMode, 1.0f, L"P", L"M", 1, 1, 0);
    }
    SIZE Extent(HDC hdc, const LOGFONTW& lf, LPCWSTR text)
    {
        HFONT f = CreateFontIndirectW(&lf);
        HGDIOBJ old = SelectObject(hdc, f);
        SIZE s = {};
        GetTextExtentPoint32W(hdc, text, lstrlenW(text), &s);
        SelectObject(hdc, old);
        DeleteObject(f);
        return s;
    }
    SimRenderJob job;
};

// Every pixel the watermark touched, and whether all of them have one colour.
struct Ink {
    long count = 0;
    bool uniform = true;
    COLORREF colour = CLR_INVALID;
};
Ink InkOf(const SimPage& page)
{
    Ink ink;
    for (int y = 0; y < page.height(); ++y)
        for (int x = 0; x < page.width(); ++x) {
            COLORREF c = page.Pixel(x, y);
            if (c == RGB(255, 255, 255))
                continue;
            if (ink.count++ == 0)
                ink.colour = c;
            else if (c != ink.colour)
                ink.uniform = false;
        }
    return ink;
}

}  // namespace

TEST_F(RendererTest, IntensityFadesTheColourTowardsWhite)
{
    SimPage page(job, 24);
    WATERMARK wm = Record(L"WWW", 72, 0, WM_POS_CENTRE, WM_POS_CENTRE, RGB(200, 0, 0));
    Print(page, wm);
    Ink full = InkOf(page);
    EXPECT_GT(full.count, 1000);
    EXPECT_TRUE(full.uniform);
    EXPECT_EQ(full.colour, RGB(200, 0, 0));

    page.Clear();
    wm.bIntensity = 50;
    Print(page, wm);
    Ink half = InkOf(page);
    EXPECT_EQ(half.colour, RGB(227, 127, 127));  // 255 - 55/2 and 255 - 255/2, rounded
    EXPECT_EQ(half.count, full.count);

    page.Clear();
    wm.bIntensity = 0;
    Print(page, wm);
    EXPECT_EQ(InkOf(page).count, 0);

    // A damaged record's intensity above 100 stays a valid colour, not a wrap.
    page.Clear();
    wm.bIntensity = 255;
    Print(page, wm);
    EXPECT_EQ(InkOf(page).colour, RGB(115, 0, 0));  // 255 - 140; green and blue held at 0
}

TEST_F(RendererTest, UnderThePageLeavesBlackContentBlack)
{
    SimPage page(job, 24);
    const RECT content = {0, 0, page.width(), page.height() / 2 + 20};
    auto paintContent = [&] {
        page.Clear();
        FillRect(page.dc(), &content, static_cast<HBRUSH>(GetStockObject(BLACK_BRUSH)));
    };
    WATERMARK wm = Record(L"WWW", 72, 0, WM_POS_CENTRE, WM_POS_CENTRE, RGB(0, 160, 255));
    paintContent();
    Print(page, wm, WMDRAW_UNDER);
    long blueInBlack = 0, blueOutside = 0;
    for (int y = 0; y < page.height(); ++y)
        for (int x = 0; x < page.width(); ++x) {
            COLORREF c = page.Pixel(x, y);
            bool inside = y < content.bottom;
            if (inside && c != RGB(0, 0, 0))
                ++blueInBlack;
            if (!inside && c == RGB(0, 160, 255))
                ++blueOutside;
        }
    EXPECT_EQ(blueInBlack, 0);
    EXPECT_GT(blueOutside, 100);  // the text straddles the content's edge
    EXPECT_EQ(TheGdiRecord().rop2.back(), R2_MASKPEN);

    paintContent();
    Print(page, wm, WMDRAW_OVER);
    blueInBlack = 0;
    for (int y = 0; y < content.bottom; ++y)
        for (int x = 0; x < page.width(); ++x)
            blueInBlack += page.Pixel(x, y) == RGB(0, 160, 255);
    EXPECT_GT(blueInBlack, 100);
    EXPECT_EQ(TheGdiRecord().rop2.back(), R2_COPYPEN);
}

TEST_F(RendererTest, DiagonalCentredWatermarkIsCentredOnThePage)
{
    SimPage page(job, 1);
    Print(page, Record(L"ЧЕРНОВАЯ ПЕЧАТЬ", 72, 450, WM_POS_CENTRE, WM_POS_CENTRE));
    RECT ink = page.InkBounds();
    ASSERT_GT(ink.right - ink.left, 200);
    // Rotated by 45 degrees: as wide as high, within the glyphs' own slack.
    const int w = ink.right - ink.left, h = ink.bottom - ink.top;
    EXPECT_NEAR(w, h, w / 8);
    EXPECT_NEAR((ink.left + ink.right) / 2.0, page.width() / 2.0, 15);
    EXPECT_NEAR((ink.top + ink.bottom) / 2.0, page.height() / 2.0, 15);
    // Ink rises to the upper right: the top rows' ink lies right of centre.
    int topRowX = -1;
    for (int x = 0; x < page.width() && topRowX < 0; ++x)
        if (page.Pixel(x, ink.top) != RGB(255, 255, 255))
            topRowX = x;
    EXPECT_GT(topRowX, page.width() / 2);
}

TEST_F(RendererTest, PreviewFontHeightFromTheDisplay)
{
    HDC screen = GetDC(nullptr);
    HDC dc = CreateCompatibleDC(screen);
    ReleaseDC(nullptr, screen);
    ASSERT_EQ(GetDeviceCaps(dc, LOGPIXELSY), 96);
    HBITMAP bmp = CreateCompatibleBitmap(dc, 200, 150);
    HGDIOBJ old = SelectObject(dc, bmp);
    RECT rc = {0, 0, 200, 150};
    WATERMARK wm = Record(L"Черновик", 72, 300, WM_POS_CENTRE, WM_POS_CENTRE);
    DrawWatermark(dc, nullptr, &wm, &rc, WMDRAW_PREVIEW, PREVIEW_SCALE, nullptr, nullptr, 1, 1, 0);
    ASSERT_FALSE(TheGdiRecord().fonts.empty());
    EXPECT_EQ(TheGdiRecord().fonts.back().lfHeight, -19);  // 96 * 72 / 72 * 0.195 = 18.72
    EXPECT_EQ(TheGdiRecord().fonts.back().lfEscapement, 300);
    wm.iPointSize = 0;
    DrawWatermark(dc, nullptr, &wm, &rc, WMDRAW_PREVIEW, PREVIEW_SCALE, nullptr, nullptr, 1, 1, 0);
    EXPECT_EQ(TheGdiRecord().fonts.back().lfHeight, -1);
    SelectObject(dc, old);
    DeleteObject(bmp);
    DeleteDC(dc);
}

TEST_F(RendererTest, PrintSizeAndStartFollowTheJobsDevmode)
{
    SimSetA4(job, 600);
    SimPage page(job, 1);
    WATERMARK wm = Record(L"Top left", 36, 0, WM_HPOS_LEFT, WM_VPOS_TOP);
    Print(page, wm);
    GdiRecord& rec = TheGdiRecord();
    EXPECT_EQ(rec.fonts.back().lfHeight, -300);  // 36 pt at 600 dpi
    // Left/top starts at the physical offsets.
    EXPECT_EQ(rec.textOrigins.back().x, job.offsetX);
    EXPECT_EQ(rec.textOrigins.back().y, job.offsetY);

    job.dm.dmScale = 50;
    Print(page, wm);
    EXPECT_EQ(rec.fonts.back().lfHeight, -150);
    EXPECT_EQ(rec.textOrigins.back().x, job.offsetX / 2);
    EXPECT_EQ(rec.textOrigins.back().y, job.offsetY / 2);

    // A resolution code instead of dots per inch is read as 600 dpi.
    job.dm.dmScale = 100;
    job.dm.dmPrintQuality = DMRES_HIGH;
    Print(page, wm);
    EXPECT_EQ(rec.fonts.back().lfHeight, -300);
}

TEST_F(RendererTest, RightAndBottomAnchorsKeepClearOfThePrinterMargins)
{
    SimSetA4(job, 600);
    SimPage page(job, 1);
    GdiRecord& rec = TheGdiRecord();
    const int pw = job.physicalWidth, ph = job.physicalHeight, pox = job.offsetX, poy = job.offsetY;

    WATERMARK wm = Record(L"Right bottom", 24, 0, WM_HPOS_RIGHT, WM_VPOS_BOTTOM);
    Print(page, wm);
    SIZE s = Extent(page.dc(), rec.fonts.back(), wm.szText);
    // Twice 0.07 inch (42) and twice 0.1 inch (60) at 600 dpi.
    EXPECT_EQ(rec.textOrigins.back().x, pw - s.cx - 2 * pox - 84);
    EXPECT_EQ(rec.textOrigins.back().y, ph - s.cy - 2 * poy - 120);

    wm = Record(L"Right top", 24, 0, WM_HPOS_RIGHT, WM_VPOS_TOP);
    Print(page, wm);
    s = Extent(page.dc(), rec.fonts.back(), wm.szText);
    EXPECT_EQ(rec.textOrigins.back().x, pw - s.cx - 2 * pox - 42);
    EXPECT_EQ(rec.textOrigins.back().y, poy);

    wm = Record(L"Left bottom", 24, 0, WM_HPOS_LEFT, WM_VPOS_BOTTOM);
    Print(page, wm);
    s = Extent(page.dc(), rec.fonts.back(), wm.szText);
    EXPECT_EQ(rec.textOrigins.back().x, pox);
    EXPECT_EQ(rec.textOrigins.back().y, ph - s.cy - 2 * poy - 60);
}

TEST_F(RendererTest, OffsetsInMillimetresAndInches)
{
    SimSetA4(job, 600);
    SimPage page(job, 1);
    GdiRecord& rec = TheGdiRecord();
    WATERMARK wm = Record(L"Offset", 24, 0, WM_HPOS_LEFT, WM_VPOS_TOP);
    Print(page, wm);
    const POINT base = rec.textOrigins.back();

    wm.dVertOffset = 10;
    Print(page, wm);
    EXPECT_EQ(rec.textOrigins.back().x, base.x);
    EXPECT_EQ(base.y - rec.textOrigins.back().y, 236);  // 10 mm up at 600 dpi
    wm.iUnits = WM_UNITS_INCHES;
    Print(page, wm);
    EXPECT_EQ(base.y - rec.textOrigins.back().y, 6000);  // 10 inches: 254 mm

    wm.iUnits = WM_UNITS_MM;
    wm.dVertOffset = 0;
    wm.dHorzOffset = 10;
    Print(page, wm);
    EXPECT_EQ(rec.textOrigins.back().x - base.x, 236);  // right
    // A damaged record's offset cannot push the geometry out of range.
    double nan;
    const unsigned long long bits = 0x7FF8000000000000ull;
    std::memcpy(&nan, &bits, sizeof(nan));
    wm.dHorzOffset = nan;
    Print(page, wm);
    EXPECT_EQ(rec.textOrigins.back().x, base.x);
}

TEST_F(RendererTest, DeviceContextStateAndObjectsComeBack)
{
    SimPage page(job, 24);
    HDC dc = page.dc();
    HFONT appFont = CreateFontW(-20, 0, 0, 0, FW_NORMAL, 0, 0, 0, DEFAULT_CHARSET, 0, 0, 0, 0, L"Arial");
    SelectObject(dc, appFont);
    SetTextColor(dc, RGB(1, 2, 3));
    SetROP2(dc, R2_XORPEN);
    SetBkMode(dc, OPAQUE);
    const HGDIOBJ pen = GetCurrentObject(dc, OBJ_PEN), brush = GetCurrentObject(dc, OBJ_BRUSH);
    const long liveBefore = long(TheGdiRecord().live.size());

    WATERMARK outline = Record(L"Outline", 48, 200, WM_HPOS_RIGHT, WM_POS_CENTRE, RGB(0, 0, 255));
    outline.bOutline = 1;
    WATERMARK broken = Record(L"%нет такой%", 48, 0, WM_POS_CENTRE, WM_POS_CENTRE);
    broken.bDynamic = 1;
    for (const WATERMARK* wm : {&outline, &broken}) {
        Print(page, *wm, WMDRAW_UNDER);
        EXPECT_EQ(GetCurrentObject(dc, OBJ_FONT), appFont);
        EXPECT_EQ(GetCurrentObject(dc, OBJ_PEN), pen);
        EXPECT_EQ(GetCurrentObject(dc, OBJ_BRUSH), brush);
        EXPECT_EQ(GetTextColor(dc), RGB(1, 2, 3));
        EXPECT_EQ(GetROP2(dc), R2_XORPEN);
        EXPECT_EQ(GetBkMode(dc), OPAQUE);
        EXPECT_EQ(GetGraphicsMode(dc), GM_COMPATIBLE);
        HRGN clip = CreateRectRgn(0, 0, 0, 0);
        EXPECT_EQ(GetClipRgn(dc, clip), 0);  // no clip region left behind
        DeleteObject(clip);
        EXPECT_EQ(long(TheGdiRecord().live.size()), liveBefore);
    }
    // The outline is drawn, the failed dynamic text is not.
    Ink ink = InkOf(page);
    EXPECT_GT(ink.count, 100);
    EXPECT_EQ(ink.colour, RGB(0, 0, 255));
    page.Clear();
    Print(page, broken);
    EXPECT_EQ(InkOf(page).count, 0);
    SelectObject(dc, GetStockObject(SYSTEM_FONT));
    DeleteObject(appFont);
}
