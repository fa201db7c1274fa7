// Trunks in the order of the ids that a file gives them.
#pragma once

#include <cstddef>

#include "torvane/links/alias.h"

namespace _torvane_
{

// They lie behind this head, and are constructed one by one as their ids turn up. A page goes with the last of them.
struct TrunkPage
{
  static constexpr ULong kTrunks = 512;

  // Null when memory is short.
  static TrunkPage* Make();

  AliasTrunk* Trunks() { return reinterpret_cast<AliasTrunk*>(this + 1); }

  LLong live; // trunks that are there; counted when the translation ends
};
static_assert(sizeof(TrunkPage) % alignof(AliasTrunk) == 0);

} // namespace _torvane_
