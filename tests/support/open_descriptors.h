// Counts the descriptors of this process.
#ifndef BASALT_TESTS_SUPPORT_OPEN_DESCRIPTORS_H
#define BASALT_TESTS_SUPPORT_OPEN_DESCRIPTORS_H

#include <filesystem>
#include <iterator>

namespace basalt::test {

// Equal readings: none leaked in between.
inline long open_descriptors() {
    const std::filesystem::directory_iterator all("/proc/self/fd");
    return std::distance(begin(all), end(all));
}

}  // namespace basalt::test

#endif
