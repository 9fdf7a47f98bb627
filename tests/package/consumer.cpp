// A host as users write it: stores, selects, measures, and prints the version it linked.
#include <basalt/basalt.h>

#include <cstdio>

// The name and version that the build put into this program.
static bool has_its_version() {
#ifdef VERSION_STRING
    VersionInfo info;
    return info.InitVersionInfo(nullptr) && info.GetVersionString() == VERSION_STRING;
#else
    return true;
#endif
}

int main() {
    vex_util::Sparse2DArray heights(sizeof(double), 16, 64);
    for (int y = 0; y < 40; ++y) {
        for (int x = 0; x < 40; ++x) {
            const double height = 100.0 + x + y;
            heights.Insert(x, y, &height);
        }
    }
    const int min[2] = {8, 8};
    const int max[2] = {20, 20};
    int count = 0;
    heights.Select(min, max);
    heights.IterateSelected(
        [](int, int, const void*, const void* context) {
            ++*static_cast<int*>(const_cast<void*>(context));
            return true;
        },
        &count);
    const geo_nee a{0.0, 0.0, 0.0};
    const geo_nee b{3.0, 4.0, 0.0};
    std::printf("basalt %s: %d cells, %g m, language %u\n", BASALT_VERSION, count, geo_horz_dist(a, b),
                static_cast<unsigned>(_languageVersion()));
    return count == 1024 && geo_horz_dist(a, b) == 5.0 &&
                   vex_lib::vlSharedMemoryHeap::GetHeapHandle() != nullptr && has_its_version()
               ? 0
               : 1;
}
