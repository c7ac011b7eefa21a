// The templates of the watermark page and its dialogs, created as real
// windows: every control with its id, class, style and text, the groups and
// buddies the dialog manager relies on, and a layout in which no text is cut
// and no two controls collide.
#include "resources/resource.h"
#include "templatecheck.h"

#include <windows.h>
#include <commctrl.h>

#include <gtest/gtest.h>
#include <string>
#include <vector>

using namespace templatecheck;

namespace {

const Bits kCentred = Kind(SS_TYPEMASK, SS_CENTER);
const Bits kWhiteRect = Kind(SS_TYPEMASK, SS_WHITERECT);
const Bits kList = On(LBS_NOTIFY | WS_VSCROLL | WS_BORDER | WS_TABSTOP);
const Bits kSingleList = kList | On(WS_HSCROLL) | Off(LBS_SORT | LBS_MULTIPLESEL | LBS_EXTENDEDSEL);
const Bits kToggleList = kList | On(WS_HSCROLL | LBS_MULTIPLESEL) | Off(LBS_SORT | LBS_EXTENDEDSEL);
const Bits kSortedList = kList | On(LBS_SORT) | Off(LBS_MULTIPLESEL | LBS_EXTENDEDSEL);
const Bits kEdit = On(ES_AUTOHSCROLL | WS_BORDER | WS_TABSTOP) | Off(ES_MULTILINE | ES_READONLY);
const Bits kNumber = kEdit | Kind(ES_CENTER | ES_RIGHT, ES_RIGHT);
const Bits kDropList = Kind(0x3, CBS_DROPDOWNLIST) | On(WS_VSCROLL | WS_TABSTOP);
const Bits kSpin = On(UDS_SETBUDDYINT | UDS_WRAP | UDS_AUTOBUDDY | UDS_ALIGNRIGHT | UDS_ARROWKEYS) | Off(UDS_ALIGNLEFT);
const Bits kOffsetSpin = On(UDS_AUTOBUDDY | UDS_ALIGNRIGHT | UDS_ARROWKEYS) | Off(UDS_SETBUDDYINT | UDS_ALIGNLEFT);

// An up-down control and the field it steps.
struct Spin {
    int spin, buddy;
};

struct Template {
    UINT id;
    std::vector<Control> controls;
    std::vector<Frame> frames;
    std::vector<std::vector<int>> radioGroups;
    std::vector<Spin> spins;
    std::vector<Labelled> labels;
    int defaultButton;  // 0: a property page, which has none of its own
};

const WCHAR kDefined[] = L"Заданные водяные знаки";
const WCHAR kInstructions[] =
    L"Выберите динамическую переменную в списке и нажмите кнопку «Добавить», чтобы вставить её в текст водяного знака.";

const std::vector<Template>& Templates()
{
    static const std::vector<Template> templates = {
        {IDD_104,
         {
             {1046, kButton, kGroupBox, L"Порядок наложения водяных знаков"},
             {1031, kButton, kFirstRadio, L"&Без водяных знаков"},
             {1032, kButton, kRadio, L"Все стр&аницы"},
             {1033, kButton, kRadio, L"Перв&ая/остальные стр."},
             {1034, kButton, kRadio, L"Не&четные/четные стр."},
             {1047, kButton, kGroupBox, L"Варианты выбора водяных знаков"},
             {1035, kStatic, kLabel, L"Первая с&траница"},
             {1037, kListBox, kSingleList, nullptr},
             {1036, kStatic, kLabel, L"&Остальные страницы"},
             {1038, kListBox, kSingleList, nullptr},
             {1039, kButton, kPush, L"&Добавить водяной знак..."},
             {1049, kButton, kPush, L"Р&едактировать водяной знак..."},
             {1040, kButton, kPush, L"Удалить вод&яной знак..."},
             {1048, kButton, kGroupBox, L"Положение водяного знака"},
             {1042, kButton, kFirstRadio, L"Под страни&цей"},
             {1061, kButton, kRadio, L"По&верх страницы"},
         },
         {{{1046}, {1031, 1032, 1033, 1034}},
          {{1047}, {1035, 1037, 1036, 1038, 1039, 1049, 1040}},
          {{1048}, {1042, 1061}}},
         {{1031, 1032, 1033, 1034}, {1042, 1061}},
         {},
         {{1037, L"Первая с&траница"}, {1038, L"&Остальные страницы"}},
         0},
        {IDD_103,
         {
             {kUnnumbered, kStatic, kLabel, L"И&мя водяного знака:"},
             {1043, kEditClass, kEdit, nullptr},
             {kUnnumbered, kStatic, kLabel, L"&Текст водяного знака:"},
             {1004, kEditClass, kEdit, nullptr},
             {1216, kButton, kCheck, L"Текст содержит &динамические водяные знаки"},
             {1003, kButton, kPush | On(WS_DISABLED), L"Наст&роить динамические водяные знаки..."},
             {kUnnumbered, kStatic, kLabel, L"&Шрифт:"},
             {1006, kComboBox, kDropList | On(CBS_SORT) | Off(CBS_OWNERDRAWFIXED | CBS_OWNERDRAWVARIABLE), nullptr},
             {kUnnumbered, kStatic, kLabel, L"Ра&змер шрифта:"},
             {1022, kComboBox, Kind(0x3, CBS_DROPDOWN) | On(WS_VSCROLL | WS_TABSTOP) | Off(CBS_SORT), nullptr},
             {kUnnumbered, kStatic, kLabel, L"&Цвет:"},
             {1009, kComboBox,
              kDropList | On(CBS_OWNERDRAWFIXED | CBS_HASSTRINGS) | Off(CBS_SORT | CBS_OWNERDRAWVARIABLE), nullptr},
             {1050, kButton, kGroupBox, L"Начертание"},
             {1014, kButton, kCheck, L"Зачеркнут&ый"},
             {1013, kButton, kCheck, L"Курс&ив"},
             {1015, kButton, kCheck, L"Подчеркн&утый"},
             {1012, kButton, kCheck, L"Полу&жирный"},
             {1016, kButton, kCheck, L"К&онтур"},
             {kUnnumbered, kStatic, kLabel, L"Инт&енсивность:"},
             {1023, kEditClass, kNumber, nullptr},
             {1025, kUpDown, kSpin, nullptr},
             {1117, kStatic, kLabel, L"У&гол:"},
             {1098, kEditClass, kNumber, nullptr},
             {1099, kUpDown, kSpin, nullptr},
             {1217, kButton, kPush, L"&Разместить водяной знак..."},
             {1019, kStatic, kWhiteRect, nullptr},
             {IDOK, kButton, kDefault, L"ОК"},
             {IDCANCEL, kButton, kPush, L"Отмена"},
         },
         {{{1050}, {1014, 1013, 1015, 1012, 1016}}},
         {},
         {{1025, 1023}, {1099, 1098}},
         {{1043, L"И&мя водяного знака:"},
          {1004, L"&Текст водяного знака:"},
          {1006, L"&Шрифт:"},
          {1022, L"Ра&змер шрифта:"},
          {1009, L"&Цвет:"},
          {1023, L"Инт&енсивность:"},
          {1098, L"У&гол:"}},
         IDOK},
        {IDD_220,
         {
             {kUnnumbered, kButton, kGroupBox, L"Положение по вертикали"},
             {1220, kButton, kFirstRadio, L"Св&ерху"},
             {1221, kButton, kRadio, L"По &центру"},
             {1222, kButton, kRadio, L"Вн&изу"},
             {1223, kStatic, kLabel, L"&Cдвиг:"},  // Latin C
             {1224, kEditClass, kNumber, nullptr},
             {1225, kUpDown, kOffsetSpin, nullptr},
             {kUnnumbered, kButton, kGroupBox, L"Положение по горизонтали"},
             {1227, kButton, kFirstRadio, L"&Слева"},
             {1228, kButton, kRadio, L"По це&нтру"},
             {1229, kButton, kRadio, L"Сп&рава"},
             {1230, kStatic, kLabel, L"С&двиг:"},  // Cyrillic С
             {1231, kEditClass, kNumber, nullptr},
             {1232, kUpDown, kOffsetSpin, nullptr},
             {1233, kButton, kGroupBox, L"Единицы измерения"},
             {1234, kButton, kFirstRadio, L"Дю&ймы"},
             {1235, kButton, kRadio, L"&Миллиметры"},
             {1236, kStatic, kWhiteRect, nullptr},
             {1237, kButton, kPush, L"Центрировать &водяной знак"},
             {IDOK, kButton, kDefault, L"ОК"},
             {IDCANCEL, kButton, kPush, L"Отмена"},
         },
         {{{kUnnumbered, L"Положение по вертикали"}, {1220, 1221, 1222, 1223, 1224, 1225}},
          {{kUnnumbered, L"Положение по горизонтали"}, {1227, 1228, 1229, 1230, 1231, 1232}},
          {{1233}, {1234, 1235}}},
         {{1220, 1221, 1222}, {1227, 1228, 1229}, {1234, 1235}},
         {{1225, 1224}, {1232, 1231}},
         {{1224, L"&Cдвиг:"}, {1231, L"С&двиг:"}},
         IDOK},
        {IDD_135,
         {
             {kUnnumbered, kStatic, kLabel, kDefined},
             {1041, kListBox, kToggleList, nullptr},
             {IDOK, kButton, kDefault, L"Закрыть"},
             {1070, kButton, kPush, L"Удалить"},
         },
         {},
         {},
         {},
         {{1041, kDefined}},
         IDOK},
        {IDD_136,
         {
             {kUnnumbered, kStatic, kLabel, kDefined},
             {1169, kListBox, kSingleList, nullptr},
             {IDOK, kButton, kDefault, L"ОК"},
             {IDCANCEL, kButton, kPush, L"Отмена"},
         },
         {},
         {},
         {},
         {{1169, kDefined}},
         IDOK},
        {IDD_101,
         {
             {kUnnumbered, kStatic, kCentred, kInstructions},
             {1001, kListBox, kSortedList, nullptr},
             {1002, kButton, kPush, L"&Добавить"},
             {1000, kEditClass, kEdit | On(ES_NOHIDESEL), nullptr},
             {IDOK, kButton, kDefault, L"ОК"},
             {IDCANCEL, kButton, kPush, L"Отмена"},
         },
         {},
         {},
         {},
         {},
         IDOK},
    };
    return templates;
}

}  // namespace

TEST(Templates, EveryControlHasItsIdClassStyleAndText)
{
    ForEachTemplate(Templates(), [](const Template& t, HWND dlg) {
        ExpectControls(dlg, t.id, t.controls, Order::Any);
    });
}

TEST(Templates, OnlyTheDefaultButtonOfAModalDialogActsAsDefault)
{
    ForEachTemplate(Templates(), [](const Template& t, HWND dlg) {
        ExpectDefaultButton(dlg, t.defaultButton);
    });
    Dialog del(IDD_135);
    ASSERT_NE(del.get(), nullptr);
    EXPECT_EQ(GetDlgItem(del.get(), IDCANCEL), nullptr) << "the delete dialog closes only through its own button";
}

TEST(Templates, RadioGroupsRunFromTheirFirstRadioToTheirLast)
{
    ForEachTemplate(Templates(), [](const Template& t, HWND dlg) {
        for (const std::vector<int>& group : t.radioGroups) {
            HWND first = GetDlgItem(dlg, group.front());
            ASSERT_NE(first, nullptr);
            // The arrow keys walk the group as the dialog manager sees it.
            std::vector<int> walked;
            HWND h = first;
            do {
                walked.push_back(IdOf(h));
                h = GetNextDlgGroupItem(dlg, h, FALSE);
            } while (h && h != first && walked.size() <= group.size());
            EXPECT_EQ(walked, group) << "group of " << group.front();
            HWND last = GetDlgItem(dlg, group.back());
            EXPECT_EQ(GetNextDlgGroupItem(dlg, first, TRUE), last) << "group of " << group.front();
        }
    });
}

TEST(Templates, UpDownControlsFollowTheirBuddiesAndSetTheirTextAsListed)
{
    ForEachTemplate(Templates(), [](const Template& t, HWND dlg) {
        for (const Spin& s : t.spins) {
            HWND spin = GetDlgItem(dlg, s.spin);
            HWND buddy = GetDlgItem(dlg, s.buddy);
            ASSERT_NE(spin, nullptr) << s.spin;
            ASSERT_NE(buddy, nullptr) << s.buddy;
            EXPECT_EQ(reinterpret_cast<HWND>(SendMessageW(spin, UDM_GETBUDDY, 0, 0)), buddy) << s.spin;
            EXPECT_EQ(GetWindow(buddy, GW_HWNDNEXT), spin) << s.spin << " comes right after its buddy";
            // The arrows sit at the right end of the field, on its line.
            RECT rs = RectOf(dlg, spin), rb = RectOf(dlg, buddy);
            EXPECT_GE(rs.left, rb.right - 3) << s.spin;
            EXPECT_LE(rs.left, rb.right + 1) << s.spin;
            EXPECT_EQ(rs.top, rb.top) << s.spin;
            EXPECT_EQ(rs.bottom, rb.bottom) << s.spin;

            SetWindowTextW(buddy, L"x");
            SendMessageW(spin, UDM_SETRANGE32, static_cast<WPARAM>(-200), 200);
            SendMessageW(spin, UDM_SETPOS32, 0, -42);
            const bool setsText = (StyleOf(spin) & UDS_SETBUDDYINT) != 0;
            EXPECT_EQ(Text(buddy), setsText ? L"-42" : L"x") << s.spin;
        }
    });
}

TEST(Templates, LabelsComeRightBeforeTheirFields)
{
    ForEachTemplate(Templates(), [](const Template& t, HWND dlg) {
        for (const Labelled& l : t.labels)
            ExpectLabelLeads(dlg, l);
    });
}

TEST(Templates, GroupBoxesFrameTheirControls)
{
    ForEachTemplate(Templates(), [](const Template& t, HWND dlg) {
        for (const Frame& f : t.frames)
            ExpectFrame(dlg, f);
    });
}

TEST(Templates, TextsFitTheirControls)
{
    ForEachTemplate(Templates(), [](const Template& t, HWND dlg) {
        FontDC dc(dlg);
        ASSERT_NE(dc.get(), nullptr);
        EXPECT_GT(ExpectTextsFit(dlg, dc.get()), 0);
        // The page's list labels switch to the texts of the order mode.
        if (t.id == IDD_104) {
            struct { int id; std::vector<UINT> strings; } switched[] = {{1035, {19, 21, 23}}, {1036, {20, 22}}};
            for (auto& s : switched)
                for (UINT str : s.strings) {
                    const std::wstring text = LoadText(str);
                    ASSERT_FALSE(text.empty()) << str;
                    ExpectTextFits(GetDlgItem(dlg, s.id), dc.get(), text);
                }
        }
    });
}

TEST(Templates, ControlsStayInsideTheDialogAndDoNotOverlap)
{
    ForEachTemplate(Templates(), [](const Template&, HWND dlg) {
        ExpectInsideAndApart(dlg);
    });
}
