#include "demo.h"

int RunExtraDemos(const wchar_t* outDir)
{
    int rc = RunPrintDemo(outDir);
    if (rc == 0)
        rc = RunSheetDemo(outDir);
    return rc;
}
