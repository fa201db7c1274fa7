#include "type_names.h"

#include "torvane/nodes/type_name.h"

namespace q7r
{

std::string TypeName(_torvane_::Long type)
{
  const char* name = _torvane_::GetTypeName(type);
  return name ? name : "type " + std::to_string(type);
}

} // namespace q7r
