// Control identifiers of the print-and-hold page.
#pragma once
