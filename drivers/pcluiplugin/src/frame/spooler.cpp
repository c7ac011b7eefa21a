#include "frame/spooler.h"

#include <strsafe.h>

PRINTER_INFO_2W* ReadPrinterInfo2(HANDLE hPrinter, HeapBuffer& buf)
{
    if (!hPrinter)
        return nullptr;
    DWORD cbNeeded = 0;
    GetPrinterW(hPrinter, 2, nullptr, 0, &cbNeeded);
    if (cbNeeded < sizeof(PRINTER_INFO_2W) || !buf.alloc(cbNeeded))
        return nullptr;
    DWORD cbGot = 0;
    if (!GetPrinterW(hPrinter, 2, buf.get<BYTE>(), cbNeeded, &cbGot)) {
        buf.reset();
        return nullptr;
    }
    return buf.get<PRINTER_INFO_2W>();
}

BOOL ReadPrinterDriverName(HANDLE hPrinter, WCHAR* out, size_t cchOut)
{
    HeapBuffer buf;
    PRINTER_INFO_2W* pi = ReadPrinterInfo2(hPrinter, buf);
    if (!pi || !pi->pDriverName)
        return FALSE;
    size_t cch = 0;
    if (FAILED(StringCchLengthW(pi->pDriverName, cchOut, &cch)))
        return FALSE;
    StringCchCopyW(out, cchOut, pi->pDriverName);
    return TRUE;
}

void CopySpoolerString(WCHAR* out, size_t cchOut, LPCWSTR src)
{
    if (!cchOut)
        return;
    out[0] = 0;
    if (src)
        StringCchCopyNW(out, cchOut, src, cchOut - 1);
}
