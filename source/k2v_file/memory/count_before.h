// The one binary search of sorted places.
#pragma once

#include "torvane/types.h"

namespace _torvane_
{

// How many of `count` places stand before those that are looked for: `isBefore(place)` is true for the first ones and
// false for all behind them.
template <class IsBefore>
Long CountBefore(Long count, IsBefore&& isBefore)
{
  Long low = 0;
  Long high = count;
  while (low < high) {
    const Long middle = low + (high - low) / 2;
    if (isBefore(middle))
      low = middle + 1;
    else
      high = middle;
  }
  return low;
}

} // namespace _torvane_
