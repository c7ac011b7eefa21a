// The property sheets of a simulated colour printer with every feature, as
// the Unidrv host builds them through the plug-in's COM interface: one PNG
// per plug-in page and per watermark dialog, and one of the device sheet.
#include "demo.h"
#include "pngwriter.h"
#include "simhost.h"
#include "simspooler.h"
#include "uidriver.h"

#include <commctrl.h>
#include <cstdio>
#include <string>
#include <vector>

namespace {

void Settle(HWND hwnd)
{
    RedrawWindow(hwnd, nullptr, nullptr, RDW_INVALIDATE | RDW_ERASE | RDW_ALLCHILDREN | RDW_UPDATENOW | RDW_FRAME);
    for (int i = 0; i < 5; ++i) {
        PumpMessages();
        Sleep(30);
    }
}

// The window as the screen shows it; through the window's own painting when
// there is no screen to read back.
bool Capture(HWND hwnd, const std::wstring& path)
{
    // A modal dialog is shown once its loop first idles; scripts run before.
    ShowWindow(hwnd, SW_SHOW);
    SetForegroundWindow(hwnd);
    Settle(hwnd);
    RECT r;
    GetWindowRect(hwnd, &r);
    const int w = r.right - r.left, h = r.bottom - r.top;
    HDC screen = GetDC(nullptr);
    HDC mem = CreateCompatibleDC(screen);
    BITMAPINFO bi = {};
    bi.bmiHeader.biSize = sizeof(bi.bmiHeader);
    bi.bmiHeader.biWidth = w;
    bi.bmiHeader.biHeight = -h;
    bi.bmiHeader.biPlanes = 1;
    bi.bmiHeader.biBitCount = 24;
    void* bits = nullptr;
    HBITMAP bmp = CreateDIBSection(screen, &bi, DIB_RGB_COLORS, &bits, nullptr, 0);
    HGDIOBJ old = SelectObject(mem, bmp);
    bool ok = BitBlt(mem, 0, 0, w, h, screen, r.left, r.top, SRCCOPY) != FALSE;
    // A screen without content (no display) reads back as one colour.
    const BYTE* p = static_cast<const BYTE*>(bits);
    bool flat = true;
    const int stride = (w * 3 + 3) & ~3;
    for (int y = 0; y < h && flat; y += 7)
        for (int x = 0; x < w * 3; x += 5)
            if (p[y * stride + x] != p[0]) {
                flat = false;
                break;
            }
    if (!ok || flat)
        ok = PrintWindow(hwnd, mem, 0) != FALSE;
    SelectObject(mem, old);
    ok = ok && SaveBitmapPng(bmp, path.c_str());
    DeleteObject(bmp);
    DeleteDC(mem);
    ReleaseDC(nullptr, screen);
    return ok;
}

std::wstring Out(const wchar_t* dir, const wchar_t* name) { return std::wstring(dir) + L"\\" + name; }

void Report(bool ok, const char* what, const wchar_t* file)
{
    std::printf("%s -> %s (%s)\n", what, Utf8(file).c_str(), ok ? "ok" : "failed");
}

// The about page lists the driver's files with their versions: the plug-in
// and the demo host stand in for them.
void ListDriverFiles(SimHost& host)
{
    WCHAR self[MAX_PATH] = {};
    GetModuleFileNameW(nullptr, self, MAX_PATH);
    std::wstring dir(self);
    dir.resize(dir.find_last_of(L'\\') + 1);
    if (SimPrinter* p = SimPrinterOf(host.Printer()))
        p->dependentFiles = {dir + L"NVPCLUI.dll", dir + L"demohost.exe", dir + L"NVPCLUI.chm"};
}

struct Shot {
    WORD templateId;
    const char* what;
    const wchar_t* file;
};

int DocumentSheet(const wchar_t* outDir)
{
    SimHost host(DemoCreatePlugin(), kDemoPrinter, kDemoDriver);
    for (const char* f : {"PrintAndHold", "IsColorPrinter", "HasKeepPreviousPHJobs", "HasPrintQuality", "HasManualColor"})
        host.driverUI.features[f] = "1";
    host.driverUI.features["ColorMode"] = "Color";
    // A job that already carries watermarks: draft on the first page, the
    // user's name on the others.
    host.oem.iOrder = 2;
    lstrcpynW(host.oem.WMARK1.szName, L"Черновая печать", 128);
    lstrcpynW(host.oem.WMARK2.szName, L"Имя пользователя", 128);
    ListDriverFiles(host);
    if (host.InitDocumentSheet() != S_OK)
        return 1;
    HWND sheet = host.ShowSheet(L"Свойства документа: Norvane LaserJet (demo)");
    if (!sheet)
        return 1;
    ShowWindow(sheet, SW_SHOW);
    int failures = 0;
    const Shot pages[] = {
        {138, "document sheet, print-and-hold page", L"page138_pnh.png"},
        {104, "document sheet, watermark page", L"page104_watermark.png"},
        {107, "document sheet, manual colour page", L"page107_manualcolour.png"},
        {221, "document sheet, profiles page", L"page221_profiles.png"},
        {137, "document sheet, about page", L"page137_about.png"},
    };
    for (const Shot& s : pages) {
        if (!host.SelectPage(s.templateId)) {
            std::printf("%s: the page could not be shown\n", s.what);
            ++failures;
            continue;
        }
        const bool ok = Capture(sheet, Out(outDir, s.file));
        failures += !ok;
        Report(ok, s.what, s.file);
    }

    // The RGB print-quality dialog, from the manual colour page.
    host.SelectPage(107);
    QueueDialog([&](HWND rgb) {
        bool ok = Capture(rgb, Out(outDir, L"dialog231_rgbquality.png"));
        Report(ok, "RGB print-quality dialog", L"dialog231_rgbquality.png");
        failures += !ok;
        Click(rgb, IDCANCEL);
    });
    Click(host.PageWindow(107), 1253);

    // The watermark dialogs, opened from the page as a user opens them.
    host.SelectPage(104);
    HWND page = host.PageWindow(104);
    QueueDialog([&](HWND choose) {
        bool ok = Capture(choose, Out(outDir, L"dialog136_choose.png"));
        Report(ok, "choose-to-edit dialog", L"dialog136_choose.png");
        failures += !ok;
        // The draft watermark shows best in the previews.
        const std::vector<std::wstring> names = ListItems(choose, 1169);
        for (size_t i = 0; i < names.size(); ++i)
            if (names[i] == L"Черновая печать")
                SendDlgItemMessageW(choose, 1169, LB_SETCURSEL, i, 0);
        Click(choose, IDOK);
    });
    QueueDialog([&](HWND edit) {
        bool ok = Capture(edit, Out(outDir, L"dialog103_edit.png"));
        Report(ok, "add/edit watermark dialog", L"dialog103_edit.png");
        failures += !ok;
        QueueDialog([&](HWND place) {
            bool shot = Capture(place, Out(outDir, L"dialog220_placement.png"));
            Report(shot, "placement dialog", L"dialog220_placement.png");
            failures += !shot;
            Click(place, IDCANCEL);
        });
        Click(edit, 1217);
        Click(edit, 1216);
        QueueDialog([&](HWND dyn) {
            bool shot = Capture(dyn, Out(outDir, L"dialog101_dynamic.png"));
            Report(shot, "dynamic variables dialog", L"dialog101_dynamic.png");
            failures += !shot;
            Click(dyn, IDCANCEL);
        });
        Click(edit, 1003);
        Click(edit, IDCANCEL);
    });
    SendMessageW(page, WM_COMMAND, MAKEWPARAM(1049, BN_CLICKED), reinterpret_cast<LPARAM>(GetDlgItem(page, 1049)));
    QueueDialog([&](HWND del) {
        bool ok = Capture(del, Out(outDir, L"dialog135_delete.png"));
        Report(ok, "delete watermarks dialog", L"dialog135_delete.png");
        failures += !ok;
        Click(del, IDOK);
    });
    SendMessageW(page, WM_COMMAND, MAKEWPARAM(1040, BN_CLICKED), reinterpret_cast<LPARAM>(GetDlgItem(page, 1040)));
    if (PendingDialogScripts() != 0) {
        std::printf("a watermark dialog did not open\n");
        ClearDialogScripts();
        ++failures;
    }
    host.Destroy();
    return failures;
}

int MonochromeQualityPage(const wchar_t* outDir)
{
    SimHost host(DemoCreatePlugin(), kDemoPrinter, kDemoDriver);
    host.driverUI.features["HasPrintQuality"] = "1";
    if (host.InitDocumentSheet() != S_OK)
        return 1;
    HWND sheet = host.ShowSheet(L"Свойства документа: Norvane LaserJet (demo)");
    if (!sheet || !host.SelectPage(229))
        return 1;
    ShowWindow(sheet, SW_SHOW);
    const bool ok = Capture(sheet, Out(outDir, L"page229_monoquality.png"));
    Report(ok, "black-and-white printer, quality page", L"page229_monoquality.png");
    host.Destroy();
    return !ok;
}

int DeviceSheet(const wchar_t* outDir)
{
    SimHost host(DemoCreatePlugin(), kDemoPrinter, kDemoDriver);
    ListDriverFiles(host);
    if (host.InitDeviceSheet() != S_OK)
        return 1;
    HWND sheet = host.ShowSheet(L"Свойства принтера: Norvane LaserJet (demo)");
    if (!sheet)
        return 1;
    ShowWindow(sheet, SW_SHOW);
    const bool ok = Capture(sheet, Out(outDir, L"device109_about.png"));
    Report(ok, "device sheet, about page", L"device109_about.png");
    host.Destroy();
    return !ok;
}

}  // namespace

int RunSheetDemo(const wchar_t* outDir)
{
    InstallMessageBoxRecorder(DemoLoadPlugin());
    INITCOMMONCONTROLSEX icc = {sizeof(icc), ICC_WIN95_CLASSES};
    InitCommonControlsEx(&icc);
    int failures = DocumentSheet(outDir);
    failures += MonochromeQualityPage(outDir);
    failures += DeviceSheet(outDir);
    return failures == 0 ? 0 : 1;
}
