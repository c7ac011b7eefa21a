#include "frame/treehook.h"

// The driver settings tree hook is not offered yet.
HRESULT HandleCommonUIProp(DWORD, POEMCUIPPARAM, IPrintOemDriverUI*) { return E_NOTIMPL; }
