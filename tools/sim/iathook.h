// Import-table patching: the test programs and the demo put simulated
// spooler, render-side and host functions behind the plug-in's imports, so
// the plug-in itself only ever calls the real Win32 functions.
#pragma once
#include <windows.h>

// Replaces the import dllName!funcName of module mod with newFn. Returns the
// previous target (null when the module does not import the function).
void* PatchImport(HMODULE mod, const char* dllName, const char* funcName, void* newFn);
