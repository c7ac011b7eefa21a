// The print-and-hold page of the document sheet.
#pragma once
#include "frame/pagecontext.h"

INT_PTR CALLBACK PrintAndHoldPageProc(HWND hwnd, UINT msg, WPARAM wParam, LPARAM lParam);  // 138
