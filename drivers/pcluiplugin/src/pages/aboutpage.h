// The about page of the document and device sheets.
#pragma once
#include "frame/pagecontext.h"

INT_PTR CALLBACK AboutPageProc(HWND hwnd, UINT msg, WPARAM wParam, LPARAM lParam);  // 137, 234, 109, 233

// Puts the two columns into the page's file-version list and a row for every
// dependent file of the printer's driver that has a readable version (or no
// version information at all). Does nothing when the list is missing.
void FillFileVersionList(HWND hwndPage, HANDLE hPrinter);
