// The parameters of plane objects (kObjectPlane), which are entries of the object's container.
#pragma once

#include "torvane/types.h"

namespace _torvane_
{

inline constexpr Long kPlaneWidth = 1230;  // Real, in the document's unit
inline constexpr Long kPlaneHeight = 1231; // Real
inline constexpr Long kPlaneAxis = 1300;   // Long: which way it faces
inline constexpr Long kPlaneTowardsViewer = 5;

// What exported planes have besides. The other two are known by number alone.
struct PlaneSetting
{
  Long id;
  Long value;
};

inline constexpr PlaneSetting kPlaneSettings[] = {{1233, 1}, {1232, 1}, {kPlaneAxis, kPlaneTowardsViewer}};

} // namespace _torvane_
