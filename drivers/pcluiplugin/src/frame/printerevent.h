#pragma once
#include "frame/oemui.h"

HRESULT HandlePrinterEvent(PWSTR pPrinterName, INT iDriverEvent, DWORD dwFlags, LPARAM lParam);
