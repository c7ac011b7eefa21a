#include "demo.h"
int RunSheetDemo(const wchar_t*) { return 0; }
