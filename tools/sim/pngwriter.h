// Writes a bitmap to a PNG file through WIC (demo output and screenshots).
#pragma once
#include <windows.h>

// COM must be initialised on the calling thread. TRUE on success.
BOOL SaveBitmapPng(HBITMAP hbm, LPCWSTR path);
