// How messages and comparisons name a node: "objects/Body/Arm/tags/Texture[2]".
#pragma once

#include <string>
#include <string_view>
#include <unordered_map>

#include "torvane/nodes/base_list.h"

namespace q7r
{

// A node's name, or its type's where it has none.
std::string LabelOf(const _torvane_::BaseList2D& node);

// The labels of a list's members in their order, those that come again with a number.
class Labels
{
 public:
  std::string Next(const _torvane_::BaseList2D& node);

 private:
  std::unordered_map<std::string, int> counts_;
};

std::string Below(const std::string& path, std::string_view name);
// The path of a node's list. Children stand below their parent without a word between.
std::string ListPath(const std::string& path, std::string_view list);

} // namespace q7r
