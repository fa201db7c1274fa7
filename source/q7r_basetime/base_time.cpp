#include "torvane/time/base_time.h"

#include <utility>

#include "q7r_basetime/basetime_log.h"
#include "torvane/memory/assertion.h"

namespace _torvane_
{

namespace
{

constexpr Real kMaxSeconds = 1e15;
constexpr Real kTicksPerSecond = 1000.0;
constexpr Real kTiny = 0.001;                // a number below this counts as 0
constexpr Real kIntegerLimit = 2147483520.0; // below this the division runs in integers
constexpr Real kLargeLimit = 1e18;

ULong GreatestDivisor(ULong a, ULong b)
{
  while (b != 0)
    a = std::exchange(b, a % b);
  return a;
}

Real Rounded(Real value) { return std::floor(std::fabs(value) + 0.5); }

// The value if it is at least 1; otherwise a report and 1. Not a number counts as below 1.
Real AtLeastOne(Real value, Long line, const char* message)
{
  if (value >= 1.0)
    return value;
  ReportBaseTime(line, message);
  return 1.0;
}

Real Clamped(Real value, Real low, Real high) { return value < low ? low : value > high ? high : value; }

} // namespace

BaseTime::BaseTime(Real seconds) noexcept
    : numerator_(std::floor(Clamped(seconds, -kMaxSeconds, kMaxSeconds) * kTicksPerSecond + 0.5)),
      denominator_(kTicksPerSecond)
{
  Reduce();
}

BaseTime::BaseTime(Real numerator, Real denominator) noexcept
    : numerator_(Rounded(numerator)),
      denominator_(AtLeastOne(Rounded(denominator), kLineOfFraction, "a time has a denominator below 1"))
{
  if ((numerator < 0.0) != (denominator < 0.0))
    numerator_ = -numerator_;
  Reduce();
}

void BaseTime::Reduce() noexcept
{
  Real x = std::fabs(numerator_);
  Real y = std::fabs(denominator_);
  // A value that is not finite has no fraction.
  if (!(x >= kTiny && y >= kTiny && std::isfinite(x) && std::isfinite(y))) {
    *this = BaseTime();
    return;
  }
  if (!(x < kIntegerLimit && y < kIntegerLimit)) {
    ReduceLarge();
    return;
  }
  ULong divisor = GreatestDivisor(static_cast<ULong>(x), static_cast<ULong>(y));
  if (static_cast<ULong>(y) == 0) {
    *this = BaseTime();
  } else if (divisor > 1) {
    numerator_ /= divisor;
    denominator_ /= divisor;
  }
}

// Euclid's rule in floats, for numbers that integers don't hold.
void BaseTime::ReduceLarge() noexcept
{
  Real x = std::fabs(numerator_);
  Real y = std::fabs(denominator_);
  Real scale = kLargeLimit / std::fmax(x, y);
  if (scale < 1.0) {
    x *= scale;
    y *= scale;
    numerator_ *= scale;
    denominator_ *= scale;
  }
  if (y < 1.0)
    y = denominator_ = 1.0;
  Real rest = std::fmod(x, y);
  while (rest >= 0.5) {
    x = std::exchange(y, rest);
    rest = std::fmod(x, y);
  }
  numerator_ /= y;
  denominator_ /= y;
}

void BaseTime::SetDenominator(Real denominator) noexcept
{
  denominator_ = AtLeastOne(denominator, __LINE__, "a time gets a denominator below 1");
}

Long BaseTime::GetFrame(Real fps) const noexcept
{
  constexpr Real kMost = 2147483647.0;
  Real frame = std::floor(numerator_ * fps) / std::floor(denominator_);
  return std::isnan(frame) ? 0 : static_cast<Long>(Clamped(frame, -kMost - 1.0, kMost));
}

void BaseTime::Quantize(Real fps) noexcept
{
  Real rate = AtLeastOne(fps, __LINE__, "a time is quantized to a rate below 1");
  numerator_ = std::floor(std::floor(numerator_ * rate) / std::floor(denominator_));
  denominator_ = std::floor(rate);
  Reduce();
}

BaseTime BaseTime::Add(const BaseTime& other) const noexcept
{
  return {numerator_ * other.denominator_ + other.numerator_ * denominator_, denominator_ * other.denominator_};
}

BaseTime BaseTime::Subtract(const BaseTime& other) const noexcept
{
  return {numerator_ * other.denominator_ - other.numerator_ * denominator_, denominator_ * other.denominator_};
}

} // namespace _torvane_
