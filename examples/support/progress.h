// A progress bar for work that takes its time.
#ifndef EXAMPLES_PROGRESS_H
#define EXAMPLES_PROGRESS_H

#include <chrono>
#include <cstdint>
#include <string>

/// Shows how far a step has come as a bar and per cent, on standard error, when that is a terminal and the
/// step lasts longer than half a second; the line is wiped when the step ends. Otherwise nothing is written.
class Progress {
public:
    Progress(std::string step, std::int64_t total);
    ~Progress();
    Progress(const Progress&) = delete;
    Progress& operator=(const Progress&) = delete;

    /// done: 0 to the total given.
    void update(std::int64_t done);

private:
    using Clock = std::chrono::steady_clock;

    std::string m_step;
    std::int64_t m_total;
    bool m_on_terminal;
    bool m_shown = false;
    Clock::time_point m_next;
};

#endif
