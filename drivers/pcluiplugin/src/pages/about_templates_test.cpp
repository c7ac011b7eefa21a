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

