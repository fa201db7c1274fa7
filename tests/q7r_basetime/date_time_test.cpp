#include <cstdlib>
#include <ctime>
#include <thread>

#include "support/library.h"

#ifndef _WIN32
#include <sys/wait.h>
#include <unistd.h>
#endif

namespace
{

TEST(DateTime, ComparesByTheLargestUnitThatDiffers)
{
  const DateTime date{2000, 6, 15, 12, 30, 45};
  EXPECT_EQ(date.Compare(date), 0);
  EXPECT_EQ(date.Compare({1999, 12, 31, 23, 59, 59}), 1);
  EXPECT_EQ(date.Compare({2000, 6, 15, 20, 0, 0}), -8);
  EXPECT_EQ(date.Compare({2000, 6, 15, 12, 30, 5}), 40);
  EXPECT_EQ((DateTime{0x7FFFFFFF, 0, 0, 0, 0, 0}.Compare({-5, 0, 0, 0, 0, 0})), 0x7FFFFFFF);
}

TEST(DateTime, CountsJulianDays)
{
  const std::tuple<DateTime, Real> rows[] = {
      {{2000, 1, 1, 12, 0, 0}, 2451545.5},  {{1999, 12, 31, 0, 0, 0}, 2451544.0},
      {{2000, 3, 1, 0, 0, 0}, 2451605.0},   {{1970, 1, 1, 6, 0, 0}, 2440588.25},
      {{1582, 10, 15, 0, 0, 0}, 2299161.0}, // the day after the next row
      {{1582, 10, 4, 0, 0, 0}, 2299160.0},  {{1, 1, 1, 0, 0, 0}, 1721424.0},
      {{-1, 12, 31, 0, 0, 0}, 1721423.0}, // no year 0
      {{-4713, 1, 1, 0, 0, 0}, 0.0},
  };
  for (const auto& [date, day] : rows) {
    SCOPED_TRACE(day);
    EXPECT_EQ(GetJulianDay(date), day);
    EXPECT_EQ(FromJulianDay(day), date);
  }
}

TEST(DateTime, ComesBackFromItsJulianDayToTheSecond)
{
  std::mt19937 random(3);
  for (int i = 0; i < 20000; ++i) {
    DateTime date;
    date.year = static_cast<Long>(random() % 4000) + 1;
    date.month = static_cast<Long>(random() % 12) + 1;
    date.day = static_cast<Long>(random() % 28) + 1;
    date.hour = static_cast<Long>(random() % 24);
    date.minute = static_cast<Long>(random() % 60);
    date.second = static_cast<Long>(random() % 60);
    const bool skippedByTheReform = date.year == 1582 && date.month == 10 && date.day > 4 && date.day < 15;
    if (skippedByTheReform)
      continue;
    ASSERT_EQ(FromJulianDay(GetJulianDay(date)), date) << date.year << "-" << date.month << "-" << date.day;
  }
}

TEST(DateTime, RoundsTheLastSecondOfAMinuteUp)
{
  // 59.7 seconds round to 60: the count is raised a little, which carries over only close to the full minute.
  EXPECT_EQ(FromJulianDay(2451545.0 + 59.7 / 86400), (DateTime{2000, 1, 1, 0, 0, 59}));
  EXPECT_EQ(FromJulianDay(2451545.0 + 59.95 / 86400), (DateTime{2000, 1, 1, 0, 1, 0}));
  EXPECT_EQ(FromJulianDay(2451545.0 + 86399.95 / 86400), (DateTime{2000, 1, 2, 0, 0, 0}));
  for (Real value : {1e300, -1e300, std::nan(""), -0.25})
    EXPECT_LE(FromJulianDay(value).second, 59);
}

TEST(DateTime, KnowsLeapYears)
{
  for (Long year : {4, 1996, 2000, 2400})
    EXPECT_TRUE(IsLeapYear(year)) << year;
  for (Long year : {1, 1900, 1999, 2100})
    EXPECT_FALSE(IsLeapYear(year)) << year;
}

TEST(DateTime, GoesThroughTheCalendarOfTheMachine)
{
  const DateTime date{2021, 7, 4, 13, 14, 15};
  std::time_t seconds = 0;
  DateTime back;
  ASSERT_TRUE(DateTimeToTime(date, seconds));
  ASSERT_TRUE(DateTimeFromTime(seconds, back));
  EXPECT_EQ(back, date);
#ifndef _WIN32 // where the C library has no times before its epoch
  // The second before the epoch of the C library is a valid time, whatever the time zone.
  ASSERT_TRUE(DateTimeFromTime(-1, back));
  ASSERT_TRUE(DateTimeToTime(back, seconds));
  EXPECT_EQ(seconds, -1);
#endif

  DateTime now;
  GetDateTimeNow(now);
  ASSERT_TRUE(DateTimeToTime(now, seconds));
  EXPECT_LE(std::abs(std::difftime(std::time(nullptr), seconds)), 2.0);
  EXPECT_TRUE(TakeReports().empty());

  const DateTime kept = now;
  EXPECT_FALSE(DateTimeToTime({-0x7FFFFFFF, 1, 1, 0, 0, 0}, seconds));
  EXPECT_FALSE(DateTimeFromTime(std::numeric_limits<std::time_t>::max(), now));
  EXPECT_EQ(now, kept);
  EXPECT_EQ(TakeReports(), (Reports{"q7r_basetime:417", "q7r_basetime:484"}));
}

using Uuid = std::array<UChar, 16>;

Uuid NewUuid()
{
  Uuid uuid{};
  CreateUuid(uuid.data());
  return uuid;
}

TEST(Uuid, DiffersInEveryThread)
{
  constexpr int kThreads = 4;
  constexpr int kEach = 20000;
  std::vector<std::vector<Uuid>> made(kThreads);
  std::vector<std::thread> threads;
  for (auto& list : made)
    threads.emplace_back([&list] {
      for (int i = 0; i < kEach; ++i)
        list.push_back(NewUuid());
    });
  for (std::thread& thread : threads)
    thread.join();
  std::set<Uuid> all;
  for (const auto& list : made)
    all.insert(list.begin(), list.end());
  EXPECT_EQ(all.size(), static_cast<std::size_t>(kThreads * kEach));
}

#ifndef _WIN32
TEST(Uuid, DiffersInAChildProcess)
{
  NewUuid(); // there is a stock to inherit now
  int ends[2];
  ASSERT_EQ(pipe(ends), 0);
  const pid_t child = fork();
  if (child == 0) {
    const Uuid uuid = NewUuid();
    _exit(write(ends[1], uuid.data(), uuid.size()) == 16 ? 0 : 1);
  }
  Uuid theirs{};
  ASSERT_EQ(read(ends[0], theirs.data(), theirs.size()), 16);
  int status = -1;
  ASSERT_EQ(waitpid(child, &status, 0), child);
  close(ends[0]);
  close(ends[1]);
  EXPECT_NE(NewUuid(), theirs);
}
#endif

} // namespace
