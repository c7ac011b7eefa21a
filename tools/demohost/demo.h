#pragma once
#include "frame/oemui.h"

#include <string>

// The console shows UTF-8; the C runtime's %ls drops non-ASCII text.
std::string Utf8(const WCHAR* w);
// The demo printer and its driver, shared by all demos.
constexpr const wchar_t* kDemoPrinter = L"Norvane LaserJet (demo)";
constexpr const wchar_t* kDemoDriver = L"Norvane PCL6 Demo Driver";

// Loads the plug-in next to the demo program (spooler imports simulated).
HMODULE DemoLoadPlugin();
IPrintOemUI2* DemoCreatePlugin();
int RunDevmodeDemo();
// Demos added by later work (print job, property sheets); 0 on success.
int RunExtraDemos(const wchar_t* outDir);
// The sample print job through DocumentEvent, one PNG per sheet.
int RunPrintDemo(const wchar_t* outDir);
// The property sheets of simulated printers, one PNG per page and dialog.
int RunSheetDemo(const wchar_t* outDir);
