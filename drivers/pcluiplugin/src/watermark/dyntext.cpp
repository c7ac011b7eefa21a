#include "watermark/dyntext.h"

#include "frame/module.h"
#include "frame/scoped.h"
#include "frame/spooler.h"
#include "resources/resource.h"
#include "watermark/escapes.h"
#include "watermark/wmrecord.h"

#include <strsafe.h>

namespace {

constexpr int NAME_CCH = 50;
constexpr int DESC_CCH = 128;
constexpr int VALUE_CCH = 260;
constexpr DWORD VALUE_CCH_ANNOUNCED = 100;  // what producers are told the buffer holds
constexpr int OUTPUT_CCH = 1023;
// No variable name is longer than 17 units, so anything collected past this
// cannot match and is only consumed, not stored.
constexpr int COLLECT_CCH = 26;

enum DynVar {
    DV_USER, DV_DATE_SHORT, DV_DATE_LONG, DV_DATE_DMY, DV_TIME, DV_TIME_24, DV_TIME_HHMM,
    DV_PAGE, DV_HOST, DV_PRINTER, DV_MODEL, DV_PERCENT
};

struct ValueSource {
    HDC hdc;
    HANDLE hPrinter;
    LPCWSTR pszPrinter;
    LPCWSTR pszModel;
    INT iPage;
    DWORD dwMode;
};

// Output that refuses to grow past its buffer.
struct Output {
    WCHAR buf[OUTPUT_CCH + 1];
    int len = 0;
    void Append(const WCHAR* p, int cch)
    {
        for (int i = 0; i < cch && p[i] && len < OUTPUT_CCH; ++i)
            buf[len++] = p[i];
    }
};

void LoadTable(UINT firstId, WCHAR (*table)[NAME_CCH])
{
    for (int i = 0; i < DYNVAR_COUNT; ++i)
        if (LoadStringW(ModuleInstance(), firstId + i, table[i], NAME_CCH) <= 0)
            table[i][0] = L'\0';
}

void JobOwner(const ValueSource& src, WCHAR* value)
{
    if (!src.hdc || !src.hPrinter)
        return;
    DWORD jobId = QueryJobId(src.hdc);
    DWORD cbNeeded = 0;
    GetJobW(src.hPrinter, jobId, 1, nullptr, 0, &cbNeeded);
    if (cbNeeded < sizeof(JOB_INFO_1W))
        return;
    HeapBuffer buf(cbNeeded);
    if (!buf || !GetJobW(src.hPrinter, jobId, 1, buf.get<BYTE>(), cbNeeded, &cbNeeded))
        return;
    CopySpoolerString(value, VALUE_CCH_ANNOUNCED, buf.get<JOB_INFO_1W>()->pUserName);
}

void FormatDate(DWORD flags, LPCWSTR picture, WCHAR* value)
{
    SYSTEMTIME st;
    GetLocalTime(&st);
    if (GetDateFormatW(LOCALE_USER_DEFAULT, flags, &st, picture, value, VALUE_CCH_ANNOUNCED) <= 0)
        value[0] = L'\0';
}

void FormatTime(DWORD flags, LPCWSTR picture, WCHAR* value)
{
    SYSTEMTIME st;
    GetLocalTime(&st);
    if (GetTimeFormatW(LOCALE_USER_DEFAULT, flags, &st, picture, value, VALUE_CCH_ANNOUNCED) <= 0)
        value[0] = L'\0';
}

void ProduceValue(int index, const ValueSource& src, WCHAR* value)
{
    value[0] = L'\0';
    DWORD cch = VALUE_CCH_ANNOUNCED;
    switch (index) {
    case DV_USER:
        if (src.dwMode & WMDRAW_PREVIEW) {
            if (!GetUserNameW(value, &cch))
                value[0] = L'\0';
        } else if (src.dwMode & WMDRAW_PRINT) {
            JobOwner(src, value);
        }
        break;
    case DV_DATE_SHORT: FormatDate(DATE_SHORTDATE, nullptr, value); break;
    case DV_DATE_LONG: FormatDate(DATE_LONGDATE, nullptr, value); break;
    case DV_DATE_DMY: FormatDate(0, L"dd/MM/yyyy", value); break;
    case DV_TIME: FormatTime(LOCALE_NOUSEROVERRIDE, nullptr, value); break;
    case DV_TIME_24: FormatTime(0, L"HH':'mm':'ss", value); break;
    case DV_TIME_HHMM: FormatTime(0, L"hh':'mm tt", value); break;
    case DV_PAGE: StringCchPrintfW(value, VALUE_CCH, L"%d", src.iPage); break;
    case DV_HOST:
        if (!GetComputerNameW(value, &cch))
            value[0] = L'\0';
        break;
    case DV_PRINTER: CopySpoolerString(value, VALUE_CCH, src.pszPrinter); break;
    case DV_MODEL: CopySpoolerString(value, VALUE_CCH, src.pszModel); break;
    case DV_PERCENT: value[0] = L'%'; value[1] = L'\0'; break;
    }
    value[VALUE_CCH - 1] = L'\0';
}

BOOL InsertVariable(WCHAR* text, LPCWSTR pszToken)
{
    WCHAR names[DYNVAR_COUNT][NAME_CCH];
    LoadTable(IDS_DYNVAR_FIRST_NAME, names);
    for (int i = 0; i < DYNVAR_COUNT; ++i) {
        WCHAR desc[DESC_CCH];
        if (LoadStringW(ModuleInstance(), IDS_DYNVAR_FIRST_DESC + i, desc, DESC_CCH) <= 0)
            continue;
        if (lstrcmpiW(desc, pszToken) != 0)
            continue;
        size_t cchText = BoundedLength(text, DYNTEXT_CCH);
        size_t cchName = BoundedLength(names[i], NAME_CCH);
        if (cchText + cchName + 1 < DYNTEXT_CCH) {
            text[cchText] = L'\0';  // a full field had no terminator to append after
            StringCchCatW(text, DYNTEXT_CCH, names[i]);
        }
        break;
    }
    return TRUE;
}

}  // namespace

BOOL ExpandDynamicText(HDC hdc, HANDLE hPrinter, WCHAR text[DYNTEXT_CCH], LPCWSTR pszToken, LPCWSTR pszPrinter,
                       LPCWSTR pszModel, INT iPage, DWORD dwMode)
{
    if (!text)
        return FALSE;
    if (pszToken)
        return InsertVariable(text, pszToken);

    WCHAR names[DYNVAR_COUNT][NAME_CCH];
    LoadTable(IDS_DYNVAR_FIRST_NAME, names);
    const ValueSource src{hdc, hPrinter, pszPrinter, pszModel, iPage, dwMode};

    const int cchIn = static_cast<int>(BoundedLength(text, DYNTEXT_CCH));
    Output out;
    BOOL result = TRUE;
    int i = 0;
    while (i < cchIn) {
        if (text[i] != L'%') {
            out.Append(&text[i], 1);
            ++i;
            continue;
        }
        WCHAR var[COLLECT_CCH + 1];
        int cchVar = 0;
        var[cchVar++] = L'%';
        int j = i + 1;
        bool overlong = false;
        for (; j < cchIn && text[j] != L'%'; ++j) {
            if (cchVar < COLLECT_CCH)
                var[cchVar++] = text[j];
            else
                overlong = true;
        }
        const bool closed = j < cchIn;
        if (closed) {
            if (cchVar < COLLECT_CCH)
                var[cchVar++] = L'%';
            else
                overlong = true;
        }
        var[cchVar] = L'\0';

        int index = -1;
        if (!overlong)
            for (int k = 0; k < DYNVAR_COUNT && index < 0; ++k)
                if (names[k][0] && lstrcmpiW(var, names[k]) == 0)
                    index = k;
        if (index >= 0) {
            WCHAR value[VALUE_CCH];
            ProduceValue(index, src, value);
            if (!value[0])
                result = FALSE;
            out.Append(value, VALUE_CCH);
        } else {
            result = FALSE;
        }
        // An unclosed variable gives its characters back as plain text.
        i = closed ? j + 1 : i + 1;
    }
    out.buf[out.len] = L'\0';
    if (out.len >= DYNTEXT_CCH)
        out.buf[DYNTEXT_CCH - 2] = L'\0';
    StringCchCopyW(text, DYNTEXT_CCH, out.buf);
    return result;
}
