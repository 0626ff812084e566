#!/usr/bin/env bash
# Peak memory of verrant-cli on a catalogue larger than the limit: every command reads it a block
# at a time and writes its findings as it finds them, so no command may hold the catalogue, its
# findings or its progress lines. Ends with "N passed, M failed".
set -u
cd "$(dirname "$0")/../.."
source tools/script-helpers.sh
ensure_packages time gawk
# VERRANT_CLI=path checks another build.
cli=${VERRANT_CLI:-$(release_cli)} || { echo "0 passed, 1 failed"; exit 1; }
work=$(mktemp -d)
trap 'rm -rf "$work"' EXIT
passed=0 failed=0
limit_kb=$((64 * 1024))

# 1,600,000 objects in 75 MB: each with a number line, an empty mesh key and an irregular line;
# every fourth name is doubled, so that the doubled check needs more than one window, and the mesh
# checks need thirteen.
objects="$work/mods/std/com/maddox/il2/objects"
mkdir -p "$objects" "$work/reports" "$work/mods/mapmods/maps"
awk 'BEGIN { printf "[***]\r\nTitle Mods\r\n"
             for (i = 0; i < 1600000; i++) printf "(%d)\r\n[buildings.House$Obj%d]\r\nMesh\r\nx %d\r\n", i, i % 1200000, i }' \
    >"$objects/static.ini"
cp "$objects/static.ini" "$work/catalogue"
size_kb=$(($(stat -c %s "$work/catalogue") / 1024))
[ "$size_kb" -gt $((limit_kb * 5 / 4)) ] || { echo "FAIL: the catalogue is too small to tell"; exit 1; }

check() {
    local name=$1 peak; shift
    /usr/bin/time -f %M -o "$work/peak" "$cli" "$@" --catalogue "$objects" --report-dir "$work/reports" \
        --progress >/dev/null 2>"$work/stderr"
    peak=$(tail -n 1 "$work/peak")
    if [ "$peak" -lt "$limit_kb" ]; then
        passed=$((passed + 1)); echo "PASS: $name: $((peak / 1024)) MB"
    else
        failed=$((failed + 1)); echo "FAIL: $name: $((peak / 1024)) MB, limit $((limit_kb / 1024)) MB"
    fi
    cp "$work/catalogue" "$objects/static.ini"
}
for command in doubled-objects irregular-entries empty-references renumber denumber fmb-list fmb-plus-list \
    wrong-sim-references doubled-used-sims check-all; do
    check "$command" "$command"
done
check "missing-objects --all-maps" missing-objects --all-maps
echo "$passed passed, $failed failed"
[ "$failed" = 0 ]
