#include "simspooler.h"
#include "iathook.h"

#include <cstring>
#include <memory>

namespace {

struct Handle {
    SimPrinter* printer;
    bool opened;  // through OpenPrinterW
};

std::vector<std::unique_ptr<SimPrinter>> g_printers;
std::vector<std::unique_ptr<Handle>> g_handles;
int g_open = 0;

Handle* HandleOf(HANDLE h)
{
    for (auto& p : g_handles)
        if (p.get() == h)
            return p.get();
    return nullptr;
}

// Lays out a fixed structure followed by its strings in one caller buffer,
// as the spooler does.
class Packer {
public:
    Packer(size_t cbFixed, BYTE* buf, DWORD cbBuf) : need_(cbFixed), buf_(buf), cb_(cbBuf) {}
    LPWSTR add(const std::wstring& s) { return addRaw(s.c_str(), (s.size() + 1) * sizeof(WCHAR)); }
    LPWSTR addMulti(const std::vector<std::wstring>& list)
    {
        std::wstring all;
        for (auto& s : list) {
            all += s;
            all.push_back(0);
        }
        all.push_back(0);
        return addRaw(all.data(), all.size() * sizeof(WCHAR));
    }
    DWORD needed() const { return DWORD(need_); }
    bool fits() const { return buf_ && need_ <= cb_; }
private:
    LPWSTR addRaw(const void* p, size_t cb)
    {
        size_t at = need_;
        need_ += cb;
        if (buf_ && need_ <= cb_) {
            memcpy(buf_ + at, p, cb);
            return reinterpret_cast<LPWSTR>(buf_ + at);
        }
        return nullptr;
    }
    size_t need_;
    BYTE* buf_;
    DWORD cb_;
};

BOOL Finish(Packer& pk, LPDWORD pcbNeeded)
{
    if (pcbNeeded)
        *pcbNeeded = pk.needed();
    if (!pk.fits()) {
        SetLastError(ERROR_INSUFFICIENT_BUFFER);
        return FALSE;
    }
    return TRUE;
}

BOOL WINAPI SimGetPrinterW(HANDLE h, DWORD level, LPBYTE buf, DWORD cb, LPDWORD pcbNeeded)
{
    Handle* hd = HandleOf(h);
    if (!hd) {
        SetLastError(ERROR_INVALID_HANDLE);
        return FALSE;
    }
    SimPrinter& p = *hd->printer;
    if (p.failGetPrinter) {
        SetLastError(ERROR_ACCESS_DENIED);
        return FALSE;
    }
    if (level != 2) {
        SetLastError(ERROR_INVALID_LEVEL);
        return FALSE;
    }
    PRINTER_INFO_2W info = {};
    bool room = buf && cb >= sizeof(info);
    Packer pk(sizeof(info), room ? buf : nullptr, cb);
    info.pPrinterName = pk.add(p.name);
    info.pDriverName = pk.add(p.driver);
    info.pPortName = pk.add(L"FILE:");
    info.pPrintProcessor = pk.add(p.printProcessor);
    info.pDatatype = pk.add(L"RAW");
    if (!Finish(pk, pcbNeeded))
        return FALSE;
    memcpy(buf, &info, sizeof(info));
    return TRUE;
}

BOOL WINAPI SimGetPrinterDriverW(HANDLE h, LPWSTR, DWORD level, LPBYTE buf, DWORD cb, LPDWORD pcbNeeded)
{
    Handle* hd = HandleOf(h);
    if (!hd) {
        SetLastError(ERROR_INVALID_HANDLE);
        return FALSE;
    }
    SimPrinter& p = *hd->printer;
    size_t fixed = level == 2 ? sizeof(DRIVER_INFO_2W) : level == 3 ? sizeof(DRIVER_INFO_3W)
                 : level == 6 ? sizeof(DRIVER_INFO_6W) : 0;
    if (!fixed) {
        SetLastError(ERROR_INVALID_LEVEL);
        return FALSE;
    }
    DRIVER_INFO_6W info = {};
    bool room = buf && cb >= fixed;
    Packer pk(fixed, room ? buf : nullptr, cb);
    info.cVersion = 3;
    info.pName = pk.add(p.driver);
    info.pEnvironment = pk.add(L"Windows x64");
    info.pDriverPath = pk.add(L"C:\\windows\\system32\\spool\\drivers\\x64\\3\\UNIDRV.DLL");
    info.pDataFile = pk.add(p.dataFile);
    info.pConfigFile = pk.add(L"C:\\windows\\system32\\spool\\drivers\\x64\\3\\UNIDRVUI.DLL");
    if (level >= 3) {
        info.pHelpFile = pk.add(L"");
        info.pDependentFiles = p.dependentFiles.empty() ? nullptr : pk.addMulti(p.dependentFiles);
    }
    if (!Finish(pk, pcbNeeded))
        return FALSE;
    memcpy(buf, &info, fixed);
    return TRUE;
}

BOOL WINAPI SimGetJobW(HANDLE h, DWORD jobId, DWORD level, LPBYTE buf, DWORD cb, LPDWORD pcbNeeded)
{
    Handle* hd = HandleOf(h);
    if (!hd || level != 1) {
        SetLastError(hd ? ERROR_INVALID_LEVEL : ERROR_INVALID_HANDLE);
        return FALSE;
    }
    for (auto& job : hd->printer->jobs) {
        if (job.first != jobId)
            continue;
        JOB_INFO_1W info = {};
        bool room = buf && cb >= sizeof(info);
        Packer pk(sizeof(info), room ? buf : nullptr, cb);
        info.JobId = jobId;
        info.pPrinterName = pk.add(hd->printer->name);
        info.pUserName = pk.add(job.second);
        info.pDocument = pk.add(L"Document");
        if (!Finish(pk, pcbNeeded))
            return FALSE;
        memcpy(buf, &info, sizeof(info));
        return TRUE;
    }
    SetLastError(ERROR_INVALID_PARAMETER);
    return FALSE;
}

BOOL WINAPI SimOpenPrinterW(LPWSTR name, LPHANDLE ph, LPPRINTER_DEFAULTSW)
{
    SimPrinter* p = name ? SimPrinterNamed(name) : nullptr;
    if (!p || !ph) {
        SetLastError(ERROR_INVALID_PRINTER_NAME);
        return FALSE;
    }
    g_handles.push_back(std::unique_ptr<Handle>(new Handle{p, true}));
    *ph = g_handles.back().get();
    ++g_open;
    return TRUE;
}

BOOL WINAPI SimClosePrinter(HANDLE h)
{
    for (auto it = g_handles.begin(); it != g_handles.end(); ++it) {
        if (it->get() == h && (*it)->opened) {
            g_handles.erase(it);
            --g_open;
            return TRUE;
        }
    }
    SetLastError(ERROR_INVALID_HANDLE);
    return FALSE;
}

BOOL WINAPI SimSetPrinterW(HANDLE h, DWORD level, LPBYTE buf, DWORD)
{
    Handle* hd = HandleOf(h);
    if (!hd || level != 2 || !buf) {
        SetLastError(ERROR_INVALID_PARAMETER);
        return FALSE;
    }
    auto* info = reinterpret_cast<PRINTER_INFO_2W*>(buf);
    hd->printer->setPrinterCalls++;
    hd->printer->printProcessor = info->pPrintProcessor ? info->pPrintProcessor : L"";
    return TRUE;
}

}  // namespace

HANDLE SimAddPrinter(const SimPrinter& printer)
{
    g_printers.push_back(std::unique_ptr<SimPrinter>(new SimPrinter(printer)));
    g_handles.push_back(std::unique_ptr<Handle>(new Handle{g_printers.back().get(), false}));
    return g_handles.back().get();
}

SimPrinter* SimPrinterOf(HANDLE h)
{
    Handle* hd = HandleOf(h);
    return hd ? hd->printer : nullptr;
}

SimPrinter* SimPrinterNamed(const std::wstring& name)
{
    for (auto& p : g_printers)
        if (_wcsicmp(p->name.c_str(), name.c_str()) == 0)
            return p.get();
    return nullptr;
}

void SimResetSpooler()
{
    g_handles.clear();
    g_printers.clear();
    g_open = 0;
}

int SimOpenHandleCount() { return g_open; }

void InstallSimSpooler(HMODULE mod)
{
    PatchImport(mod, "winspool.drv", "GetPrinterW", reinterpret_cast<void*>(&SimGetPrinterW));
    PatchImport(mod, "winspool.drv", "GetPrinterDriverW", reinterpret_cast<void*>(&SimGetPrinterDriverW));
    PatchImport(mod, "winspool.drv", "GetJobW", reinterpret_cast<void*>(&SimGetJobW));
    PatchImport(mod, "winspool.drv", "OpenPrinterW", reinterpret_cast<void*>(&SimOpenPrinterW));
    PatchImport(mod, "winspool.drv", "ClosePrinter", reinterpret_cast<void*>(&SimClosePrinter));
    PatchImport(mod, "winspool.drv", "SetPrinterW", reinterpret_cast<void*>(&SimSetPrinterW));
}
