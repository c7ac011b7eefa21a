#pragma once
#include "frame/oemui.h"

HRESULT HandleDocumentEvent(HANDLE hPrinter, HDC hdc, INT iEsc, ULONG cbIn, PVOID pvIn, ULONG cbOut,
                            PVOID pvOut, PINT piResult);
