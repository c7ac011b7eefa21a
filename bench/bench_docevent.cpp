// What the end of every printed page costs: DocumentEvent end-of-page on a
// 600-dpi A4 page, plain and 4-up, 1-bit and 24-bit, with no watermark
// selected, with the draft watermark and with a dynamic one. Each figure is
// set beside a baseline measured in the same run: one plain TextOutW of the
// same text with the same font into the same bitmap.
#include "benchutil.h"
#include "frame/module.h"
#include "frame/oemdevmode.h"
#include "simrender.h"
#include "simspooler.h"
#include "watermark/docevent.h"
#include "watermark/dyntext.h"
#include "watermark/wmrecord.h"

#include <winddiui.h>
#include <cstdio>

namespace {

// The watermark's font at the page's resolution, as the renderer makes it.
HFONT PrintFont(const WATERMARK& wm, int dpi)
{
    LOGFONTW lf = wm.lfFont;
    lf.lfHeight = -MulDiv(wm.iPointSize, dpi, 72);
    lf.lfWidth = 0;
    return CreateFontIndirectW(&lf);
}

double BaselineTextOut(SimPage& page, const WATERMARK& wm, LPCWSTR text, int dpi, int n)
{
    HFONT font = PrintFont(wm, dpi);
    HGDIOBJ old = SelectObject(page.dc(), font);
    SetBkMode(page.dc(), TRANSPARENT);
    SetTextColor(page.dc(), wm.crColor);
    const int len = lstrlenW(text);
    double t = PerCall(n, [&] { TextOutW(page.dc(), page.width() / 2, page.height() / 2, text, len); });
    SelectObject(page.dc(), old);
    DeleteObject(font);
    return t;
}

}  // namespace

int main()
{
    HMODULE self = GetModuleHandleW(nullptr);
    ModuleAttach(self);
    InstallSimSpooler(self);
    InstallSimRender(self);
    SimPrinter printer;
    printer.name = L"Bench printer";
    printer.driver = L"Norvane Bench Driver";
    HANDLE hPrinter = SimAddPrinter(printer);

    WATERMARK defaults[4];
    BuildDefaultWatermarks(defaults);
    const WATERMARK& draft = defaults[0];
    WATERMARK dynamic = defaults[3];  // date and time, top right
    dynamic.bSelected = 1;
    WATERMARK draftSel = draft;
    draftSel.bSelected = 1;

    const int dpi = 600;
    std::printf("DocumentEvent end of page, A4 at %d dpi (best of 5 rounds)\n", dpi);
    std::printf("%-6s %-6s %-10s %12s %12s %10s %10s\n", "bits", "layout", "watermark", "page us", "TextOutW us",
                "ratio", "pages/s");
    for (int bpp : {1, 24}) {
        for (int up : {1, 4}) {
            SimRenderJob job;
            SimSetA4(job, dpi);
            job.oem.dmOEMExtra.dwSignature = OEM_SIGNATURE;
            job.oem.dmOEMExtra.dwSize = OEMDEV_SIZE;
            job.oem.dmOEMExtra.dwVersion = OEM_VERSION;
            job.oem.iPlacement = 8;
            if (up > 1) {
                SimLayout layout;
                layout.pagesPerSheet = up;
                job.oem.iLayoutActive = 1;
                job.sheet = SimSheetRecords(job, layout, 0, up);
            }
            SimPage page(job, bpp);
            struct Variant {
                const char* name;
                int order;
                const WATERMARK* wm;
            } variants[] = {{"none", 0, nullptr}, {"draft", 1, &draftSel}, {"dynamic", 1, &dynamic}};
            for (const Variant& v : variants) {
                job.oem.iOrder = v.order;
                if (v.wm)
                    job.oem.WMARK1 = *v.wm;
                const int n = v.wm ? 20 : 2000;
                double t = PerCall(n, [&] {
                    int result = 0;
                    HandleDocumentEvent(hPrinter, page.dc(), DOCUMENTEVENT_ENDPAGE, 0, nullptr, 0, nullptr, &result);
                });
                // The baseline draws the text the page carries, expanded.
                const WATERMARK& base = v.wm ? *v.wm : draftSel;
                WCHAR text[DYNTEXT_CCH];
                lstrcpynW(text, base.szText, DYNTEXT_CCH);
                if (base.bDynamic)
                    ExpandDynamicText(page.dc(), hPrinter, text, nullptr, L"Bench printer", L"Norvane Bench Driver", 1,
                                      WMDRAW_PRINT);
                double b = BaselineTextOut(page, base, text, dpi, 20);
                page.Clear();
                std::printf("%-6d %-6s %-10s %12.1f %12.1f %10.2f %10.0f\n", bpp, up == 1 ? "plain" : "4-up", v.name,
                            t * 1e6, b * 1e6, t / b, 1.0 / t);
            }
        }
    }
    std::printf("ratio: page time over one TextOutW of the same text and font into the same bitmap\n");
    // Where a dynamic watermark's time goes: the expansion of its text alone.
    {
        SimRenderJob job;
        SimSetA4(job, dpi);
        SimPage page(job, 1);
        double e = PerCall(200, [&] {
            WCHAR text[DYNTEXT_CCH];
            lstrcpynW(text, dynamic.szText, DYNTEXT_CCH);
            ExpandDynamicText(page.dc(), hPrinter, text, nullptr, L"Bench printer", L"Norvane Bench Driver", 1,
                              WMDRAW_PRINT);
        });
        std::printf("expanding the dynamic text alone: %.1f us\n", e * 1e6);
    }
    return 0;
}
