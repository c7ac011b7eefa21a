#!/bin/sh
# Creates the private, headless Wine prefix the tests run in (once).
set -e
prefix="$1"
wine64="$2"
[ -f "$prefix/.pclui-ready" ] && exit 0
mkdir -p "$prefix"
export WINEPREFIX="$prefix" WINEDEBUG=-all
# Mono and Gecko are not needed and must not prompt for an install.
WINEDLLOVERRIDES="mscoree,mshtml=" "$wine64" wineboot -i >/dev/null 2>&1 || true
# No display: windows, dialogs and property sheets work without an X server.
"$wine64" reg add 'HKCU\Software\Wine\Drivers' /v Graphics /d null /f >/dev/null 2>&1
# A crash must end the test process at once instead of waiting in the debugger.
"$wine64" reg delete 'HKLM\Software\Microsoft\Windows NT\CurrentVersion\AeDebug' /v Debugger /f >/dev/null 2>&1 || true
wineserver_bin="$(dirname "$wine64")/wineserver"
[ -x "$wineserver_bin" ] || wineserver_bin=wineserver
"$wineserver_bin" -w || true
touch "$prefix/.pclui-ready"
