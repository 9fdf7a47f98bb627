#include "progress.h"

#include <unistd.h>

#include <algorithm>
#include <cstdio>
#include <fstream>
#include <string_view>
#include <utility>

Progress::Progress(std::string step, std::int64_t total)
    : m_step(std::move(step)),
      m_total(std::max<std::int64_t>(total, 1)),
      m_on_terminal(isatty(STDERR_FILENO) == 1),
      m_next(Clock::now() + std::chrono::milliseconds(500)) {}

Progress::~Progress() {
    if (m_shown) {
        std::fputs("\r\033[K", stderr);
    }
}

void Progress::update(std::int64_t done) {
    if (!m_on_terminal || Clock::now() < m_next) {
        return;
    }
    m_next = Clock::now() + std::chrono::milliseconds(100);
    m_shown = true;
    constexpr int WIDTH = 30;
    const double share = std::clamp(static_cast<double>(done) / static_cast<double>(m_total), 0.0, 1.0);
    std::string bar(WIDTH, '.');
    std::fill_n(bar.begin(), static_cast<int>(share * WIDTH), '#');
    std::fprintf(stderr, "\r\033[K%s [%s] %d %%", m_step.c_str(), bar.c_str(), static_cast<int>(100 * share));
}

namespace {

/// Value in bytes of a line `Key:   123 kB`.
std::optional<std::int64_t> memory_line(const char* path, std::string_view key) {
    std::ifstream file(path);
    std::int64_t kilobytes = 0;
    for (std::string word; file >> word;) {
        if (word == key && file >> kilobytes) {
            return kilobytes * 1024;
        }
    }
    return std::nullopt;
}

}  // namespace

std::optional<std::int64_t> resident_memory() {
    // The rollup counts pages; the figure in status lags behind by a few hundred kilobytes.
    const std::optional<std::int64_t> exact = memory_line("/proc/self/smaps_rollup", "Rss:");
    return exact ? exact : memory_line("/proc/self/status", "VmRSS:");
}

std::optional<std::int64_t> private_memory() {
    return memory_line("/proc/self/status", "RssAnon:");
}
