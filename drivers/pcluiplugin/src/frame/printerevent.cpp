#include "frame/printerevent.h"

HRESULT HandlePrinterEvent(PWSTR, INT, DWORD, LPARAM) { return E_NOTIMPL; }
