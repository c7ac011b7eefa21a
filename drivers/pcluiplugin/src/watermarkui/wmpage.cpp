#include "watermarkui/wmpage.h"

#include "frame/pagenotify.h"
#include "frame/dialogutil.h"
#include "frame/module.h"
#include "frame/rastermode.h"
#include "frame/uimessages.h"
#include "resources/resource.h"
#include "watermark/renderer.h"
#include "watermark/wmstore.h"
#include "watermarkui/wmdialogs.h"

#include <cstring>
#include <initializer_list>

namespace {

const int kOrderRadios[] = {IDC_WM_ORDER_NONE, IDC_WM_ORDER_ALL, IDC_WM_ORDER_FIRST, IDC_WM_ORDER_ODDEVEN};
const int kOrderValues[] = {0, 1, 2, 4};
// Controls that only make sense while watermarks are printed.
const int kModeControls[] = {IDC_WM_OVER, IDC_WM_UNDER, IDC_WM_LISTS_GROUP, IDC_WM_PLACE_GROUP, IDC_WM_LABEL1,
                             IDC_WM_LABEL2};

void Enable(HWND hwnd, int id, BOOL on) { EnableWindow(GetDlgItem(hwnd, id), on); }

void SetLabel(HWND hwnd, int id, UINT idString)
{
    WCHAR text[64];
    LoadPluginString(idString, text, 64);
    SetDlgItemTextW(hwnd, id, text);
}

void CheckOrderRadio(HWND hwnd, int id)
{
    for (int radio : kOrderRadios)
        CheckDlgButton(hwnd, radio, radio == id ? BST_CHECKED : BST_UNCHECKED);
}

void CheckPlacement(HWND hwnd, BOOL over)
{
    CheckDlgButton(hwnd, IDC_WM_OVER, over ? BST_CHECKED : BST_UNCHECKED);
    CheckDlgButton(hwnd, IDC_WM_UNDER, over ? BST_UNCHECKED : BST_CHECKED);
}

HWND List(HWND hwnd, int id) { return GetDlgItem(hwnd, id); }

int Selected(HWND hwnd, int id) { return static_cast<int>(SendDlgItemMessageW(hwnd, id, LB_GETCURSEL, 0, 0)); }

void Select(HWND hwnd, int id, int i) { SendDlgItemMessageW(hwnd, id, LB_SETCURSEL, i, 0); }

void SelectIfNone(HWND hwnd, int id)
{
    if (Selected(hwnd, id) == LB_ERR)
        Select(hwnd, id, 0);
}

// Empties both lists, puts the none entry and every name in, none selected.
void FillBothLists(HWND hwnd, const WatermarkNode* head)
{
    WCHAR none[25];
    LoadNoneText(none);
    for (int id : {IDC_WM_LIST1, IDC_WM_LIST2}) {
        SendDlgItemMessageW(hwnd, id, LB_RESETCONTENT, 0, 0);
        SendDlgItemMessageW(hwnd, id, LB_ADDSTRING, 0, reinterpret_cast<LPARAM>(none));
        Select(hwnd, id, 0);
    }
    WCHAR name[128];
    for (const WatermarkNode* n = head; n; n = n->next) {
        RecordName(n->wm, name);
        for (int id : {IDC_WM_LIST1, IDC_WM_LIST2})
            SendDlgItemMessageW(hwnd, id, LB_ADDSTRING, 0, reinterpret_cast<LPARAM>(name));
    }
    SetNameListExtent(List(hwnd, IDC_WM_LIST1), List(hwnd, IDC_WM_LIST1), head);
    SetNameListExtent(List(hwnd, IDC_WM_LIST2), List(hwnd, IDC_WM_LIST1), head);
}

void MarkChanged(HWND hwnd) { PropSheet_Changed(GetParent(hwnd), hwnd); }

// After initialisation and activation: "all pages" shows one list only.
void FixAllPagesLabels(HWND hwnd)
{
    if (IsDlgButtonChecked(hwnd, IDC_WM_ORDER_ALL) == BST_CHECKED) {
        Enable(hwnd, IDC_WM_LABEL2, FALSE);
        SetLabel(hwnd, IDC_WM_LABEL1, IDS_STR_23);
    }
}

BOOL ReadOrder(HWND hwnd, INT* order)
{
    for (size_t i = 0; i < 4; ++i) {
        if (IsDlgButtonChecked(hwnd, kOrderRadios[i]) == BST_CHECKED) {
            *order = kOrderValues[i];
            return TRUE;
        }
    }
    return FALSE;
}

INT ReadPlacement(HWND hwnd) { return IsDlgButtonChecked(hwnd, IDC_WM_OVER) == BST_CHECKED ? 8 : 4; }

// The records chosen in the two lists, each marked selected; zero records
// for the none entry.
void CopyChosenRecords(HWND hwnd, const PAGECONTEXT* ctx, WATERMARK* w1, WATERMARK* w2)
{
    const int s1 = Selected(hwnd, IDC_WM_LIST1), s2 = Selected(hwnd, IDC_WM_LIST2);
    int i = 1;
    for (const WatermarkNode* n = ctx->pWatermarkList; n; n = n->next, ++i) {
        if (i == s1) {
            *w1 = n->wm;
            w1->bSelected = 1;
        }
        if (i == s2) {
            *w2 = n->wm;
            w2->bSelected = 1;
        }
    }
    if (s1 == 0)
        std::memset(w1, 0, sizeof(*w1));
    if (s2 == 0)
        std::memset(w2, 0, sizeof(*w2));
}

BOOL WatermarksOnInRaster(HWND hwnd, const PAGECONTEXT* ctx)
{
    return IsDlgButtonChecked(hwnd, IDC_WM_ORDER_NONE) != BST_CHECKED && ctx->bColorPrinter &&
           RasterModeSelected(ctx->pOemDevmode);
}

INT_PTR RunDialog(HWND hwnd, PAGECONTEXT* ctx, WORD templateId, DLGPROC proc)
{
    return IsolatedDialogBoxParam(ModuleInstance(), MAKEINTRESOURCEW(templateId), hwnd, proc,
                                  reinterpret_cast<LPARAM>(ctx));
}

// ---- message handlers -------------------------------------------------------

BOOL OnInitDialog(HWND hwnd, PAGECONTEXT* ctx)
{
    SetWindowLongPtrW(hwnd, GWLP_USERDATA, reinterpret_cast<LONG_PTR>(ctx));
    SetWindowLongPtrW(GetParent(hwnd), GWLP_USERDATA, reinterpret_cast<LONG_PTR>(ctx));
    IsolatedInitCommonControls();
    if (!ctx)
        return TRUE;
    if (LoadWatermarkList(ctx->hPrinter, GetProcessHeap(), &ctx->pWatermarkList) > 0) {
        CheckDlgButton(hwnd, IDC_WM_ORDER_NONE, BST_CHECKED);
        ShowWatermarkSettings(hwnd, ctx);
    } else {
        FillBothLists(hwnd, nullptr);
        CheckDlgButton(hwnd, IDC_WM_ORDER_NONE, BST_CHECKED);
        CheckDlgButton(hwnd, IDC_WM_UNDER, BST_CHECKED);
        for (int id : {IDC_WM_LISTS_GROUP, IDC_WM_PLACE_GROUP, IDC_WM_LABEL1, IDC_WM_LABEL2, IDC_WM_LIST1,
                       IDC_WM_LIST2, IDC_WM_UNDER, IDC_WM_OVER})
            Enable(hwnd, id, FALSE);
        EnableEditDeleteButtons(hwnd, FALSE);
    }
    FixAllPagesLabels(hwnd);
    if (ctx->bNoPermission)
        DisableAllChildren(hwnd);
    return TRUE;
}

void OnOrderRadio(HWND hwnd, PAGECONTEXT* ctx, int id)
{
    if (IsDlgButtonChecked(hwnd, id) != BST_CHECKED)
        return;
    const BOOL any = ctx->pWatermarkList != nullptr;
    const BOOL on = id != IDC_WM_ORDER_NONE;
    Enable(hwnd, IDC_WM_LIST1, on);
    Enable(hwnd, IDC_WM_LIST2, id == IDC_WM_ORDER_FIRST || id == IDC_WM_ORDER_ODDEVEN);
    Enable(hwnd, IDC_WM_LABEL1, on);
    Enable(hwnd, IDC_WM_LABEL2, id == IDC_WM_ORDER_FIRST || id == IDC_WM_ORDER_ODDEVEN);
    Enable(hwnd, IDC_WM_LISTS_GROUP, on);
    Enable(hwnd, IDC_WM_PLACE_GROUP, on);
    Enable(hwnd, IDC_WM_UNDER, on && any);
    Enable(hwnd, IDC_WM_OVER, on && any);
    switch (id) {
    case IDC_WM_ORDER_NONE:
        SetLabel(hwnd, IDC_WM_LABEL1, IDS_STR_19);
        SetLabel(hwnd, IDC_WM_LABEL2, IDS_STR_20);
        break;
    case IDC_WM_ORDER_ALL:
        SelectIfNone(hwnd, IDC_WM_LIST1);
        Select(hwnd, IDC_WM_LIST2, 0);
        SetLabel(hwnd, IDC_WM_LABEL1, IDS_STR_23);
        break;
    case IDC_WM_ORDER_FIRST:
    case IDC_WM_ORDER_ODDEVEN:
        SelectIfNone(hwnd, IDC_WM_LIST1);
        SelectIfNone(hwnd, IDC_WM_LIST2);
        SetLabel(hwnd, IDC_WM_LABEL1, id == IDC_WM_ORDER_FIRST ? IDS_STR_19 : IDS_STR_21);
        SetLabel(hwnd, IDC_WM_LABEL2, id == IDC_WM_ORDER_FIRST ? IDS_STR_20 : IDS_STR_22);
        break;
    }
    MarkChanged(hwnd);
}

void OnAdd(HWND hwnd, PAGECONTEXT* ctx)
{
    ctx->dwDialogMode = DLGMODE_ADD;
    ctx->pEditedRecord = nullptr;
    RunDialog(hwnd, ctx, IDD_103, WatermarkEditDialogProc);
    if (ctx->dwDialogOutcome != DLGOUTCOME_CHANGED)
        return;
    ctx->dwDialogOutcome = DLGOUTCOME_UNCHANGED;
    SaveWatermarkList(hwnd, ctx->hPrinter, ctx->pWatermarkList);
    RefillWatermarkLists(hwnd, ctx->pWatermarkList, FALSE);
}

void OnEdit(HWND hwnd, PAGECONTEXT* ctx)
{
    ctx->dwDialogMode = DLGMODE_EDIT;
    RunDialog(hwnd, ctx, IDD_136, ChooseWatermarkDialogProc);
    if (ctx->dwDialogOutcome != DLGOUTCOME_CHANGED)
        return;
    ctx->dwDialogOutcome = DLGOUTCOME_UNCHANGED;
    SaveWatermarkList(hwnd, ctx->hPrinter, ctx->pWatermarkList);
    RefillWatermarkLists(hwnd, ctx->pWatermarkList, TRUE);
    if (!ctx->pEditedRecord)
        return;
    WCHAR edited[128], chosen[128];
    RecordName(ctx->pEditedRecord->wm, edited);
    for (int id : {IDC_WM_LIST1, IDC_WM_LIST2}) {
        if (ListEntryText(List(hwnd, id), Selected(hwnd, id), chosen, 128) && lstrcmpiW(chosen, edited) == 0) {
            MarkChanged(hwnd);
            return;
        }
    }
}

void OnDelete(HWND hwnd, PAGECONTEXT* ctx)
{
    ctx->dwDialogMode = DLGMODE_DELETE;
    const int lists[] = {IDC_WM_LIST1, IDC_WM_LIST2};
    for (int k = 0; k < 2; ++k) {
        ctx->szSelectedName[k][0] = 0;
        if (!ListEntryText(List(hwnd, lists[k]), Selected(hwnd, lists[k]), ctx->szSelectedName[k], 128))
            ctx->szSelectedName[k][0] = 0;
    }
    RunDialog(hwnd, ctx, IDD_135, DeleteWatermarksDialogProc);
    if (ctx->dwDialogOutcome != DLGOUTCOME_CHANGED)
        return;
    ctx->dwDialogOutcome = DLGOUTCOME_UNCHANGED;
    SaveWatermarkList(hwnd, ctx->hPrinter, ctx->pWatermarkList);
    RefillWatermarkLists(hwnd, ctx->pWatermarkList, FALSE);
    if (ctx->bDeletedSelection)
        MarkChanged(hwnd);
}

void OnCommand(HWND hwnd, PAGECONTEXT* ctx, int id, int code)
{
    switch (id) {
    case IDC_WM_ORDER_NONE:
    case IDC_WM_ORDER_ALL:
    case IDC_WM_ORDER_FIRST:
    case IDC_WM_ORDER_ODDEVEN:
        if (code == BN_CLICKED)
            OnOrderRadio(hwnd, ctx, id);
        break;
    case IDC_WM_LIST1:
    case IDC_WM_LIST2:
        if (code == LBN_SELCHANGE)
            MarkChanged(hwnd);
        break;
    case IDC_WM_UNDER:
    case IDC_WM_OVER:
        if (code == BN_CLICKED)
            MarkChanged(hwnd);
        break;
    case IDC_WM_ADD:
        if (code == BN_CLICKED)
            OnAdd(hwnd, ctx);
        break;
    case IDC_WM_EDIT:
        if (code == BN_CLICKED)
            OnEdit(hwnd, ctx);
        break;
    case IDC_WM_DELETE:
        if (code == BN_CLICKED)
            OnDelete(hwnd, ctx);
        break;
    default:
        break;
    }
}

BOOL Refuse(HWND hwnd, UINT idText, LONG_PTR result)
{
    ShowPluginMessage(hwnd, idText, IDS_STR_12, MB_ICONHAND);
    SetWindowLongPtrW(hwnd, DWLP_MSGRESULT, result);
    return TRUE;
}

BOOL OnKillActive(HWND hwnd, PAGECONTEXT* ctx)
{
    if (ctx->bNoPermission)
        return FALSE;
    const BOOL noneChecked = IsDlgButtonChecked(hwnd, IDC_WM_ORDER_NONE) == BST_CHECKED;
    if (Selected(hwnd, IDC_WM_LIST1) == 0 && Selected(hwnd, IDC_WM_LIST2) == 0 && !noneChecked)
        return Refuse(hwnd, IDS_STR_159, TRUE);
    if (WatermarksOnInRaster(hwnd, ctx))
        return Refuse(hwnd, IDS_STR_166, TRUE);
    INT order = 0;
    if (ReadOrder(hwnd, &order)) {
        ctx->ws.iOrder = order;
        ctx->iWatermarkModeEcho = order;
    }
    ctx->ws.iPlacement = ReadPlacement(hwnd);
    CopyChosenRecords(hwnd, ctx, &ctx->ws.WMARK1, &ctx->ws.WMARK2);
    return FALSE;
}

BOOL OnApply(HWND hwnd, PAGECONTEXT* ctx)
{
    if (ctx->bNoPermission)
        return FALSE;
    if (WatermarksOnInRaster(hwnd, ctx))
        return Refuse(hwnd, IDS_STR_166, PSNRET_INVALID_NOCHANGEPAGE);
    if (OEMDEV* oem = ctx->pOemDevmode) {
        INT order = 0;
        if (ReadOrder(hwnd, &order))
            oem->iOrder = order;
        oem->iPlacement = ReadPlacement(hwnd);
        CopyChosenRecords(hwnd, ctx, &oem->WMARK1, &oem->WMARK2);
    }
    ctx->bApplied = 1;
    return FALSE;
}

BOOL OnSetActive(HWND hwnd, PAGECONTEXT* ctx)
{
    HWND sheet = GetParent(hwnd);
    const LONG_PTR ex = GetWindowLongPtrW(sheet, GWL_EXSTYLE);
    if (ex & WS_EX_CONTEXTHELP) {
        SetWindowLongPtrW(sheet, GWL_EXSTYLE, ex & ~WS_EX_CONTEXTHELP);
        SendMessageW(sheet, WM_NCPAINT, 1, 0);
    }
    CheckDlgButton(hwnd, IDC_WM_ORDER_NONE, BST_CHECKED);
    ShowWatermarkSettings(hwnd, ctx);
    FixAllPagesLabels(hwnd);
    if (ctx->bNoPermission)
        DisableAllChildren(hwnd);
    return FALSE;
}

BOOL OnNotify(HWND hwnd, PAGECONTEXT* ctx, const NMHDR* nm)
{
    static const PageHandlers handlers = {OnSetActive, OnKillActive, OnApply};
    return DispatchPageNotify(hwnd, ctx, nm, handlers);
}

}  // namespace

void LoadNoneText(WCHAR buf[25]) { LoadPluginString(IDS_STR_157, buf, 25, L"(Нет)"); }

void RecordName(const WATERMARK& wm, WCHAR name[128])
{
    size_t n = BoundedLength(wm.szName, 128);
    if (n > 127)
        n = 127;
    std::memcpy(name, wm.szName, n * sizeof(WCHAR));
    name[n] = 0;
}

BOOL ListEntryText(HWND hwndList, int i, WCHAR* buf, int cch)
{
    if (i < 0 || cch <= 0)
        return FALSE;
    const LRESULT len = SendMessageW(hwndList, LB_GETTEXTLEN, i, 0);
    if (len == LB_ERR || len >= cch)
        return FALSE;
    return SendMessageW(hwndList, LB_GETTEXT, i, reinterpret_cast<LPARAM>(buf)) != LB_ERR;
}

void SetNameListExtent(HWND hwndList, HWND hwndMeasure, const WatermarkNode* pHead)
{
    size_t longest = 0;
    for (const WatermarkNode* n = pHead; n; n = n->next) {
        size_t len = BoundedLength(n->wm.szName, 128);
        if (len > 127)
            len = 127;
        if (len > longest)
            longest = len;
    }
    TEXTMETRICW tm = {};
    if (HDC dc = GetDC(hwndMeasure)) {
        GetTextMetricsW(dc, &tm);
        ReleaseDC(hwndMeasure, dc);
    }
    SendMessageW(hwndList, LB_SETHORIZONTALEXTENT, static_cast<WPARAM>(tm.tmMaxCharWidth * longest), 0);
}

PAGECONTEXT* DialogContext(HWND hwnd) { return PageContextOf(hwnd); }

LRESULT PaintWatermarkPreview(HWND hwndPreview, void (*refresh)(HWND hwndDialog, WATERMARK& wm))
{
    PAINTSTRUCT ps;
    HDC dc = BeginPaint(hwndPreview, &ps);
    auto* ctx = reinterpret_cast<PAGECONTEXT*>(GetWindowLongPtrW(hwndPreview, GWLP_USERDATA));
    if (dc && ctx && ctx->pPreviewRecord) {
        refresh(GetParent(hwndPreview), *ctx->pPreviewRecord);
        RECT rc;
        GetClientRect(hwndPreview, &rc);
        DrawWatermark(dc, nullptr, ctx->pPreviewRecord, &rc, WMDRAW_PREVIEW, PREVIEW_SCALE, ctx->szPrinterName,
                      ctx->szDriverName, 1, 1, 0);
    }
    EndPaint(hwndPreview, &ps);
    return 0;
}

void EnableEditDeleteButtons(HWND hwndPage, BOOL bEnable)
{
    Enable(hwndPage, IDC_WM_DELETE, bEnable);
    Enable(hwndPage, IDC_WM_EDIT, bEnable);
}

void ShowWatermarkSettings(HWND hwnd, PAGECONTEXT* ctx)
{
    const WORKINGSETTINGS& ws = ctx->ws;
    const INT m = ws.iOrder;
    EnableEditDeleteButtons(hwnd, ctx->pWatermarkList != nullptr);
    if (m != 0) {
        Enable(hwnd, IDC_WM_LIST1, TRUE);
        if (m != 1)
            Enable(hwnd, IDC_WM_LIST2, TRUE);
        for (int id : kModeControls)
            Enable(hwnd, id, TRUE);
    } else {
        SetLabel(hwnd, IDC_WM_LABEL1, IDS_STR_19);
        SetLabel(hwnd, IDC_WM_LABEL2, IDS_STR_20);
        CheckOrderRadio(hwnd, IDC_WM_ORDER_NONE);
        Enable(hwnd, IDC_WM_LIST1, FALSE);
        Enable(hwnd, IDC_WM_LIST2, FALSE);
        for (int id : kModeControls)
            Enable(hwnd, id, FALSE);
    }
    FillBothLists(hwnd, ctx->pWatermarkList);

    WCHAR name1[128], name2[128], name[128];
    RecordName(ws.WMARK1, name1);
    RecordName(ws.WMARK2, name2);
    BOOL found1 = FALSE;
    int i = 1;
    for (const WatermarkNode* n = ctx->pWatermarkList; n; n = n->next, ++i) {
        RecordName(n->wm, name);
        if (!found1 && lstrcmpiW(name, name1) == 0) {
            found1 = TRUE;
            if (m == 2 || m == 4 || m == 1) {
                if (m == 2) {
                    SetLabel(hwnd, IDC_WM_LABEL1, IDS_STR_19);
                    SetLabel(hwnd, IDC_WM_LABEL2, IDS_STR_20);
                    CheckOrderRadio(hwnd, IDC_WM_ORDER_FIRST);
                } else if (m == 4) {
                    SetLabel(hwnd, IDC_WM_LABEL1, IDS_STR_21);
                    SetLabel(hwnd, IDC_WM_LABEL2, IDS_STR_22);
                    CheckOrderRadio(hwnd, IDC_WM_ORDER_ODDEVEN);
                } else {
                    CheckOrderRadio(hwnd, IDC_WM_ORDER_ALL);
                    Enable(hwnd, IDC_WM_LIST2, FALSE);
                }
                Select(hwnd, IDC_WM_LIST1, i);
            }
        }
        if (lstrcmpiW(name, name2) == 0 && (m == 2 || m == 4)) {
            SetLabel(hwnd, IDC_WM_LABEL1, m == 2 ? IDS_STR_19 : IDS_STR_21);
            SetLabel(hwnd, IDC_WM_LABEL2, m == 2 ? IDS_STR_20 : IDS_STR_22);
            CheckOrderRadio(hwnd, m == 2 ? IDC_WM_ORDER_FIRST : IDC_WM_ORDER_ODDEVEN);
            Select(hwnd, IDC_WM_LIST2, i);
        }
    }
    CheckPlacement(hwnd, ws.iPlacement == 8);
}

void RefillWatermarkLists(HWND hwnd, const WatermarkNode* pHead, BOOL bKeepIndices)
{
    const int lists[] = {IDC_WM_LIST1, IDC_WM_LIST2};
    int index[2];
    WCHAR text[2][128];
    for (int k = 0; k < 2; ++k) {
        index[k] = Selected(hwnd, lists[k]);
        if (!ListEntryText(List(hwnd, lists[k]), index[k], text[k], 128))
            text[k][0] = 0;
    }
    FillBothLists(hwnd, pHead);
    for (int k = 0; k < 2; ++k) {
        if (bKeepIndices) {
            Select(hwnd, lists[k], index[k]);
            continue;
        }
        LRESULT found = SendDlgItemMessageW(hwnd, lists[k], LB_FINDSTRINGEXACT, 0, reinterpret_cast<LPARAM>(text[k]));
        Select(hwnd, lists[k], found == LB_ERR ? 0 : static_cast<int>(found));
    }
    EnableEditDeleteButtons(hwnd, pHead != nullptr);
}

INT_PTR CALLBACK WatermarkPageProc(HWND hwnd, UINT msg, WPARAM wParam, LPARAM lParam)
{
    if (msg == WM_INITDIALOG) {
        return OnInitDialog(hwnd, PageContextFromInit(lParam));
    }
    // The sheet window carries the context for everyone who only sees it.
    auto* ctx = reinterpret_cast<PAGECONTEXT*>(GetWindowLongPtrW(GetParent(hwnd), GWLP_USERDATA));
    if (!ctx)
        return FALSE;
    switch (msg) {
    case WM_COMMAND:
        if (LOWORD(wParam) >= IDC_WM_ORDER_NONE && LOWORD(wParam) <= IDC_WM_OVER)
            OnCommand(hwnd, ctx, LOWORD(wParam), HIWORD(wParam));
        return FALSE;
    case WM_NOTIFY:
        return OnNotify(hwnd, ctx, reinterpret_cast<const NMHDR*>(lParam));
    default:
        return FALSE;
    }
}
