// Choosing a watermark to edit, and deleting watermarks.
#include "frame/dialogutil.h"
#include "frame/module.h"
#include "frame/uimessages.h"
#include "resources/resource.h"
#include "watermarkui/wmdialogs.h"
#include "watermarkui/wmpage.h"

#include <windowsx.h>
#include <vector>

namespace {

WNDPROC g_prevChooseListProc = nullptr;

void FillNames(HWND hwndList, const WatermarkNode* head)
{
    WCHAR name[128];
    for (const WatermarkNode* n = head; n; n = n->next) {
        RecordName(n->wm, name);
        SendMessageW(hwndList, LB_ADDSTRING, 0, reinterpret_cast<LPARAM>(name));
    }
    SetNameListExtent(hwndList, hwndList, head);
}

BOOL KeepContext(HWND hwnd, LPARAM lParam)
{
    SetWindowLongPtrW(hwnd, GWLP_USERDATA, lParam);
    return lParam != 0;
}

// ---- choose to edit ---------------------------------------------------------

void ChooseWatermarkToEdit(HWND hwnd, PAGECONTEXT* ctx)
{
    HWND list = GetDlgItem(hwnd, IDC_WMCHOOSE_LIST);
    const int sel = static_cast<int>(SendMessageW(list, LB_GETCURSEL, 0, 0));
    WCHAR name[128] = {};
    const BOOL chosen = sel != LB_ERR && ListEntryText(list, sel, name, 128);
    EndDialog(hwnd, 1);
    if (ctx->dwDialogMode != DLGMODE_EDIT || !chosen)
        return;
    ctx->pEditedRecord = FindWatermarkByName(ctx->pWatermarkList, name);
    // The page owns the add/edit dialog; this one is already told to close.
    IsolatedDialogBoxParam(ModuleInstance(), MAKEINTRESOURCEW(IDD_103), GetWindow(hwnd, GW_OWNER),
                           WatermarkEditDialogProc, reinterpret_cast<LPARAM>(ctx));
}

LRESULT CALLBACK ChooseListProc(HWND hwnd, UINT msg, WPARAM wParam, LPARAM lParam)
{
    if (msg == WM_LBUTTONDBLCLK) {
        HWND dlg = GetParent(hwnd);
        PAGECONTEXT* ctx = DialogContext(dlg);
        const LRESULT hit = SendMessageW(hwnd, LB_ITEMFROMPOINT, 0, lParam);
        // The nearest entry is reported for any point; only a point on it counts.
        RECT item = {};
        const POINT pt = {GET_X_LPARAM(lParam), GET_Y_LPARAM(lParam)};
        if (ctx && HIWORD(hit) == 0 &&
            SendMessageW(hwnd, LB_GETITEMRECT, LOWORD(hit), reinterpret_cast<LPARAM>(&item)) != LB_ERR &&
            PtInRect(&item, pt))
            ChooseWatermarkToEdit(dlg, ctx);
    }
    return CallWindowProcW(g_prevChooseListProc, hwnd, msg, wParam, lParam);
}

// ---- delete -----------------------------------------------------------------

// Unlinks and frees the record list entry k designates; TRUE when one was freed.
BOOL RemoveRecord(PAGECONTEXT* ctx, int k, LPCWSTR name)
{
    WatermarkNode*& head = ctx->pWatermarkList;
    if (!head)
        return FALSE;
    WatermarkNode* victim = nullptr;
    if (k == 0) {
        victim = head;
        head = victim->next;
    } else {
        WCHAR other[128];
        for (WatermarkNode* prev = head; prev->next; prev = prev->next) {
            RecordName(prev->next->wm, other);
            if (lstrcmpiW(other, name) == 0) {
                victim = prev->next;
                prev->next = victim->next;
                break;
            }
        }
    }
    if (!victim)
        return FALSE;
    if (ctx->pEditedRecord == victim)
        ctx->pEditedRecord = nullptr;
    HeapFree(GetProcessHeap(), 0, victim);
    return TRUE;
}

void OnDeletePressed(HWND hwnd, PAGECONTEXT* ctx)
{
    HWND list = GetDlgItem(hwnd, IDC_WMDEL_LIST);
    // A record removed by an earlier press of this opening must still reach
    // the page, or it would neither save nor refill its lists.
    const BOOL removedBefore = ctx->dwDialogOutcome == DLGOUTCOME_CHANGED;
    const LRESULT n = SendMessageW(list, LB_GETSELCOUNT, 0, 0);
    if (n != LB_ERR && n > 0) {
        std::vector<int> picked(static_cast<size_t>(n));
        const LRESULT got = SendMessageW(list, LB_GETSELITEMS, n, reinterpret_cast<LPARAM>(picked.data()));
        if (got != LB_ERR) {
            picked.resize(static_cast<size_t>(got));
            if (ShowPluginMessage(hwnd, IDS_STR_158, IDS_STR_13, MB_YESNO | MB_ICONEXCLAMATION) != IDYES) {
                if (!removedBefore)
                    ctx->dwDialogOutcome = DLGOUTCOME_UNCHANGED;
                return;
            }
            if (ctx->dwDialogMode == DLGMODE_DELETE) {
                if (!removedBefore)
                    ctx->dwDialogOutcome = DLGOUTCOME_UNCHANGED;
                for (size_t j = picked.size(); j-- > 0;) {
                    const int k = picked[j];
                    WCHAR name[128] = {};
                    if (!ListEntryText(list, k, name, 128))
                        continue;
                    if (RemoveRecord(ctx, k, name))
                        ctx->dwDialogOutcome = DLGOUTCOME_CHANGED;
                    if (lstrcmpW(name, ctx->szSelectedName[0]) == 0 || lstrcmpW(name, ctx->szSelectedName[1]) == 0)
                        ctx->bDeletedSelection = 1;
                    SendMessageW(list, LB_DELETESTRING, k, 0);
                }
            }
        }
    }
    SendMessageW(list, LB_SETSEL, TRUE, 0);
    if (!ctx->pWatermarkList)
        EnableWindow(GetDlgItem(hwnd, IDC_WMDEL_DELETE), FALSE);
}

}  // namespace

INT_PTR CALLBACK ChooseWatermarkDialogProc(HWND hwnd, UINT msg, WPARAM wParam, LPARAM lParam)
{
    if (msg == WM_INITDIALOG) {
        KeepContext(hwnd, lParam);
        auto* ctx = reinterpret_cast<PAGECONTEXT*>(lParam);
        HWND list = GetDlgItem(hwnd, IDC_WMCHOOSE_LIST);
        g_prevChooseListProc = reinterpret_cast<WNDPROC>(
            SetWindowLongPtrW(list, GWLP_WNDPROC, reinterpret_cast<LONG_PTR>(ChooseListProc)));
        if (!ctx || !ctx->pWatermarkList) {
            EnableWindow(GetDlgItem(hwnd, IDOK), FALSE);
        } else {
            FillNames(list, ctx->pWatermarkList);
            SendMessageW(list, LB_SETCURSEL, 0, 0);
        }
        return TRUE;
    }
    if (msg != WM_COMMAND)
        return FALSE;
    PAGECONTEXT* ctx = DialogContext(hwnd);
    if (!ctx)
        return FALSE;
    switch (LOWORD(wParam)) {
    case IDOK:
        ChooseWatermarkToEdit(hwnd, ctx);
        break;
    case IDCANCEL:
        ctx->dwDialogOutcome = DLGOUTCOME_UNCHANGED;
        EndDialog(hwnd, 1);
        break;
    default:
        break;
    }
    return FALSE;
}

INT_PTR CALLBACK DeleteWatermarksDialogProc(HWND hwnd, UINT msg, WPARAM wParam, LPARAM lParam)
{
    switch (msg) {
    case WM_INITDIALOG: {
        auto* ctx = reinterpret_cast<PAGECONTEXT*>(lParam);
        KeepContext(hwnd, lParam);
        if (ctx) {
            // Nothing has been removed yet in this opening.
            ctx->dwDialogOutcome = DLGOUTCOME_UNCHANGED;
            ctx->bDeletedSelection = 0;
            FillNames(GetDlgItem(hwnd, IDC_WMDEL_LIST), ctx->pWatermarkList);
        }
        EnableWindow(GetDlgItem(hwnd, IDC_WMDEL_DELETE), FALSE);
        return TRUE;
    }
    case WM_CLOSE:
        EndDialog(hwnd, 1);
        return TRUE;
    case WM_COMMAND: {
        PAGECONTEXT* ctx = DialogContext(hwnd);
        switch (LOWORD(wParam)) {
        case IDC_WMDEL_LIST:
            if (HIWORD(wParam) == LBN_SELCHANGE) {
                const LRESULT n = SendDlgItemMessageW(hwnd, IDC_WMDEL_LIST, LB_GETSELCOUNT, 0, 0);
                EnableWindow(GetDlgItem(hwnd, IDC_WMDEL_DELETE), n != LB_ERR && n > 0);
            }
            return TRUE;
        case IDC_WMDEL_DELETE:
            if (ctx)
                OnDeletePressed(hwnd, ctx);
            return TRUE;
        case IDOK:
            EndDialog(hwnd, 1);
            return TRUE;
        default:
            return FALSE;
        }
    }
    default:
        return FALSE;
    }
}
