#!/bin/sh
# Runs the demo host under its own Xvfb server, in a copy of the test prefix
# that uses the X11 graphics driver, so that the property sheets and dialogs
# are drawn on a screen and can be captured.
#   demo-display.sh <64-bit build dir> <wine64> <output dir>
set -e
build="$(cd "$1" && pwd)"
wine64="$2"
mkdir -p "$3"
out="$(cd "$3" && pwd)"
base="$build/wineprefix"
prefix="$build/wineprefix-display"
wineserver_bin="$(dirname "$wine64")/wineserver"
[ -x "$wineserver_bin" ] || wineserver_bin=wineserver
winpath() { echo "Z:$1" | sed 's#/#\\#g'; }

if ! command -v Xvfb >/dev/null 2>&1; then
    echo "Xvfb is missing: running without a display (no screenshots of windows)"
    cd "$build/bin" && WINEPREFIX="$base" WINEDEBUG=-all "$wine64" ./demohost.exe "$(winpath "$out")"
    exit $?
fi

if [ ! -f "$prefix/.pclui-display-ready" ]; then
    rm -rf "$prefix"
    cp -a "$base" "$prefix"
    rm -f "$prefix/.pclui-display-ready"
    WINEPREFIX="$prefix" WINEDEBUG=-all "$wine64" reg delete 'HKCU\Software\Wine\Drivers' /v Graphics /f >/dev/null 2>&1 || true
    # No window manager runs on the server: Wine draws the captions itself.
    WINEPREFIX="$prefix" WINEDEBUG=-all "$wine64" reg add 'HKCU\Software\Wine\X11 Driver' /v Managed /d N /f >/dev/null 2>&1 || true
    WINEPREFIX="$prefix" WINEDEBUG=-all "$wine64" reg add 'HKCU\Software\Wine\X11 Driver' /v Decorated /d N /f >/dev/null 2>&1 || true
    WINEPREFIX="$prefix" "$wineserver_bin" -w || true
    touch "$prefix/.pclui-display-ready"
fi

# A display number nobody uses.
n=91
while [ -e "/tmp/.X11-unix/X$n" ] || [ -e "/tmp/.X$n-lock" ]; do n=$((n + 1)); done
Xvfb ":$n" -screen 0 1280x1024x24 -nolisten tcp >/dev/null 2>&1 &
xvfb=$!
trap 'kill $xvfb 2>/dev/null || true' EXIT
i=0
while [ ! -e "/tmp/.X11-unix/X$n" ] && [ $i -lt 50 ]; do sleep 0.1; i=$((i + 1)); done

rc=0
(cd "$build/bin" && DISPLAY=":$n" WINEPREFIX="$prefix" WINEDEBUG=-all "$wine64" ./demohost.exe "$(winpath "$out")") || rc=$?
WINEPREFIX="$prefix" "$wineserver_bin" -k >/dev/null 2>&1 || true
exit $rc
