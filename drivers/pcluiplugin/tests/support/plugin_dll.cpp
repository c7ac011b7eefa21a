#include "plugin_dll.h"
#include "simspooler.h"

#include <shlwapi.h>

HMODULE PluginDll()
{
    static HMODULE mod = [] {
        WCHAR path[MAX_PATH];
        GetModuleFileNameW(nullptr, path, MAX_PATH);
        PathRemoveFileSpecW(path);
        PathAppendW(path, L"NVPCLUI.dll");
        HMODULE h = LoadLibraryW(path);
        if (h)
            InstallSimSpooler(h);
        return h;
    }();
    return mod;
}

IPrintOemUI2* CreatePluginObject()
{
    HMODULE h = PluginDll();
    if (!h)
        return nullptr;
    auto getClassObject = reinterpret_cast<HRESULT(STDAPICALLTYPE*)(REFCLSID, REFIID, void**)>(
        GetProcAddress(h, "DllGetClassObject"));
    if (!getClassObject)
        return nullptr;
    IClassFactory* factory = nullptr;
    if (FAILED(getClassObject(CLSID_OEMUI, IID_IClassFactory, reinterpret_cast<void**>(&factory))))
        return nullptr;
    IPrintOemUI2* obj = nullptr;
    factory->CreateInstance(nullptr, IID_IPrintOemUI2, reinterpret_cast<void**>(&obj));
    factory->Release();
    return obj;
}

void ClearPluginRegistry()
{
    SHDeleteKeyW(HKEY_CURRENT_USER, L"Software\\Norvane");
    SHDeleteKeyW(HKEY_USERS, L".Default\\Software\\Norvane");
}
