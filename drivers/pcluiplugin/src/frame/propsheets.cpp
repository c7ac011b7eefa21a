#include "frame/propsheets.h"

HRESULT HandleDocumentPropertySheets(PPROPSHEETUI_INFO, LPARAM, IPrintOemDriverUI*) { return E_NOTIMPL; }
HRESULT HandleDevicePropertySheets(PPROPSHEETUI_INFO, LPARAM) { return E_NOTIMPL; }
