// Draws one watermark record into a device context: scaled into a preview
// control, or onto the printer's page image at print time.
#pragma once
#include "watermark/dyntext.h"
#include "watermark/wmrecord.h"

constexpr FLOAT PREVIEW_SCALE = 0.195f;

// dwMode: WMDRAW_PREVIEW or WMDRAW_PRINT, optionally WMDRAW_UNDER.
// rcArea: the preview's client rectangle, or the page image's area on the
// sheet in device units. The DC's state is the same on return.
void DrawWatermark(HDC hdc, HANDLE hPrinter, const WATERMARK* pWm, const RECT* prcArea, DWORD dwMode, FLOAT fScale,
                   LPCWSTR pszPrinter, LPCWSTR pszModel, INT iPage, DWORD dwOrientation, DWORD dwLayoutActive);

// Rounds halves away from zero.
int RoundHalfAway(double v);
