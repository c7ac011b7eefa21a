// Message boxes and strings of the plug-in's own string table.
#pragma once
#include <windows.h>

// Shows string idText with caption idCaption (texts cut to 256 and 20
// units); returns what MessageBoxW returns.
int ShowPluginMessage(HWND hwndOwner, UINT idText, UINT idCaption, UINT uType);
// Loads string id into buf (cch units); falls back to pszDefault (may be
// null, giving an empty text) when the string cannot be loaded.
void LoadPluginString(UINT id, WCHAR* buf, int cch, LPCWSTR pszDefault = nullptr);
