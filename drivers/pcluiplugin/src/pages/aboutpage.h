// The about page of the document and device sheets.
#pragma once
#include "frame/pagecontext.h"

INT_PTR CALLBACK AboutPageProc(HWND hwnd, UINT msg, WPARAM wParam, LPARAM lParam);  // 137, 234, 109, 233
