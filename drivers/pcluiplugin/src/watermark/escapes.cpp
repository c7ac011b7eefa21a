#include "watermark/escapes.h"

#include <cstring>

BOOL RenderSideHandsOff(HDC hdc)
{
    return ExtEscape(hdc, ESC_HANDS_OFF, 0, nullptr, 0, nullptr) != 0;
}

INT QueryPageNumber(HDC hdc)
{
    INT page = 0;
    ExtEscape(hdc, ESC_PAGE_NUMBER, 0, nullptr, sizeof(page), reinterpret_cast<LPSTR>(&page));
    return page;
}

DWORD QueryJobId(HDC hdc)
{
    int id = ExtEscape(hdc, ESC_JOB_ID, 0, nullptr, 0, nullptr);
    return id > 0 ? static_cast<DWORD>(id) : 0;
}

void FetchOemDevmode(HDC hdc, OEMDEV* pOem)
{
    std::memset(pOem, 0, sizeof(*pOem));
    if (ExtEscape(hdc, ESC_OEM_DEVMODE, 0, nullptr, sizeof(*pOem), reinterpret_cast<LPSTR>(pOem)) <= 0)
        std::memset(pOem, 0, sizeof(*pOem));
}

BOOL FetchPublicDevmode(HDC hdc, DEVMODEW* pdm)
{
    std::memset(pdm, 0, sizeof(*pdm));
    if (ExtEscape(hdc, ESC_PUBLIC_DEVMODE, 0, nullptr, PUBLIC_DEVMODE_SIZE, reinterpret_cast<LPSTR>(pdm)) > 0)
        return TRUE;
    std::memset(pdm, 0, sizeof(*pdm));
    return FALSE;
}

void SendPageRecord(HDC hdc, const PAGERECORD& rec)
{
    ExtEscape(hdc, ESC_SET_PAGE_RECORD, sizeof(rec), reinterpret_cast<LPCSTR>(&rec), 0, nullptr);
}

int CountPageRecords(HDC hdc)
{
    int n = ExtEscape(hdc, ESC_PAGE_RECORDS, 0, nullptr, 0, nullptr);
    return n > 0 ? n : 0;
}

int FetchPageRecords(HDC hdc, PAGERECORD* pRecs, int cMax)
{
    int n = ExtEscape(hdc, ESC_PAGE_RECORDS, 0, nullptr, cMax * static_cast<int>(sizeof(PAGERECORD)),
                      reinterpret_cast<LPSTR>(pRecs));
    if (n < 0)
        return 0;
    return n < cMax ? n : cMax;
}
