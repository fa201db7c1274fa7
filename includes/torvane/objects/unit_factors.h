// What a length unit is in metres.
#pragma once

#include "torvane/values/custom_data.h"

namespace _torvane_
{

inline constexpr Long kKeyDocumentUnit = 2117; // of a document's container: a UnitScaleData
inline constexpr Long kUnitMetre = 2;

// The scale times the unit's length in metres (unknown units count as metres). 1.0, with a report, for null.
Real GetUnitFactor(const UnitScaleData* unit);

// What a length in `from` is to be multiplied by to be one in `to`. 1.0 when both are the same, and when `to` has no
// length.
Real ConvertUnits(const UnitScaleData* from, const UnitScaleData* to);

} // namespace _torvane_
