#include "templatecheck.h"

#include "frame/module.h"

#include <gtest/gtest.h>

namespace templatecheck {

namespace {

// Style bits that creation moves elsewhere: the dialog manager turns a 3-D
// dialog's WS_BORDER into WS_EX_CLIENTEDGE, and scroll bars leave the style
// while there is nothing to scroll. They are checked in the template and,
// live, by what they do.
constexpr DWORD kCreationAltered = WS_BORDER | WS_VSCROLL | WS_HSCROLL;

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

INT_PTR CALLBACK InertDialogProc(HWND, UINT, WPARAM, LPARAM) { return FALSE; }

std::string Utf8(const std::wstring& text)
{
    int n = WideCharToMultiByte(CP_UTF8, 0, text.c_str(), -1, nullptr, 0, nullptr, nullptr);
    if (n <= 1)
        return {};
    std::string out(n - 1, '\0');
    WideCharToMultiByte(CP_UTF8, 0, text.c_str(), -1, &out[0], n, nullptr, nullptr);
    return out;
}

std::string Describe(UINT templateId, const Control& c)
{
    std::string out = "template " + std::to_string(templateId) + ", control " + std::to_string(c.id);
    if (c.id == kUnnumbered && c.text)
        out += " \"" + Utf8(c.text) + "\"";
    return out;
}

}  // namespace

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
        items.push_back({static_cast<short>(LOWORD(item->id)), item->style});
        p = SkipSzOrOrd(SkipSzOrOrd(p + sizeof(ItemHead)));  // class, title
        WORD extra = *reinterpret_cast<const WORD*>(p);
        p += sizeof(WORD) + extra;
    }
    return items;
}

Dialog::Dialog(UINT id)
{
    INITCOMMONCONTROLSEX icc = {sizeof icc,
                                ICC_STANDARD_CLASSES | ICC_UPDOWN_CLASS | ICC_BAR_CLASSES | ICC_LISTVIEW_CLASSES};
    InitCommonControlsEx(&icc);
    parent_ = CreateWindowExW(0, L"Static", L"", WS_OVERLAPPEDWINDOW, 0, 0, 900, 700, nullptr, nullptr, nullptr,
                              nullptr);
    if (parent_)
        hwnd_ = CreateDialogParamW(ModuleInstance(), MAKEINTRESOURCEW(id), parent_, InertDialogProc, 0);
}

Dialog::~Dialog()
{
    if (hwnd_)
        DestroyWindow(hwnd_);
    if (parent_)
        DestroyWindow(parent_);
}

FontDC::FontDC(HWND dlg) : hwnd_(dlg), dc_(GetDC(dlg))
{
    HFONT font = reinterpret_cast<HFONT>(SendMessageW(dlg, WM_GETFONT, 0, 0));
    if (dc_ && font)
        old_ = SelectObject(dc_, font);
}

FontDC::~FontDC()
{
    if (old_)
        SelectObject(dc_, old_);
    if (dc_)
        ReleaseDC(hwnd_, dc_);
}

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
                return nullptr;
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
    std::string out = "control " + std::to_string(IdOf(hwnd)) + " (";
    const std::string text = Utf8(Text(hwnd));
    if (!text.empty())
        out += "\"" + text + "\" ";
    const std::wstring cls = ClassOf(hwnd);
    return out + std::string(cls.begin(), cls.end()) + ")";
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

SIZE Measure(HDC dc, const std::wstring& text, int width, bool wrap)
{
    RECT r = {0, 0, wrap ? width : 0, 0};
    DrawTextW(dc, text.c_str(), -1, &r, DT_CALCRECT | DT_NOPREFIX | (wrap ? DT_WORDBREAK : DT_SINGLELINE));
    return {r.right - r.left, r.bottom - r.top};
}

std::wstring LoadText(UINT id)
{
    WCHAR buf[256] = {};
    const int n = LoadStringW(ModuleInstance(), id, buf, 256);
    return std::wstring(buf, n > 0 ? n : 0);
}

void ExpectTextFits(HWND hwnd, HDC dc, const std::wstring& text, Lines lines)
{
    RECT client = {};
    GetClientRect(hwnd, &client);
    const int width = client.right, height = client.bottom;
    const std::wstring cls = ClassOf(hwnd);
    // A static with SS_NOPREFIX draws its ampersands.
    const bool prefixes = !(cls == kStatic && (StyleOf(hwnd) & SS_NOPREFIX));
    const std::wstring shown = prefixes ? Shown(text) : text;

    if (cls == kButton) {
        const DWORD type = StyleOf(hwnd) & BS_TYPEMASK;
        const int reserve = type == BS_PUSHBUTTON || type == BS_DEFPUSHBUTTON ? 8 : 16;
        SIZE s = Measure(dc, shown);
        EXPECT_LE(s.cx + reserve, width) << Describe(hwnd) << ": text " << s.cx << " px, room " << width - reserve;
        EXPECT_LE(s.cy, height) << Describe(hwnd) << ": text " << s.cy << " px high, control " << height;
        return;
    }
    TEXTMETRICW tm = {};
    GetTextMetricsW(dc, &tm);
    const bool wrap = lines == Lines::AsRoomAllows && height >= 2 * tm.tmHeight;
    SIZE s = Measure(dc, shown, width, wrap);
    EXPECT_LE(s.cx, width) << Describe(hwnd) << ": text " << s.cx << " px, control " << width;
    EXPECT_LE(s.cy, height) << Describe(hwnd) << ": text " << s.cy << " px high, control " << height;
}

int ExpectTextsFit(HWND dlg, HDC dc, Lines lines)
{
    int measured = 0;
    for (HWND h : Children(dlg)) {
        const std::wstring text = Text(h);
        if (text.empty() || ClassOf(h) == kComboBox)
            continue;
        ExpectTextFits(h, dc, text, lines);
        ++measured;
    }
    return measured;
}

void ExpectControls(HWND dlg, UINT templateId, const std::vector<Control>& controls, Order order)
{
    const std::vector<HWND> children = Children(dlg);
    const std::vector<Item> items = TemplateItems(templateId);
    ASSERT_EQ(items.size(), children.size());
    EXPECT_EQ(children.size(), controls.size()) << "no control beyond those listed";
    for (size_t i = 0; i < controls.size(); ++i) {
        const Control& c = controls[i];
        const std::string what = Describe(templateId, c);
        HWND h = Find(dlg, {c.id, c.text});
        ASSERT_NE(h, nullptr) << what;
        size_t index = 0;
        while (index < children.size() && children[index] != h)
            ++index;
        ASSERT_LT(index, items.size()) << what;
        if (order == Order::Listed) {
            EXPECT_EQ(index, i) << what << " is created in its listed place";
        }
        EXPECT_EQ(IdOf(h), c.id) << what;
        EXPECT_EQ(items[index].id, IdOf(h)) << what;
        EXPECT_EQ(ClassOf(h), c.cls) << what;

        const DWORD on = c.style.on | WS_CHILD | (c.style.off & WS_VISIBLE ? 0 : WS_VISIBLE);
        const DWORD live = StyleOf(h);
        EXPECT_EQ(live & on & ~kCreationAltered, on & ~kCreationAltered)
            << what << std::hex << ": style 0x" << live << " lacks 0x" << (on & ~live & ~kCreationAltered);
        EXPECT_EQ(live & c.style.off, 0u) << what << std::hex << ": style 0x" << live << " has 0x"
                                           << (live & c.style.off);
        // The code decides what is disabled, unless the table says otherwise.
        EXPECT_EQ((live & WS_DISABLED) != 0, (c.style.on & WS_DISABLED) != 0) << what;

        const DWORD written = items[index].style;
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
}

void ExpectDefaultButton(HWND dlg, int defaultButton)
{
    const bool page = (StyleOf(dlg) & WS_CHILD) != 0;
    EXPECT_EQ(page, defaultButton == 0) << "a page leaves the default button to the sheet";
    int defaults = 0;
    for (HWND h : Children(dlg))
        if (SendMessageW(h, WM_GETDLGCODE, 0, 0) & DLGC_DEFPUSHBUTTON) {
            ++defaults;
            EXPECT_EQ(IdOf(h), defaultButton) << Describe(h);
        }
    EXPECT_EQ(defaults, page ? 0 : 1);
    if (!page) {
        const LRESULT def = SendMessageW(dlg, DM_GETDEFID, 0, 0);
        EXPECT_EQ(HIWORD(def), DC_HASDEFID);
        EXPECT_EQ(LOWORD(def), defaultButton);
    }
}

void ExpectLabelLeads(HWND dlg, const Labelled& l)
{
    HWND field = GetDlgItem(dlg, l.field);
    ASSERT_NE(field, nullptr) << l.field;
    HWND label = GetWindow(field, GW_HWNDPREV);
    ASSERT_NE(label, nullptr) << l.field;
    EXPECT_EQ(ClassOf(label), kStatic) << l.field;
    EXPECT_EQ(Text(label), l.label) << l.field;
    EXPECT_EQ(StyleOf(label) & WS_TABSTOP, 0u) << l.field;
    EXPECT_NE(StyleOf(field) & WS_TABSTOP, 0u) << l.field;
    EXPECT_EQ(GetNextDlgTabItem(dlg, label, FALSE), field) << l.field;
    RECT rl = RectOf(dlg, label), rf = RectOf(dlg, field);
    EXPECT_TRUE(rl.bottom <= rf.top || rl.right <= rf.left) << l.field << ": label above or left of field";
}

void ExpectFrame(HWND dlg, const Frame& f)
{
    HWND group = Find(dlg, f.group);
    ASSERT_NE(group, nullptr) << "group " << f.group.id;
    ASSERT_TRUE(IsGroupBox(group)) << Describe(group);
    const RECT rg = RectOf(dlg, group);
    for (int id : f.members) {
        HWND member = GetDlgItem(dlg, id);
        ASSERT_NE(member, nullptr) << id;
        EXPECT_TRUE(Contains(rg, RectOf(dlg, member))) << Describe(member) << " inside " << Describe(group);
    }
}

void ExpectInsideAndApart(HWND dlg)
{
    RECT client = {};
    GetClientRect(dlg, &client);
    const std::vector<HWND> children = Children(dlg);
    auto visible = [](HWND h) { return (StyleOf(h) & WS_VISIBLE) != 0; };
    for (size_t i = 0; i < children.size(); ++i) {
        const RECT ri = RectOf(dlg, children[i]);
        EXPECT_TRUE(Contains(client, ri)) << Describe(children[i]);
        EXPECT_GT(ri.right - ri.left, 0) << Describe(children[i]);
        EXPECT_GT(ri.bottom - ri.top, 0) << Describe(children[i]);
        // A hidden control takes no room.
        if (!visible(children[i]))
            continue;
        for (size_t j = i + 1; j < children.size(); ++j) {
            RECT rj = RectOf(dlg, children[j]), common = {};
            if (!visible(children[j]) || !IntersectRect(&common, &ri, &rj))
                continue;
            const bool framed = (IsGroupBox(children[i]) && Contains(ri, rj)) ||
                                (IsGroupBox(children[j]) && Contains(rj, ri));
            EXPECT_TRUE(framed || IsBuddyPair(children[i], children[j]))
                << Describe(children[i]) << " overlaps " << Describe(children[j]);
        }
    }
}

}  // namespace templatecheck
