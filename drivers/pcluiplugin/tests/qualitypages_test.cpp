// The manual colour page, the black-and-white print-quality page and the RGB
// print-quality dialog in a real property sheet of the DLL, driven as a user
// drives them: list choices, clicks, trackbar keys, tab switches and Apply,
// with the modal dialog answered by scripts.
#include "frame/oemdevmode.h"
#include "frame/pagecontext.h"
#include "plugin_dll.h"
#include "simhost.h"
#include "simspooler.h"
#include "uidriver.h"

#include <commctrl.h>
#include <gtest/gtest.h>
#include <cstring>
#include <initializer_list>
#include <memory>
#include <string>
#include <vector>

namespace {

constexpr int kApplyButton = 0x3021;
constexpr size_t kManColOffset = 1424;

// Manual colour page (107).
constexpr int kMethod = 1172, kImages = 1178, kText = 1181, kGraphics = 1180, kToner = 1182, kQuality = 1253;
const int kRgbControls[] = {1177, kImages, 1176, kText, 1175, kGraphics};
// Black-and-white page (229).
constexpr int kBwBrightness = 1252, kBwContrast = 1251, kGrayCorr = 1239, kBwEnhance = 1241;
// RGB dialog (231).
constexpr int kRgbBrightness = 1250, kRgbContrast = 1249, kSaturation = 1253, kRgbEnhance = 1241;

using Texts = std::vector<std::wstring>;
const Texts kMethodTexts = {L"Значение параметра принтера", L"Выкл.", L"Автоматическая настройка", L"Ручная"};
const Texts kRgbTexts = {L"Значение параметра принтера", L"sRGB, экран", L"Яркие цвета sRGB", L"Яркие цвета",
                         L"Отображение - настоящий черный", L"Выкл."};
const Texts kTonerTexts = {L"Значение параметра принтера", L"Вкл.", L"Выкл."};

using Bytes = std::vector<BYTE>;

// The five words as the stored format has them: little-endian.
Bytes LittleEndian(std::initializer_list<DWORD> words)
{
    Bytes out;
    for (DWORD w : words)
        for (int i = 0; i < 4; ++i)
            out.push_back(static_cast<BYTE>(w >> (8 * i)));
    return out;
}

Bytes ManColBytes(const OEMDEV& oem)
{
    const BYTE* p = reinterpret_cast<const BYTE*>(&oem) + kManColOffset;
    return Bytes(p, p + 20);
}

Bytes BytesOf(const MANCOLDATA& d)
{
    const BYTE* p = reinterpret_cast<const BYTE*>(&d);
    return Bytes(p, p + sizeof(d));
}

struct Quality {
    INT Brightness, Contrast, ImageSaturation, GrayCorr, EnhanceLines;
    bool operator==(const Quality& o) const
    {
        return std::memcmp(this, &o, sizeof(o)) == 0;
    }
};

std::ostream& operator<<(std::ostream& os, const Quality& q)
{
    return os << "{" << q.Brightness << ", " << q.Contrast << ", " << q.ImageSaturation << ", " << q.GrayCorr << ", "
              << q.EnhanceLines << "}";
}

Quality QualityOf(const OEMDEV& o) { return {o.Brightness, o.Contrast, o.ImageSaturation, o.GrayCorr, o.EnhanceLines}; }
Quality QualityOf(const WORKINGSETTINGS& w)
{
    return {w.Brightness, w.Contrast, w.ImageSaturation, w.GrayCorr, w.EnhanceLines};
}

int Pos(HWND dlg, int id) { return static_cast<int>(SendDlgItemMessageW(dlg, id, TBM_GETPOS, 0, 0)); }

// Moves a trackbar by steps with the arrow keys, as a user with the focus on
// it would; a disabled trackbar cannot have the focus.
void Slide(HWND dlg, int id, int steps)
{
    if (!IsEnabled(dlg, id)) {
        ADD_FAILURE() << "trackbar " << id << " is disabled";
        return;
    }
    for (int i = 0; i < (steps < 0 ? -steps : steps); ++i)
        PressKey(GetDlgItem(dlg, id), steps < 0 ? VK_LEFT : VK_RIGHT);
}

// Clicks a control as a user can: only when it is enabled (BM_CLICK alone
// also reaches a disabled button).
void UserClick(HWND dlg, int id)
{
    if (!IsEnabled(dlg, id)) {
        ADD_FAILURE() << "control " << id << " is disabled";
        return;
    }
    Click(dlg, id);
}

// Presses a button of a modal dialog; a disabled one fails the test and the
// dialog is closed so that the test goes on.
void Press(HWND dlg, int id)
{
    if (!IsEnabled(dlg, id)) {
        ADD_FAILURE() << "button " << id << " is disabled";
        EndDialog(dlg, 2);
        return;
    }
    Click(dlg, id);
}

// Range, steps and ticks of a trackbar.
void ExpectSetUp(HWND dlg, int id, int lo, int hi)
{
    HWND tb = GetDlgItem(dlg, id);
    EXPECT_EQ(SendMessageW(tb, TBM_GETRANGEMIN, 0, 0), lo) << id;
    EXPECT_EQ(SendMessageW(tb, TBM_GETRANGEMAX, 0, 0), hi) << id;
    EXPECT_EQ(SendMessageW(tb, TBM_GETLINESIZE, 0, 0), 1) << id;
    EXPECT_EQ(SendMessageW(tb, TBM_GETPAGESIZE, 0, 0), 1) << id;
    EXPECT_EQ(SendMessageW(tb, TBM_GETNUMTICS, 0, 0), hi - lo + 1) << id << ": a tick at every value";
}

std::vector<HWND> Descendants(HWND parent)
{
    std::vector<HWND> out;
    EnumChildWindows(
        parent,
        [](HWND h, LPARAM lp) {
            reinterpret_cast<std::vector<HWND>*>(lp)->push_back(h);
            return TRUE;
        },
        reinterpret_cast<LPARAM>(&out));
    return out;
}

struct QualityPagesTest : ::testing::Test {
    static void SetUpTestSuite() { InstallMessageBoxRecorder(PluginDll()); }
    void SetUp() override
    {
        SimResetSpooler();
        ClearPluginRegistry();
        TheMessageBoxes().clear();
        ClearDialogScripts();
        host = std::make_unique<SimHost>(CreatePluginObject(), L"Norvane Color LaserJet", L"Norvane PCL 6");
    }
    void TearDown() override
    {
        EXPECT_EQ(PendingDialogScripts(), 0u) << "a dialog the test expected did not open";
        ClearDialogScripts();
        EXPECT_TRUE(TheMessageBoxes().empty());
        host->Destroy();
        host.reset();
        SimResetSpooler();
    }
    void Features(std::initializer_list<const char*> features)
    {
        for (const char* f : features)
            host->driverUI.features[f] = "1";
    }
    // Builds and shows the sheet and switches to the page of template id.
    HWND Open(WORD id)
    {
        EXPECT_EQ(host->InitDocumentSheet(), S_OK);
        EXPECT_NE(host->ShowSheet(), nullptr);
        EXPECT_TRUE(host->SelectPage(id));
        HWND page = host->PageWindow(id);
        EXPECT_NE(page, nullptr);
        return page;
    }
    PAGECONTEXT* Context() const { return static_cast<PAGECONTEXT*>(host->Param()->pOEMUserData); }
    bool SheetChanged() const { return IsWindowEnabled(GetDlgItem(host->Sheet(), kApplyButton)) != FALSE; }
    // Opens the RGB quality dialog with the page's button.
    void RunQualityDialog(HWND page, DialogScript script)
    {
        QueueDialog(std::move(script));
        UserClick(page, kQuality);
    }
    std::unique_ptr<SimHost> host;
};

using QualityManualColourPage = QualityPagesTest;
using QualityRgbDialog = QualityPagesTest;
using QualityMonoPage = QualityPagesTest;

}  // namespace

TEST_F(QualityManualColourPage, ListsOfferTheirEntriesInOrderAndApplyStoresTheirValues)
{
    Features({"HasPrintQuality", "HasManualColor", "IsColorPrinter"});
    host->oem.ManColData = {3, 1, 2, 5, 0};
    host->oem.Brightness = 2;
    host->oem.Contrast = 3;
    host->oem.ImageSaturation = 4;
    host->oem.GrayCorr = 0;
    host->oem.EnhanceLines = 1;
    ASSERT_EQ(host->InitDocumentSheet(), S_OK);
    ASSERT_EQ(host->oem.HasPrintQuality, 1) << "the sheet learnt it from the driver";
    ASSERT_NE(host->ShowSheet(), nullptr);
    // The page drops the sheet's context-help button when it comes up.
    SetWindowLongPtrW(host->Sheet(), GWL_EXSTYLE, GetWindowLongPtrW(host->Sheet(), GWL_EXSTYLE) | WS_EX_CONTEXTHELP);
    ASSERT_TRUE(host->SelectPage(107));
    HWND page = host->PageWindow(107);
    ASSERT_NE(page, nullptr);
    EXPECT_EQ(GetWindowLongPtrW(host->Sheet(), GWL_EXSTYLE) & WS_EX_CONTEXTHELP, 0);

    EXPECT_EQ(ListItems(page, kMethod), kMethodTexts);
    for (int id : {kImages, kText, kGraphics})
        EXPECT_EQ(ListItems(page, id), kRgbTexts) << id;
    EXPECT_EQ(ListItems(page, kToner), kTonerTexts);
    EXPECT_EQ(ListSelection(page, kMethod), 3);
    EXPECT_EQ(ListSelection(page, kImages), 1);
    EXPECT_EQ(ListSelection(page, kText), 2);
    EXPECT_EQ(ListSelection(page, kGraphics), 4) << "true black is shown before off";
    EXPECT_EQ(ListSelection(page, kToner), 0);
    for (int id : kRgbControls)
        EXPECT_TRUE(IsEnabled(page, id)) << id;
    EXPECT_FALSE(SheetChanged());

    SelectListItem(page, kImages, 5);
    SelectListItem(page, kText, 4);
    SelectListItem(page, kGraphics, 3);
    SelectListItem(page, kToner, 1);
    EXPECT_TRUE(SheetChanged());
    ASSERT_TRUE(host->Apply());
    EXPECT_EQ(ManColBytes(host->oem), LittleEndian({3, 4, 5, 3, 2}));
    // The quality values of the working settings go along; grey correction
    // and the print-quality flag as they were before the sheet was built.
    EXPECT_EQ(QualityOf(host->oem), (Quality{2, 3, 4, 0, 1}));
    EXPECT_EQ(host->oem.HasPrintQuality, 0);
    EXPECT_EQ(Context()->bApplied, 1u);

    // Every entry stores the value it stands for.
    const DWORD methodValues[] = {0, 1, 2, 3}, rgbValues[] = {0, 1, 2, 3, 5, 4}, tonerValues[] = {0, 2, 1};
    SelectListItem(page, kMethod, 3);
    for (int i = 0; i < 4; ++i) {
        SelectListItem(page, kMethod, i);
        ASSERT_TRUE(host->Apply());
        EXPECT_EQ(host->oem.ManColData.dwMethod, methodValues[i]) << i;
    }
    for (int i = 0; i < 6; ++i) {
        SelectListItem(page, kImages, i);
        SelectListItem(page, kText, 5 - i);
        SelectListItem(page, kGraphics, i);
        ASSERT_TRUE(host->Apply());
        EXPECT_EQ(ManColBytes(host->oem), LittleEndian({3, rgbValues[i], rgbValues[5 - i], rgbValues[i], 2})) << i;
    }
    for (int i = 0; i < 3; ++i) {
        SelectListItem(page, kToner, i);
        ASSERT_TRUE(host->Apply());
        EXPECT_EQ(host->oem.ManColData.dwTonerSaver, tonerValues[i]) << i;
    }
    EXPECT_EQ(BytesOf(Context()->ws.ManColData), ManColBytes(host->oem)) << "leaving for Apply keeps them too";
}

TEST_F(QualityManualColourPage, RgbListsWorkOnlyForManualCorrectionAndKeepTheirValues)
{
    Features({"HasPrintQuality", "HasManualColor", "IsColorPrinter"});
    host->oem.ManColData = {1, 2, 3, 5, 1};
    HWND page = Open(107);
    ASSERT_NE(page, nullptr);
    for (int id : kRgbControls)
        EXPECT_FALSE(IsEnabled(page, id)) << id;
    for (int id : {kMethod, kToner, kQuality})
        EXPECT_TRUE(IsEnabled(page, id)) << id;
    EXPECT_EQ(ListSelection(page, kImages), 2);
    EXPECT_EQ(ListSelection(page, kText), 3);
    EXPECT_EQ(ListSelection(page, kGraphics), 4);

    SelectListItem(page, kMethod, 3);  // "Ручная"
    for (int id : kRgbControls)
        EXPECT_TRUE(IsEnabled(page, id)) << id;
    SelectListItem(page, kGraphics, 1);
    SelectListItem(page, kMethod, 2);  // "Автоматическая настройка"
    for (int id : kRgbControls)
        EXPECT_FALSE(IsEnabled(page, id)) << id;
    EXPECT_EQ(ListSelection(page, kGraphics), 1);

    // Coming back shows the working settings under the same rule.
    ASSERT_TRUE(host->SelectPage(104));
    EXPECT_EQ(BytesOf(Context()->ws.ManColData), LittleEndian({2, 2, 3, 1, 1}));
    ASSERT_TRUE(host->SelectPage(107));
    EXPECT_EQ(ListSelection(page, kMethod), 2);
    EXPECT_FALSE(IsEnabled(page, kImages));
    ASSERT_TRUE(host->Apply());
    EXPECT_EQ(ManColBytes(host->oem), LittleEndian({2, 2, 3, 1, 1}));
}

TEST_F(QualityManualColourPage, StoredValuesNoEntryCarriesShowNothingAndBecomeZero)
{
    Features({"HasPrintQuality", "HasManualColor", "IsColorPrinter"});
    host->oem.ManColData = {7, 6, 3, 0xFFFFFFFF, 3};
    HWND page = Open(107);
    ASSERT_NE(page, nullptr);
    EXPECT_EQ(ListSelection(page, kMethod), -1);
    EXPECT_EQ(ListSelection(page, kImages), -1);
    EXPECT_EQ(ListSelection(page, kText), 3);
    EXPECT_EQ(ListSelection(page, kGraphics), -1);
    EXPECT_EQ(ListSelection(page, kToner), -1);
    for (int id : kRgbControls)
        EXPECT_FALSE(IsEnabled(page, id)) << id;
    // The activation took what the lists show; the devmode waits for Apply.
    EXPECT_EQ(BytesOf(Context()->ws.ManColData), LittleEndian({0, 0, 3, 0, 0}));
    EXPECT_EQ(ManColBytes(host->oem), LittleEndian({7, 6, 3, 0xFFFFFFFF, 3}));
    ASSERT_TRUE(host->Apply());
    EXPECT_EQ(ManColBytes(host->oem), LittleEndian({0, 0, 3, 0, 0}));
}

TEST_F(QualityRgbDialog, ShowsTheWorkingValuesAtTheNearestEndAndOkStoresTheTrackbars)
{
    Features({"HasPrintQuality", "HasManualColor", "IsColorPrinter"});
    host->oem.Brightness = -9;
    host->oem.Contrast = 2;
    host->oem.ImageSaturation = 7;
    host->oem.GrayCorr = 1;
    host->oem.EnhanceLines = 1;
    HWND page = Open(107);
    ASSERT_NE(page, nullptr);
    bool ran = false;
    RunQualityDialog(page, [&](HWND dlg) {
        ran = true;
        EXPECT_EQ(WindowText(dlg), L"Качество печати RGB");
        ExpectSetUp(dlg, kRgbBrightness, -6, 6);
        ExpectSetUp(dlg, kRgbContrast, 0, 5);
        ExpectSetUp(dlg, kSaturation, 0, 5);
        EXPECT_EQ(Pos(dlg, kRgbBrightness), -6);
        EXPECT_EQ(Pos(dlg, kRgbContrast), 2);
        EXPECT_EQ(Pos(dlg, kSaturation), 5);
        EXPECT_TRUE(IsChecked(dlg, kRgbEnhance));
        EXPECT_TRUE(IsEnabled(dlg, kSaturation)) << "a driver without ColorMode counts as colour";
        EXPECT_FALSE(SheetChanged());
        Slide(dlg, kRgbBrightness, 3);
        EXPECT_TRUE(SheetChanged()) << "a move tells the sheet at once";
        Slide(dlg, kRgbContrast, -1);
        UserClick(dlg, kRgbEnhance);
        Press(dlg, IDOK);
    });
    EXPECT_TRUE(ran);
    // The dialog writes the working settings only; the page's Apply carries them.
    EXPECT_EQ(QualityOf(Context()->ws), (Quality{-3, 1, 5, 1, 0}));
    EXPECT_EQ(QualityOf(host->oem), (Quality{-9, 2, 7, 1, 1}));
    ASSERT_TRUE(host->Apply());
    EXPECT_EQ(QualityOf(host->oem), (Quality{-3, 1, 5, 1, 0}));

    // Opened again it shows what OK stored.
    RunQualityDialog(page, [&](HWND dlg) {
        EXPECT_EQ(Pos(dlg, kRgbBrightness), -3);
        EXPECT_EQ(Pos(dlg, kRgbContrast), 1);
        EXPECT_FALSE(IsChecked(dlg, kRgbEnhance));
        Press(dlg, IDCANCEL);
    });
}

TEST_F(QualityRgbDialog, MonoColourModeDisablesSaturationAndOkKeepsItsPosition)
{
    struct Case {
        const char* option;
        bool saturation;
    };
    // "Monochrome" does not fit the 10-byte answer, so the driver cannot give it.
    for (const Case& c : {Case{"Mono", false}, Case{"Color", true}, Case{"Mon", true}, Case{"Monochrome", true}}) {
        SCOPED_TRACE(c.option);
        host->Destroy();
        host = std::make_unique<SimHost>(CreatePluginObject(), L"Norvane Color LaserJet", L"Norvane PCL 6");
        Features({"HasPrintQuality", "HasManualColor", "IsColorPrinter"});
        host->driverUI.features["ColorMode"] = c.option;
        host->oem.ImageSaturation = 3;
        HWND page = Open(107);
        ASSERT_NE(page, nullptr);
        RunQualityDialog(page, [&](HWND dlg) {
            EXPECT_EQ(IsEnabled(dlg, kSaturation), c.saturation);
            EXPECT_TRUE(IsEnabled(dlg, kRgbBrightness));
            EXPECT_TRUE(IsEnabled(dlg, kRgbContrast));
            EXPECT_EQ(Pos(dlg, kSaturation), 3);
            Slide(dlg, kRgbBrightness, 1);
            Press(dlg, IDOK);
        });
        EXPECT_EQ(Context()->ws.ImageSaturation, 3);
        EXPECT_EQ(Context()->ws.Brightness, 1);
        int asked = 0;
        for (const std::string& q : host->driverUI.queries)
            asked += q == "ColorMode";
        EXPECT_EQ(asked, 1);
    }
}

TEST_F(QualityRgbDialog, CancelLeavesTheWorkingSettingsAndOnlyOkMarksThePage)
{
    Features({"HasPrintQuality", "HasManualColor", "IsColorPrinter"});
    host->oem.Brightness = 1;
    host->oem.Contrast = 4;
    host->oem.ImageSaturation = 2;
    host->oem.EnhanceLines = 0;
    HWND page = Open(107);
    ASSERT_NE(page, nullptr);
    const WORKINGSETTINGS before = Context()->ws;

    RunQualityDialog(page, [&](HWND dlg) { Press(dlg, IDCANCEL); });
    EXPECT_FALSE(SheetChanged());

    RunQualityDialog(page, [&](HWND dlg) {
        Slide(dlg, kRgbBrightness, -4);
        Slide(dlg, kRgbContrast, 1);
        Slide(dlg, kSaturation, 3);
        UserClick(dlg, kRgbEnhance);
        Press(dlg, IDCANCEL);
    });
    EXPECT_EQ(std::memcmp(&Context()->ws, &before, sizeof(before)), 0);
    ASSERT_TRUE(host->Apply());
    EXPECT_EQ(QualityOf(host->oem), (Quality{1, 4, 2, before.GrayCorr, 0}));

    // OK without a change still counts as a change of the page.
    host->CloseSheet();
    ASSERT_NE(host->ShowSheet(), nullptr);
    ASSERT_TRUE(host->SelectPage(107));
    page = host->PageWindow(107);
    EXPECT_FALSE(SheetChanged());
    RunQualityDialog(page, [&](HWND dlg) { Press(dlg, IDOK); });
    EXPECT_TRUE(SheetChanged());
}

TEST_F(QualityMonoPage, GreyCorrectionOffDisablesTheLevelsButKeepsTheirPositions)
{
    Features({"HasPrintQuality"});
    host->oem.Brightness = 3;
    host->oem.Contrast = 4;
    host->oem.GrayCorr = 0;
    host->oem.EnhanceLines = 1;
    host->oem.ImageSaturation = 2;
    HWND page = Open(229);
    ASSERT_NE(page, nullptr);
    ExpectSetUp(page, kBwBrightness, -6, 6);
    ExpectSetUp(page, kBwContrast, 0, 5);
    EXPECT_EQ(Pos(page, kBwBrightness), 3);
    EXPECT_EQ(Pos(page, kBwContrast), 4);
    EXPECT_FALSE(IsChecked(page, kGrayCorr));
    EXPECT_TRUE(IsChecked(page, kBwEnhance));
    EXPECT_FALSE(IsEnabled(page, kBwBrightness));
    EXPECT_FALSE(IsEnabled(page, kBwContrast));
    EXPECT_FALSE(SheetChanged());

    UserClick(page, kGrayCorr);
    EXPECT_TRUE(IsEnabled(page, kBwBrightness));
    EXPECT_TRUE(IsEnabled(page, kBwContrast));
    EXPECT_TRUE(SheetChanged());
    Slide(page, kBwBrightness, -2);
    UserClick(page, kGrayCorr);
    EXPECT_FALSE(IsEnabled(page, kBwBrightness));
    UserClick(page, kBwEnhance);

    ASSERT_TRUE(host->SelectPage(104));
    EXPECT_EQ(QualityOf(Context()->ws), (Quality{1, 4, 2, 0, 0}));
    EXPECT_EQ(Context()->bApplied, 1u);
    ASSERT_TRUE(host->SelectPage(229));
    EXPECT_EQ(Pos(page, kBwBrightness), 1);
    EXPECT_FALSE(IsEnabled(page, kBwBrightness));
    EXPECT_FALSE(IsChecked(page, kBwEnhance));
    ASSERT_TRUE(host->Apply());
    EXPECT_EQ(QualityOf(host->oem), (Quality{1, 4, 2, 0, 0}));
    EXPECT_EQ(ManColBytes(host->oem), LittleEndian({0, 0, 0, 0, 0})) << "not this page's block";
}

TEST_F(QualityMonoPage, StoredLevelsOutsideTheRangeShowAtTheNearestEndAndAreStoredSo)
{
    Features({"HasPrintQuality"});
    host->oem.Brightness = -20;
    host->oem.Contrast = 99;
    host->oem.GrayCorr = 5;
    host->oem.EnhanceLines = 0;
    HWND page = Open(229);
    ASSERT_NE(page, nullptr);
    EXPECT_EQ(Pos(page, kBwBrightness), -6);
    EXPECT_EQ(Pos(page, kBwContrast), 5);
    EXPECT_TRUE(IsChecked(page, kGrayCorr));
    EXPECT_TRUE(IsEnabled(page, kBwBrightness));
    EXPECT_FALSE(SheetChanged());
    Slide(page, kBwContrast, 1);  // already at the end
    EXPECT_TRUE(SheetChanged()) << "a trackbar key tells the sheet";
    ASSERT_TRUE(host->SelectPage(104));
    EXPECT_EQ(Context()->ws.Brightness, -6);
    EXPECT_EQ(Context()->ws.Contrast, 5);
    EXPECT_EQ(Context()->ws.GrayCorr, 1);
    ASSERT_TRUE(host->Apply());
    EXPECT_EQ(host->oem.Brightness, -6);
    EXPECT_EQ(host->oem.Contrast, 5);
    EXPECT_EQ(host->oem.GrayCorr, 1);
}

TEST_F(QualityPagesTest, WithoutPermissionEverythingIsDisabledAndNothingIsStored)
{
    Features({"HasPrintQuality", "HasManualColor"});
    host->paramFlags = 0x20;
    host->oem.ManColData = {3, 1, 2, 3, 1};
    host->oem.Brightness = 9;
    host->oem.Contrast = 2;
    host->oem.ImageSaturation = 3;
    host->oem.GrayCorr = 1;
    host->oem.EnhanceLines = 0;
    ASSERT_EQ(host->InitDocumentSheet(), S_OK);
    const OEMDEV before = host->oem;
    const WORKINGSETTINGS working = Context()->ws;
    ASSERT_NE(host->ShowSheet(), nullptr);

    for (WORD id : {WORD(107), WORD(229)}) {
        ASSERT_TRUE(host->SelectPage(id)) << id;
        HWND page = host->PageWindow(id);
        const std::vector<HWND> controls = Descendants(page);
        EXPECT_GT(controls.size(), 5u);
        for (HWND h : controls)
            EXPECT_FALSE(IsWindowEnabled(h)) << id << ": control " << GetDlgCtrlID(h);
    }
    // The quality button is disabled with the rest; a program can still send
    // its command, and then the dialog only lets the user out.
    ASSERT_TRUE(host->SelectPage(107));
    HWND page = host->PageWindow(107);
    QueueDialog([&](HWND dlg) {
        for (HWND h : Descendants(dlg))
            EXPECT_EQ(IsWindowEnabled(h) != FALSE, GetDlgCtrlID(h) == IDCANCEL) << GetDlgCtrlID(h);
        Press(dlg, IDCANCEL);
    });
    SendMessageW(page, WM_COMMAND, MAKEWPARAM(kQuality, BN_CLICKED),
                 reinterpret_cast<LPARAM>(GetDlgItem(page, kQuality)));
    EXPECT_EQ(PendingDialogScripts(), 0u);

    ASSERT_TRUE(host->SelectPage(229));
    ASSERT_TRUE(host->SelectPage(107));
    host->Apply();
    EXPECT_EQ(std::memcmp(&host->oem, &before, sizeof(before)), 0);
    EXPECT_EQ(std::memcmp(&Context()->ws, &working, sizeof(working)), 0);
    EXPECT_EQ(Context()->bApplied, 0u);
    host->calls.clear();
    EXPECT_EQ(host->Destroy(), S_OK);
    EXPECT_EQ(host->Result(), 1u) << "no page applied";
    EXPECT_TRUE(host->calls.empty());
}
