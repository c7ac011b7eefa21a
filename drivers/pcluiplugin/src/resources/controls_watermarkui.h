// Control identifiers of the watermark page and its dialogs.
#pragma once

// Watermark page (104).
#define IDC_WM_ORDER_GROUP     1046
#define IDC_WM_ORDER_NONE      1031
#define IDC_WM_ORDER_ALL       1032
#define IDC_WM_ORDER_FIRST     1033
#define IDC_WM_ORDER_ODDEVEN   1034
#define IDC_WM_LISTS_GROUP     1047
#define IDC_WM_LABEL1          1035
#define IDC_WM_LIST1           1037
#define IDC_WM_LABEL2          1036
#define IDC_WM_LIST2           1038
#define IDC_WM_ADD             1039
#define IDC_WM_EDIT            1049
#define IDC_WM_DELETE          1040
#define IDC_WM_PLACE_GROUP     1048
#define IDC_WM_UNDER           1042
#define IDC_WM_OVER            1061

// Add/edit watermark dialog (103).
#define IDC_WMED_NAME          1043
#define IDC_WMED_TEXT          1004
#define IDC_WMED_DYNAMIC       1216
#define IDC_WMED_DYNSETUP      1003
#define IDC_WMED_FONT          1006
#define IDC_WMED_SIZE          1022
#define IDC_WMED_COLOUR        1009
#define IDC_WMED_STYLE_GROUP   1050
#define IDC_WMED_STRIKEOUT     1014
#define IDC_WMED_ITALIC        1013
#define IDC_WMED_UNDERLINE     1015
#define IDC_WMED_BOLD          1012
#define IDC_WMED_OUTLINE       1016
#define IDC_WMED_INTENSITY     1023
#define IDC_WMED_INTENSITY_SPIN 1025
#define IDC_WMED_ANGLE_LABEL   1117
#define IDC_WMED_ANGLE         1098
#define IDC_WMED_ANGLE_SPIN    1099
#define IDC_WMED_PLACE         1217
#define IDC_WMED_PREVIEW       1019

// Placement dialog (220).
#define IDC_WMPL_TOP           1220
#define IDC_WMPL_VCENTRE       1221
#define IDC_WMPL_BOTTOM        1222
#define IDC_WMPL_VOFFSET_LABEL 1223
#define IDC_WMPL_VOFFSET       1224
#define IDC_WMPL_VOFFSET_SPIN  1225
#define IDC_WMPL_LEFT          1227
#define IDC_WMPL_HCENTRE       1228
#define IDC_WMPL_RIGHT         1229
#define IDC_WMPL_HOFFSET_LABEL 1230
#define IDC_WMPL_HOFFSET       1231
#define IDC_WMPL_HOFFSET_SPIN  1232
#define IDC_WMPL_UNITS_GROUP   1233
#define IDC_WMPL_INCHES        1234
#define IDC_WMPL_MM            1235
#define IDC_WMPL_PREVIEW       1236
#define IDC_WMPL_CENTRE        1237

// Delete (135) and choose-to-edit (136) dialogs.
#define IDC_WMDEL_LIST         1041
#define IDC_WMDEL_DELETE       1070
#define IDC_WMCHOOSE_LIST      1169

// Dynamic variables dialog (101).
#define IDC_DYN_TEXT           1000
#define IDC_DYN_LIST           1001
#define IDC_DYN_ADD            1002
