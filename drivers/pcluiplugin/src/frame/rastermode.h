// Whether the driver prints in raster graphics mode: its graphics-mode item
// (named by the driver framework's resources) has the raster option chosen.
#pragma once
#include "frame/oemdevmode.h"

BOOL RasterModeSelected(const OEMDEV* pOem);
