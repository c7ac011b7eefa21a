#include "frame/uimessages.h"

#include "frame/module.h"

#include <strsafe.h>

int ShowPluginMessage(HWND hwndOwner, UINT idText, UINT idCaption, UINT uType)
{
    WCHAR text[256];
    WCHAR caption[20];
    LoadPluginString(idText, text, 256);
    LoadPluginString(idCaption, caption, 20);
    return MessageBoxW(hwndOwner, text, caption, uType);
}

void LoadPluginString(UINT id, WCHAR* buf, int cch, LPCWSTR pszDefault)
{
    if (cch <= 0)
        return;
    buf[0] = 0;
    if (LoadStringW(ModuleInstance(), id, buf, cch) <= 0 && pszDefault)
        StringCchCopyW(buf, cch, pszDefault);
}
