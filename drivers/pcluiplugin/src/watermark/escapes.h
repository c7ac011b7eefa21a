// Private escapes to the driver's render-side plug-in. Every call goes
// through ExtEscape on the printer device context; nothing else in the
// engine talks to the render side.
#pragma once
#include "frame/oemdevmode.h"

#include <cstddef>

enum : int {
    ESC_PAGE_NUMBER = 4096,      // out: 32-bit physical page number
    ESC_JOB_ID = 4097,           // result: the print job's identifier
    ESC_OEM_DEVMODE = 4105,      // out: the job's 1752-byte OEM devmode
    ESC_PUBLIC_DEVMODE = 4112,   // out: the job's 220-byte DEVMODEW
    ESC_SET_PAGE_RECORD = 4115,  // in: one page record
    ESC_PAGE_RECORDS = 4116,     // out: the page records of this sheet; result: their count
    ESC_HANDS_OFF = 65570,       // result nonzero: leave this event alone
    ESC_LAYOUT_PAGE = 65550,     // watched, never sent: carries a page image's layout
};

// One page image on the sheet, as exchanged with the render side.
#pragma pack(push, 1)
struct PAGERECORD {
    DWORD dwReserved;       // 0
    INT iPageNumber;        // 4: logical page shown in this image
    FLOAT fScale;           // 8: 1.0 for a plain page
    DWORD dwOrientation;    // 12: 1 untransformed, 2 or 6 rotated, else translated
    RECT rcArea;            // 16: image area on the sheet, device units
    DWORD dwLongEdgeDuplex; // 32
    DWORD dwBackSideTurn;   // 36
};
#pragma pack(pop)
static_assert(sizeof(PAGERECORD) == 40, "PAGERECORD size");
static_assert(offsetof(PAGERECORD, iPageNumber) == 4 && offsetof(PAGERECORD, fScale) == 8 &&
                  offsetof(PAGERECORD, dwOrientation) == 12 && offsetof(PAGERECORD, rcArea) == 16 &&
                  offsetof(PAGERECORD, dwLongEdgeDuplex) == 32 && offsetof(PAGERECORD, dwBackSideTurn) == 36,
              "PAGERECORD offsets");

// The public devmode as the render side hands it over (no private part).
constexpr UINT PUBLIC_DEVMODE_SIZE = 220;
static_assert(sizeof(DEVMODEW) == PUBLIC_DEVMODE_SIZE, "DEVMODEW size");

// Nonzero when the render side asks the plug-in to keep out of this event.
BOOL RenderSideHandsOff(HDC hdc);
// Physical number of the page now printing; 0 when the render side gives none.
INT QueryPageNumber(HDC hdc);
DWORD QueryJobId(HDC hdc);
// The job's OEM devmode; all zeros (no watermark) when the render side does
// not deliver one.
void FetchOemDevmode(HDC hdc, OEMDEV* pOem);
// The job's public devmode; FALSE (and zeros) when the render side fails.
BOOL FetchPublicDevmode(HDC hdc, DEVMODEW* pdm);
void SendPageRecord(HDC hdc, const PAGERECORD& rec);
// Number of page records of the current sheet; negative answers count 0.
int CountPageRecords(HDC hdc);
// Fills at most cMax records; returns how many the render side reports,
// never more than cMax.
int FetchPageRecords(HDC hdc, PAGERECORD* pRecs, int cMax);
