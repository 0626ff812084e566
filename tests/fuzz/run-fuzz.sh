#!/usr/bin/env bash
# Builds the fuzz targets (clang, libFuzzer, ASan, UBSan) and runs each from its checked-in seeds
# for FUZZ_SECONDS (default 3); ends with "N passed, M failed", one count per target.
#   tests/fuzz/run-fuzz.sh [--seconds N] [--only TARGET]
# A target fails on a crash, a hang (over 10 s for one input), a sanitizer report or a leak; the
# input that did it is kept in build/fuzz/findings/.
set -u
cd "$(dirname "$0")/../.."
seconds=${FUZZ_SECONDS:-3}
only=""
while [ $# -gt 0 ]; do
    case "$1" in
        --seconds) seconds=$2; shift 2 ;;
        --only) only=$2; shift 2 ;;
        *) echo "usage: $0 [--seconds N] [--only TARGET]"; exit 2 ;;
    esac
done
build=build/fuzz
logs=build/logs/fuzz
mkdir -p "$logs" "$build/findings"

if ! cmake -S tests/fuzz -B "$build" -DCMAKE_CXX_COMPILER=clang++ -DCMAKE_BUILD_TYPE=RelWithDebInfo \
        >"$logs/configure.log" 2>&1 || ! cmake --build "$build" -j2 >"$logs/build.log" 2>&1; then
    echo "FAIL: fuzz build (see $logs/build.log)"
    tail -n 20 "$logs/build.log"
    echo "0 passed, 1 failed"
    exit 1
fi

passed=0
failed=0
while read -r target seeds; do
    [ -z "$target" ] && continue
    [ -n "$only" ] && [ "$only" != "$target" ] && continue
    work="$build/corpus/$target"
    mkdir -p "$work"
    log="$logs/$target.log"
    # New inputs go into the working corpus; the checked-in seeds are only read.
    if "$build/$target" -max_total_time="$seconds" -timeout=10 -rss_limit_mb=2048 -print_final_stats=1 \
            -artifact_prefix="$build/findings/$target-" "$work" "tests/fuzz/corpus/$seeds" >"$log" 2>&1; then
        passed=$((passed + 1))
        runs=$(grep -E '^stat::number_of_executed_units' "$log" | awk '{print $2}')
        echo "PASS: $target (${runs:-?} runs in ${seconds} s)"
    else
        failed=$((failed + 1))
        echo "FAIL: $target (see $log)"
        grep -E 'ERROR|property failed|SUMMARY|Test unit written' "$log" | head -n 5 | sed 's/^/    /'
    fi
done <"$build/fuzz-targets.txt"

echo "$passed passed, $failed failed"
[ "$failed" = 0 ]
