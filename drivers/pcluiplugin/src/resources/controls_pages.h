// Control identifiers of the print-and-hold, colour, quality and about pages.
#pragma once
