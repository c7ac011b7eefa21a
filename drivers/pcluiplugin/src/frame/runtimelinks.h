// Run-time links kept in the OEM devmode (pOptItems, pPageContext). The
// devmode arrives from files, other processes and other bitness, so it never
// holds a raw pointer: it holds a 32-bit cookie that this table maps back to
// a live object of this process. A cookie this process did not hand out, or
// whose object is gone, resolves to null.
#pragma once
#include <windows.h>

enum RuntimeLinkKind : DWORD {
    RUNTIME_LINK_OPTITEMS = 1,
    RUNTIME_LINK_PAGECONTEXT = 2,
};

// Returns a non-zero cookie for p, or 0 when p is null or the table is full.
// Registering the same object and kind again returns its existing cookie.
DWORD RegisterRuntimeLink(void* p, RuntimeLinkKind kind);
// The object behind the cookie, or null.
void* ResolveRuntimeLink(DWORD cookie, RuntimeLinkKind kind);
// Forgets the cookie; later resolutions of it give null.
void RevokeRuntimeLink(DWORD cookie);
// Forgets every cookie that maps to p.
void RevokeRuntimeLinksTo(void* p);
