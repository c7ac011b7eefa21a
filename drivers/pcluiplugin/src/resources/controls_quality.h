// Control identifiers of the manual colour page and the print-quality page and dialog.
// An identifier means something only within its template: 1252 and 1253, for
// instance, are a trackbar and a button on one template and a label and a
// trackbar on another.
#pragma once

// Manual colour page (107).
#define IDC_MC_FRAME            1046
#define IDC_MC_METHOD           1172
#define IDC_MC_IMAGES_LABEL     1177
#define IDC_MC_IMAGES           1178
#define IDC_MC_TEXT_LABEL       1176
#define IDC_MC_TEXT             1181
#define IDC_MC_GRAPHICS_LABEL   1175
#define IDC_MC_GRAPHICS         1180
#define IDC_MC_TONER_LABEL      1179
#define IDC_MC_TONER            1182
#define IDC_MC_QUALITY          1253

// Black-and-white print-quality page (229).
#define IDC_BWQ_GRAYCORR        1239
#define IDC_BWQ_BRIGHTNESS_LABEL 1235
#define IDC_BWQ_BRIGHTNESS      1252
#define IDC_BWQ_BRIGHTNESS_MIN  1232
#define IDC_BWQ_BRIGHTNESS_MID  1233
#define IDC_BWQ_BRIGHTNESS_MAX  1234
#define IDC_BWQ_CONTRAST_LABEL  1236
#define IDC_BWQ_CONTRAST        1251
#define IDC_BWQ_CONTRAST_MIN    1237
#define IDC_BWQ_CONTRAST_MAX    1238
#define IDC_BWQ_ENHANCE         1241

// RGB print-quality dialog (231).
#define IDC_RGBQ_BRIGHTNESS_LABEL 1242
#define IDC_RGBQ_BRIGHTNESS     1250
#define IDC_RGBQ_BRIGHTNESS_MIN 1244
#define IDC_RGBQ_BRIGHTNESS_MID 1245
#define IDC_RGBQ_BRIGHTNESS_MAX 1246
#define IDC_RGBQ_CONTRAST_LABEL 1243
#define IDC_RGBQ_CONTRAST       1249
#define IDC_RGBQ_CONTRAST_MIN   1247
#define IDC_RGBQ_CONTRAST_MAX   1248
#define IDC_RGBQ_SATURATION_LABEL 1252
#define IDC_RGBQ_SATURATION     1253
#define IDC_RGBQ_SATURATION_MIN 1254
#define IDC_RGBQ_SATURATION_MAX 1255
#define IDC_RGBQ_ENHANCE        1241
