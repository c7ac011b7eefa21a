// The modal dialogs of the watermark page. Each takes the page context as
// its creation parameter; callers read the dialog outcome it leaves there.
#pragma once
#include "frame/pagecontext.h"

INT_PTR CALLBACK WatermarkEditDialogProc(HWND hwnd, UINT msg, WPARAM wParam, LPARAM lParam);     // 103
INT_PTR CALLBACK PlacementDialogProc(HWND hwnd, UINT msg, WPARAM wParam, LPARAM lParam);         // 220
INT_PTR CALLBACK DeleteWatermarksDialogProc(HWND hwnd, UINT msg, WPARAM wParam, LPARAM lParam);  // 135
INT_PTR CALLBACK ChooseWatermarkDialogProc(HWND hwnd, UINT msg, WPARAM wParam, LPARAM lParam);   // 136
INT_PTR CALLBACK DynamicVariablesDialogProc(HWND hwnd, UINT msg, WPARAM wParam, LPARAM lParam);  // 101

// Accepted placement offsets, inclusive: 9999.9 inches in either unit.
constexpr double kMaxOffsetInches = 9999.9;
constexpr double kMaxOffsetMm = 253997.46;
// A typed offset: digits, one point, a leading minus, within the unit's limits.
BOOL IsValidOffsetText(LPCWSTR text, BOOL bInches);
