// The times at which curves take keys.
#pragma once

#include "torvane/time/base_time.h"

namespace _torvane_
{

inline constexpr Real kKeyTimeLimit = 10000.0; // seconds, either way

inline Bool IsKeyTime(const BaseTime& time)
{
  return time.Compare(BaseTime::Raw(-kKeyTimeLimit, 1.0)) >= 0 && time.Compare(BaseTime::Raw(kKeyTimeLimit, 1.0)) <= 0;
}

} // namespace _torvane_
