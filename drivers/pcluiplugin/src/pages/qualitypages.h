// The manual colour page, the black-and-white print-quality page and the
// RGB print-quality dialog.
#pragma once
#include "frame/pagecontext.h"

INT_PTR CALLBACK ManualColourPageProc(HWND hwnd, UINT msg, WPARAM wParam, LPARAM lParam);  // 107
INT_PTR CALLBACK MonoQualityPageProc(HWND hwnd, UINT msg, WPARAM wParam, LPARAM lParam);   // 229
INT_PTR CALLBACK RgbQualityDialogProc(HWND hwnd, UINT msg, WPARAM wParam, LPARAM lParam);  // 231
