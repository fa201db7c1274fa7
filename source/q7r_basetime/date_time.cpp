#include "torvane/time/date_time.h"

#include <cmath>

#include "q7r_basetime/basetime_log.h"
#include "torvane/time/reproducible_run.h"

namespace _torvane_
{

namespace
{

constexpr Real kReformDay = 2299161.0;             // 15 October 1582
constexpr LLong kReformDate = 588829;              // the same as (month + 12 year) 31 + day
constexpr Real kSmallStep = 1.1574074074074074e-6; // a tenth of a second in days
constexpr Long kEpochOfTm = 1900;

Long ToLong(Real value)
{
  constexpr Real kMost = 2147483647.0;
  return std::isnan(value) ? 0 : value < -kMost ? -0x7FFFFFFF : value > kMost ? 0x7FFFFFFF : static_cast<Long>(value);
}

Long ToLong(LLong value)
{
  constexpr LLong kMost = 0x7FFFFFFF;
  return static_cast<Long>(value < -kMost ? -kMost : value > kMost ? kMost : value);
}

// Breaks the fraction of a day down; the second may come out as 60.
void SetTimeOfDay(DateTime& date, Real fraction)
{
  Real hours = fraction * 24.0;
  date.hour = ToLong(hours);
  Real minutes = (hours - std::trunc(hours)) * 60.0;
  date.minute = ToLong(minutes);
  date.second = ToLong((minutes - std::trunc(minutes)) * 60.0 + 0.5);
}

DateTime DateOfDay(Real value)
{
  Real day = std::trunc(value);
  Real fraction = value - day;
  if (value >= kReformDay) {
    Real centuries = std::trunc((value - 1867216.0 - 0.25) / 36524.25);
    day += centuries + 1.0 - std::trunc(0.25 * centuries);
  }
  Real b = day + 1524.0;
  Real c = std::trunc(6680.0 + (b - 2439870.0 - 122.1) / 365.25);
  Real d = std::trunc(365.0 * c + 0.25 * c);
  Real e = std::trunc((b - d) / 30.6001);

  DateTime date;
  date.day = ToLong(b - d - std::trunc(30.6001 * e));
  Real month = e - 1.0 > 12.0 ? e - 13.0 : e - 1.0;
  Real year = c - 4715.0 - (month > 2.0 ? 1.0 : 0.0);
  date.month = ToLong(month);
  date.year = ToLong(year < 1.0 ? year - 1.0 : year);
  SetTimeOfDay(date, fraction);
  return date;
}

} // namespace

Long DateTime::Compare(const DateTime& other) const noexcept
{
  constexpr Long DateTime::*kFields[] = {&DateTime::year, &DateTime::month,  &DateTime::day,
                                         &DateTime::hour, &DateTime::minute, &DateTime::second};
  for (auto field : kFields) {
    if (this->*field != other.*field)
      return ToLong(LLong{this->*field} - other.*field);
  }
  return 0;
}

Real GetJulianDay(const DateTime& date) noexcept
{
  Real y = date.year < 0 ? date.year + 1.0 : date.year;
  Real m = date.month;
  if (date.month < 3) {
    y -= 1.0;
    m += 13.0;
  } else {
    m += 1.0;
  }
  Real day = std::floor(365.25 * y) + std::floor(30.6001 * m) + date.day + 1720995.0;
  if ((date.month + LLong{12} * date.year) * 31 + date.day >= kReformDate) {
    Real centuries = std::trunc(0.01 * y);
    day += 2.0 - centuries + std::trunc(0.25 * centuries);
  }
  return day + (date.hour + (date.minute + date.second / 60.0) / 60.0) / 24.0;
}

DateTime FromJulianDay(Real value) noexcept
{
  DateTime date = DateOfDay(value);
  if (date.second >= 60) {
    date = DateOfDay(value + kSmallStep);
    date.second = date.second > 59 ? 59 : date.second;
  }
  return date;
}

Bool DateTimeToTime(const DateTime& date, std::time_t& seconds) noexcept
{
  constexpr Long kFirstYear = kEpochOfTm - 0x7FFFFFFF; // earlier ones don't fit the broken-down time
  std::tm broken{};
  broken.tm_wday = -1; // is filled in when the C library has such a date; -1 second is a valid result
  if (date.year >= kFirstYear && date.month > -0x7FFFFFFF) {
    broken.tm_year = date.year - kEpochOfTm;
    broken.tm_mon = date.month - 1;
    broken.tm_mday = date.day;
    broken.tm_hour = date.hour;
    broken.tm_min = date.minute;
    broken.tm_sec = date.second;
    broken.tm_isdst = -1;
    std::time_t result = std::mktime(&broken);
    if (broken.tm_wday >= 0) {
      seconds = result;
      return true;
    }
  }
  ReportBaseTime(kLineOfDateToTime, "a date has no time in the C library");
  return false;
}

Bool DateTimeFromTime(std::time_t seconds, DateTime& date) noexcept
{
  std::tm broken{};
#ifdef _WIN32
  Bool done = localtime_s(&broken, &seconds) == 0;
#else
  Bool done = localtime_r(&seconds, &broken) != nullptr;
#endif
  if (!done) {
    ReportBaseTime(kLineOfTimeToDate, "a time has no date in the C library");
    return false;
  }
  date = {ToLong(LLong{broken.tm_year} + kEpochOfTm),
          broken.tm_mon + 1,
          broken.tm_mday,
          broken.tm_hour,
          broken.tm_min,
          broken.tm_sec};
  return true;
}

void GetDateTimeNow(DateTime& date) noexcept
{
  if (const ReproducibleRun* run = ReproducibleRun::GetCurrent())
    date = run->GetNow();
  else
    DateTimeFromTime(std::time(nullptr), date);
}

} // namespace _torvane_
