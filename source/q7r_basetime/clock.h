// A clock that runs on.
#pragma once

#include "torvane/types.h"

namespace _torvane_
{

// A running number of milliseconds, cut to 32 bits; 0 in a reproducible run.
Long ReadMilliseconds() noexcept;

} // namespace _torvane_
