/// @file
/// Automation dates: days since 30 December 1899 in a double, and COleDateTime, which adds a status.
///
/// The whole part counts days, also backwards; the fraction is the time of day, counted away from zero: -1.25
/// is 29 December 1899, 6:00. Dates run from 1 January 100 (-657434) to 31 December 9999 (2958465).
///
/// Threads: every function is reentrant.
#ifndef BASALT_PLATFORM_AUTOMATION_DATE_H
#define BASALT_PLATFORM_AUTOMATION_DATE_H

#include "basalt/export.h"
#include "basalt/platform/calendar.h"

/// Days since 30 December 1899, 0:00.
using DATE = double;

/// Converts calendar time to an automation date. Weekday and milliseconds are not looked at.
/// @return 1, or 0 with ERROR_INVALID_PARAMETER and `date` as it was for what is no date (nothing is rolled
/// over: 31 April is none), no time of day, or a year before 100
///
/// Accuracy: the nearest double, give or take one: 2e-5 s and better.
BASALT_API int SystemTimeToVariantTime(SYSTEMTIME* time, DATE* date);

/// Converts an automation date to calendar time, to the nearest second; milliseconds are 0.
/// @return 1, or 0 with ERROR_INVALID_PARAMETER and `time` as it was for a date that rounds to none of the
/// years 100 to 9999 or that lies before 1 January 100, and NaN
BASALT_API int VariantTimeToSystemTime(DATE date, SYSTEMTIME* time);

/// An automation date with its status.
///
/// Bad input: what is no date leaves the object invalid. The parts of a date that is not valid are -1, and it
/// equals none and is neither before nor after any.
class BASALT_API COleDateTime {
public:
    /// What the value is worth.
    enum DateTimeStatus {
        error = -1,   ///< no answer
        valid = 0,    ///< a date
        invalid = 1,  ///< no date; the value has no meaning
        null = 2      ///< deliberately none
    };

    /// 30 December 1899, 0:00, valid.
    COleDateTime() = default;
    /// The date given.
    COleDateTime(DATE date);
    /// The calendar time given.
    COleDateTime(const SYSTEMTIME& time);
    /// The calendar time given.
    COleDateTime(int year, int month, int day, int hour, int minute, int second);

    /// The status.
    DateTimeStatus GetStatus() const { return m_status; }
    /// Sets the status; the value stays.
    void SetStatus(DateTimeStatus status) { m_status = status; }
    /// Becomes the calendar time given.
    /// @return the new status: valid or invalid
    int SetDateTime(int year, int month, int day, int hour, int minute, int second);

    /// The value.
    operator DATE() const { return m_dt; }
    /// The calendar time.
    /// @return false, and the time as it was, when the date is not valid
    bool GetAsSystemTime(SYSTEMTIME& time) const;

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
    /// Whether they are not.
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
