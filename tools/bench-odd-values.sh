#!/usr/bin/env bash
# Times a release verrant-cli on catalogues and paths made to stall a careless path lookup: a mesh
# value of many ".." parts, a --catalogue path of many parts, and values that no folder listing can
# judge (a "~" in them) beside a folder of many files, which must not be listed once per value.
# Usage: bash tools/bench-odd-values.sh [CLI]   (default: builds build/release's verrant-cli)
set -eu
cd "$(dirname "$0")/.."
cli=${1:-}
source tools/script-helpers.sh
[ -n "$cli" ] || cli=$(release_cli) || exit 2
work=$(mktemp -d)
trap 'rm -rf "$work"' EXIT

# Seconds (wall) of one command.
measure() {
    /usr/bin/time -f "%e" -o "$work/time" "$@" >/dev/null 2>&1 || true
    tail -n 1 "$work/time"
}

catalogue="$work/tree/mods/std/com/maddox/il2/objects"
mkdir -p "$catalogue" "$work/tree/mods/Pack/3do/Many"
repeat() { awk -v n="$2" -v part="$1" 'BEGIN { for (i = 0; i < n; i++) printf "%s", part }'; }

for parts in 10000 100000; do
    printf '[***]\r\nTitle Mods\r\n[buildings.House$Up]\r\nMesh 3do\\%sx.sim\r\n' "$(repeat '..\' "$parts")" \
        >"$catalogue/static.ini"
    printf "%-52s %8s s\n" "one mesh value of $parts \"..\" parts" \
        "$(measure "$cli" wrong-sim-references --catalogue "$catalogue" --report-dir "$work")"
done

printf "%-52s %8s s\n" "a --catalogue path of 16000 missing parts" \
    "$(measure "$cli" doubled-objects --catalogue "$work/$(repeat x/ 16000)" --report-dir "$work")"

(cd "$work/tree/mods/Pack/3do/Many" && seq -f "f%.0f.sim" 50000 | xargs touch)
awk 'BEGIN { printf "[***]\r\nTitle Mods\r\n"
    for (i = 0; i < 200; i++) printf "[buildings.House$T%d]\r\nMesh 3do\\Many\\t~%d.sim\r\n", i, i }' \
    >"$catalogue/static.ini"
printf "%-52s %8s s\n" "200 values with \"~\" beside 50000 files" \
    "$(measure "$cli" wrong-sim-references --catalogue "$catalogue" --report-dir "$work")"
