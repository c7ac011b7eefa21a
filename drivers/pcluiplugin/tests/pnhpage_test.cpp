// The print-and-hold page of the DLL in a real property sheet, driven as a
// user drives it: list choices, typing, tab switches and Apply, with its
// message boxes recorded. What the page stores is checked byte for byte in
// the working settings and in the OEM devmode.
#include "frame/oemdevmode.h"
#include "frame/pagecontext.h"
#include "plugin_dll.h"
#include "simhost.h"
#include "simspooler.h"
#include "uidriver.h"

#include <commctrl.h>
#include <gtest/gtest.h>
#include <algorithm>
#include <cstring>
#include <memory>
#include <string>
#include <vector>

namespace {

constexpr WORD kPage = 138;
constexpr WORD kWatermarkPage = 104;
constexpr int kGroup = 1052, kList = 1084, kUser = 1085, kPin = 1086, kUserLabel = 1087, kPinLabel = 1088,
              kKeep = 1211;
constexpr int kApplyButton = 0x3021;
const std::vector<int> kAllControls = {kGroup, kList, kUser, kPin, kUserLabel, kPinLabel, kKeep};

const wchar_t kQuoteText[] = L"Имя пользователя не должно содержать кавычек";
const wchar_t kNoUserText[] = L"Введите имя пользователя.";
const wchar_t kShortPinText[] = L"Введите персональный идентификационный номер из 4 цифр.";
const wchar_t kBadPinText[] =
    L"Недопустимые символы в персональном идентификационном номере.  Следует вводить только цифры 1-6.";

std::vector<BYTE> Bytes(const PNHDATA& b)
{
    const BYTE* p = reinterpret_cast<const BYTE*>(&b);
    return std::vector<BYTE>(p, p + sizeof(b));
}

// A block whose bytes behind the strings' terminators are a fill pattern,
// to show what a copy leaves there.
PNHDATA Patterned(DWORD type, const wchar_t* user, const wchar_t* pin, DWORD keep, DWORD keep2)
{
    PNHDATA b;
    std::memset(&b, 0xCD, sizeof(b));
    b.dwOutputType = type;
    std::memcpy(b.szUserName, user, (wcslen(user) + 1) * sizeof(WCHAR));
    std::memcpy(b.szPIN, pin, (wcslen(pin) + 1) * sizeof(WCHAR));
    b.dwKeepPrevious = keep;
    b.dwKeepPrevious2 = keep2;
    return b;
}

// What a page write gives: dst with the strings copied up to their
// terminators and offset 68 repeating the flag.
PNHDATA Written(PNHDATA dst, DWORD type, const wchar_t* user, const wchar_t* pin, DWORD keep)
{
    dst.dwOutputType = type;
    std::memcpy(dst.szUserName, user, (wcslen(user) + 1) * sizeof(WCHAR));
    std::memcpy(dst.szPIN, pin, (wcslen(pin) + 1) * sizeof(WCHAR));
    dst.dwKeepPrevious = keep;
    dst.dwKeepPrevious2 = keep;
    return dst;
}

std::wstring LoggedInUser()
{
    WCHAR name[257] = {};
    DWORD cch = 257;
    if (!GetUserNameW(name, &cch))
        return L"";
    return std::wstring(name).substr(0, 24);
}

struct PrintAndHoldPage : ::testing::Test {
    std::unique_ptr<SimHost> host;
    HWND page = nullptr;

    void SetUp() override
    {
        static const bool installed = (InstallMessageBoxRecorder(PluginDll()), true);
        (void)installed;
        NewHost();
    }
    // A fresh printer and host for a printer that reports print-and-hold.
    void NewHost()
    {
        host.reset();
        page = nullptr;
        SimResetSpooler();
        ClearPluginRegistry();
        TheMessageBoxes().clear();
        host.reset(new SimHost(CreatePluginObject(), L"Norvane LaserJet", L"Norvane PCL 6"));
        host->driverUI.features["PrintAndHold"] = "1";
    }
    void TearDown() override
    {
        host.reset();
        SimResetSpooler();
    }
    // Builds and shows the sheet; the page is its first tab.
    void Show(bool keepCapability = true)
    {
        if (keepCapability)
            host->driverUI.features["HasKeepPreviousPHJobs"] = "1";
        ASSERT_EQ(host->InitDocumentSheet(), S_OK);
        ASSERT_NE(host->ShowSheet(), nullptr);
        page = host->PageWindow(kPage);
        ASSERT_NE(page, nullptr);
    }
    PAGECONTEXT* Ctx() { return static_cast<PAGECONTEXT*>(host->Param()->pOEMUserData); }
    bool Leave() { return host->SelectPage(kWatermarkPage) != FALSE; }
    bool Return() { return host->SelectPage(kPage) != FALSE; }
    bool Enabled(int id) { return IsEnabled(page, id); }
    bool Current() { return PropSheet_GetCurrentPageHwnd(host->Sheet()) == page; }
    // The enable states of PIN, user name and keep check box, labels included.
    std::vector<bool> Fields()
    {
        EXPECT_EQ(Enabled(kPin), Enabled(kPinLabel));
        EXPECT_EQ(Enabled(kUser), Enabled(kUserLabel));
        return {Enabled(kPin), Enabled(kUser), Enabled(kKeep)};
    }
};

}  // namespace

TEST_F(PrintAndHoldPage, EnableRulesFollowTheOutputTypeAndUserChangesMarkTheSheet)
{
    Show();
    // The defaults: print at once, nothing to fill in.
    EXPECT_EQ(ListSelection(page, kList), 0);
    EXPECT_EQ(Fields(), (std::vector<bool>{false, false, false}));
    HWND apply = GetDlgItem(host->Sheet(), kApplyButton);
    ASSERT_NE(apply, nullptr);
    EXPECT_FALSE(IsWindowEnabled(apply)) << "loading the page is no change";
    // Through a page that changes nothing on its own, and back.
    EXPECT_TRUE(host->SelectPage(137));
    PumpMessages();
    EXPECT_TRUE(Return());
    PumpMessages();
    EXPECT_FALSE(IsWindowEnabled(apply)) << "nor is showing it again";

    const std::vector<bool> expected[] = {
        {false, false, false}, {true, true, true}, {false, true, true}, {false, true, true}, {false, true, true}};
    for (int type : {1, 2, 3, 4, 0}) {
        SelectListItem(page, kList, type);
        EXPECT_EQ(Fields(), expected[type]) << type;
    }
    EXPECT_TRUE(IsWindowEnabled(apply));

    SelectListItem(page, kList, 1);
    SetFieldText(page, kUser, L"Ivan");
    SetFieldText(page, kPin, L"1234");
    for (int id : {kUser, kPin, kKeep}) {
        PropSheet_UnChanged(host->Sheet(), page);
        ASSERT_FALSE(IsWindowEnabled(apply));
        if (id == kKeep)
            Click(page, kKeep);
        else
            TypeAtEnd(page, id, id == kPin ? L"\b" : L"x");
        EXPECT_TRUE(IsWindowEnabled(apply)) << id;
        if (id == kPin)
            TypeAtEnd(page, kPin, L"4");
    }
    host->Destroy();
}

TEST_F(PrintAndHoldPage, ValidationReportsTheFirstProblemAndKeepsThePage)
{
    host->oem.PnHData = Patterned(1, L"Ivan", L"1234", 0, 0);
    Show();
    const std::vector<BYTE> before = Bytes(Ctx()->ws.PnHData);
    struct Case {
        const wchar_t* user;
        const wchar_t* pin;
        const wchar_t* text;
        int field;
    } cases[] = {
        {L" \" ", L"", kQuoteText, kUser},  // the quote counts before the blanks and the PIN
        {L"A\"B", L"1234", kQuoteText, kUser},
        {L"   ", L"12", kNoUserText, kUser},
        {L"", L"1234", kNoUserText, kUser},
        {L"Ivan", L"12", kShortPinText, kPin},
        {L"Ivan", L"", kShortPinText, kPin},
        {L"Ivan", L"12a4", kBadPinText, kPin},
        {L"Ivan", L"１２３４", kBadPinText, kPin},  // full-width digits
    };
    for (const Case& c : cases) {
        SCOPED_TRACE(testing::Message() << "case " << (&c - cases));
        TheMessageBoxes().clear();
        SetFieldText(page, kUser, c.user);
        SetFieldText(page, kPin, c.pin);  // as pasted: the field's digit filter is not the check
        EXPECT_FALSE(Leave());
        EXPECT_TRUE(Current());
        ASSERT_EQ(TheMessageBoxes().size(), 1u);
        EXPECT_EQ(TheMessageBoxes()[0].text, c.text);
        EXPECT_EQ(TheMessageBoxes()[0].caption, L"Ошибка");
        EXPECT_EQ(TheMessageBoxes()[0].type, UINT(MB_OK | MB_ICONERROR));
        EXPECT_EQ(GetFocus(), GetDlgItem(page, c.field));
        EXPECT_EQ(Bytes(Ctx()->ws.PnHData), before) << "nothing stored";
    }
    TheMessageBoxes().clear();
    EXPECT_FALSE(host->Apply());
    EXPECT_EQ(TheMessageBoxes().size(), 1u);
    EXPECT_EQ(host->oem.PnHData.dwOutputType, 1u);
    EXPECT_EQ(std::wstring(host->oem.PnHData.szPIN, 4), L"1234") << "a refused page applies nothing";

    // Every decimal digit counts, 0 and 7 to 9 included.
    TheMessageBoxes().clear();
    SetFieldText(page, kUser, L" Ivan ");
    SetFieldText(page, kPin, L"0789");
    EXPECT_TRUE(Leave());
    EXPECT_TRUE(TheMessageBoxes().empty());
    EXPECT_EQ(std::wstring(Ctx()->ws.PnHData.szPIN), L"0789");
    EXPECT_EQ(std::wstring(Ctx()->ws.PnHData.szUserName), L" Ivan ");

    // Disabled fields are not checked.
    ASSERT_TRUE(Return());
    SelectListItem(page, kList, 2);
    SetFieldText(page, kPin, L"x");
    EXPECT_TRUE(Leave());
    ASSERT_TRUE(Return());
    SelectListItem(page, kList, 0);
    SetFieldText(page, kUser, L"\"");
    EXPECT_TRUE(Leave());
    EXPECT_TRUE(TheMessageBoxes().empty());
    EXPECT_EQ(std::wstring(Ctx()->ws.PnHData.szUserName), L" Ivan ");
    host->Destroy();
}

TEST_F(PrintAndHoldPage, RoundTripThroughWorkingSettingsIntoTheDevmode)
{
    const PNHDATA stored = Patterned(4, L"Петров-Водкин", L"5678", 0, 7);
    host->oem.PnHData = stored;
    Show();
    EXPECT_EQ(ListSelection(page, kList), 4);
    EXPECT_EQ(ItemText(page, kUser), L"Петров-Водкин");
    EXPECT_EQ(ItemText(page, kPin), L"5678");
    EXPECT_FALSE(IsChecked(page, kKeep));

    SelectListItem(page, kList, 1);
    TypeInto(page, kUser, L"Иванов");
    TypeInto(page, kPin, L"43a21");  // the letter never reaches the field
    EXPECT_EQ(ItemText(page, kPin), L"4321");
    Click(page, kKeep);
    const PNHDATA ws = Ctx()->ws.PnHData;
    ASSERT_TRUE(Leave());
    EXPECT_EQ(Bytes(Ctx()->ws.PnHData), Bytes(Written(ws, 1, L"Иванов", L"4321", 1)));
    EXPECT_EQ(Bytes(host->oem.PnHData), Bytes(stored)) << "the devmode waits for Apply";

    ASSERT_TRUE(host->Apply());
    // The bytes behind each terminator keep what the devmode held.
    EXPECT_EQ(Bytes(host->oem.PnHData), Bytes(Written(stored, 1, L"Иванов", L"4321", 1)));
    EXPECT_EQ(std::wstring(host->oem.PnHData.szUserName + 7, 6), L"Водкин");

    ASSERT_TRUE(Return());
    EXPECT_EQ(ListSelection(page, kList), 1);
    EXPECT_EQ(ItemText(page, kUser), L"Иванов");
    EXPECT_EQ(ItemText(page, kPin), L"4321");
    EXPECT_TRUE(IsChecked(page, kKeep));

    host->calls.clear();
    EXPECT_EQ(host->Destroy(), S_OK);
    ASSERT_EQ(host->calls.size(), 1u);
    EXPECT_EQ(host->calls[0].function, WPARAM(CPSFUNC_SET_RESULT));
}

TEST_F(PrintAndHoldPage, PrinterAndHeldJobsClearWhatDoesNotApply)
{
    host->oem.PnHData = Patterned(1, L"Сидоров", L"5555", 1, 1);
    Show();
    EXPECT_TRUE(IsChecked(page, kKeep));
    const PNHDATA ws = Ctx()->ws.PnHData;
    TypeInto(page, kUser, L"Другой");
    SelectListItem(page, kList, 0);
    ASSERT_TRUE(Leave());
    EXPECT_EQ(Bytes(Ctx()->ws.PnHData), Bytes(Written(ws, 0, L"Сидоров", L"", 0)));

    ASSERT_TRUE(Return());
    EXPECT_EQ(ListSelection(page, kList), 0);
    EXPECT_EQ(ItemText(page, kUser), L"Сидоров");
    EXPECT_EQ(ItemText(page, kPin), L"");
    EXPECT_FALSE(IsChecked(page, kKeep));

    for (int type : {2, 3, 4}) {
        SelectListItem(page, kList, type);
        SetFieldText(page, kPin, L"9999");
        TypeInto(page, kUser, L"Hold" + std::to_wstring(type));
        if (!IsChecked(page, kKeep))
            Click(page, kKeep);
        const PNHDATA expected = Written(host->oem.PnHData, type, (L"Hold" + std::to_wstring(type)).c_str(), L"", 1);
        ASSERT_TRUE(host->Apply());
        EXPECT_EQ(Bytes(host->oem.PnHData), Bytes(expected)) << type;
    }
    host->Destroy();
}

TEST_F(PrintAndHoldPage, KeepPreviousNeedsTheDriverCapability)
{
    host->oem.PnHData = Patterned(1, L"Ivan", L"1234", 1, 1);
    Show(false);
    EXPECT_FALSE(IsWindowVisible(GetDlgItem(page, kKeep)));
    Click(page, kKeep);
    SelectListItem(page, kList, 3);
    EXPECT_FALSE(IsWindowVisible(GetDlgItem(page, kKeep)));
    ASSERT_TRUE(Leave());
    EXPECT_EQ(Ctx()->ws.PnHData.dwKeepPrevious, 0u);
    EXPECT_EQ(Ctx()->ws.PnHData.dwKeepPrevious2, 0u);
    ASSERT_TRUE(Return());
    EXPECT_FALSE(IsWindowVisible(GetDlgItem(page, kKeep)));
    ASSERT_TRUE(host->Apply());
    EXPECT_EQ(host->oem.PnHData.dwKeepPrevious, 0u);
    EXPECT_EQ(host->oem.PnHData.dwKeepPrevious2, 0u);
    host->Destroy();

    // With it the box shows the stored flag, also for a list without choice.
    NewHost();
    host->oem.PnHData = Patterned(0xFFFFFFFF, L"Ivan", L"", 1, 0);
    Show(true);
    EXPECT_TRUE(IsWindowVisible(GetDlgItem(page, kKeep)));
    EXPECT_TRUE(IsChecked(page, kKeep));
    EXPECT_TRUE(Enabled(kKeep));
    ASSERT_TRUE(host->Apply());
    EXPECT_EQ(host->oem.PnHData.dwKeepPrevious, 1u);
    EXPECT_EQ(host->oem.PnHData.dwKeepPrevious2, 1u);
    host->Destroy();
}

TEST_F(PrintAndHoldPage, StoredValuesOutsideTheListsAndFieldsAreShownBounded)
{
    // An output type the list does not have; an empty name shows the user's.
    host->oem.PnHData = Patterned(9, L"", L"", 0, 0);
    Show();
    EXPECT_EQ(ListSelection(page, kList), -1);
    EXPECT_EQ(Fields(), (std::vector<bool>{false, false, true}));
    EXPECT_EQ(ItemText(page, kUser), LoggedInUser());
    ASSERT_TRUE(Leave());
    EXPECT_EQ(Ctx()->ws.PnHData.dwOutputType, 0xFFFFFFFFu);
    EXPECT_EQ(Ctx()->ws.PnHData.szUserName[0], L'\0') << "the shown name is not stored while disabled";

    // A profile loaded while the page is inactive, its strings filling their
    // fields without a terminator.
    PNHDATA& ws = Ctx()->ws.PnHData;
    ws.dwOutputType = 2;
    std::fill(std::begin(ws.szUserName), std::end(ws.szUserName), L'B');
    std::fill(std::begin(ws.szPIN), std::end(ws.szPIN), L'7');
    ws.dwKeepPrevious = 1;
    ASSERT_TRUE(Return());
    EXPECT_EQ(ListSelection(page, kList), 2);
    EXPECT_EQ(ItemText(page, kUser), std::wstring(24, L'B'));
    EXPECT_EQ(ItemText(page, kPin), L"7777");
    EXPECT_TRUE(IsChecked(page, kKeep));
    ASSERT_TRUE(host->Apply());
    EXPECT_EQ(std::wstring(host->oem.PnHData.szUserName), std::wstring(24, L'B'));
    EXPECT_EQ(host->oem.PnHData.szPIN[0], L'\0');
    EXPECT_EQ(host->oem.PnHData.dwOutputType, 2u);
    host->Destroy();

    // The same from the devmode itself.
    NewHost();
    PNHDATA& oem = host->oem.PnHData;
    oem.dwOutputType = 1;
    std::fill(std::begin(oem.szUserName), std::end(oem.szUserName), L'A');
    std::fill(std::begin(oem.szPIN), std::end(oem.szPIN), L'9');
    Show();
    EXPECT_EQ(ItemText(page, kUser), std::wstring(24, L'A'));
    EXPECT_EQ(ItemText(page, kPin), L"9999");
    host->Destroy();
}

TEST_F(PrintAndHoldPage, WithoutPermissionEverythingIsDisabledAndNothingStored)
{
    host->paramFlags = 0x20;
    host->oem.PnHData = Patterned(1, L"Ivan", L"1234", 1, 1);
    Show();
    const std::vector<BYTE> ws = Bytes(Ctx()->ws.PnHData);
    const std::vector<BYTE> oem = Bytes(host->oem.PnHData);
    for (int id : kAllControls)
        EXPECT_FALSE(Enabled(id)) << id;
    EXPECT_EQ(ItemText(page, kUser), L"Ivan");

    // Messages that reach the controls anyway change nothing that is kept.
    SelectListItem(page, kList, 3);
    for (int id : kAllControls)
        EXPECT_FALSE(Enabled(id)) << id;
    SetFieldText(page, kUser, L"\"");
    ASSERT_TRUE(Leave());
    EXPECT_TRUE(TheMessageBoxes().empty());
    EXPECT_EQ(Bytes(Ctx()->ws.PnHData), ws);
    ASSERT_TRUE(Return());
    EXPECT_EQ(ItemText(page, kUser), L"Ivan");
    EXPECT_EQ(ListSelection(page, kList), 1);
    for (int id : kAllControls)
        EXPECT_FALSE(Enabled(id)) << id;
    ASSERT_TRUE(host->Apply());
    EXPECT_EQ(Bytes(host->oem.PnHData), oem);

    host->calls.clear();
    EXPECT_EQ(host->Destroy(), S_OK);
    EXPECT_TRUE(host->calls.empty()) << "no page applied";
    EXPECT_EQ(host->Result(), 1u);
}
