// DevMode through the plug-in object: sizing, defaults, conversion, merging
// and the answers to malformed records.
#include "frame/oemdevmode.h"
#include "plugin_dll.h"
#include "simspooler.h"

#include <gtest/gtest.h>
#include <algorithm>
#include <cstring>
#include <vector>

namespace {

constexpr BYTE kFill = 0xC3;

// An OEM devmode buffer with guard bytes behind it.
struct DevmodeBuf {
    DevmodeBuf() : bytes(OEMDEV_SIZE + 64, kFill) {}
    OEMDEV* dm() { return reinterpret_cast<OEMDEV*>(bytes.data()); }
    bool tailIntact() const
    {
        for (size_t i = OEMDEV_SIZE; i < bytes.size(); ++i)
            if (bytes[i] != kFill)
                return false;
        return true;
    }
    std::vector<BYTE> bytes;
};

struct DevmodeTest : ::testing::Test {
    void SetUp() override
    {
        ClearPluginRegistry();
        plugin = CreatePluginObject();
        ASSERT_NE(plugin, nullptr);
        param.cbSize = sizeof(param);
    }
    void TearDown() override { plugin->Release(); }
    HRESULT call(DWORD mode, void* in, void* out)
    {
        param.pOEMDMIn = in;
        param.pOEMDMOut = out;
        return plugin->DevMode(mode, &param);
    }
    IPrintOemUI2* plugin = nullptr;
    OEMDMPARAM param = {};
};

void ExpectDefaults(const OEMDEV* d)
{
    EXPECT_EQ(d->dmOEMExtra.dwSize, 1752u);
    EXPECT_EQ(d->dmOEMExtra.dwSignature, 0x4E52564Eu);
    EXPECT_EQ(d->dmOEMExtra.dwVersion, 1u);
    EXPECT_EQ(d->iOrder, 0);
    EXPECT_EQ(d->iPlacement, 4);
    EXPECT_EQ(d->GrayCorr, 1);
    EXPECT_EQ(d->PnHData.szUserName[0], 0);
    EXPECT_EQ(d->PnHData.szPIN[0], 0);
    EXPECT_EQ(d->PnHData.dwOutputType, 0u);
    EXPECT_EQ(d->PnHData.dwKeepPrevious, 0u);
    EXPECT_EQ(d->PnHData.dwKeepPrevious2, 0u);
    static const BYTE zero[664] = {};
    EXPECT_EQ(memcmp(&d->WMARK1, zero, 664), 0);
    EXPECT_EQ(memcmp(&d->WMARK2, zero, 664), 0);
    EXPECT_EQ(memcmp(&d->ManColData, zero, 20), 0);
    EXPECT_EQ(d->bPageOrder + d->bPagesPerSheet + d->bRasterMode, 0);
    EXPECT_EQ(d->iLayoutActive, 0u);
    EXPECT_EQ(d->pOptItems, 0u);
    EXPECT_EQ(d->cOEMOptItems, 0u);
    EXPECT_EQ(d->iReinitItems, 0u);
    EXPECT_EQ(d->Brightness | d->Contrast | d->ImageSaturation | d->EnhanceLines | d->HasPrintQuality, 0);
    EXPECT_EQ(d->pPageContext, 0u);
}

}  // namespace

TEST_F(DevmodeTest, SizeDefaultAndBadModes)
{
    param.cbBufSize = 7;
    EXPECT_EQ(call(OEMDM_SIZE, reinterpret_cast<void*>(0x10), reinterpret_cast<void*>(0x20)), S_OK);
    EXPECT_EQ(param.cbBufSize, 1752u);

    DevmodeBuf out;
    EXPECT_EQ(call(OEMDM_DEFAULT, nullptr, out.dm()), S_OK);
    ExpectDefaults(out.dm());
    EXPECT_TRUE(out.tailIntact());
    // Fields the default does not set are left as the caller had them.
    EXPECT_EQ(out.dm()->dwReserved, 0xC3C3C3C3u);
    EXPECT_EQ(out.dm()->bPad, kFill);
    EXPECT_EQ(out.dm()->cDrvOptItems, 0xC3C3C3C3u);
    EXPECT_EQ(out.dm()->szProfileName[0], 0xC3C3);

    for (DWORD mode : {0u, 5u, 0xFFFFFFFFu}) {
        DevmodeBuf untouched;
        SetLastError(0);
        EXPECT_EQ(call(mode, untouched.dm(), untouched.dm()), E_FAIL);
        EXPECT_EQ(GetLastError(), DWORD(ERROR_INVALID_PARAMETER));
        EXPECT_TRUE(std::all_of(untouched.bytes.begin(), untouched.bytes.end(), [](BYTE b) { return b == kFill; }));
    }
    SetLastError(0);
    EXPECT_EQ(plugin->DevMode(OEMDM_SIZE, nullptr), E_FAIL);
    EXPECT_EQ(GetLastError(), DWORD(ERROR_INVALID_PARAMETER));
    // Null records are accepted and nothing is written.
    EXPECT_EQ(call(OEMDM_DEFAULT, nullptr, nullptr), S_OK);
    EXPECT_EQ(call(OEMDM_CONVERT, nullptr, out.dm()), S_OK);
    EXPECT_EQ(call(OEMDM_MERGE, out.dm(), nullptr), S_OK);
}

TEST_F(DevmodeTest, ConvertCopiesSettingsAndDropsRuntimeLinks)
{
    DevmodeBuf in, out;
    ASSERT_EQ(call(OEMDM_DEFAULT, nullptr, in.dm()), S_OK);
    ASSERT_EQ(call(OEMDM_DEFAULT, nullptr, out.dm()), S_OK);
    OEMDEV* d = in.dm();
    d->iOrder = 2;
    d->iPlacement = 8;
    d->dwReserved = 0x11223344;
    memset(&d->WMARK1, 0x41, sizeof(d->WMARK1));
    memset(&d->WMARK2, 0x42, sizeof(d->WMARK2));
    d->PnHData.dwOutputType = 1;
    lstrcpyW(d->PnHData.szUserName, L"ivanov");
    lstrcpyW(d->PnHData.szPIN, L"1234");
    d->ManColData.dwMethod = 3;
    d->ManColData.dwTonerSaver = 2;
    lstrcpyW(d->szProfileName, L"Отчёты");
    d->Brightness = -4;
    d->Contrast = 5;
    d->ImageSaturation = 2;
    d->GrayCorr = 0;
    d->EnhanceLines = 1;
    d->HasPrintQuality = 1;
    d->pOptItems = 0xDEADBEEF;
    d->cOEMOptItems = 9;
    d->pPageContext = 0xFEEDF00D;
    d->cDrvOptItems = 17;

    EXPECT_EQ(call(OEMDM_CONVERT, in.dm(), out.dm()), S_OK);
    OEMDEV* o = out.dm();
    EXPECT_EQ(o->iOrder, 2);
    EXPECT_EQ(o->iPlacement, 8);
    EXPECT_EQ(o->dwReserved, 0x11223344u);
    EXPECT_EQ(memcmp(&o->WMARK1, &d->WMARK1, 664), 0);
    EXPECT_EQ(memcmp(&o->WMARK2, &d->WMARK2, 664), 0);
    EXPECT_EQ(memcmp(&o->PnHData, &d->PnHData, 72), 0);
    EXPECT_EQ(memcmp(&o->ManColData, &d->ManColData, 20), 0);
    EXPECT_STREQ(o->szProfileName, L"Отчёты");
    EXPECT_EQ(o->Brightness, -4);
    EXPECT_EQ(o->Contrast, 5);
    EXPECT_EQ(o->ImageSaturation, 2);
    EXPECT_EQ(o->GrayCorr, 0);
    EXPECT_EQ(o->EnhanceLines, 1);
    EXPECT_EQ(o->HasPrintQuality, 1);
    EXPECT_EQ(o->cDrvOptItems, 17u);
    EXPECT_EQ(o->pOptItems, 0u);
    EXPECT_EQ(o->cOEMOptItems, 0u);
    EXPECT_EQ(o->pPageContext, 0u);
    EXPECT_TRUE(out.tailIntact());

    // Converting in place keeps the settings too.
    EXPECT_EQ(call(OEMDM_CONVERT, in.dm(), in.dm()), S_OK);
    EXPECT_EQ(in.dm()->iOrder, 2);
    EXPECT_EQ(in.dm()->Brightness, -4);
    EXPECT_EQ(in.dm()->pPageContext, 0u);
}

TEST_F(DevmodeTest, MalformedInputSizesAndForeignSignatures)
{
    // An older, shorter record keeps its bytes; fields beyond it get defaults.
    for (DWORD size : {0u, 5u, 12u, 1451u, 1452u, 1753u, 0xFFFFFFFFu}) {
        SCOPED_TRACE(size);
        DevmodeBuf in, out;
        ASSERT_EQ(call(OEMDM_DEFAULT, nullptr, out.dm()), S_OK);
        memset(in.bytes.data(), 0x5A, OEMDEV_SIZE);
        in.dm()->dmOEMExtra.dwSignature = OEM_SIGNATURE;
        in.dm()->dmOEMExtra.dwSize = size;
        EXPECT_EQ(call(OEMDM_MERGE, in.dm(), out.dm()), S_OK);
        OEMDEV* o = out.dm();
        EXPECT_EQ(o->dmOEMExtra.dwSize, 1752u);
        EXPECT_EQ(o->dmOEMExtra.dwSignature, OEM_SIGNATURE);
        EXPECT_EQ(o->dmOEMExtra.dwVersion, 1u);
        EXPECT_EQ(o->pOptItems | o->cOEMOptItems | o->pPageContext, 0u);
        EXPECT_TRUE(out.tailIntact()) << "never more than 1752 bytes are written";
        DWORD copied = size > 1752 ? 1752 : size;
        if (copied > 16)
            EXPECT_EQ(o->iPlacement, 0x5A5A5A5A);
        if (copied <= 1724) {
            EXPECT_EQ(o->GrayCorr, 1);
            EXPECT_EQ(o->Brightness, 0);
        } else {
            EXPECT_EQ(o->GrayCorr, 0x5A5A5A5A);
        }
        if (copied <= 12)
            EXPECT_EQ(o->iPlacement, 4);
        if (copied == 1452)
            EXPECT_EQ(o->szProfileName[0], 0xC3C3) << "profile name beyond the short input is left alone";
    }

    // A foreign record is never partly used.
    DevmodeBuf foreign, out;
    memset(foreign.bytes.data(), 0x77, OEMDEV_SIZE);
    ASSERT_EQ(call(OEMDM_DEFAULT, nullptr, out.dm()), S_OK);
    out.dm()->Brightness = 3;
    EXPECT_EQ(call(OEMDM_CONVERT, foreign.dm(), out.dm()), S_OK);
    ExpectDefaults(out.dm());
    EXPECT_EQ(call(OEMDM_MERGE, foreign.dm(), out.dm()), S_OK);
    ExpectDefaults(out.dm());
    EXPECT_TRUE(out.tailIntact());
}

TEST_F(DevmodeTest, DriverEventSeedsAndDevModeCopiesTheDefaults)
{
    DRIVER_INFO_2W info = {};
    info.cVersion = 3;
    info.pName = const_cast<LPWSTR>(L"Norvane Test Driver");
    EXPECT_EQ(plugin->DriverEvent(DRIVER_EVENT_INITIALIZE, 2, reinterpret_cast<LPBYTE>(&info), 0), S_OK);
    HKEY hKey = nullptr;
    ASSERT_EQ(RegOpenKeyExW(HKEY_USERS, L".Default\\Software\\Norvane\\PCLPlugIn\\Norvane Test Driver", 0,
                            KEY_READ, &hKey),
              ERROR_SUCCESS);
    DWORD cValues = 0;
    RegQueryInfoKeyW(hKey, nullptr, nullptr, nullptr, nullptr, nullptr, nullptr, &cValues, nullptr, nullptr, nullptr,
                     nullptr);
    RegCloseKey(hKey);
    EXPECT_EQ(cValues, 4u);

    SimPrinter p;
    p.name = L"Office printer";
    p.driver = L"Norvane Test Driver";
    param.hPrinter = SimAddPrinter(p);
    EXPECT_EQ(call(OEMDM_SIZE, nullptr, nullptr), S_OK);
    ASSERT_EQ(RegOpenKeyExW(HKEY_CURRENT_USER, L"Software\\Norvane\\PCLPlugIn\\Norvane Test Driver\\Watermark", 0,
                            KEY_READ, &hKey),
              ERROR_SUCCESS);
    WATERMARK wm = {};
    DWORD cb = sizeof(wm), type = 0;
    EXPECT_EQ(RegQueryValueExW(hKey, L"Черновая печать", nullptr, &type, reinterpret_cast<BYTE*>(&wm), &cb),
              ERROR_SUCCESS);
    RegCloseKey(hKey);
    EXPECT_EQ(type, DWORD(REG_BINARY));
    EXPECT_EQ(cb, 664u);
    EXPECT_STREQ(wm.szText, L"ЧЕРНОВАЯ ПЕЧАТЬ");
    EXPECT_EQ(wm.lfFont.lfOrientation, 450);
    EXPECT_STREQ(wm.lfFont.lfFaceName, L"Arial");

    // Other events and levels: nothing seeded for them, and never "success".
    EXPECT_EQ(plugin->DriverEvent(2, 2, reinterpret_cast<LPBYTE>(&info), 0), S_OK);
    SimResetSpooler();
}
