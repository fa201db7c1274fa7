// Exact times.
#pragma once

#include <cstdint>

namespace host
{

// A quotient in lowest terms. Results that don't fit are the nearest that do, to about 1e-18 of the value.
class Ratio
{
 public:
  constexpr Ratio(std::int64_t whole = 0) : numerator_(whole), divisor_(1) {}
  // 0 for a divisor of 0, as files mark what isn't there.
  Ratio(std::int64_t numerator, std::int64_t divisor);

  std::int64_t Numerator() const { return numerator_; }
  std::int64_t Divisor() const { return divisor_; } // above 0
  bool IsWhole() const { return divisor_ == 1; }
  double ToDouble() const { return static_cast<double>(numerator_) / static_cast<double>(divisor_); }
  // To the nearest whole number.
  std::int64_t Round() const;

  friend Ratio operator+(const Ratio& a, const Ratio& b);
  friend Ratio operator-(const Ratio& a, const Ratio& b);
  friend Ratio operator*(const Ratio& a, const Ratio& b);
  // 0 where `b` is 0.
  friend Ratio operator/(const Ratio& a, const Ratio& b);
  friend bool operator<(const Ratio& a, const Ratio& b);
  friend bool operator==(const Ratio&, const Ratio&) = default;

 private:
  std::int64_t numerator_;
  std::int64_t divisor_;
};

} // namespace host
