#!/usr/bin/env bash
# End-to-end tests: the real verrant.exe under Wine, inside a Wine virtual desktop (1280x1024) in an
# Xvfb display of its own, worked by the driver e2e_driver.exe. Uses its own WINEPREFIX and HOME
# under build/e2e, saves screenshots into build/e2e-shots, and stops its Xvfb and wineserver by PID
# and prefix at the end, also on failure. Ends with "N passed, M failed".
#   VERRANT_EXE=path overrides the program under test (default build/mingw/src/verrant.exe).
set -u
cd "$(dirname "$0")/../.."
top=$(pwd)
build="$top/build/mingw"
program="${VERRANT_EXE:-$build/src/verrant.exe}"
driver="$build/tests/e2e/e2e_driver.exe"
probe="$build/tests/e2e/e2e_probe.dll"
cli="$build/src/verrant-cli.exe"
e2e="$top/build/e2e"
shots="$top/build/e2e-shots"

for file in "$program" "$driver" "$probe" "$cli"; do
    if [ ! -f "$file" ]; then
        echo "missing $file (build the MinGW configuration first)"
        echo "0 passed, 1 failed"
        exit 1
    fi
done

windows_path() { echo "Z:${1//\//\\}"; }

rm -rf "$e2e"
mkdir -p "$e2e/home/Desktop" "$shots"
rm -f "$shots"/*.png "$shots"/*.request
export WINEPREFIX="$e2e/prefix" HOME="$e2e/home" WINEDEBUG=-all WINEDLLOVERRIDES="mscoree,mshtml="
export WINEARCH=win64 LC_ALL=C.UTF-8
unset WAYLAND_DISPLAY

xvfb_pid=""
watcher_pid=""
cleanup() {
    [ -n "$watcher_pid" ] && kill "$watcher_pid" 2>/dev/null
    [ -d "$WINEPREFIX" ] && wineserver -k 2>/dev/null
    [ -n "$xvfb_pid" ] && kill "$xvfb_pid" 2>/dev/null
    [ -n "$watcher_pid" ] && wait "$watcher_pid" 2>/dev/null
    [ -n "$xvfb_pid" ] && wait "$xvfb_pid" 2>/dev/null
}
trap cleanup EXIT

# A display number nobody uses; Xvfb refuses one that is taken, so try the next.
for number in $(seq 140 240); do
    [ -e "/tmp/.X$number-lock" ] || [ -e "/tmp/.X11-unix/X$number" ] && continue
    Xvfb ":$number" -screen 0 1280x1024x24 -nolisten tcp >"$e2e/xvfb.log" 2>&1 &
    xvfb_pid=$!
    for _ in $(seq 50); do
        [ -e "/tmp/.X11-unix/X$number" ] && break
        kill -0 "$xvfb_pid" 2>/dev/null || break
        sleep 0.1
    done
    if kill -0 "$xvfb_pid" 2>/dev/null && [ -e "/tmp/.X11-unix/X$number" ]; then
        export DISPLAY=":$number"
        break
    fi
    wait "$xvfb_pid" 2>/dev/null
    xvfb_pid=""
done
if [ -z "$xvfb_pid" ]; then
    echo "no free X display for Xvfb"
    echo "0 passed, 1 failed"
    exit 1
fi

started=$(date +%s)
wine wineboot -i >"$e2e/wineboot.log" 2>&1
# Debian's Wine finds its own fonts (Tahoma, and Marlett for the caption buttons) only here.
cp /usr/share/wine/fonts/* "$WINEPREFIX/drive_c/windows/Fonts/" 2>/dev/null
cat >"$e2e/settings.reg" <<'EOF'
REGEDIT4

[HKEY_CURRENT_USER\Software\Wine\Explorer]
"Desktop"="verrant"

[HKEY_CURRENT_USER\Software\Wine\Explorer\Desktops]
"verrant"="1280x1024"

[HKEY_CURRENT_USER\Software\Wine\WineDbg]
"ShowCrashDialog"=dword:00000000
EOF
wine regedit /S "$(windows_path "$e2e/settings.reg")" >>"$e2e/wineboot.log" 2>&1
wineserver -k  # the next process starts the virtual desktop the prefix now names
echo "prefix ready in $(($(date +%s) - started)) s"

# The driver asks for screenshots by leaving NAME.request files; this takes them.
(
    while true; do
        for request in "$shots"/*.request; do
            [ -e "$request" ] || continue
            import -window root "${request%.request}.png" 2>>"$e2e/import.log"
            rm -f "$request"
        done
        sleep 0.1
    done
) &
watcher_pid=$!

# Scenarios copy the demo tree before use, and check reports against verrant-cli.exe's.
export VERRANT_E2E_DEMO_TREE="$(windows_path "$top/examples/demo-tree")" VERRANT_E2E_CLI="$(windows_path "$cli")"
# Wine processes inherit the driver's output: a file, so no pipe stays open behind them.
started=$(date +%s)
timeout 600 wine "$driver" "$(windows_path "$program")" "$(windows_path "$probe")" 'C:\verrant-e2e' \
    "$(windows_path "$shots")" >"$e2e/driver.log" 2>"$e2e/driver-stderr.log"
status=$?
echo "scenarios took $(($(date +%s) - started)) s; screenshots in $shots"
cat "$e2e/driver.log"
if ! grep -qE '^[0-9]+ passed, [0-9]+ failed' "$e2e/driver.log"; then
    echo "the driver ended without a result (status $status); its errors:"
    tail -n 20 "$e2e/driver-stderr.log"
    echo "0 passed, 1 failed"
fi
