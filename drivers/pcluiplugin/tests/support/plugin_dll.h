// Loads the built NVPCLUI.dll the way the driver does and puts the
// simulations behind its imports.
#pragma once
#include "frame/oemui.h"

// The DLL next to the test program, loaded once per process with the
// simulated spooler installed into its imports.
HMODULE PluginDll();
// A fresh plug-in object through DllGetClassObject and CreateInstance.
IPrintOemUI2* CreatePluginObject();
// Deletes HKCU\Software\Norvane and HKU\.Default\Software\Norvane subtrees.
void ClearPluginRegistry();
