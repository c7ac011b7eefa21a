// The watermark page of the document sheet: order mode, the watermark of
// each page group, placement, and the user's watermark definitions.
#pragma once
#include "frame/pagecontext.h"

INT_PTR CALLBACK WatermarkPageProc(HWND hwnd, UINT msg, WPARAM wParam, LPARAM lParam);

// Sets every control from the working settings and the watermark list.
void ShowWatermarkSettings(HWND hwndPage, PAGECONTEXT* ctx);
// Rebuilds both lists after the watermark list changed, keeping the
// selections by index (bKeepIndices) or by name.
void RefillWatermarkLists(HWND hwndPage, const WatermarkNode* pHead, BOOL bKeepIndices);
void EnableEditDeleteButtons(HWND hwndPage, BOOL bEnable);

// Shared by the watermark dialogs: horizontal extent of a list of names,
// the system font's widest character times the longest name.
void SetNameListExtent(HWND hwndList, HWND hwndMeasure, const WatermarkNode* pHead);
// A record's name as a terminated string (names from the store may fill
// their field).
void RecordName(const WATERMARK& wm, WCHAR name[128]);
// The text of list entry i, or FALSE when it does not fit cch.
BOOL ListEntryText(HWND hwndList, int i, WCHAR* buf, int cch);
// The page context of a watermark dialog (kept in its user data).
PAGECONTEXT* DialogContext(HWND hwnd);
// Paints a preview control of a watermark dialog: refresh brings the
// dialog's preview record up to date from its controls, then the renderer
// draws the record as the previews show it.
LRESULT PaintWatermarkPreview(HWND hwndPreview, void (*refresh)(HWND hwndDialog, WATERMARK& wm));
// The none entry's text, "(Нет)".
void LoadNoneText(WCHAR buf[25]);
