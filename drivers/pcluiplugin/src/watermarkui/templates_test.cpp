// The templates of the watermark page and its dialogs, created as real
// windows: every control with its id, class, style and text, the groups and
// buddies the dialog manager relies on, and a layout in which no text is cut
// and no two controls collide.
#include "frame/module.h"
#include "resources/resource.h"

#include <windows.h>
#include <commctrl.h>

#include <gtest/gtest.h>
#include <string>
#include <vector>

namespace {

// Style bits a control must have (on) and must not have (off).
struct Bits {
    DWORD on = 0, off = 0;
};
constexpr Bits operator|(Bits a, Bits b) { return {a.on | b.on, a.off | b.off}; }
constexpr Bits On(DWORD s) { return {s, 0}; }
constexpr Bits Off(DWORD s) { return {0, s}; }
// An enumerated style field (button type, static type, combo type): exactly
// value within mask.
constexpr Bits Kind(DWORD mask, DWORD value) { return {value, mask & ~value}; }

const Bits kPush = Kind(BS_TYPEMASK, BS_PUSHBUTTON) | On(WS_TABSTOP);
const Bits kDefault = Kind(BS_TYPEMASK, BS_DEFPUSHBUTTON) | On(WS_TABSTOP);
const Bits kGroupBox = Kind(BS_TYPEMASK, BS_GROUPBOX);
const Bits kFirstRadio = Kind(BS_TYPEMASK, BS_AUTORADIOBUTTON) | On(WS_GROUP | WS_TABSTOP);
const Bits kRadio = Kind(BS_TYPEMASK, BS_AUTORADIOBUTTON) | Off(WS_GROUP);
const Bits kCheck = Kind(BS_TYPEMASK, BS_AUTOCHECKBOX) | On(WS_TABSTOP);
const Bits kLabel = Kind(SS_TYPEMASK, SS_LEFT);
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

const WCHAR kButton[] = L"Button";
const WCHAR kStatic[] = L"Static";
const WCHAR kEditClass[] = L"Edit";
const WCHAR kListBox[] = L"ListBox";
const WCHAR kComboBox[] = L"ComboBox";
const WCHAR kUpDown[] = L"msctls_updown32";

constexpr int kUnnumbered = -1;

struct Control {
    int id;              // kUnnumbered: found by its text among the unnumbered controls
    const WCHAR* cls;
    Bits style;
    const WCHAR* text;   // nullptr: the text is not set by the template
};

// A control identified by id, or by text when it has none.
struct Ref {
    int id;
    const WCHAR* text = nullptr;
};

struct Frame {
    Ref group;
    std::vector<int> members;
};

struct Spin {
    int spin, buddy;
};

struct Labelled {
    int field;
    const WCHAR* label;
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

// Style bits that creation moves elsewhere: the dialog manager turns a 3-D
// dialog's WS_BORDER into WS_EX_CLIENTEDGE, and scroll bars leave the style
// while there is nothing to scroll. They are checked in the template and,
// live, by what they do.
constexpr DWORD kCreationAltered = WS_BORDER | WS_VSCROLL | WS_HSCROLL;

struct Item {
    int id;
    DWORD style;
};

const BYTE* SkipSzOrOrd(const BYTE* p)
{
    auto* w = reinterpret_cast<const WORD*>(p);
    if (*w == 0xFFFF)
        return p + 2 * sizeof(WORD);
    while (*w++) {
    }
    return reinterpret_cast<const BYTE*>(w);
}

const BYTE* AlignDword(const BYTE* base, const BYTE* p)
{
    return base + ((p - base + 3) & ~static_cast<ptrdiff_t>(3));
}

// The controls of a DIALOGEX template as the resource compiler wrote them,
// in creation order.
std::vector<Item> TemplateItems(UINT id)
{
#pragma pack(push, 1)
    struct Head {
        WORD dlgVer, signature;
        DWORD helpID, exStyle, style;
        WORD cDlgItems;
        short x, y, cx, cy;
    };
    struct ItemHead {
        DWORD helpID, exStyle, style;
        short x, y, cx, cy;
        DWORD id;
    };
#pragma pack(pop)
    std::vector<Item> items;
    HRSRC r = FindResourceW(ModuleInstance(), MAKEINTRESOURCEW(id), RT_DIALOG);
    auto* base = r ? static_cast<const BYTE*>(LockResource(LoadResource(ModuleInstance(), r))) : nullptr;
    if (!base)
        return items;
    auto* head = reinterpret_cast<const Head*>(base);
    if (head->signature != 0xFFFF)
        return items;
    const BYTE* p = SkipSzOrOrd(SkipSzOrOrd(SkipSzOrOrd(base + sizeof(Head))));  // menu, class, caption
    if (head->style & DS_SETFONT)
        p = SkipSzOrOrd(p + 2 * sizeof(WORD) + 2);  // size, weight, italic, charset, face
    for (WORD i = 0; i < head->cDlgItems; ++i) {
        p = AlignDword(base, p);
        auto* item = reinterpret_cast<const ItemHead*>(p);
        items.push_back({static_cast<int>(item->id), item->style});
        p = SkipSzOrOrd(SkipSzOrOrd(p + sizeof(ItemHead)));  // class, title
        WORD extra = *reinterpret_cast<const WORD*>(p);
        p += sizeof(WORD) + extra;
    }
    return items;
}

INT_PTR CALLBACK InertDialogProc(HWND, UINT, WPARAM, LPARAM) { return FALSE; }

// A template created as a hidden dialog; the page template (WS_CHILD) and the
// modal ones alike get a hidden top-level window as parent or owner.
class Dialog {
public:
    explicit Dialog(UINT id)
    {
        INITCOMMONCONTROLSEX icc = {sizeof icc, ICC_UPDOWN_CLASS | ICC_STANDARD_CLASSES};
        InitCommonControlsEx(&icc);
        parent_ = CreateWindowExW(0, L"Static", L"", WS_OVERLAPPEDWINDOW, 0, 0, 900, 700, nullptr, nullptr,
                                  nullptr, nullptr);
        if (parent_)
            hwnd_ = CreateDialogParamW(ModuleInstance(), MAKEINTRESOURCEW(id), parent_, InertDialogProc, 0);
    }
    ~Dialog()
    {
        if (hwnd_)
            DestroyWindow(hwnd_);
        if (parent_)
            DestroyWindow(parent_);
    }
    Dialog(const Dialog&) = delete;
    Dialog& operator=(const Dialog&) = delete;
    HWND get() const { return hwnd_; }

private:
    HWND parent_ = nullptr;
    HWND hwnd_ = nullptr;
};

class WindowDC {
public:
    explicit WindowDC(HWND hwnd) : hwnd_(hwnd), dc_(GetDC(hwnd)) {}
    ~WindowDC()
    {
        if (dc_)
            ReleaseDC(hwnd_, dc_);
    }
    WindowDC(const WindowDC&) = delete;
    WindowDC& operator=(const WindowDC&) = delete;
    HDC get() const { return dc_; }

private:
    HWND hwnd_;
    HDC dc_;
};

std::wstring Text(HWND hwnd)
{
    WCHAR buf[512] = {};
    int n = GetWindowTextW(hwnd, buf, 512);
    return std::wstring(buf, n > 0 ? n : 0);
}

std::wstring ClassOf(HWND hwnd)
{
    WCHAR buf[64] = {};
    int n = GetClassNameW(hwnd, buf, 64);
    return std::wstring(buf, n > 0 ? n : 0);
}

DWORD StyleOf(HWND hwnd) { return static_cast<DWORD>(GetWindowLongW(hwnd, GWL_STYLE)); }

int IdOf(HWND hwnd) { return static_cast<short>(LOWORD(GetDlgCtrlID(hwnd))); }

std::vector<HWND> Children(HWND dlg)
{
    std::vector<HWND> out;
    for (HWND h = GetWindow(dlg, GW_CHILD); h; h = GetWindow(h, GW_HWNDNEXT))
        out.push_back(h);
    return out;
}

HWND Find(HWND dlg, const Ref& ref)
{
    if (ref.id != kUnnumbered)
        return GetDlgItem(dlg, ref.id);
    HWND found = nullptr;
    for (HWND h : Children(dlg))
        if (IdOf(h) == kUnnumbered && ref.text && Text(h) == ref.text) {
            if (found)
                return nullptr;  // ambiguous
            found = h;
        }
    return found;
}

// The control's rectangle in the dialog's client coordinates.
RECT RectOf(HWND dlg, HWND hwnd)
{
    RECT r = {};
    GetWindowRect(hwnd, &r);
    MapWindowPoints(HWND_DESKTOP, dlg, reinterpret_cast<POINT*>(&r), 2);
    return r;
}

bool Contains(const RECT& outer, const RECT& inner)
{
    return inner.left >= outer.left && inner.top >= outer.top && inner.right <= outer.right &&
           inner.bottom <= outer.bottom;
}

std::string Describe(HWND hwnd)
{
    std::wstring text = Text(hwnd);
    std::string out = "control " + std::to_string(IdOf(hwnd)) + " (";
    int n = WideCharToMultiByte(CP_UTF8, 0, text.c_str(), -1, nullptr, 0, nullptr, nullptr);
    if (n > 1) {
        std::string utf8(n - 1, '\0');
        WideCharToMultiByte(CP_UTF8, 0, text.c_str(), -1, &utf8[0], n, nullptr, nullptr);
        out += "\"" + utf8 + "\" ";
    }
    const std::wstring cls = ClassOf(hwnd);
    return out + std::string(cls.begin(), cls.end()) + ")";
}

std::string Describe(const Template& t, const Ref& ref)
{
    return "template " + std::to_string(t.id) + ", control " + std::to_string(ref.id);
}

// The text as drawn: "&x" shows x underlined, "&&" shows one ampersand.
std::wstring Shown(const std::wstring& text)
{
    std::wstring out;
    for (size_t i = 0; i < text.size(); ++i) {
        if (text[i] == L'&' && i + 1 < text.size())
            ++i;
        out += text[i];
    }
    return out;
}

bool IsGroupBox(HWND hwnd)
{
    return ClassOf(hwnd) == kButton && (StyleOf(hwnd) & BS_TYPEMASK) == BS_GROUPBOX;
}

bool IsBuddyPair(HWND a, HWND b)
{
    auto buddyOf = [](HWND h) {
        return ClassOf(h) == kUpDown ? reinterpret_cast<HWND>(SendMessageW(h, UDM_GETBUDDY, 0, 0)) : nullptr;
    };
    return buddyOf(a) == b || buddyOf(b) == a;
}

// Width and height of text as a control draws it, on one line or broken into
// lines of at most width pixels.
SIZE Measure(HDC dc, const std::wstring& text, int width, bool wrap)
{
    RECT r = {0, 0, wrap ? width : 0, 0};
    DrawTextW(dc, text.c_str(), -1, &r, DT_CALCRECT | DT_NOPREFIX | (wrap ? DT_WORDBREAK : DT_SINGLELINE));
    return {r.right - r.left, r.bottom - r.top};
}

// Fails unless text fits the control's client area. Push buttons keep room for
// their frame, check boxes and radios for the box, group boxes for the frame
// line on both sides of the caption; statics tall enough for two lines wrap.
void ExpectTextFits(HWND hwnd, HDC dc, const std::wstring& text)
{
    RECT client = {};
    GetClientRect(hwnd, &client);
    const int width = client.right, height = client.bottom;
    const std::wstring shown = Shown(text);
    TEXTMETRICW tm = {};
    GetTextMetricsW(dc, &tm);

    if (ClassOf(hwnd) == kButton) {
        int reserve = 0;
        switch (StyleOf(hwnd) & BS_TYPEMASK) {
        case BS_PUSHBUTTON:
        case BS_DEFPUSHBUTTON:
            reserve = 8;
            break;
        case BS_GROUPBOX:
            reserve = 16;
            break;
        default:  // check boxes and radios
            reserve = 16;
            break;
        }
        SIZE s = Measure(dc, shown, 0, false);
        EXPECT_LE(s.cx + reserve, width) << Describe(hwnd) << ": text " << s.cx << " px, room " << width - reserve;
        EXPECT_LE(s.cy, height) << Describe(hwnd) << ": text " << s.cy << " px high, control " << height;
        return;
    }
    const bool multiline = height >= 2 * tm.tmHeight;
    SIZE s = Measure(dc, shown, width, multiline);
    EXPECT_LE(s.cx, width) << Describe(hwnd) << ": text " << s.cx << " px, control " << width;
    EXPECT_LE(s.cy, height) << Describe(hwnd) << ": text " << s.cy << " px high, control " << height;
}

}  // namespace

TEST(Templates, EveryControlHasItsIdClassStyleAndText)
{
    for (const Template& t : Templates()) {
        SCOPED_TRACE("template " + std::to_string(t.id));
        Dialog dlg(t.id);
        ASSERT_NE(dlg.get(), nullptr);
        const std::vector<HWND> children = Children(dlg.get());
        const std::vector<Item> items = TemplateItems(t.id);
        ASSERT_EQ(items.size(), children.size());
        EXPECT_EQ(children.size(), t.controls.size()) << "no control beyond those listed";
        for (const Control& c : t.controls) {
            const std::string what = Describe(t, {c.id, c.text});
            HWND h = Find(dlg.get(), {c.id, c.text});
            ASSERT_NE(h, nullptr) << what;
            EXPECT_EQ(ClassOf(h), c.cls) << what;
            const DWORD on = c.style.on | WS_CHILD | WS_VISIBLE;
            const DWORD live = StyleOf(h);
            EXPECT_EQ(live & on & ~kCreationAltered, on & ~kCreationAltered)
                << what << std::hex << ": style 0x" << live << " lacks 0x" << (on & ~live & ~kCreationAltered);
            EXPECT_EQ(live & c.style.off, 0u) << what << std::hex << ": style 0x" << live << " has 0x"
                                               << (live & c.style.off);
            EXPECT_EQ((live & WS_DISABLED) != 0, (c.style.on & WS_DISABLED) != 0) << what;
            size_t index = 0;
            while (index < children.size() && children[index] != h)
                ++index;
            ASSERT_LT(index, items.size()) << what;
            EXPECT_EQ(static_cast<short>(LOWORD(items[index].id)), IdOf(h)) << what;
            const DWORD written = items[index].style;
            EXPECT_EQ(written & on, on) << what << std::hex << ": template style 0x" << written << " lacks 0x"
                                        << (on & ~written);
            EXPECT_EQ(written & c.style.off, 0u) << what << std::hex << ": template style 0x" << written
                                                  << " has 0x" << (written & c.style.off);
            if (written & WS_BORDER) {
                EXPECT_NE(GetWindowLongW(h, GWL_EXSTYLE) & WS_EX_CLIENTEDGE, 0) << what << ": sunken frame";
            }
            if (c.text) {
                EXPECT_EQ(Text(h), c.text) << what;
            }
        }
    }
}

TEST(Templates, ListsShowTheirScrollBarsWhenFull)
{
    for (const Template& t : Templates()) {
        SCOPED_TRACE("template " + std::to_string(t.id));
        Dialog dlg(t.id);
        ASSERT_NE(dlg.get(), nullptr);
        for (const Control& c : t.controls) {
            if (c.cls != kListBox)
                continue;
            HWND list = GetDlgItem(dlg.get(), c.id);
            ASSERT_NE(list, nullptr) << c.id;
            for (int i = 0; i < 60; ++i)
                SendMessageW(list, LB_ADDSTRING, 0, reinterpret_cast<LPARAM>(L"Водяной знак с очень длинным именем"));
            SendMessageW(list, LB_SETHORIZONTALEXTENT, 4000, 0);
            const DWORD style = StyleOf(list);
            EXPECT_NE(style & WS_VSCROLL, 0u) << c.id;
            EXPECT_EQ((style & WS_HSCROLL) != 0, (c.style.on & WS_HSCROLL) != 0) << c.id;
        }
    }
}

TEST(Templates, OnlyTheDefaultButtonOfAModalDialogActsAsDefault)
{
    for (const Template& t : Templates()) {
        SCOPED_TRACE("template " + std::to_string(t.id));
        Dialog dlg(t.id);
        ASSERT_NE(dlg.get(), nullptr);
        const bool page = (StyleOf(dlg.get()) & WS_CHILD) != 0;
        EXPECT_EQ(page, t.defaultButton == 0) << "a page leaves the default button to the sheet";
        int defaults = 0;
        for (HWND h : Children(dlg.get())) {
            const LRESULT code = SendMessageW(h, WM_GETDLGCODE, 0, 0);
            if (code & DLGC_DEFPUSHBUTTON) {
                ++defaults;
                EXPECT_EQ(IdOf(h), t.defaultButton) << Describe(h);
            }
        }
        EXPECT_EQ(defaults, page ? 0 : 1);
        if (!page) {
            const LRESULT def = SendMessageW(dlg.get(), DM_GETDEFID, 0, 0);
            EXPECT_EQ(HIWORD(def), DC_HASDEFID);
            EXPECT_EQ(LOWORD(def), t.defaultButton);
        }
    }
    Dialog del(IDD_135);
    ASSERT_NE(del.get(), nullptr);
    EXPECT_EQ(GetDlgItem(del.get(), IDCANCEL), nullptr) << "the delete dialog closes only through its own button";
}

TEST(Templates, RadioGroupsRunFromTheirFirstRadioToTheirLast)
{
    for (const Template& t : Templates()) {
        SCOPED_TRACE("template " + std::to_string(t.id));
        Dialog dlg(t.id);
        ASSERT_NE(dlg.get(), nullptr);
        for (const std::vector<int>& group : t.radioGroups) {
            HWND first = GetDlgItem(dlg.get(), group.front());
            ASSERT_NE(first, nullptr);
            // The arrow keys walk the group as the dialog manager sees it.
            std::vector<int> walked;
            HWND h = first;
            do {
                walked.push_back(IdOf(h));
                h = GetNextDlgGroupItem(dlg.get(), h, FALSE);
            } while (h && h != first && walked.size() <= group.size());
            EXPECT_EQ(walked, group) << "group of " << group.front();
            HWND last = GetDlgItem(dlg.get(), group.back());
            EXPECT_EQ(GetNextDlgGroupItem(dlg.get(), first, TRUE), last) << "group of " << group.front();
        }
    }
}

TEST(Templates, UpDownControlsFollowTheirBuddiesAndSetTheirTextAsListed)
{
    for (const Template& t : Templates()) {
        SCOPED_TRACE("template " + std::to_string(t.id));
        Dialog dlg(t.id);
        ASSERT_NE(dlg.get(), nullptr);
        for (const Spin& s : t.spins) {
            HWND spin = GetDlgItem(dlg.get(), s.spin);
            HWND buddy = GetDlgItem(dlg.get(), s.buddy);
            ASSERT_NE(spin, nullptr) << s.spin;
            ASSERT_NE(buddy, nullptr) << s.buddy;
            EXPECT_EQ(reinterpret_cast<HWND>(SendMessageW(spin, UDM_GETBUDDY, 0, 0)), buddy) << s.spin;
            EXPECT_EQ(GetWindow(buddy, GW_HWNDNEXT), spin) << s.spin << " comes right after its buddy";
            // The arrows sit at the right end of the field, on its line.
            RECT rs = RectOf(dlg.get(), spin), rb = RectOf(dlg.get(), buddy);
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
    }
}

TEST(Templates, LabelsComeRightBeforeTheirFields)
{
    for (const Template& t : Templates()) {
        SCOPED_TRACE("template " + std::to_string(t.id));
        Dialog dlg(t.id);
        ASSERT_NE(dlg.get(), nullptr);
        for (const Labelled& l : t.labels) {
            HWND field = GetDlgItem(dlg.get(), l.field);
            ASSERT_NE(field, nullptr) << l.field;
            HWND label = GetWindow(field, GW_HWNDPREV);
            ASSERT_NE(label, nullptr) << l.field;
            EXPECT_EQ(ClassOf(label), kStatic) << l.field;
            EXPECT_EQ(Text(label), l.label) << l.field;
            EXPECT_EQ(StyleOf(label) & WS_TABSTOP, 0u) << l.field;
            EXPECT_NE(StyleOf(field) & WS_TABSTOP, 0u) << l.field;
            // The label's accelerator moves the focus on to the field.
            RECT rl = RectOf(dlg.get(), label), rf = RectOf(dlg.get(), field);
            EXPECT_TRUE(rl.bottom <= rf.top || rl.right <= rf.left) << l.field << ": label above or left of field";
        }
    }
}

TEST(Templates, GroupBoxesFrameTheirControls)
{
    for (const Template& t : Templates()) {
        SCOPED_TRACE("template " + std::to_string(t.id));
        Dialog dlg(t.id);
        ASSERT_NE(dlg.get(), nullptr);
        for (const Frame& f : t.frames) {
            HWND group = Find(dlg.get(), f.group);
            ASSERT_NE(group, nullptr) << Describe(t, f.group);
            ASSERT_TRUE(IsGroupBox(group)) << Describe(t, f.group);
            RECT rg = RectOf(dlg.get(), group);
            for (int id : f.members) {
                HWND member = GetDlgItem(dlg.get(), id);
                ASSERT_NE(member, nullptr) << id;
                EXPECT_TRUE(Contains(rg, RectOf(dlg.get(), member))) << Describe(member) << " inside "
                                                                      << Describe(group);
            }
        }
    }
}

TEST(Templates, TextsFitTheirControls)
{
    for (const Template& t : Templates()) {
        SCOPED_TRACE("template " + std::to_string(t.id));
        Dialog dlg(t.id);
        ASSERT_NE(dlg.get(), nullptr);
        HFONT font = reinterpret_cast<HFONT>(SendMessageW(dlg.get(), WM_GETFONT, 0, 0));
        ASSERT_NE(font, nullptr);
        WindowDC dc(dlg.get());
        ASSERT_NE(dc.get(), nullptr);
        HGDIOBJ old = SelectObject(dc.get(), font);
        int measured = 0;
        for (HWND h : Children(dlg.get())) {
            const std::wstring cls = ClassOf(h);
            const std::wstring text = Text(h);
            if (text.empty() || (cls != kButton && cls != kStatic))
                continue;
            ExpectTextFits(h, dc.get(), text);
            ++measured;
        }
        EXPECT_GT(measured, 0);
        // The page's list labels switch to the texts of the order mode.
        if (t.id == IDD_104) {
            struct { int id; std::vector<UINT> strings; } switched[] = {{1035, {19, 21, 23}}, {1036, {20, 22}}};
            for (auto& s : switched)
                for (UINT str : s.strings) {
                    WCHAR buf[128] = {};
                    ASSERT_GT(LoadStringW(ModuleInstance(), str, buf, 128), 0) << str;
                    ExpectTextFits(GetDlgItem(dlg.get(), s.id), dc.get(), buf);
                }
        }
        SelectObject(dc.get(), old);
    }
}

TEST(Templates, ControlsStayInsideTheDialogAndDoNotOverlap)
{
    for (const Template& t : Templates()) {
        SCOPED_TRACE("template " + std::to_string(t.id));
        Dialog dlg(t.id);
        ASSERT_NE(dlg.get(), nullptr);
        RECT client = {};
        GetClientRect(dlg.get(), &client);
        const std::vector<HWND> children = Children(dlg.get());
        for (size_t i = 0; i < children.size(); ++i) {
            RECT ri = RectOf(dlg.get(), children[i]);
            EXPECT_TRUE(Contains(client, ri)) << Describe(children[i]);
            EXPECT_GT(ri.right - ri.left, 0) << Describe(children[i]);
            EXPECT_GT(ri.bottom - ri.top, 0) << Describe(children[i]);
            for (size_t j = i + 1; j < children.size(); ++j) {
                RECT rj = RectOf(dlg.get(), children[j]), common = {};
                if (!IntersectRect(&common, &ri, &rj))
                    continue;
                const bool framed = (IsGroupBox(children[i]) && Contains(ri, rj)) ||
                                    (IsGroupBox(children[j]) && Contains(rj, ri));
                EXPECT_TRUE(framed || IsBuddyPair(children[i], children[j]))
                    << Describe(children[i]) << " overlaps " << Describe(children[j]);
            }
        }
    }
}
