#!/usr/bin/env bash
# Runs Verrant on the demo tree: without a display, every check of verrant-cli, with the reports
# written to build/demo-reports. Installs missing Debian packages first when run as root.
set -u
cd "$(dirname "$0")/.."
top=$(pwd)
packages=(cmake make g++)
missing=()
for package in "${packages[@]}"; do
    dpkg -s "$package" >/dev/null 2>&1 || missing+=("$package")
done
if [ ${#missing[@]} -gt 0 ] && [ "$(id -u)" = 0 ]; then
    apt-get update -qq && DEBIAN_FRONTEND=noninteractive apt-get install -y -qq "${missing[@]}" >/dev/null
fi
cmake -S . -B build/release -DCMAKE_BUILD_TYPE=Release -DVERRANT_TESTS=OFF >/dev/null &&
    cmake --build build/release -j"$(nproc)" --target verrant-cli >/dev/null || exit 2

cli="$top/build/release/src/verrant-cli"
# A fresh copy each time: renumbering rewrites the catalogue it is given.
rm -rf "$top/build/demo-tree" && cp -r "$top/examples/demo-tree" "$top/build/demo-tree"
catalogue="$top/build/demo-tree/mods/std/com/maddox/il2/objects"
map="$top/build/demo-tree/mods/mapmods/maps/Coast/actors.static"
reports="$top/build/demo-reports"
mkdir -p "$reports"
for command in $("$cli" --help | sed -n 's/^  \([a-z+-]*\) .*/\1/p' | grep -v '^-'); do
    echo "== verrant-cli $command"
    "$cli" "$command" --catalogue "$catalogue" --map "$map" --report-dir "$reports"
    echo "   exit status $?"
done
echo "Reports in $reports"
