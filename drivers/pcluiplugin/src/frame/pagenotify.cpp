#include "frame/pagenotify.h"

#include "frame/dialogutil.h"

BOOL DispatchPageNotify(HWND hwnd, PAGECONTEXT* ctx, const NMHDR* nm, const PageHandlers& handlers)
{
    switch (nm->code) {
    case PSN_SETACTIVE:
        return handlers.onSetActive ? handlers.onSetActive(hwnd, ctx) : FALSE;
    case PSN_KILLACTIVE:
        return handlers.onKillActive ? handlers.onKillActive(hwnd, ctx) : FALSE;
    case PSN_APPLY:
        return handlers.onApply ? handlers.onApply(hwnd, ctx) : FALSE;
    case PSN_HELP:
        ShowDriverHelp(hwnd, ctx->hPrinter);
        return FALSE;
    default:
        return FALSE;
    }
}
