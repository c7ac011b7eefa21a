// Loads NVPCLUI.dll from the folder of the running program, as the driver
// loads it, with the simulated spooler and render side behind its imports.
#pragma once
#include "frame/oemui.h"

HMODULE LoadPluginBesideProgram();
// A new plug-in object through DllGetClassObject and CreateInstance; null on failure.
IPrintOemUI2* CreatePluginFrom(HMODULE plugin);
