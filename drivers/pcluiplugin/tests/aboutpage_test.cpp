// The about page shown by the sheet as the driver builds it: the driver and
// version lines, the list of the driver's files with the versions read from
// real libraries next to this program, the maker's notice per template, and
// the sheet's context-help button while the page is shown.
#include "frame/pagecontext.h"
#include "plugin_dll.h"
#include "simhost.h"
#include "simspooler.h"
#include "uidriver.h"

#include <commctrl.h>
#include <gtest/gtest.h>
#include <string>
#include <utility>
#include <vector>

namespace {

constexpr int kDriverLine = 1165;
constexpr int kVersionLine = 1080;
constexpr int kFileList = 1081;
constexpr int kNotice = 1164;

using Rows = std::vector<std::pair<std::wstring, std::wstring>>;

// The directory of this program, where the build puts the fixture libraries.
std::wstring BinDir()
{
    WCHAR path[MAX_PATH] = {};
    DWORD n = GetModuleFileNameW(nullptr, path, MAX_PATH);
    std::wstring dir(path, n);
    return dir.substr(0, dir.rfind(L'\\') + 1);
}

std::wstring CellText(HWND list, int row, int column)
{
    WCHAR buf[260] = {};
    LVITEMW item = {};
    item.iSubItem = column;
    item.pszText = buf;
    item.cchTextMax = 260;
    SendMessageW(list, LVM_GETITEMTEXTW, row, reinterpret_cast<LPARAM>(&item));
    return buf;
}

Rows RowsOf(HWND page)
{
    HWND list = GetDlgItem(page, kFileList);
    Rows rows;
    const int n = ListView_GetItemCount(list);
    for (int i = 0; i < n; ++i)
        rows.push_back({CellText(list, i, 0), CellText(list, i, 1)});
    return rows;
}

std::wstring ColumnHeading(HWND list, int column)
{
    WCHAR buf[64] = {};
    LVCOLUMNW col = {};
    col.mask = LVCF_TEXT;
    col.pszText = buf;
    col.cchTextMax = 64;
    if (!SendMessageW(list, LVM_GETCOLUMNW, column, reinterpret_cast<LPARAM>(&col)))
        return L"<none>";
    return buf;
}

bool HasContextHelp(HWND sheet) { return (GetWindowLongW(sheet, GWL_EXSTYLE) & WS_EX_CONTEXTHELP) != 0; }

bool IsShown(HWND page, int id) { return (GetWindowLongW(GetDlgItem(page, id), GWL_STYLE) & WS_VISIBLE) != 0; }

struct AboutPageTest : ::testing::Test {
    void SetUp() override
    {
        SimResetSpooler();
        ClearPluginRegistry();
    }
    void TearDown() override { SimResetSpooler(); }

    // The about page of a freshly shown sheet for a driver with these files.
    HWND ShowAbout(SimHost& host, const std::vector<std::wstring>& files, bool device = false)
    {
        SimPrinterOf(host.Printer())->dependentFiles = files;
        if ((device ? host.InitDeviceSheet() : host.InitDocumentSheet()) != S_OK || host.pages.empty())
            return nullptr;
        return ShowPage(host);
    }
    HWND ShowPage(SimHost& host)
    {
        const WORD about = host.PageTemplates().back();
        if (!host.ShowSheet() || !host.SelectPage(about))
            return nullptr;
        PumpMessages();
        return host.PageWindow(about);
    }
};

}  // namespace

TEST_F(AboutPageTest, ListsTheDriverFilesWithTheirVersionsInNameOrder)
{
    const std::wstring bin = BinDir();
    for (const wchar_t* f : {L"verfixture_ru.dll", L"verfixture_plain.dll", L"verfixture_notrans.dll",
                                  L"verfixture_nofilever.dll", L"verfixture_emptyver.dll", L"NVPCLUI.dll"})
        ASSERT_NE(GetFileAttributesW((bin + f).c_str()), INVALID_FILE_ATTRIBUTES) << "fixture missing";

    SimHost host(CreatePluginObject(), L"Norvane LaserJet", L"Norvane PCL 6");
    HWND page = ShowAbout(host, {bin + L"verfixture_ru.dll", bin + L"verfixture_plain.dll",
                                 bin + L"verfixture_notrans.dll", bin + L"NVPCLUI.dll",
                                 bin + L"verfixture_nofilever.dll", L"PCLDATA.GPD",
                                 bin + L"verfixture_emptyver.dll"});
    ASSERT_NE(page, nullptr);
    EXPECT_EQ(ItemText(page, kDriverLine), L"Драйвер Norvane PCL 6");
    EXPECT_EQ(ItemText(page, kVersionLine), L"Версия 1.0");

    // Only files with a first translation and its FileVersion string, or with
    // no version information at all, get a row; a name without a directory
    // is shown whole.
    EXPECT_EQ(RowsOf(page), (Rows{{L"NVPCLUI.dll", L"1.0.0.0"},
                                  {L"PCLDATA.GPD", L"Не применимо"},
                                  {L"verfixture_plain.dll", L"Не применимо"},
                                  {L"verfixture_ru.dll", L"7.3.0.12 (сборка 41)"}}));

    HWND list = GetDlgItem(page, kFileList);
    EXPECT_EQ(ColumnHeading(list, 0), L"Файл");
    EXPECT_EQ(ColumnHeading(list, 1), L"Версия");
    RECT r = {};
    ASSERT_TRUE(GetWindowRect(list, &r));
    const int room = (r.right - r.left) - 21;
    EXPECT_EQ(ListView_GetColumnWidth(list, 0), room / 3 + 20);
    EXPECT_EQ(ListView_GetColumnWidth(list, 0) + ListView_GetColumnWidth(list, 1), room);
    EXPECT_TRUE(IsShown(page, kNotice));
    EXPECT_FALSE(IsShown(page, IDOK));
    host.Destroy();
}

TEST_F(AboutPageTest, EachSheetAndBrandGetsItsTemplateWithTheSameLines)
{
    const std::wstring ru = BinDir() + L"verfixture_ru.dll";
    struct Case {
        const wchar_t* driver;
        bool device;
        WORD templateId;
        bool noticeShown;
    };
    for (const Case& c : {Case{L"Norvane PCL 6", false, 137, true}, Case{L"Tarn LaserJet 5", false, 234, false},
                          Case{L"Norvane PCL 6", true, 109, true}, Case{L"TARN LaserJet 5", true, 233, false}}) {
        SCOPED_TRACE(c.templateId);
        SimHost host(CreatePluginObject(), L"Printer", c.driver);
        HWND page = ShowAbout(host, {ru}, c.device);
        ASSERT_NE(page, nullptr);
        EXPECT_EQ(host.PageTemplates().back(), c.templateId);
        EXPECT_EQ(ItemText(page, kDriverLine), std::wstring(L"Драйвер ") + c.driver);
        EXPECT_EQ(ItemText(page, kVersionLine), L"Версия 1.0");
        EXPECT_EQ(RowsOf(page), (Rows{{L"verfixture_ru.dll", L"7.3.0.12 (сборка 41)"}}));
        EXPECT_EQ(IsShown(page, kNotice), c.noticeShown);
        if (!c.device)
            host.Destroy();
    }
}

TEST_F(AboutPageTest, MissingDriverInformationLeavesTextsAndRowsOut)
{
    {
        // A printer whose information cannot be read shows an empty driver
        // name; the file list comes from the driver information.
        SimHost host(CreatePluginObject(), L"Unreadable", L"Norvane PCL 6");
        SimPrinterOf(host.Printer())->failGetPrinter = true;
        HWND page = ShowAbout(host, {BinDir() + L"verfixture_plain.dll"});
        ASSERT_NE(page, nullptr);
        EXPECT_EQ(ItemText(page, kDriverLine), L"Драйвер ");
        EXPECT_EQ(ItemText(page, kVersionLine), L"Версия 1.0");
        EXPECT_EQ(RowsOf(page), (Rows{{L"verfixture_plain.dll", L"Не применимо"}}));
        host.Destroy();
    }
    {
        // A driver without dependent files: the columns and no rows.
        SimHost host(CreatePluginObject(), L"Bare", L"Norvane PCL 6");
        HWND page = ShowAbout(host, {});
        ASSERT_NE(page, nullptr);
        EXPECT_EQ(ItemText(page, kDriverLine), L"Драйвер Norvane PCL 6");
        EXPECT_TRUE(RowsOf(page).empty());
        EXPECT_EQ(ColumnHeading(GetDlgItem(page, kFileList), 1), L"Версия");
        host.Destroy();
    }
    {
        // A sheet without a printer keeps the template's texts and an empty list.
        SimHost host(CreatePluginObject(), L"Nameless", L"Norvane PCL 6");
        SimPrinterOf(host.Printer())->dependentFiles = {BinDir() + L"verfixture_ru.dll"};
        ASSERT_EQ(host.InitDocumentSheet(), S_OK);
        reinterpret_cast<PAGECONTEXT*>(host.pages.back().lParam)->hPrinter = nullptr;
        HWND page = ShowPage(host);
        ASSERT_NE(page, nullptr);
        EXPECT_EQ(ItemText(page, kDriverLine), L"Драйвер");
        EXPECT_EQ(ItemText(page, kVersionLine), L"Версия");
        EXPECT_TRUE(RowsOf(page).empty());
        EXPECT_EQ(ColumnHeading(GetDlgItem(page, kFileList), 0), L"<none>");
        host.Destroy();
    }
}

TEST_F(AboutPageTest, HidesTheSheetsContextHelpWhileShown)
{
    // A page of the driver's own stands beside the plug-in's pages; it leaves
    // the caption's button alone, so what the sheet shows is the about page's
    // doing (the plug-in's other pages hide the button as well).
    PROPSHEETPAGEW own = {};
    own.dwSize = sizeof(own);
    own.hInstance = GetModuleHandleW(nullptr);
    own.pszTemplate = MAKEINTRESOURCEW(112);
    own.pfnDlgProc = [](HWND, UINT msg, WPARAM, LPARAM) -> INT_PTR { return msg == WM_INITDIALOG; };
    for (bool device : {false, true}) {
        SCOPED_TRACE(device ? "device sheet" : "document sheet");
        SimHost host(CreatePluginObject(), L"Norvane LaserJet", L"Norvane PCL 6");
        ASSERT_EQ(device ? host.InitDeviceSheet() : host.InitDocumentSheet(), S_OK);
        const WORD about = host.PageTemplates().back();
        host.pages.push_back(own);
        HWND sheet = host.ShowSheet();
        ASSERT_NE(sheet, nullptr);
        ASSERT_TRUE(host.SelectPage(about));
        EXPECT_FALSE(HasContextHelp(sheet));
        ASSERT_TRUE(host.SelectPage(112));
        EXPECT_TRUE(HasContextHelp(sheet));
        ASSERT_TRUE(host.SelectPage(about));
        EXPECT_FALSE(HasContextHelp(sheet));
        host.CloseSheet();
        if (!device)
            host.Destroy();
    }
}

TEST_F(AboutPageTest, UsersWithoutPermissionSeeTheListWithEveryControlDisabled)
{
    SimHost host(CreatePluginObject(), L"Norvane LaserJet", L"Norvane PCL 6");
    host.paramFlags = 0x20;
    HWND page = ShowAbout(host, {BinDir() + L"verfixture_ru.dll"});
    ASSERT_NE(page, nullptr);
    EXPECT_EQ(RowsOf(page), (Rows{{L"verfixture_ru.dll", L"7.3.0.12 (сборка 41)"}}));
    for (int id : {kDriverLine, kVersionLine, kFileList, kNotice, IDOK})
        EXPECT_FALSE(IsEnabled(page, id)) << id;
    host.Destroy();
}
