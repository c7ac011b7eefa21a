// Control identifiers of the print-and-hold page.
#pragma once

#define IDC_PNH_OUTPUT_GROUP 1052
#define IDC_PNH_OUTPUT 1084
#define IDC_PNH_USER 1085
#define IDC_PNH_PIN 1086
#define IDC_PNH_USER_LABEL 1087
#define IDC_PNH_PIN_LABEL 1088
#define IDC_PNH_KEEP 1211
