// The page context: the per-sheet state shared by all pages and dialogs of
// one property sheet. It lives in the driver's OEM heap from INIT to the end
// of the sheet; the OEM devmode reaches it through its pPageContext cookie.
#pragma once
#include "frame/oemdevmode.h"

// The plug-in's settings being edited while the sheet is open.
struct WORKINGSETTINGS {
    INT iOrder;
    INT iPlacement;
    WATERMARK WMARK1;
    WATERMARK WMARK2;
    PNHDATA PnHData;
    MANCOLDATA ManColData;
    INT Brightness;
    INT Contrast;
    INT ImageSaturation;
    INT GrayCorr;
    INT EnhanceLines;
    INT HasPrintQuality;
};

enum : DWORD { DLGOUTCOME_CHANGED = 1, DLGOUTCOME_UNCHANGED = 2 };
enum : DWORD { DLGMODE_ADD = 0, DLGMODE_EDIT = 1, DLGMODE_DELETE = 2 };

struct PAGECONTEXT {
    HANDLE hComPropSheet;             // sheet handle for the sheet callback
    POEMUIPSPARAM pParam;             // the driver's parameter block
    PFNCOMPROPSHEET pfnComPropSheet;  // the sheet callback
    DWORD dwDialogOutcome;            // 1 changed, 2 cancelled or acted on
    HANDLE hPrinter;
    DWORD dwDialogMode;               // 0 add, 1 edit, 2 delete
    DWORD bKeepPrevious;              // "HasKeepPreviousPHJobs"
    DWORD bNoPermission;              // DM_NOPERMISSION
    WCHAR szPrinterName[260];
    WCHAR szDriverName[260];
    WatermarkNode* pWatermarkList;    // from the process heap
    WatermarkNode* pEditedRecord;     // null when adding
    WATERMARK* pPreviewRecord;        // scratch record of the add/edit dialog
    OEMDEV* pOemDevmode;
    IPrintOemDriverUI* pDriverUI;     // document sheet only
    INT iWatermarkModeEcho;           // watermark page's iOrder when it was left
    WCHAR szSelectedName[2][128];
    DWORD bDeletedSelection;
    DWORD bColorPrinter;              // "IsColorPrinter"
    DWORD bApplied;
    WCHAR szNewName[128];
    WCHAR szOldName[128];
    WORKINGSETTINGS ws;
    WCHAR szDcfPath[260];
    WCHAR szTextBuffer[128];          // between add/edit and dynamic variables dialogs
};

// The page context a page receives with WM_INITDIALOG (its PROPSHEETPAGEW).
inline PAGECONTEXT* PageContextFromInit(LPARAM lParam)
{
    auto* psp = reinterpret_cast<const PROPSHEETPAGEW*>(lParam);
    return psp ? reinterpret_cast<PAGECONTEXT*>(psp->lParam) : nullptr;
}

// The page context of a page window (kept in its GWLP_USERDATA).
inline PAGECONTEXT* PageContextOf(HWND hwnd)
{
    return reinterpret_cast<PAGECONTEXT*>(GetWindowLongPtrW(hwnd, GWLP_USERDATA));
}
