#include "basalt/platform/calendar.h"

#include <time.h>

#include <chrono>
#include <cstdint>

#include "basalt/platform/error.h"
#include "src/platform/ticks.h"

using namespace basalt::platform;
using std::chrono::days;
using std::chrono::sys_days;

namespace {

constexpr WORD FIRST_YEAR = 1601;
constexpr WORD LAST_YEAR = 30827;
constexpr sys_days FIRST_DAY = std::chrono::year(FIRST_YEAR) / std::chrono::January / 1;
constexpr std::int64_t TICKS_PER_DAY = 86'400 * TICKS_PER_SECOND;

std::chrono::year_month_day date_of(const SYSTEMTIME& time) {
    return std::chrono::year(time.wYear) / time.wMonth / time.wDay;
}

bool is_valid(const SYSTEMTIME& time) {
    // The calendar's own types keep months and days in a byte, so larger ones are refused before.
    return time.wYear >= FIRST_YEAR && time.wYear <= LAST_YEAR && time.wMonth <= 12 && time.wDay <= 31 &&
           date_of(time).ok() && time.wHour <= 23 && time.wMinute <= 59 && time.wSecond <= 59 &&
           time.wMilliseconds <= 999;
}

}  // namespace

BOOL SystemTimeToFileTime(const SYSTEMTIME* time, FILETIME* ticks) {
    if (!is_valid(*time)) {
        SetLastError(ERROR_INVALID_PARAMETER);
        return 0;
    }
    const std::int64_t day = (sys_days(date_of(*time)) - FIRST_DAY).count();
    const std::int64_t seconds = (time->wHour * 60 + time->wMinute) * 60 + time->wSecond;
    *ticks = file_time(day * TICKS_PER_DAY + seconds * TICKS_PER_SECOND +
                       time->wMilliseconds * TICKS_PER_MILLISECOND);
    return 1;
}

BOOL FileTimeToSystemTime(const FILETIME* ticks, SYSTEMTIME* time) {
    const std::int64_t count = tick_count(*ticks);
    if (count < 0) {
        SetLastError(ERROR_INVALID_PARAMETER);
        return 0;
    }
    const sys_days day = FIRST_DAY + days(count / TICKS_PER_DAY);
    const std::chrono::year_month_day date = day;
    const auto millisecond = static_cast<int>(count % TICKS_PER_DAY / TICKS_PER_MILLISECOND);
    const int second = millisecond / 1000;
    time->wYear = static_cast<WORD>(static_cast<int>(date.year()));
    time->wMonth = static_cast<WORD>(static_cast<unsigned>(date.month()));
    time->wDayOfWeek = static_cast<WORD>(std::chrono::weekday(day).c_encoding());
    time->wDay = static_cast<WORD>(static_cast<unsigned>(date.day()));
    time->wHour = static_cast<WORD>(second / 3600);
    time->wMinute = static_cast<WORD>(second / 60 % 60);
    time->wSecond = static_cast<WORD>(second % 60);
    time->wMilliseconds = static_cast<WORD>(millisecond % 1000);
    return 1;
}

void GetSystemTime(SYSTEMTIME* time) {
    timespec now{};
    clock_gettime(CLOCK_REALTIME, &now);
    const FILETIME ticks = file_time(ticks_of(now));
    FileTimeToSystemTime(&ticks, time);
}
