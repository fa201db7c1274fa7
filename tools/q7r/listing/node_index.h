// Where nodes stand, by number: names repeat.
#pragma once

#include <cstddef>
#include <unordered_map>
#include <vector>

#include "output/value_sink.h"
#include "torvane/document/base_document.h"

namespace q7r
{

class NodeIndex
{
 public:
  // A node's places in its lists, from the root list down: [2, 0] is the first child of the third member. Null for
  // null and for what is no named node.
  void TellPath(ValueSink& sink, const _torvane_::GeListNode* node);
  // The paths of what the links of a container lead to, by id; links that lead nowhere are left out.
  void TellLinks(ValueSink& sink, const _torvane_::BaseContainer& container);

 private:
  using Places = std::unordered_map<const _torvane_::BaseList2D*, std::size_t>;

  const Places& PlacesIn(const _torvane_::RootList2D& list);
  std::vector<long long> PathOf(const _torvane_::GeListNode* node);

  std::unordered_map<const _torvane_::RootList2D*, Places> lists_; // each counted when it is first asked for
};

} // namespace q7r
