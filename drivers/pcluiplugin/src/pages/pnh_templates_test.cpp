// The print-and-hold page's template created as a real window: every control
// with its id, class, style and text, the labels and the frame the dialog
// manager and the user rely on, and a layout in which no text is cut and no
// two controls collide.
#include "resources/resource.h"
#include "templatecheck.h"

#include <windows.h>
#include <commctrl.h>

#include <gtest/gtest.h>
#include <string>
#include <vector>

using namespace templatecheck;

namespace {

const Bits kSingleList = On(LBS_NOTIFY | WS_VSCROLL | WS_BORDER | WS_TABSTOP) |
                         Off(LBS_SORT | LBS_MULTIPLESEL | LBS_EXTENDEDSEL | LBS_NOSEL);
const Bits kField = On(ES_AUTOHSCROLL | WS_BORDER | WS_TABSTOP) | Off(ES_MULTILINE | ES_READONLY);
const Bits kText = kField | Off(ES_PASSWORD | ES_NUMBER);
const Bits kSecret = kField | On(ES_PASSWORD | ES_NUMBER);

const WCHAR kUserLabel[] = L"Имя поль&зователя:";
const WCHAR kPinLabel[] = L"&PIN: (####, 0-9)";

const std::vector<Control>& Controls()
{
    static const std::vector<Control> controls = {
        {1052, kButton, kGroupBox, L"Выв&од на:"},
        {1084, kListBox, kSingleList, nullptr},
        {1087, kStatic, kLabel, kUserLabel},
        {1085, kEditClass, kText, nullptr},
        {1088, kStatic, kLabel, kPinLabel},
        {1086, kEditClass, kSecret, nullptr},
        {1211, kButton, kCheck, L"&Сохранять предыдущие дублирующиеся задания"},
    };
    return controls;
}

// Strings the page puts into the list, in list order.
const UINT kListStrings[] = {64, 60, 61, 62, 63};

}  // namespace

TEST(PrintAndHoldTemplate, EveryControlHasItsIdClassStyleAndText)
{
    Dialog page(IDD_138);
    ASSERT_NE(page.get(), nullptr);
    ExpectControls(page.get(), IDD_138, Controls(), Order::Listed);
    // The PIN is typed blind; the user name is not.
    EXPECT_NE(SendDlgItemMessageW(page.get(), 1086, EM_GETPASSWORDCHAR, 0, 0), 0);
    EXPECT_EQ(SendDlgItemMessageW(page.get(), 1085, EM_GETPASSWORDCHAR, 0, 0), 0);
    ExpectDefaultButton(page.get(), 0);
}

TEST(PrintAndHoldTemplate, LabelsComeRightBeforeTheirFieldsAndTheFrameHoldsTheList)
{
    Dialog page(IDD_138);
    ASSERT_NE(page.get(), nullptr);
    for (const Labelled& l : {Labelled{1085, kUserLabel}, Labelled{1086, kPinLabel}})
        ExpectLabelLeads(page.get(), l);
    ASSERT_NO_FATAL_FAILURE(ExpectFrame(page.get(), {{1052}, {1084}}));
    // The group's accelerator reaches the list, the next tab stop after it.
    EXPECT_EQ(GetNextDlgTabItem(page.get(), GetDlgItem(page.get(), 1052), FALSE), GetDlgItem(page.get(), 1084));
}

TEST(PrintAndHoldTemplate, TextsFitTheirControlsAndTheListShowsEveryOutputType)
{
    Dialog page(IDD_138);
    ASSERT_NE(page.get(), nullptr);
    FontDC dc(page.get());
    ASSERT_NE(dc.get(), nullptr);
    EXPECT_EQ(ExpectTextsFit(page.get(), dc.get(), Lines::One), 4);

    // All five entries are seen at once, each whole.
    HWND list = GetDlgItem(page.get(), 1084);
    ASSERT_NE(list, nullptr);
    for (UINT id : kListStrings) {
        const std::wstring text = LoadText(id);
        ASSERT_FALSE(text.empty()) << id;
        SendMessageW(list, LB_ADDSTRING, 0, reinterpret_cast<LPARAM>(text.c_str()));
    }
    RECT client = {};
    GetClientRect(list, &client);
    const LRESULT itemHeight = SendMessageW(list, LB_GETITEMHEIGHT, 0, 0);
    EXPECT_LE(itemHeight * 5, client.bottom);
    EXPECT_EQ(StyleOf(list) & WS_VSCROLL, 0u) << "nothing to scroll";
    for (UINT id : kListStrings) {
        SIZE s = Measure(dc.get(), LoadText(id));
        EXPECT_LE(s.cx + 4, client.right) << id;
    }
    // A full list scrolls.
    for (int i = 0; i < 20; ++i)
        SendMessageW(list, LB_ADDSTRING, 0, reinterpret_cast<LPARAM>(L"Печать с резервированием"));
    EXPECT_NE(StyleOf(list) & WS_VSCROLL, 0u);
}

TEST(PrintAndHoldTemplate, ControlsStayInsideThePageAndDoNotOverlap)
{
    Dialog page(IDD_138);
    ASSERT_NE(page.get(), nullptr);
    ExpectInsideAndApart(page.get());
}
