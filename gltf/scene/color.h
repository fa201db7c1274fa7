// Colours as the scene has them (sRGB) and as glTF has them (linear).
#pragma once

#include <algorithm>
#include <cmath>

#include "gltf/scene/frames.h"

namespace gltf
{

inline Real ToLinear(Real c) { return c <= 0.04045 ? c / 12.92 : std::pow((c + 0.055) / 1.055, 2.4); }

// Components below 0 become 0; there is no upper bound.
inline Vector ToLinear(const Vector& c)
{
  return {ToLinear(std::max(c.x, 0.0)), ToLinear(std::max(c.y, 0.0)), ToLinear(std::max(c.z, 0.0))};
}

inline Vector Clamped01(const Vector& c)
{
  return {std::clamp(c.x, 0.0, 1.0), std::clamp(c.y, 0.0, 1.0), std::clamp(c.z, 0.0, 1.0)};
}

inline Real LargestOf(const Vector& c) { return std::max({c.x, c.y, c.z}); }

} // namespace gltf
