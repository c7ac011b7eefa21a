// The OEM devmode: the plug-in's 1752-byte private part of the driver's
// DEVMODE. It travels with every job and reaches the render side, so every
// offset is binding.
#pragma once
#include "frame/oemui.h"
#include "watermark/wmrecord.h"

#define OEM_SIGNATURE 0x4E52564E  // 'NRVN'
#define OEM_VERSION 1
#define OEMDEV_SIZE 1752

#pragma pack(push, 1)
// Print-and-hold settings (72 bytes).
struct PNHDATA {
    DWORD dwOutputType;       // 0: 0 printer, 1 confidential, 2 reserve, 3 repeat, 4 verify
    WCHAR szUserName[25];     // 4
    WCHAR szPIN[5];           // 54
    DWORD dwKeepPrevious;     // 64
    DWORD dwKeepPrevious2;    // 68: always written equal to dwKeepPrevious
};

// Manual colour settings (20 bytes).
struct MANCOLDATA {
    DWORD dwMethod;        // 0 printer, 1 off, 2 automatic, 3 manual
    DWORD dwRGBImages;
    DWORD dwRGBText;
    DWORD dwRGBGraphics;
    DWORD dwTonerSaver;    // 0 printer, 1 off, 2 on
};

struct OEMDEV {
    OEM_DMEXTRAHEADER dmOEMExtra;  // 0
    INT iOrder;                    // 12: 0 none, 1 all, 2 first/other, 4 odd/even
    INT iPlacement;                // 16: 4 under, 8 over
    DWORD dwReserved;              // 20
    WATERMARK WMARK1;              // 24
    WATERMARK WMARK2;              // 688
    PNHDATA PnHData;               // 1352
    MANCOLDATA ManColData;         // 1424
    BYTE bPageOrder;               // 1444
    BYTE bPagesPerSheet;           // 1445
    BYTE bRasterMode;              // 1446
    BYTE bPad;                     // 1447
    DWORD iLayoutActive;           // 1448
    WCHAR szProfileName[128];      // 1452
    DWORD pOptItems;               // 1708: run-time link cookie (see runtimelinks.h)
    DWORD cDrvOptItems;            // 1712
    DWORD cOEMOptItems;            // 1716
    DWORD iReinitItems;            // 1720
    INT Brightness;                // 1724
    INT Contrast;                  // 1728
    INT ImageSaturation;           // 1732
    INT GrayCorr;                  // 1736
    INT EnhanceLines;              // 1740
    INT HasPrintQuality;           // 1744
    DWORD pPageContext;            // 1748: run-time link cookie
};
#pragma pack(pop)

static_assert(sizeof(PNHDATA) == 72, "PNHDATA");
static_assert(offsetof(PNHDATA, szUserName) == 4 && offsetof(PNHDATA, szPIN) == 54 &&
                  offsetof(PNHDATA, dwKeepPrevious) == 64 && offsetof(PNHDATA, dwKeepPrevious2) == 68,
              "PNHDATA offsets");
static_assert(sizeof(MANCOLDATA) == 20, "MANCOLDATA");
static_assert(sizeof(OEMDEV) == OEMDEV_SIZE, "OEMDEV size");
static_assert(offsetof(OEMDEV, iOrder) == 12, "iOrder");
static_assert(offsetof(OEMDEV, iPlacement) == 16, "iPlacement");
static_assert(offsetof(OEMDEV, dwReserved) == 20, "dwReserved");
static_assert(offsetof(OEMDEV, WMARK1) == 24, "WMARK1");
static_assert(offsetof(OEMDEV, WMARK2) == 688, "WMARK2");
static_assert(offsetof(OEMDEV, PnHData) == 1352, "PnHData");
static_assert(offsetof(OEMDEV, ManColData) == 1424, "ManColData");
static_assert(offsetof(OEMDEV, bPageOrder) == 1444, "bPageOrder");
static_assert(offsetof(OEMDEV, bPagesPerSheet) == 1445, "bPagesPerSheet");
static_assert(offsetof(OEMDEV, bRasterMode) == 1446, "bRasterMode");
static_assert(offsetof(OEMDEV, iLayoutActive) == 1448, "iLayoutActive");
static_assert(offsetof(OEMDEV, szProfileName) == 1452, "szProfileName");
static_assert(offsetof(OEMDEV, pOptItems) == 1708, "pOptItems");
static_assert(offsetof(OEMDEV, cDrvOptItems) == 1712, "cDrvOptItems");
static_assert(offsetof(OEMDEV, cOEMOptItems) == 1716, "cOEMOptItems");
static_assert(offsetof(OEMDEV, iReinitItems) == 1720, "iReinitItems");
static_assert(offsetof(OEMDEV, Brightness) == 1724, "Brightness");
static_assert(offsetof(OEMDEV, Contrast) == 1728, "Contrast");
static_assert(offsetof(OEMDEV, ImageSaturation) == 1732, "ImageSaturation");
static_assert(offsetof(OEMDEV, GrayCorr) == 1736, "GrayCorr");
static_assert(offsetof(OEMDEV, EnhanceLines) == 1740, "EnhanceLines");
static_assert(offsetof(OEMDEV, HasPrintQuality) == 1744, "HasPrintQuality");
static_assert(offsetof(OEMDEV, pPageContext) == 1748, "pPageContext");

// Writes the default record (the fields the default sets; the rest untouched).
void WriteDefaultOemDevmode(OEMDEV* pOut);
// Converts pIn into pOut; either may be null (then nothing happens).
void ConvertOemDevmode(const OEMDEV* pIn, OEMDEV* pOut);
// IPrintOemUI::DevMode after the watermark copy.
HRESULT OemDevMode(DWORD dwMode, POEMDMPARAM pParam);
