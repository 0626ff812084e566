#!/usr/bin/env bash
# The download: tools/package.sh makes the zip; it must hold the two programs and README.txt (CR LF)
# and nothing else, and both programs from it must start under Wine: verrant-cli.exe --version
# prints the version, verrant.exe opens its main window. Uses its own Wine prefix and Xvfb display
# under build/package-test and stops both. Ends with "N passed, M failed".
set -u
cd "$(dirname "$0")/../.."
work="$PWD/build/package-test"
passed=0 failed=0
check() { if [ "$1" = 0 ]; then passed=$((passed + 1)); echo "PASS: $2"; else failed=$((failed + 1)); echo "FAIL: $2"; fi; }
rm -rf "$work" && mkdir -p "$work/home"
zip=$(bash tools/package.sh) || { echo "FAIL: tools/package.sh"; echo "0 passed, 1 failed"; exit 1; }
version=$(basename "$zip" | sed -E 's/^verrant-(.*)-win64\.zip$/\1/')

[ "$(unzip -Z1 "$zip" | sort | tr '\n' ' ')" = "README.txt verrant-cli.exe verrant.exe " ]
check $? "the zip holds verrant.exe, verrant-cli.exe and README.txt only"
unzip -q "$zip" -d "$work/unpacked"
readme="$work/unpacked/README.txt"
[ -s "$readme" ] && ! grep -q $'[^\r]$' "$readme" && ! grep -q $'^$' "$readme"
check $? "README.txt ends every line with CR LF"

export WINEPREFIX="$work/prefix" HOME="$work/home" WINEDEBUG=-all WINEDLLOVERRIDES="mscoree,mshtml=" WINEARCH=win64
cleanup() { [ -d "$WINEPREFIX" ] && wineserver -k 2>/dev/null; [ -n "${xvfb:-}" ] && kill "$xvfb" 2>/dev/null; wait; }
trap cleanup EXIT
for display in $(seq 170 190); do
    [ -e "/tmp/.X$display-lock" ] && continue
    Xvfb ":$display" -screen 0 1024x768x24 -nolisten tcp 2>"$work/xvfb.log" &
    xvfb=$!
    for _ in $(seq 50); do [ -e "/tmp/.X11-unix/X$display" ] && break; sleep 0.1; done
    kill -0 "$xvfb" 2>/dev/null && [ -e "/tmp/.X11-unix/X$display" ] && break
done
export DISPLAY=":$display"
wine wineboot -i >"$work/wineboot.log" 2>&1

printed=$(cd "$work/unpacked" && wine verrant-cli.exe --version 2>"$work/cli.log" | tr -d '\r')
[ "$printed" = "verrant-cli $version" ]
check $? "verrant-cli.exe --version prints \"verrant-cli $version\" (printed \"$printed\")"

# A settings file names a catalogue, so the program starts without asking; no window manager, so
# each top-level window is an X window named by its title.
catalogue="$work/tree/mods/std/com/maddox/il2/objects"
mkdir -p "$catalogue" && printf '[buildings.House$Kiosk]\r\n' >"$catalogue/static.ini"
printf '%s' "Z:${catalogue//\//\\}\\" >"$work/unpacked/verrant.ini"
(cd "$work/unpacked" && wine verrant.exe >"$work/program.log" 2>&1 &)
shown=1
for _ in $(seq 60); do
    xwininfo -root -tree 2>/dev/null | grep -q "\"Verrant V.$version\"" && { shown=0; break; }
    sleep 0.5
done
check $shown "verrant.exe starts and shows its main window \"Verrant V.$version\""

echo "$passed passed, $failed failed"
[ "$failed" = 0 ]
