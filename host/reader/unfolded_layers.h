// How many objects compositions become, each nested one counted as often as it is used.
#pragma once

#include <cstddef>
#include <cstdint>
#include <vector>

namespace host
{

// The layers of a composition that become objects.
struct UnfoldedLayers
{
  std::uint64_t own = 0;
  std::vector<std::size_t> nested; // of these, the compositions that layers show, by place in the list; with repeats
};

// In all, for each composition of the list. One that contains itself counts what isn't counted yet as nothing; a number
// beyond all bounds is the largest there is.
std::vector<std::uint64_t> CountUnfolded(const std::vector<UnfoldedLayers>& compositions);

} // namespace host
