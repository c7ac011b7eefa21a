// The class factory and the plug-in object. Both are thin: every interface
// call is handed to the subsystem that owns it.
#include "frame/info.h"
#include "frame/module.h"
#include "frame/oemdevmode.h"
#include "frame/printerevent.h"
#include "frame/propsheets.h"
#include "frame/treehook.h"
#include "watermark/docevent.h"
#include "watermark/wmstore.h"

#include <new>

namespace {

// Reference counting and QueryInterface shared by the two COM classes;
// Derived::Accepts names the interfaces it answers with itself.
template <class Interface, class Derived> class ComObjectBase : public Interface {
public:
    STDMETHODIMP QueryInterface(REFIID riid, void** ppv) override
    {
        if (!ppv)
            return E_POINTER;
        if (Derived::Accepts(riid)) {
            *ppv = static_cast<Interface*>(this);
            AddRef();
            return S_OK;
        }
        *ppv = nullptr;
        return E_NOINTERFACE;
    }
    STDMETHODIMP_(ULONG) AddRef() override { return InterlockedIncrement(&refs_); }
    STDMETHODIMP_(ULONG) Release() override
    {
        LONG n = InterlockedDecrement(&refs_);
        if (n == 0)
            delete static_cast<Derived*>(this);
        return n;
    }

protected:
    ~ComObjectBase() = default;

private:
    volatile LONG refs_ = 1;
};

class PluginObject final : public ComObjectBase<IPrintOemUI2, PluginObject> {
public:
    PluginObject() { ModuleObjectCreated(); }
    ~PluginObject()
    {
        if (driverUI_)
            driverUI_->Release();
        ModuleObjectDestroyed();
    }
    static bool Accepts(REFIID riid)
    {
        return IsEqualIID(riid, IID_IUnknown) || IsEqualIID(riid, IID_IPrintOemUI) ||
               IsEqualIID(riid, IID_IPrintOemUI2);
    }

    // IPrintOemUI
    STDMETHODIMP GetInfo(DWORD dwMode, PVOID pBuffer, DWORD cbSize, PDWORD pcbNeeded) override
    {
        return PluginGetInfo(dwMode, pBuffer, cbSize, pcbNeeded);
    }
    STDMETHODIMP DevMode(DWORD dwMode, POEMDMPARAM pParam) override
    {
        if (!pParam) {
            SetLastError(ERROR_INVALID_PARAMETER);
            return E_FAIL;
        }
        CopyDefaultWatermarks(pParam->hPrinter);
        return OemDevMode(dwMode, pParam);
    }
    STDMETHODIMP PublishDriverInterface(IUnknown* pIUnknown) override
    {
        if (driverUI_)
            return S_OK;
        if (!pIUnknown)
            return E_FAIL;
        HRESULT hr = pIUnknown->QueryInterface(IID_IPrintOemDriverUI, reinterpret_cast<void**>(&driverUI_));
        if (FAILED(hr) || !driverUI_) {
            driverUI_ = nullptr;
            return E_FAIL;
        }
        return S_OK;
    }
    STDMETHODIMP CommonUIProp(DWORD dwMode, POEMCUIPPARAM pParam) override
    {
        return HandleCommonUIProp(dwMode, pParam, driverUI_);
    }
    STDMETHODIMP DocumentPropertySheets(PPROPSHEETUI_INFO pInfo, LPARAM lParam) override
    {
        return HandleDocumentPropertySheets(pInfo, lParam, driverUI_);
    }
    STDMETHODIMP DevicePropertySheets(PPROPSHEETUI_INFO pInfo, LPARAM lParam) override
    {
        return HandleDevicePropertySheets(pInfo, lParam);
    }
    STDMETHODIMP DevQueryPrintEx(POEMUIOBJ, PVOID, PDEVMODEW, PVOID) override { return E_NOTIMPL; }
    STDMETHODIMP DeviceCapabilities(POEMUIOBJ, HANDLE, PWSTR, WORD, PVOID, PDEVMODEW, PVOID, DWORD,
                                    DWORD*) override
    {
        return E_NOTIMPL;
    }
    STDMETHODIMP UpgradePrinter(DWORD, PBYTE) override { return E_NOTIMPL; }
    STDMETHODIMP PrinterEvent(PWSTR pPrinterName, INT iDriverEvent, DWORD dwFlags, LPARAM lParam) override
    {
        return HandlePrinterEvent(pPrinterName, iDriverEvent, dwFlags, lParam);
    }
    STDMETHODIMP DriverEvent(DWORD dwDriverEvent, DWORD dwLevel, LPBYTE pDriverInfo, LPARAM lParam) override
    {
        return SeedDefaultWatermarks(dwDriverEvent, dwLevel, pDriverInfo, lParam);
    }
    STDMETHODIMP QueryColorProfile(HANDLE, POEMUIOBJ, PDEVMODEW, PVOID, ULONG ulQueryMode, VOID* pvProfileData,
                                   ULONG* pcbProfileData, FLONG* pflProfileData) override
    {
        return PluginQueryColorProfile(ulQueryMode, pvProfileData, pcbProfileData, pflProfileData);
    }
    STDMETHODIMP FontInstallerDlgProc(HWND, UINT, WPARAM, LPARAM) override { return E_NOTIMPL; }
    STDMETHODIMP UpdateExternalFonts(HANDLE, HANDLE, PWSTR) override { return E_NOTIMPL; }

    // IPrintOemUI2
    STDMETHODIMP QueryJobAttributes(HANDLE, PDEVMODEW, DWORD, LPBYTE) override { return E_NOTIMPL; }
    STDMETHODIMP HideStandardUI(DWORD) override { return E_NOTIMPL; }
    STDMETHODIMP DocumentEvent(HANDLE hPrinter, HDC hdc, INT iEsc, ULONG cbIn, PVOID pvIn, ULONG cbOut,
                               PVOID pvOut, PINT piResult) override
    {
        return HandleDocumentEvent(hPrinter, hdc, iEsc, cbIn, pvIn, cbOut, pvOut, piResult);
    }

private:
    IPrintOemDriverUI* driverUI_ = nullptr;
};

class ClassFactory final : public ComObjectBase<IClassFactory, ClassFactory> {
public:
    ClassFactory() { ModuleObjectCreated(); }
    ~ClassFactory() { ModuleObjectDestroyed(); }
    static bool Accepts(REFIID riid)
    {
        return IsEqualIID(riid, IID_IUnknown) || IsEqualIID(riid, IID_IClassFactory);
    }

    STDMETHODIMP CreateInstance(IUnknown* pOuter, REFIID riid, void** ppv) override
    {
        if (pOuter)
            return CLASS_E_NOAGGREGATION;
        auto* obj = new (std::nothrow) PluginObject();
        if (!obj)
            return E_OUTOFMEMORY;
        HRESULT hr = obj->QueryInterface(riid, ppv);
        obj->Release();
        return hr;
    }
    STDMETHODIMP LockServer(BOOL fLock) override
    {
        ModuleLockServer(fLock);
        return S_OK;
    }
};

}  // namespace

extern "C" HRESULT STDAPICALLTYPE DllGetClassObject(REFCLSID rclsid, REFIID riid, void** ppv)
{
    if (!IsEqualCLSID(rclsid, CLSID_OEMUI))
        return CLASS_E_CLASSNOTAVAILABLE;
    auto* factory = new (std::nothrow) ClassFactory();
    if (!factory)
        return E_OUTOFMEMORY;
    HRESULT hr = factory->QueryInterface(riid, ppv);
    factory->Release();
    return hr;
}

extern "C" HRESULT STDAPICALLTYPE DllCanUnloadNow()
{
    return ModuleCanUnload() ? S_OK : S_FALSE;
}

extern "C" BOOL WINAPI DllMain(HINSTANCE hInstance, DWORD dwReason, LPVOID)
{
    switch (dwReason) {
    case DLL_PROCESS_ATTACH:
        ModuleAttach(hInstance);
        break;
    case DLL_PROCESS_DETACH:
        ModuleDetach();
        break;
    }
    return TRUE;
}
