#!/usr/bin/env bash
# End-to-end tests: the real verrant.exe under Wine in a 1280x1024 virtual desktop on an Xvfb display of
# its own, worked by the MinGW build's e2e_driver.exe, with its own WINEPREFIX and HOME under build/e2e and
# screenshots in build/e2e-shots. Ends with "N passed, M failed". VERRANT_EXE=path picks another program.
set -u
cd "$(dirname "$0")/../.."
build="$PWD/build/mingw" e2e="$PWD/build/e2e" shots="$PWD/build/e2e-shots"
program="${VERRANT_EXE:-$build/src/verrant.exe}" cli="$build/src/verrant-cli.exe"
driver="$build/tests/e2e/e2e_driver.exe" probe="$build/tests/e2e/e2e_probe.dll"
give_up() { echo "$1"; echo "0 passed, 1 failed"; exit 1; }
for f in "$program" "$driver" "$probe" "$cli"; do [ -f "$f" ] || give_up "no $f: build MinGW first"; done
winpath() { echo "Z:${1//\//\\}"; }

rm -rf "$e2e" "$shots" && mkdir -p "$e2e/home/Desktop" "$shots"
export WINEPREFIX="$e2e/prefix" HOME="$e2e/home" LC_ALL=C.UTF-8
export WINEDEBUG=-all WINEDLLOVERRIDES="mscoree,mshtml="  # no Mono or Gecko to install
cleanup() {
    [ -d "$WINEPREFIX" ] && wineserver -k 2>/dev/null
    kill $(jobs -p) 2>/dev/null  # the screenshot watcher and Xvfb
    wait 2>/dev/null
}
trap cleanup EXIT

# A display number of its own, well above those a desktop session uses; the next one when taken.
for display in $(seq 140 160); do
    [ -e "/tmp/.X$display-lock" ] && continue
    Xvfb ":$display" -screen 0 1280x1024x24 -nolisten tcp 2>"$e2e/xvfb.log" &
    for _ in $(seq 50); do [ -e "/tmp/.X11-unix/X$display" ] && break; sleep 0.1; done
    [ -e "/tmp/.X11-unix/X$display" ] && kill -0 $! 2>/dev/null && break
done
kill -0 $! 2>/dev/null || give_up "Xvfb did not start"
export DISPLAY=":$display"

wine wineboot -i >"$e2e/wineboot.log" 2>&1
# Debian's Wine finds its own fonts (Tahoma, and Marlett for the caption buttons) only here.
cp /usr/share/wine/fonts/* "$WINEPREFIX/drive_c/windows/Fonts/" 2>/dev/null
wine reg add 'HKCU\Software\Wine\Explorer' /v Desktop /d verrant /f >>"$e2e/wineboot.log"
wine reg add 'HKCU\Software\Wine\Explorer\Desktops' /v verrant /d 1280x1024 /f >>"$e2e/wineboot.log"
# No crash dialog, which would wait forever: a crash ends the program with a backtrace.
wine reg add 'HKCU\Software\Wine\WineDbg' /v ShowCrashDialog /t REG_DWORD /d 0 /f >>"$e2e/wineboot.log"
wineserver -k  # the next process starts the virtual desktop the prefix now names
work="$WINEPREFIX/drive_c/verrant-e2e"
mkdir -p "$work/cli" && cp -r examples/demo-tree "$work/demo" && cp -r examples/demo-tree "$work/demo-cli"
# Enough entries and mods to keep the mesh search, and with it the Wait window, busy for a while.
big="$work/mesh-big/mods"
for m in $(seq 0 299); do mkdir -p "$big/Mod$m/3do/Gen/F$((m % 100))"; done
mkdir -p "$big/std/com/maddox/il2/objects" && awk 'BEGIN { printf "[***]\r\nTitle Generated\r\n"
    for (i = 0; i < 20000; i++) printf "[buildings.House$Gen%d]\r\nMesh 3do/Gen/F%d/m%d.sim\r\n", i, i%100, i
}' >"$big/std/com/maddox/il2/objects/static.ini"

# The driver asks for screenshots by leaving NAME.request files; this takes them.
while sleep 0.1; do
    for request in "$shots"/*.request; do
        [ -e "$request" ] && import -window root "${request%.request}.png" 2>>"$e2e/import.log"
        rm -f "$request"
    done
done &

# Wine processes inherit the driver's output: a file, so no pipe stays open behind them.
timeout 600 wine "$driver" "$(winpath "$program")" "$(winpath "$probe")" "$(winpath "$shots")" \
    "$(winpath "$cli")" "$(winpath "$HOME/Desktop")" >"$e2e/driver.log" 2>"$e2e/driver-stderr.log"
cat "$e2e/driver.log"
grep -qE '^[0-9]+ passed, [0-9]+ failed' "$e2e/driver.log" ||
    give_up "the driver ended without a result; its errors: $(tail -n 20 "$e2e/driver-stderr.log")"
