// Control identifiers of the print-and-hold, colour, quality and about pages.
#pragma once
#include "controls_pnh.h"
#include "controls_quality.h"
#include "controls_about.h"
