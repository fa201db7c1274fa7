// The parameters of plane objects (kObjectPlane), which are entries of the object's container.
#pragma once

#include "torvane/types.h"

namespace _torvane_
{

inline constexpr Long kPlaneWidth = 1230;  // Real, in the document's unit
inline constexpr Long kPlaneHeight = 1231; // Real

// Known by number alone.
struct PlaneSetting
{
  Long id;
  Long value; // in exported scenes
};

inline constexpr PlaneSetting kPlaneSettings[] = {{1233, 1}, {1232, 1}, {1300, 5}};

} // namespace _torvane_
