#include "torvane/time/reproducible_run.h"

#include <chrono>

#include "q7r_basetime/clock.h"

namespace _torvane_
{

namespace
{

thread_local ReproducibleRun* gCurrentRun = nullptr;

// The generator splitmix64: neighbours give numbers that have nothing in common.
ULLong MixBits(ULLong number)
{
  number += 0x9E3779B97F4A7C15;
  number = (number ^ (number >> 30)) * 0xBF58476D1CE4E5B9;
  number = (number ^ (number >> 27)) * 0x94D049BB133111EB;
  return number ^ (number >> 31);
}

} // namespace

ReproducibleRun::ReproducibleRun(ULLong seed, const DateTime& now) noexcept
    : seed_(seed), now_(now), before_(gCurrentRun)
{
  gCurrentRun = this;
}

ReproducibleRun::~ReproducibleRun() { gCurrentRun = before_; }

ReproducibleRun* ReproducibleRun::GetCurrent() noexcept { return gCurrentRun; }

void ReproducibleRun::TakeUuid(UChar* bytes) noexcept
{
  const ULLong halves[] = {MixBits(seed_ ^ MixBits(drawn_)), MixBits(~seed_ + MixBits(drawn_))};
  ++drawn_;
  for (Long i = 0; i < 16; ++i)
    bytes[i] = static_cast<UChar>(halves[i / 8] >> (8 * (7 - i % 8)));
}

Long ReadMilliseconds() noexcept
{
  using namespace std::chrono;
  if (ReproducibleRun::GetCurrent())
    return 0;
  const auto now = duration_cast<milliseconds>(steady_clock::now().time_since_epoch()).count();
  return static_cast<Long>(static_cast<ULong>(now));
}

} // namespace _torvane_
