#include "demo.h"
int RunPrintDemo(const wchar_t*) { return 0; }
