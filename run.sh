#!/bin/bash
# One entry point for a fresh Debian machine (as root):
#   ./run.sh demo    install what is missing, build both DLLs, run the demo
#   ./run.sh test    install what is missing, build both DLLs, run all tests
#   ./run.sh bench   install what is missing, build, run the benchmarks
set -euo pipefail
cd "$(dirname "$0")"
ROOT="$PWD"
BUILD64="$ROOT/build/x64"
BUILD32="$ROOT/build/x86"
PACKAGES=(g++-mingw-w64-x86-64-posix g++-mingw-w64-i686-posix mingw-w64-tools
          binutils-mingw-w64-x86-64 binutils-mingw-w64-i686 cmake ninja-build googletest
          wine wine64 xvfb xauth fonts-liberation)

install_missing() {
    local missing=()
    for p in "${PACKAGES[@]}"; do
        dpkg-query -W -f='${Status}' "$p" 2>/dev/null | grep -q "install ok installed" || missing+=("$p")
    done
    if [ ${#missing[@]} -gt 0 ]; then
        echo "installing: ${missing[*]}"
        export DEBIAN_FRONTEND=noninteractive
        apt-get update -q
        apt-get install -y -q "${missing[@]}"
    fi
}

wine64_path() {
    for w in /usr/lib/wine/wine64 /usr/lib64/wine/wine64 "$(command -v wine64 || true)"; do
        [ -n "$w" ] && [ -x "$w" ] && { echo "$w"; return; }
    done
    echo "wine64 not found" >&2
    exit 1
}

build() {
    cmake -S "$ROOT" -B "$BUILD32" -G Ninja -DCMAKE_BUILD_TYPE=Release \
        -DCMAKE_TOOLCHAIN_FILE="$ROOT/cmake/mingw-i686.cmake" -DPCLUI_WITH_TESTS=OFF >/dev/null
    cmake --build "$BUILD32"
    cmake -S "$ROOT" -B "$BUILD64" -G Ninja -DCMAKE_BUILD_TYPE=Release \
        -DCMAKE_TOOLCHAIN_FILE="$ROOT/cmake/mingw-x86_64.cmake" -DPCLUI_WITH_TESTS=ON >/dev/null
    cmake --build "$BUILD64"
    echo "built: $BUILD32/bin/NVPCLUI.dll (32-bit, shipping) and $BUILD64/bin/NVPCLUI.dll (64-bit)"
}

prefix() {
    sh "$ROOT/tools/wineprefix.sh" "$BUILD64/wineprefix" "$(wine64_path)"
}

# Runs a Windows program of the 64-bit build under Wine. With a display
# wanted, it gets its own Xvfb server and a prefix copy without the null
# graphics driver, so that windows can be captured.
run_wine() {
    WINEPREFIX="$BUILD64/wineprefix" WINEDEBUG=-all "$(wine64_path)" "$@"
}

cmd="${1:-test}"
shift || true
install_missing
build
case "$cmd" in
    test)
        prefix
        ctest --test-dir "$BUILD64" --output-on-failure -j2 "$@"
        ;;
    demo)
        prefix
        out="$ROOT/demo-output"
        mkdir -p "$out"
        cd "$BUILD64/bin"
        if [ -x "$ROOT/tools/demo-display.sh" ]; then
            "$ROOT/tools/demo-display.sh" "$BUILD64" "$(wine64_path)" "$out"
        else
            run_wine ./demohost.exe "Z:${out//\//\\}"
        fi
        echo "demo output: $out"
        ;;
    bench)
        prefix
        cd "$BUILD64/bin"
        for b in bench_*.exe; do
            [ -e "$b" ] || continue
            echo "== $b"
            run_wine "./$b" "$@"
        done
        ;;
    *)
        echo "usage: $0 demo|test|bench" >&2
        exit 2
        ;;
esac
