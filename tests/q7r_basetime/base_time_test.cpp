#include "support/library.h"

namespace
{

constexpr Real kNan = std::numeric_limits<Real>::quiet_NaN();
constexpr Real kInfinity = std::numeric_limits<Real>::infinity();

void ExpectFields(const BaseTime& time, Real numerator, Real denominator)
{
  EXPECT_EQ(std::pair(time.GetNumerator(), time.GetDenominator()), std::pair(numerator, denominator));
}

TEST(BaseTime, RoundsSignsAndReducesFractions)
{
  const std::tuple<Real, Real, Real, Real> rows[] = {
      {0, 25, 0, 1},
      {30, 25, 6, 5},
      {5, -2, -5, 2},
      {-5, -2, 5, 2},
      {-30, 25, -6, 5},
      {2.5, 1.4, 3, 1},
      {0.4, 7, 0, 1},
      {-2.5, 1, -3, 1},
      {2147483519, 1, 2147483519, 1},
      {3000000000, 1, 3000000000, 1}, // beyond integers
      {3000000000, 2500000000, 6, 5},
      {3000000001, 3000000000, 3000000001, 3000000000},
      {6000000000, 4, 1500000000, 1},
      {1e19, 1, 1e18, 1},
      {-4e18, 2e18, -2, 1},
      {kNan, 1, 0, 1},
      {kInfinity, 1, 0, 1},
      {1, kInfinity, 0, 1},
  };
  for (const auto& [n, d, numerator, denominator] : rows) {
    SCOPED_TRACE(testing::Message() << n << " / " << d);
    ExpectFields(BaseTime(n, d), numerator, denominator);
  }
  EXPECT_TRUE(TakeReports().empty());
  ExpectFields(BaseTime(3, 0.4), 3, 1);
  ExpectFields(BaseTime(3, kNan), 3, 1);
  EXPECT_EQ(TakeReports(), (Reports{"q7r_basetime:95", "q7r_basetime:95"}));
}

TEST(BaseTime, TakesSecondsToTheThousandth)
{
  ExpectFields(BaseTime(0.04), 1, 25);
  ExpectFields(BaseTime(1.2344), 617, 500);
  ExpectFields(BaseTime(-0.5), -1, 2);
  ExpectFields(BaseTime(-0.0005), 0, 1); // halves go up
  ExpectFields(BaseTime(3e15), 1e15, 1);
  ExpectFields(BaseTime(-kInfinity), -1e15, 1);
  ExpectFields(BaseTime(kNan), 0, 1);
}

TEST(BaseTime, CountsFrames)
{
  EXPECT_EQ(BaseTime(30, 25).GetFrame(25), 30);
  EXPECT_EQ(BaseTime(1, 2).GetFrame(25), 12);
  EXPECT_EQ(BaseTime(-1, 2).GetFrame(25), -12); // towards zero
  EXPECT_EQ(BaseTime(1, 1).GetFrame(29.97), 29);
  EXPECT_EQ(BaseTime(1e15).GetFrame(1000), 2147483647);
  EXPECT_EQ(BaseTime::Raw(0, 0).GetFrame(25), 0);
  EXPECT_EQ(BaseTime::Raw(5, 0).Get(), 0.0);
  EXPECT_EQ(BaseTime(5, 4).Get(), 1.25);

  BaseTime time(1, 2);
  time.Quantize(25);
  ExpectFields(time, 12, 25);
  time = BaseTime(-1, 2);
  time.Quantize(25);
  ExpectFields(time, -13, 25);
  time = BaseTime(7, 4);
  time.Quantize(2.9); // floor(7 * 2.9) / 4 at whole 2
  ExpectFields(time, 5, 2);
  EXPECT_TRUE(TakeReports().empty());
  time = BaseTime(7, 4);
  time.Quantize(0.5);
  ExpectFields(time, 1, 1);
  time.SetDenominator(0.5);
  ExpectFields(time, 1, 1);
  EXPECT_EQ(TakeReports().size(), 2u);
  time = BaseTime::Raw(7, 0);
  time.Quantize(25);
  ExpectFields(time, 0, 1);
}

TEST(BaseTime, ComparesAndAddsByValue)
{
  EXPECT_EQ(BaseTime::Raw(30, 25).Compare(BaseTime(6, 5)), 0);
  EXPECT_EQ(BaseTime(1, 3).Compare(BaseTime(1, 2)), -1);
  EXPECT_EQ(BaseTime(-1, 3).Compare(BaseTime(-1, 2)), 1);
  EXPECT_TRUE(BaseTime(1, 3) < BaseTime(1, 2) && BaseTime(1, 2) >= BaseTime::Raw(2, 4));
  // Only the whole parts of the products count.
  EXPECT_EQ(BaseTime::Raw(0.5, 1).Compare(BaseTime::Raw(0.9, 1)), 0);
  EXPECT_EQ(BaseTime::Raw(0.9, 1).Compare(BaseTime::Raw(1.1, 1)), -1);
  EXPECT_EQ(BaseTime::Raw(kNan, 1).Compare(BaseTime(1, 1)), 0);
  ExpectFields(BaseTime(1, 2) + BaseTime(1, 3), 5, 6);
  ExpectFields(BaseTime(1, 25) - BaseTime(2, 25), -1, 25);
  ExpectFields(BaseTime(1, 25) - BaseTime(1, 25), 0, 1);
}

} // namespace
