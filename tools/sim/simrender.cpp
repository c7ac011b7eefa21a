#include "simrender.h"
#include "iathook.h"

#include <algorithm>
#include <cmath>
#include <cstring>

namespace {

std::map<HDC, SimRenderJob*> g_jobs;

using ExtEscapeFn = int(WINAPI*)(HDC, int, int, LPCSTR, int, LPSTR);
using GetDeviceCapsFn = int(WINAPI*)(HDC, int);

ExtEscapeFn RealExtEscape()
{
    static auto fn = reinterpret_cast<ExtEscapeFn>(GetProcAddress(GetModuleHandleW(L"gdi32.dll"), "ExtEscape"));
    return fn;
}
GetDeviceCapsFn RealGetDeviceCaps()
{
    static auto fn =
        reinterpret_cast<GetDeviceCapsFn>(GetProcAddress(GetModuleHandleW(L"gdi32.dll"), "GetDeviceCaps"));
    return fn;
}

SimRenderJob* JobOf(HDC hdc)
{
    auto it = g_jobs.find(hdc);
    return it == g_jobs.end() ? nullptr : it->second;
}

template <class T> int CopyOut(const T& v, int cbOutput, LPSTR out)
{
    if (!out || cbOutput < int(sizeof(T)))
        return -1;
    std::memcpy(out, &v, sizeof(T));
    return 1;
}

int WINAPI SimExtEscape(HDC hdc, int code, int cbInput, LPCSTR in, int cbOutput, LPSTR out)
{
    SimRenderJob* job = JobOf(hdc);
    if (!job)
        return RealExtEscape()(hdc, code, cbInput, in, cbOutput, out);
    job->escapeCalls[code]++;
    switch (code) {
    case ESC_PAGE_NUMBER: return CopyOut(job->physicalPage, cbOutput, out);
    case ESC_JOB_ID: return int(job->jobId);
    case ESC_OEM_DEVMODE: return job->failOemDevmode ? -1 : CopyOut(job->oem, cbOutput, out);
    case ESC_PUBLIC_DEVMODE: return job->failPublicDevmode ? -1 : CopyOut(job->dm, cbOutput, out);
    case ESC_SET_PAGE_RECORD:
        if (!in || cbInput != int(sizeof(PAGERECORD)))
            return -1;
        job->received.emplace_back();
        std::memcpy(&job->received.back(), in, sizeof(PAGERECORD));
        return 1;
    case ESC_PAGE_RECORDS: {
        const int n = int(job->sheet.size());
        if (!out)
            return job->reportedCount >= 0 ? job->reportedCount : n;
        const int fit = cbOutput / int(sizeof(PAGERECORD));
        const int copy = n < fit ? n : fit;
        if (copy > 0)
            std::memcpy(out, job->sheet.data(), copy * sizeof(PAGERECORD));
        return copy;
    }
    case ESC_HANDS_OFF: return job->handsOff;
    default: return 0;
    }
}

int WINAPI SimGetDeviceCaps(HDC hdc, int index)
{
    SimRenderJob* job = JobOf(hdc);
    if (!job)
        return RealGetDeviceCaps()(hdc, index);
    switch (index) {
    case PHYSICALWIDTH: return job->physicalWidth;
    case PHYSICALHEIGHT: return job->physicalHeight;
    case PHYSICALOFFSETX: return job->offsetX;
    case PHYSICALOFFSETY: return job->offsetY;
    case LOGPIXELSX:
    case LOGPIXELSY: return job->dpi;
    case HORZRES: return SimPrintableWidth(*job);
    case VERTRES: return SimPrintableHeight(*job);
    case TECHNOLOGY: return DT_RASPRINTER;
    default: return RealGetDeviceCaps()(hdc, index);
    }
}

PAGERECORD Record(int page, float scale, DWORD orientation, RECT area, const SimLayout& layout)
{
    PAGERECORD r = {};
    r.iPageNumber = page;
    r.fScale = scale;
    r.dwOrientation = orientation;
    r.rcArea = area;
    r.dwLongEdgeDuplex = layout.longEdgeDuplex ? 1 : 0;
    r.dwBackSideTurn = layout.backSideTurn ? 1 : 0;
    return r;
}

}  // namespace

void SimSetA4(SimRenderJob& job, int dpi)
{
    job.dpi = dpi;
    job.physicalWidth = MulDiv(2100, dpi, 254);
    job.physicalHeight = MulDiv(2970, dpi, 254);
    job.offsetX = job.offsetY = dpi / 6;
    job.dm.dmSize = sizeof(DEVMODEW);
    job.dm.dmFields = DM_ORIENTATION | DM_SCALE | DM_PRINTQUALITY | DM_DUPLEX;
    job.dm.dmOrientation = DMORIENT_PORTRAIT;
    job.dm.dmScale = 100;
    job.dm.dmPrintQuality = short(dpi);
    job.dm.dmDuplex = DMDUP_SIMPLEX;
}

int SimPrintableWidth(const SimRenderJob& job) { return job.physicalWidth - 2 * job.offsetX; }
int SimPrintableHeight(const SimRenderJob& job) { return job.physicalHeight - 2 * job.offsetY; }

SimPage::SimPage(SimRenderJob& job, int bitsPerPixel) : bpp_(bitsPerPixel)
{
    w_ = SimPrintableWidth(job);
    h_ = SimPrintableHeight(job);
    struct {
        BITMAPINFOHEADER h;
        RGBQUAD colours[2];
    } bi = {};
    bi.h.biSize = sizeof(bi.h);
    bi.h.biWidth = w_;
    bi.h.biHeight = -h_;
    bi.h.biPlanes = 1;
    bi.h.biBitCount = WORD(bpp_);
    bi.h.biCompression = BI_RGB;
    bi.colours[1] = {255, 255, 255, 0};
    dc_ = CreateCompatibleDC(nullptr);
    void* bits = nullptr;
    bmp_ = CreateDIBSection(dc_, reinterpret_cast<BITMAPINFO*>(&bi), DIB_RGB_COLORS, &bits, nullptr, 0);
    bits_ = static_cast<BYTE*>(bits);
    stride_ = ((w_ * bpp_ + 31) / 32) * 4;
    old_ = SelectObject(dc_, bmp_);
    Clear();
    SimAttachJob(dc_, &job);
}

SimPage::~SimPage()
{
    SimDetachJob(dc_);
    if (old_)
        SelectObject(dc_, old_);
    DeleteObject(bmp_);
    DeleteDC(dc_);
}

void SimPage::Clear()
{
    GdiFlush();
    if (bits_)
        std::memset(bits_, 0xFF, size_t(stride_) * h_);
}

COLORREF SimPage::Pixel(int x, int y) const
{
    GdiFlush();
    if (!bits_ || x < 0 || y < 0 || x >= w_ || y >= h_)
        return CLR_INVALID;
    const BYTE* row = bits_ + size_t(stride_) * y;
    if (bpp_ == 1)
        return (row[x / 8] & (0x80 >> (x % 8))) ? RGB(255, 255, 255) : RGB(0, 0, 0);
    const BYTE* p = row + x * 3;
    return RGB(p[2], p[1], p[0]);
}

RECT SimPage::InkBounds() const
{
    RECT r = {w_, h_, 0, 0};
    for (int y = 0; y < h_; ++y)
        for (int x = 0; x < w_; ++x)
            if (Pixel(x, y) != RGB(255, 255, 255)) {
                if (x < r.left) r.left = x;
                if (y < r.top) r.top = y;
                if (x + 1 > r.right) r.right = x + 1;
                if (y + 1 > r.bottom) r.bottom = y + 1;
            }
    if (r.right <= r.left)
        r = {0, 0, 0, 0};
    return r;
}

long SimPage::InkCount() const
{
    long n = 0;
    for (int y = 0; y < h_; ++y)
        for (int x = 0; x < w_; ++x)
            n += Pixel(x, y) != RGB(255, 255, 255);
    return n;
}

void SimAttachJob(HDC hdc, SimRenderJob* job) { g_jobs[hdc] = job; }
void SimDetachJob(HDC hdc) { g_jobs.erase(hdc); }

std::vector<PAGERECORD> SimSheetRecords(const SimRenderJob& job, const SimLayout& layout, int side, int totalPages)
{
    const int W = SimPrintableWidth(job), H = SimPrintableHeight(job);
    const float pageW = float(W), pageH = float(H);
    std::vector<PAGERECORD> recs;
    if (layout.booklet) {
        const int n = ((totalPages + 3) / 4) * 4;
        const int first = (side % 2 == 0) ? n - side : side + 1;
        const int second = (side % 2 == 0) ? side + 1 : n - side;
        const float scale = std::min(pageW / pageH, (pageH / 2) / pageW);
        recs.push_back(Record(first, scale, 2, {0, 0, W, H / 2}, layout));
        recs.push_back(Record(second, scale, 2, {0, H / 2, W, H}, layout));
    } else {
        const int per = layout.pagesPerSheet;
        const int base = side * per + 1;
        if (per == 2) {
            const float scale = std::min(pageW / pageH, (pageH / 2) / pageW);
            recs.push_back(Record(base, scale, 2, {0, 0, W, H / 2}, layout));
            recs.push_back(Record(base + 1, scale, 2, {0, H / 2, W, H}, layout));
        } else if (per == 4 || per == 6) {
            const int cols = 2, rows = per / 2;
            const int cw = W / cols, ch = H / rows;
            const float scale = std::min(float(cw) / pageW, float(ch) / pageH);
            for (int i = 0; i < per; ++i) {
                const int c = i % cols, r = i / cols;
                recs.push_back(Record(base + i, scale, 3, {c * cw, r * ch, (c + 1) * cw, (r + 1) * ch}, layout));
            }
        } else {
            recs.push_back(Record(base, 1.0f, 3, {0, 0, W, H}, layout));
        }
    }
    if (layout.reversed)
        for (size_t i = 0, j = recs.size() - 1; i < j; ++i, --j)
            std::swap(recs[i].iPageNumber, recs[j].iPageNumber);
    return recs;
}

void InstallSimRender(HMODULE mod)
{
    PatchImport(mod, "gdi32.dll", "ExtEscape", reinterpret_cast<void*>(&SimExtEscape));
    PatchImport(mod, "gdi32.dll", "GetDeviceCaps", reinterpret_cast<void*>(&SimGetDeviceCaps));
}
