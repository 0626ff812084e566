#!/usr/bin/env bash
# Runs every test of Verrant and ends with one line "N passed, M failed".
# Installs missing Debian packages first when run as root. FUZZ_SECONDS sets how long each fuzz
# target runs (default 3).
set -u
cd "$(dirname "$0")/.."
top=$(pwd)
jobs=$(nproc 2>/dev/null || echo 2)

source tools/script-helpers.sh
ensure_packages cmake make g++ libgtest-dev googletest g++-mingw-w64-x86-64 binutils-mingw-w64-x86-64 \
    wine wine64 fonts-wine fonts-dejavu-core xvfb xauth imagemagick x11-utils clang libclang-rt-14-dev zip unzip

passed=0
failed=0
pass() { passed=$((passed + 1)); echo "PASS: $1"; }
fail() { failed=$((failed + 1)); echo "FAIL: $1"; }
# Adds the counts of a closing "N passed, M failed" line from a suite's output file.
add_counts() {
    local line
    line=$(grep -E '^[0-9]+ passed, [0-9]+ failed' "$1" | tail -n 1)
    if [ -z "$line" ]; then fail "$2 (no result line)"; return; fi
    passed=$((passed + $(echo "$line" | cut -d' ' -f1)))
    failed=$((failed + $(echo "$line" | cut -d' ' -f3)))
    echo "$2: $line"
}

logs="$top/build/logs"
mkdir -p "$logs"

# Includes in src/ point down only.
if bash tools/check-layers.sh >"$logs/layers.log" 2>&1; then pass "layers"; else fail "layers"; cat "$logs/layers.log"; fi

# Native: core, headless platform, verrant-cli and unit tests under the sanitizers.
if cmake -S . -B build/native -DCMAKE_BUILD_TYPE=Debug -DVERRANT_SANITIZE=ON -DVERRANT_WERROR=ON \
        >"$logs/native-configure.log" 2>&1 &&
    cmake --build build/native -j"$jobs" >"$logs/native-build.log" 2>&1; then
    pass "native build"
    (cd build/native && ctest -j"$jobs" --timeout 300 >"$logs/unit.log" 2>&1)
    summary=$(grep -E 'tests passed, [0-9]+ tests failed out of [0-9]+' "$logs/unit.log" | tail -n 1)
    if [ -n "$summary" ]; then
        total=$(echo "$summary" | sed -E 's/.* out of ([0-9]+).*/\1/')
        bad=$(echo "$summary" | sed -E 's/.* ([0-9]+) tests failed.*/\1/')
        passed=$((passed + total - bad))
        failed=$((failed + bad))
        echo "unit and cli tests: $((total - bad)) passed, $bad failed"
        grep -E '\*\*\*Failed|Not Run|Timeout' "$logs/unit.log" | sed 's/^/    /'
    else
        fail "unit tests (no ctest summary; see $logs/unit.log)"
    fi
else
    fail "native build (see $logs/native-build.log)"
    tail -n 30 "$logs/native-build.log"
fi

# Windows: the program, verrant-cli.exe and the end-to-end driver, warning-free.
if cmake -S . -B build/mingw -DCMAKE_TOOLCHAIN_FILE=cmake/mingw-w64.cmake -DCMAKE_BUILD_TYPE=Release \
        -DVERRANT_WERROR=ON >"$logs/mingw-configure.log" 2>&1 &&
    cmake --build build/mingw -j"$jobs" >"$logs/mingw-build.log" 2>&1; then
    pass "MinGW build"
    # verrant.exe must run on a bare Windows: only system DLLs in its import table.
    imports=$(x86_64-w64-mingw32-objdump -p build/mingw/src/verrant.exe 2>/dev/null | sed -n 's/^\s*DLL Name: //p')
    foreign=$(echo "$imports" | grep -viE '^(kernel32|user32|gdi32|comctl32|shell32|ole32|oleaut32|advapi32|comdlg32|shlwapi|version|msvcrt|ucrtbase|api-ms-win-[a-z0-9-]+)\.dll$')
    if [ -n "$imports" ] && [ -z "$foreign" ]; then
        pass "verrant.exe imports system DLLs only ($(echo $imports | tr ' ' ','))"
    else
        fail "verrant.exe imports: ${foreign:-none found}"
    fi
else
    fail "MinGW build (see $logs/mingw-build.log)"
    tail -n 30 "$logs/mingw-build.log"
fi

# Further suites print their own closing line; the package suite makes the download zip.
for suite in tests/e2e/run-e2e.sh tests/package/run-package-test.sh tests/fuzz/run-fuzz.sh tests/memory/run-memory-test.sh; do
    [ -f "$suite" ] || continue
    bash "$suite" >"$logs/$(basename "$suite" .sh).log" 2>&1
    add_counts "$logs/$(basename "$suite" .sh).log" "$suite"
done

echo "$passed passed, $failed failed"
[ "$failed" = 0 ]
