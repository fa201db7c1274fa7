#include "node_path.h"

#include "scene_file.h"
#include "type_names.h"

namespace q7r
{

std::string LabelOf(const _torvane_::BaseList2D& node)
{
  return node.GetName().Content() ? ToUtf8(node.GetName()) : TypeName(node.GetType());
}

std::string Labels::Next(const _torvane_::BaseList2D& node)
{
  const std::string label = LabelOf(node);
  const int number = ++counts_[label];
  return number == 1 ? label : label + "[" + std::to_string(number) + "]";
}

std::string Below(const std::string& path, std::string_view name)
{
  return path.empty() ? std::string(name) : path + "/" + std::string(name);
}

std::string ListPath(const std::string& path, std::string_view list)
{
  return list == "children" ? path : Below(path, list);
}

} // namespace q7r
