// SPDX-License-Identifier: MIT
#pragma once

#include <Pegasus/Common/Config.h>

namespace Pegasus {

constexpr Uint64 kMicrosPerSecond = 1000000;
constexpr Uint64 kMicrosPerMinute = 60 * kMicrosPerSecond;
constexpr Uint64 kMicrosPerHour = 60 * kMicrosPerMinute;
constexpr Uint64 kMicrosPerDay = 24 * kMicrosPerHour;
constexpr Uint32 kMaxYear = 9999;

// A day of the proleptic Gregorian calendar, whose year 0 is a leap year.
struct CivilDay
{
    Uint32 year;
    Uint32 month;
    Uint32 day;
};

constexpr bool isLeapYear(Uint32 year)
{
    return year % 4 == 0 && (year % 100 != 0 || year % 400 == 0);
}

constexpr Uint32 daysInMonth(Uint32 year, Uint32 month)
{
    return month == 2 ? (isLeapYear(year) ? 29 : 28)
                      : (month == 4 || month == 6 || month == 9 || month == 11 ? 30 : 31);
}

// Days before January 1st of a year, counted from the beginning of year 0.
constexpr Uint32 daysBeforeYear(Uint32 year)
{
    return year == 0 ? 0 : 365 * year + (year - 1) / 4 - (year - 1) / 100 + (year - 1) / 400 + 1;
}

constexpr Uint32 dayNumber(const CivilDay& civil)
{
    Uint32 days = daysBeforeYear(civil.year) + civil.day - 1;
    for (Uint32 month = 1; month < civil.month; ++month) {
        days += daysInMonth(civil.year, month);
    }
    return days;
}

constexpr CivilDay civilDay(Uint32 number)
{
    CivilDay civil{number / 366, 1, 1};
    while (daysBeforeYear(civil.year + 1) <= number) {
        ++civil.year;
    }
    number -= daysBeforeYear(civil.year);
    for (; number >= daysInMonth(civil.year, civil.month); ++civil.month) {
        number -= daysInMonth(civil.year, civil.month);
    }
    civil.day = number + 1;
    return civil;
}

// Microseconds from the beginning of year 0 to 1970, and to the end of year 9999.
constexpr Uint64 kUnixEpochMicros = Uint64(daysBeforeYear(1970)) * kMicrosPerDay;
constexpr Uint64 kTimeStampEnd = Uint64(daysBeforeYear(kMaxYear + 1)) * kMicrosPerDay;
// 100 million days.
constexpr Uint64 kIntervalEnd = 100000000 * kMicrosPerDay;

} // namespace Pegasus
