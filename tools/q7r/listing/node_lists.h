// The lists of other nodes that a node owns.
#pragma once

#include <array>
#include <cstddef>

#include "torvane/nodes/base_list.h"
#include "torvane/nodes/root_list.h"

namespace q7r
{

// The lists that a node owns, with the names that listings give them.
struct NodeList
{
  const char* name = nullptr;
  const _torvane_::RootList2D* root = nullptr; // null: an empty list
};

class NodeLists
{
 public:
  explicit NodeLists(_torvane_::BaseList2D& node);

  const NodeList* begin() const { return lists_.data(); }
  const NodeList* end() const { return lists_.data() + count_; }

 private:
  void Add(const char* name, const _torvane_::RootList2D* root, bool always);

  static constexpr std::size_t kMost = 8;
  std::array<NodeList, kMost> lists_;
  std::size_t count_ = 0;
};

} // namespace q7r
