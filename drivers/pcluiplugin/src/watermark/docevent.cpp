#include "watermark/docevent.h"

HRESULT HandleDocumentEvent(HANDLE, HDC, INT, ULONG, PVOID, ULONG, PVOID, PINT) { return E_NOTIMPL; }
