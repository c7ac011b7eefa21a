#pragma once
#include "frame/oemui.h"

HRESULT PluginGetInfo(DWORD dwMode, PVOID pBuffer, DWORD cbSize, PDWORD pcbNeeded);
HRESULT PluginQueryColorProfile(ULONG ulQueryMode, VOID* pvProfileData, ULONG* pcbProfileData,
                                FLONG* pflProfileData);
