// Services shared by every page and dialog: the driver's help file, the help
// window beside the sheet, disabling a page, and running dialogs and pages
// inside the module's activation context so that they get version 6 of the
// common controls.
#pragma once
#include <windows.h>
#include <commctrl.h>
#include <commdlg.h>

// The driver's help file among its dependent files, lower-cased, written
// into path (260 units, zero-filled by the caller). When no file has a help
// extension the last one examined is left there; with no dependent files the
// buffer is untouched.
void FindDriverHelpFile(HANDLE hPrinter, WCHAR path[260]);
// The help request of the property-sheet help notification: a .chm file
// through its index beside the sheet, a .hlp file through its finder.
void ShowDriverHelp(HWND hwndPage, HANDLE hPrinter);
// The HTML Help control's HtmlHelpW, loaded on first use and kept for the
// life of the process; null once loading failed.
HWND HtmlHelpW(HWND hwndCaller, LPCWSTR pszFile, UINT uCommand, DWORD_PTR dwData);
// Puts the sheet so that it ends at the middle of the desktop (or at its
// left edge when it is wider than half) and the help window right of it.
void PlaceBesideHelp(HWND hwndSheet, HWND hwndHelp);
// Disables every descendant window of hwnd; a null window does nothing.
void DisableAllChildren(HWND hwnd);
// The activation context built from the module's manifest (resource 2);
// INVALID_HANDLE_VALUE when it cannot be built, and a later call retries.
HANDLE ModuleActivationContext();

// The wrapped functions called inside the module's isolation context, with
// their own arguments and results. When the context cannot be activated
// nothing is called and the function's failure value is returned.
INT_PTR IsolatedDialogBoxParam(HINSTANCE hInst, LPCWSTR pszTemplate, HWND hwndOwner, DLGPROC pfn,
                               LPARAM lParam);
void IsolatedInitCommonControls();
HMODULE IsolatedLoadLibraryW(LPCWSTR pszFile);
HPROPSHEETPAGE IsolatedCreatePropertySheetPageW(LPCPROPSHEETPAGEW ppsp);
INT_PTR IsolatedPropertySheetW(LPCPROPSHEETHEADERW ppsh);
BOOL IsolatedGetOpenFileNameW(LPOPENFILENAMEW pofn);
