# Sourced by the other scripts: moves to the project's root, and installs Debian packages that are missing.

caller_folder=$PWD
calling_script=$(realpath "$0")
cd "$(dirname "${BASH_SOURCE[0]}")/.."
mkdir -p build

show_help() {  # prints the calling script's opening comment when the first argument is --help or -h
    if [ "${1:-}" = --help ] || [ "${1:-}" = -h ]; then
        sed -n '2,/^[^#]/{/^#/s/^# \{0,1\}//p}' "$calling_script"
        exit 0
    fi
}

need_packages() {  # package names; needs no network when all are installed
    local missing=() apt='apt-get -q -o DPkg::Lock::Timeout=600' as_root=
    for package in "$@"; do
        [[ $(dpkg-query -W -f '${db:Status-Status}' "$package" 2>/dev/null || true) == installed* ]] || missing+=("$package")
    done
    [ ${#missing[@]} -gt 0 ] || return 0
    if [ "$(id -u)" != 0 ]; then
        command -v sudo >/dev/null || {
            echo "Packages are missing. As root, run: apt-get install --no-install-recommends ${missing[*]}" >&2
            exit 1
        }
        as_root=sudo
    fi
    echo "Installing Debian packages: ${missing[*]}" >&2
    # shellcheck disable=SC2086  # the command is words
    { $as_root $apt update && $as_root env DEBIAN_FRONTEND=noninteractive $apt install -y --no-install-recommends \
        "${missing[@]}"; } >build/packages.log 2>&1 || { tail -n 20 build/packages.log >&2; exit 1; }
}

build_with_progress() {  # what is built, arguments of cmake --build; one line of progress on standard error
    local what=$1 log
    log=build/build-${what%%[ ,]*}.log
    shift
    {
        printf 'Building %s (output in %s):' "$what" "$log"
        cmake --build "$@" 2>&1 | tee "$log" | awk 'match($0, /^\[[0-9]+\/[0-9]+\]/) {
            split(substr($0, 2, RLENGTH - 2), done, "/")
            for (; next_mark <= 100 * done[1] / done[2]; next_mark += 10) { printf " %d%%", next_mark; fflush() }
        }' || { echo; grep -A 8 -E 'error: |FAILED' "$log" | head -n 60; exit 1; }
        echo
    } >&2
}

BUILD_PACKAGES=(g++ cmake ninja-build pkg-config)
EXAMPLE_PACKAGES=(libfmt-dev nlohmann-json3-dev)
TEST_PACKAGES=(libgtest-dev locales "${EXAMPLE_PACKAGES[@]}")
PEER_PACKAGES=(libbenchmark-dev libabsl-dev libopenvdb-dev libtbb-dev libboost1.81-dev libgeos-dev
    libspatialindex-dev libgeographiclib-dev libproj-dev libspdlog-dev libcairo2-dev
    libpixman-1-dev)
