// The templates of the manual colour page and the print-quality page and
// dialog, created as real windows: every control with its id, class, style
// and text, the labels and the frame the dialog manager and the user rely on,
// scale labels standing over the ticks they name, and a layout in which no
// text is cut and no two controls collide.
#include "frame/module.h"
#include "resources/resource.h"

#include <windows.h>
#include <commctrl.h>

#include <gtest/gtest.h>
#include <cstdlib>
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
// An enumerated style field: exactly value within mask.
constexpr Bits Kind(DWORD mask, DWORD value) { return {value, mask & ~value}; }

const Bits kPush = Kind(BS_TYPEMASK, BS_PUSHBUTTON) | On(WS_TABSTOP);
const Bits kDefault = Kind(BS_TYPEMASK, BS_DEFPUSHBUTTON) | On(WS_TABSTOP);
const Bits kGroupBox = Kind(BS_TYPEMASK, BS_GROUPBOX);
const Bits kCheck = Kind(BS_TYPEMASK, BS_AUTOCHECKBOX) | On(WS_TABSTOP);
const Bits kLabel = Kind(SS_TYPEMASK, SS_LEFT) | Off(WS_TABSTOP);
const Bits kScale = Kind(SS_TYPEMASK, SS_CENTER) | Off(WS_TABSTOP);
// Unsorted: the entries keep their display order.
const Bits kDropList = Kind(0x3, CBS_DROPDOWNLIST) | On(WS_VSCROLL | WS_TABSTOP) |
                       Off(CBS_SORT | CBS_OWNERDRAWFIXED | CBS_OWNERDRAWVARIABLE);
const Bits kTrackbar = On(TBS_AUTOTICKS | WS_TABSTOP) | Off(TBS_VERT | TBS_NOTICKS | TBS_NOTHUMB);

const WCHAR kButton[] = L"Button";
const WCHAR kStatic[] = L"Static";
const WCHAR kComboBox[] = L"ComboBox";
const WCHAR kTrackbarClass[] = L"msctls_trackbar32";

constexpr int kUnnumbered = -1;
// Styles the window manager adds or drops when a combo box is created.
constexpr DWORD kCreationAltered = WS_BORDER | WS_VSCROLL | WS_HSCROLL;

struct Control {
    int id;             // kUnnumbered: found by its text among the unnumbered controls
    const WCHAR* cls;
    Bits style;
    const WCHAR* text;  // nullptr: the template sets no text
};

struct Labelled {
    int field;
    const WCHAR* label;
};

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

// ---- reading templates and windows ------------------------------------------

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
        items.push_back({static_cast<int>(static_cast<short>(LOWORD(item->id))), item->style});
        p = SkipSzOrOrd(SkipSzOrOrd(p + sizeof(ItemHead)));  // class, title
        WORD extra = *reinterpret_cast<const WORD*>(p);
        p += sizeof(WORD) + extra;
    }
    return items;
}

INT_PTR CALLBACK InertDialogProc(HWND, UINT, WPARAM, LPARAM) { return FALSE; }

// A template created as a hidden dialog below a hidden top-level window.
class Dialog {
public:
    explicit Dialog(UINT id)
    {
        INITCOMMONCONTROLSEX icc = {sizeof icc, ICC_BAR_CLASSES | ICC_STANDARD_CLASSES};
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

// The dialog's font selected into a screen DC for measuring.
class FontDC {
public:
    explicit FontDC(HWND dlg) : hwnd_(dlg), dc_(GetDC(dlg))
    {
        HFONT font = reinterpret_cast<HFONT>(SendMessageW(dlg, WM_GETFONT, 0, 0));
        if (dc_ && font)
            old_ = SelectObject(dc_, font);
    }
    ~FontDC()
    {
        if (old_)
            SelectObject(dc_, old_);
        if (dc_)
            ReleaseDC(hwnd_, dc_);
    }
    FontDC(const FontDC&) = delete;
    FontDC& operator=(const FontDC&) = delete;
    HDC get() const { return old_ ? dc_ : nullptr; }

private:
    HWND hwnd_;
    HDC dc_;
    HGDIOBJ old_ = nullptr;
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

HWND Find(HWND dlg, const Control& c)
{
    if (c.id != kUnnumbered)
        return GetDlgItem(dlg, c.id);
    HWND found = nullptr;
    for (HWND h : Children(dlg))
        if (IdOf(h) == kUnnumbered && c.text && Text(h) == c.text) {
            if (found)
                return nullptr;  // ambiguous
            found = h;
        }
    return found;
}

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
    const std::wstring cls = ClassOf(hwnd);
    return "control " + std::to_string(IdOf(hwnd)) + " (" + std::string(cls.begin(), cls.end()) + ")";
}

bool IsGroupBox(HWND hwnd)
{
    return ClassOf(hwnd) == kButton && (StyleOf(hwnd) & BS_TYPEMASK) == BS_GROUPBOX;
}

// The text as drawn: "&x" shows x underlined.
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

SIZE Measure(HDC dc, const std::wstring& text)
{
    RECT r = {0, 0, 0, 0};
    DrawTextW(dc, text.c_str(), -1, &r, DT_CALCRECT | DT_NOPREFIX | DT_SINGLELINE);
    return {r.right - r.left, r.bottom - r.top};
}

// Fails unless text fits on one line in the control's client area; buttons
// keep room for their frame or box.
void ExpectTextFits(HWND hwnd, HDC dc, const std::wstring& text)
{
    RECT client = {};
    GetClientRect(hwnd, &client);
    int reserve = 0;
    if (ClassOf(hwnd) == kButton)
        reserve = (StyleOf(hwnd) & BS_TYPEMASK) <= BS_DEFPUSHBUTTON ? 8 : 16;
    const SIZE s = Measure(dc, Shown(text));
    EXPECT_LE(s.cx + reserve, client.right) << Describe(hwnd) << ": text " << s.cx << " px";
    EXPECT_LE(s.cy, client.bottom) << Describe(hwnd) << ": text " << s.cy << " px high";
}

std::wstring PluginString(UINT id)
{
    WCHAR buf[256] = {};
    const int n = LoadStringW(ModuleInstance(), id, buf, 256);
    return std::wstring(buf, n > 0 ? n : 0);
}

}  // namespace

TEST(QualityTemplates, EveryControlHasItsIdClassStyleAndText)
{
    for (const Template& t : Templates()) {
        SCOPED_TRACE("template " + std::to_string(t.id));
        Dialog dlg(t.id);
        ASSERT_NE(dlg.get(), nullptr);
        const std::vector<HWND> children = Children(dlg.get());
        const std::vector<Item> items = TemplateItems(t.id);
        ASSERT_EQ(items.size(), children.size());
        EXPECT_EQ(children.size(), t.controls.size()) << "no control beyond those listed";
        for (size_t i = 0; i < t.controls.size() && i < children.size(); ++i) {
            const Control& c = t.controls[i];
            const std::string what = "control " + std::to_string(c.id);
            HWND h = Find(dlg.get(), c);
            ASSERT_NE(h, nullptr) << what;
            EXPECT_EQ(children[i], h) << what << " is created in its listed place";
            EXPECT_EQ(ClassOf(h), c.cls) << what;
            const DWORD on = c.style.on | WS_CHILD | WS_VISIBLE;
            const DWORD live = StyleOf(h);
            EXPECT_EQ(live & on & ~kCreationAltered, on & ~kCreationAltered)
                << what << std::hex << ": style 0x" << live << " lacks 0x" << (on & ~live);
            EXPECT_EQ(live & c.style.off, 0u) << what << std::hex << ": style 0x" << live;
            EXPECT_EQ(live & WS_DISABLED, 0u) << what << ": the code decides what is disabled";
            EXPECT_EQ(items[i].id, c.id) << what;
            EXPECT_EQ(items[i].style & on, on) << what << std::hex << ": template style 0x" << items[i].style;
            EXPECT_EQ(items[i].style & c.style.off, 0u) << what << std::hex << ": template style 0x"
                                                         << items[i].style;
            if (c.text) {
                EXPECT_EQ(Text(h), c.text) << what;
            }
        }
    }
}

TEST(QualityTemplates, OnlyTheModalDialogHasADefaultButton)
{
    for (const Template& t : Templates()) {
        SCOPED_TRACE("template " + std::to_string(t.id));
        Dialog dlg(t.id);
        ASSERT_NE(dlg.get(), nullptr);
        const bool page = (StyleOf(dlg.get()) & WS_CHILD) != 0;
        EXPECT_EQ(page, t.defaultButton == 0) << "a page leaves the default button to the sheet";
        int defaults = 0;
        for (HWND h : Children(dlg.get()))
            if (SendMessageW(h, WM_GETDLGCODE, 0, 0) & DLGC_DEFPUSHBUTTON) {
                ++defaults;
                EXPECT_EQ(IdOf(h), t.defaultButton) << Describe(h);
            }
        EXPECT_EQ(defaults, page ? 0 : 1);
        if (!page) {
            const LRESULT def = SendMessageW(dlg.get(), DM_GETDEFID, 0, 0);
            EXPECT_EQ(HIWORD(def), DC_HASDEFID);
            EXPECT_EQ(LOWORD(def), t.defaultButton);
        }
    }
}

TEST(QualityTemplates, LabelsLeadTheFocusToTheirFields)
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
            // The label's accelerator moves the focus to the next tab stop.
            EXPECT_EQ(GetNextDlgTabItem(dlg.get(), label, FALSE), field) << l.field;
            RECT rl = RectOf(dlg.get(), label), rf = RectOf(dlg.get(), field);
            EXPECT_LE(rl.bottom, rf.top) << l.field << ": label above its field";
        }
    }
}

TEST(QualityTemplates, TheFrameHoldsTheRgbListsAndTheirLabels)
{
    Dialog dlg(IDD_107);
    ASSERT_NE(dlg.get(), nullptr);
    HWND frame = GetDlgItem(dlg.get(), 1046);
    ASSERT_NE(frame, nullptr);
    ASSERT_TRUE(IsGroupBox(frame));
    const RECT rf = RectOf(dlg.get(), frame);
    for (int id : {1177, 1178, 1176, 1181, 1175, 1180}) {
        HWND h = GetDlgItem(dlg.get(), id);
        ASSERT_NE(h, nullptr) << id;
        EXPECT_TRUE(Contains(rf, RectOf(dlg.get(), h))) << id << " inside the frame";
        // A dropped list reaches past the frame; its closed field stays inside.
    }
    for (int id : {1172, 1179, 1182, 1253}) {
        RECT common = {}, r = RectOf(dlg.get(), GetDlgItem(dlg.get(), id));
        EXPECT_FALSE(IntersectRect(&common, &rf, &r)) << id << " outside the frame";
    }
}

TEST(QualityTemplates, ScaleLabelsStandOverTheTicksTheyName)
{
    for (const Template& t : Templates()) {
        SCOPED_TRACE("template " + std::to_string(t.id));
        Dialog dlg(t.id);
        ASSERT_NE(dlg.get(), nullptr);
        for (const Range& r : t.ranges) {
            HWND tb = GetDlgItem(dlg.get(), r.trackbar);
            ASSERT_NE(tb, nullptr);
            SendMessageW(tb, TBM_SETRANGEMIN, FALSE, r.lo);
            SendMessageW(tb, TBM_SETRANGEMAX, TRUE, r.hi);
        }
        for (const ScaleMark& m : t.marks) {
            HWND tb = GetDlgItem(dlg.get(), m.trackbar);
            HWND label = GetDlgItem(dlg.get(), m.label);
            ASSERT_NE(label, nullptr) << m.label;
            EXPECT_EQ(Text(label), std::to_wstring(m.value)) << m.label;
            SendMessageW(tb, TBM_SETPOS, TRUE, m.value);
            RECT thumb = {};
            SendMessageW(tb, TBM_GETTHUMBRECT, 0, reinterpret_cast<LPARAM>(&thumb));
            MapWindowPoints(tb, dlg.get(), reinterpret_cast<POINT*>(&thumb), 2);
            const RECT rl = RectOf(dlg.get(), label), rt = RectOf(dlg.get(), tb);
            const int thumbCentre = (thumb.left + thumb.right) / 2, labelCentre = (rl.left + rl.right) / 2;
            EXPECT_LE(std::abs(thumbCentre - labelCentre), 4)
                << m.label << ": label centre " << labelCentre << ", thumb centre " << thumbCentre;
            EXPECT_LE(rl.bottom, rt.top) << m.label << " above its trackbar";
            EXPECT_GE(rl.bottom, rt.top - 6) << m.label << " right above its trackbar";
        }
    }
}

TEST(QualityTemplates, TextsAndListEntriesFitTheirControls)
{
    for (const Template& t : Templates()) {
        SCOPED_TRACE("template " + std::to_string(t.id));
        Dialog dlg(t.id);
        ASSERT_NE(dlg.get(), nullptr);
        FontDC dc(dlg.get());
        ASSERT_NE(dc.get(), nullptr);
        int measured = 0;
        for (HWND h : Children(dlg.get())) {
            const std::wstring text = Text(h);
            if (text.empty() || ClassOf(h) == kComboBox)
                continue;
            ExpectTextFits(h, dc.get(), text);
            ++measured;
        }
        EXPECT_GT(measured, 0);
    }
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
            const std::wstring entry = PluginString(s);
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
    for (const Template& t : Templates()) {
        SCOPED_TRACE("template " + std::to_string(t.id));
        Dialog dlg(t.id);
        ASSERT_NE(dlg.get(), nullptr);
        RECT client = {};
        GetClientRect(dlg.get(), &client);
        const std::vector<HWND> children = Children(dlg.get());
        for (size_t i = 0; i < children.size(); ++i) {
            const RECT ri = RectOf(dlg.get(), children[i]);
            EXPECT_TRUE(Contains(client, ri)) << Describe(children[i]);
            EXPECT_GT(ri.right - ri.left, 0) << Describe(children[i]);
            EXPECT_GT(ri.bottom - ri.top, 0) << Describe(children[i]);
            for (size_t j = i + 1; j < children.size(); ++j) {
                RECT rj = RectOf(dlg.get(), children[j]), common = {};
                if (!IntersectRect(&common, &ri, &rj))
                    continue;
                const bool framed = (IsGroupBox(children[i]) && Contains(ri, rj)) ||
                                    (IsGroupBox(children[j]) && Contains(rj, ri));
                EXPECT_TRUE(framed) << Describe(children[i]) << " overlaps " << Describe(children[j]);
            }
        }
    }
}
