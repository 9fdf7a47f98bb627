#include "basalt/platform/automation_date.h"

#include <chrono>
#include <cmath>
#include <limits>
#include <optional>

#include "src/platform/clock/date_fields.h"
#include "src/platform/system/failure.h"

namespace {

using namespace basalt::platform;
using std::chrono::sys_days;

constexpr sys_days ZERO = std::chrono::year{1899} / 12 / 30;
constexpr int FIRST_YEAR = 100;
constexpr int LAST_YEAR = 9999;
constexpr sys_days FIRST = std::chrono::year{FIRST_YEAR} / 1 / 1;
constexpr sys_days LAST = std::chrono::year{LAST_YEAR} / 12 / 31;
constexpr std::int64_t SECONDS_PER_DAY = 86'400;

// Dates in chronological order are in the order of their seconds.
std::optional<std::int64_t> seconds_of(const COleDateTime& date) {
    SYSTEMTIME time{};
    if (!date.GetAsSystemTime(time)) {
        return std::nullopt;
    }
    return (sys_days(date_of(time)) - ZERO).count() * SECONDS_PER_DAY + second_of_day(time);
}

int part_of(const COleDateTime& date, WORD SYSTEMTIME::*part) {
    SYSTEMTIME time{};
    return date.GetAsSystemTime(time) ? time.*part : static_cast<int>(COleDateTime::error);
}

}  // namespace

int SystemTimeToVariantTime(SYSTEMTIME* time, DATE* date) {
    if (!is_valid(*time, FIRST_YEAR, LAST_YEAR)) {
        return fail_with(ERROR_INVALID_PARAMETER, 0);
    }
    const auto days = static_cast<double>((sys_days(date_of(*time)) - ZERO).count());
    const double time_of_day = second_of_day(*time) / static_cast<double>(SECONDS_PER_DAY);
    *date = days < 0.0 ? days - time_of_day : days + time_of_day;
    return 1;
}

int VariantTimeToSystemTime(DATE date, SYSTEMTIME* time) {
    const double first = static_cast<double>((FIRST - ZERO).count());
    const double last = static_cast<double>((LAST - ZERO).count());
    const double whole = std::trunc(date);
    // False for NaN.
    const bool is_date = whole >= first && whole <= last;
    sys_days day = is_date ? ZERO + std::chrono::days(static_cast<int>(whole)) : ZERO;
    auto second = is_date ? std::llround(std::abs(date - whole) * SECONDS_PER_DAY) : 0;
    if (second == SECONDS_PER_DAY) {
        day += std::chrono::days(1);
        second = 0;
    }
    if (!is_date || day > LAST) {
        return fail_with(ERROR_INVALID_PARAMETER, 0);
    }
    *time = system_time(day, static_cast<int>(second), 0);
    return 1;
}

COleDateTime::COleDateTime(DATE date) : m_dt(date) {
    SYSTEMTIME time{};
    m_status = VariantTimeToSystemTime(date, &time) != 0 ? valid : invalid;
}

COleDateTime::COleDateTime(const SYSTEMTIME& time) {
    SYSTEMTIME copy = time;
    m_status = SystemTimeToVariantTime(&copy, &m_dt) != 0 ? valid : invalid;
}

COleDateTime::COleDateTime(int year, int month, int day, int hour, int minute, int second) {
    SetDateTime(year, month, day, hour, minute, second);
}

int COleDateTime::SetDateTime(int year, int month, int day, int hour, int minute, int second) {
    // A value that does not fit its field becomes 65535, which is invalid in all of them.
    const auto field = [](int value) {
        constexpr int LARGEST = std::numeric_limits<WORD>::max();
        return static_cast<WORD>(value >= 0 && value < LARGEST ? value : LARGEST);
    };
    SYSTEMTIME time{};
    time.wYear = field(year);
    time.wMonth = field(month);
    time.wDay = field(day);
    time.wHour = field(hour);
    time.wMinute = field(minute);
    time.wSecond = field(second);
    m_status = SystemTimeToVariantTime(&time, &m_dt) != 0 ? valid : invalid;
    return m_status;
}

bool COleDateTime::GetAsSystemTime(SYSTEMTIME& time) const {
    return m_status == valid && VariantTimeToSystemTime(m_dt, &time) != 0;
}

int COleDateTime::GetYear() const {
    return part_of(*this, &SYSTEMTIME::wYear);
}

int COleDateTime::GetMonth() const {
    return part_of(*this, &SYSTEMTIME::wMonth);
}

int COleDateTime::GetDay() const {
    return part_of(*this, &SYSTEMTIME::wDay);
}

int COleDateTime::GetHour() const {
    return part_of(*this, &SYSTEMTIME::wHour);
}

int COleDateTime::GetMinute() const {
    return part_of(*this, &SYSTEMTIME::wMinute);
}

int COleDateTime::GetSecond() const {
    return part_of(*this, &SYSTEMTIME::wSecond);
}

int COleDateTime::GetDayOfWeek() const {
    const int sunday_0 = part_of(*this, &SYSTEMTIME::wDayOfWeek);
    return sunday_0 == error ? error : sunday_0 + 1;
}

bool COleDateTime::operator==(const COleDateTime& other) const {
    const std::optional<std::int64_t> a = seconds_of(*this);
    return a && a == seconds_of(other);
}

bool COleDateTime::operator<(const COleDateTime& other) const {
    const std::optional<std::int64_t> a = seconds_of(*this);
    const std::optional<std::int64_t> b = seconds_of(other);
    return a && b && *a < *b;
}
