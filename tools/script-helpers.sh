# Shell procedures the project's scripts share; source it from a script run at the project's root.

# Installs the named Debian packages that are missing, when run as root; otherwise names them.
ensure_packages() {
    local missing=() package
    for package in "$@"; do
        dpkg -s "$package" >/dev/null 2>&1 || missing+=("$package")
    done
    [ ${#missing[@]} -eq 0 ] && return 0
    if [ "$(id -u)" = 0 ]; then
        echo "Installing: ${missing[*]}" >&2
        apt-get update -qq && DEBIAN_FRONTEND=noninteractive apt-get install -y -qq "${missing[@]}" >/dev/null
    else
        echo "Missing packages (run as root to install them): ${missing[*]}" >&2
    fi
}

# Builds a release verrant-cli in build/release and prints its path; false when the build fails.
release_cli() {
    cmake -S . -B build/release -DCMAKE_BUILD_TYPE=Release -DVERRANT_TESTS=OFF >/dev/null &&
        cmake --build build/release -j2 --target verrant-cli >/dev/null &&
        echo "$(pwd)/build/release/src/verrant-cli"
}
