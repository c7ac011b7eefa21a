// The document and device sheets as the Unidrv host builds them: which
// pages the plug-in adds for which printer, the reasons' results, and what
// the OEM devmode holds after the sheet is gone.
#include "plugin_dll.h"
#include "simhost.h"
#include "simspooler.h"
#include "uidriver.h"

#include <commctrl.h>
#include <gtest/gtest.h>
#include <algorithm>
#include <vector>

namespace {

using Templates = std::vector<WORD>;

struct SheetTest : ::testing::Test {
    void SetUp() override
    {
        SimResetSpooler();
        ClearPluginRegistry();
    }
    void TearDown() override { SimResetSpooler(); }
    Templates DocumentPages(std::initializer_list<const char*> features, const wchar_t* driver = L"Norvane PCL 6")
    {
        SimHost host(CreatePluginObject(), L"Norvane LaserJet", driver);
        for (const char* f : features)
            host.driverUI.features[f] = "1";
        EXPECT_EQ(host.InitDocumentSheet(), S_OK);
        Templates t = host.PageTemplates();
        host.Destroy();
        return t;
    }
};

}  // namespace

TEST_F(SheetTest, PagesFollowTheReportedFeatures)
{
    EXPECT_EQ(DocumentPages({}), (Templates{104, 221, 137}));
    EXPECT_EQ(DocumentPages({"PrintAndHold", "IsColorPrinter", "HasPrintQuality", "HasManualColor"}),
              (Templates{138, 104, 107, 221, 137}));
    EXPECT_EQ(DocumentPages({"HasPrintQuality"}), (Templates{104, 229, 221, 137}));
    EXPECT_EQ(DocumentPages({"IsColorPrinter", "HasPrintQuality"}), (Templates{104, 221, 137}));

    // Manual colour needs print quality; the devmode learns there is none.
    SimHost host(CreatePluginObject(), L"Norvane LaserJet", L"Norvane PCL 6");
    host.driverUI.features["HasManualColor"] = "1";
    host.oem.HasPrintQuality = 1;
    ASSERT_EQ(host.InitDocumentSheet(), S_OK);
    EXPECT_EQ(host.PageTemplates(), (Templates{104, 221, 137}));
    EXPECT_EQ(host.oem.HasPrintQuality, 0);
    EXPECT_EQ(std::count(host.driverUI.queries.begin(), host.driverUI.queries.end(), std::string("HasManualColor")), 0);
    // Every page comes from the plug-in with help, its context and its template.
    for (const PROPSHEETPAGEW& p : host.pages) {
        EXPECT_TRUE(p.dwFlags & PSP_HASHELP);
        EXPECT_EQ(p.hInstance, PluginDll());
        EXPECT_EQ(p.lParam, reinterpret_cast<LPARAM>(host.Param()->pOEMUserData));
        EXPECT_NE(p.pfnDlgProc, nullptr);
    }
    EXPECT_NE(host.oem.pPageContext, 0u);
    EXPECT_EQ(host.Result(), ULONG_PTR(0x1002));  // the answer for the about page
    host.Destroy();
}

TEST_F(SheetTest, PartnerBrandChoosesTheAboutTemplates)
{
    EXPECT_EQ(DocumentPages({}, L"tARN LaserJet 5").back(), 234);
    EXPECT_EQ(DocumentPages({}, L"TARN").back(), 234);
    EXPECT_EQ(DocumentPages({}, L"Tar").back(), 137);
    EXPECT_EQ(DocumentPages({}, L"Norvane Tarn").back(), 137);
    for (auto [driver, want] : {std::pair<const wchar_t*, WORD>{L"Tarnished PCL", 233}, {L"Ta", 109}}) {
        SimHost host(CreatePluginObject(), L"Device", driver);
        ASSERT_EQ(host.InitDeviceSheet(), S_OK);
        EXPECT_EQ(host.PageTemplates(), Templates{want}) << driver;
    }
    // A printer whose information cannot be read has no driver name.
    SimHost host(CreatePluginObject(), L"Unreadable", L"Tarn 9000");
    SimPrinterOf(host.Printer())->failGetPrinter = true;
    ASSERT_EQ(host.InitDocumentSheet(), S_OK);
    EXPECT_EQ(host.PageTemplates().back(), 137);
    host.Destroy();
}

TEST_F(SheetTest, ReasonsAnswerAndWrongVersionsFail)
{
    SimHost host(CreatePluginObject(), L"Norvane LaserJet", L"Norvane PCL 6");
    ASSERT_EQ(host.InitDocumentSheet(), S_OK);

    PROPSHEETUI_INFO_HEADER header = {};
    header.cbSize = sizeof(header);
    EXPECT_EQ(host.CallReason(PROPSHEETUI_REASON_GET_INFO_HEADER, reinterpret_cast<LPARAM>(&header)), S_OK);
    ASSERT_NE(header.pTitle, nullptr);
    EXPECT_STREQ(reinterpret_cast<const wchar_t*>(header.pTitle), L"Norvane Plug-in Page");
    EXPECT_EQ(host.Result(), 1u);

    SETRESULT_INFO sr = {};
    sr.cbSize = sizeof(sr);
    sr.Result = 42;
    host.calls.clear();
    EXPECT_EQ(host.CallReason(PROPSHEETUI_REASON_SET_RESULT, reinterpret_cast<LPARAM>(&sr)), S_OK);
    EXPECT_EQ(host.Result(), 42u);
    ASSERT_EQ(host.calls.size(), 1u);
    EXPECT_EQ(host.calls[0].function, WPARAM(CPSFUNC_SET_RESULT));
    EXPECT_EQ(host.calls[0].lParam2, LPARAM(CPSUI_OK));
    host.calls.clear();
    EXPECT_EQ(host.CallReason(PROPSHEETUI_REASON_SET_RESULT, reinterpret_cast<LPARAM>(&sr), true), S_OK);
    EXPECT_EQ(host.Result(), 42u);
    EXPECT_TRUE(host.calls.empty());

    EXPECT_EQ(host.CallReason(PROPSHEETUI_REASON_GET_ICON, 0), S_OK);
    EXPECT_EQ(host.Result(), 0u);
    sr.Result = 7;
    host.CallReason(PROPSHEETUI_REASON_SET_RESULT, reinterpret_cast<LPARAM>(&sr));
    EXPECT_EQ(host.CallReason(99, 0), S_OK);
    EXPECT_EQ(host.Result(), 7u);  // untouched

    for (WORD reason = 0; reason <= 4; ++reason) {
        for (bool device : {false, true}) {
            SetLastError(0);
            EXPECT_EQ(host.CallReason(reason, 0, device, 0x0101), E_FAIL);
            EXPECT_EQ(GetLastError(), 87u);
        }
    }
    SetLastError(0);
    EXPECT_EQ(host.Plugin()->DocumentPropertySheets(nullptr, 0), E_FAIL);
    EXPECT_EQ(GetLastError(), 87u);
    host.Destroy();
}

TEST_F(SheetTest, DestroyReportsApplyAndLeavesNoLinks)
{
    {
        SimHost host(CreatePluginObject(), L"Norvane LaserJet", L"Norvane PCL 6");
        ASSERT_EQ(host.InitDocumentSheet(), S_OK);
        host.calls.clear();
        EXPECT_EQ(host.Destroy(), S_OK);
        EXPECT_EQ(host.Result(), 1u);
        EXPECT_TRUE(host.calls.empty());
        EXPECT_EQ(host.oem.pPageContext, 0u);
        EXPECT_EQ(host.oem.pOptItems, 0u);
        EXPECT_EQ(host.oem.cDrvOptItems, 0u);
    }
    {
        SimHost host(CreatePluginObject(), L"Norvane LaserJet", L"Norvane PCL 6");
        ASSERT_EQ(host.InitDocumentSheet(), S_OK);
        ASSERT_NE(host.ShowSheet(), nullptr);
        EXPECT_TRUE(host.Apply());
        host.calls.clear();
        EXPECT_EQ(host.Destroy(), S_OK);
        ASSERT_EQ(host.calls.size(), 1u);
        EXPECT_EQ(host.calls[0].function, WPARAM(CPSFUNC_SET_RESULT));
        EXPECT_EQ(host.calls[0].lParam2, LPARAM(CPSUI_OK));
        EXPECT_EQ(host.Result(), 1u);
        EXPECT_EQ(host.oem.pPageContext, 0u);
    }
}

TEST_F(SheetTest, NothingIsBuiltWithoutMemoryAndRefusedPagesAreReported)
{
    SimHost host(CreatePluginObject(), L"Norvane LaserJet", L"Norvane PCL 6");
    host.failHeap = true;
    EXPECT_EQ(host.InitDocumentSheet(), S_OK);
    EXPECT_TRUE(host.pages.empty());
    EXPECT_EQ(host.Result(), 0u);
    EXPECT_EQ(host.oem.pPageContext, 0u);
    EXPECT_EQ(host.InitDeviceSheet(), S_OK);
    EXPECT_TRUE(host.pages.empty());
    EXPECT_EQ(host.Result(), 0u);

    SimHost refusing(CreatePluginObject(), L"Norvane LaserJet", L"Norvane PCL 6");
    refusing.refuseAddsFrom = 2;  // the about page is refused
    EXPECT_EQ(refusing.InitDocumentSheet(), S_OK);
    EXPECT_EQ(refusing.PageTemplates(), (Templates{104, 221}));
    EXPECT_EQ(refusing.Result(), 0u);
    refusing.Destroy();
}

TEST_F(SheetTest, PagesShowInARealSheetInTheirOrder)
{
    SimHost host(CreatePluginObject(), L"Norvane LaserJet", L"Norvane PCL 6");
    host.driverUI.features = {{"PrintAndHold", "1"}, {"HasPrintQuality", "1"}};
    ASSERT_EQ(host.InitDocumentSheet(), S_OK);
    HWND sheet = host.ShowSheet();
    ASSERT_NE(sheet, nullptr);
    HWND tab = PropSheet_GetTabControl(sheet);
    ASSERT_EQ(TabCtrl_GetItemCount(tab), 5);
    const wchar_t* captions[] = {nullptr, L"Водяной знак"};
    WCHAR text[64];
    TCITEMW item = {};
    item.mask = TCIF_TEXT;
    item.pszText = text;
    item.cchTextMax = 64;
    TabCtrl_GetItem(tab, 1, &item);
    EXPECT_STREQ(text, captions[1]);
    // The watermark page leaves its context with the sheet window.
    ASSERT_TRUE(host.SelectPage(104));
    EXPECT_EQ(GetWindowLongPtrW(sheet, GWLP_USERDATA), reinterpret_cast<LONG_PTR>(host.Param()->pOEMUserData));
    host.Destroy();
}
