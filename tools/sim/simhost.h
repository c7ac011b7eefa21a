// A simulated Unidrv host for the plug-in's property sheets: the driver's
// parameter block with a private OEM heap, a UI object whose procedures
// record DrvUpdateUISetting, the driver helper interface answering feature
// keywords, and a common property-sheet callback that records what the
// plug-in adds and can show the pages in a real comctl32 property sheet.
// The host reaches the plug-in only through its COM interface.
#pragma once
#include "frame/oemdevmode.h"
#include "simdriverui.h"

#include <string>
#include <vector>

struct SimSheetCall {
    WPARAM function;  // CPSFUNC_*
    LPARAM lParam1;
    LPARAM lParam2;
    LONG_PTR answer;
};

class SimHost {
public:
    // A printer named printerName with driver driverName is added to the
    // simulated spooler. The host takes over the reference to a fresh
    // plug-in object, which gets this host's driver UI (a plug-in object
    // keeps the first driver interface it is given, as with the driver).
    SimHost(IPrintOemUI2* plugin, const std::wstring& printerName, const std::wstring& driverName);
    ~SimHost();
    SimHost(const SimHost&) = delete;
    SimHost& operator=(const SimHost&) = delete;

    SimDriverUI driverUI;
    OEMDEV oem{};                  // the OEM devmode being edited
    DEVMODEW publicDm{};
    DWORD paramFlags = 0;          // OEMUIPSPARAM dwFlags (0x20: no permission)
    int refuseAddsFrom = -1;       // page additions from this index on are refused (answer 0)
    bool failHeap = false;         // the OEM heap cannot give memory

    // Sheet reasons, through the plug-in's COM interface.
    HRESULT InitDocumentSheet();
    HRESULT InitDeviceSheet();
    HRESULT Destroy();
    HRESULT CallReason(WORD reason, LPARAM lParam, bool device = false, WORD version = 0x0100);
    ULONG_PTR Result() const { return info_.Result; }

    // Pages the plug-in added, in order.
    std::vector<PROPSHEETPAGEW> pages;
    std::vector<WORD> PageTemplates() const;
    std::vector<SimSheetCall> calls;
    std::vector<PVOID> updatedItems;  // DrvUpdateUISetting through the UI object
    POEMUIPSPARAM Param() { return &param_; }
    HANDLE Printer() const { return hPrinter_; }
    HANDLE Heap() const { return heap_; }

    // Shows the recorded pages in a modeless PropertySheetW and returns the
    // sheet window (pages are created as comctl32 creates them).
    HWND ShowSheet(const wchar_t* caption = L"Norvane LaserJet — настройка печати", HWND owner = nullptr);
    void CloseSheet();
    HWND Sheet() const { return sheet_; }
    IPrintOemUI2* Plugin() const { return plugin_; }
    // The page window showing template id, or null when not created yet.
    HWND PageWindow(WORD templateId);
    // Switches tabs as a user does; FALSE when the current page refused.
    BOOL SelectPage(WORD templateId);
    // Presses the sheet's Apply button: kill-active and apply notifications
    // as comctl32 sends them. Returns TRUE when every page accepted.
    BOOL Apply();

private:
    static LONG_PTR CALLBACK SheetCallback(HANDLE hComPropSheet, UINT function, LPARAM lParam1, LPARAM lParam2);
    static BOOL APIENTRY ProcGetDriverSetting(PVOID, PCSTR, PVOID, DWORD, PDWORD, PDWORD);
    static BOOL APIENTRY ProcUpdateUISetting(PVOID, PVOID, DWORD, DWORD);
    HRESULT Init(bool device);
    int IndexOf(WORD templateId) const;

    IPrintOemUI2* plugin_;
    SimDriverObject driverObject_;
    std::wstring printerName_;
    HANDLE hPrinter_ = nullptr;
    HANDLE heap_ = nullptr;
    OEMUIPROCS procs_{};
    OEMUIOBJ uiobj_{};
    OEMUIPSPARAM param_{};
    PROPSHEETUI_INFO info_{};
    HWND sheet_ = nullptr;
};
