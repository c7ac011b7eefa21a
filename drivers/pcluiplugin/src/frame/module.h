// Module-wide state of the plug-in DLL: the instance handle, the counts that
// decide whether the DLL may be unloaded, and the activation context slot.
#pragma once
#include <windows.h>

void ModuleAttach(HINSTANCE hInstance);
void ModuleDetach();
HINSTANCE ModuleInstance();

void ModuleObjectCreated();
void ModuleObjectDestroyed();
void ModuleLockServer(BOOL fLock);
BOOL ModuleCanUnload();

// The activation context built from the module's own manifest; starts as
// INVALID_HANDLE_VALUE and is released at process detach.
HANDLE* ModuleActivationContextSlot();
