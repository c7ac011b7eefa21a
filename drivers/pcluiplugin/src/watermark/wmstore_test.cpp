// The watermark store against Wine's real registry.
#include "watermark/wmstore.h"
#include "frame/oemui.h"
#include "simspooler.h"

#include <gtest/gtest.h>
#include <shlwapi.h>
#include <string>

namespace {

const WCHAR kDriver[] = L"Norvane Store Driver";
const WCHAR kUserKey[] = L"Software\\Norvane\\PCLPlugIn\\Norvane Store Driver\\Watermark";
const WCHAR kDefaultKey[] = L".Default\\Software\\Norvane\\PCLPlugIn\\Norvane Store Driver";

struct StoreTest : ::testing::Test {
    void SetUp() override
    {
        SHDeleteKeyW(HKEY_CURRENT_USER, L"Software\\Norvane");
        SHDeleteKeyW(HKEY_USERS, L".Default\\Software\\Norvane");
        SimResetSpooler();
        SimPrinter p;
        p.name = L"Printer A";
        p.driver = kDriver;
        printerA = SimAddPrinter(p);
        p.name = L"Printer B";
        printerB = SimAddPrinter(p);
    }
    void TearDown() override { FreeWatermarkList(&list, GetProcessHeap()); }
    void Seed()
    {
        DRIVER_INFO_3W info = {};
        info.pName = const_cast<LPWSTR>(kDriver);
        EXPECT_EQ(SeedDefaultWatermarks(DRIVER_EVENT_INITIALIZE, 3, reinterpret_cast<LPBYTE>(&info), 0), S_OK);
    }
    DWORD ValueCount(HKEY root, LPCWSTR path)
    {
        HKEY h = nullptr;
        if (RegOpenKeyExW(root, path, 0, KEY_READ, &h) != ERROR_SUCCESS)
            return DWORD(-1);
        DWORD n = 0;
        RegQueryInfoKeyW(h, nullptr, nullptr, nullptr, nullptr, nullptr, nullptr, &n, nullptr, nullptr, nullptr,
                         nullptr);
        RegCloseKey(h);
        return n;
    }
    HANDLE printerA = nullptr, printerB = nullptr;
    WatermarkNode* list = nullptr;
};

WATERMARK Named(LPCWSTR name, INT size)
{
    WATERMARK wm = {};
    lstrcpynW(wm.szName, name, 128);
    lstrcpyW(wm.szText, L"text");
    wm.iPointSize = size;
    return wm;
}

}  // namespace

TEST_F(StoreTest, SeedingCopyingAndSharingBetweenPrinters)
{
    Seed();
    HKEY h = nullptr;
    ASSERT_EQ(RegOpenKeyExW(HKEY_USERS, kDefaultKey, 0, KEY_WRITE, &h), ERROR_SUCCESS);
    WATERMARK extra = Named(L"Custom", 10);
    RegSetValueExW(h, L"Custom", 0, REG_BINARY, reinterpret_cast<BYTE*>(&extra), sizeof(extra));
    WATERMARK changed = Named(L"Черновая печать", 99);
    RegSetValueExW(h, L"Черновая печать", 0, REG_BINARY, reinterpret_cast<BYTE*>(&changed), sizeof(changed));
    RegCloseKey(h);
    Seed();  // overwrites the four defaults, keeps the other value
    EXPECT_EQ(ValueCount(HKEY_USERS, kDefaultKey), 5u);

    CopyDefaultWatermarks(printerA);
    EXPECT_EQ(ValueCount(HKEY_CURRENT_USER, kUserKey), 5u);
    EXPECT_EQ(LoadWatermarkList(printerB, GetProcessHeap(), &list), 5u) << "printers of one driver share a store";
    WatermarkNode* draft = FindWatermarkByName(list, L"черновая ПЕЧАТЬ");
    ASSERT_NE(draft, nullptr);
    EXPECT_EQ(draft->wm.iPointSize, 72);
    EXPECT_EQ(draft->wm.crColor, 0xCDCDCDu);
    EXPECT_EQ(draft->wm.pNext, 0u);
    WatermarkNode* user = FindWatermarkByName(list, L"Имя пользователя");
    ASSERT_NE(user, nullptr);
    EXPECT_STREQ(user->wm.szText, L"Пользователь: %Имяпользователя%");
    EXPECT_EQ(user->wm.bDynamic, 1);
    EXPECT_EQ(user->wm.iVertPos, 2);
    EXPECT_EQ(user->wm.iHorzPos, 3);

    // An existing store, even an emptied one, is never reseeded.
    SaveWatermarkList(nullptr, printerA, nullptr);
    EXPECT_EQ(ValueCount(HKEY_CURRENT_USER, kUserKey), 0u) << "an empty save leaves an empty key";
    CopyDefaultWatermarks(printerA);
    EXPECT_EQ(ValueCount(HKEY_CURRENT_USER, kUserKey), 0u);

    // An unknown level seeds the key of an empty driver name.
    EXPECT_EQ(SeedDefaultWatermarks(DRIVER_EVENT_INITIALIZE, 7, reinterpret_cast<LPBYTE>(&extra), 0), S_OK);
    EXPECT_EQ(ValueCount(HKEY_USERS, L".Default\\Software\\Norvane\\PCLPlugIn\\"), 4u);
}

TEST_F(StoreTest, CopyWithoutDefaultKeyTouchesNothing)
{
    CopyDefaultWatermarks(printerA);
    EXPECT_EQ(ValueCount(HKEY_USERS, kDefaultKey), DWORD(-1)) << "the default key is not created";
    EXPECT_EQ(ValueCount(HKEY_CURRENT_USER, kUserKey), DWORD(-1)) << "the user's store is left alone";
    CopyDefaultWatermarks(nullptr);
    HANDLE unknown = reinterpret_cast<HANDLE>(0x5555);
    CopyDefaultWatermarks(unknown);
    EXPECT_EQ(LoadWatermarkList(unknown, GetProcessHeap(), &list), 0u);
}

TEST_F(StoreTest, SaveReplacesTheStoreAndLaterDuplicatesWin)
{
    WatermarkNode* src = nullptr;
    for (auto& wm : {Named(L"One", 1), Named(L"Two", 2), Named(L"One", 3)})
        AppendWatermarkNode(&src, GetProcessHeap())->wm = wm;
    src->wm.pNext = 0x12345678;  // a stale link is never stored
    EXPECT_TRUE(SaveWatermarkList(nullptr, printerA, src));
    EXPECT_EQ(LoadWatermarkList(printerA, GetProcessHeap(), &list), 2u);
    WatermarkNode* one = FindWatermarkByName(list, L"One");
    ASSERT_NE(one, nullptr);
    EXPECT_EQ(one->wm.iPointSize, 3);
    EXPECT_EQ(one->wm.pNext, 0u);
    FreeWatermarkList(&list, GetProcessHeap());

    FreeWatermarkList(&src->next, GetProcessHeap());
    EXPECT_TRUE(SaveWatermarkList(nullptr, printerA, src));
    EXPECT_EQ(ValueCount(HKEY_CURRENT_USER, kUserKey), 1u) << "a save replaces the store wholesale";
    FreeWatermarkList(&src, GetProcessHeap());
}

TEST_F(StoreTest, UntrustedValuesAreSkippedAndBoundsHold)
{
    HKEY h = nullptr;
    ASSERT_EQ(RegCreateKeyExW(HKEY_CURRENT_USER, kUserKey, 0, nullptr, 0, KEY_WRITE, nullptr, &h, nullptr),
              ERROR_SUCCESS);
    BYTE big[700] = {};
    RegSetValueExW(h, L"short", 0, REG_BINARY, big, 663);
    RegSetValueExW(h, L"long", 0, REG_BINARY, big, 665);
    RegSetValueExW(h, L"dword", 0, REG_DWORD, big, 4);
    RegSetValueExW(h, L"string", 0, REG_SZ, big, 664);
    // A record whose texts fill all 128 units with no terminator.
    WATERMARK full;
    memset(&full, 0, sizeof(full));
    for (int i = 0; i < 128; ++i)
        full.szName[i] = full.szText[i] = L'Ж';
    RegSetValueExW(h, L"full", 0, REG_BINARY, reinterpret_cast<BYTE*>(&full), sizeof(full));
    RegCloseKey(h);

    EXPECT_EQ(LoadWatermarkList(printerA, GetProcessHeap(), &list), 1u);
    ASSERT_EQ(WatermarkListLength(list), 1u);
    EXPECT_EQ(BoundedLength(list->wm.szName, 128), 128u);
    EXPECT_EQ(FindWatermarkByName(list, std::wstring(127, L'Ж').c_str()), list) << "compared within the field";
    EXPECT_TRUE(SaveWatermarkList(nullptr, printerA, list));
    EXPECT_EQ(ValueCount(HKEY_CURRENT_USER, kUserKey), 1u);
}

TEST_F(StoreTest, ThousandValuesLoadInEnumerationOrder)
{
    HKEY h = nullptr;
    ASSERT_EQ(RegCreateKeyExW(HKEY_CURRENT_USER, kUserKey, 0, nullptr, 0, KEY_WRITE, nullptr, &h, nullptr),
              ERROR_SUCCESS);
    for (int i = 0; i < 1000; ++i) {
        WCHAR name[32];
        wsprintfW(name, L"Знак %04d", i);
        WATERMARK wm = Named(name, i);
        RegSetValueExW(h, name, 0, REG_BINARY, reinterpret_cast<BYTE*>(&wm), sizeof(wm));
    }
    RegCloseKey(h);
    EXPECT_EQ(ValueCount(HKEY_CURRENT_USER, kUserKey), 1000u);
    EXPECT_EQ(LoadWatermarkList(printerA, GetProcessHeap(), &list), 1000u);
    EXPECT_EQ(WatermarkListLength(list), 1000u);
    WatermarkNode* n = FindWatermarkByName(list, L"знак 0999");
    ASSERT_NE(n, nullptr);
    EXPECT_EQ(n->wm.iPointSize, 999);
}

TEST_F(StoreTest, OverlongDriverNamesOpenNoStore)
{
    SimPrinter p;
    p.name = L"Long";
    p.driver = std::wstring(99, L'D');
    HANDLE ok = SimAddPrinter(p);
    p.driver = std::wstring(100, L'D');
    HANDLE tooLong = SimAddPrinter(p);
    HKEY h = OpenUserWatermarkKey(ok, KEY_READ, nullptr);
    EXPECT_NE(h, nullptr);
    if (h)
        RegCloseKey(h);
    EXPECT_EQ(OpenUserWatermarkKey(tooLong, KEY_READ, nullptr), nullptr);
    EXPECT_EQ(OpenBaseKey(tooLong, KEY_READ, nullptr), nullptr);
    // A profile name that makes the path longer than 259 units is refused.
    EXPECT_EQ(OpenProfileKey(ok, std::wstring(140, L'P').c_str(), KEY_READ, nullptr), nullptr);
    DWORD disp = 0;
    h = OpenProfileKey(ok, L"Мой профиль", KEY_READ | KEY_WRITE, &disp);
    ASSERT_NE(h, nullptr);
    RegCloseKey(h);
    EXPECT_EQ(disp, DWORD(REG_CREATED_NEW_KEY));
    h = OpenProfileKey(ok, L"Мой профиль", KEY_READ, &disp);
    ASSERT_NE(h, nullptr);
    RegCloseKey(h);
    EXPECT_EQ(disp, DWORD(REG_OPENED_EXISTING_KEY));

    DRIVER_INFO_1W info = {const_cast<LPWSTR>(p.driver.c_str())};
    SeedDefaultWatermarks(DRIVER_EVENT_INITIALIZE, 1, reinterpret_cast<LPBYTE>(&info), 0);
    EXPECT_EQ(ValueCount(HKEY_USERS, (L".Default\\Software\\Norvane\\PCLPlugIn\\" + std::wstring(99, L'D')).c_str()),
              DWORD(-1)) << "a cut name must not seed another driver's store";
}
