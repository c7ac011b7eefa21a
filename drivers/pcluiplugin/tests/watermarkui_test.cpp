// The watermark page and its dialogs in a real property sheet of the DLL,
// driven as a user drives them: clicks, typing, tab switches and Apply,
// with the modal dialogs answered by scripts and message boxes recorded.
#include "frame/oemdevmode.h"
#include "plugin_dll.h"
#include "resources/resource.h"
#include "simhost.h"
#include "simrender.h"
#include "simspooler.h"
#include "uidriver.h"
#include "watermark/wmrecord.h"

#include <commctrl.h>
#include <gtest/gtest.h>
#include <winddiui.h>
#include <algorithm>
#include <cstring>
#include <memory>
#include <string>
#include <vector>

namespace {

const wchar_t kDriver[] = L"Norvane PCL 6";
const wchar_t kStoreKey[] = L"Software\\Norvane\\PCLPlugIn\\Norvane PCL 6\\Watermark";
constexpr int kApplyButton = 0x3021;

WATERMARK Record(const wchar_t* name, const wchar_t* text, COLORREF colour = RGB(0, 0, 0))
{
    WATERMARK wm = {};
    lstrcpynW(wm.szName, name, 128);
    lstrcpynW(wm.szText, text, 128);
    wm.crColor = colour;
    wm.bIntensity = 100;
    lstrcpynW(wm.lfFont.lfFaceName, L"Arial", LF_FACESIZE);
    wm.lfFont.lfWeight = FW_BOLD;
    wm.iPointSize = 48;
    wm.iVertPos = WM_POS_CENTRE;
    wm.iHorzPos = WM_POS_CENTRE;
    wm.iUnits = WM_UNITS_INCHES;
    return wm;
}

void Store(const std::vector<WATERMARK>& records)
{
    HKEY key = nullptr;
    ASSERT_EQ(RegCreateKeyExW(HKEY_CURRENT_USER, kStoreKey, 0, nullptr, 0, KEY_WRITE, nullptr, &key, nullptr),
              ERROR_SUCCESS);
    for (const WATERMARK& wm : records)
        RegSetValueExW(key, wm.szName, 0, REG_BINARY, reinterpret_cast<const BYTE*>(&wm), sizeof(wm));
    RegCloseKey(key);
}

// The store as the page left it: name -> record.
std::vector<WATERMARK> Stored()
{
    std::vector<WATERMARK> out;
    HKEY key = nullptr;
    if (RegOpenKeyExW(HKEY_CURRENT_USER, kStoreKey, 0, KEY_READ, &key) != ERROR_SUCCESS)
        return out;
    for (DWORD i = 0;; ++i) {
        WCHAR name[256];
        DWORD cch = 256, type = 0, cb = sizeof(WATERMARK);
        WATERMARK wm = {};
        if (RegEnumValueW(key, i, name, &cch, nullptr, &type, reinterpret_cast<BYTE*>(&wm), &cb) != ERROR_SUCCESS)
            break;
        out.push_back(wm);
    }
    RegCloseKey(key);
    return out;
}

bool HasStored(const wchar_t* name)
{
    for (const WATERMARK& wm : Stored())
        if (lstrcmpW(wm.szName, name) == 0)
            return true;
    return false;
}

int IndexOf(const std::vector<std::wstring>& items, const std::wstring& s)
{
    auto it = std::find(items.begin(), items.end(), s);
    return it == items.end() ? -1 : static_cast<int>(it - items.begin());
}

struct WatermarkUiTest : ::testing::Test {
    static void SetUpTestSuite() { InstallMessageBoxRecorder(PluginDll()); }
    void SetUp() override
    {
        SimResetSpooler();
        ClearPluginRegistry();
        TheMessageBoxes().clear();
        ClearDialogScripts();
        host = std::make_unique<SimHost>(CreatePluginObject(), L"Norvane LaserJet", kDriver);
    }
    void TearDown() override
    {
        EXPECT_EQ(PendingDialogScripts(), 0u) << "a dialog the test expected did not open";
        ClearDialogScripts();
        host->Destroy();
        host.reset();
        SimResetSpooler();
    }
    // Builds the sheet, shows it and returns the watermark page.
    HWND Open()
    {
        EXPECT_EQ(host->InitDocumentSheet(), S_OK);
        EXPECT_NE(host->ShowSheet(), nullptr);
        EXPECT_TRUE(host->SelectPage(104));
        page = host->PageWindow(104);
        EXPECT_NE(page, nullptr);
        return page;
    }
    bool SheetChanged() const { return IsWindowEnabled(GetDlgItem(host->Sheet(), kApplyButton)) != FALSE; }
    // Leaves the page for the profiles page; FALSE when the page refused.
    bool Leave() { return host->SelectPage(221); }
    void Back() { ASSERT_TRUE(host->SelectPage(104)); }
    // Runs the add/edit dialog from Add with script.
    void Add(DialogScript script)
    {
        QueueDialog(std::move(script));
        Click(page, 1039);
    }
    static void Fill(HWND dlg, const wchar_t* name, const wchar_t* text)
    {
        TypeInto(dlg, 1043, name);
        TypeInto(dlg, 1004, text);
    }
    std::wstring LastMessage() const { return TheMessageBoxes().empty() ? L"" : TheMessageBoxes().back().text; }
    std::unique_ptr<SimHost> host;
    HWND page = nullptr;
};

}  // namespace

TEST_F(WatermarkUiTest, EmptyStoreOffersOnlyTheNoneEntry)
{
    Open();
    EXPECT_EQ(ListItems(page, 1037), std::vector<std::wstring>{L"(Нет)"});
    EXPECT_EQ(ListItems(page, 1038), std::vector<std::wstring>{L"(Нет)"});
    EXPECT_TRUE(IsChecked(page, 1031));
    EXPECT_TRUE(IsChecked(page, 1042));
    for (int id : {1037, 1038, 1042, 1061, 1040, 1049})
        EXPECT_FALSE(IsEnabled(page, id)) << id;
    for (int id : {1031, 1032, 1033, 1034, 1039})
        EXPECT_TRUE(IsEnabled(page, id)) << id;

    // Asking for watermarks without defining one keeps the user on the page.
    Click(page, 1032);
    EXPECT_TRUE(IsEnabled(page, 1037));
    EXPECT_EQ(ItemText(page, 1035), L"Все стран&ицы");
    EXPECT_FALSE(IsEnabled(page, 1042)) << "placement needs a watermark";
    EXPECT_FALSE(Leave());
    ASSERT_EQ(TheMessageBoxes().size(), 1u);
    EXPECT_EQ(TheMessageBoxes()[0].text, L"Выберите хотя бы один водяной знак.");
    EXPECT_EQ(TheMessageBoxes()[0].caption, L"Ошибка");
    EXPECT_EQ(TheMessageBoxes()[0].type & MB_ICONMASK, UINT(MB_ICONHAND));
    Click(page, 1031);
    EXPECT_TRUE(Leave());
}

TEST_F(WatermarkUiTest, StoredModeShowsThroughEitherNameAndLeavingStoresIt)
{
    Store({Record(L"Черновик", L"ЧЕРНОВИК"), Record(L"Копия", L"КОПИЯ")});
    host->oem.iOrder = 2;
    host->oem.WMARK2 = Record(L"копия", L"");  // found ignoring case
    host->oem.iPlacement = 0;                  // anything but 8 is under the page
    Open();
    const std::vector<std::wstring> names = ListItems(page, 1037);
    const int copy = IndexOf(names, L"Копия"), draft = IndexOf(names, L"Черновик");
    ASSERT_GT(copy, 0);
    ASSERT_GT(draft, 0);
    EXPECT_TRUE(IsChecked(page, 1033));
    EXPECT_FALSE(IsChecked(page, 1031));
    EXPECT_EQ(ListSelection(page, 1037), 0);
    EXPECT_EQ(ListSelection(page, 1038), copy);
    EXPECT_EQ(ItemText(page, 1035), L"Первая с&траница");
    EXPECT_EQ(ItemText(page, 1036), L"&Остальные страницы");
    EXPECT_TRUE(IsChecked(page, 1042));
    EXPECT_TRUE(IsEnabled(page, 1040));

    // Odd/even with a first-page watermark and over the page.
    Click(page, 1034);
    EXPECT_EQ(ItemText(page, 1035), L"Нечетные с&траницы");
    SelectListItem(page, 1037, draft);
    Click(page, 1061);
    EXPECT_TRUE(SheetChanged());
    ASSERT_TRUE(Leave());
    Back();
    EXPECT_TRUE(IsChecked(page, 1034));
    EXPECT_EQ(ListSelection(page, 1037), draft);
    EXPECT_EQ(ListSelection(page, 1038), copy);
    EXPECT_TRUE(IsChecked(page, 1061));

    ASSERT_TRUE(host->Apply());
    EXPECT_EQ(host->oem.iOrder, 4);
    EXPECT_EQ(host->oem.iPlacement, 8);
    WATERMARK want1 = Record(L"Черновик", L"ЧЕРНОВИК");
    want1.bSelected = 1;
    EXPECT_EQ(std::memcmp(&host->oem.WMARK1, &want1, sizeof(want1)), 0);
    EXPECT_STREQ(host->oem.WMARK2.szName, L"Копия");
    EXPECT_EQ(host->oem.WMARK2.bSelected, 1);

    // All pages: the second group gets a zero record.
    Click(page, 1032);
    EXPECT_FALSE(IsEnabled(page, 1038));
    EXPECT_EQ(ListSelection(page, 1038), 0);
    ASSERT_TRUE(host->Apply());
    EXPECT_EQ(host->oem.iOrder, 1);
    const WATERMARK zero = {};
    EXPECT_EQ(std::memcmp(&host->oem.WMARK2, &zero, sizeof(zero)), 0);
}

TEST_F(WatermarkUiTest, ModeWhoseWatermarksAreGoneShowsAsNone)
{
    Store({Record(L"Черновик", L"ЧЕРНОВИК")});
    host->oem.iOrder = 2;
    host->oem.WMARK1 = Record(L"Удалённый", L"x");
    host->oem.WMARK2 = Record(L"Другой", L"y");
    Open();
    EXPECT_TRUE(IsChecked(page, 1031));
    EXPECT_TRUE(IsEnabled(page, 1037)) << "the lists stay enabled for the stored mode";
    EXPECT_TRUE(IsEnabled(page, 1042));
    ASSERT_TRUE(Leave());
    ASSERT_TRUE(host->Apply());
    EXPECT_EQ(host->oem.iOrder, 0);
    const WATERMARK zero = {};
    EXPECT_EQ(std::memcmp(&host->oem.WMARK1, &zero, sizeof(zero)), 0);
}

TEST_F(WatermarkUiTest, AddingChecksTheNameAndStoresTheDefinition)
{
    Store({Record(L"Draft", L"DRAFT")});
    Open();
    EXPECT_FALSE(SheetChanged());
    std::wstring face;
    Add([this, &face](HWND dlg) {
        EXPECT_EQ(WindowText(dlg), L"Добавить водяной знак");
        face = ItemText(dlg, 1006);  // "Arial" where it is installed, else the first face
        EXPECT_FALSE(face.empty());
        EXPECT_FALSE(IsEnabled(dlg, IDOK));
        Fill(dlg, L"   ", L"текст");
        EXPECT_FALSE(IsEnabled(dlg, IDOK)) << "a name of spaces only";
        Fill(dlg, L"DRAFT", L"текст");
        ASSERT_TRUE(IsEnabled(dlg, IDOK));
        Click(dlg, IDOK);
        EXPECT_EQ(LastMessage(), L"Водяной знак с указанным именем уже существует.  Введите другое имя.");
        EXPECT_EQ(GetFocus(), GetDlgItem(dlg, 1043));
        Fill(dlg, L"(Нет)", L"текст");
        Click(dlg, IDOK);
        EXPECT_EQ(LastMessage(), L"Нельзя создать водяной знак без имени.  Введите другое имя.");
        ASSERT_TRUE(IsWindow(dlg));
        Fill(dlg, L"Отпечатал  ", L"Отпечатал %Имяпользователя%");
        Click(dlg, 1216);
        EXPECT_TRUE(IsEnabled(dlg, 1003));
        SelectListItem(dlg, 1009, 10);  // red
        Click(dlg, 1012);               // bold
        Click(dlg, IDOK);
    });
    EXPECT_EQ(TheMessageBoxes().size(), 2u);
    EXPECT_EQ(ListItems(page, 1037), (std::vector<std::wstring>{L"(Нет)", L"Draft", L"Отпечатал"}));
    EXPECT_FALSE(SheetChanged()) << "adding does not change the job's settings";
    ASSERT_TRUE(HasStored(L"Отпечатал"));
    for (const WATERMARK& wm : Stored()) {
        if (lstrcmpW(wm.szName, L"Отпечатал") != 0)
            continue;
        EXPECT_STREQ(wm.szText, L"Отпечатал %Имяпользователя%");
        EXPECT_EQ(wm.bDynamic, 1);
        EXPECT_EQ(wm.crColor, COLORREF(0x0000FF));
        EXPECT_EQ(wm.lfFont.lfWeight, FW_BOLD);
        EXPECT_EQ(wm.iPointSize, 72);
        EXPECT_EQ(wm.bIntensity, 100);
        EXPECT_EQ(std::wstring(wm.lfFont.lfFaceName), face);
        EXPECT_EQ(wm.iUnits, WM_UNITS_INCHES);
    }

    // "(нет)" is just a name; the own name in other capitals is fine.
    Add([](HWND dlg) {
        Fill(dlg, L"(нет)", L"x");
        Click(dlg, IDOK);
    });
    EXPECT_TRUE(HasStored(L"(нет)"));
    SelectListItem(page, 1037, 1);  // not used by the job yet; the edit below makes it so
    QueueDialog([](HWND choose) {
        EXPECT_EQ(ListItems(choose, 1169).size(), 3u);
        EXPECT_EQ(ListSelection(choose, 1169), 0);
        Click(choose, IDOK);
    });
    QueueDialog([](HWND dlg) {
        EXPECT_EQ(WindowText(dlg), L"Редактировать водяной знак");
        EXPECT_EQ(ItemText(dlg, 1043), L"Draft");
        TypeInto(dlg, 1043, L"draft");
        Click(dlg, IDOK);
    });
    Click(page, 1049);
    EXPECT_EQ(ListItems(page, 1037)[1], L"draft");
    EXPECT_EQ(ListSelection(page, 1037), 1);
    EXPECT_TRUE(SheetChanged());
    EXPECT_TRUE(HasStored(L"draft"));
    EXPECT_FALSE(HasStored(L"Draft"));
}

TEST_F(WatermarkUiTest, TypedFieldsFallBackToAcceptedValues)
{
    WATERMARK odd = Record(L"Серый", L"x", 0x123456);
    lstrcpynW(odd.lfFont.lfFaceName, L"Norvane Missing Sans", LF_FACESIZE);
    Store({odd});
    Open();
    Add([](HWND dlg) {
        TypeInto(dlg, 1022, L"2a");
        EXPECT_EQ(ItemText(dlg, 1022), L"2");
        TypeInto(dlg, 1022, L"24");
        TypeAtEnd(dlg, 1022, std::wstring(2, L'\b'));
        EXPECT_EQ(ItemText(dlg, 1022), L"2");
        TypeInto(dlg, 1022, L"999");  // 9, 99, then 999 is too big
        EXPECT_EQ(ItemText(dlg, 1022), L"99");
        TypeInto(dlg, 1023, L"0");
        EXPECT_EQ(ItemText(dlg, 1023), L"100");
        TypeInto(dlg, 1023, L"55");
        EXPECT_EQ(ItemText(dlg, 1023), L"55");
        TypeInto(dlg, 1098, L"45");
        TypeAtEnd(dlg, 1098, L"0");
        EXPECT_EQ(ItemText(dlg, 1098), L"45");
        TypeInto(dlg, 1098, L"-");
        EXPECT_EQ(ItemText(dlg, 1098), L"45");
        TypeInto(dlg, 1098, L"30");
        TypeAtStart(dlg, 1098, L"-");
        EXPECT_EQ(ItemText(dlg, 1098), L"-30");
        Click(dlg, IDCANCEL);
    });
    EXPECT_EQ(Stored().size(), 1u);

    // A colour outside the table and a face that is not installed show no
    // selection and survive OK.
    QueueDialog([](HWND choose) { Click(choose, IDOK); });
    QueueDialog([](HWND dlg) {
        EXPECT_EQ(ListSelection(dlg, 1009), -1);
        EXPECT_EQ(ListSelection(dlg, 1006), -1);
        EXPECT_EQ(ItemText(dlg, 1022), L"48");
        Click(dlg, IDOK);
    });
    Click(page, 1049);
    ASSERT_EQ(Stored().size(), 1u);
    EXPECT_EQ(Stored()[0].crColor, COLORREF(0x123456));
    EXPECT_STREQ(Stored()[0].lfFont.lfFaceName, L"Norvane Missing Sans");
}

TEST_F(WatermarkUiTest, PlacementOffsetsAreCheckedAndConvertedAsTyped)
{
    Open();
    Add([this](HWND dlg) {
        Fill(dlg, L"Угол", L"УГОЛ");
        QueueDialog([](HWND pl) {
            EXPECT_EQ(ItemText(pl, 1231), L"0.0");
            EXPECT_TRUE(IsChecked(pl, 1221) && IsChecked(pl, 1228) && IsChecked(pl, 1234));
            TypeInto(pl, 1231, L"12.3");
            TypeAtEnd(pl, 1231, L".");
            EXPECT_EQ(ItemText(pl, 1231), L"12.3");
            TypeInto(pl, 1231, L"1");
            TypeAtEnd(pl, 1231, L"-");
            EXPECT_EQ(ItemText(pl, 1231), L"1.0");
            TypeInto(pl, 1231, L"1.27");
            TypeAtEnd(pl, 1231, L"x");
            EXPECT_EQ(ItemText(pl, 1231), L"1.2");
            TypeInto(pl, 1224, L"1000");
            TypeAtEnd(pl, 1224, L"0");
            EXPECT_EQ(ItemText(pl, 1224), L"1000.0");
            TypeInto(pl, 1224, L"9999.9");
            PressKey(GetDlgItem(pl, 1224), VK_UP);
            EXPECT_EQ(ItemText(pl, 1224), L"9999.9");
            Click(pl, 1235);  // to millimetres
            EXPECT_EQ(ItemText(pl, 1224), L"253997.4");
            TypeInto(pl, 1231, L"10000");
            EXPECT_EQ(ItemText(pl, 1231), L"10000");
            TypeInto(pl, 1231, L"100.0");
            Click(pl, 1234);
            EXPECT_EQ(ItemText(pl, 1231), L"3.9");
            Click(pl, 1235);
            EXPECT_EQ(ItemText(pl, 1231), L"99.1");
            Click(pl, 1220);
            Click(pl, 1229);
            Click(pl, IDOK);
        });
        Click(dlg, 1217);
        // A cancelled placement in add mode forgets the accepted one.
        QueueDialog([](HWND pl) {
            EXPECT_TRUE(IsChecked(pl, 1220) && IsChecked(pl, 1229) && IsChecked(pl, 1235));
            EXPECT_EQ(ItemText(pl, 1231), L"99.1");
            Click(pl, 1237);
            EXPECT_TRUE(IsChecked(pl, 1221) && IsChecked(pl, 1228) && IsChecked(pl, 1235));
            EXPECT_EQ(ItemText(pl, 1224), L"0.0");
            Click(pl, IDCANCEL);
        });
        Click(dlg, 1217);
        QueueDialog([](HWND pl) {
            EXPECT_TRUE(IsChecked(pl, 1221) && IsChecked(pl, 1228) && IsChecked(pl, 1234));
            TypeInto(pl, 1231, L"2.5");
            TypeAtStart(pl, 1231, L"-");
            EXPECT_EQ(ItemText(pl, 1231), L"-2.5");
            Click(pl, 1227);
            Click(pl, IDOK);
        });
        Click(dlg, 1217);
        Click(dlg, IDOK);
    });
    ASSERT_EQ(Stored().size(), 1u);
    const WATERMARK wm = Stored()[0];
    EXPECT_EQ(wm.iHorzPos, WM_HPOS_LEFT);
    EXPECT_EQ(wm.iVertPos, WM_POS_CENTRE);
    EXPECT_EQ(wm.iUnits, WM_UNITS_INCHES);
    EXPECT_DOUBLE_EQ(wm.dHorzOffset, -2.5);
}

TEST_F(WatermarkUiTest, StoredOffsetBeyondItsUnitIsBroughtIntoRangeOnce)
{
    WATERMARK distant = Record(L"Далеко", L"x");
    distant.dHorzOffset = 1e9;
    distant.dVertOffset = -1e9;
    Store({distant});
    Open();
    QueueDialog([](HWND choose) { Click(choose, IDOK); });
    QueueDialog([](HWND dlg) {
        QueueDialog([](HWND pl) {
            EXPECT_EQ(ItemText(pl, 1231), L"9999.9");
            EXPECT_EQ(ItemText(pl, 1224), L"-9999.9");
            PressKey(GetDlgItem(pl, 1224), VK_DOWN);
            EXPECT_EQ(ItemText(pl, 1224), L"-9999.9");
            Click(pl, IDOK);
        });
        Click(dlg, 1217);
        Click(dlg, IDOK);
    });
    Click(page, 1049);
    ASSERT_EQ(Stored().size(), 1u);
    EXPECT_DOUBLE_EQ(Stored()[0].dHorzOffset, 9999.9);
}

TEST_F(WatermarkUiTest, DeletingRemovesRecordsAndReportsEveryRemoval)
{
    Store({Record(L"A", L"a"), Record(L"B", L"b"), Record(L"C", L"c"), Record(L"D", L"d"), Record(L"E", L"e")});
    host->oem.iOrder = 2;
    host->oem.WMARK1 = Record(L"E", L"e");
    host->oem.WMARK2 = Record(L"C", L"c");
    Open();
    ASSERT_EQ(ListSelection(page, 1038), 3);

    // Three at once; then one more whose later press is answered No.
    QueueDialog([](HWND dlg) {
        EXPECT_FALSE(IsEnabled(dlg, 1070));
        for (int i : {0, 1, 3})
            ToggleMultiSelect(dlg, 1041, i);
        ASSERT_TRUE(IsEnabled(dlg, 1070));
        Click(dlg, 1070);
        EXPECT_EQ(ListItems(dlg, 1041), (std::vector<std::wstring>{L"C", L"E"}));
        EXPECT_GT(SendDlgItemMessageW(dlg, 1041, LB_GETSEL, 0, 0), 0);
        ToggleMultiSelect(dlg, 1041, 0);
        ToggleMultiSelect(dlg, 1041, 0);  // C selected again
        Click(dlg, 1070);                 // C was chosen for the other pages
        EXPECT_EQ(ListItems(dlg, 1041), std::vector<std::wstring>{L"E"});
        QueueMessageBoxAnswer(IDNO);
        Click(dlg, 1070);
        EXPECT_EQ(ListItems(dlg, 1041), std::vector<std::wstring>{L"E"});
        Click(dlg, IDOK);
    });
    Click(page, 1040);
    ASSERT_EQ(TheMessageBoxes().size(), 3u);
    EXPECT_EQ(TheMessageBoxes()[0].text, L"Вы действительно хотите удалить выбранные водяные знаки?");
    EXPECT_EQ(TheMessageBoxes()[0].caption, L"Предупреждение");
    EXPECT_EQ(TheMessageBoxes()[0].type, UINT(MB_YESNO | MB_ICONEXCLAMATION));
    // The page saved and refilled although the last press deleted nothing.
    ASSERT_EQ(Stored().size(), 1u);
    EXPECT_STREQ(Stored()[0].szName, L"E");
    EXPECT_EQ(ListItems(page, 1038), (std::vector<std::wstring>{L"(Нет)", L"E"}));
    EXPECT_EQ(ListSelection(page, 1038), 0) << "the deleted selection falls back to none";
    EXPECT_EQ(ListSelection(page, 1037), 1);
    EXPECT_TRUE(SheetChanged());

    // The last one: the buttons go.
    QueueDialog([](HWND dlg) {
        ToggleMultiSelect(dlg, 1041, 0);
        Click(dlg, 1070);
        EXPECT_FALSE(IsEnabled(dlg, 1070));
        Click(dlg, IDOK);
    });
    Click(page, 1040);
    EXPECT_TRUE(Stored().empty());
    EXPECT_FALSE(IsEnabled(page, 1040));
    EXPECT_FALSE(IsEnabled(page, 1049));

    // Choosing to edit with nothing there, then cancelling, opens nothing.
    QueueDialog([](HWND choose) {
        EXPECT_FALSE(IsEnabled(choose, IDOK));
        Click(choose, IDCANCEL);
    });
    SendMessageW(page, WM_COMMAND, MAKEWPARAM(1049, BN_CLICKED), 0);
}

TEST_F(WatermarkUiTest, DynamicVariablesAreInsertedByDescription)
{
    Open();
    Add([this](HWND dlg) {
        Fill(dlg, L"Страница", L"Стр. ");
        Click(dlg, 1216);
        QueueDialog([](HWND dyn) {
            EXPECT_EQ(ItemText(dyn, 1000), L"Стр. ");
            EXPECT_FALSE(IsEnabled(dyn, IDOK));
            EXPECT_FALSE(IsEnabled(dyn, 1002));
            const std::vector<std::wstring> items = ListItems(dyn, 1001);
            ASSERT_EQ(items.size(), 12u);
            SendDlgItemMessageW(dyn, 1000, EM_SETSEL, 0, 0);  // caret at the start
            SelectListItem(dyn, 1001, IndexOf(items, L"Номер страницы"));
            ASSERT_TRUE(IsEnabled(dyn, 1002));
            Click(dyn, 1002);
            EXPECT_EQ(ItemText(dyn, 1000), L"Стр. %номерстраницы%");
            EXPECT_TRUE(IsEnabled(dyn, IDOK));
            SendDlgItemMessageW(dyn, 1000, EM_SETSEL, 0, 4);  // "Стр."
            SelectListItem(dyn, 1001, IndexOf(items, L"Символ процента (%)"));
            Click(dyn, 1002);
            EXPECT_EQ(ItemText(dyn, 1000), L"%% %номерстраницы%");
            Click(dyn, IDOK);
        });
        Click(dlg, 1003);
        EXPECT_EQ(ItemText(dlg, 1004), L"%% %номерстраницы%");
        // A text with no room left keeps the field as it was.
        const std::wstring full(120, L'x');
        TypeInto(dlg, 1004, full);
        QueueDialog([&full](HWND dyn) {
            const std::vector<std::wstring> items = ListItems(dyn, 1001);
            SelectListItem(dyn, 1001, IndexOf(items, L"Имя пользователя"));
            Click(dyn, 1002);
            EXPECT_EQ(ItemText(dyn, 1000), full);
            Click(dyn, IDCANCEL);
        });
        Click(dlg, 1003);
        EXPECT_EQ(ItemText(dlg, 1004), full);
        TypeInto(dlg, 1004, L"Стр. %номерстраницы%");
        Click(dlg, IDOK);
    });
    ASSERT_EQ(Stored().size(), 1u);
    EXPECT_STREQ(Stored()[0].szText, L"Стр. %номерстраницы%");

    // An unknown variable is refused at OK with the focus on the text.
    Add([](HWND dlg) {
        Fill(dlg, L"Неверный", L"%нетакой%");
        Click(dlg, 1216);
        Click(dlg, IDOK);
        EXPECT_TRUE(IsWindow(dlg));
        EXPECT_EQ(GetFocus(), GetDlgItem(dlg, 1004));
        Click(dlg, IDCANCEL);
    });
    EXPECT_EQ(TheMessageBoxes().back().text.substr(0, 46), L"Введен неверный динамический текст водяного зн");
    EXPECT_EQ(Stored().size(), 1u);
}

TEST_F(WatermarkUiTest, NoPermissionDisablesThePageAndStoresNothing)
{
    Store({Record(L"A", L"a")});
    host->paramFlags = 0x20;
    host->oem.iOrder = 1;
    host->oem.WMARK1 = Record(L"A", L"a");
    host->oem.WMARK1.bSelected = 1;
    const OEMDEV before = host->oem;
    Open();
    for (int id : {1031, 1032, 1033, 1034, 1037, 1038, 1039, 1040, 1049, 1042, 1061})
        EXPECT_FALSE(IsEnabled(page, id)) << id;
    // Even changed behind the user's back, nothing reaches the devmode.
    CheckRadioButton(page, 1031, 1034, 1031);
    EXPECT_TRUE(Leave());
    Back();
    ASSERT_TRUE(host->Apply());
    EXPECT_EQ(std::memcmp(&before.WMARK1, &host->oem.WMARK1, sizeof(WATERMARK)), 0);
    EXPECT_EQ(host->oem.iOrder, 1);
}

TEST_F(WatermarkUiTest, DefinedWatermarksPrintOnTheirPages)
{
    Open();
    Add([](HWND dlg) {
        Fill(dlg, L"Первая", L"Стр. %номерстраницы%");
        Click(dlg, 1216);
        SelectListItem(dlg, 1009, 10);  // red
        Click(dlg, IDOK);
    });
    Add([](HWND dlg) {
        Fill(dlg, L"Остальные", L"КОПИЯ");
        SelectListItem(dlg, 1009, 2);  // blue
        Click(dlg, IDOK);
    });
    Click(page, 1033);
    SelectListItem(page, 1037, 1);
    SelectListItem(page, 1038, 2);
    ASSERT_TRUE(host->Apply());
    ASSERT_EQ(host->oem.iOrder, 2);
    host->Destroy();

    SimRenderJob job;
    SimSetA4(job, 100);
    job.oem = host->oem;
    SimPage sheet(job, 24);
    auto count = [&sheet](COLORREF c) {
        long n = 0;
        for (int y = 0; y < sheet.height(); ++y)
            for (int x = 0; x < sheet.width(); ++x)
                n += sheet.Pixel(x, y) == c;
        return n;
    };
    for (int p = 1; p <= 2; ++p) {
        sheet.Clear();
        job.physicalPage = p;
        int result = 0;
        ASSERT_EQ(host->Plugin()->DocumentEvent(host->Printer(), sheet.dc(), DOCUMENTEVENT_ENDPAGE, 0, nullptr, 0,
                                                nullptr, &result),
                  S_OK);
        EXPECT_EQ(result, 1);
        const long red = count(RGB(255, 0, 0)), blue = count(RGB(0, 0, 255));
        if (p == 1) {
            EXPECT_GT(red, 300);
            EXPECT_EQ(blue, 0);
        } else {
            EXPECT_GT(blue, 300);
            EXPECT_EQ(red, 0);
        }
    }
}
