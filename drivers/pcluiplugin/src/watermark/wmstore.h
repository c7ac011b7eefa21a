// The watermark store: default watermarks under the default user, and each
// user's own watermarks, per printer driver, in the registry.
#pragma once
#include "watermark/wmrecord.h"

// Key openers; each returns an open key or null. A driver name of 100
// characters or more, or a path that does not fit 260 units, opens nothing:
// two drivers must never share a store because their names were cut.
HKEY OpenBaseKey(HANDLE hPrinter, REGSAM sam, DWORD* pdwDisposition);
HKEY OpenUserWatermarkKey(HANDLE hPrinter, REGSAM sam, DWORD* pdwDisposition);
HKEY OpenProfileKey(HANDLE hPrinter, LPCWSTR pszProfile, REGSAM sam, DWORD* pdwDisposition);
// Creates the default key (the spooler's seeding).
HKEY OpenDefaultWatermarkKey(HANDLE hPrinter, LPCWSTR pszDriverName, REGSAM sam);

// Deletes the value when pData is null (result 1); otherwise writes it as
// REG_BINARY and answers 1 on success, 0 on failure.
BOOL WriteBinaryValue(HKEY hKey, LPCWSTR pszName, const void* pData, DWORD cb);

HRESULT SeedDefaultWatermarks(DWORD dwDriverEvent, DWORD dwLevel, LPBYTE pDriverInfo, LPARAM lParam);
void CopyDefaultWatermarks(HANDLE hPrinter);
// Appends one node per stored value; returns the number of values read.
DWORD LoadWatermarkList(HANDLE hPrinter, HANDLE hHeap, WatermarkNode** ppHead);
BOOL SaveWatermarkList(HWND hwndOwner, HANDLE hPrinter, const WatermarkNode* pHead);
