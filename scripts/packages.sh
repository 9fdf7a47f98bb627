# Sourced by the other scripts: moves to the project's root and installs Debian packages that are missing.

caller_folder=$PWD
calling_script=$(realpath "$0")
cd "$(dirname "${BASH_SOURCE[0]}")/.."

show_help() {  # prints the calling script's opening comment when the first argument asks for help
    if [ "${1:-}" = --help ] || [ "${1:-}" = -h ]; then
        sed -n '2,/^[^#]/{/^#/s/^# \{0,1\}//p}' "$calling_script"
        exit 0
    fi
}

need_packages() {  # package names; nothing is asked of the network when all are there
    local missing=()
    for package in "$@"; do
        [[ $(dpkg-query -W -f '${db:Status-Status}' "$package" 2>/dev/null || true) == installed* ]] || missing+=("$package")
    done
    [ ${#missing[@]} -eq 0 ] && return
    local run=()
    [ "$(id -u)" = 0 ] || run=(sudo)
    echo "Installing: ${missing[*]}"
    "${run[@]}" apt-get update -q >/dev/null
    DEBIAN_FRONTEND=noninteractive "${run[@]}" apt-get install -q -y --no-install-recommends "${missing[@]}" >/dev/null
}

BUILD_PACKAGES=(g++ cmake ninja-build pkg-config libpixman-1-dev)
TEST_PACKAGES=(libgtest-dev)
PEER_PACKAGES=(libbenchmark-dev libabsl-dev libopenvdb-dev libtbb-dev libboost1.81-dev libgeos-dev
    libspatialindex-dev libgeographiclib-dev libproj-dev libspdlog-dev libcairo2-dev)
CHECK_PACKAGES=(abigail-tools binutils clang clang-format clang-tidy doxygen git libclang-rt-14-dev llvm locales
    python3)
