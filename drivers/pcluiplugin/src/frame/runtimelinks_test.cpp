// Cookies in the devmode's run-time fields resolve only to live objects of
// this process.
#include "frame/runtimelinks.h"

#include <gtest/gtest.h>
#include <set>
#include <vector>

TEST(RuntimeLinks, ResolveOnlyWhatWasHandedOutAndIsAlive)
{
    int a = 0, b = 0;
    DWORD ca = RegisterRuntimeLink(&a, RUNTIME_LINK_PAGECONTEXT);
    DWORD cb = RegisterRuntimeLink(&b, RUNTIME_LINK_OPTITEMS);
    ASSERT_NE(ca, 0u);
    ASSERT_NE(cb, 0u);
    EXPECT_NE(ca, cb);
    EXPECT_EQ(RegisterRuntimeLink(&a, RUNTIME_LINK_PAGECONTEXT), ca) << "one cookie per object";
    EXPECT_EQ(ResolveRuntimeLink(ca, RUNTIME_LINK_PAGECONTEXT), &a);
    EXPECT_EQ(ResolveRuntimeLink(cb, RUNTIME_LINK_OPTITEMS), &b);
    EXPECT_EQ(ResolveRuntimeLink(ca, RUNTIME_LINK_OPTITEMS), nullptr) << "a cookie of another kind";
    EXPECT_EQ(RegisterRuntimeLink(nullptr, RUNTIME_LINK_OPTITEMS), 0u);
    EXPECT_EQ(ResolveRuntimeLink(0, RUNTIME_LINK_PAGECONTEXT), nullptr);

    // Values that arrive in a devmode from elsewhere: raw pointers, other
    // processes' cookies, garbage. None of them may resolve.
    int hits = 0;
    for (DWORD v = 1; v < 200000; v += 7)
        if (v != ca && v != cb && ResolveRuntimeLink(v, RUNTIME_LINK_PAGECONTEXT))
            ++hits;
    const DWORD raw = DWORD(reinterpret_cast<ULONG_PTR>(&a));
    if (raw != ca)
        EXPECT_EQ(ResolveRuntimeLink(raw, RUNTIME_LINK_PAGECONTEXT), nullptr);
    EXPECT_EQ(hits, 0);

    RevokeRuntimeLink(ca);
    EXPECT_EQ(ResolveRuntimeLink(ca, RUNTIME_LINK_PAGECONTEXT), nullptr) << "the object is gone";
    DWORD again = RegisterRuntimeLink(&a, RUNTIME_LINK_PAGECONTEXT);
    EXPECT_NE(again, ca) << "a new registration never revives an old cookie";
    EXPECT_EQ(ResolveRuntimeLink(ca, RUNTIME_LINK_PAGECONTEXT), nullptr);
    RevokeRuntimeLinksTo(&a);
    RevokeRuntimeLinksTo(&b);
    EXPECT_EQ(ResolveRuntimeLink(again, RUNTIME_LINK_PAGECONTEXT), nullptr);
    EXPECT_EQ(ResolveRuntimeLink(cb, RUNTIME_LINK_OPTITEMS), nullptr);
}

TEST(RuntimeLinks, FullTableRefusesInsteadOfReusingLiveSlots)
{
    std::vector<int> objects(1100);
    std::set<DWORD> cookies;
    size_t refused = 0;
    for (int& o : objects) {
        DWORD c = RegisterRuntimeLink(&o, RUNTIME_LINK_OPTITEMS);
        if (c)
            cookies.insert(c);
        else
            ++refused;
    }
    EXPECT_GT(refused, 0u);
    EXPECT_EQ(cookies.size() + refused, objects.size());
    for (size_t i = 0; i < objects.size(); ++i) {
        DWORD c = RegisterRuntimeLink(&objects[i], RUNTIME_LINK_OPTITEMS);
        if (c)
            EXPECT_EQ(ResolveRuntimeLink(c, RUNTIME_LINK_OPTITEMS), &objects[i]);
    }
    for (int& o : objects)
        RevokeRuntimeLinksTo(&o);
}
