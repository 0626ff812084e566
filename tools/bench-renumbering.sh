#!/usr/bin/env bash
# Renumbers generated catalogues of growing size with a release verrant-cli and prints time and
# peak resident size for each, beside a plain copy of the same file as the baseline.
# Usage: bash tools/bench-renumbering.sh [LINES ...]   (default: 500000 1000000 2000000)
set -eu
cd "$(dirname "$0")/.."
sizes=("$@")
[ ${#sizes[@]} -gt 0 ] || sizes=(500000 1000000 2000000)

source tools/script-helpers.sh
cli=$(release_cli) || exit 2
work=$(mktemp -d)
trap 'rm -rf "$work"' EXIT

# Seconds and peak resident kilobytes of one command, as "seconds kilobytes".
measure() {
    /usr/bin/time -f "%e %M" -o "$work/time" "$@" >/dev/null 2>&1
    cat "$work/time"
}

printf "%10s %10s %9s %9s %9s %9s %8s\n" lines bytes renum_s renum_MB copy_s copy_MB ratio
for lines in "${sizes[@]}"; do
    # Six lines per object, a group every 50 objects, stale number lines and LF ends.
    awk -v n="$lines" 'BEGIN {
        for (i = 0; written < n; i++) {
            if (i % 50 == 0) { print "[***]"; print "Title Group " i; written += 2 }
            print "(" i + 7 ")"
            print "[buildings.House$Object" i "]"
            print "Mesh          3do/Buildings/Object" i "/mono.sim"
            print "// a comment (kept)"
            print "Panzer        0.3"
            print ""
            written += 6
        } }' >"$work/static.ini"
    bytes=$(stat -c %s "$work/static.ini")
    read -r copy_s copy_kb < <(measure cp "$work/static.ini" "$work/copy.ini")
    read -r renum_s renum_kb < <(measure "$cli" renumber --catalogue "$work")
    ratio=$(awk -v a="$renum_s" -v b="$copy_s" 'BEGIN { printf "%.1f", (b > 0 ? a / b : 0) }')
    printf "%10d %10d %9s %9.1f %9s %9.1f %8s\n" "$lines" "$bytes" "$renum_s" "$(echo "$renum_kb / 1024" | bc -l)" \
        "$copy_s" "$(echo "$copy_kb / 1024" | bc -l)" "$ratio"
done
