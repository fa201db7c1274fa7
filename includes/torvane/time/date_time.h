// Calendar dates of the proleptic mix that scene files use: Julian before 15 October 1582, Gregorian from then on.
#pragma once

#include <ctime>

#include "torvane/types.h"

namespace _torvane_
{

struct DateTime
{
  Long year = 0; // the year before 1 is -1
  Long month = 0;
  Long day = 0;
  Long hour = 0;
  Long minute = 0;
  Long second = 0;

  // The difference of the first unequal field, largest unit first; 0 for equal dates. Kept within 32 bits.
  Long Compare(const DateTime& other) const noexcept;
  friend constexpr Bool operator==(const DateTime& a, const DateTime& b) = default;
};

// The machine's local time, or the date of a ReproducibleRun. A failure is reported and leaves `date` as it is.
void GetDateTimeNow(DateTime& date) noexcept;

// Local time to and from the C library's count of seconds. False, and a report, when it has no such date.
Bool DateTimeToTime(const DateTime& date, std::time_t& seconds) noexcept;
Bool DateTimeFromTime(std::time_t seconds, DateTime& date) noexcept;

// Days in the count where 1 January 2000, 12:00 is 2451545.5: a day begins at midnight.
Real GetJulianDay(const DateTime& date) noexcept;
// The date of such a count, to the second. Counts beyond the range of the fields give the nearest that they hold.
DateTime FromJulianDay(Real value) noexcept;

// By the Gregorian rule.
constexpr Bool IsLeapYear(Long year) noexcept { return (year % 4 == 0 && year % 100 != 0) || year % 400 == 0; }

} // namespace _torvane_
