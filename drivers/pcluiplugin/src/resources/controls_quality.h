// Control identifiers of the manual colour page and the print-quality page and dialog.
#pragma once
