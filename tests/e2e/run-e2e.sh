#!/usr/bin/env bash
# End-to-end tests: the real verrant.exe under Wine in a 1280x1024 Wine virtual desktop on an Xvfb display
# of its own, worked by e2e_driver.exe from the MinGW build, with its own WINEPREFIX and HOME under
# build/e2e; screenshots go to build/e2e-shots. Stops its Xvfb by PID and its wineserver by prefix.
# Ends with "N passed, M failed". VERRANT_EXE=path overrides the program under test.
set -u
cd "$(dirname "$0")/../.."
build="$PWD/build/mingw" e2e="$PWD/build/e2e" shots="$PWD/build/e2e-shots"
program="${VERRANT_EXE:-$build/src/verrant.exe}" cli="$build/src/verrant-cli.exe"
driver="$build/tests/e2e/e2e_driver.exe" probe="$build/tests/e2e/e2e_probe.dll"
give_up() { echo "$1"; echo "0 passed, 1 failed"; exit 1; }
for f in "$program" "$driver" "$probe" "$cli"; do [ -f "$f" ] || give_up "no $f: build MinGW first"; done
windows_path() { echo "Z:${1//\//\\}"; }

rm -rf "$e2e" "$shots" && mkdir -p "$e2e/home/Desktop" "$shots"
export WINEPREFIX="$e2e/prefix" HOME="$e2e/home" LC_ALL=C.UTF-8
export WINEDEBUG=-all WINEDLLOVERRIDES="mscoree,mshtml=" WINEARCH=win64
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
printf '%s\n' REGEDIT4 '[HKEY_CURRENT_USER\Software\Wine\Explorer]' '"Desktop"="verrant"' \
    '[HKEY_CURRENT_USER\Software\Wine\Explorer\Desktops]' '"verrant"="1280x1024"' \
    '[HKEY_CURRENT_USER\Software\Wine\WineDbg]' '"ShowCrashDialog"=dword:00000000' >"$e2e/settings.reg"
wine regedit /S "$(windows_path "$e2e/settings.reg")" >>"$e2e/wineboot.log" 2>&1
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
timeout 600 wine "$driver" "$(windows_path "$program")" "$(windows_path "$probe")" 'C:\verrant-e2e' \
    "$(windows_path "$shots")" "$(windows_path "$cli")" "$(windows_path "$HOME/Desktop")" \
    >"$e2e/driver.log" 2>"$e2e/driver-stderr.log"
echo "the run took $SECONDS s; screenshots in $shots"
cat "$e2e/driver.log"
grep -qE '^[0-9]+ passed, [0-9]+ failed' "$e2e/driver.log" ||
    give_up "the driver ended without a result; its errors: $(tail -n 20 "$e2e/driver-stderr.log")"
