#!/usr/bin/env bash
# Times the catalogue checks of verrant-cli (release build) on generated catalogues of N building
# headers with no doubles, against counting the same file's lines with wc. The runs at N and
# 2N show whether a check stays linear. Usage: tools/bench-checks.sh [N] (default 100000).
set -u
cd "$(dirname "$0")/.."
top=$(pwd)
count=${1:-100000}
source tools/script-helpers.sh
cli=$(release_cli) || exit 2
work=$(mktemp -d)
trap 'rm -rf "$work"' EXIT

# One group marker per 100 objects, each object with a number line, title, meshes and a body.
generate() {
    mkdir -p "$2"
    awk -v n="$1" 'BEGIN {
        for (i = 0; i < n; i++) {
            if (i % 100 == 0) printf "[***]\r\nTitle Group %d\r\n", i / 100
            printf "(%d)\r\n[buildings.House$Obj%07d]\r\nTitle Obj%07d\r\n", i, i, i
            printf "Mesh 3do/Buildings/Obj%07d/live.sim\r\nMeshDead 3do/Buildings/Obj%07d/dead.sim\r\n", i, i
            printf "Body Wood\r\n\r\n"
        }
    }' >"$2/static.ini"
}

# Best of three runs: "wall-ms cpu-ms", CPU being user plus system time, which a busy machine
# disturbs less than the wall clock.
best_ms() {
    local best_wall="" best_cpu="" times wall cpu
    for _ in 1 2 3; do
        times=$({ TIMEFORMAT='%R %U %S'; time "$@" >/dev/null 2>&1; } 2>&1)
        wall=$(awk -v t="$times" 'BEGIN { split(t, f, " "); printf "%d", f[1] * 1000 }')
        cpu=$(awk -v t="$times" 'BEGIN { split(t, f, " "); printf "%d", (f[2] + f[3]) * 1000 }')
        if [ -z "$best_wall" ] || [ "$wall" -lt "$best_wall" ]; then best_wall=$wall; fi
        if [ -z "$best_cpu" ] || [ "$cpu" -lt "$best_cpu" ]; then best_cpu=$cpu; fi
    done
    echo "$best_wall $best_cpu"
}

declare -A took
for n in "$count" $((count * 2)); do
    generate "$n" "$work/cat$n"
    bytes=$(stat -c %s "$work/cat$n/static.ini")
    read -r _ baseline < <(best_ms wc -l "$work/cat$n/static.ini")
    echo "== $n building headers, $bytes bytes; wc -l takes $baseline ms CPU"
    [ "$baseline" -gt 0 ] || baseline=1
    for command in doubled-objects irregular-entries empty-references; do
        for progress in "" --progress; do
            read -r wall cpu < <(best_ms "$cli" "$command" --catalogue "$work/cat$n" --report-dir "$work" $progress)
            took[$n$command$progress]=$cpu
            printf '  %-18s %-10s %5d ms wall %5d ms CPU  (%s x wc -l)\n' "$command" "$progress" "$wall" "$cpu" \
                "$(awk -v a="$cpu" -v b="$baseline" 'BEGIN { printf "%.1f", a / b }')"
        done
    done
done
echo "== CPU time at $((count * 2)) over CPU time at $count (2.0 is linear)"
for command in doubled-objects irregular-entries empty-references; do
    for progress in "" --progress; do
        printf '  %-18s %-10s %s\n' "$command" "$progress" \
            "$(awk -v a="${took[$((count * 2))$command$progress]}" -v b="${took[$count$command$progress]}" \
                'BEGIN { printf "%.2f", (b > 0 ? a / b : 0) }')"
    done
done
