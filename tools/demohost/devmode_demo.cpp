#include "demo.h"
#include "frame/oemdevmode.h"
#include "pluginloader.h"
#include "simdriverui.h"
#include "simspooler.h"

#include <shlwapi.h>
#include <cstdio>
#include <string>
#include <vector>

std::string Utf8(const WCHAR* w)
{
    char buf[512] = {};
    WideCharToMultiByte(CP_UTF8, 0, w, -1, buf, sizeof(buf) - 1, nullptr, nullptr);
    return buf;
}

HMODULE DemoLoadPlugin() { return LoadPluginBesideProgram(); }

IPrintOemUI2* DemoCreatePlugin() { return CreatePluginFrom(DemoLoadPlugin()); }

int RunDevmodeDemo()
{
    HMODULE h = DemoLoadPlugin();
    std::printf("LoadLibrary NVPCLUI.dll: %s\n", h ? "loaded" : "FAILED");
    IPrintOemUI2* plugin = DemoCreatePlugin();
    std::printf("DllGetClassObject + CreateInstance(IPrintOemUI2): %s\n", plugin ? "object created" : "FAILED");
    if (!plugin)
        return 1;

    SimDriverUI driverUI;
    SimDriverObject driverObj(&driverUI);
    std::printf("PublishDriverInterface: 0x%08lx\n", (unsigned long)plugin->PublishDriverInterface(&driverObj));

    DWORD value = 0, needed = 0;
    HRESULT hr = plugin->GetInfo(OEMGI_GETSIGNATURE, &value, sizeof(value), &needed);
    std::printf("GetInfo(signature): 0x%08lx -> 0x%08lx '%c%c%c%c'\n", (unsigned long)hr, (unsigned long)value,
                char(value >> 24), char(value >> 16), char(value >> 8), char(value));
    hr = plugin->GetInfo(OEMGI_GETVERSION, &value, sizeof(value), &needed);
    std::printf("GetInfo(version): 0x%08lx -> %lu\n", (unsigned long)hr, (unsigned long)value);

    SimPrinter printer;
    printer.name = kDemoPrinter;
    printer.driver = kDemoDriver;
    HANDLE hPrinter = SimAddPrinter(printer);

    DRIVER_INFO_2W info = {};
    info.cVersion = 3;
    info.pName = const_cast<LPWSTR>(printer.driver.c_str());
    hr = plugin->DriverEvent(DRIVER_EVENT_INITIALIZE, 2, reinterpret_cast<LPBYTE>(&info), 0);
    std::printf("DriverEvent(initialize): 0x%08lx (default watermarks seeded)\n", (unsigned long)hr);

    OEMDMPARAM param = {};
    param.cbSize = sizeof(param);
    param.hPrinter = hPrinter;
    hr = plugin->DevMode(OEMDM_SIZE, &param);
    std::printf("DevMode(size): 0x%08lx -> %lu bytes\n", (unsigned long)hr, (unsigned long)param.cbBufSize);

    HKEY hKey = nullptr;
    DWORD cValues = 0;
    if (RegOpenKeyExW(HKEY_CURRENT_USER, L"Software\\Norvane\\PCLPlugIn\\Norvane PCL6 Demo Driver\\Watermark", 0,
                      KEY_READ, &hKey) == ERROR_SUCCESS) {
        RegQueryInfoKeyW(hKey, nullptr, nullptr, nullptr, nullptr, nullptr, nullptr, &cValues, nullptr, nullptr,
                         nullptr, nullptr);
        for (DWORD i = 0; i < cValues; ++i) {
            WCHAR name[128];
            DWORD cch = 128;
            if (RegEnumValueW(hKey, i, name, &cch, nullptr, nullptr, nullptr, nullptr) == ERROR_SUCCESS)
                std::printf("  user watermark: %s\n", Utf8(name).c_str());
        }
        RegCloseKey(hKey);
    }
    std::printf("user watermark store after the first DevMode call: %lu watermarks\n", (unsigned long)cValues);

    std::vector<BYTE> in(param.cbBufSize), out(param.cbBufSize);
    param.pOEMDMOut = in.data();
    hr = plugin->DevMode(OEMDM_DEFAULT, &param);
    auto* def = reinterpret_cast<OEMDEV*>(in.data());
    std::printf("DevMode(default): 0x%08lx -> size %lu, iOrder %d, iPlacement %d, GrayCorr %d\n", (unsigned long)hr,
                (unsigned long)def->dmOEMExtra.dwSize, def->iOrder, def->iPlacement, def->GrayCorr);

    def->iOrder = 2;
    def->Brightness = 3;
    param.pOEMDMIn = in.data();
    param.pOEMDMOut = out.data();
    reinterpret_cast<OEMDEV*>(out.data())->dmOEMExtra.dwSignature = OEM_SIGNATURE;
    reinterpret_cast<OEMDEV*>(out.data())->dmOEMExtra.dwSize = OEMDEV_SIZE;
    hr = plugin->DevMode(OEMDM_CONVERT, &param);
    auto* conv = reinterpret_cast<OEMDEV*>(out.data());
    std::printf("DevMode(convert): 0x%08lx -> iOrder %d, Brightness %d\n", (unsigned long)hr, conv->iOrder,
                conv->Brightness);
    def->dmOEMExtra.dwSignature = 0x12345678;
    hr = plugin->DevMode(OEMDM_MERGE, &param);
    std::printf("DevMode(merge, foreign input): 0x%08lx -> signature 0x%08lx, iOrder %d\n", (unsigned long)hr,
                (unsigned long)conv->dmOEMExtra.dwSignature, conv->iOrder);

    ULONG cb = 64;
    WCHAR profile[32] = {};
    FLONG flags = 0;
    hr = plugin->QueryColorProfile(hPrinter, nullptr, nullptr, nullptr, 0, profile, &cb, &flags);
    std::printf("QueryColorProfile: 0x%08lx -> %ls (flags %lu)\n", (unsigned long)hr, profile, (unsigned long)flags);
    plugin->Release();
    return 0;
}
