// A simulated spooler for Wine, which has no printers: printers, their
// drivers and jobs live in this process, and the spooler imports of a module
// are redirected here with InstallSimSpooler.
#pragma once
#include <windows.h>
#include <string>
#include <vector>

struct SimPrinter {
    std::wstring name;
    std::wstring driver;
    std::wstring dataFile;                    // DRIVER_INFO_2/3 pDataFile
    std::vector<std::wstring> dependentFiles; // DRIVER_INFO_3/6 pDependentFiles
    std::wstring printProcessor;              // PRINTER_INFO_2 pPrintProcessor (SetPrinterW writes it)
    std::vector<std::pair<DWORD, std::wstring>> jobs;  // job id -> owner
    bool failGetPrinter = false;
    int setPrinterCalls = 0;
};

// Adds a printer and returns a handle to it that stays valid until
// SimResetSpooler (the handle a driver would pass the plug-in).
HANDLE SimAddPrinter(const SimPrinter& printer);
SimPrinter* SimPrinterOf(HANDLE hPrinter);
SimPrinter* SimPrinterNamed(const std::wstring& name);
void SimResetSpooler();
// Handles opened through OpenPrinterW and not yet closed.
int SimOpenHandleCount();

// Redirects winspool.drv imports of mod (GetPrinterW, GetPrinterDriverW,
// GetJobW, OpenPrinterW, ClosePrinter, SetPrinterW) to the simulation.
void InstallSimSpooler(HMODULE mod);
