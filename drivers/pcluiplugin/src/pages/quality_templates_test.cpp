// The templates of the manual colour page and the print-quality page and
// dialog, created as real windows: every control with its id, class, style
// and text, the labels and the frame the dialog manager and the user rely on,
// scale labels standing over the ticks they name, and a layout in which no
// text is cut and no two controls collide.
#include "resources/resource.h"
#include "templatecheck.h"

#include <windows.h>
#include <commctrl.h>

#include <gtest/gtest.h>
#include <cstdlib>
#include <string>
#include <vector>

using namespace templatecheck;

namespace {

const Bits kScale = Kind(SS_TYPEMASK, SS_CENTER) | Off(WS_TABSTOP);
// Unsorted: the entries keep their display order.
const Bits kDropList = Kind(0x3, CBS_DROPDOWNLIST) | On(WS_VSCROLL | WS_TABSTOP) |
                       Off(CBS_SORT | CBS_OWNERDRAWFIXED | CBS_OWNERDRAWVARIABLE);
const Bits kTrackbar = On(TBS_AUTOTICKS | WS_TABSTOP) | Off(TBS_VERT | TBS_NOTICKS | TBS_NOTHUMB);

// A scale label and the trackbar position it names.
struct ScaleMark {
    int label, trackbar, value;
};

struct Range {
    int trackbar, lo, hi;
};

struct Template {
    UINT id;
    std::vector<Control> controls;
    std::vector<Labelled> labels;
    std::vector<Range> ranges;
    std::vector<ScaleMark> marks;
    int defaultButton;  // 0: a property page, which has none of its own
};

const WCHAR kMethodLabel[] = L"&Способ цветокоррекции";

const std::vector<Template>& Templates()
{
    static const std::vector<Template> templates = {
        {IDD_107,
         {
             {kUnnumbered, kStatic, kLabel, kMethodLabel},
             {1172, kComboBox, kDropList, nullptr},
             {1046, kButton, kGroupBox, L""},
             {1177, kStatic, kLabel, L"&Изображения RGB"},
             {1178, kComboBox, kDropList, nullptr},
             {1176, kStatic, kLabel, L"&Текст RGB"},
             {1181, kComboBox, kDropList, nullptr},
             {1175, kStatic, kLabel, L"&Графика RGB"},
             {1180, kComboBox, kDropList, nullptr},
             {1179, kStatic, kLabel, L"Ink&Thrift (TM)"},
             {1182, kComboBox, kDropList, nullptr},
             {1253, kButton, kPush, L"Настроить &качество печати"},
         },
         {{1172, kMethodLabel},
          {1178, L"&Изображения RGB"},
          {1181, L"&Текст RGB"},
          {1180, L"&Графика RGB"},
          {1182, L"Ink&Thrift (TM)"}},
         {},
         {},
         0},
        {IDD_229,
         {
             {1239, kButton, kCheck, L"Включить коррекцию &серого"},
             {1235, kStatic, kLabel, L"&Яркость"},
             {1252, kTrackbarClass, kTrackbar, nullptr},
             {1232, kStatic, kScale, L"-6"},
             {1233, kStatic, kScale, L"0"},
             {1234, kStatic, kScale, L"6"},
             {1236, kStatic, kLabel, L"&Контрастность"},
             {1251, kTrackbarClass, kTrackbar, nullptr},
             {1237, kStatic, kScale, L"0"},
             {1238, kStatic, kScale, L"5"},
             {1241, kButton, kCheck, L"Улучшить &тонкие линии"},
         },
         {{1252, L"&Яркость"}, {1251, L"&Контрастность"}},
         {{1252, -6, 6}, {1251, 0, 5}},
         {{1232, 1252, -6}, {1233, 1252, 0}, {1234, 1252, 6}, {1237, 1251, 0}, {1238, 1251, 5}},
         0},
        {IDD_231,
         {
             {1242, kStatic, kLabel, L"&Яркость изображения RGB"},
             {1250, kTrackbarClass, kTrackbar, nullptr},
             {1244, kStatic, kScale, L"-6"},
             {1245, kStatic, kScale, L"0"},
             {1246, kStatic, kScale, L"6"},
             {1243, kStatic, kLabel, L"&Контрастность RGB"},
             {1249, kTrackbarClass, kTrackbar, nullptr},
             {1247, kStatic, kScale, L"0"},
             {1248, kStatic, kScale, L"5"},
             {1252, kStatic, kLabel, L"&Насыщенность изображения RGB"},
             {1253, kTrackbarClass, kTrackbar, nullptr},
             {1254, kStatic, kScale, L"0"},
             {1255, kStatic, kScale, L"5"},
             {1241, kButton, kCheck, L"Улучшить &тонкие линии"},
             {IDOK, kButton, kDefault, L"ОК"},
             {IDCANCEL, kButton, kPush, L"Отмена"},
         },
         {{1250, L"&Яркость изображения RGB"},
          {1249, L"&Контрастность RGB"},
          {1253, L"&Насыщенность изображения RGB"}},
         {{1250, -6, 6}, {1249, 0, 5}, {1253, 0, 5}},
         {{1244, 1250, -6},
          {1245, 1250, 0},
          {1246, 1250, 6},
          {1247, 1249, 0},
          {1248, 1249, 5},
          {1254, 1253, 0},
          {1255, 1253, 5}},
         IDOK},
    };
    return templates;
}

// Entries of the page's lists (string ids), in display order.
const std::vector<std::pair<int, std::vector<UINT>>>& ListEntries()
{
    static const std::vector<std::pair<int, std::vector<UINT>>> lists = {
        {1172, {104, 144, 138, 108}},
        {1178, {104, 139, 140, 141, 219, 144}},
        {1181, {104, 139, 140, 141, 219, 144}},
        {1180, {104, 139, 140, 141, 219, 144}},
        {1182, {104, 105, 144}},
    };
    return lists;
}

}  // namespace

TEST(QualityTemplates, EveryControlHasItsIdClassStyleAndText)
{
    ForEachTemplate(Templates(), [](const Template& t, HWND dlg) {
        ExpectControls(dlg, t.id, t.controls, Order::Listed);
    });
}

TEST(QualityTemplates, OnlyTheModalDialogHasADefaultButton)
{
    ForEachTemplate(Templates(), [](const Template& t, HWND dlg) {
        ExpectDefaultButton(dlg, t.defaultButton);
    });
}

TEST(QualityTemplates, TheFrameHoldsTheRgbListsAndTheirLabels)
{
    Dialog dlg(IDD_107);
    ASSERT_NE(dlg.get(), nullptr);
    // A dropped list reaches past the frame; its closed field stays inside.
    ASSERT_NO_FATAL_FAILURE(ExpectFrame(dlg.get(), {{1046}, {1177, 1178, 1176, 1181, 1175, 1180}}));
    const RECT rf = RectOf(dlg.get(), GetDlgItem(dlg.get(), 1046));
    for (int id : {1172, 1179, 1182, 1253}) {
        RECT common = {}, r = RectOf(dlg.get(), GetDlgItem(dlg.get(), id));
        EXPECT_FALSE(IntersectRect(&common, &rf, &r)) << id << " outside the frame";
    }
}

TEST(QualityTemplates, TextsAndListEntriesFitTheirControls)
{
    ForEachTemplate(Templates(), [](const Template&, HWND dlg) {
        FontDC dc(dlg);
        ASSERT_NE(dc.get(), nullptr);
        EXPECT_GT(ExpectTextsFit(dlg, dc.get(), Lines::One), 0);
    });
    // Every entry of the page's lists shows whole in the closed list and the
    // opened list shows them all without scrolling.
    Dialog dlg(IDD_107);
    ASSERT_NE(dlg.get(), nullptr);
    FontDC dc(dlg.get());
    ASSERT_NE(dc.get(), nullptr);
    for (const auto& [id, strings] : ListEntries()) {
        HWND combo = GetDlgItem(dlg.get(), id);
        ASSERT_NE(combo, nullptr) << id;
        COMBOBOXINFO ci = {sizeof(ci)};
        ASSERT_TRUE(GetComboBoxInfo(combo, &ci)) << id;
        for (UINT s : strings) {
            const std::wstring entry = LoadText(s);
            ASSERT_FALSE(entry.empty()) << s;
            EXPECT_LE(Measure(dc.get(), entry).cx, ci.rcItem.right - ci.rcItem.left) << id << ", string " << s;
            SendMessageW(combo, CB_ADDSTRING, 0, reinterpret_cast<LPARAM>(entry.c_str()));
        }
        RECT dropped = {};
        SendMessageW(combo, CB_GETDROPPEDCONTROLRECT, 0, reinterpret_cast<LPARAM>(&dropped));
        const RECT closed = RectOf(dlg.get(), combo);
        const LRESULT itemHeight = SendMessageW(combo, CB_GETITEMHEIGHT, 0, 0);
        EXPECT_GE(dropped.bottom - dropped.top - (closed.bottom - closed.top),
                  static_cast<LONG>(itemHeight * strings.size()))
            << id;
    }
}

TEST(QualityTemplates, ControlsStayInsideTheDialogAndDoNotOverlap)
{
    ForEachTemplate(Templates(), [](const Template&, HWND dlg) {
        ExpectInsideAndApart(dlg);
    });
}
