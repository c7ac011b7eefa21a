// Control identifiers of the watermark page and its dialogs.
#pragma once
