// The sort of a gradient's knots.
#pragma once

#include "torvane/types.h"

namespace _torvane_
{

// A shell sort: in place, without memory, not stable. `Order::IsBehind(a, b)` tells that `a` must stand behind `b`.
template <class T, class Order>
struct CShellSort
{
  static void Sort(T* elements, Long count)
  {
    Long gap = 1;
    while (gap < count / 3)
      gap = gap * 3 + 1; // 1, 4, 13, 40, ...
    for (; gap > 0; gap /= 3) {
      for (Long i = gap; i < count; ++i)
        SinkIn(elements, i, gap);
    }
  }

 private:
  // Moves the element at `place` down its run of every `gap`th element, to where it belongs.
  static void SinkIn(T* elements, Long place, Long gap)
  {
    const T element = elements[place];
    while (place >= gap && Order::IsBehind(elements[place - gap], element)) {
      elements[place] = elements[place - gap];
      place -= gap;
    }
    elements[place] = element;
  }
};

} // namespace _torvane_
