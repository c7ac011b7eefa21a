#pragma once
#include "frame/oemui.h"

HRESULT HandleDocumentPropertySheets(PPROPSHEETUI_INFO pPSUIInfo, LPARAM lParam,
                                     IPrintOemDriverUI* pDriverUI);
HRESULT HandleDevicePropertySheets(PPROPSHEETUI_INFO pPSUIInfo, LPARAM lParam);
