#!/usr/bin/env bash
# Builds the fuzz targets (clang, libFuzzer, ASan, UBSan) and runs each, or those named, from its
# seeds and dictionary in tests/fuzz/corpus for FUZZ_SECONDS (default 3); ends with "N passed, M
# failed". A target fails on a failed property, a crash, a hang (10 s), a sanitizer report or a
# leak, and the input that did it is kept in build/fuzz/findings/.   Usage: run-fuzz.sh [TARGET...]
set -u
cd "$(dirname "$0")/../.."
build=build/fuzz logs=build/logs/fuzz seconds=${FUZZ_SECONDS:-3} passed=0 failed=0
mkdir -p $logs $build/findings
{ cmake -S tests/fuzz -B $build -DCMAKE_CXX_COMPILER=clang++ -DCMAKE_BUILD_TYPE=RelWithDebInfo &&
    cmake --build $build -j2; } >$logs/build.log 2>&1 ||
    { tail -n 20 $logs/build.log; printf 'FAIL: fuzz build (see %s)\n0 passed, 1 failed\n' $logs/build.log; exit 1; }

for target in ${*:-catalogue_fuzz map_file_fuzz}; do
    seeds=tests/fuzz/corpus/${target%_fuzz}
    log=$logs/$target.log
    mkdir -p $build/corpus/$target
    # New inputs go to the working corpus, the seeds are only read; what the baselines print is dropped.
    if $build/$target -max_total_time=$seconds -timeout=10 -rss_limit_mb=2048 -print_final_stats=1 -close_fd_mask=1 \
            -dict=$seeds.dict -artifact_prefix=$build/findings/$target- $build/corpus/$target $seeds >$log 2>&1; then
        passed=$((passed + 1))
        echo "PASS: $target ($(awk '/^stat::number_of_executed_units/ {print $2}' $log) runs in $seconds s)"
    else
        failed=$((failed + 1))
        echo "FAIL: $target (see $log)"
        grep -E 'ERROR|property failed|SUMMARY|Test unit written' $log | head -n 5 | sed 's/^/    /'
    fi
done
echo "$passed passed, $failed failed"
[ $failed = 0 ]
