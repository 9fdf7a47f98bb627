#!/usr/bin/env bash
# Makes the Debian packages (library, development files with the static archive, tool, documentation with the examples)
# and the source archive of the last commit in build/debian, and prints their paths.
# Usage: scripts/debian_packages.sh
set -euo pipefail
. "$(dirname "$0")/packages.sh"
show_help "$@"

need_packages "${BUILD_PACKAGES[@]}" dpkg-dev doxygen file git gzip
work=$PWD/build/debian
rm -rf "$work"
mkdir -p "$work"
log=$work/log
configure() {  # name, cmake options
    cmake -S . -B "$work/$1" -G Ninja -DCMAKE_BUILD_TYPE=Release -DBASALT_BUILD_TESTS=OFF -DBASALT_BUILD_EXAMPLES=OFF \
        -DCMAKE_SKIP_INSTALL_RPATH=ON -DCMAKE_INSTALL_PREFIX=/usr "${@:2}" \
        -DCMAKE_INSTALL_LIBDIR="lib/$(dpkg-architecture -qDEB_HOST_MULTIARCH)" >>"$log" 2>&1 || { cat "$log"; exit 1; }
}
configure shared -DBUILD_SHARED_LIBS=ON -DBASALT_BUILD_DOCS=ON -DBASALT_PACKAGE_DOCS=ON
configure static -DBUILD_SHARED_LIBS=OFF -DBASALT_BUILD_TOOLS=OFF
build_with_progress "shared library and tool" "$work/shared"
build_with_progress "documentation" "$work/shared" --target docs
build_with_progress "static library" "$work/static"
echo "Making packages" >&2
cat >"$work/packages.cmake" <<END
include("$work/shared/CPackConfig.cmake")
set(CPACK_PACKAGE_DIRECTORY "$work")
# the shared build comes last: its files replace those of the static one
set(CPACK_INSTALL_CMAKE_PROJECTS "$work/static;basalt;ALL;/" "$work/shared;basalt;ALL;/")
# the static archive joins the development files
set(CPACK_COMPONENTS_ALL runtime development archive tools documentation)
set(CPACK_COMPONENTS_GROUPING ONE_PER_GROUP)
set(CPACK_COMPONENT_DEVELOPMENT_GROUP development)
set(CPACK_COMPONENT_ARCHIVE_GROUP development)
set(CPACK_COMPONENT_RUNTIME_GROUP runtime)
set(CPACK_COMPONENT_TOOLS_GROUP tools)
set(CPACK_COMPONENT_DOCUMENTATION_GROUP documentation)
END
cpack --config "$work/packages.cmake" >>"$log" 2>&1 || { tail -n 40 "$log"; exit 1; }
version=$(sed -n 's/^set(CPACK_PACKAGE_VERSION "\(.*\)")$/\1/p' "$work/shared/CPackConfig.cmake")
git archive --format=tar.gz --prefix="basalt-$version/" -o "$work/basalt-$version.tar.gz" HEAD
ls -1 "$work"/*.deb "$work"/*.tar.gz
