#include "frame/printerevent.h"

#include "frame/scoped.h"

#include <strsafe.h>
#include <wchar.h>

namespace {

const size_t kNameUnits = 128;  // data file path and print processor name

// A block from LocalAlloc, freed on every path.
class LocalBlock {
public:
    explicit LocalBlock(SIZE_T cb) : p_(LocalAlloc(LPTR, cb)) {}
    ~LocalBlock() { if (p_) LocalFree(p_); }
    LocalBlock(const LocalBlock&) = delete;
    LocalBlock& operator=(const LocalBlock&) = delete;
    BYTE* get() const { return static_cast<BYTE*>(p_); }
private:
    HLOCAL p_;
};

// The driver's data file path; FALSE when the driver cannot be read, has no
// data file, or the path does not fit (a cut path would name the wrong file).
BOOL ReadDataFilePath(HANDLE hPrinter, WCHAR (&path)[kNameUnits])
{
    path[0] = 0;
    DWORD cb = 0;
    GetPrinterDriverW(hPrinter, nullptr, 2, nullptr, 0, &cb);
    HeapBuffer buf;
    if (cb < sizeof(DRIVER_INFO_2W) || !buf.alloc(cb))
        return FALSE;
    DWORD got = 0;
    if (!GetPrinterDriverW(hPrinter, nullptr, 2, buf.get<BYTE>(), cb, &got))
        return FALSE;
    const WCHAR* dataFile = buf.get<DRIVER_INFO_2W>()->pDataFile;
    if (!dataFile || FAILED(StringCchCopyW(path, kNameUnits, dataFile))) {
        path[0] = 0;
        return FALSE;
    }
    return TRUE;
}

// The print processor belonging to a data file: its base name with the last
// character replaced by 'C' (ABCDEF.GPD gives ABCDEC). The base name ends at
// the first dot, which must not lead the name and must be followed by at least
// three characters.
BOOL DerivePrintProcessor(const WCHAR* path, WCHAR (&name)[kNameUnits])
{
    ZeroMemory(name, sizeof(name));
    const WCHAR* slash = wcsrchr(path, L'\\');
    if (!slash || !slash[1])
        return FALSE;
    const WCHAR* file = slash + 1;
    const WCHAR* dot = wcschr(file, L'.');
    if (!dot || dot == file || wcsnlen(dot + 1, 3) < 3)
        return FALSE;
    const size_t len = static_cast<size_t>(dot - file);
    if (len >= kNameUnits)
        return FALSE;
    CopyMemory(name, file, len * sizeof(WCHAR));
    name[len - 1] = L'C';
    return TRUE;
}

HRESULT SetDriverPrintProcessor(PWSTR pPrinterName)
{
    // A null name would open the print server rather than a printer.
    if (!pPrinterName || !pPrinterName[0])
        return E_FAIL;
    PRINTER_DEFAULTSW defaults = {nullptr, nullptr, PRINTER_ALL_ACCESS};
    HANDLE opened = nullptr;
    if (!OpenPrinterW(pPrinterName, &opened, &defaults) || !opened)
        return E_FAIL;
    ScopedPrinter printer;
    *printer.out() = opened;

    WCHAR path[kNameUnits];
    WCHAR processor[kNameUnits];
    const BOOL named = ReadDataFilePath(printer.get(), path) && DerivePrintProcessor(path, processor);

    DWORD cb = 0;
    if (GetPrinterW(printer.get(), 2, nullptr, 0, &cb) || GetLastError() != ERROR_INSUFFICIENT_BUFFER ||
        cb < sizeof(PRINTER_INFO_2W))
        return E_FAIL;
    LocalBlock info(cb);
    DWORD got = 0;
    if (!info.get() || !GetPrinterW(printer.get(), 2, info.get(), cb, &got))
        return E_FAIL;
    if (named) {
        auto* pi = reinterpret_cast<PRINTER_INFO_2W*>(info.get());
        pi->pPrintProcessor = processor;
        // A printer that refuses keeps its processor; the event still succeeded.
        SetPrinterW(printer.get(), 2, info.get(), 0);
    }
    return S_OK;
}

}  // namespace

HRESULT HandlePrinterEvent(PWSTR pPrinterName, INT iDriverEvent, DWORD, LPARAM)
{
    if (iDriverEvent != PRINTER_EVENT_INITIALIZE)
        return S_OK;
    return SetDriverPrintProcessor(pPrinterName);
}
