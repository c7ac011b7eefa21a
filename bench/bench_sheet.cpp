// How opening the printing preferences grows with the user's watermark
// store: from DocumentPropertySheets INIT until every page of the sheet has
// handled WM_INITDIALOG, and the opening of the add/edit watermark dialog,
// with 10 and with 1,000 stored watermarks, through the built DLL.
#include "benchutil.h"
#include "frame/oemdevmode.h"
#include "pluginloader.h"
#include "simhost.h"
#include "simspooler.h"
#include "uidriver.h"

#include <commctrl.h>
#include <shlwapi.h>
#include <cstdio>
#include <string>

namespace {

const wchar_t kDriver[] = L"Norvane Bench Driver";
const wchar_t kStoreKey[] = L"Software\\Norvane\\PCLPlugIn\\Norvane Bench Driver\\Watermark";


void FillStore(int count)
{
    SHDeleteKeyW(HKEY_CURRENT_USER, L"Software\\Norvane");
    HKEY key = nullptr;
    RegCreateKeyExW(HKEY_CURRENT_USER, kStoreKey, 0, nullptr, 0, KEY_WRITE, nullptr, &key, nullptr);
    for (int i = 0; i < count; ++i) {
        WATERMARK wm = {};
        swprintf(wm.szName, 128, L"Водяной знак номер %04d", i);
        lstrcpynW(wm.szText, L"КОНФИДЕНЦИАЛЬНО", 128);
        wm.bIntensity = 100;
        wm.iPointSize = 72;
        wm.iVertPos = wm.iHorzPos = wm.iUnits = 1;
        lstrcpynW(wm.lfFont.lfFaceName, L"Arial", LF_FACESIZE);
        RegSetValueExW(key, wm.szName, 0, REG_BINARY, reinterpret_cast<const BYTE*>(&wm), sizeof(wm));
    }
    RegCloseKey(key);
}

struct Timing {
    double sheet = 1e9;   // INIT until every page is initialised
    double dialog = 1e9;  // Add pressed until the dialog is initialised
};

Timing Measure(HMODULE plugin, int stored)
{
    FillStore(stored);
    Timing best;
    for (int round = 0; round < 5; ++round) {
        SimResetSpooler();
        SimHost host(CreatePluginFrom(plugin), L"Bench printer", kDriver);
        const double t0 = Now();
        host.InitDocumentSheet();
        HWND sheet = host.ShowSheet();
        // A page handles WM_INITDIALOG when it is first shown.
        for (WORD id : host.PageTemplates())
            host.SelectPage(id);
        const double t1 = Now();
        host.SelectPage(104);
        HWND page = host.PageWindow(104);
        double opened = 0;
        QueueDialog([&opened](HWND dlg) {
            opened = Now();
            Click(dlg, IDCANCEL);
        });
        const double t2 = Now();
        SendMessageW(page, WM_COMMAND, MAKEWPARAM(1039, BN_CLICKED), reinterpret_cast<LPARAM>(GetDlgItem(page, 1039)));
        if (sheet && t1 - t0 < best.sheet)
            best.sheet = t1 - t0;
        if (opened > 0 && opened - t2 < best.dialog)
            best.dialog = opened - t2;
        host.Destroy();
    }
    return best;
}

}  // namespace

int main()
{
    HMODULE plugin = LoadPluginBesideProgram();
    if (!plugin) {
        std::printf("NVPCLUI.dll not found beside the benchmark\n");
        return 1;
    }
    InstallMessageBoxRecorder(plugin);
    INITCOMMONCONTROLSEX icc = {sizeof(icc), ICC_WIN95_CLASSES};
    InitCommonControlsEx(&icc);
    const Timing small = Measure(plugin, 10), large = Measure(plugin, 1000);
    std::printf("document sheet until every page is initialised: %.1f ms with 10 watermarks, %.1f ms with 1000; "
                "ratio 1000/10 %.2f\n",
                small.sheet * 1e3, large.sheet * 1e3, large.sheet / small.sheet);
    std::printf("add/edit watermark dialog opening: %.1f ms with 10 watermarks, %.1f ms with 1000; ratio 1000/10 %.2f\n",
                small.dialog * 1e3, large.dialog * 1e3, large.dialog / small.dialog);
    SHDeleteKeyW(HKEY_CURRENT_USER, L"Software\\Norvane");
    return 0;
}
