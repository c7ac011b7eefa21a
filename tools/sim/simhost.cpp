#include "simhost.h"

#include "simspooler.h"

#include <commctrl.h>

namespace {

SimHost* g_procHost = nullptr;  // the UI object's procedures have no context argument of ours

}  // namespace

SimHost::SimHost(IPrintOemUI2* plugin, const std::wstring& printerName, const std::wstring& driverName)
    : plugin_(plugin), driverObject_(&driverUI), printerName_(printerName)
{
    SimPrinter p;
    p.name = printerName;
    p.driver = driverName;
    hPrinter_ = SimAddPrinter(p);
    heap_ = HeapCreate(0, 0, 0);
    procs_.DrvGetDriverSetting = ProcGetDriverSetting;
    procs_.DrvUpdateUISetting = ProcUpdateUISetting;
    uiobj_.cbSize = sizeof(uiobj_);
    uiobj_.pOemUIProcs = &procs_;
    g_procHost = this;
    if (plugin_) {
        plugin_->PublishDriverInterface(&driverObject_);
        OEMDMPARAM dm = {};
        dm.cbSize = sizeof(dm);
        dm.hPrinter = hPrinter_;
        dm.pOEMDMOut = &oem;
        dm.cbBufSize = sizeof(oem);
        plugin_->DevMode(OEMDM_DEFAULT, &dm);
    }
    publicDm.dmSize = sizeof(publicDm);
    publicDm.dmFields = DM_ORIENTATION | DM_SCALE | DM_PRINTQUALITY;
    publicDm.dmOrientation = DMORIENT_PORTRAIT;
    publicDm.dmScale = 100;
    publicDm.dmPrintQuality = 600;
}

SimHost::~SimHost()
{
    CloseSheet();
    if (plugin_)
        plugin_->Release();
    if (heap_)
        HeapDestroy(heap_);
    if (g_procHost == this)
        g_procHost = nullptr;
}

BOOL APIENTRY SimHost::ProcGetDriverSetting(PVOID, PCSTR feature, PVOID out, DWORD cb, PDWORD needed, PDWORD returned)
{
    return g_procHost && g_procHost->driverUI.DrvGetDriverSetting(nullptr, feature, out, cb, needed, returned) == S_OK;
}

BOOL APIENTRY SimHost::ProcUpdateUISetting(PVOID, PVOID item, DWORD, DWORD)
{
    if (g_procHost)
        g_procHost->updatedItems.push_back(item);
    return TRUE;
}

LONG_PTR CALLBACK SimHost::SheetCallback(HANDLE hComPropSheet, UINT function, LPARAM lParam1, LPARAM lParam2)
{
    auto* host = static_cast<SimHost*>(hComPropSheet);
    LONG_PTR answer = 0;
    if (function == CPSFUNC_ADD_PROPSHEETPAGEW && lParam1) {
        const int index = static_cast<int>(host->pages.size());
        if (host->refuseAddsFrom < 0 || index < host->refuseAddsFrom) {
            host->pages.push_back(*reinterpret_cast<const PROPSHEETPAGEW*>(lParam1));
            answer = 0x1000 + index;  // a page handle of the common layer
        }
    } else if (function == CPSFUNC_SET_RESULT) {
        answer = 1;
    }
    host->calls.push_back({function, lParam1, lParam2, answer});
    return answer;
}

HRESULT SimHost::Init(bool device)
{
    param_ = {};
    param_.cbSize = sizeof(param_);
    param_.poemuiobj = &uiobj_;
    param_.hPrinter = hPrinter_;
    param_.pPrinterName = const_cast<PWSTR>(printerName_.c_str());
    param_.hOEMHeap = failHeap ? nullptr : heap_;
    param_.pPublicDM = &publicDm;
    param_.pOEMDM = &oem;
    param_.dwFlags = paramFlags;
    info_ = {};
    info_.cbSize = sizeof(info_);
    info_.Version = 0x0100;
    info_.Reason = PROPSHEETUI_REASON_INIT;
    info_.hComPropSheet = this;
    info_.pfnComPropSheet = SheetCallback;
    info_.lParamInit = reinterpret_cast<LPARAM>(&param_);
    return device ? plugin_->DevicePropertySheets(&info_, 0) : plugin_->DocumentPropertySheets(&info_, 0);
}

HRESULT SimHost::InitDocumentSheet() { return Init(false); }
HRESULT SimHost::InitDeviceSheet() { return Init(true); }

HRESULT SimHost::CallReason(WORD reason, LPARAM lParam, bool device, WORD version)
{
    info_.Reason = reason;
    info_.Version = version;
    HRESULT hr = device ? plugin_->DevicePropertySheets(&info_, lParam) : plugin_->DocumentPropertySheets(&info_, lParam);
    info_.Version = 0x0100;
    return hr;
}

HRESULT SimHost::Destroy()
{
    CloseSheet();
    return CallReason(PROPSHEETUI_REASON_DESTROY, 0);
}

std::vector<WORD> SimHost::PageTemplates() const
{
    std::vector<WORD> ids;
    for (const PROPSHEETPAGEW& p : pages)
        ids.push_back(static_cast<WORD>(reinterpret_cast<ULONG_PTR>(p.pszTemplate)));
    return ids;
}

int SimHost::IndexOf(WORD templateId) const
{
    const std::vector<WORD> ids = PageTemplates();
    for (size_t i = 0; i < ids.size(); ++i)
        if (ids[i] == templateId)
            return static_cast<int>(i);
    return -1;
}

HWND SimHost::ShowSheet(const wchar_t* caption, HWND owner)
{
    CloseSheet();
    std::vector<HPROPSHEETPAGE> handles;
    for (const PROPSHEETPAGEW& p : pages)
        if (HPROPSHEETPAGE h = CreatePropertySheetPageW(&p))
            handles.push_back(h);
    if (handles.empty())
        return nullptr;
    PROPSHEETHEADERW h = {};
    h.dwSize = sizeof(h);
    h.dwFlags = PSH_MODELESS;
    h.hwndParent = owner;
    h.pszCaption = caption;
    h.nPages = static_cast<UINT>(handles.size());
    h.phpage = handles.data();
    sheet_ = reinterpret_cast<HWND>(PropertySheetW(&h));
    return sheet_;
}

void SimHost::CloseSheet()
{
    if (sheet_ && IsWindow(sheet_))
        DestroyWindow(sheet_);
    sheet_ = nullptr;
}

HWND SimHost::PageWindow(WORD templateId)
{
    const int i = IndexOf(templateId);
    if (!sheet_ || i < 0)
        return nullptr;
    return PropSheet_IndexToHwnd(sheet_, i);
}

BOOL SimHost::SelectPage(WORD templateId)
{
    const int i = IndexOf(templateId);
    if (!sheet_ || i < 0)
        return FALSE;
    if (PropSheet_GetCurrentPageHwnd(sheet_) == PropSheet_IndexToHwnd(sheet_, i))
        return TRUE;  // a user clicking the tab already shown changes nothing
    PropSheet_SetCurSel(sheet_, nullptr, i);
    return PropSheet_GetCurrentPageHwnd(sheet_) == PropSheet_IndexToHwnd(sheet_, i);
}

BOOL SimHost::Apply()
{
    if (!sheet_)
        return FALSE;
    HWND before = PropSheet_GetCurrentPageHwnd(sheet_);
    // What the sheet's Apply button does.
    return static_cast<BOOL>(SendMessageW(sheet_, PSM_APPLY, 0, 0)) && PropSheet_GetCurrentPageHwnd(sheet_) == before;
}
