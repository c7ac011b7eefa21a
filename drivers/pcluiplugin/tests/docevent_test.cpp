// Page-time printing through the plug-in object's DocumentEvent, as GDI and
// the driver call it, with the simulated render side answering the escapes
// and the page drawn into real DIB sections.
#include "frame/oemdevmode.h"
#include "gdirecorder.h"
#include "plugin_dll.h"
#include "simrender.h"
#include "simspooler.h"
#include "watermark/escapes.h"
#include "watermark/wmrecord.h"

#include <gtest/gtest.h>
#include <winddiui.h>
#include <cstring>
#include <vector>

namespace {

constexpr COLORREF kRed = RGB(255, 0, 0), kBlue = RGB(0, 0, 255);

WATERMARK Mark(LPCWSTR text, COLORREF colour, int angle = 0)
{
    WATERMARK wm = {};
    lstrcpynW(wm.szName, text, 128);
    lstrcpynW(wm.szText, text, 128);
    wm.crColor = colour;
    wm.bIntensity = 100;
    wm.lfFont.lfOrientation = angle;
    wm.lfFont.lfWeight = FW_BOLD;
    lstrcpynW(wm.lfFont.lfFaceName, L"Arial", LF_FACESIZE);
    wm.iPointSize = 60;
    wm.iHorzPos = WM_POS_CENTRE;
    wm.iVertPos = WM_POS_CENTRE;
    wm.iUnits = WM_UNITS_MM;
    wm.bSelected = 1;
    return wm;
}

struct DocEventTest : ::testing::Test {
    void SetUp() override
    {
        InstallGdiRecorder(PluginDll());
        TheGdiRecord().Clear();
        plugin = CreatePluginObject();
        ASSERT_NE(plugin, nullptr);
        OEMDMPARAM p = {};
        p.cbSize = sizeof(p);
        p.pOEMDMOut = &job.oem;
        ASSERT_EQ(plugin->DevMode(OEMDM_DEFAULT, &p), S_OK);
        SimSetA4(job, 100);
        SimResetSpooler();
        SimPrinter printer;
        printer.name = L"Norvane LaserJet";
        printer.driver = L"Norvane PCL 6";
        hPrinter = SimAddPrinter(printer);
    }
    void TearDown() override
    {
        plugin->Release();
        SimResetSpooler();
    }
    int Event(HDC hdc, INT iEsc, ULONG cbIn = 0, PVOID pvIn = nullptr, ULONG cbOut = 0, PVOID pvOut = nullptr,
              int preset = 77)
    {
        int result = preset;
        EXPECT_EQ(plugin->DocumentEvent(hPrinter, hdc, iEsc, cbIn, pvIn, cbOut, pvOut, &result), S_OK);
        return result;
    }
    int EndPage(SimPage& page, int preset = 77) { return Event(page.dc(), DOCUMENTEVENT_ENDPAGE, 0, nullptr, 0, nullptr, preset); }
    // Ink of one colour inside r.
    static long Count(const SimPage& page, const RECT& r, COLORREF c)
    {
        long n = 0;
        for (int y = r.top; y < r.bottom; ++y)
            for (int x = r.left; x < r.right; ++x)
                n += page.Pixel(x, y) == c;
        return n;
    }
    static RECT Whole(const SimPage& page) { return {0, 0, page.width(), page.height()}; }
    IPrintOemUI2* plugin = nullptr;
    HANDLE hPrinter = nullptr;
    SimRenderJob job;
};

bool IsIdentity(HDC hdc)
{
    XFORM xf;
    GetWorldTransform(hdc, &xf);
    return xf.eM11 == 1 && xf.eM12 == 0 && xf.eM21 == 0 && xf.eM22 == 1 && xf.eDx == 0 && xf.eDy == 0;
}

POINT Map(const XFORM& xf, float x, float y)
{
    return {LONG(x * xf.eM11 + y * xf.eM21 + xf.eDx), LONG(x * xf.eM12 + y * xf.eM22 + xf.eDy)};
}

}  // namespace

TEST_F(DocEventTest, QueryFilterAsksForEscapeAndEndPage)
{
    BYTE buf[sizeof(DOCEVENT_FILTER) + 8 * sizeof(DWORD)] = {};
    auto* filter = reinterpret_cast<DOCEVENT_FILTER*>(buf);
    int dummyIn = 0;
    filter->cbSize = sizeof(buf);
    filter->cElementsAllocated = 1;
    EXPECT_EQ(Event(nullptr, DOCUMENTEVENT_QUERYFILTER, sizeof(dummyIn), &dummyIn, sizeof(buf), buf), 1);
    EXPECT_EQ(filter->cElementsNeeded, 2u);
    EXPECT_EQ(filter->cElementsReturned, 0u);

    filter->cElementsAllocated = 8;
    EXPECT_EQ(Event(nullptr, DOCUMENTEVENT_QUERYFILTER, sizeof(dummyIn), &dummyIn, sizeof(buf), buf), 1);
    EXPECT_EQ(filter->cElementsReturned, 2u);
    EXPECT_EQ(filter->aDocEventCall[0], DWORD(DOCUMENTEVENT_ESCAPE));
    EXPECT_EQ(filter->aDocEventCall[1], DWORD(DOCUMENTEVENT_ENDPAGE));

    EXPECT_EQ(Event(nullptr, DOCUMENTEVENT_QUERYFILTER, 0, nullptr, sizeof(buf), buf), -1);
    EXPECT_EQ(Event(nullptr, DOCUMENTEVENT_QUERYFILTER, sizeof(dummyIn), &dummyIn, 0, nullptr), -1);
    // A filter claiming more room than its buffer has is not overrun.
    BYTE small[sizeof(DOCEVENT_FILTER)] = {};
    auto* tight = reinterpret_cast<DOCEVENT_FILTER*>(small);
    tight->cElementsAllocated = 100;
    EXPECT_EQ(Event(nullptr, DOCUMENTEVENT_QUERYFILTER, sizeof(dummyIn), &dummyIn, sizeof(small), small), 1);
    EXPECT_EQ(tight->cElementsNeeded, 2u);
    // Events the plug-in does not handle leave the result alone.
    EXPECT_EQ(Event(nullptr, DOCUMENTEVENT_STARTPAGE), 77);
}

TEST_F(DocEventTest, LayoutEscapeForwardsThePageRecord)
{
    SimPage page(job, 1);
    job.oem.iLayoutActive = 1;
    INT block[25] = {};
    block[0] = 100;
    block[1] = 1;
    block[4] = 2;        // orientation code, offset 16
    block[5] = 7;        // page number, offset 20
    block[10] = 10;      // area, offsets 40..52
    block[11] = 20;
    block[12] = 310;
    block[13] = 420;
    const float scale = 0.5f;
    std::memcpy(&block[22], &scale, 4);  // offset 88
    block[23] = 1;       // long-edge duplex, offset 92
    block[24] = 1;       // back-side turn, offset 96
    DOCEVENT_ESCAPE esc = {ESC_LAYOUT_PAGE, int(sizeof(block)), block};
    EXPECT_EQ(Event(page.dc(), DOCUMENTEVENT_ESCAPE, sizeof(esc), &esc), 1);
    ASSERT_EQ(job.received.size(), 1u);
    const PAGERECORD& r = job.received[0];
    EXPECT_EQ(r.dwReserved, 0u);
    EXPECT_EQ(r.iPageNumber, 7);
    EXPECT_EQ(r.fScale, 0.5f);
    EXPECT_EQ(r.dwOrientation, 2u);
    EXPECT_EQ(r.rcArea.left, 10);
    EXPECT_EQ(r.rcArea.top, 20);
    EXPECT_EQ(r.rcArea.right, 310);
    EXPECT_EQ(r.rcArea.bottom, 420);
    EXPECT_EQ(r.dwLongEdgeDuplex, 1u);
    EXPECT_EQ(r.dwBackSideTurn, 1u);

    // Every way the event can be wrong fails it and sends nothing.
    DOCEVENT_ESCAPE other = {4096, int(sizeof(block)), block};
    EXPECT_EQ(Event(page.dc(), DOCUMENTEVENT_ESCAPE, sizeof(other), &other), -1);
    EXPECT_EQ(Event(page.dc(), DOCUMENTEVENT_ESCAPE, 0, nullptr), -1);
    DOCEVENT_ESCAPE shortBlock = {ESC_LAYOUT_PAGE, 96, block};
    EXPECT_EQ(Event(page.dc(), DOCUMENTEVENT_ESCAPE, sizeof(shortBlock), &shortBlock), -1);
    DOCEVENT_ESCAPE noBlock = {ESC_LAYOUT_PAGE, int(sizeof(block)), nullptr};
    EXPECT_EQ(Event(page.dc(), DOCUMENTEVENT_ESCAPE, sizeof(noBlock), &noBlock), -1);
    block[1] = 2;
    EXPECT_EQ(Event(page.dc(), DOCUMENTEVENT_ESCAPE, sizeof(esc), &esc), -1);
    block[1] = 1;
    job.oem.iLayoutActive = 0;
    EXPECT_EQ(Event(page.dc(), DOCUMENTEVENT_ESCAPE, sizeof(esc), &esc), -1);
    job.oem.iLayoutActive = 1;
    job.handsOff = 1;
    EXPECT_EQ(Event(page.dc(), DOCUMENTEVENT_ESCAPE, sizeof(esc), &esc), -1);
    EXPECT_EQ(job.received.size(), 1u);
}

TEST_F(DocEventTest, OrderChoosesTheSlotOnPlainPages)
{
    SimPage page(job, 24);
    job.oem.WMARK1 = Mark(L"FIRST", kRed);
    job.oem.WMARK2 = Mark(L"OTHER", kBlue);
    job.oem.iPlacement = 8;
    struct Case {
        int order;
        COLORREF page1, page2, page3;
    } cases[] = {
        {1, kRed, kRed, kRed},
        {2, kRed, kBlue, kBlue},
        {4, kRed, kBlue, kRed},
    };
    for (const Case& c : cases) {
        job.oem.iOrder = c.order;
        const COLORREF want[] = {c.page1, c.page2, c.page3};
        for (int p = 1; p <= 3; ++p) {
            page.Clear();
            job.physicalPage = p;
            EXPECT_EQ(EndPage(page), 1);
            const COLORREF other = want[p - 1] == kRed ? kBlue : kRed;
            EXPECT_GT(Count(page, Whole(page), want[p - 1]), 500) << "order " << c.order << " page " << p;
            EXPECT_EQ(Count(page, Whole(page), other), 0) << "order " << c.order << " page " << p;
            EXPECT_TRUE(IsIdentity(page.dc()));
            EXPECT_EQ(GetGraphicsMode(page.dc()), GM_COMPATIBLE);
        }
    }
    // No watermarks: success, nothing drawn. An unknown order: nothing
    // drawn and the result untouched.
    for (int order : {0, 3}) {
        job.oem.iOrder = order;
        page.Clear();
        EXPECT_EQ(EndPage(page), order == 0 ? 1 : 77);
        EXPECT_EQ(page.InkCount(), 0);
    }
    // A chosen slot that is not selected prints nothing but succeeds.
    job.oem.iOrder = 2;
    job.oem.WMARK2.bSelected = 0;
    job.physicalPage = 2;
    page.Clear();
    EXPECT_EQ(EndPage(page), 1);
    EXPECT_EQ(page.InkCount(), 0);
    EXPECT_EQ(TheGdiRecord().rop2.size() > 0 ? TheGdiRecord().rop2.back() : 0, R2_COPYPEN);
}

TEST_F(DocEventTest, TwoUpOddEvenPutsOneWatermarkOnEachImage)
{
    SimPage page(job, 24);
    job.oem.iLayoutActive = 1;
    job.oem.iOrder = 4;
    job.oem.iPlacement = 4;
    job.oem.WMARK1 = Mark(L"ODD", kRed);
    job.oem.WMARK2 = Mark(L"EVEN", kBlue);
    SimLayout two;
    two.pagesPerSheet = 2;
    job.sheet = SimSheetRecords(job, two, 0, 4);
    ASSERT_EQ(job.sheet.size(), 2u);
    EXPECT_EQ(EndPage(page), 1);
    const RECT top = job.sheet[0].rcArea, bottom = job.sheet[1].rcArea;
    EXPECT_GT(Count(page, top, kRed), 200);
    EXPECT_EQ(Count(page, top, kBlue), 0);
    EXPECT_GT(Count(page, bottom, kBlue), 200);
    EXPECT_EQ(Count(page, bottom, kRed), 0);
    EXPECT_EQ(TheGdiRecord().rop2.back(), R2_MASKPEN);
    EXPECT_TRUE(IsIdentity(page.dc()));

    // Reversed order on the sheet swaps them.
    page.Clear();
    two.reversed = true;
    job.sheet = SimSheetRecords(job, two, 0, 4);
    EXPECT_EQ(EndPage(page), 1);
    EXPECT_GT(Count(page, top, kBlue), 200);
    EXPECT_GT(Count(page, bottom, kRed), 200);
}

TEST_F(DocEventTest, PageImagesGetTheirTransforms)
{
    SimPage page(job, 1);
    job.oem.iLayoutActive = 1;
    job.oem.iOrder = 1;
    job.oem.WMARK1 = Mark(L"X", kRed);
    GdiRecord& rec = TheGdiRecord();
    PAGERECORD r = {};
    r.iPageNumber = 3;
    r.fScale = 0.5f;
    r.rcArea = {100, 200, 400, 600};

    struct Case {
        DWORD orientation, backTurn, longEdge;
        INT physicalPage;
        POINT expect;  // where the image's (10, 20) lands on the sheet
    } cases[] = {
        {3, 0, 0, 1, {110, 220}},  // translated
        {2, 0, 0, 1, {120, 590}},  // rotated: (left + y, bottom - x)
        {6, 0, 0, 1, {120, 590}},
        {3, 1, 1, 2, {380, 210}},  // back side turned: (right - y, top + x)
        {3, 1, 1, 3, {110, 220}},  // front side: no turn
        {3, 1, 0, 2, {110, 220}},  // short-edge duplex: no turn
    };
    for (const Case& c : cases) {
        r.dwOrientation = c.orientation;
        r.dwBackSideTurn = c.backTurn;
        r.dwLongEdgeDuplex = c.longEdge;
        job.sheet = {r};
        job.physicalPage = c.physicalPage;
        rec.Clear();
        EXPECT_EQ(EndPage(page), 1);
        ASSERT_EQ(rec.textTransforms.size(), 1u);
        POINT got = Map(rec.textTransforms[0], 10, 20);
        EXPECT_EQ(got.x, c.expect.x) << "orientation " << c.orientation << " page " << c.physicalPage;
        EXPECT_EQ(got.y, c.expect.y) << "orientation " << c.orientation << " page " << c.physicalPage;
        EXPECT_TRUE(IsIdentity(page.dc()));
    }
    // Orientation code 1 leaves the transform alone.
    r.dwOrientation = 1;
    r.dwBackSideTurn = 0;
    job.sheet = {r};
    rec.Clear();
    EndPage(page);
    ASSERT_EQ(rec.textTransforms.size(), 1u);
    EXPECT_EQ(Map(rec.textTransforms[0], 10, 20).x, 10);
}

TEST_F(DocEventTest, RenderSideRefusalsAndBadCounts)
{
    SimPage page(job, 1);
    job.oem.iOrder = 1;
    job.oem.WMARK1 = Mark(L"DRAFT", kRed);
    job.handsOff = 1;
    EXPECT_EQ(EndPage(page), 1);
    EXPECT_EQ(page.InkCount(), 0);
    EXPECT_EQ(job.escapeCalls[ESC_OEM_DEVMODE], 0);
    job.handsOff = 0;

    // No devmode from the render side: nothing to print, still success.
    job.failOemDevmode = true;
    EXPECT_EQ(EndPage(page), 1);
    EXPECT_EQ(page.InkCount(), 0);
    job.failOemDevmode = false;

    // A count no sheet can have is refused like a failed allocation.
    job.oem.iLayoutActive = 1;
    job.sheet = SimSheetRecords(job, SimLayout{}, 0, 1);
    job.reportedCount = 0x7FFFFFFF;
    EXPECT_EQ(EndPage(page), 1);
    EXPECT_EQ(page.InkCount(), 0);
    // A layout sheet with no records draws nothing and reports nothing.
    job.reportedCount = 0;
    EXPECT_EQ(EndPage(page), 77);
    // The render side filling fewer records than it counted: only those.
    job.reportedCount = 5;
    EXPECT_EQ(EndPage(page), 1);
    EXPECT_GT(page.InkCount(), 0);
}

TEST_F(DocEventTest, DynamicTextUsesThePrinterNames)
{
    SimPage page(job, 1);
    job.oem.iOrder = 1;
    job.oem.WMARK1 = Mark(L"%принтер% %номерстраницы%", kRed);
    job.oem.WMARK1.bDynamic = 1;
    EXPECT_EQ(EndPage(page), 1);
    EXPECT_GT(page.InkCount(), 0);
    // Without the printer's name the dynamic text prints nothing.
    SimPrinterOf(hPrinter)->failGetPrinter = true;
    page.Clear();
    EXPECT_EQ(EndPage(page), 1);
    EXPECT_EQ(page.InkCount(), 0);
}

// Under Wine, GetGuiResources does not count GDI objects, so the plug-in's
// own GDI calls are counted at its import table (every object it created
// and has not deleted), and heap use is the sum of busy blocks in every
// process heap, walked with HeapWalk.
namespace {
SIZE_T BusyHeapBytes()
{
    HANDLE heaps[256];
    DWORD n = GetProcessHeaps(256, heaps);
    SIZE_T total = 0;
    for (DWORD i = 0; i < n && i < 256; ++i) {
        PROCESS_HEAP_ENTRY e = {};
        HeapLock(heaps[i]);
        while (HeapWalk(heaps[i], &e))
            if (e.wFlags & PROCESS_HEAP_ENTRY_BUSY)
                total += e.cbData;
        HeapUnlock(heaps[i]);
    }
    return total;
}
}  // namespace

TEST_F(DocEventTest, TenThousandPagesLeakNothing)
{
    SimSetA4(job, 30);  // small pages: the count of pages is what matters
    SimPage page(job, 1);
    job.oem.iOrder = 4;
    job.oem.iPlacement = 4;
    job.oem.WMARK1 = Mark(L"ЧЕРНОВАЯ ПЕЧАТЬ", kRed, 450);
    job.oem.WMARK2 = Mark(L"%Имяпользователя% %датакраткая% %номерстраницы%", kBlue);
    job.oem.WMARK2.bDynamic = 1;
    job.oem.WMARK2.bOutline = 1;
    SimPrinterOf(hPrinter)->jobs = {{9, L"petrov"}};
    job.jobId = 9;
    GdiRecord& rec = TheGdiRecord();
    auto printPages = [&](int from, int count) {
        for (int p = from; p < from + count; ++p) {
            job.physicalPage = p;
            if (EndPage(page) != 1)
                return false;
            rec.Clear();  // keep the recorder's own lists from growing
        }
        return true;
    };
    ASSERT_TRUE(printPages(1, 200));  // warm-up: fonts, locale data, caches
    const size_t liveBefore = rec.live.size();
    const long createdBefore = rec.created, deletedBefore = rec.deleted;
    const SIZE_T heapBefore = BusyHeapBytes();

    ASSERT_TRUE(printPages(201, 10000));

    EXPECT_EQ(rec.live.size(), liveBefore);
    EXPECT_EQ(rec.created - createdBefore, rec.deleted - deletedBefore);
    EXPECT_GE(rec.created - createdBefore, 10000 * 4);  // font, brush, pen, region per page
    const SIZE_T heapAfter = BusyHeapBytes();
    // One leaked byte per page would show as 10,000 bytes.
    EXPECT_LT(heapAfter > heapBefore ? heapAfter - heapBefore : 0, SIZE_T(4096))
        << "before " << heapBefore << " after " << heapAfter;
    EXPECT_TRUE(IsIdentity(page.dc()));
}
