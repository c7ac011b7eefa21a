// Dynamic text expansion and insertion, with the real locale, user and
// computer functions and the simulated spooler and render side.
#include "watermark/dyntext.h"

#include "simrender.h"
#include "simspooler.h"

#include <gtest/gtest.h>
#include <string>

namespace {

struct Expansion {
    BOOL ok;
    std::wstring text;
};

Expansion Expand(const std::wstring& in, LPCWSTR printer = L"Принтер 1", LPCWSTR model = L"Norvane PCL 6",
                 INT page = 1, DWORD mode = WMDRAW_PREVIEW, HDC hdc = nullptr, HANDLE hPrinter = nullptr)
{
    WCHAR text[DYNTEXT_CCH] = {};
    in.copy(text, DYNTEXT_CCH);
    BOOL ok = ExpandDynamicText(hdc, hPrinter, text, nullptr, printer, model, page, mode);
    return {ok, std::wstring(text)};
}

std::wstring Today(LPCWSTR picture)
{
    SYSTEMTIME st;
    GetLocalTime(&st);
    WCHAR buf[100];
    GetDateFormatW(LOCALE_USER_DEFAULT, 0, &st, picture, buf, 100);
    return buf;
}

}  // namespace

TEST(DynamicText, VariablesExpandInPlace)
{
    EXPECT_EQ(Expand(L"Стр. %номерстраницы% из", nullptr, nullptr, 12).text, L"Стр. 12 из");
    Expansion e = Expand(L"%принтер% / %модель%");
    EXPECT_TRUE(e.ok);
    EXPECT_EQ(e.text, L"Принтер 1 / Norvane PCL 6");
    // Names match without regard to case.
    e = Expand(L"[%ПРИНТЕР%]");
    EXPECT_TRUE(e.ok);
    EXPECT_EQ(e.text, L"[Принтер 1]");
    e = Expand(L"%датаддммгггг%");
    EXPECT_TRUE(e.ok);
    EXPECT_EQ(e.text, Today(L"dd/MM/yyyy"));
    WCHAR host[100];
    DWORD cch = 100;
    ASSERT_TRUE(GetComputerNameW(host, &cch));
    EXPECT_EQ(Expand(L"%имяхоста%").text, host);
    // The 24-hour time has two colons and eight characters.
    e = Expand(L"%времямил%");
    ASSERT_EQ(e.text.size(), 8u);
    EXPECT_EQ(e.text[2], L':');
    EXPECT_EQ(e.text[5], L':');
    EXPECT_TRUE(Expand(L"%датакраткая% %датадлинная% %время% %времяччмм%").ok);
}

TEST(DynamicText, PercentSignsAndUnknownNames)
{
    Expansion e = Expand(L"100%% готово");
    EXPECT_TRUE(e.ok);
    EXPECT_EQ(e.text, L"100% готово");
    // A lone percent sign is dropped, the rest stays, and the text is refused.
    e = Expand(L"скидка 5% сегодня");
    EXPECT_FALSE(e.ok);
    EXPECT_EQ(e.text, L"скидка 5 сегодня");
    e = Expand(L"до %нетакого% после");
    EXPECT_FALSE(e.ok);
    EXPECT_EQ(e.text, L"до  после");
    // A variable longer than any name cannot overrun the collector.
    e = Expand(L"a%" + std::wstring(100, L'x') + L"%b");
    EXPECT_FALSE(e.ok);
    EXPECT_EQ(e.text, L"ab");
    // Empty values fail the expansion but keep the rest.
    e = Expand(L"[%принтер%]", L"", nullptr);
    EXPECT_FALSE(e.ok);
    EXPECT_EQ(e.text, L"[]");
}

TEST(DynamicText, UserNameInPreviewAndJobOwnerAtPrintTime)
{
    WCHAR me[100];
    DWORD cch = 100;
    ASSERT_TRUE(GetUserNameW(me, &cch));
    EXPECT_EQ(Expand(L"%Имяпользователя%").text, me);

    SimResetSpooler();
    SimPrinter p;
    p.name = L"Job printer";
    p.driver = L"Norvane PCL";
    p.jobs = {{41, L"ivanova"}, {42, L"petrov"}};
    HANDLE hPrinter = SimAddPrinter(p);
    SimRenderJob job;
    SimSetA4(job, 100);
    job.jobId = 42;
    SimPage page(job, 1);
    Expansion e = Expand(L"от %имяпользователя%", nullptr, nullptr, 1, WMDRAW_PRINT, page.dc(), hPrinter);
    EXPECT_TRUE(e.ok);
    EXPECT_EQ(e.text, L"от petrov");
    EXPECT_EQ(job.escapeCalls[4097], 1);

    // Without a device context or printer handle, or for an unknown job,
    // there is no owner.
    EXPECT_FALSE(Expand(L"%Имяпользователя%", nullptr, nullptr, 1, WMDRAW_PRINT, nullptr, hPrinter).ok);
    job.jobId = 7;
    e = Expand(L"x%Имяпользователя%", nullptr, nullptr, 1, WMDRAW_PRINT, page.dc(), hPrinter);
    EXPECT_FALSE(e.ok);
    EXPECT_EQ(e.text, L"x");
    SimResetSpooler();
}

TEST(DynamicText, OutputStaysInsideTheField)
{
    Expansion e = Expand(std::wstring(127, L'a'));
    EXPECT_TRUE(e.ok);
    EXPECT_EQ(e.text.size(), 127u);
    // 126 plain characters plus "%%" expand to 127 ...
    e = Expand(std::wstring(126, L'b') + L"%%");
    EXPECT_EQ(e.text, std::wstring(126, L'b') + L"%");
    // ... and a 128-character result is cut to 126.
    e = Expand(std::wstring(120, L'c') + L"%модель%", nullptr, L"12345678");
    EXPECT_TRUE(e.ok);
    EXPECT_EQ(e.text, std::wstring(120, L'c') + L"123456");

    // Fourteen 259-character printer names are far more than the 1023-unit
    // intermediate buffer.
    std::wstring longName(259, L'П');
    std::wstring many;
    while (many.size() + 9 <= 127)
        many += L"%принтер%";
    e = Expand(many, longName.c_str());
    EXPECT_TRUE(e.ok);
    EXPECT_EQ(e.text, std::wstring(126, L'П'));

    // A field filled to all 128 units with no terminator.
    WCHAR full[DYNTEXT_CCH + 4];
    for (auto& ch : full)
        ch = L'z';
    full[DYNTEXT_CCH] = L'\0';  // guard beyond the field; must stay untouched
    full[DYNTEXT_CCH + 1] = L'G';
    EXPECT_TRUE(ExpandDynamicText(nullptr, nullptr, full, nullptr, L"p", L"m", 1, WMDRAW_PREVIEW));
    EXPECT_EQ(std::wstring(full), std::wstring(126, L'z'));
    EXPECT_EQ(full[DYNTEXT_CCH + 1], L'G');
}

TEST(DynamicText, InsertionAppendsTheVariableThatFits)
{
    WCHAR text[DYNTEXT_CCH] = L"Печать: ";
    EXPECT_TRUE(ExpandDynamicText(nullptr, nullptr, text, L"ИМЯ ПРИНТЕРА", nullptr, nullptr, 1, 1));
    EXPECT_STREQ(text, L"Печать: %принтер%");
    EXPECT_TRUE(ExpandDynamicText(nullptr, nullptr, text, L"Символ процента (%)", nullptr, nullptr, 1, 1));
    EXPECT_STREQ(text, L"Печать: %принтер%%%");
    // Unknown descriptions change nothing.
    EXPECT_TRUE(ExpandDynamicText(nullptr, nullptr, text, L"%принтер%", nullptr, nullptr, 1, 1));
    EXPECT_STREQ(text, L"Печать: %принтер%%%");

    // "%номерстраницы%" is 15 units: 111 + 15 + 1 = 127 fits, 112 does not.
    std::wstring base(111, L'q');
    base.copy(text, DYNTEXT_CCH);
    text[111] = 0;
    EXPECT_TRUE(ExpandDynamicText(nullptr, nullptr, text, L"Номер страницы", nullptr, nullptr, 1, 1));
    EXPECT_EQ(std::wstring(text), base + L"%номерстраницы%");
    base.push_back(L'q');
    base.copy(text, DYNTEXT_CCH);
    text[112] = 0;
    EXPECT_TRUE(ExpandDynamicText(nullptr, nullptr, text, L"Номер страницы", nullptr, nullptr, 1, 1));
    EXPECT_EQ(std::wstring(text), base);
}
