// Page-time printing: at the end of every page, the chosen watermark goes
// onto each page image of the sheet.
#include "watermark/docevent.h"

#include "frame/scoped.h"
#include "frame/spooler.h"
#include "watermark/escapes.h"
#include "watermark/renderer.h"

#include <cstring>
#include <winddiui.h>

namespace {

constexpr int DOCEVENT_OK = 1;   // DOCUMENTEVENT_SUCCESS
constexpr int DOCEVENT_BAD = -1; // DOCUMENTEVENT_FAILURE
constexpr UINT FILTER_EVENTS = 2;
// No sheet holds anywhere near this many page images; a larger count from
// the render side is treated like a failed allocation (and cannot overflow
// the buffer size on 32-bit builds).
constexpr int MAX_PAGE_RECORDS = 4096;
// Layout block of escape 65550: words at these byte offsets.
constexpr int LAYOUT_MIN_SIZE = 100;
constexpr UINT LAYOUT_MAGIC = 100, LAYOUT_VERSION = 1;

void QueryFilter(PVOID pvIn, ULONG cbOut, PVOID pvOut, PINT piResult)
{
    const ULONG header = offsetof(DOCEVENT_FILTER, aDocEventCall);
    if (!pvIn || !pvOut || cbOut < header) {
        *piResult = DOCEVENT_BAD;
        return;
    }
    auto* filter = static_cast<DOCEVENT_FILTER*>(pvOut);
    UINT room = filter->cElementsAllocated;
    const UINT roomInBuffer = (cbOut - header) / sizeof(DWORD);
    if (room > roomInBuffer)
        room = roomInBuffer;
    if (room < FILTER_EVENTS) {
        filter->cElementsNeeded = FILTER_EVENTS;
    } else {
        filter->cElementsReturned = FILTER_EVENTS;
        filter->aDocEventCall[0] = DOCUMENTEVENT_ESCAPE;
        filter->aDocEventCall[1] = DOCUMENTEVENT_ENDPAGE;
    }
    *piResult = DOCEVENT_OK;
}

INT LayoutWord(const BYTE* block, int offset)
{
    INT v;
    std::memcpy(&v, block + offset, sizeof(v));
    return v;
}

void EscapeEvent(HDC hdc, ULONG cbIn, PVOID pvIn, PINT piResult)
{
    const auto* esc = static_cast<const DOCEVENT_ESCAPE*>(pvIn);
    if (!esc || cbIn < sizeof(DOCEVENT_ESCAPE) || esc->iEscape != ESC_LAYOUT_PAGE) {
        *piResult = DOCEVENT_BAD;
        return;
    }
    OEMDEV oem;
    FetchOemDevmode(hdc, &oem);
    if (RenderSideHandsOff(hdc)) {
        *piResult = DOCEVENT_BAD;
        return;
    }
    const auto* block = static_cast<const BYTE*>(esc->pvInData);
    if (!block || esc->cjInput < LAYOUT_MIN_SIZE || !oem.iLayoutActive ||
        static_cast<UINT>(LayoutWord(block, 0)) != LAYOUT_MAGIC ||
        static_cast<UINT>(LayoutWord(block, 4)) != LAYOUT_VERSION) {
        *piResult = DOCEVENT_BAD;
        return;
    }
    PAGERECORD rec = {};
    rec.iPageNumber = LayoutWord(block, 20);
    std::memcpy(&rec.fScale, block + 88, sizeof(rec.fScale));
    rec.dwOrientation = LayoutWord(block, 16);
    rec.rcArea = {LayoutWord(block, 40), LayoutWord(block, 44), LayoutWord(block, 48), LayoutWord(block, 52)};
    rec.dwLongEdgeDuplex = LayoutWord(block, 92);
    rec.dwBackSideTurn = LayoutWord(block, 96);
    SendPageRecord(hdc, rec);
    *piResult = DOCEVENT_OK;
}

// The page records of this sheet, or the one record of a plain page.
int CollectPageRecords(HDC hdc, const OEMDEV& oem, HeapBuffer& buf)
{
    if (oem.iLayoutActive) {
        int n = CountPageRecords(hdc);
        if (n == 0)
            return 0;
        if (n > MAX_PAGE_RECORDS || !buf.alloc(SIZE_T(n) * sizeof(PAGERECORD)))
            return -1;
        return FetchPageRecords(hdc, buf.get<PAGERECORD>(), n);
    }
    if (!buf.alloc(sizeof(PAGERECORD)))
        return -1;
    PAGERECORD& rec = *buf.get<PAGERECORD>();
    rec.iPageNumber = QueryPageNumber(hdc);
    rec.fScale = 1.0f;
    rec.dwOrientation = 1;
    const int pox = GetDeviceCaps(hdc, PHYSICALOFFSETX), poy = GetDeviceCaps(hdc, PHYSICALOFFSETY);
    rec.rcArea = {pox, poy, GetDeviceCaps(hdc, PHYSICALWIDTH) - pox, GetDeviceCaps(hdc, PHYSICALHEIGHT) - poy};
    DEVMODEW dm;
    FetchPublicDevmode(hdc, &dm);
    rec.dwLongEdgeDuplex = dm.dmDuplex == DMDUP_VERTICAL ? 1 : 0;
    return 1;
}

const WATERMARK* ChooseSlot(const OEMDEV& oem, const PAGERECORD& rec, bool& known)
{
    known = true;
    switch (oem.iOrder) {
    case 0: return nullptr;
    case 1: return &oem.WMARK1;
    case 2: return rec.iPageNumber == 1 ? &oem.WMARK1 : &oem.WMARK2;
    case 4: return (rec.iPageNumber & 1) ? &oem.WMARK1 : &oem.WMARK2;
    default: known = false; return nullptr;
    }
}

void SetImageTransform(HDC hdc, const PAGERECORD& rec, INT physicalPage)
{
    const RECT& a = rec.rcArea;
    const FLOAT l = FLOAT(a.left), t = FLOAT(a.top), r = FLOAT(a.right), b = FLOAT(a.bottom);
    if ((physicalPage % 2) == 0 && rec.dwBackSideTurn && rec.dwLongEdgeDuplex == 1) {
        // (x, y) -> (right - y, top + x)
        XFORM rot = {0, 1, -1, 0, 0, 0};
        XFORM move = {1, 0, 0, 1, t, -r};
        SetWorldTransform(hdc, &rot);
        ModifyWorldTransform(hdc, &move, MWT_LEFTMULTIPLY);
    } else if (rec.dwOrientation == 2 || rec.dwOrientation == 6) {
        // (x, y) -> (left + y, bottom - x)
        XFORM rot = {0, -1, 1, 0, 0, 0};
        XFORM move = {1, 0, 0, 1, -b, l};
        SetWorldTransform(hdc, &rot);
        ModifyWorldTransform(hdc, &move, MWT_LEFTMULTIPLY);
    } else if (rec.dwOrientation != 1) {
        XFORM move = {1, 0, 0, 1, l, t};
        SetWorldTransform(hdc, &move);
    }
}

struct PrinterNames {
    WCHAR printer[MAX_PATH];
    WCHAR driver[MAX_PATH];
};

void ReadPrinterNames(HANDLE hPrinter, PrinterNames& names)
{
    names.printer[0] = names.driver[0] = L'\0';
    HeapBuffer buf;
    if (PRINTER_INFO_2W* pi = ReadPrinterInfo2(hPrinter, buf)) {
        CopySpoolerString(names.printer, MAX_PATH, pi->pPrinterName);
        CopySpoolerString(names.driver, MAX_PATH, pi->pDriverName);
    }
}

void EndPageEvent(HANDLE hPrinter, HDC hdc, PINT piResult)
{
    if (RenderSideHandsOff(hdc)) {
        *piResult = DOCEVENT_OK;
        return;
    }
    PrinterNames names;
    ReadPrinterNames(hPrinter, names);
    OEMDEV oem;
    FetchOemDevmode(hdc, &oem);
    HeapBuffer buf;
    const int n = CollectPageRecords(hdc, oem, buf);
    if (n < 0) {
        *piResult = DOCEVENT_OK;
        return;
    }
    const DWORD mode = WMDRAW_PRINT | (oem.iPlacement == 4 ? WMDRAW_UNDER : WMDRAW_OVER);
    const PAGERECORD* recs = buf.get<PAGERECORD>();
    for (int i = 0; i < n; ++i) {
        const PAGERECORD& rec = recs[i];
        const INT physicalPage = QueryPageNumber(hdc);
        bool known = true;
        const WATERMARK* slot = ChooseSlot(oem, rec, known);
        if (!known)
            continue;
        if (!slot || !slot->bSelected) {
            *piResult = DOCEVENT_OK;
            continue;
        }
        // World transforms need the advanced mode; the application's own
        // mode comes back once the transform is identity again.
        const int oldMode = SetGraphicsMode(hdc, GM_ADVANCED);
        SetImageTransform(hdc, rec, physicalPage);
        DrawWatermark(hdc, hPrinter, slot, &rec.rcArea, mode, rec.fScale, names.printer, names.driver,
                      rec.iPageNumber, rec.dwOrientation, oem.iLayoutActive);
        ModifyWorldTransform(hdc, nullptr, MWT_IDENTITY);
        if (oldMode)
            SetGraphicsMode(hdc, oldMode);
        *piResult = DOCEVENT_OK;
    }
}

}  // namespace

HRESULT HandleDocumentEvent(HANDLE hPrinter, HDC hdc, INT iEsc, ULONG cbIn, PVOID pvIn, ULONG cbOut, PVOID pvOut,
                            PINT piResult)
{
    if (!piResult)
        return S_OK;
    switch (iEsc) {
    case DOCUMENTEVENT_QUERYFILTER: QueryFilter(pvIn, cbOut, pvOut, piResult); break;
    case DOCUMENTEVENT_ESCAPE: EscapeEvent(hdc, cbIn, pvIn, piResult); break;
    case DOCUMENTEVENT_ENDPAGE: EndPageEvent(hPrinter, hdc, piResult); break;
    default: break;
    }
    return S_OK;
}
