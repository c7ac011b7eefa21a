// PrinterEvent as the spooler calls it: a printer just created gets the print
// processor named after the driver's data file, every other event is ignored,
// and no path leaves a printer handle open.
#include "plugin_dll.h"
#include "simspooler.h"

#include <gtest/gtest.h>
#include <string>

namespace {

const wchar_t kPrinter[] = L"Norvane LaserJet";
const wchar_t kOriginal[] = L"WinPrint";
constexpr INT kInitialize = 3;  // PRINTER_EVENT_INITIALIZE

struct PrinterEventTest : ::testing::Test {
    void SetUp() override
    {
        SimResetSpooler();
        plugin = CreatePluginObject();
        ASSERT_NE(plugin, nullptr);
    }
    void TearDown() override
    {
        if (plugin)
            plugin->Release();
        SimResetSpooler();
    }
    SimPrinter* AddPrinter(const std::wstring& dataFile)
    {
        SimPrinter p;
        p.name = kPrinter;
        p.driver = L"Norvane PCL 6";
        p.dataFile = dataFile;
        p.printProcessor = kOriginal;
        return SimPrinterOf(SimAddPrinter(p));
    }
    // The event as the spooler sends it; the open-handle count must be what
    // it was before.
    HRESULT Send(const wchar_t* printer, INT event, DWORD flags = 0, LPARAM lParam = 0)
    {
        const int before = SimOpenHandleCount();
        HRESULT hr = plugin->PrinterEvent(const_cast<PWSTR>(printer), event, flags, lParam);
        EXPECT_EQ(SimOpenHandleCount(), before) << "printer handle left open";
        return hr;
    }
    IPrintOemUI2* plugin = nullptr;
};

}  // namespace

TEST_F(PrinterEventTest, NewPrinterGetsTheProcessorNamedAfterTheDataFile)
{
    const std::wstring dir = L"C:\\Windows\\System32\\spool\\drivers\\x64\\3\\";
    // A path that just fits the 128-unit buffer with its terminator.
    const std::wstring longDir = L"C:\\" + std::wstring(127 - 3 - 11, L'd') + L"\\";
    ASSERT_EQ((longDir + L"ABCDEF.GPD").size(), 127u);
    struct Case {
        std::wstring dataFile;
        const wchar_t* processor;  // nullptr: none derived, the printer keeps its own
    };
    const Case cases[] = {
        {dir + L"ABCDEF.GPD", L"ABCDEC"},
        {dir + L"abcdef.gpd", L"abcdeC"},
        {dir + L"NVPCL6.V2.GPD", L"NVPCLC"},   // cut at the first dot
        {dir + L"AB.C.D", L"AC"},              // "C.D" follows the first dot
        {dir + L"X.GPD", L"C"},
        {dir + L"NVPCL6.GPDX", L"NVPCLC"},
        {longDir + L"ABCDEF.GPD", L"ABCDEC"},
        {dir + L"NVPCL6.GP", nullptr},         // fewer than three after the dot
        {dir + L"NVPCL6.", nullptr},
        {dir + L"NVPCL6", nullptr},            // no dot
        {L"C:\\my.drivers\\NVPCL6", nullptr},  // a dot in the directory does not count
        {dir + L".GPD", nullptr},              // the name begins with its dot
        {L"ABCDEF.GPD", nullptr},              // no backslash
        {dir, nullptr},                        // ends with its backslash
        {L"", nullptr},
        {L"C:\\" + longDir + L"ABCDEF.GPD", nullptr},  // too long: a cut path would name the wrong file
    };
    for (const Case& c : cases) {
        SCOPED_TRACE(std::string(c.dataFile.begin(), c.dataFile.end()));
        SimResetSpooler();
        SimPrinter* p = AddPrinter(c.dataFile);
        EXPECT_EQ(Send(kPrinter, kInitialize), S_OK);
        EXPECT_EQ(p->printProcessor, c.processor ? c.processor : kOriginal);
        EXPECT_EQ(p->setPrinterCalls, c.processor ? 1 : 0);
    }
}

TEST_F(PrinterEventTest, OtherEventsChangeNothing)
{
    SimPrinter* p = AddPrinter(L"C:\\drivers\\ABCDEF.GPD");
    for (INT event : {0, 1, 2, 4, 5, 6, -1}) {
        EXPECT_EQ(Send(kPrinter, event), S_OK) << event;
        EXPECT_EQ(Send(L"No such printer", event), S_OK) << event;
    }
    EXPECT_EQ(p->printProcessor, kOriginal);
    EXPECT_EQ(p->setPrinterCalls, 0);
    // Flags and lparam play no part in the initialisation either.
    EXPECT_EQ(Send(kPrinter, kInitialize, 0xFFFFFFFF, 12345), S_OK);
    EXPECT_EQ(p->printProcessor, L"ABCDEC");
}

TEST_F(PrinterEventTest, FailuresReportEFailAndCloseThePrinter)
{
    SimPrinter* p = AddPrinter(L"C:\\drivers\\ABCDEF.GPD");
    EXPECT_EQ(Send(L"No such printer", kInitialize), E_FAIL);
    EXPECT_EQ(Send(nullptr, kInitialize), E_FAIL);
    EXPECT_EQ(Send(L"", kInitialize), E_FAIL);

    // The printer opens but its information cannot be read.
    p->failGetPrinter = true;
    EXPECT_EQ(Send(kPrinter, kInitialize), E_FAIL);
    EXPECT_EQ(p->setPrinterCalls, 0);
    EXPECT_EQ(p->printProcessor, kOriginal);

    p->failGetPrinter = false;
    EXPECT_EQ(Send(kPrinter, kInitialize), S_OK);
    EXPECT_EQ(p->printProcessor, L"ABCDEC");
    EXPECT_EQ(SimOpenHandleCount(), 0);
}
