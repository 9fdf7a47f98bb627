#include <cstdio>

#include "basalt/util/hex.h"

namespace basalt {

namespace {

bool is_same_time(const SYSTEMTIME& a, const SYSTEMTIME& b) {
    return a.wYear == b.wYear && a.wMonth == b.wMonth && a.wDay == b.wDay && a.wHour == b.wHour &&
           a.wMinute == b.wMinute && a.wSecond == b.wSecond;
}

}  // namespace

bool ParseDateFromHexString(const std::string& hex, COleDateTime& date) {
    const std::string text = HexStringToString(hex);
    int day = 0;
    int month = 0;
    int year = 0;
    // Fields that cannot be read stay 0, which is invalid.
    static_cast<void>(std::sscanf(text.c_str(), "%2d%2d%4d", &day, &month, &year));
    SYSTEMTIME time{};
    time.wYear = static_cast<WORD>(year);
    time.wMonth = static_cast<WORD>(month);
    time.wDay = static_cast<WORD>(day);
    SYSTEMTIME back{};
    const bool is_valid = SystemTimeToVariantTime(&time, &date.m_dt) != 0 &&
                          VariantTimeToSystemTime(date.m_dt, &back) != 0 && is_same_time(time, back);
    date.SetStatus(is_valid ? COleDateTime::valid : COleDateTime::invalid);
    return true;
}

}  // namespace basalt
