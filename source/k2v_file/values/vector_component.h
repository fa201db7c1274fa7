// The components of a Vector as a parameter path names them.
#pragma once

#include "torvane/math/vector.h"
#include "torvane/values/parameter_path.h"

namespace _torvane_
{

// The component that a path level names, or null for another id.
inline Real* ComponentOf(Vector& vector, Long id)
{
  switch (id) {
  case kVectorX:
    return &vector.x;
  case kVectorY:
    return &vector.y;
  case kVectorZ:
    return &vector.z;
  default:
    return nullptr;
  }
}

} // namespace _torvane_
