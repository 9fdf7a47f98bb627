#include "basalt/platform/calendar.h"

#include <time.h>

#include <chrono>
#include <cstdint>

#include "src/platform/clock/date_fields.h"
#include "src/platform/system/failure.h"
#include "src/platform/ticks.h"

using namespace basalt::platform;
using std::chrono::sys_days;

namespace {

constexpr int FIRST_YEAR = 1601;
constexpr int LAST_YEAR = 30827;
constexpr sys_days FIRST_DAY = std::chrono::year(FIRST_YEAR) / std::chrono::January / 1;
constexpr std::int64_t TICKS_PER_DAY = 86'400 * TICKS_PER_SECOND;

}  // namespace

BOOL SystemTimeToFileTime(const SYSTEMTIME* time, FILETIME* ticks) {
    if (!is_valid(*time, FIRST_YEAR, LAST_YEAR) || time->wMilliseconds > 999) {
        return fail_with(ERROR_INVALID_PARAMETER, 0);
    }
    const std::int64_t day = (sys_days(date_of(*time)) - FIRST_DAY).count();
    *ticks = file_time(day * TICKS_PER_DAY + second_of_day(*time) * TICKS_PER_SECOND +
                       time->wMilliseconds * TICKS_PER_MILLISECOND);
    return 1;
}

BOOL FileTimeToSystemTime(const FILETIME* ticks, SYSTEMTIME* time) {
    const std::int64_t count = tick_count(*ticks);
    if (count < 0) {
        return fail_with(ERROR_INVALID_PARAMETER, 0);
    }
    const auto millisecond = static_cast<int>(count % TICKS_PER_DAY / TICKS_PER_MILLISECOND);
    *time = system_time(FIRST_DAY + std::chrono::days(count / TICKS_PER_DAY), millisecond / 1000,
                        millisecond % 1000);
    return 1;
}

void GetSystemTime(SYSTEMTIME* time) {
    timespec now{};
    clock_gettime(CLOCK_REALTIME, &now);
    const FILETIME ticks = file_time(ticks_of(now));
    FileTimeToSystemTime(&ticks, time);
}
