#include "simdriverui.h"

#include <cstring>

STDMETHODIMP SimDriverUI::QueryInterface(REFIID riid, void** ppv)
{
    if (IsEqualIID(riid, IID_IUnknown) || IsEqualIID(riid, IID_IPrintOemDriverUI)) {
        *ppv = static_cast<IPrintOemDriverUI*>(this);
        AddRef();
        return S_OK;
    }
    *ppv = nullptr;
    return E_NOINTERFACE;
}

STDMETHODIMP SimDriverUI::DrvGetDriverSetting(PVOID, PCSTR Feature, PVOID pOutput, DWORD cbSize, PDWORD pcbNeeded,
                                              PDWORD pdwOptionsReturned)
{
    queries.push_back(Feature ? Feature : "");
    auto it = Feature ? features.find(Feature) : features.end();
    if (it == features.end())
        return E_FAIL;
    DWORD need = DWORD(it->second.size() + 1);
    if (pcbNeeded)
        *pcbNeeded = need;
    if (pdwOptionsReturned)
        *pdwOptionsReturned = 1;
    if (!pOutput || cbSize < need)
        return E_OUTOFMEMORY;
    memcpy(pOutput, it->second.c_str(), need);
    return S_OK;
}

STDMETHODIMP SimDriverUI::DrvUpdateUISetting(PVOID, PVOID pOptItem, DWORD, DWORD)
{
    updatedItems.push_back(pOptItem);
    return S_OK;
}

STDMETHODIMP SimDriverObject::QueryInterface(REFIID riid, void** ppv)
{
    ++queryCount;
    return ui_->QueryInterface(riid, ppv);
}
