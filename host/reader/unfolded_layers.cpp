#include "host/reader/unfolded_layers.h"

#include <limits>

namespace host
{

namespace
{

struct Visit
{
  std::size_t composition;
  std::size_t next = 0; // of its nested ones
};

std::uint64_t AddUpTo(std::uint64_t a, std::uint64_t b)
{
  constexpr std::uint64_t kMost = std::numeric_limits<std::uint64_t>::max();
  return b > kMost - a ? kMost : a + b;
}

} // namespace

std::vector<std::uint64_t> CountUnfolded(const std::vector<UnfoldedLayers>& compositions)
{
  std::vector<std::uint64_t> counts(compositions.size());
  std::vector<bool> isEntered(compositions.size());
  std::vector<Visit> open; // depth first, without recursion
  const auto enter = [&](std::size_t composition) {
    isEntered[composition] = true;
    open.push_back({composition});
  };
  for (std::size_t start = 0; start < compositions.size(); ++start) {
    if (!isEntered[start])
      enter(start);
    while (!open.empty()) {
      Visit& visit = open.back();
      const UnfoldedLayers& layers = compositions[visit.composition];
      if (visit.next < layers.nested.size()) {
        const std::size_t inner = layers.nested[visit.next++];
        if (!isEntered[inner])
          enter(inner);
        continue;
      }
      counts[visit.composition] = layers.own;
      for (const std::size_t inner : layers.nested)
        counts[visit.composition] = AddUpTo(counts[visit.composition], counts[inner]);
      open.pop_back();
    }
  }
  return counts;
}

} // namespace host
