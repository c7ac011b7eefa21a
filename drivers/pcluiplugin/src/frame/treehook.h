#pragma once
#include "frame/oemui.h"

HRESULT HandleCommonUIProp(DWORD dwMode, POEMCUIPPARAM pParam, IPrintOemDriverUI* pDriverUI);
