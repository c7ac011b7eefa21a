// A stand-in for the driver's render-side plug-in and the printer's page
// surface. Wine has neither, so tests and the demo print onto GDI DIB
// sections whose ExtEscape and page-geometry answers come from here. The
// plug-in keeps calling the real ExtEscape and GetDeviceCaps; only the
// import table of the module under test is redirected.
#pragma once
#include "frame/oemdevmode.h"
#include "watermark/escapes.h"

#include <map>
#include <vector>

struct SimRenderJob {
    OEMDEV oem{};            // answer of 4105
    DEVMODEW dm{};           // answer of 4112 (dmOrientation, dmScale, dmPrintQuality, dmDuplex)
    INT physicalPage = 1;    // answer of 4096
    DWORD jobId = 0;         // result of 4097
    int handsOff = 0;        // result of 65570
    std::vector<PAGERECORD> sheet;     // answer of 4116
    int reportedCount = -1;            // when 0 or more: the count 4116 reports without a buffer
    std::vector<PAGERECORD> received;  // records sent with 4115
    // Page geometry in device units, as GetDeviceCaps reports it.
    int dpi = 600;
    int physicalWidth = 0, physicalHeight = 0, offsetX = 0, offsetY = 0;
    bool failOemDevmode = false;
    bool failPublicDevmode = false;
    std::map<int, int> escapeCalls;  // escape code -> number of calls
};

// A4 portrait at dpi with 1/6-inch unprintable margins on every side;
// dmScale 100, dmPrintQuality dpi.
void SimSetA4(SimRenderJob& job, int dpi);
// Printable width and height (HORZRES, VERTRES).
int SimPrintableWidth(const SimRenderJob& job);
int SimPrintableHeight(const SimRenderJob& job);

// A page surface of the job's printable size: a DIB section of 1 or 24
// bits per pixel, white, selected into a memory DC attached to the job.
class SimPage {
public:
    SimPage(SimRenderJob& job, int bitsPerPixel);
    ~SimPage();
    SimPage(const SimPage&) = delete;
    SimPage& operator=(const SimPage&) = delete;
    HDC dc() const { return dc_; }
    HBITMAP bitmap() const { return bmp_; }
    int width() const { return w_; }
    int height() const { return h_; }
    void Clear();
    // Pixel colour as 0x00BBGGRR; 1-bit pages answer black or white.
    COLORREF Pixel(int x, int y) const;
    // Bounding box of the pixels that differ from white; empty when none.
    RECT InkBounds() const;
    long InkCount() const;
private:
    HDC dc_ = nullptr;
    HBITMAP bmp_ = nullptr;
    HGDIOBJ old_ = nullptr;
    BYTE* bits_ = nullptr;
    int w_ = 0, h_ = 0, bpp_ = 0, stride_ = 0;
};

// Answers the escapes and page geometry of hdc from job until detached.
void SimAttachJob(HDC hdc, SimRenderJob* job);
void SimDetachJob(HDC hdc);

// Page layouts the render side would report for a sheet.
struct SimLayout {
    int pagesPerSheet = 1;   // 1, 2, 4 or 6
    bool booklet = false;    // two images per side, booklet page order
    bool reversed = false;   // images of the sheet in reverse order
    bool backSideTurn = false;
    bool longEdgeDuplex = false;
};
// The page records of one side of a sheet (side 0 first). totalPages is the
// job's logical page count (booklets are padded to a multiple of four).
std::vector<PAGERECORD> SimSheetRecords(const SimRenderJob& job, const SimLayout& layout, int side, int totalPages);

// Redirects gdi32 ExtEscape and GetDeviceCaps of mod to the simulation;
// DCs never attached get the real functions.
void InstallSimRender(HMODULE mod);
