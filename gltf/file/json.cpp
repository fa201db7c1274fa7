#include "gltf/file/json.h"

#include <algorithm>
#include <cfloat>
#include <cmath>

namespace gltf
{

std::string Dump(const Json& value) { return value.dump(-1, ' ', false, Json::error_handler_t::replace); }

Real Finite(Real number)
{
  if (std::isnan(number))
    return 0.0;
  return std::clamp(number, -Real{FLT_MAX}, Real{FLT_MAX}) + 0.0;
}

Json ToJson(const Vector& vector) { return {Finite(vector.x), Finite(vector.y), Finite(vector.z)}; }

Json ToJson(const Quaternion& q) { return {q.x + 0.0, q.y + 0.0, q.z + 0.0, q.w + 0.0}; }

std::size_t Section::Add(const Json& element)
{
  if (count_ > 0)
    text_ += ",";
  text_ += Dump(element);
  return count_++;
}

} // namespace gltf
