#include "process.h"

#include <sys/resource.h>
#include <unistd.h>

#include <algorithm>
#include <cstdio>
#include <memory>
#include <string>
#include <string_view>

#include "number_parsing.h"

namespace {

/// Value in bytes of a line `Key:   123 kB`.
std::optional<std::int64_t> memory_line(const char* path, std::string_view key) {
    const auto close = [](std::FILE* file) { std::fclose(file); };
    const std::unique_ptr<std::FILE, decltype(close)> file(std::fopen(path, "r"), close);
    if (!file) {
        return std::nullopt;
    }
    char text[256];
    while (std::fgets(text, sizeof text, file.get()) != nullptr) {
        std::string_view line(text);
        if (line.substr(0, key.size()) != key) {
            continue;
        }
        line = line.substr(std::min(line.find_first_of("0123456789"), line.size()));
        const std::optional<std::int64_t> kilobytes = parse_integer(line.substr(0, line.find(' ')));
        return kilobytes ? std::optional(*kilobytes * 1024) : std::nullopt;
    }
    return std::nullopt;
}

}  // namespace

bool standard_error_is_terminal() {
    return isatty(STDERR_FILENO) == 1;
}

std::optional<std::int64_t> resident_memory() {
    // The rollup counts pages; the figure in status lags behind by a few hundred kilobytes.
    const std::optional<std::int64_t> exact = memory_line("/proc/self/smaps_rollup", "Rss:");
    return exact ? exact : memory_line("/proc/self/status", "VmRSS:");
}

std::optional<std::int64_t> peak_resident_memory() {
    return memory_line("/proc/self/status", "VmHWM:");
}

std::optional<std::int64_t> private_memory() {
    return memory_line("/proc/self/status", "RssAnon:");
}

std::optional<std::int64_t> private_memory_limit() {
    rlimit limit = {};
    if (getrlimit(RLIMIT_DATA, &limit) != 0 || limit.rlim_cur == RLIM_INFINITY) {
        return std::nullopt;
    }
    return static_cast<std::int64_t>(limit.rlim_cur);
}
