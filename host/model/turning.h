// Orientations: three angles that turn together.
#pragma once

#include "host/model/curves.h"

namespace host
{

// The orientation at the progress `y` of the shortest turn between two, all in degrees about X, Y and Z, turned in
// that order from the left: R = Rx Ry Rz. Spherical interpolation, which goes on at the same speed below 0 and above 1.
// The angles come out from 0 (included) to 360 (excluded). Equal orientations give `from` as it is.
Value TurnBetween(const Value& from, const Value& to, double y);

} // namespace host
