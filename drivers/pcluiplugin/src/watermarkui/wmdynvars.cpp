// Composing dynamic watermark text: variable names inserted by description.
#include "frame/uimessages.h"
#include "resources/resource.h"
#include "watermark/dyntext.h"
#include "watermarkui/wmdialogs.h"
#include "watermarkui/wmpage.h"

#include <strsafe.h>

namespace {

// Composition buffer shared by the dialog's insertions.
WCHAR g_compose[DYNTEXT_CCH];

void OnInit(HWND hwnd, PAGECONTEXT* ctx)
{
    SetWindowLongPtrW(hwnd, GWLP_USERDATA, reinterpret_cast<LONG_PTR>(ctx));
    if (ctx) {
        ctx->szTextBuffer[127] = 0;
        SetDlgItemTextW(hwnd, IDC_DYN_TEXT, ctx->szTextBuffer);
    }
    WCHAR desc[128];
    for (UINT k = 0; k < DYNVAR_COUNT; ++k) {
        LoadPluginString(IDS_STR_200 + k, desc, 128);
        SendDlgItemMessageW(hwnd, IDC_DYN_LIST, LB_ADDSTRING, 0, reinterpret_cast<LPARAM>(desc));
    }
    EnableWindow(GetDlgItem(hwnd, IDOK), FALSE);
    EnableWindow(GetDlgItem(hwnd, IDC_DYN_ADD), FALSE);
}

void OnAdd(HWND hwnd, PAGECONTEXT* ctx)
{
    GetDlgItemTextW(hwnd, IDC_DYN_TEXT, g_compose, DYNTEXT_CCH);
    HWND list = GetDlgItem(hwnd, IDC_DYN_LIST);
    WCHAR desc[128] = {};
    if (!ListEntryText(list, static_cast<int>(SendMessageW(list, LB_GETCURSEL, 0, 0)), desc, 128))
        return;
    DWORD start = 0, end = 0;
    SendDlgItemMessageW(hwnd, IDC_DYN_TEXT, EM_GETSEL, reinterpret_cast<WPARAM>(&start),
                        reinterpret_cast<LPARAM>(&end));
    if (start == end) {
        ExpandDynamicText(nullptr, ctx->hPrinter, g_compose, desc, ctx->szPrinterName, ctx->szDriverName, 1,
                          WMDRAW_PREVIEW);
        SetDlgItemTextW(hwnd, IDC_DYN_TEXT, g_compose);
    } else {
        g_compose[0] = 0;
        ExpandDynamicText(nullptr, ctx->hPrinter, g_compose, desc, ctx->szPrinterName, ctx->szDriverName, 1,
                          WMDRAW_PREVIEW);
        SendDlgItemMessageW(hwnd, IDC_DYN_TEXT, EM_REPLACESEL, FALSE, reinterpret_cast<LPARAM>(g_compose));
    }
}

void Close(HWND hwnd, PAGECONTEXT* ctx, DWORD outcome)
{
    ctx->dwDialogOutcome = outcome;
    EndDialog(hwnd, 1);
}

}  // namespace

INT_PTR CALLBACK DynamicVariablesDialogProc(HWND hwnd, UINT msg, WPARAM wParam, LPARAM lParam)
{
    if (msg == WM_INITDIALOG) {
        OnInit(hwnd, reinterpret_cast<PAGECONTEXT*>(lParam));
        return TRUE;
    }
    if (msg != WM_COMMAND)
        return FALSE;
    PAGECONTEXT* ctx = DialogContext(hwnd);
    if (!ctx)
        return FALSE;
    switch (LOWORD(wParam)) {
    case IDC_DYN_TEXT:
        if (HIWORD(wParam) == EN_UPDATE) {
            WCHAR text[128];
            EnableWindow(GetDlgItem(hwnd, IDOK), GetDlgItemTextW(hwnd, IDC_DYN_TEXT, text, 128) > 0);
        }
        break;
    case IDC_DYN_LIST:
        if (HIWORD(wParam) == LBN_SELCHANGE)
            EnableWindow(GetDlgItem(hwnd, IDC_DYN_ADD), SendDlgItemMessageW(hwnd, IDC_DYN_LIST, LB_GETCURSEL, 0, 0) != LB_ERR);
        break;
    case IDC_DYN_ADD:
        if (HIWORD(wParam) == BN_CLICKED)
            OnAdd(hwnd, ctx);
        break;
    case IDOK:
        GetDlgItemTextW(hwnd, IDC_DYN_TEXT, ctx->szTextBuffer, 128);
        Close(hwnd, ctx, DLGOUTCOME_CHANGED);
        break;
    case IDCANCEL:
        Close(hwnd, ctx, DLGOUTCOME_UNCHANGED);
        break;
    default:
        break;
    }
    return FALSE;
}
