#include "frame/runtimelinks.h"

namespace {

constexpr DWORD kSlots = 1024;          // far more than sheets a process opens at once
constexpr DWORD kSlotBits = 10;

struct Slot {
    void* p;
    DWORD cookie;
    RuntimeLinkKind kind;
};

SRWLOCK g_lock = SRWLOCK_INIT;
Slot g_slots[kSlots];
DWORD g_generation = 0;
DWORD g_salt = 0;

// A per-process salt makes a cookie from another process unlikely to match.
DWORD Salt()
{
    if (!g_salt) {
        LARGE_INTEGER t;
        QueryPerformanceCounter(&t);
        g_salt = (GetCurrentProcessId() * 2654435761u) ^ t.LowPart;
        g_salt &= ~((1u << kSlotBits) - 1);  // keep the slot bits readable
        if (!g_salt)
            g_salt = 0x5A5A5A00u & ~((1u << kSlotBits) - 1);
    }
    return g_salt;
}

DWORD MakeCookie(DWORD slot)
{
    g_generation = (g_generation + 1) & ((1u << (32 - kSlotBits)) - 1);
    if (!g_generation)
        g_generation = 1;
    DWORD cookie = ((g_generation << kSlotBits) | slot) ^ Salt();
    return cookie ? cookie : MakeCookie(slot);
}

DWORD SlotOf(DWORD cookie) { return (cookie ^ Salt()) & (kSlots - 1); }

}  // namespace

DWORD RegisterRuntimeLink(void* p, RuntimeLinkKind kind)
{
    if (!p)
        return 0;
    AcquireSRWLockExclusive(&g_lock);
    DWORD cookie = 0;
    DWORD freeSlot = kSlots;
    for (DWORD i = 0; i < kSlots; ++i) {
        if (g_slots[i].p == p && g_slots[i].kind == kind) {
            cookie = g_slots[i].cookie;
            break;
        }
        if (!g_slots[i].p && freeSlot == kSlots)
            freeSlot = i;
    }
    if (!cookie && freeSlot < kSlots) {
        cookie = MakeCookie(freeSlot);
        g_slots[freeSlot] = {p, cookie, kind};
    }
    ReleaseSRWLockExclusive(&g_lock);
    return cookie;
}

void* ResolveRuntimeLink(DWORD cookie, RuntimeLinkKind kind)
{
    if (!cookie)
        return nullptr;
    AcquireSRWLockShared(&g_lock);
    const Slot& s = g_slots[SlotOf(cookie)];
    void* p = (s.p && s.cookie == cookie && s.kind == kind) ? s.p : nullptr;
    ReleaseSRWLockShared(&g_lock);
    return p;
}

void RevokeRuntimeLink(DWORD cookie)
{
    if (!cookie)
        return;
    AcquireSRWLockExclusive(&g_lock);
    Slot& s = g_slots[SlotOf(cookie)];
    if (s.cookie == cookie)
        s = {nullptr, 0, RuntimeLinkKind(0)};
    ReleaseSRWLockExclusive(&g_lock);
}

void RevokeRuntimeLinksTo(void* p)
{
    if (!p)
        return;
    AcquireSRWLockExclusive(&g_lock);
    for (Slot& s : g_slots)
        if (s.p == p)
            s = {nullptr, 0, RuntimeLinkKind(0)};
    ReleaseSRWLockExclusive(&g_lock);
}
