// Spooler queries shared by several subsystems. Every call here goes to the
// real spooler functions of winspool.drv; there is no other implementation.
#pragma once
#include "frame/scoped.h"

// PRINTER_INFO_2 of the printer into buf (size query, then the call);
// null when any step fails.
PRINTER_INFO_2W* ReadPrinterInfo2(HANDLE hPrinter, HeapBuffer& buf);
// The printer's driver name; FALSE (out unchanged) when it cannot be read
// or does not fit cchOut with its terminator.
BOOL ReadPrinterDriverName(HANDLE hPrinter, WCHAR* out, size_t cchOut);
// Copies a spooler string bounded by cchOut, cutting longer ones; an absent
// string gives an empty result.
void CopySpoolerString(WCHAR* out, size_t cchOut, LPCWSTR src);
