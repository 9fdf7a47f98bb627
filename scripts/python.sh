#!/usr/bin/env bash
# Builds the Python package into an environment below build/python, runs its tests, and compares its help with the
# reference in docs/python.md.
# Usage: scripts/python.sh [pytest options]
#        scripts/python.sh bench                 measures batch calls beside NumPy, pyproj and shapely
#        scripts/python.sh reference             writes docs/python.md
#        scripts/python.sh plot [GRID [PICTURE]]  draws the sample terrain, or another, into build/python/terrain.png
set -euo pipefail
. "$(dirname "$0")/packages.sh"
show_help "$@"

need_packages "${BUILD_PACKAGES[@]}" python3-dev python3-numpy python3-pip python3-pybind11 pybind11-dev \
    python3-pytest python3-setuptools python3-venv python3-wheel
work=build/python
[ -x $work/environment/bin/python ] || /usr/bin/python3 -m venv --system-site-packages $work/environment
python=$PWD/$work/environment/bin/python
$python -m pip install --quiet --no-build-isolation --no-index --no-deps --force-reinstall bindings/python
case ${1:-} in
    bench)
        need_packages python3-pyproj python3-shapely proj-data
        PROJ_DATA=/usr/share/proj "$python" bindings/python/bench/batch.py
        ;;
    plot)
        need_packages python3-matplotlib
        shift
        "$python" bindings/python/examples/plot_terrain.py "${1:-examples/data/jacksboro.asc}" \
            "${2:-$work/terrain.png}"
        ;;
    reference) "$python" bindings/python/reference.py >docs/python.md ;;
    *)
        "$python" bindings/python/reference.py docs/python.md
        "$python" -B -m pytest -q -p no:cacheprovider bindings/python/tests "$@"
        ;;
esac
