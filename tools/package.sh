#!/usr/bin/env bash
# Builds verrant.exe and verrant-cli.exe with MinGW in Release and writes
# build/package/verrant-VERSION-win64.zip: both programs, stripped, and README.txt, the user guide
# with CR LF line ends. VERSION is the program's own, from its version resource. Installs missing
# Debian packages first when run as root. Prints the zip's path.
set -u
cd "$(dirname "$0")/.."
source tools/script-helpers.sh
ensure_packages cmake make g++-mingw-w64-x86-64 binutils-mingw-w64-x86-64 zip

version=$(sed -n 's/.*VALUE "ProductVersion", "\([0-9.]*\)".*/\1/p' src/platform/win32/verrant.rc)
name="verrant-$version-win64"
mkdir -p build/logs
# The test command's MinGW build, so that a package after the tests costs no second build.
if ! cmake -S . -B build/mingw -DCMAKE_TOOLCHAIN_FILE=cmake/mingw-w64.cmake -DCMAKE_BUILD_TYPE=Release \
        >build/logs/package-build.log 2>&1 ||
    ! cmake --build build/mingw -j2 --target verrant verrant-cli >>build/logs/package-build.log 2>&1; then
    echo "package: the MinGW build failed (see build/logs/package-build.log)" >&2
    exit 2
fi

stage="build/package/$name"
rm -rf "$stage" "build/package/$name.zip" && mkdir -p "$stage"
for program in verrant verrant-cli; do
    x86_64-w64-mingw32-strip -o "$stage/$program.exe" "build/mingw/src/$program.exe" || exit 2
done
sed 's/$/\r/' tools/package/README.txt >"$stage/README.txt"
(cd "$stage" && zip -q -X "../$name.zip" verrant.exe verrant-cli.exe README.txt) || exit 2
echo "build/package/$name.zip"
