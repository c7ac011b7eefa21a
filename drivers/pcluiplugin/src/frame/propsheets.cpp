#include "frame/propsheets.h"

#include "frame/dialogutil.h"
#include "frame/module.h"
#include "frame/pagecontext.h"
#include "frame/runtimelinks.h"
#include "frame/spooler.h"
#include "pages/aboutpage.h"
#include "pages/pnhpage.h"
#include "pages/qualitypages.h"
#include "resources/resource.h"
#include "watermark/wmrecord.h"
#include "watermarkui/wmpage.h"

#include <strsafe.h>
#include <cstring>

namespace {

constexpr WORD kPropSheetUIVersion = 0x0100;
constexpr DWORD kNoPermission = 0x20;  // DM_NOPERMISSION in the parameter block's flags
const WCHAR kHeaderTitle[] = L"Norvane Plug-in Page";

// The profiles page comes with its subsystem later; until then it keeps the
// page context like every page does.
INT_PTR CALLBACK PlainPageProc(HWND hwnd, UINT msg, WPARAM, LPARAM lParam)
{
    if (msg == WM_INITDIALOG) {
        auto* psp = reinterpret_cast<PROPSHEETPAGEW*>(lParam);
        SetWindowLongPtrW(hwnd, GWLP_USERDATA, psp ? psp->lParam : 0);
        return TRUE;
    }
    return FALSE;
}

BOOL HasFeature(PAGECONTEXT* ctx, PCSTR keyword)
{
    if (!ctx->pDriverUI)
        return FALSE;
    BYTE out[10] = {};
    DWORD needed = 0, returned = 0;
    return ctx->pDriverUI->DrvGetDriverSetting(ctx->pParam->poemuiobj, keyword, out, sizeof(out), &needed,
                                               &returned) == S_OK;
}

BOOL IsPartnerBrand(const WCHAR* driverName)
{
    WCHAR prefix[5] = {};
    StringCchCopyNW(prefix, 5, driverName, 4);
    return lstrcmpiW(prefix, L"Tarn") == 0;
}

LONG_PTR AddPage(PAGECONTEXT* ctx, WORD templateId, DLGPROC proc)
{
    PROPSHEETPAGEW psp = {};
    psp.dwSize = sizeof(psp);
    psp.dwFlags = PSP_HASHELP;
    psp.hInstance = ModuleInstance();
    psp.pszTemplate = MAKEINTRESOURCEW(templateId);
    psp.pfnDlgProc = proc;
    psp.lParam = reinterpret_cast<LPARAM>(ctx);
    HANDLE actCtx = ModuleActivationContext();
    if (actCtx != INVALID_HANDLE_VALUE) {
        psp.dwFlags |= PSP_USEFUSIONCONTEXT;
        psp.hActCtx = actCtx;
    }
    return ctx->pfnComPropSheet(ctx->hComPropSheet, CPSFUNC_ADD_PROPSHEETPAGEW, reinterpret_cast<LPARAM>(&psp), 0);
}

// A text field of a record from the devmode, copied as a string: cut to fit
// with its terminator and zero behind it, whatever the source held.
void CopyTextField(WCHAR* dst, const WCHAR* src, size_t cch)
{
    size_t n = BoundedLength(src, cch);
    if (n >= cch)
        n = cch - 1;
    std::memcpy(dst, src, n * sizeof(WCHAR));
    std::memset(dst + n, 0, (cch - n) * sizeof(WCHAR));
}

void CopyWatermarkField(WATERMARK& dst, const WATERMARK& src)
{
    dst = src;
    CopyTextField(dst.szName, src.szName, 128);
    CopyTextField(dst.szText, src.szText, 128);
    dst.lfFont.lfFaceName[LF_FACESIZE - 1] = 0;
    dst.pNext = 0;
}

void LoadWorkingSettings(WORKINGSETTINGS& ws, const OEMDEV& oem)
{
    ws.iOrder = oem.iOrder;
    ws.iPlacement = oem.iPlacement;
    ws.ManColData = oem.ManColData;
    ws.PnHData.dwOutputType = oem.PnHData.dwOutputType;
    ws.PnHData.dwKeepPrevious = oem.PnHData.dwKeepPrevious;
    ws.PnHData.dwKeepPrevious2 = oem.PnHData.dwKeepPrevious2;
    CopyTextField(ws.PnHData.szPIN, oem.PnHData.szPIN, 5);
    CopyTextField(ws.PnHData.szUserName, oem.PnHData.szUserName, 25);
    CopyWatermarkField(ws.WMARK1, oem.WMARK1);
    CopyWatermarkField(ws.WMARK2, oem.WMARK2);
    ws.Brightness = oem.Brightness;
    ws.Contrast = oem.Contrast;
    ws.ImageSaturation = oem.ImageSaturation;
    ws.GrayCorr = oem.GrayCorr;
    ws.EnhanceLines = oem.EnhanceLines;
    ws.HasPrintQuality = oem.HasPrintQuality;
}

// Steps shared by both sheets: the context in the driver's heap, the
// printer's names, the sheet's handles.
PAGECONTEXT* NewPageContext(PPROPSHEETUI_INFO info, POEMUIPSPARAM param)
{
    if (!param || !param->hOEMHeap)
        return nullptr;
    auto* ctx = static_cast<PAGECONTEXT*>(HeapAlloc(param->hOEMHeap, HEAP_ZERO_MEMORY, sizeof(PAGECONTEXT)));
    if (!ctx)
        return nullptr;
    HeapBuffer buf;
    if (PRINTER_INFO_2W* pi = ReadPrinterInfo2(param->hPrinter, buf))
        CopySpoolerString(ctx->szDriverName, 260, pi->pDriverName);
    ctx->hComPropSheet = info->hComPropSheet;
    ctx->pfnComPropSheet = info->pfnComPropSheet;
    ctx->pParam = param;
    ctx->hPrinter = param->hPrinter;
    ctx->pOemDevmode = static_cast<OEMDEV*>(param->pOEMDM);
    CopySpoolerString(ctx->szPrinterName, 260, param->pPrinterName);
    return ctx;
}

ULONG_PTR BuildDocumentSheet(PPROPSHEETUI_INFO info, IPrintOemDriverUI* driverUI)
{
    auto* param = reinterpret_cast<POEMUIPSPARAM>(info->lParamInit);
    PAGECONTEXT* ctx = NewPageContext(info, param);
    if (!ctx || !ctx->pOemDevmode || !ctx->pfnComPropSheet) {
        // Nothing is half-built: no pages, and the sheet learns it failed.
        SetLastError(ERROR_NOT_ENOUGH_MEMORY);
        return 0;
    }
    OEMDEV* oem = ctx->pOemDevmode;
    ctx->pDriverUI = driverUI;
    ctx->bApplied = 0;
    oem->pPageContext = RegisterRuntimeLink(ctx, RUNTIME_LINK_PAGECONTEXT);
    LoadWorkingSettings(ctx->ws, *oem);
    param->pOEMUserData = ctx;
    ctx->bNoPermission = (param->dwFlags & kNoPermission) ? 1 : 0;

    LONG_PTR last = 0;
    if (HasFeature(ctx, "PrintAndHold"))
        last = AddPage(ctx, IDD_138, PrintAndHoldPageProc);
    last = AddPage(ctx, IDD_104, WatermarkPageProc);
    ctx->bColorPrinter = HasFeature(ctx, "IsColorPrinter") ? 1 : 0;
    ctx->bKeepPrevious = HasFeature(ctx, "HasKeepPreviousPHJobs") ? 1 : 0;
    if (HasFeature(ctx, "HasPrintQuality")) {
        oem->HasPrintQuality = 1;
        if (HasFeature(ctx, "HasManualColor"))
            last = AddPage(ctx, IDD_107, ManualColourPageProc);
        if (!ctx->bColorPrinter)
            last = AddPage(ctx, IDD_229, MonoQualityPageProc);
    } else {
        oem->HasPrintQuality = 0;
    }
    last = AddPage(ctx, IDD_221, PlainPageProc);
    last = AddPage(ctx, IsPartnerBrand(ctx->szDriverName) ? IDD_234 : IDD_137, AboutPageProc);
    return static_cast<ULONG_PTR>(last);
}

ULONG_PTR BuildDeviceSheet(PPROPSHEETUI_INFO info)
{
    auto* param = reinterpret_cast<POEMUIPSPARAM>(info->lParamInit);
    PAGECONTEXT* ctx = NewPageContext(info, param);
    if (!ctx || !ctx->pfnComPropSheet) {
        SetLastError(ERROR_NOT_ENOUGH_MEMORY);
        return 0;
    }
    return static_cast<ULONG_PTR>(AddPage(ctx, IsPartnerBrand(ctx->szDriverName) ? IDD_233 : IDD_109, AboutPageProc));
}

ULONG_PTR DestroyDocumentSheet(PPROPSHEETUI_INFO info)
{
    auto* param = reinterpret_cast<POEMUIPSPARAM>(info->lParamInit);
    auto* ctx = param ? static_cast<PAGECONTEXT*>(param->pOEMUserData) : nullptr;
    if (!ctx)
        return 1;
    if (OEMDEV* oem = ctx->pOemDevmode) {
        RevokeRuntimeLink(oem->pOptItems);
        RevokeRuntimeLink(oem->pPageContext);
        oem->pOptItems = 0;
        oem->cDrvOptItems = 0;
        oem->pPageContext = 0;
    }
    RevokeRuntimeLinksTo(ctx);
    ULONG_PTR result = 1;
    if (ctx->bApplied)
        result = static_cast<ULONG_PTR>(ctx->pfnComPropSheet(ctx->hComPropSheet, CPSFUNC_SET_RESULT, 0, CPSUI_OK));
    FreeWatermarkList(&ctx->pWatermarkList, GetProcessHeap());
    ctx->pEditedRecord = nullptr;
    param->pOEMUserData = nullptr;
    return result;
}

ULONG_PTR SetResult(LPARAM lParam)
{
    auto* sr = reinterpret_cast<PSETRESULT_INFO>(lParam);
    return sr ? static_cast<ULONG_PTR>(sr->Result) : 0;
}

BOOL ValidInfo(PPROPSHEETUI_INFO info)
{
    if (info && info->Version == kPropSheetUIVersion)
        return TRUE;
    SetLastError(ERROR_INVALID_PARAMETER);
    return FALSE;
}

void SetHeaderTitle(LPARAM lParam)
{
    if (auto* header = reinterpret_cast<PPROPSHEETUI_INFO_HEADER>(lParam))
        header->pTitle = const_cast<LPWSTR>(kHeaderTitle);
}

}  // namespace

HRESULT HandleDocumentPropertySheets(PPROPSHEETUI_INFO info, LPARAM lParam, IPrintOemDriverUI* driverUI)
{
    if (!ValidInfo(info))
        return E_FAIL;
    switch (info->Reason) {
    case PROPSHEETUI_REASON_INIT:
        info->Result = BuildDocumentSheet(info, driverUI);
        break;
    case PROPSHEETUI_REASON_GET_INFO_HEADER:
        SetHeaderTitle(lParam);
        info->Result = 1;
        break;
    case PROPSHEETUI_REASON_DESTROY:
        info->Result = DestroyDocumentSheet(info);
        break;
    case PROPSHEETUI_REASON_SET_RESULT:
        if (info->pfnComPropSheet)
            info->pfnComPropSheet(info->hComPropSheet, CPSFUNC_SET_RESULT, 0, CPSUI_OK);
        info->Result = SetResult(lParam);
        break;
    case PROPSHEETUI_REASON_GET_ICON:
        info->Result = 0;
        break;
    default:
        break;
    }
    return S_OK;
}

HRESULT HandleDevicePropertySheets(PPROPSHEETUI_INFO info, LPARAM lParam)
{
    if (!ValidInfo(info))
        return E_FAIL;
    switch (info->Reason) {
    case PROPSHEETUI_REASON_INIT:
        info->Result = BuildDeviceSheet(info);
        break;
    case PROPSHEETUI_REASON_GET_INFO_HEADER:
        SetHeaderTitle(lParam);
        info->Result = 1;
        break;
    case PROPSHEETUI_REASON_DESTROY:
        info->Result = 1;
        break;
    case PROPSHEETUI_REASON_SET_RESULT:
        info->Result = SetResult(lParam);
        break;
    case PROPSHEETUI_REASON_GET_ICON:
        info->Result = 0;
        break;
    default:
        break;
    }
    return S_OK;
}
