#include "host/model/ratio.h"

#include <limits>
#include <numeric>

namespace host
{

namespace
{

__extension__ typedef __int128 Wide; // products and sums of products of 64-bit numbers

constexpr Wide kLargest = std::numeric_limits<std::int64_t>::max();

Wide Absolute(Wide number) { return number < 0 ? -number : number; }

Wide CommonDivisor(Wide a, Wide b)
{
  while (b > kLargest) {
    const Wide rest = a % b;
    a = b;
    b = rest;
  }
  if (b == 0)
    return a;
  return std::gcd(static_cast<std::int64_t>(a % b), static_cast<std::int64_t>(b));
}

Ratio Reduce(Wide numerator, Wide divisor)
{
  if (divisor == 0)
    return 0;
  if (divisor < 0) {
    numerator = -numerator;
    divisor = -divisor;
  }
  const Wide common = CommonDivisor(Absolute(numerator), divisor);
  numerator /= common;
  divisor /= common;
  while (Absolute(numerator) > kLargest || divisor > kLargest) {
    numerator /= 2;
    divisor /= 2;
  }
  if (divisor == 0) // beyond all that is counted here
    return {numerator < 0 ? -std::numeric_limits<std::int64_t>::max() : std::numeric_limits<std::int64_t>::max(), 1};
  return {static_cast<std::int64_t>(numerator), static_cast<std::int64_t>(divisor)};
}

} // namespace

Ratio::Ratio(std::int64_t numerator, std::int64_t divisor) : numerator_(0), divisor_(1)
{
  if (divisor == 0)
    return;
  const std::int64_t common = std::gcd(numerator, divisor) * (divisor < 0 ? -1 : 1);
  numerator_ = numerator / common;
  divisor_ = divisor / common;
}

std::int64_t Ratio::Round() const
{
  const Wide doubled = Wide{numerator_} * 2 + divisor_;
  const Wide below = Wide{divisor_} * 2;
  return static_cast<std::int64_t>(doubled / below - (doubled % below < 0 ? 1 : 0));
}

Ratio operator+(const Ratio& a, const Ratio& b)
{
  return Reduce(Wide{a.numerator_} * b.divisor_ + Wide{b.numerator_} * a.divisor_, Wide{a.divisor_} * b.divisor_);
}

Ratio operator-(const Ratio& a, const Ratio& b)
{
  return Reduce(Wide{a.numerator_} * b.divisor_ - Wide{b.numerator_} * a.divisor_, Wide{a.divisor_} * b.divisor_);
}

Ratio operator*(const Ratio& a, const Ratio& b)
{
  return Reduce(Wide{a.numerator_} * b.numerator_, Wide{a.divisor_} * b.divisor_);
}

Ratio operator/(const Ratio& a, const Ratio& b)
{
  return Reduce(Wide{a.numerator_} * b.divisor_, Wide{a.divisor_} * b.numerator_);
}

bool operator<(const Ratio& a, const Ratio& b)
{
  return Wide{a.numerator_} * b.divisor_ < Wide{b.numerator_} * a.divisor_;
}

} // namespace host
