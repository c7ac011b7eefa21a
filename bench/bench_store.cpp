// The cost of the watermark store on the paths that run most often: the
// copy before every DevMode call and the load of a large store. Each figure
// is measured against a bare baseline in the same run and printed as ratios.
#include "benchutil.h"
#include "frame/module.h"
#include "frame/oemdevmode.h"
#include "simspooler.h"
#include "watermark/wmstore.h"
#include "frame/oemui.h"

#include <shlwapi.h>
#include <cstdio>
#include <cstring>
#include <vector>

namespace {

const WCHAR kDriver[] = L"Norvane Bench Driver";
const WCHAR kUserKey[] = L"Software\\Norvane\\PCLPlugIn\\Norvane Bench Driver\\Watermark";

}  // namespace

int main()
{
    ModuleAttach(GetModuleHandleW(nullptr));
    InstallSimSpooler(GetModuleHandleW(nullptr));
    SHDeleteKeyW(HKEY_CURRENT_USER, L"Software\\Norvane");
    SHDeleteKeyW(HKEY_USERS, L".Default\\Software\\Norvane");
    SimPrinter p;
    p.name = L"Bench printer";
    p.driver = kDriver;
    HANDLE hPrinter = SimAddPrinter(p);
    DRIVER_INFO_2W info = {};
    info.pName = const_cast<LPWSTR>(kDriver);
    SeedDefaultWatermarks(DRIVER_EVENT_INITIALIZE, 2, reinterpret_cast<LPBYTE>(&info), 0);
    CopyDefaultWatermarks(hPrinter);  // the user's store now exists

    std::vector<BYTE> in(OEMDEV_SIZE), out(OEMDEV_SIZE);
    OEMDMPARAM param = {};
    param.cbSize = sizeof(param);
    param.hPrinter = hPrinter;
    param.pOEMDMOut = in.data();
    OemDevMode(OEMDM_DEFAULT, &param);
    param.pOEMDMIn = in.data();
    param.pOEMDMOut = out.data();
    memcpy(out.data(), in.data(), OEMDEV_SIZE);

    const int n = 2000;
    double convert = PerCall(n, [&] {
        CopyDefaultWatermarks(param.hPrinter);  // what the plug-in object runs first
        OemDevMode(OEMDM_CONVERT, &param);
    });
    double bare = PerCall(n, [&] {
        memcpy(out.data(), in.data(), OEMDEV_SIZE);
        HKEY h = nullptr;
        if (RegOpenKeyExW(HKEY_CURRENT_USER, kUserKey, 0, KEY_READ, &h) == ERROR_SUCCESS)
            RegCloseKey(h);
    });
    std::printf("DevMode convert (store seeded): %.2f us/call; bare copy + one key open/close: %.2f us/call; "
                "ratio %.2f\n", convert * 1e6, bare * 1e6, convert / bare);

    HKEY h = nullptr;
    RegCreateKeyExW(HKEY_CURRENT_USER, kUserKey, 0, nullptr, 0, KEY_WRITE, nullptr, &h, nullptr);
    for (int i = 0; i < 1000; ++i) {
        WATERMARK wm = {};
        wsprintfW(wm.szName, L"Знак %04d", i);
        RegSetValueExW(h, wm.szName, 0, REG_BINARY, reinterpret_cast<BYTE*>(&wm), sizeof(wm));
    }
    RegCloseKey(h);
    double load = PerCall(20, [&] {
        WatermarkNode* list = nullptr;
        LoadWatermarkList(hPrinter, GetProcessHeap(), &list);
        FreeWatermarkList(&list, GetProcessHeap());
    });
    double raw = PerCall(20, [&] {
        HKEY k = nullptr;
        if (RegOpenKeyExW(HKEY_CURRENT_USER, kUserKey, 0, KEY_READ, &k) != ERROR_SUCCESS)
            return;
        WCHAR name[128];
        WATERMARK wm;
        for (DWORD i = 0;; ++i) {
            DWORD cch = 128, cb = sizeof(wm), type = 0;
            if (RegEnumValueW(k, i, name, &cch, nullptr, &type, reinterpret_cast<BYTE*>(&wm), &cb) ==
                ERROR_NO_MORE_ITEMS)
                break;
        }
        RegCloseKey(k);
    });
    std::printf("LoadWatermarkList of 1000: %.2f ms; raw RegEnumValueW loop: %.2f ms; ratio %.2f\n", load * 1e3,
                raw * 1e3, load / raw);
    SHDeleteKeyW(HKEY_CURRENT_USER, L"Software\\Norvane");
    SHDeleteKeyW(HKEY_USERS, L".Default\\Software\\Norvane");
    return 0;
}
