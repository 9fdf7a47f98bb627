#!/usr/bin/env bash
# Prints two tables. Sizes in bytes, stripped: the library, and a static program of each family beyond an empty one.
# Headers beside other libraries': lines after preprocessing and milliseconds of compilation beyond an empty file, the
# least of ROUNDS (7) in random order.
# Usage: scripts/sizes.sh [--page PAGE]          also writes the tables between the page's marks
set -euo pipefail
. "$(dirname "$0")/packages.sh"
show_help "$@"

need_packages "${BUILD_PACKAGES[@]}" libgeographiclib-dev libboost1.81-dev libspdlog-dev libopenvdb-dev libtbb-dev \
    python3
work=build/sizes
mkdir -p $work
for kind in ON OFF; do
    cmake -S . -B $work/$kind -G Ninja -DCMAKE_BUILD_TYPE=Release -DBUILD_SHARED_LIBS=$kind -DBASALT_BUILD_TESTS=OFF \
        -DBASALT_BUILD_EXAMPLES=OFF >$work/log
    cmake --build $work/$kind --target basalt >>$work/log || { cat $work/log; exit 1; }
done

program() {  # name, headers, statement: builds a static program
    printf '%s\nint main(int count, char**) { %s }\n' "$2" "$3" >"$work/$1.cpp"
    g++ -std=c++17 -O2 -Iinclude -I$work/OFF/include "$work/$1.cpp" -o "$work/$1" -Wl,--gc-sections -s \
        $work/OFF/src/libbasalt.a
}
sections() { size "$1" | awk 'NR == 2 { print $1, $2, $3 }'; }

program empty '' 'return count;'
program geo '#include <basalt/geo.h>' 'return (int)geo_vincenty_distance({0.1 * count, 0, 0}, {0.2, 0, 0});'
program memory '#include <basalt/memory.h>' 'vex_lib::vlWinHeapAllocator heap(0); return heap.Alloc(count) == nullptr;'
program sparse '#include <basalt/sparse.h>' 'vex_util::Sparse2DArray array(8, 16, 64); return array.Find(count, 0) != nullptr;'
program util '#include <basalt/util.h>' 'return basalt::IsHexString(std::string(count, 48)) ? 0 : 1;'
program files '#include <basalt/files.h>' 'return vex_util::CFilePath(CString(L"a.b")).IsFile() ? count : 0;'
program graphics '#include <basalt/graphics.h>' 'return ColorPalette().FindClosestColor(count);'

{
    echo "| what | code and constants | data | zeroed data |"
    echo "|---|---:|---:|---:|"
    strip -o $work/stripped.so $work/ON/src/libbasalt.so
    read -r code data zeroed <<<"$(sections $work/stripped.so)"
    printf "| the shared library | %'d | %'d | %'d |\n" "$code" "$data" "$zeroed"
    read -r code0 data0 zeroed0 <<<"$(sections $work/empty)"
    for name in geo memory sparse util files graphics; do
        read -r code data zeroed <<<"$(sections $work/$name)"
        printf "| a static program of \`%s\` | %'d | %'d | %'d |\n" $name $((code - code0)) $((data - data0)) $((zeroed - zeroed0))
    done
} >$work/sizes

headers=(basalt/{geo,sparse,memory,frame,util,files,graphics,basalt}.h GeographicLib/Geodesic.hpp
    GeographicLib/Geocentric.hpp boost/geometry.hpp openvdb/openvdb.h spdlog/spdlog.h filesystem vector)
source_of() { if [ "$1" = empty ]; then echo; else echo "#include <$1>"; fi; }
compile() {  # header, compiler options
    source_of "$1" | g++ -std=c++17 -Iinclude -I$work/ON/include "${@:2}" -x c++ -
}

declare -A least lines
for header in empty "${headers[@]}"; do
    compile "$header" -fsyntax-only 2>$work/log || { cat $work/log; exit 1; }
    lines[$header]=$(compile "$header" -E -P | wc -l)
    least[$header]=1000000000
done
for _ in $(seq "${ROUNDS:-7}"); do
    for header in $(printf '%s\n' empty "${headers[@]}" | shuf); do
        began=$(date +%s%N)
        compile "$header" -fsyntax-only
        taken=$((($(date +%s%N) - began) / 1000))
        [ $taken -ge "${least[$header]}" ] || least[$header]=$taken
    done
done

{
    echo "| header | lines | milliseconds |"
    echo "|---|---:|---:|"
    for header in "${headers[@]}"; do
        LC_ALL=C awk -v name="$header" -v lines="${lines[$header]}" -v us=$((least[$header] - least[empty])) \
            'BEGIN { printf "| `%s` | %d | %.0f |\n", name, lines, us / 1000 }'
    done
} >$work/headers

for table in sizes headers; do
    cat $work/$table
    [ "${1:-}" != --page ] || python3 scripts/bench_table.py --page "$2" $table --text "$(cat $work/$table)"
done
