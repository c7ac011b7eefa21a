// The watermark record: one 664-byte watermark definition, stored byte for
// byte in the registry, in the OEM devmode and (as hex) in DCF files.
#pragma once
#include <windows.h>
#include <cstddef>

#pragma pack(push, 1)
struct WATERMARK {
    WCHAR szName[128];    // 0
    WCHAR szText[128];    // 256
    COLORREF crColor;     // 512
    BYTE bIntensity;      // 516
    BYTE bPad1[3];        // 517
    LOGFONTW lfFont;      // 520
    BYTE bOutline;        // 612
    BYTE bPad2[3];        // 613
    INT iPointSize;       // 616
    BYTE bSelected;       // 620
    BYTE bPad3[3];        // 621
    double dHorzOffset;   // 624
    double dVertOffset;   // 632
    INT iVertPos;         // 640: 1 centre, 2 top, 3 bottom
    INT iHorzPos;         // 644: 1 centre, 2 right, 3 left
    INT iUnits;           // 648: 1 inches, 2 millimetres
    BYTE bDynamic;        // 652
    BYTE bPad4[3];        // 653
    DWORD pNext;          // 656: stale in every stored copy, never followed
    DWORD dwPad5;         // 660
};
#pragma pack(pop)

static_assert(sizeof(LOGFONTW) == 92, "LOGFONTW");
static_assert(sizeof(WATERMARK) == 664, "WATERMARK size");
static_assert(offsetof(WATERMARK, szText) == 256, "szText");
static_assert(offsetof(WATERMARK, crColor) == 512, "crColor");
static_assert(offsetof(WATERMARK, bIntensity) == 516, "bIntensity");
static_assert(offsetof(WATERMARK, lfFont) == 520, "lfFont");
static_assert(offsetof(WATERMARK, bOutline) == 612, "bOutline");
static_assert(offsetof(WATERMARK, iPointSize) == 616, "iPointSize");
static_assert(offsetof(WATERMARK, bSelected) == 620, "bSelected");
static_assert(offsetof(WATERMARK, dHorzOffset) == 624, "dHorzOffset");
static_assert(offsetof(WATERMARK, dVertOffset) == 632, "dVertOffset");
static_assert(offsetof(WATERMARK, iVertPos) == 640, "iVertPos");
static_assert(offsetof(WATERMARK, iHorzPos) == 644, "iHorzPos");
static_assert(offsetof(WATERMARK, iUnits) == 648, "iUnits");
static_assert(offsetof(WATERMARK, bDynamic) == 652, "bDynamic");
static_assert(offsetof(WATERMARK, pNext) == 656, "pNext");

enum : INT { WM_POS_CENTRE = 1, WM_VPOS_TOP = 2, WM_VPOS_BOTTOM = 3, WM_HPOS_RIGHT = 2, WM_HPOS_LEFT = 3 };
enum : INT { WM_UNITS_INCHES = 1, WM_UNITS_MM = 2 };

// A node of an in-memory watermark list. The record's own 32-bit pNext
// cannot hold a 64-bit pointer, so the link lives beside the record; the
// record's pNext stays 0 in every copy the plug-in writes.
struct WatermarkNode {
    WATERMARK wm;
    WatermarkNode* next;
};

// Appends a zero-filled node at the tail (allocated from hHeap); null when
// the allocation fails.
WatermarkNode* AppendWatermarkNode(WatermarkNode** ppHead, HANDLE hHeap);
// Frees every node of the list to hHeap and empties the head.
void FreeWatermarkList(WatermarkNode** ppHead, HANDLE hHeap);
// First node whose szName equals pszName without regard to case.
WatermarkNode* FindWatermarkByName(WatermarkNode* pHead, LPCWSTR pszName);
size_t WatermarkListLength(const WatermarkNode* pHead);

// Length of a fixed text field that may lack its terminator.
size_t BoundedLength(const WCHAR* psz, size_t cchField);

// The four default watermarks, in seeding order.
void BuildDefaultWatermarks(WATERMARK aWm[4]);
