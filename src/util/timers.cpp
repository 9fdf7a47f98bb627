#include "basalt/util/timers.h"

#include <atomic>
#include <cmath>
#include <mutex>

#include "src/platform/clock.h"

namespace vex_util {

namespace {

std::int64_t read_counter() {
    LARGE_INTEGER count{};
    QueryPerformanceCounter(&count);
    return count.QuadPart;
}

double seconds(std::int64_t ticks) {
    return static_cast<double>(ticks) * HiResTimer::s_llFrequency;
}

// Atomic because other threads' timers read the shared value; locked so that it is queried once.
void determine_tick_length() {
    static constinit std::mutex lock;
    const std::atomic_ref<double> tick_length(HiResTimer::s_llFrequency);
    if (tick_length.load(std::memory_order_acquire) != 0.0) {
        return;
    }
    const std::lock_guard guard(lock);
    if (tick_length.load(std::memory_order_relaxed) == 0.0) {
        LARGE_INTEGER frequency{};
        QueryPerformanceFrequency(&frequency);
        tick_length.store(1.0 / static_cast<double>(frequency.QuadPart), std::memory_order_release);
    }
}

}  // namespace

constinit double HiResTimer::s_llFrequency = 0.0;

HiResTimer::HiResTimer() : HiResTimer(CString(), false) {}

// NOLINTNEXTLINE(modernize-pass-by-value): the declared signature
HiResTimer::HiResTimer(const CString& name, bool flag) : m_name(name), m_flag(flag) {
    determine_tick_length();
    Reset();
}

void HiResTimer::Reset() {
    m_start = read_counter();
}

float HiResTimer::GetElapsedS() {
    m_last_reading = read_counter();
    return static_cast<float>(seconds(m_last_reading - m_start));
}

float HiResTimer::GetElapsed() {
    return GetElapsedS();
}

unsigned long HiResTimer::GetElapsedMs() {
    m_last_reading = read_counter();
    const auto milliseconds = static_cast<std::int64_t>(seconds(m_last_reading - m_start) * 1000.0);
    return static_cast<std::uint32_t>(milliseconds);
}

PeriodicTimer::PeriodicTimer() : PeriodicTimer(1.0F, false) {}

PeriodicTimer::PeriodicTimer(float period, bool startDue)
    : m_stopwatch(CString(L"PeriodicTimer"), false), m_carry(startDue ? period : 0.0F), m_period(period) {}

void PeriodicTimer::Reset() {
    m_stopwatch.Reset();
}

void PeriodicTimer::Reset(float period, bool startDue) {
    m_period = period;
    m_stopwatch.Reset();
    if (startDue) {
        m_carry = period;
    }
}

bool PeriodicTimer::Update(bool dropRemainder) {
    const float passed = m_stopwatch.GetElapsedS() + m_carry;
    // False for NaN, which reports nothing.
    if (!(passed >= m_period)) {
        return false;
    }
    m_stopwatch.Reset();
    m_carry = dropRemainder ? 0.0F : std::fmod(passed, m_period);
    return true;
}

}  // namespace vex_util
