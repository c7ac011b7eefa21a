// The about templates created as real windows: the same controls in all of
// them with their ids, classes, styles and texts, the maker's notice hidden
// only in the partner-brand variants, a layout in which no text is cut and no
// two visible controls collide; and the file-version list filled into a real
// list view from the simulated spooler.
#include "pages/aboutpage.h"
#include "resources/resource.h"
#include "simspooler.h"
#include "templatecheck.h"

#include <windows.h>
#include <commctrl.h>

#include <gtest/gtest.h>
#include <string>
#include <vector>

using namespace templatecheck;

namespace {

const Bits kLine = Kind(SS_TYPEMASK, SS_LEFT) | On(SS_NOPREFIX);
const Bits kNotice = Kind(SS_TYPEMASK, SS_LEFT);
const Bits kFileList = Kind(LVS_TYPEMASK, LVS_REPORT) | On(LVS_SORTASCENDING | WS_BORDER | WS_TABSTOP) |
                       Off(LVS_SORTDESCENDING | LVS_NOCOLUMNHEADER);
const Bits kHiddenOk = Kind(BS_TYPEMASK, BS_PUSHBUTTON) | kHidden;

const WCHAR kNoticeText[] =
    L"© Norvane. Все права защищены. Использование программы регулируется лицензионным соглашением.";

struct Template {
    UINT id;
    bool noticeShown;
};

const Template kTemplates[] = {{IDD_108, true}, {IDD_109, true}, {IDD_137, true}, {IDD_233, false}, {IDD_234, false}};

std::vector<Control> ControlsOf(const Template& t)
{
    return {
        {IDC_ABOUT_DRIVER, kStatic, kLine, L"Драйвер"},
        {IDC_ABOUT_VERSION, kStatic, kLine, L"Версия"},
        {IDC_ABOUT_FILES, kListView, kFileList, nullptr},
        {IDC_ABOUT_NOTICE, kStatic, t.noticeShown ? kNotice : kNotice | kHidden, kNoticeText},
        {IDOK, kButton, kHiddenOk, L"ОК"},
    };
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

std::wstring ExeFileName()
{
    WCHAR path[MAX_PATH] = {};
    GetModuleFileNameW(nullptr, path, MAX_PATH);
    return path;
}

}  // namespace

TEST(AboutTemplates, EveryControlHasItsIdClassStyleAndText)
{
    ForEachTemplate(kTemplates, [](const Template& t, HWND dlg) {
        ExpectControls(dlg, t.id, ControlsOf(t), Order::Any);
    });
}

TEST(AboutTemplates, PagesLeaveTheDefaultButtonToTheSheet)
{
    ForEachTemplate(kTemplates, [](const Template&, HWND dlg) {
        ExpectDefaultButton(dlg, 0);
    });
}

TEST(AboutTemplates, TextsFitAndVisibleControlsDoNotOverlap)
{
    ForEachTemplate(kTemplates, [](const Template&, HWND dlg) {
        {
            FontDC dc(dlg);
            ASSERT_NE(dc.get(), nullptr);
            EXPECT_GT(ExpectTextsFit(dlg, dc.get()), 0);
            // The lines as the page writes them, with a driver name of ordinary length.
            ExpectTextFits(GetDlgItem(dlg, IDC_ABOUT_DRIVER), dc.get(), L"Драйвер Norvane LaserJet PCL 6 Universal");
            ExpectTextFits(GetDlgItem(dlg, IDC_ABOUT_VERSION), dc.get(), L"Версия 1.0");
        }
        ExpectInsideAndApart(dlg);
    });
}

// A bare list view of a given width stands in for the page, so that the
// column widths can be checked for a known width.
struct AboutFileList : ::testing::Test {
    void SetUp() override
    {
        SimResetSpooler();
        INITCOMMONCONTROLSEX icc = {sizeof icc, ICC_LISTVIEW_CLASSES};
        InitCommonControlsEx(&icc);
        page = CreateWindowExW(0, L"Static", L"", WS_OVERLAPPEDWINDOW, 0, 0, 600, 400, nullptr, nullptr, nullptr,
                               nullptr);
        ASSERT_NE(page, nullptr);
    }
    void TearDown() override
    {
        if (page)
            DestroyWindow(page);
        SimResetSpooler();
    }
    HWND AddList(int width)
    {
        return CreateWindowExW(0, WC_LISTVIEWW, L"", WS_CHILD | LVS_REPORT | LVS_SORTASCENDING, 0, 0, width, 200,
                               page, reinterpret_cast<HMENU>(static_cast<INT_PTR>(IDC_ABOUT_FILES)), nullptr,
                               nullptr);
    }
    HANDLE AddPrinter(const std::vector<std::wstring>& files)
    {
        SimPrinter p;
        p.name = L"Norvane LaserJet";
        p.driver = L"Norvane PCL 6";
        p.dependentFiles = files;
        return SimAddPrinter(p);
    }
    HWND page = nullptr;
};

TEST_F(AboutFileList, ColumnsShareTheListWidthAndRowsFollowTheFiles)
{
    HWND list = AddList(300);
    ASSERT_NE(list, nullptr);
    const std::wstring exe = ExeFileName();
    HANDLE printer = AddPrinter({L"C:\\Windows\\System32\\spool\\drivers\\x64\\3\\missing.hlp", exe});
    FillFileVersionList(page, printer);

    EXPECT_EQ(ListView_GetColumnWidth(list, 0), 113);
    EXPECT_EQ(ListView_GetColumnWidth(list, 1), 166);
    EXPECT_EQ(ColumnHeading(list, 0), L"Файл");
    EXPECT_EQ(ColumnHeading(list, 1), L"Версия");
    ASSERT_EQ(ListView_GetItemCount(list), 2);
    // The program carries the plug-in's own version resource.
    const std::wstring exeName = exe.substr(exe.rfind(L'\\') + 1);
    EXPECT_EQ(CellText(list, 0, 0), L"missing.hlp");
    EXPECT_EQ(CellText(list, 0, 1), L"Не применимо");
    EXPECT_EQ(CellText(list, 1, 0), exeName);
    EXPECT_EQ(CellText(list, 1, 1), L"1.0.0.0");
}

TEST_F(AboutFileList, MissingPiecesLeaveRowsOut)
{
    // Without a dependent-file list only the columns are there.
    HWND list = AddList(400);
    ASSERT_NE(list, nullptr);
    FillFileVersionList(page, AddPrinter({}));
    EXPECT_EQ(ListView_GetItemCount(list), 0);
    EXPECT_EQ(ListView_GetColumnWidth(list, 0) + ListView_GetColumnWidth(list, 1), 400 - 21);
    DestroyWindow(list);

    // A printer the spooler does not know gives no driver information.
    list = AddList(400);
    ASSERT_NE(list, nullptr);
    FillFileVersionList(page, nullptr);
    EXPECT_EQ(ListView_GetItemCount(list), 0);
    DestroyWindow(list);

    // Without the list nothing is touched.
    FillFileVersionList(page, AddPrinter({ExeFileName()}));
    EXPECT_EQ(GetWindow(page, GW_CHILD), nullptr);
}
