#include "pages/qualitypages.h"

// Not built yet: keeps the page context like every page does.
INT_PTR CALLBACK ManualColourPageProc(HWND hwnd, UINT msg, WPARAM, LPARAM lParam)
{
    if (msg == WM_INITDIALOG) {
        auto* psp = reinterpret_cast<PROPSHEETPAGEW*>(lParam);
        SetWindowLongPtrW(hwnd, GWLP_USERDATA, psp ? psp->lParam : 0);
        return TRUE;
    }
    return FALSE;
}

// Not built yet: keeps the page context like every page does.
INT_PTR CALLBACK MonoQualityPageProc(HWND hwnd, UINT msg, WPARAM, LPARAM lParam)
{
    if (msg == WM_INITDIALOG) {
        auto* psp = reinterpret_cast<PROPSHEETPAGEW*>(lParam);
        SetWindowLongPtrW(hwnd, GWLP_USERDATA, psp ? psp->lParam : 0);
        return TRUE;
    }
    return FALSE;
}

// Not built yet: keeps the page context like every page does.
INT_PTR CALLBACK RgbQualityDialogProc(HWND hwnd, UINT msg, WPARAM, LPARAM lParam)
{
    if (msg == WM_INITDIALOG) {
        auto* psp = reinterpret_cast<PROPSHEETPAGEW*>(lParam);
        SetWindowLongPtrW(hwnd, GWLP_USERDATA, psp ? psp->lParam : 0);
        return TRUE;
    }
    return FALSE;
}

