#include "frame/info.h"
#include "frame/oemdevmode.h"

HRESULT PluginGetInfo(DWORD dwMode, PVOID pBuffer, DWORD cbSize, PDWORD pcbNeeded)
{
    if (!pcbNeeded ||
        (dwMode != OEMGI_GETSIGNATURE && dwMode != OEMGI_GETVERSION && dwMode != OEMGI_GETPUBLISHERINFO)) {
        SetLastError(ERROR_INVALID_PARAMETER);
        return E_FAIL;
    }
    *pcbNeeded = sizeof(DWORD);
    if (!pBuffer || cbSize < sizeof(DWORD)) {
        SetLastError(ERROR_INSUFFICIENT_BUFFER);
        return E_FAIL;
    }
    switch (dwMode) {
    case OEMGI_GETSIGNATURE:
        *static_cast<DWORD*>(pBuffer) = OEM_SIGNATURE;
        return S_OK;
    case OEMGI_GETVERSION:
        *static_cast<DWORD*>(pBuffer) = OEM_VERSION;
        return S_OK;
    default:  // publisher information is not offered
        *pcbNeeded = 0;
        SetLastError(ERROR_NOT_SUPPORTED);
        return E_FAIL;
    }
}

HRESULT PluginQueryColorProfile(ULONG ulQueryMode, VOID* pvProfileData, ULONG* pcbProfileData,
                                FLONG* pflProfileData)
{
    static const WCHAR kProfile[] = L"OEMPROFILE.icm";
    constexpr ULONG kReported = 32;
    if (ulQueryMode != QCP_DEVICEPROFILE)
        return E_FAIL;
    if (!pcbProfileData) {
        SetLastError(ERROR_INVALID_PARAMETER);
        return E_FAIL;
    }
    if (!pvProfileData || *pcbProfileData < kReported) {
        *pcbProfileData = kReported;
        SetLastError(ERROR_INSUFFICIENT_BUFFER);
        return E_FAIL;
    }
    CopyMemory(pvProfileData, kProfile, sizeof(kProfile));
    *pcbProfileData = kReported;
    if (pflProfileData)
        *pflProfileData = QCP_PROFILEDISK;
    return S_OK;
}
