#include "plugin_dll.h"
#include "pluginloader.h"

#include <shlwapi.h>

HMODULE PluginDll() { return LoadPluginBesideProgram(); }

IPrintOemUI2* CreatePluginObject() { return CreatePluginFrom(PluginDll()); }

void ClearPluginRegistry()
{
    SHDeleteKeyW(HKEY_CURRENT_USER, L"Software\\Norvane");
    SHDeleteKeyW(HKEY_USERS, L".Default\\Software\\Norvane");
}
