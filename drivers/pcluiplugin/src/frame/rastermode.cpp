#include "frame/rastermode.h"

#include "frame/dialogutil.h"
#include "frame/runtimelinks.h"

namespace {

constexpr UINT kGraphicsModeItem = 11114;
constexpr UINT kRasterOption = 11601;

class ScopedLibrary {
public:
    explicit ScopedLibrary(HMODULE h) : h_(h) {}
    ~ScopedLibrary() { if (h_) FreeLibrary(h_); }
    ScopedLibrary(const ScopedLibrary&) = delete;
    ScopedLibrary& operator=(const ScopedLibrary&) = delete;
    HMODULE get() const { return h_; }
private:
    HMODULE h_;
};

// Names in option items may be resource ids; only real strings compare.
BOOL NameIs(LPCWSTR name, LPCWSTR wanted)
{
    return name && !IS_INTRESOURCE(name) && wanted[0] && lstrcmpiW(name, wanted) == 0;
}

LPCWSTR SelectedOptionName(const OPTITEM& item)
{
    const POPTTYPE type = item.pOptType;
    if (!type || !type->pOptParam || item.Sel < 0 || item.Sel >= type->Count)
        return nullptr;
    return type->pOptParam[item.Sel].pData;
}

}  // namespace

BOOL RasterModeSelected(const OEMDEV* pOem)
{
    if (!pOem || pOem->cDrvOptItems < 1)
        return FALSE;
    auto* items = static_cast<const OPTITEM*>(ResolveRuntimeLink(pOem->pOptItems, RUNTIME_LINK_OPTITEMS));
    if (!items)
        return FALSE;
    ScopedLibrary unires(IsolatedLoadLibraryW(L"UniRes.dll"));
    if (!unires.get())
        return FALSE;
    WCHAR itemName[50] = {}, rasterName[50] = {};
    LoadStringW(unires.get(), kGraphicsModeItem, itemName, 50);
    LoadStringW(unires.get(), kRasterOption, rasterName, 50);
    for (DWORD i = 0; i < pOem->cDrvOptItems; ++i) {
        if (NameIs(items[i].pName, itemName))
            return NameIs(SelectedOptionName(items[i]), rasterName);
    }
    return FALSE;
}
