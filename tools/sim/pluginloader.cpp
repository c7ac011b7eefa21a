#include "pluginloader.h"
#include "simrender.h"
#include "simspooler.h"

#include <shlwapi.h>

HMODULE LoadPluginBesideProgram()
{
    static HMODULE mod = [] {
        WCHAR path[MAX_PATH];
        GetModuleFileNameW(nullptr, path, MAX_PATH);
        PathRemoveFileSpecW(path);
        PathAppendW(path, L"NVPCLUI.dll");
        HMODULE h = LoadLibraryW(path);
        if (h) {
            InstallSimSpooler(h);
            InstallSimRender(h);
        }
        return h;
    }();
    return mod;
}

IPrintOemUI2* CreatePluginFrom(HMODULE plugin)
{
    if (!plugin)
        return nullptr;
    auto getClassObject = reinterpret_cast<HRESULT(STDAPICALLTYPE*)(REFCLSID, REFIID, void**)>(
        GetProcAddress(plugin, "DllGetClassObject"));
    IClassFactory* factory = nullptr;
    if (!getClassObject || FAILED(getClassObject(CLSID_OEMUI, IID_IClassFactory, reinterpret_cast<void**>(&factory))))
        return nullptr;
    IPrintOemUI2* obj = nullptr;
    factory->CreateInstance(nullptr, IID_IPrintOemUI2, reinterpret_cast<void**>(&obj));
    factory->Release();
    return obj;
}
