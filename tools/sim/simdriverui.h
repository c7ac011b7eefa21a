// A simulated driver helper interface (IPrintOemDriverUI): it answers
// DrvGetDriverSetting from a configurable set of feature keywords and
// records DrvUpdateUISetting calls.
#pragma once
#include "frame/oemui.h"
#include <map>
#include <string>
#include <vector>

class SimDriverUI final : public IPrintOemDriverUI {
public:
    // Features present, each with the option name returned for it.
    std::map<std::string, std::string> features;
    std::vector<std::string> queries;          // every keyword asked, in order
    std::vector<PVOID> updatedItems;           // items passed to DrvUpdateUISetting
    LONG refs = 1;

    STDMETHODIMP QueryInterface(REFIID riid, void** ppv) override;
    STDMETHODIMP_(ULONG) AddRef() override { return InterlockedIncrement(&refs); }
    STDMETHODIMP_(ULONG) Release() override { return InterlockedDecrement(&refs); }  // owned by the test
    STDMETHODIMP DrvGetDriverSetting(PVOID pci, PCSTR Feature, PVOID pOutput, DWORD cbSize, PDWORD pcbNeeded,
                                     PDWORD pdwOptionsReturned) override;
    STDMETHODIMP DrvUpgradeRegistrySetting(HANDLE, PCSTR, PCSTR) override { return E_NOTIMPL; }
    STDMETHODIMP DrvUpdateUISetting(PVOID pci, PVOID pOptItem, DWORD dwPreviousSelection, DWORD dwMode) override;
};

// A driver object that hands out the helper interface (what the driver
// passes to PublishDriverInterface).
class SimDriverObject final : public IUnknown {
public:
    explicit SimDriverObject(SimDriverUI* ui) : ui_(ui) {}
    int queryCount = 0;
    STDMETHODIMP QueryInterface(REFIID riid, void** ppv) override;
    STDMETHODIMP_(ULONG) AddRef() override { return 2; }
    STDMETHODIMP_(ULONG) Release() override { return 1; }
private:
    SimDriverUI* ui_;
};
