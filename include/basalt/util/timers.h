/// @file
/// Stopwatch and period timer on the machine's monotonic clock.
#ifndef BASALT_UTIL_TIMERS_H
#define BASALT_UTIL_TIMERS_H

#include <cstdint>

#include "basalt/export.h"
#include "basalt/platform/cstring.h"

namespace vex_util {

/// Stopwatch on the performance counter. It starts at construction, queries do not stop it, and a copy keeps
/// the same start.
/// Threads: one timer is used by one thread at a time; different timers are independent.
class BASALT_API HiResTimer {
public:
    /// An unnamed timer, started now.
    HiResTimer();
    /// A timer started now. Name and flag are stored for the host and not used.
    HiResTimer(const CString& name, bool flag);

    /// Starts again from 0.
    void Reset();
    /// Time since the last start (seconds), to the nearest float: within 6e-8 of itself.
    float GetElapsedS();
    /// The same as GetElapsedS().
    float GetElapsed();
    /// Whole milliseconds since the last start, truncated to 32 bits: wraps around every 49.7 days.
    unsigned long GetElapsedMs();

    /// Length of one counter tick (seconds), one for the process; 0.0 until the first timer is constructed.
    static double s_llFrequency;

private:
    CString m_name;
    std::int64_t m_start = 0;
    std::int64_t m_last_reading = 0;
    [[maybe_unused]] bool m_flag;
};

/// Reports to a polling loop when a period has passed. The time by which a poll is late counts towards the
/// next period, so the phase holds.
///
/// Accuracy: carry and elapsed time are floats, so each completed period shifts the phase by at most 6e-8 of
/// the elapsed time plus 6e-8 of the sum with the carry (1.2e-7 s for periods of a second polled often, in
/// either direction), and by the time between the two counter readings of one Update() call.
/// Threads: one timer is used by one thread at a time.
class BASALT_API PeriodicTimer {
public:
    /// Periods of one second, the first complete a second from now.
    PeriodicTimer();
    /// @param period length of a period (seconds); 0 or less is complete at every Update(), NaN at none
    /// @param startDue true: the first Update() already reports a period
    PeriodicTimer(float period, bool startDue);

    /// Restarts the current period and keeps the time carried into it.
    void Reset();
    /// Starts with a new period (seconds). With `startDue` the next Update() reports one; without, the time
    /// carried into the current period is kept.
    void Reset(float period, bool startDue);
    /// Whether a period has passed since the last start; if so the next one starts.
    /// @param dropRemainder true: the next period starts now; false: it started when the last one ended
    /// @return true for one or more completed periods: those beyond the first are dropped, the phase holds.
    /// Bad input: after a period of 0 without `dropRemainder` nothing is reported until a Reset() with
    /// `startDue`.
    bool Update(bool dropRemainder);

private:
    HiResTimer m_stopwatch;
    float m_carry = 0.0F;
    float m_period;
};

}  // namespace vex_util

#endif
