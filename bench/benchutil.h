// Timing shared by the benchmarks: a high-resolution clock and the best of
// five rounds per call, so that one slow round does not skew a ratio.
#pragma once
#include <windows.h>

inline double Now()
{
    static LARGE_INTEGER f = [] { LARGE_INTEGER x; QueryPerformanceFrequency(&x); return x; }();
    LARGE_INTEGER t;
    QueryPerformanceCounter(&t);
    return double(t.QuadPart) / double(f.QuadPart);
}

// Seconds per call of f, best of five rounds of n calls after one warm-up.
template <class F> double PerCall(int n, F f)
{
    f();
    double best = 1e9;
    for (int round = 0; round < 5; ++round) {
        const double t0 = Now();
        for (int i = 0; i < n; ++i)
            f();
        const double t = (Now() - t0) / n;
        if (t < best)
            best = t;
    }
    return best;
}
