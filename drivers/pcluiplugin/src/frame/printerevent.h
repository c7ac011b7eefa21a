// Printer events: a printer just created with the driver gets the driver's
// own print processor.
#pragma once
#include "frame/oemui.h"

HRESULT HandlePrinterEvent(PWSTR pPrinterName, INT iDriverEvent, DWORD dwFlags, LPARAM lParam);
