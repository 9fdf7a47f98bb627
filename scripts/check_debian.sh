#!/usr/bin/env bash
# Installs the Debian packages in a minimal Debian root, builds outside programs against them there (by CMake; by
# pkg-config, shared and static; as a subproject of the source archive), removes the packages, and checks that no file is
# left. Then builds and installs the library there by the lines of the README. Needs root or sudo; the root is made once,
# from this system's mirror, and kept in build/debian-root.
# Usage: scripts/check_debian.sh
set -euo pipefail
. "$(dirname "$0")/packages.sh"
show_help "$@"

need_packages debootstrap
as_root=()
[ "$(id -u)" = 0 ] || as_root=(sudo)
root=$PWD/build/debian-root
if [ ! -f "$root/ready" ]; then
    # shellcheck source=/dev/null
    suite=$(. /etc/os-release && echo "$VERSION_CODENAME")
    mirror=$(apt-get indextargets --format '$(SITE)' 'Created-By: Packages' | awk '!/security/ && !found++')
    "${as_root[@]}" debootstrap --variant=minbase \
        --include=ca-certificates,cmake,g++,make,ninja-build,pkg-config "$suite" "$root" "$mirror" \
        >build/debian-root.log 2>&1 || { tail -n 20 build/debian-root.log; exit 1; }
    "${as_root[@]}" touch "$root/ready"
fi
scripts/debian_packages.sh
"${as_root[@]}" rm -rf "$root/outside"
"${as_root[@]}" mkdir "$root/outside"
"${as_root[@]}" cp -r build/debian/*.deb build/debian/*.tar.gz tests/package "$root/outside/"
# programs read their own file in /proc
"${as_root[@]}" mount -t proc proc "$root/proc"
trap '"${as_root[@]}" umount "$root/proc"' EXIT

# Everything below runs inside, offline.
"${as_root[@]}" chroot "$root" bash -euo pipefail -s <<'INSIDE'
cd /outside
files() { find / -xdev \( -path /outside -o -path /proc -o -path /var/lib/dpkg -o -path /var/log -o -path /var/cache \) \
    -prune -o -print | sort; }
files >before
dpkg -i ./*.deb >install.log 2>&1 || { cat install.log; exit 1; }
[[ $(ldconfig -p) == *libbasalt.so* ]] || { echo "the loader does not find the library"; exit 1; }

configure() { cmake -S "$1" -B "$2" -G Ninja -DCMAKE_BUILD_TYPE=Release "${@:3}" && cmake --build "$2"; }
mkdir source
tar -xf basalt-*.tar.gz -C source --strip-components=1
{
    configure package/find_package found
    configure package/subdirectory sub -DBASALT_SOURCE_DIR=/outside/source
    # shellcheck disable=SC2046  # the flags are words
    g++ -std=c++17 package/consumer.cpp -o bare $(pkg-config --cflags --libs basalt)
    # shellcheck disable=SC2046
    g++ -std=c++17 package/consumer.cpp -o bare-static $(pkg-config --cflags basalt) -l:libbasalt.a \
        $(pkg-config --static --libs-only-l basalt | sed 's/-lbasalt//')
} >build.log 2>&1 || { tail -n 40 build.log; exit 1; }
basalt --version
ls /usr/share/man/man1/basalt.1* >/dev/null || { echo "the tool has no manual page"; exit 1; }
for program in found/consumer sub/consumer ./bare ./bare-static; do
    "$program" || { echo "$program failed"; exit 1; }
done
[[ $(ldd bare-static) != *libbasalt* ]] || { echo "the static program needs the shared library"; exit 1; }

dpkg --purge $(dpkg-query -W -f '${Package}\n' '*basalt*') >remove.log 2>&1 || { cat remove.log; exit 1; }
files >after
diff before after || { echo "files are left"; exit 1; }
echo "installed, four programs built and run, removed: no file is left"

cd source
export HOME=/outside
awk -f tests/pages/page_block.awk README.md >main.cpp
awk '/^## Quick start/ {on = 1} /^With CMake/ {exit} on && /^    / {print}' README.md >lines.sh
bash -e lines.sh >lines.log 2>&1 || { tail -n 40 lines.log; exit 1; }
./a.out
INSIDE
