// The property-sheet notifications every page of the plug-in answers, mapped
// to the page's own handlers; help is the driver's on every page.
#pragma once
#include "frame/pagecontext.h"

struct PageHandlers {
    BOOL (*onSetActive)(HWND hwnd, PAGECONTEXT* ctx);
    BOOL (*onKillActive)(HWND hwnd, PAGECONTEXT* ctx);
    BOOL (*onApply)(HWND hwnd, PAGECONTEXT* ctx);
};

// The page procedure's answer to a sheet notification; FALSE for others.
BOOL DispatchPageNotify(HWND hwnd, PAGECONTEXT* ctx, const NMHDR* nm, const PageHandlers& handlers);
