#include "progress.h"

#include <algorithm>
#include <cstdio>
#include <utility>

#include "process.h"

Progress::Progress(std::string step, std::int64_t total)
    : m_step(std::move(step)),
      m_total(std::max<std::int64_t>(total, 1)),
      m_on_terminal(standard_error_is_terminal()),
      m_next(Clock::now() + std::chrono::milliseconds(500)) {}

Progress::~Progress() {
    if (m_shown) {
        std::fputs("\r\033[K", stderr);
    }
}

void Progress::update(std::int64_t done) {
    if (!m_on_terminal) {
        return;
    }
    const Clock::time_point now = Clock::now();
    if (now < m_next) {
        return;
    }
    m_next = now + std::chrono::milliseconds(100);
    m_shown = true;
    constexpr int WIDTH = 30;
    const double share = std::clamp(static_cast<double>(done) / static_cast<double>(m_total), 0.0, 1.0);
    const auto filled = static_cast<std::size_t>(share * WIDTH);
    const std::string bar = std::string(filled, '#') + std::string(WIDTH - filled, '.');
    std::fprintf(stderr, "\r\033[K%s [%s] %d %%", m_step.c_str(), bar.c_str(), static_cast<int>(100 * share));
    std::fflush(stderr);
}
