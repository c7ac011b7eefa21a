// Declarations of the Unidrv user-interface plug-in interfaces and parameter
// blocks. MinGW ships the common property-sheet and spooler headers but not
// these, so they are declared here from the published reference of each
// method and structure. The layouts are shared with the driver: every block
// carries static_asserts for both the 32- and the 64-bit build.
#pragma once

#include <windows.h>
#include <objbase.h>
#include <winspool.h>
#include <winddiui.h>
#include <compstui.h>

#include <cstddef>

// ---- constants ----------------------------------------------------------

// IPrintOemUI::GetInfo modes
#define OEMGI_GETSIGNATURE 1
#define OEMGI_GETINTERFACEVERSION 2
#define OEMGI_GETVERSION 3
#define OEMGI_GETPUBLISHERINFO 4

// IPrintOemUI::DevMode modes
#define OEMDM_SIZE 1
#define OEMDM_DEFAULT 2
#define OEMDM_CONVERT 3
#define OEMDM_MERGE 4

// IPrintOemUI::CommonUIProp modes
#define OEMCUIP_DOCPROP 1
#define OEMCUIP_PRNPROP 2

// OEMUIPSPARAM::dwFlags / OEMCUIPPARAM::dwFlags
#ifndef DM_NOPERMISSION
#define DM_NOPERMISSION 0x00000020
#endif

#ifndef QCP_DEVICEPROFILE
#define QCP_DEVICEPROFILE 0x0000
#endif
#ifndef QCP_PROFILEDISK
#define QCP_PROFILEDISK 0x0002
#endif

// ---- parameter blocks ---------------------------------------------------

struct OEMUIPROCS;

typedef BOOL(APIENTRY* PFN_DrvGetDriverSetting)(PVOID pdriverobj, PCSTR Feature, PVOID pOutput,
                                                DWORD cbSize, PDWORD pcbNeeded,
                                                PDWORD pdwOptionsReturned);
typedef BOOL(APIENTRY* PFN_DrvUpdateUISetting)(PVOID pdriverobj, PVOID pOptItem,
                                               DWORD dwPreviousSelection, DWORD dwMode);

struct OEMUIPROCS {
    PFN_DrvGetDriverSetting DrvGetDriverSetting;
    PFN_DrvUpdateUISetting DrvUpdateUISetting;
};
typedef OEMUIPROCS* POEMUIPROCS;

struct OEMUIOBJ {
    DWORD cbSize;
    POEMUIPROCS pOemUIProcs;
};
typedef OEMUIOBJ* POEMUIOBJ;

struct OEM_DMEXTRAHEADER {
    DWORD dwSize;
    DWORD dwSignature;
    DWORD dwVersion;
};
typedef OEM_DMEXTRAHEADER* POEM_DMEXTRAHEADER;

struct OEMDMPARAM {
    DWORD cbSize;
    PVOID pdriverobj;
    HANDLE hPrinter;
    HANDLE hModule;
    PDEVMODEW pPublicDMIn;
    PDEVMODEW pPublicDMOut;
    PVOID pOEMDMIn;
    PVOID pOEMDMOut;
    DWORD cbBufSize;
};
typedef OEMDMPARAM* POEMDMPARAM;

struct OEMCUIPPARAM;
typedef LONG(APIENTRY* OEMCUIPCALLBACK)(PCPSUICBPARAM, OEMCUIPPARAM*);

struct OEMCUIPPARAM {
    DWORD cbSize;
    POEMUIOBJ poemuiobj;
    HANDLE hPrinter;
    PWSTR pPrinterName;
    HANDLE hModule;
    HANDLE hOEMHeap;
    PDEVMODEW pPublicDM;
    PVOID pOEMDM;
    DWORD dwFlags;
    POPTITEM pDrvOptItems;
    DWORD cDrvOptItems;
    POPTITEM pOEMOptItems;
    DWORD cOEMOptItems;
    PVOID pOEMUserData;
    OEMCUIPCALLBACK OEMCUIPCallback;
};
typedef OEMCUIPPARAM* POEMCUIPPARAM;

struct OEMUIPSPARAM {
    DWORD cbSize;
    POEMUIOBJ poemuiobj;
    HANDLE hPrinter;
    PWSTR pPrinterName;
    HANDLE hModule;
    HANDLE hOEMHeap;
    PDEVMODEW pPublicDM;
    PVOID pOEMDM;
    PVOID pOEMUserData;
    DWORD dwFlags;
    PVOID pOemEntry;
};
typedef OEMUIPSPARAM* POEMUIPSPARAM;

// ---- interfaces ---------------------------------------------------------

// The driver's helper interface, handed to PublishDriverInterface.
struct IPrintOemDriverUI : public IUnknown {
    virtual HRESULT STDMETHODCALLTYPE DrvGetDriverSetting(PVOID pci, PCSTR Feature, PVOID pOutput,
                                                          DWORD cbSize, PDWORD pcbNeeded,
                                                          PDWORD pdwOptionsReturned) = 0;
    virtual HRESULT STDMETHODCALLTYPE DrvUpgradeRegistrySetting(HANDLE hPrinter, PCSTR pFeature,
                                                                PCSTR pOption) = 0;
    virtual HRESULT STDMETHODCALLTYPE DrvUpdateUISetting(PVOID pci, PVOID pOptItem,
                                                         DWORD dwPreviousSelection,
                                                         DWORD dwMode) = 0;
};

// The plug-in's interface, slots in the order the driver calls them through.
struct IPrintOemUI : public IUnknown {
    virtual HRESULT STDMETHODCALLTYPE GetInfo(DWORD dwMode, PVOID pBuffer, DWORD cbSize,
                                              PDWORD pcbNeeded) = 0;
    virtual HRESULT STDMETHODCALLTYPE DevMode(DWORD dwMode, POEMDMPARAM pOemDMParam) = 0;
    virtual HRESULT STDMETHODCALLTYPE PublishDriverInterface(IUnknown* pIUnknown) = 0;
    virtual HRESULT STDMETHODCALLTYPE CommonUIProp(DWORD dwMode, POEMCUIPPARAM pOemCUIPParam) = 0;
    virtual HRESULT STDMETHODCALLTYPE DocumentPropertySheets(PPROPSHEETUI_INFO pPSUIInfo,
                                                             LPARAM lParam) = 0;
    virtual HRESULT STDMETHODCALLTYPE DevicePropertySheets(PPROPSHEETUI_INFO pPSUIInfo,
                                                           LPARAM lParam) = 0;
    virtual HRESULT STDMETHODCALLTYPE DevQueryPrintEx(POEMUIOBJ poemuiobj,
                                                      PVOID pDQPInfo,
                                                      PDEVMODEW pPublicDM, PVOID pOEMDM) = 0;
    virtual HRESULT STDMETHODCALLTYPE DeviceCapabilities(POEMUIOBJ poemuiobj, HANDLE hPrinter,
                                                         PWSTR pDeviceName, WORD wCapability,
                                                         PVOID pOutput, PDEVMODEW pPublicDM,
                                                         PVOID pOEMDM, DWORD dwOld,
                                                         DWORD* dwResult) = 0;
    virtual HRESULT STDMETHODCALLTYPE UpgradePrinter(DWORD dwLevel, PBYTE pDriverUpgradeInfo) = 0;
    virtual HRESULT STDMETHODCALLTYPE PrinterEvent(PWSTR pPrinterName, INT iDriverEvent,
                                                   DWORD dwFlags, LPARAM lParam) = 0;
    virtual HRESULT STDMETHODCALLTYPE DriverEvent(DWORD dwDriverEvent, DWORD dwLevel,
                                                  LPBYTE pDriverInfo, LPARAM lParam) = 0;
    virtual HRESULT STDMETHODCALLTYPE QueryColorProfile(HANDLE hPrinter, POEMUIOBJ poemuiobj,
                                                        PDEVMODEW pPublicDM, PVOID pOEMDM,
                                                        ULONG ulQueryMode, VOID* pvProfileData,
                                                        ULONG* pcbProfileData,
                                                        FLONG* pflProfileData) = 0;
    virtual HRESULT STDMETHODCALLTYPE FontInstallerDlgProc(HWND hWnd, UINT usMsg, WPARAM wParam,
                                                           LPARAM lParam) = 0;
    virtual HRESULT STDMETHODCALLTYPE UpdateExternalFonts(HANDLE hPrinter, HANDLE hHeap,
                                                          PWSTR pwstrCartridges) = 0;
};

struct IPrintOemUI2 : public IPrintOemUI {
    virtual HRESULT STDMETHODCALLTYPE QueryJobAttributes(HANDLE hPrinter, PDEVMODEW pDevmode,
                                                         DWORD dwLevel,
                                                         LPBYTE lpAttributeInfo) = 0;
    virtual HRESULT STDMETHODCALLTYPE HideStandardUI(DWORD dwMode) = 0;
    virtual HRESULT STDMETHODCALLTYPE DocumentEvent(HANDLE hPrinter, HDC hdc, INT iEsc, ULONG cbIn,
                                                    PVOID pvIn, ULONG cbOut, PVOID pvOut,
                                                    PINT piResult) = 0;
};

// ---- identifiers (defined once, in frame/guids.cpp) -----------------------

extern "C" const CLSID CLSID_OEMUI;
extern "C" const IID IID_IPrintOemUI;
extern "C" const IID IID_IPrintOemUI2;
extern "C" const IID IID_IPrintOemDriverUI;

// ---- layout checks -------------------------------------------------------

#define PCLUI_PTR_OFFSET(i32, i64) (sizeof(void*) == 8 ? (i64) : (i32))

static_assert(sizeof(OEM_DMEXTRAHEADER) == 12, "OEM_DMEXTRAHEADER");
static_assert(sizeof(OEMUIPROCS) == 2 * sizeof(void*), "OEMUIPROCS");
static_assert(offsetof(OEMUIOBJ, pOemUIProcs) == PCLUI_PTR_OFFSET(4, 8), "OEMUIOBJ");
static_assert(sizeof(OEMUIOBJ) == PCLUI_PTR_OFFSET(8, 16), "OEMUIOBJ size");

static_assert(offsetof(OEMDMPARAM, pdriverobj) == PCLUI_PTR_OFFSET(4, 8), "OEMDMPARAM");
static_assert(offsetof(OEMDMPARAM, hPrinter) == PCLUI_PTR_OFFSET(8, 16), "OEMDMPARAM");
static_assert(offsetof(OEMDMPARAM, pPublicDMIn) == PCLUI_PTR_OFFSET(16, 32), "OEMDMPARAM");
static_assert(offsetof(OEMDMPARAM, pOEMDMIn) == PCLUI_PTR_OFFSET(24, 48), "OEMDMPARAM");
static_assert(offsetof(OEMDMPARAM, pOEMDMOut) == PCLUI_PTR_OFFSET(28, 56), "OEMDMPARAM");
static_assert(offsetof(OEMDMPARAM, cbBufSize) == PCLUI_PTR_OFFSET(32, 64), "OEMDMPARAM");
static_assert(sizeof(OEMDMPARAM) == PCLUI_PTR_OFFSET(36, 72), "OEMDMPARAM size");

static_assert(offsetof(OEMUIPSPARAM, poemuiobj) == PCLUI_PTR_OFFSET(4, 8), "OEMUIPSPARAM");
static_assert(offsetof(OEMUIPSPARAM, hOEMHeap) == PCLUI_PTR_OFFSET(20, 40), "OEMUIPSPARAM");
static_assert(offsetof(OEMUIPSPARAM, pOEMDM) == PCLUI_PTR_OFFSET(28, 56), "OEMUIPSPARAM");
static_assert(offsetof(OEMUIPSPARAM, pOEMUserData) == PCLUI_PTR_OFFSET(32, 64), "OEMUIPSPARAM");
static_assert(offsetof(OEMUIPSPARAM, dwFlags) == PCLUI_PTR_OFFSET(36, 72), "OEMUIPSPARAM");
static_assert(offsetof(OEMUIPSPARAM, pOemEntry) == PCLUI_PTR_OFFSET(40, 80), "OEMUIPSPARAM");
static_assert(sizeof(OEMUIPSPARAM) == PCLUI_PTR_OFFSET(44, 88), "OEMUIPSPARAM size");

static_assert(offsetof(OEMCUIPPARAM, pOEMDM) == PCLUI_PTR_OFFSET(28, 56), "OEMCUIPPARAM");
static_assert(offsetof(OEMCUIPPARAM, dwFlags) == PCLUI_PTR_OFFSET(32, 64), "OEMCUIPPARAM");
static_assert(offsetof(OEMCUIPPARAM, pDrvOptItems) == PCLUI_PTR_OFFSET(36, 72), "OEMCUIPPARAM");
static_assert(offsetof(OEMCUIPPARAM, cDrvOptItems) == PCLUI_PTR_OFFSET(40, 80), "OEMCUIPPARAM");
static_assert(offsetof(OEMCUIPPARAM, pOEMOptItems) == PCLUI_PTR_OFFSET(44, 88), "OEMCUIPPARAM");
static_assert(offsetof(OEMCUIPPARAM, cOEMOptItems) == PCLUI_PTR_OFFSET(48, 96), "OEMCUIPPARAM");
static_assert(offsetof(OEMCUIPPARAM, pOEMUserData) == PCLUI_PTR_OFFSET(52, 104), "OEMCUIPPARAM");
static_assert(offsetof(OEMCUIPPARAM, OEMCUIPCallback) == PCLUI_PTR_OFFSET(56, 112),
              "OEMCUIPPARAM");
static_assert(sizeof(OEMCUIPPARAM) == PCLUI_PTR_OFFSET(60, 120), "OEMCUIPPARAM size");

// Blocks of the common property-sheet and document-event interfaces that the
// plug-in reads or writes; MinGW declares them, the checks guard the layout.
static_assert(offsetof(PROPSHEETUI_INFO, hComPropSheet) == 8, "PROPSHEETUI_INFO");
static_assert(offsetof(PROPSHEETUI_INFO, pfnComPropSheet) == PCLUI_PTR_OFFSET(12, 16),
              "PROPSHEETUI_INFO");
static_assert(offsetof(PROPSHEETUI_INFO, lParamInit) == PCLUI_PTR_OFFSET(16, 24),
              "PROPSHEETUI_INFO");
static_assert(offsetof(PROPSHEETUI_INFO, Result) == PCLUI_PTR_OFFSET(24, 40), "PROPSHEETUI_INFO");
static_assert(sizeof(DOCEVENT_FILTER) == 20, "DOCEVENT_FILTER");
static_assert(offsetof(DOCEVENT_ESCAPE, iEscape) == 0 && offsetof(DOCEVENT_ESCAPE, cjInput) == 4 &&
                  offsetof(DOCEVENT_ESCAPE, pvInData) == 8,
              "DOCEVENT_ESCAPE");
