#include "frame/oemdevmode.h"

#include <cstring>

namespace {

// Every field the default record sets, except the header and the three
// run-time links, which conversion handles itself.
void WriteDefaultSettings(OEMDEV* p)
{
    p->iOrder = 0;
    ZeroMemory(&p->WMARK1, sizeof(p->WMARK1));
    ZeroMemory(&p->WMARK2, sizeof(p->WMARK2));
    p->iPlacement = 4;
    ZeroMemory(&p->ManColData, sizeof(p->ManColData));
    p->PnHData.dwOutputType = 0;
    p->PnHData.szUserName[0] = 0;
    p->PnHData.szPIN[0] = 0;
    p->PnHData.dwKeepPrevious = 0;
    p->PnHData.dwKeepPrevious2 = 0;
    p->bPageOrder = 0;
    p->bRasterMode = 0;
    p->bPagesPerSheet = 0;
    p->iLayoutActive = 0;
    p->iReinitItems = 0;
    p->Brightness = 0;
    p->Contrast = 0;
    p->ImageSaturation = 0;
    p->GrayCorr = 1;
    p->EnhanceLines = 0;
    p->HasPrintQuality = 0;
}

}  // namespace

void WriteDefaultOemDevmode(OEMDEV* p)
{
    p->dmOEMExtra.dwVersion = OEM_VERSION;
    p->dmOEMExtra.dwSize = OEMDEV_SIZE;
    p->dmOEMExtra.dwSignature = OEM_SIGNATURE;
    WriteDefaultSettings(p);
    p->pOptItems = 0;
    p->cOEMOptItems = 0;
    p->pPageContext = 0;
}

void ConvertOemDevmode(const OEMDEV* pIn, OEMDEV* pOut)
{
    if (!pIn || !pOut)
        return;
    // Take what the input offers before writing anything: the driver may
    // pass one buffer as both input and output.
    OEMDEV in;
    const DWORD inSignature = pIn->dmOEMExtra.dwSignature;
    DWORD cb = pIn->dmOEMExtra.dwSize < pOut->dmOEMExtra.dwSize ? pIn->dmOEMExtra.dwSize : pOut->dmOEMExtra.dwSize;
    if (cb > OEMDEV_SIZE)
        cb = OEMDEV_SIZE;
    const bool sameSignature = inSignature == pOut->dmOEMExtra.dwSignature;
    if (sameSignature)
        memmove(&in, pIn, cb);
    pOut->iOrder = 0;
    if (!sameSignature) {
        WriteDefaultOemDevmode(pOut);
        return;
    }
    // An older, shorter input keeps the defaults beyond its end.
    WriteDefaultSettings(pOut);
    memmove(pOut, &in, cb);
    pOut->pOptItems = 0;
    pOut->cOEMOptItems = 0;
    pOut->pPageContext = 0;
    pOut->dmOEMExtra.dwSize = OEMDEV_SIZE;
    pOut->dmOEMExtra.dwVersion = OEM_VERSION;
}

HRESULT OemDevMode(DWORD dwMode, POEMDMPARAM pParam)
{
    if (!pParam || dwMode < OEMDM_SIZE || dwMode > OEMDM_MERGE) {
        SetLastError(ERROR_INVALID_PARAMETER);
        return E_FAIL;
    }
    auto* pIn = static_cast<const OEMDEV*>(pParam->pOEMDMIn);
    auto* pOut = static_cast<OEMDEV*>(pParam->pOEMDMOut);
    switch (dwMode) {
    case OEMDM_SIZE:
        pParam->cbBufSize = OEMDEV_SIZE;
        break;
    case OEMDM_DEFAULT:
        if (pOut)
            WriteDefaultOemDevmode(pOut);
        break;
    case OEMDM_CONVERT:
        ConvertOemDevmode(pIn, pOut);
        break;
    case OEMDM_MERGE:
        ConvertOemDevmode(pIn, pOut);
        if (pOut) {
            pOut->dmOEMExtra.dwSize = OEMDEV_SIZE;
            pOut->dmOEMExtra.dwSignature = OEM_SIGNATURE;
            pOut->dmOEMExtra.dwVersion = OEM_VERSION;
        }
        break;
    }
    return S_OK;
}
