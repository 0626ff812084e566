#!/usr/bin/env bash
# Runs Verrant on the demo tree. With a display (DISPLAY set): builds verrant.exe and runs it under
# Wine in a virtual desktop, started in build/demo-run whose settings file names the demo tree's
# catalogue. Without one: every check of verrant-cli, with the reports written to build/demo-reports.
# Installs missing Debian packages first when run as root.
set -u
cd "$(dirname "$0")/.."
top=$(pwd)
source tools/script-helpers.sh
packages=(cmake make g++)
[ -n "${DISPLAY:-}" ] && packages+=(g++-mingw-w64-x86-64 binutils-mingw-w64-x86-64 wine wine64 fonts-wine)
ensure_packages "${packages[@]}"
# A fresh copy each time: renumbering rewrites the catalogue it is given.
rm -rf "$top/build/demo-tree" && mkdir -p "$top/build" && cp -r "$top/examples/demo-tree" "$top/build/demo-tree"
catalogue="$top/build/demo-tree/mods/std/com/maddox/il2/objects"
map="$top/build/demo-tree/mods/mapmods/maps/Coast/actors.static"

if [ -n "${DISPLAY:-}" ]; then
    cmake -S . -B build/mingw -DCMAKE_TOOLCHAIN_FILE=cmake/mingw-w64.cmake -DCMAKE_BUILD_TYPE=Release >/dev/null &&
        cmake --build build/mingw -j"$(nproc)" --target verrant >/dev/null || exit 2
    export WINEPREFIX="$top/build/wine-program" WINEDEBUG=-all WINEDLLOVERRIDES="mscoree,mshtml="
    if [ ! -f "$WINEPREFIX/system.reg" ]; then
        echo "Preparing the Wine prefix $WINEPREFIX ..."
        wine wineboot -i >/dev/null 2>&1
        # Debian's Wine finds its own fonts (Tahoma, and Marlett for the caption buttons) only here.
        cp /usr/share/wine/fonts/* "$WINEPREFIX/drive_c/windows/Fonts/" 2>/dev/null
    fi
    # The settings file: the catalogue folder's path, ending in "\", with no line end.
    mkdir -p build/demo-run
    printf '%s' "Z:${catalogue//\//\\}\\" >build/demo-run/verrant.ini
    cd build/demo-run && exec wine explorer /desktop=verrant,1280x1024 "$top/build/mingw/src/verrant.exe"
fi

cmake -S . -B build/release -DCMAKE_BUILD_TYPE=Release -DVERRANT_TESTS=OFF >/dev/null &&
    cmake --build build/release -j"$(nproc)" --target verrant-cli >/dev/null || exit 2

cli="$top/build/release/src/verrant-cli"
reports="$top/build/demo-reports"
mkdir -p "$reports"
# Each command --help lists, with the option that picks it ("missing-objects --all-maps").
"$cli" --help | sed -n 's/^  \([a-z][a-z+-]*\)\( --[a-z-]*\)\{0,1\} .*/\1\2/p' | while read -r command option; do
    echo "== verrant-cli $command${option:+ $option}"
    if [ -n "$option" ]; then
        "$cli" "$command" "$option" --catalogue "$catalogue" --report-dir "$reports"
    else
        "$cli" "$command" --catalogue "$catalogue" --map "$map" --report-dir "$reports"
    fi
    echo "   exit status $?"
done
echo "Reports in $reports"
