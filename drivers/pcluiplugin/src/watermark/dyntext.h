// Dynamic watermark text: variables between percent signs expanded into the
// user name, dates, times, the page number and printer names.
#pragma once
#include <windows.h>

constexpr int DYNVAR_COUNT = 12;
constexpr int DYNTEXT_CCH = 128;

// Mode bits shared with the renderer.
enum : DWORD { WMDRAW_PREVIEW = 1, WMDRAW_PRINT = 2, WMDRAW_UNDER = 4, WMDRAW_OVER = 8 };

// With pszToken null: expands text (a 128-unit field, possibly without a
// terminator) in place; TRUE when every variable was known and non-empty.
// With pszToken given: appends the variable whose description matches it,
// when it fits; always TRUE.
BOOL ExpandDynamicText(HDC hdc, HANDLE hPrinter, WCHAR text[DYNTEXT_CCH], LPCWSTR pszToken, LPCWSTR pszPrinter,
                       LPCWSTR pszModel, INT iPage, DWORD dwMode);
