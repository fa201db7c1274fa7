// Exact time: a fraction of seconds.
#pragma once

#include <cmath>
#include <compare>

#include "torvane/types.h"

namespace _torvane_
{

// Two whole numbers held as Reals, so that both reach 2^53. Every operation leaves a reduced fraction with a
// denominator of at least 1; only Raw and SetDenominator hold what they are given.
class BaseTime
{
 public:
  constexpr BaseTime() noexcept = default;
  // To the next thousandth of a second; seconds are clamped to plus or minus 1e15 first.
  explicit BaseTime(Real seconds) noexcept;
  // Both numbers are rounded, the sign is that of the fraction, and the result is reduced. A denominator below 1 is
  // reported and becomes 1.
  BaseTime(Real numerator, Real denominator) noexcept;

  // The two numbers as they come, from a file for instance.
  static constexpr BaseTime Raw(Real numerator, Real denominator) noexcept
  {
    BaseTime time;
    time.numerator_ = numerator;
    time.denominator_ = denominator;
    return time;
  }

  constexpr Real GetNumerator() const noexcept { return numerator_; }
  constexpr Real GetDenominator() const noexcept { return denominator_; }
  constexpr void SetNumerator(Real numerator) noexcept { numerator_ = numerator; }
  // Not reduced. A value below 1 is reported and becomes 1.
  void SetDenominator(Real denominator) noexcept;

  // Seconds; 0 for a denominator of 0.
  constexpr Real Get() const noexcept { return denominator_ == 0.0 ? 0.0 : numerator_ / denominator_; }
  // The frame at `fps` frames a second, rounded towards zero; kept within 32 bits.
  Long GetFrame(Real fps) const noexcept;
  // Moves the time down to a frame of whole `fps`. A rate below 1 is reported and becomes 1.
  void Quantize(Real fps) noexcept;

  // -1, 0 or 1.
  Long Compare(const BaseTime& other) const noexcept;
  friend Bool operator==(const BaseTime& a, const BaseTime& b) noexcept { return a.Compare(b) == 0; }
  friend std::weak_ordering operator<=>(const BaseTime& a, const BaseTime& b) noexcept { return a.Compare(b) <=> 0; }

  [[nodiscard]] BaseTime Add(const BaseTime& other) const noexcept;
  [[nodiscard]] BaseTime Subtract(const BaseTime& other) const noexcept;
  friend BaseTime operator+(const BaseTime& a, const BaseTime& b) noexcept { return a.Add(b); }
  friend BaseTime operator-(const BaseTime& a, const BaseTime& b) noexcept { return a.Subtract(b); }

 private:
  void Reduce() noexcept;
  void ReduceLarge() noexcept;

  Real numerator_ = 0.0;
  Real denominator_ = 1.0;
};

inline Long BaseTime::Compare(const BaseTime& other) const noexcept
{
  if (numerator_ == other.numerator_ && denominator_ == other.denominator_)
    return 0;
  Real left = numerator_ * other.denominator_;
  Real right = other.numerator_ * denominator_;
  // Whole numbers, which almost all times hold, need no rounding down.
  if (!(left - right >= 1.0 || right - left >= 1.0)) {
    left = std::floor(left);
    right = std::floor(right);
  }
  return left < right ? -1 : left > right ? 1 : 0;
}

} // namespace _torvane_
