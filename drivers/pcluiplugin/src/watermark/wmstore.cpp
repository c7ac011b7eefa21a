#include "watermark/wmstore.h"
#include "frame/oemui.h"
#include "frame/module.h"
#include "frame/scoped.h"
#include "frame/spooler.h"
#include "resources/resource.h"

#include <strsafe.h>

namespace {

constexpr size_t kDriverNameCch = 100;
constexpr size_t kKeyPathCch = 260;
constexpr REGSAM kReadWrite = KEY_READ | KEY_WRITE;

// Formats a key path; FALSE when it does not fit (nothing is ever cut).
BOOL FormatKeyPath(WCHAR (&path)[kKeyPathCch], LPCWSTR fmt, LPCWSTR a, LPCWSTR b = nullptr)
{
    HRESULT hr = b ? StringCchPrintfW(path, kKeyPathCch, fmt, a, b) : StringCchPrintfW(path, kKeyPathCch, fmt, a);
    return SUCCEEDED(hr);
}

BOOL DriverNameOf(HANDLE hPrinter, WCHAR (&name)[kDriverNameCch])
{
    name[0] = 0;
    return ReadPrinterDriverName(hPrinter, name, kDriverNameCch);
}

// The three per-user openers create a missing key and report whether it
// existed; the creation's own disposition tells that without a second open.
HKEY OpenOrCreateUserKey(LPCWSTR path, REGSAM sam, DWORD* pdwDisposition)
{
    HKEY hKey = nullptr;
    DWORD disposition = 0;
    if (RegCreateKeyExW(HKEY_CURRENT_USER, path, 0, nullptr, 0, sam, nullptr, &hKey, &disposition) != ERROR_SUCCESS)
        return nullptr;
    if (pdwDisposition)
        *pdwDisposition = disposition;
    return hKey;
}

HKEY OpenUserPath(HANDLE hPrinter, LPCWSTR fmt, LPCWSTR second, REGSAM sam, DWORD* pdwDisposition)
{
    WCHAR driver[kDriverNameCch];
    WCHAR path[kKeyPathCch];
    if (!DriverNameOf(hPrinter, driver) || !FormatKeyPath(path, fmt, driver, second))
        return nullptr;
    return OpenOrCreateUserKey(path, sam, pdwDisposition);
}

BOOL DefaultKeyPath(HANDLE hPrinter, LPCWSTR pszDriverName, WCHAR (&path)[kKeyPathCch])
{
    WCHAR driver[kDriverNameCch] = {};
    if (hPrinter) {
        if (!DriverNameOf(hPrinter, driver))
            return FALSE;
    } else if (pszDriverName) {
        if (FAILED(StringCchCopyW(driver, kDriverNameCch, pszDriverName)))
            return FALSE;
    }
    return FormatKeyPath(path, L".Default\\Software\\Norvane\\PCLPlugIn\\%s", driver);
}

// The driver name of a DriverEvent: the pName member of DRIVER_INFO_1 to 4
// (the first member of level 1, the second of levels 2 to 4).
void DriverNameFromInfo(DWORD dwLevel, const BYTE* pInfo, WCHAR* out, size_t cch)
{
    out[0] = 0;
    if (!pInfo)
        return;
    LPCWSTR name = nullptr;
    switch (dwLevel) {
    case 1: name = reinterpret_cast<const DRIVER_INFO_1W*>(pInfo)->pName; break;
    case 2: name = reinterpret_cast<const DRIVER_INFO_2W*>(pInfo)->pName; break;
    case 3: name = reinterpret_cast<const DRIVER_INFO_3W*>(pInfo)->pName; break;
    case 4: name = reinterpret_cast<const DRIVER_INFO_4W*>(pInfo)->pName; break;
    default: break;
    }
    CopySpoolerString(out, cch, name);
}

void ShowSaveError(HWND hwndOwner)
{
    WCHAR text[256] = {};
    WCHAR caption[20] = {};
    LoadStringW(ModuleInstance(), IDS_ERR_REGISTRY_WRITE, text, 256);
    LoadStringW(ModuleInstance(), IDS_CAPTION_ERROR, caption, 20);
    MessageBoxW(hwndOwner, text, caption, MB_ICONERROR);
}

}  // namespace

HKEY OpenBaseKey(HANDLE hPrinter, REGSAM sam, DWORD* pdwDisposition)
{
    return OpenUserPath(hPrinter, L"Software\\Norvane\\PCLPlugIn\\%s", nullptr, sam, pdwDisposition);
}

HKEY OpenUserWatermarkKey(HANDLE hPrinter, REGSAM sam, DWORD* pdwDisposition)
{
    return OpenUserPath(hPrinter, L"Software\\Norvane\\PCLPlugIn\\%s\\Watermark", nullptr, sam, pdwDisposition);
}

HKEY OpenProfileKey(HANDLE hPrinter, LPCWSTR pszProfile, REGSAM sam, DWORD* pdwDisposition)
{
    return OpenUserPath(hPrinter, L"Software\\Norvane\\PCLPlugIn\\%s\\Profiles\\%s", pszProfile ? pszProfile : L"",
                        sam, pdwDisposition);
}

HKEY OpenDefaultWatermarkKey(HANDLE hPrinter, LPCWSTR pszDriverName, REGSAM sam)
{
    WCHAR path[kKeyPathCch];
    if (!DefaultKeyPath(hPrinter, pszDriverName, path))
        return nullptr;
    HKEY hKey = nullptr;
    if (RegCreateKeyExW(HKEY_USERS, path, 0, nullptr, 0, sam, nullptr, &hKey, nullptr) != ERROR_SUCCESS)
        return nullptr;
    return hKey;
}

BOOL WriteBinaryValue(HKEY hKey, LPCWSTR pszName, const void* pData, DWORD cb)
{
    if (!pData) {
        RegDeleteValueW(hKey, pszName);
        return TRUE;
    }
    return RegSetValueExW(hKey, pszName, 0, REG_BINARY, static_cast<const BYTE*>(pData), cb) == ERROR_SUCCESS;
}

HRESULT SeedDefaultWatermarks(DWORD dwDriverEvent, DWORD dwLevel, LPBYTE pDriverInfo, LPARAM)
{
    WCHAR driver[260];
    DriverNameFromInfo(dwLevel, pDriverInfo, driver, 260);
    if (dwDriverEvent != DRIVER_EVENT_INITIALIZE)
        return S_OK;
    // A name too long for the store's buffer opens no key at all.
    ScopedRegKey key(BoundedLength(driver, 260) < kDriverNameCch
                         ? OpenDefaultWatermarkKey(nullptr, driver, kReadWrite)
                         : nullptr);
    if (!key)
        return S_OK;
    WATERMARK defaults[4];
    BuildDefaultWatermarks(defaults);
    for (const WATERMARK& wm : defaults) {
        WCHAR name[128];
        StringCchCopyNW(name, 128, wm.szName, 127);
        WriteBinaryValue(key.get(), name, &wm, sizeof(wm));
    }
    // The driver framework does not expect success to be reported here.
    return S_OK;
}

void CopyDefaultWatermarks(HANDLE hPrinter)
{
    // Opened for reading only: this runs at every DevMode call, and an
    // ordinary user may not create keys under the default user.
    WCHAR path[kKeyPathCch];
    if (!DefaultKeyPath(hPrinter, nullptr, path))
        return;
    ScopedRegKey defKey;
    if (RegOpenKeyExW(HKEY_USERS, path, 0, KEY_READ, defKey.out()) != ERROR_SUCCESS)
        return;
    DWORD disposition = 0;
    ScopedRegKey userKey(OpenUserWatermarkKey(hPrinter, kReadWrite, &disposition));
    if (!userKey || disposition == REG_OPENED_EXISTING_KEY)
        return;  // an existing store, even an empty one, is never reseeded
    DWORD cValues = 0, cchMaxName = 0, cbMaxData = 0;
    if (RegQueryInfoKeyW(defKey.get(), nullptr, nullptr, nullptr, nullptr, nullptr, nullptr, &cValues, &cchMaxName,
                         &cbMaxData, nullptr, nullptr) != ERROR_SUCCESS)
        return;
    HeapBuffer name((cchMaxName + 1) * sizeof(WCHAR));
    HeapBuffer data(cbMaxData ? cbMaxData : 1);
    if (!name || !data)
        return;
    for (DWORD i = 0; i < cValues; ++i) {
        DWORD cchName = cchMaxName + 1;
        DWORD cbData = cbMaxData;
        DWORD type = 0;
        if (RegEnumValueW(defKey.get(), i, name.get<WCHAR>(), &cchName, nullptr, &type, data.get<BYTE>(),
                          &cbData) != ERROR_SUCCESS)
            continue;
        RegSetValueExW(userKey.get(), name.get<WCHAR>(), 0, REG_BINARY, data.get<BYTE>(), cbData);
    }
}

DWORD LoadWatermarkList(HANDLE hPrinter, HANDLE hHeap, WatermarkNode** ppHead)
{
    ScopedRegKey key(OpenUserWatermarkKey(hPrinter, KEY_READ, nullptr));
    if (!key)
        return 0;
    DWORD cValues = 0, cchMaxName = 0;
    if (RegQueryInfoKeyW(key.get(), nullptr, nullptr, nullptr, nullptr, nullptr, nullptr, &cValues, &cchMaxName,
                         nullptr, nullptr, nullptr) != ERROR_SUCCESS)
        return 0;
    HeapBuffer name((cchMaxName + 1) * sizeof(WCHAR));
    if (!name)
        return 0;
    DWORD cRead = 0;
    WATERMARK wm;
    for (DWORD i = 0; i < cValues; ++i) {
        DWORD cchName = cchMaxName + 1;
        DWORD cbData = sizeof(wm);
        DWORD type = 0;
        // Only a REG_BINARY of exactly one record becomes a list entry: a
        // shorter or foreign value would leave a half-filled record.
        LONG rc = RegEnumValueW(key.get(), i, name.get<WCHAR>(), &cchName, nullptr, &type,
                                reinterpret_cast<BYTE*>(&wm), &cbData);
        if (rc != ERROR_SUCCESS || type != REG_BINARY || cbData != sizeof(wm))
            continue;
        WatermarkNode* node = AppendWatermarkNode(ppHead, hHeap);
        if (!node)
            break;
        node->wm = wm;
        node->wm.pNext = 0;
        ++cRead;
    }
    return cRead;
}

BOOL SaveWatermarkList(HWND hwndOwner, HANDLE hPrinter, const WatermarkNode* pHead)
{
    if (!pHead) {
        ScopedRegKey base(OpenBaseKey(hPrinter, KEY_WRITE | KEY_QUERY_VALUE, nullptr));
        if (base) {
            RegDeleteKeyW(base.get(), L"Watermark");
            base.reset();
            ScopedRegKey wmKey(OpenUserWatermarkKey(hPrinter, KEY_WRITE, nullptr));
        }
        return FALSE;
    }
    {
        ScopedRegKey base(OpenBaseKey(hPrinter, KEY_WRITE, nullptr));
        if (!base) {
            ShowSaveError(hwndOwner);
            return FALSE;
        }
        RegDeleteKeyW(base.get(), L"Watermark");
    }
    ScopedRegKey wmKey(OpenUserWatermarkKey(hPrinter, KEY_WRITE, nullptr));
    if (!wmKey) {
        ShowSaveError(hwndOwner);
        return FALSE;
    }
    for (const WatermarkNode* node = pHead; node; node = node->next) {
        WATERMARK wm = node->wm;
        wm.pNext = 0;
        WCHAR name[128];
        StringCchCopyNW(name, 128, wm.szName, 127);
        WriteBinaryValue(wmKey.get(), name, &wm, sizeof(wm));
    }
    return TRUE;
}
