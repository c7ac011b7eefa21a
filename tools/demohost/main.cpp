// The demo host: loads NVPCLUI.dll the way the driver's user-interface
// layer does and shows what the plug-in answers.
#include "demo.h"

#include <cstdio>
#include <cwchar>

int wmain(int argc, wchar_t** argv)
{
    const wchar_t* outDir = argc > 1 ? argv[1] : L"demo-output";
    int rc = RunDevmodeDemo();
    if (rc == 0)
        rc = RunExtraDemos(outDir);
    std::printf(rc == 0 ? "demo finished\n" : "demo failed\n");
    return rc;
}
