#!/usr/bin/env bash
# Starts pairs of rewrites (renumber or denumber, picked at random) on one catalogue of two million
# lines, the second at a random moment of the first, and checks what each pair leaves: static.ini is
# the old catalogue or one whole result of the runs that said "Done", never a mix; no static.ini.tmp
# is left; a run that did not get the catalogue says so and exits with 2.
# Usage: bash tools/stress-rewrites.sh [PAIRS] [CLI]   (default: 200, build/release's verrant-cli)
set -u
cd "$(dirname "$0")/.."
pairs=${1:-200}
cli=${2:-}
source tools/script-helpers.sh
[ -n "$cli" ] || cli=$(release_cli) || exit 2
work=$(mktemp -d)
trap 'rm -rf "$work"' EXIT
mkdir -p "$work/catalogue" "$work/reports"

awk 'BEGIN { for (i = 0; written < 2000000; i++) {
        if (i % 50 == 0) { printf "[***]\nTitle Group %d\n", i; written += 2 }
        printf "(%d)\n[buildings.House$Object%d]\nMesh          3do/Buildings/Object%d/mono.sim\n", i + 7, i, i
        printf "// a comment\nPanzer        0.3\n\n"
        written += 6 } }' >"$work/old.ini"
# The whole results: renumbering takes out the number lines first, so any order of runs ends in one
# of these.
for mode in renumber denumber; do
    cp "$work/old.ini" "$work/catalogue/static.ini"
    "$cli" "$mode" --catalogue "$work/catalogue" --report-dir "$work/reports" >/dev/null 2>&1
    cp "$work/catalogue/static.ini" "$work/$mode.ini"
done
sum() { cksum <"$1" | cut -d' ' -f1; }
old=$(sum "$work/old.ini") renumber=$(sum "$work/renumber.ini") denumber=$(sum "$work/denumber.ini")
start=$(date +%s%N)
"$cli" renumber --catalogue "$work/catalogue" --report-dir "$work/reports" >/dev/null 2>&1
span=$((($(date +%s%N) - start) / 1000000))  # milliseconds of one rewrite
echo "catalogue: 2000000 lines, $(stat -c %s "$work/old.ini") bytes; one rewrite takes ${span} ms"

modes=(renumber denumber)
bad=0 bothDone=0 oneRefused=0
for pair in $(seq "$pairs"); do
    cp "$work/old.ini" "$work/catalogue/static.ini"
    first=${modes[RANDOM % 2]} second=${modes[RANDOM % 2]}
    delay=$(awk -v r="$RANDOM" -v s="$span" 'BEGIN { printf "%.3f", r / 32768 * s / 1000 }')
    "$cli" "$first" --catalogue "$work/catalogue" --report-dir "$work/reports" >/dev/null 2>"$work/first.err" &
    a=$!
    sleep "$delay"
    "$cli" "$second" --catalogue "$work/catalogue" --report-dir "$work/reports" >/dev/null 2>"$work/second.err"
    b=$?
    wait "$a"
    a=$?
    result=$(sum "$work/catalogue/static.ini")
    done=""
    [ "$a" = 0 ] && done="$done $first"
    [ "$b" = 0 ] && done="$done $second"
    # What the runs that said "Done" may have left, in either order.
    case "$done" in
        "") allowed="$old" ;;
        " renumber" | " renumber renumber") allowed="$renumber" ;;
        " denumber" | " denumber denumber") allowed="$denumber" ;;
        *) allowed="$renumber $denumber" ;;
    esac
    problem=""
    [[ " $allowed " == *" $result "* ]] || problem="static.ini is not a whole result of:$done"
    [ -e "$work/catalogue/static.ini.tmp" ] && problem="$problem; static.ini.tmp is left"
    for run in "first $a" "second $b"; do
        set -- $run
        [ "$2" = 0 ] || { [ "$2" = 2 ] && grep -q "^static.ini failure: " "$work/$1.err"; } ||
            problem="$problem; the $1 run ended with $2 without saying why"
    done
    if [ -n "$problem" ]; then
        bad=$((bad + 1))
        echo "pair $pair ($first, then $second after ${delay} s): $problem"
    fi
    [ "$a" = 0 ] && [ "$b" = 0 ] && bothDone=$((bothDone + 1))
    [ "$a" != "$b" ] && oneRefused=$((oneRefused + 1))
done
echo "$pairs pairs: $bothDone both done one after the other, $oneRefused with one run refused, $bad mixed or unexplained"
[ "$bad" = 0 ]
