// The knots of a gradient, as they stand in its settings.
#pragma once

#include "torvane/shaders/gradient.h"
#include "torvane/values/ge_data.h"

namespace _torvane_
{

// Calls `visit` with each knot and its place among the entries, in their order, until it gives false. Entries that are
// no knots, which a file may have, are passed over.
template <class Visit>
void ForEachKnot(const GradientData& gradient, Visit&& visit)
{
  const BaseContainer* knots = gradient.GetSettings().GetContainerInstance(kGradientKnots);
  BaseContainer::Iterator iterator;
  Long id = 0;
  const GeData* value = nullptr;
  ULong place = 0;
  for (Bool more = knots && knots->BrowseFirst(iterator, id, value); more;
       more = knots->BrowseNext(iterator, id, value), ++place) {
    if (value->GetRawType() == kDataContainer && !visit(*value->GetContainer(), place))
      return;
  }
}

inline Long CountKnots(const GradientData& gradient)
{
  Long count = 0;
  ForEachKnot(gradient, [&](const BaseContainer&, ULong) { return ++count > 0; });
  return count;
}

} // namespace _torvane_
