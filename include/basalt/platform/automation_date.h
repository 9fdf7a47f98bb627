/// @file
/// Automation dates: days since 30 December 1899 in a double, and COleDateTime, which adds a status.
///
/// The whole part counts days, also backwards; the fraction is the time of day, counted away from zero: -1.25
/// is 29 December 1899, 6:00. Dates run from 1 January 100 (-657434) to 31 December 9999 (2958465).
///
/// Threads: every function is reentrant.
#ifndef BASALT_PLATFORM_AUTOMATION_DATE_H
#define BASALT_PLATFORM_AUTOMATION_DATE_H

#include <ctime>
#include <cwchar>

#include "basalt/export.h"
#include "basalt/platform/calendar.h"
#include "basalt/platform/cstring.h"

/// Days since 30 December 1899, 0:00.
using DATE = double;

/// Converts calendar time to an automation date. Day of the week and milliseconds are ignored.
/// @return 1, or 0 with ERROR_INVALID_PARAMETER and `date` unchanged for an invalid date (31 April is not
/// rolled over), an invalid time of day and years outside 100 to 9999
///
/// Accuracy: within one unit in the last place, 2e-5 s or better.
BASALT_API int SystemTimeToVariantTime(SYSTEMTIME* time, DATE* date);

/// Converts an automation date to calendar time, to the nearest second; milliseconds are 0.
/// @return 1, or 0 with ERROR_INVALID_PARAMETER and `time` unchanged for NaN, a date before 1 January 100 and
/// one that rounds to a day after 31 December 9999
BASALT_API int VariantTimeToSystemTime(DATE date, SYSTEMTIME* time);

/// An automation date with its status.
///
/// Bad input: an invalid date makes the object invalid. Its parts are then -1, and it compares as neither
/// equal to, before nor after any date.
class BASALT_API COleDateTime {
public:
    /// Whether there is a date.
    enum DateTimeStatus {
        error = -1,   ///< result for a missing part
        valid = 0,    ///< a date
        invalid = 1,  ///< no date; the value is meaningless
        null = 2      ///< no date was set
    };

    /// 30 December 1899, 0:00, valid.
    COleDateTime() = default;
    /// The date given.
    COleDateTime(DATE date);
    /// The calendar time given.
    COleDateTime(const SYSTEMTIME& time);
    /// The calendar time given.
    COleDateTime(int year, int month, int day, int hour, int minute, int second);

    /// The time now in the local time zone.
    static COleDateTime GetCurrentTime() {
        const std::time_t now = std::time(nullptr);
        std::tm local{};
        localtime_r(&now, &local);
        return {local.tm_year + 1900, local.tm_mon + 1, local.tm_mday,
                local.tm_hour,        local.tm_min,     local.tm_sec};
    }

    /// The status.
    DateTimeStatus GetStatus() const { return m_status; }
    /// Sets the status and keeps the value.
    void SetStatus(DateTimeStatus status) { m_status = status; }
    /// Becomes the calendar time given.
    /// @return the new status: valid or invalid
    int SetDateTime(int year, int month, int day, int hour, int minute, int second);

    /// The value.
    operator DATE() const { return m_dt; }
    /// The calendar time.
    /// @return false, with the time unchanged, if the date is not valid
    bool GetAsSystemTime(SYSTEMTIME& time) const;

    /// The date as text, by a format of std::wcsftime and in the process's locale. Empty if the date is not
    /// valid, the format is null or the text is longer than a million characters.
    CString Format(const wchar_t* format) const {
        SYSTEMTIME time{};
        if (format == nullptr || !GetAsSystemTime(time)) {
            return {};
        }
        const double first_of_january = COleDateTime(time.wYear, 1, 1, 0, 0, 0);
        const double day = COleDateTime(time.wYear, time.wMonth, time.wDay, 0, 0, 0);
        std::tm fields{};
        fields.tm_year = time.wYear - 1900;
        fields.tm_mon = time.wMonth - 1;
        fields.tm_mday = time.wDay;
        fields.tm_hour = time.wHour;
        fields.tm_min = time.wMinute;
        fields.tm_sec = time.wSecond;
        fields.tm_wday = time.wDayOfWeek;
        fields.tm_yday = static_cast<int>(day - first_of_january);
        const CString marked = format + CString(L'.');  // no result is empty but one that does not fit
        CString text;
        for (int size = 256; size <= 1 << 20; size *= 8) {
            const auto length =
                std::wcsftime(text.GetBuffer(size), static_cast<std::size_t>(size), marked, &fields);
            text.ReleaseBuffer(length > 0 ? static_cast<int>(length) - 1 : 0);
            if (length > 0) {
                break;
            }
        }
        return text;
    }
    /// Year, 100 to 9999.
    int GetYear() const;
    /// Month, 1 to 12.
    int GetMonth() const;
    /// Day of the month, 1 to 31.
    int GetDay() const;
    /// Hour, 0 to 23.
    int GetHour() const;
    /// Minute, 0 to 59.
    int GetMinute() const;
    /// Second, 0 to 59.
    int GetSecond() const;
    /// Day of the week, 1 (Sunday) to 7.
    int GetDayOfWeek() const;

    /// Whether both are the same time, to the second.
    bool operator==(const COleDateTime& other) const;
    /// The opposite of ==.
    bool operator!=(const COleDateTime& other) const { return !(*this == other); }
    /// Whether this one is earlier.
    bool operator<(const COleDateTime& other) const;
    /// Whether this one is later.
    bool operator>(const COleDateTime& other) const { return other < *this; }
    /// Whether this one is not later.
    bool operator<=(const COleDateTime& other) const { return *this < other || *this == other; }
    /// Whether this one is not earlier.
    bool operator>=(const COleDateTime& other) const { return other <= *this; }

    DATE m_dt = 0.0;                  ///< the value
    DateTimeStatus m_status = valid;  ///< the status
};

#endif
