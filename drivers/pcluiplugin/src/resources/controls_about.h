// Control identifiers of the about pages (108, 109, 137, 233, 234).
#pragma once

#define IDC_ABOUT_DRIVER       1165
#define IDC_ABOUT_VERSION      1080
#define IDC_ABOUT_FILES        1081
#define IDC_ABOUT_NOTICE       1164
