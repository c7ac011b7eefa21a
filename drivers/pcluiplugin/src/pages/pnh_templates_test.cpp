// The print-and-hold page's template created as a real window: every control
// with its id, class, style and text, the labels and the frame the dialog
// manager and the user rely on, and a layout in which no text is cut and no
// two controls collide.
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
// An enumerated style field: exactly value within mask.
constexpr Bits Kind(DWORD mask, DWORD value) { return {value, mask & ~value}; }

const Bits kGroupBox = Kind(BS_TYPEMASK, BS_GROUPBOX);
const Bits kCheck = Kind(BS_TYPEMASK, BS_AUTOCHECKBOX) | On(WS_TABSTOP);
const Bits kLabel = Kind(SS_TYPEMASK, SS_LEFT) | Off(WS_TABSTOP);
const Bits kSingleList = On(LBS_NOTIFY | WS_VSCROLL | WS_BORDER | WS_TABSTOP) |
                         Off(LBS_SORT | LBS_MULTIPLESEL | LBS_EXTENDEDSEL | LBS_NOSEL);
const Bits kField = On(ES_AUTOHSCROLL | WS_BORDER | WS_TABSTOP) | Off(ES_MULTILINE | ES_READONLY);
const Bits kText = kField | Off(ES_PASSWORD | ES_NUMBER);
const Bits kSecret = kField | On(ES_PASSWORD | ES_NUMBER);

const WCHAR kButton[] = L"Button";
const WCHAR kStatic[] = L"Static";
const WCHAR kEditClass[] = L"Edit";
const WCHAR kListBox[] = L"ListBox";

struct Control {
    int id;
    const WCHAR* cls;
    Bits style;
    const WCHAR* text;  // nullptr: the template sets no text
};

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

// Style bits that creation moves elsewhere: a 3-D dialog's WS_BORDER becomes
// WS_EX_CLIENTEDGE, and scroll bars leave the style while there is nothing
// to scroll. They are checked in the template and, live, by what they do.
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

// The controls of the DIALOGEX template as the resource compiler wrote them,
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

// The page template created as a child of a hidden top-level window.
class Page {
public:
    Page()
    {
        INITCOMMONCONTROLSEX icc = {sizeof icc, ICC_STANDARD_CLASSES};
        InitCommonControlsEx(&icc);
        parent_ = CreateWindowExW(0, L"Static", L"", WS_OVERLAPPEDWINDOW, 0, 0, 900, 700, nullptr, nullptr,
                                  nullptr, nullptr);
        if (parent_)
            hwnd_ = CreateDialogParamW(ModuleInstance(), MAKEINTRESOURCEW(IDD_138), parent_, InertDialogProc, 0);
    }
    ~Page()
    {
        if (hwnd_)
            DestroyWindow(hwnd_);
        if (parent_)
            DestroyWindow(parent_);
    }
    Page(const Page&) = delete;
    Page& operator=(const Page&) = delete;
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

std::string Utf8(const std::wstring& text)
{
    int n = WideCharToMultiByte(CP_UTF8, 0, text.c_str(), -1, nullptr, 0, nullptr, nullptr);
    if (n <= 1)
        return {};
    std::string out(n - 1, '\0');
    WideCharToMultiByte(CP_UTF8, 0, text.c_str(), -1, &out[0], n, nullptr, nullptr);
    return out;
}

std::string Describe(HWND hwnd)
{
    const std::wstring cls = ClassOf(hwnd);
    return "control " + std::to_string(IdOf(hwnd)) + " (\"" + Utf8(Text(hwnd)) + "\" " +
           std::string(cls.begin(), cls.end()) + ")";
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

SIZE Measure(HDC dc, const std::wstring& text, int width, bool wrap)
{
    RECT r = {0, 0, wrap ? width : 0, 0};
    DrawTextW(dc, text.c_str(), -1, &r, DT_CALCRECT | DT_NOPREFIX | (wrap ? DT_WORDBREAK : DT_SINGLELINE));
    return {r.right - r.left, r.bottom - r.top};
}

// Fails unless text fits the control's client area; check boxes keep room
// for the box, group boxes for the frame line on both sides of the caption.
void ExpectTextFits(HWND hwnd, HDC dc, const std::wstring& text)
{
    RECT client = {};
    GetClientRect(hwnd, &client);
    const std::wstring shown = Shown(text);
    if (ClassOf(hwnd) == kButton) {
        SIZE s = Measure(dc, shown, 0, false);
        EXPECT_LE(s.cx + 16, client.right) << Describe(hwnd) << ": text " << s.cx << " px, room "
                                           << client.right - 16;
        EXPECT_LE(s.cy, client.bottom) << Describe(hwnd);
        return;
    }
    SIZE s = Measure(dc, shown, client.right, false);
    EXPECT_LE(s.cx, client.right) << Describe(hwnd) << ": text " << s.cx << " px, control " << client.right;
    EXPECT_LE(s.cy, client.bottom) << Describe(hwnd) << ": text " << s.cy << " px high, control " << client.bottom;
}

std::wstring LoadText(UINT id)
{
    WCHAR buf[128] = {};
    int n = LoadStringW(ModuleInstance(), id, buf, 128);
    return std::wstring(buf, n > 0 ? n : 0);
}

}  // namespace

TEST(PrintAndHoldTemplate, EveryControlHasItsIdClassStyleAndText)
{
    Page page;
    ASSERT_NE(page.get(), nullptr);
    const std::vector<HWND> children = Children(page.get());
    const std::vector<Item> items = TemplateItems(IDD_138);
    ASSERT_EQ(items.size(), children.size());
    ASSERT_EQ(children.size(), Controls().size()) << "no control beyond those listed";
    for (size_t i = 0; i < Controls().size(); ++i) {
        const Control& c = Controls()[i];
        const std::string what = "control " + std::to_string(c.id);
        HWND h = children[i];
        EXPECT_EQ(IdOf(h), c.id) << "creation order";
        EXPECT_EQ(GetDlgItem(page.get(), c.id), h) << what;
        EXPECT_EQ(ClassOf(h), c.cls) << what;
        const DWORD on = c.style.on | WS_CHILD | WS_VISIBLE;
        const DWORD live = StyleOf(h);
        EXPECT_EQ(live & on & ~kCreationAltered, on & ~kCreationAltered)
            << what << std::hex << ": style 0x" << live << " lacks 0x" << (on & ~live & ~kCreationAltered);
        EXPECT_EQ(live & c.style.off, 0u) << what << std::hex << ": style 0x" << live << " has 0x"
                                           << (live & c.style.off);
        EXPECT_EQ(live & WS_DISABLED, 0u) << what;
        const DWORD written = items[i].style;
        EXPECT_EQ(written & on, on) << what << std::hex << ": template style 0x" << written << " lacks 0x"
                                    << (on & ~written);
        EXPECT_EQ(written & c.style.off, 0u) << what << std::hex << ": template style 0x" << written << " has 0x"
                                              << (written & c.style.off);
        if (written & WS_BORDER) {
            EXPECT_NE(GetWindowLongW(h, GWL_EXSTYLE) & WS_EX_CLIENTEDGE, 0) << what << ": sunken frame";
        }
        if (c.text) {
            EXPECT_EQ(Text(h), c.text) << what;
        }
    }
    // The PIN is typed blind; the user name is not.
    EXPECT_NE(SendDlgItemMessageW(page.get(), 1086, EM_GETPASSWORDCHAR, 0, 0), 0);
    EXPECT_EQ(SendDlgItemMessageW(page.get(), 1085, EM_GETPASSWORDCHAR, 0, 0), 0);
    // A page leaves the default button to its sheet.
    EXPECT_NE(StyleOf(page.get()) & WS_CHILD, 0u);
    for (HWND h : children)
        EXPECT_EQ(SendMessageW(h, WM_GETDLGCODE, 0, 0) & DLGC_DEFPUSHBUTTON, 0) << Describe(h);
}

TEST(PrintAndHoldTemplate, LabelsComeRightBeforeTheirFieldsAndTheFrameHoldsTheList)
{
    Page page;
    ASSERT_NE(page.get(), nullptr);
    const struct {
        int field;
        const WCHAR* label;
    } labelled[] = {{1085, kUserLabel}, {1086, kPinLabel}};
    for (const auto& l : labelled) {
        HWND field = GetDlgItem(page.get(), l.field);
        ASSERT_NE(field, nullptr) << l.field;
        HWND label = GetWindow(field, GW_HWNDPREV);
        ASSERT_NE(label, nullptr) << l.field;
        EXPECT_EQ(ClassOf(label), kStatic) << l.field;
        EXPECT_EQ(Text(label), l.label) << l.field;
        // The label's accelerator moves the focus on to the field.
        RECT rl = RectOf(page.get(), label), rf = RectOf(page.get(), field);
        EXPECT_TRUE(rl.bottom <= rf.top || rl.right <= rf.left) << l.field << ": label above or left of field";
    }
    HWND group = GetDlgItem(page.get(), 1052);
    HWND list = GetDlgItem(page.get(), 1084);
    ASSERT_NE(group, nullptr);
    ASSERT_NE(list, nullptr);
    ASSERT_TRUE(IsGroupBox(group));
    EXPECT_TRUE(Contains(RectOf(page.get(), group), RectOf(page.get(), list)));
    // The group's accelerator reaches the list, the next tab stop after it.
    EXPECT_EQ(GetNextDlgTabItem(page.get(), group, FALSE), list);
}

TEST(PrintAndHoldTemplate, TextsFitTheirControlsAndTheListShowsEveryOutputType)
{
    Page page;
    ASSERT_NE(page.get(), nullptr);
    HFONT font = reinterpret_cast<HFONT>(SendMessageW(page.get(), WM_GETFONT, 0, 0));
    ASSERT_NE(font, nullptr);
    WindowDC dc(page.get());
    ASSERT_NE(dc.get(), nullptr);
    HGDIOBJ old = SelectObject(dc.get(), font);
    int measured = 0;
    for (HWND h : Children(page.get())) {
        const std::wstring cls = ClassOf(h);
        const std::wstring text = Text(h);
        if (text.empty() || (cls != kButton && cls != kStatic))
            continue;
        ExpectTextFits(h, dc.get(), text);
        ++measured;
    }
    EXPECT_EQ(measured, 4);

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
        SIZE s = Measure(dc.get(), LoadText(id), 0, false);
        EXPECT_LE(s.cx + 4, client.right) << id;
    }
    // A full list scrolls.
    for (int i = 0; i < 20; ++i)
        SendMessageW(list, LB_ADDSTRING, 0, reinterpret_cast<LPARAM>(L"Печать с резервированием"));
    EXPECT_NE(StyleOf(list) & WS_VSCROLL, 0u);
    SelectObject(dc.get(), old);
}

TEST(PrintAndHoldTemplate, ControlsStayInsideThePageAndDoNotOverlap)
{
    Page page;
    ASSERT_NE(page.get(), nullptr);
    RECT client = {};
    GetClientRect(page.get(), &client);
    const std::vector<HWND> children = Children(page.get());
    for (size_t i = 0; i < children.size(); ++i) {
        RECT ri = RectOf(page.get(), children[i]);
        EXPECT_TRUE(Contains(client, ri)) << Describe(children[i]);
        EXPECT_GT(ri.right - ri.left, 0) << Describe(children[i]);
        EXPECT_GT(ri.bottom - ri.top, 0) << Describe(children[i]);
        for (size_t j = i + 1; j < children.size(); ++j) {
            RECT rj = RectOf(page.get(), children[j]), common = {};
            if (!IntersectRect(&common, &ri, &rj))
                continue;
            const bool framed = (IsGroupBox(children[i]) && Contains(ri, rj)) ||
                                (IsGroupBox(children[j]) && Contains(rj, ri));
            EXPECT_TRUE(framed) << Describe(children[i]) << " overlaps " << Describe(children[j]);
        }
    }
}
