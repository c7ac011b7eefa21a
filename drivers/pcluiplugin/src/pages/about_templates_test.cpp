// The about templates created as real windows: the same controls in all of
// them with their ids, classes, styles and texts, the maker's notice hidden
// only in the partner-brand variants, a layout in which no text is cut and no
// two visible controls collide; and the file-version list filled into a real
// list view from the simulated spooler.
#include "frame/module.h"
#include "pages/aboutpage.h"
#include "resources/resource.h"
#include "simspooler.h"

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
constexpr Bits Kind(DWORD mask, DWORD value) { return {value, mask & ~value}; }

const Bits kLine = Kind(SS_TYPEMASK, SS_LEFT) | On(SS_NOPREFIX);
const Bits kNotice = Kind(SS_TYPEMASK, SS_LEFT);
const Bits kFileList = Kind(LVS_TYPEMASK, LVS_REPORT) | On(LVS_SORTASCENDING | WS_BORDER | WS_TABSTOP) |
                       Off(LVS_SORTDESCENDING | LVS_NOCOLUMNHEADER);
const Bits kHiddenOk = Kind(BS_TYPEMASK, BS_PUSHBUTTON) | Off(WS_VISIBLE);

const WCHAR kStatic[] = L"Static";
const WCHAR kButton[] = L"Button";
const WCHAR kListView[] = L"SysListView32";
const WCHAR kNoticeText[] =
    L"© Norvane. Все права защищены. Использование программы регулируется лицензионным соглашением.";

struct Control {
    int id;
    const WCHAR* cls;
    Bits style;
    bool visible;
    const WCHAR* text;  // nullptr: not set by the template
};

struct Template {
    UINT id;
    bool noticeShown;
};

const Template kTemplates[] = {{IDD_108, true}, {IDD_109, true}, {IDD_137, true}, {IDD_233, false}, {IDD_234, false}};

std::vector<Control> ControlsOf(const Template& t)
{
    return {
        {IDC_ABOUT_DRIVER, kStatic, kLine, true, L"Драйвер"},
        {IDC_ABOUT_VERSION, kStatic, kLine, true, L"Версия"},
        {IDC_ABOUT_FILES, kListView, kFileList, true, nullptr},
        {IDC_ABOUT_NOTICE, kStatic, kNotice, t.noticeShown, kNoticeText},
        {IDOK, kButton, kHiddenOk, false, L"ОК"},
    };
}

// The dialog manager turns a 3-D dialog's WS_BORDER into WS_EX_CLIENTEDGE.
constexpr DWORD kCreationAltered = WS_BORDER;

INT_PTR CALLBACK InertDialogProc(HWND, UINT, WPARAM, LPARAM) { return FALSE; }

class Dialog {
public:
    explicit Dialog(UINT id)
    {
        INITCOMMONCONTROLSEX icc = {sizeof icc, ICC_LISTVIEW_CLASSES | ICC_STANDARD_CLASSES};
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

// The controls of a DIALOGEX template in creation order, as written.
std::vector<std::pair<int, DWORD>> TemplateItems(UINT id)
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
    auto skip = [](const BYTE* p) {
        auto* w = reinterpret_cast<const WORD*>(p);
        if (*w == 0xFFFF)
            return p + 2 * sizeof(WORD);
        while (*w++) {
        }
        return reinterpret_cast<const BYTE*>(w);
    };
    std::vector<std::pair<int, DWORD>> items;
    HRSRC r = FindResourceW(ModuleInstance(), MAKEINTRESOURCEW(id), RT_DIALOG);
    auto* base = r ? static_cast<const BYTE*>(LockResource(LoadResource(ModuleInstance(), r))) : nullptr;
    if (!base)
        return items;
    auto* head = reinterpret_cast<const Head*>(base);
    if (head->signature != 0xFFFF)
        return items;
    const BYTE* p = skip(skip(skip(base + sizeof(Head))));
    if (head->style & DS_SETFONT)
        p = skip(p + 2 * sizeof(WORD) + 2);
    for (WORD i = 0; i < head->cDlgItems; ++i) {
        p = base + ((p - base + 3) & ~static_cast<ptrdiff_t>(3));
        auto* item = reinterpret_cast<const ItemHead*>(p);
        items.push_back({static_cast<short>(LOWORD(item->id)), item->style});
        p = skip(skip(p + sizeof(ItemHead)));
        p += sizeof(WORD) + *reinterpret_cast<const WORD*>(p);
    }
    return items;
}

std::string Describe(UINT templateId, int id)
{
    return "template " + std::to_string(templateId) + ", control " + std::to_string(id);
}

// Fails unless text fits the static's client area, wrapped when the control
// is tall enough for two lines.
void ExpectTextFits(HWND hwnd, HDC dc, const std::wstring& text, const std::string& what)
{
    RECT client = {};
    GetClientRect(hwnd, &client);
    TEXTMETRICW tm = {};
    GetTextMetricsW(dc, &tm);
    const bool multiline = client.bottom >= 2 * tm.tmHeight;
    RECT r = {0, 0, multiline ? client.right : 0, 0};
    DrawTextW(dc, text.c_str(), -1, &r, DT_CALCRECT | DT_NOPREFIX | (multiline ? DT_WORDBREAK : DT_SINGLELINE));
    EXPECT_LE(r.right, client.right) << what << ": text " << r.right << " px, control " << client.right;
    EXPECT_LE(r.bottom, client.bottom) << what << ": text " << r.bottom << " px high, control " << client.bottom;
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
    for (const Template& t : kTemplates) {
        SCOPED_TRACE("template " + std::to_string(t.id));
        Dialog dlg(t.id);
        ASSERT_NE(dlg.get(), nullptr);
        const std::vector<HWND> children = Children(dlg.get());
        const auto items = TemplateItems(t.id);
        const std::vector<Control> controls = ControlsOf(t);
        ASSERT_EQ(items.size(), children.size());
        EXPECT_EQ(children.size(), controls.size()) << "no control beyond those listed";
        for (const Control& c : controls) {
            const std::string what = Describe(t.id, c.id);
            HWND h = GetDlgItem(dlg.get(), c.id);
            ASSERT_NE(h, nullptr) << what;
            EXPECT_EQ(ClassOf(h), c.cls) << what;
            const DWORD on = c.style.on | WS_CHILD;
            const DWORD live = StyleOf(h);
            EXPECT_EQ(live & on & ~kCreationAltered, on & ~kCreationAltered) << what << std::hex << ": style 0x" << live;
            EXPECT_EQ(live & c.style.off, 0u) << what << std::hex << ": style 0x" << live;
            EXPECT_EQ((live & WS_VISIBLE) != 0, c.visible) << what;
            EXPECT_EQ(live & WS_DISABLED, 0u) << what;
            size_t index = 0;
            while (index < children.size() && children[index] != h)
                ++index;
            ASSERT_LT(index, items.size()) << what;
            EXPECT_EQ(items[index].first, c.id) << what;
            EXPECT_EQ(items[index].second & on, on) << what << std::hex << ": template style 0x" << items[index].second;
            if (on & WS_BORDER) {
                EXPECT_NE(GetWindowLongW(h, GWL_EXSTYLE) & WS_EX_CLIENTEDGE, 0) << what << ": sunken frame";
            }
            if (c.text) {
                EXPECT_EQ(Text(h), c.text) << what;
            }
        }
    }
}

TEST(AboutTemplates, PagesLeaveTheDefaultButtonToTheSheet)
{
    for (const Template& t : kTemplates) {
        SCOPED_TRACE("template " + std::to_string(t.id));
        Dialog dlg(t.id);
        ASSERT_NE(dlg.get(), nullptr);
        EXPECT_NE(StyleOf(dlg.get()) & WS_CHILD, 0u);
        for (HWND h : Children(dlg.get()))
            EXPECT_EQ(SendMessageW(h, WM_GETDLGCODE, 0, 0) & DLGC_DEFPUSHBUTTON, 0) << IdOf(h);
    }
}

TEST(AboutTemplates, TextsFitAndVisibleControlsDoNotOverlap)
{
    for (const Template& t : kTemplates) {
        SCOPED_TRACE("template " + std::to_string(t.id));
        Dialog dlg(t.id);
        ASSERT_NE(dlg.get(), nullptr);
        HFONT font = reinterpret_cast<HFONT>(SendMessageW(dlg.get(), WM_GETFONT, 0, 0));
        ASSERT_NE(font, nullptr);
        HDC dc = GetDC(dlg.get());
        ASSERT_NE(dc, nullptr);
        HGDIOBJ old = SelectObject(dc, font);
        for (const Control& c : ControlsOf(t)) {
            HWND h = GetDlgItem(dlg.get(), c.id);
            ASSERT_NE(h, nullptr);
            if (c.text && c.cls == kStatic)
                ExpectTextFits(h, dc, c.text, Describe(t.id, c.id));
        }
        // The lines as the page writes them, with a driver name of ordinary length.
        ExpectTextFits(GetDlgItem(dlg.get(), IDC_ABOUT_DRIVER), dc, L"Драйвер Norvane LaserJet PCL 6 Universal",
                       Describe(t.id, IDC_ABOUT_DRIVER));
        ExpectTextFits(GetDlgItem(dlg.get(), IDC_ABOUT_VERSION), dc, L"Версия 1.0", Describe(t.id, IDC_ABOUT_VERSION));
        SelectObject(dc, old);
        ReleaseDC(dlg.get(), dc);

        RECT client = {};
        GetClientRect(dlg.get(), &client);
        const std::vector<HWND> children = Children(dlg.get());
        for (size_t i = 0; i < children.size(); ++i) {
            RECT ri = RectOf(dlg.get(), children[i]);
            EXPECT_TRUE(Contains(client, ri)) << Describe(t.id, IdOf(children[i]));
            EXPECT_GT(ri.right - ri.left, 0) << Describe(t.id, IdOf(children[i]));
            EXPECT_GT(ri.bottom - ri.top, 0) << Describe(t.id, IdOf(children[i]));
            // A hidden control takes no room on the page.
            if (!(StyleOf(children[i]) & WS_VISIBLE))
                continue;
            for (size_t j = i + 1; j < children.size(); ++j) {
                if (!(StyleOf(children[j]) & WS_VISIBLE))
                    continue;
                RECT rj = RectOf(dlg.get(), children[j]), common = {};
                EXPECT_FALSE(IntersectRect(&common, &ri, &rj))
                    << Describe(t.id, IdOf(children[i])) << " overlaps " << IdOf(children[j]);
            }
        }
    }
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
