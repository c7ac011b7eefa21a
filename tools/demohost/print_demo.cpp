// The sample print job: pages go through the plug-in's DocumentEvent with
// the simulated render side, onto 300-dpi A4 page bitmaps, one PNG per sheet.
#include "demo.h"
#include "frame/oemdevmode.h"
#include "pngwriter.h"
#include "simrender.h"
#include "simspooler.h"
#include "watermark/wmrecord.h"

#include <shlwapi.h>
#include <winddiui.h>
#include <cstdio>
#include <cstring>
#include <map>
#include <vector>

namespace {

// The user's watermarks as the plug-in seeded them into the registry.
std::map<std::wstring, WATERMARK> ReadUserWatermarks()
{
    std::map<std::wstring, WATERMARK> out;
    std::wstring path = std::wstring(L"Software\\Norvane\\PCLPlugIn\\") + kDemoDriver + L"\\Watermark";
    HKEY key = nullptr;
    if (RegOpenKeyExW(HKEY_CURRENT_USER, path.c_str(), 0, KEY_READ, &key) != ERROR_SUCCESS)
        return out;
    for (DWORD i = 0;; ++i) {
        WCHAR name[128];
        DWORD cch = 128, type = 0, cb = sizeof(WATERMARK);
        WATERMARK wm;
        if (RegEnumValueW(key, i, name, &cch, nullptr, &type, reinterpret_cast<BYTE*>(&wm), &cb) != ERROR_SUCCESS)
            break;
        if (type == REG_BINARY && cb == sizeof(WATERMARK))
            out[wm.szName] = wm;
    }
    RegCloseKey(key);
    return out;
}

// What an application would have printed on the page: a heading, lines of
// text and a dark picture, laid into the page image's rectangle.
void DrawContent(HDC dc, const RECT& r, int page, bool picture)
{
    const int w = r.right - r.left;
    const double k = w / 2380.0;  // 300-dpi printable width
    HFONT heading = CreateFontW(-int(90 * k), 0, 0, 0, FW_BOLD, 0, 0, 0, DEFAULT_CHARSET, 0, 0, 0, 0, L"Times New Roman");
    HFONT body = CreateFontW(-int(42 * k), 0, 0, 0, FW_NORMAL, 0, 0, 0, DEFAULT_CHARSET, 0, 0, 0, 0, L"Times New Roman");
    SetBkMode(dc, TRANSPARENT);
    SetTextColor(dc, RGB(0, 0, 0));
    HGDIOBJ old = SelectObject(dc, heading);
    WCHAR title[64];
    wsprintfW(title, L"Отчёт о продажах — страница %d", page);
    TextOutW(dc, r.left + int(150 * k), r.top + int(200 * k), title, lstrlenW(title));
    SelectObject(dc, body);
    static const wchar_t* lines[] = {
        L"Продажи в третьем квартале выросли на двенадцать процентов по сравнению",
        L"со вторым кварталом. Наибольший рост показали северо-западный и",
        L"уральский регионы; в южном регионе объём остался на прежнем уровне.",
        L"Ниже приведены итоги по каждому направлению и планы на следующий год.",
    };
    int y = r.top + int(400 * k);
    for (int rep = 0; rep < 6; ++rep)
        for (const wchar_t* line : lines) {
            TextOutW(dc, r.left + int(150 * k), y, line, lstrlenW(line));
            y += int(60 * k);
        }
    if (picture) {
        RECT pic = {r.left + int(150 * k), r.top + int(1950 * k), r.right - int(150 * k), r.top + int(2900 * k)};
        HBRUSH dark = CreateSolidBrush(RGB(20, 20, 20));
        FillRect(dc, &pic, dark);
        DeleteObject(dark);
    }
    SelectObject(dc, old);
    DeleteObject(heading);
    DeleteObject(body);
}

struct Sheet {
    const char* what;
    int order;
    int placement;
    LPCWSTR wm1;
    LPCWSTR wm2;
    SimLayout layout;  // pagesPerSheet 0: a plain page, no layout
    int firstPage;
    int physicalPage;
    bool picture;
};

}  // namespace

int RunPrintDemo(const wchar_t* outDir)
{
    IPrintOemUI2* plugin = DemoCreatePlugin();
    if (!plugin)
        return 1;
    CreateDirectoryW(outDir, nullptr);
    CoInitializeEx(nullptr, COINIT_APARTMENTTHREADED);

    SimPrinter* printer = SimPrinterNamed(kDemoPrinter);
    HANDLE hPrinter = nullptr;
    if (!printer) {
        SimPrinter p;
        p.name = kDemoPrinter;
        p.driver = kDemoDriver;
        hPrinter = SimAddPrinter(p);
        printer = SimPrinterOf(hPrinter);
    } else {
        hPrinter = SimAddPrinter(*printer);
    }
    WCHAR me[100];
    DWORD cch = 100;
    GetUserNameW(me, &cch);
    printer->jobs = {{17, me}};
    SimPrinterOf(hPrinter)->jobs = printer->jobs;

    // The job's devmode as the driver would keep it: the plug-in's defaults,
    // then the choices made on the watermark page.
    SimRenderJob job;
    OEMDMPARAM param = {};
    param.cbSize = sizeof(param);
    param.hPrinter = hPrinter;
    param.pOEMDMOut = &job.oem;
    plugin->DevMode(OEMDM_DEFAULT, &param);
    SimSetA4(job, 300);
    job.jobId = 17;
    std::map<std::wstring, WATERMARK> marks = ReadUserWatermarks();
    std::printf("print job on \"%s\": %u stored watermarks, A4 at 300 dpi\n", Utf8(kDemoPrinter).c_str(),
                unsigned(marks.size()));
    if (marks.size() < 4) {
        plugin->Release();
        return 1;
    }
    const std::wstring draft = L"Черновая печать", confidential = L"Конфиденциально", user = L"Имя пользователя",
                       datetime = L"Дата и время";
    auto pick = [&](LPCWSTR name) {
        WATERMARK wm = {};
        if (name) {
            for (auto& m : marks)
                if (lstrcmpiW(m.first.c_str(), name) == 0)
                    wm = m.second;
            wm.bSelected = wm.szName[0] ? 1 : 0;
        }
        return wm;
    };

    SimLayout plain;
    plain.pagesPerSheet = 0;
    SimLayout fourUp;
    fourUp.pagesPerSheet = 4;
    SimLayout backSide;
    backSide.pagesPerSheet = 1;
    backSide.backSideTurn = true;
    backSide.longEdgeDuplex = true;
    const Sheet sheets[] = {
        {"first page of first/other: draft diagonally", 2, 8, draft.c_str(), user.c_str(), plain, 1, 1, false},
        {"other pages of first/other: user name, top left", 2, 8, draft.c_str(), user.c_str(), plain, 2, 2, false},
        {"odd page of odd/even: date and time, top right", 4, 8, datetime.c_str(), user.c_str(), plain, 3, 3, false},
        {"even page of odd/even: user name, top left", 4, 8, datetime.c_str(), user.c_str(), plain, 4, 4, false},
        {"4-up sheet, all pages: one draft watermark per page image", 1, 8, draft.c_str(), nullptr, fourUp, 5, 5, false},
        {"duplex back side (long edge, turned): confidential, level", 1, 8, confidential.c_str(), nullptr, backSide, 9, 6, false},
        {"under the page: a dark picture hides the watermark", 1, 4, confidential.c_str(), nullptr, plain, 10, 7, true},
        {"over the page: the watermark covers the picture", 1, 8, confidential.c_str(), nullptr, plain, 11, 8, true},
    };

    int rc = 0;
    int index = 0;
    for (const Sheet& s : sheets) {
        ++index;
        job.oem.iOrder = s.order;
        job.oem.iPlacement = s.placement;
        job.oem.WMARK1 = pick(s.wm1);
        job.oem.WMARK2 = pick(s.wm2);
        if (s.layout.backSideTurn) {
            // Wine piles up the glyphs of an angled font under a rotated world
            // transform (Windows does not); the turned side is shown level.
            job.oem.WMARK1.lfFont.lfOrientation = job.oem.WMARK1.lfFont.lfEscapement = 0;
        }
        job.oem.iLayoutActive = s.layout.pagesPerSheet ? 1 : 0;
        job.physicalPage = s.physicalPage;
        job.dm.dmDuplex = s.layout.longEdgeDuplex ? DMDUP_VERTICAL : DMDUP_SIMPLEX;
        SimPage page(job, 24);
        job.sheet.clear();
        if (job.oem.iLayoutActive) {
            job.sheet = SimSheetRecords(job, s.layout, 0, s.firstPage + 3);
            for (PAGERECORD& r : job.sheet) {
                r.iPageNumber += s.firstPage - 1;
                RECT frame = r.rcArea;
                FrameRect(page.dc(), &frame, static_cast<HBRUSH>(GetStockObject(GRAY_BRUSH)));
                DrawContent(page.dc(), r.rcArea, r.iPageNumber, s.picture);
            }
        } else {
            DrawContent(page.dc(), {0, 0, page.width(), page.height()}, s.firstPage, s.picture);
        }
        int result = 0;
        plugin->DocumentEvent(hPrinter, page.dc(), DOCUMENTEVENT_ENDPAGE, 0, nullptr, 0, nullptr, &result);
        WCHAR path[MAX_PATH];
        wsprintfW(path, L"%s\\sheet%02d.png", outDir, index);
        BOOL saved = SaveBitmapPng(page.bitmap(), path);
        std::printf("sheet %d: %s -> %s (%s)\n", index, s.what, Utf8(PathFindFileNameW(path)).c_str(),
                    result == 1 && saved ? "ok" : "FAILED");
        if (result != 1 || !saved)
            rc = 1;
    }
    CoUninitialize();
    plugin->Release();
    return rc;
}
