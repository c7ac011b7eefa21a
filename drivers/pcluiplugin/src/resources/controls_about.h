// Control identifiers of the about pages.
#pragma once
