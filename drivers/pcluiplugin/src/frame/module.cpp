#include "frame/module.h"

namespace {
HINSTANCE g_hInstance = nullptr;
volatile LONG g_cObjects = 0;
volatile LONG g_cLocks = 0;
HANDLE g_hActCtx = INVALID_HANDLE_VALUE;
}  // namespace

void ModuleAttach(HINSTANCE hInstance) { g_hInstance = hInstance; }

void ModuleDetach()
{
    if (g_hActCtx != INVALID_HANDLE_VALUE) {
        ReleaseActCtx(g_hActCtx);
        g_hActCtx = INVALID_HANDLE_VALUE;
    }
}

HINSTANCE ModuleInstance() { return g_hInstance; }

void ModuleObjectCreated() { InterlockedIncrement(&g_cObjects); }
void ModuleObjectDestroyed() { InterlockedDecrement(&g_cObjects); }

void ModuleLockServer(BOOL fLock)
{
    if (fLock)
        InterlockedIncrement(&g_cLocks);
    else
        InterlockedDecrement(&g_cLocks);
}

BOOL ModuleCanUnload()
{
    return InterlockedCompareExchange(&g_cObjects, 0, 0) == 0 &&
           InterlockedCompareExchange(&g_cLocks, 0, 0) == 0;
}

HANDLE* ModuleActivationContextSlot() { return &g_hActCtx; }
