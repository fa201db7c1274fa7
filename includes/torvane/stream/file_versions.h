// The versions of scene files at which what they hold changed. A bound is the first version with the newer form.
#pragma once

#include "torvane/types.h"

namespace _torvane_
{

inline constexpr Long kVersionUnknown = 6000;     // of a file whose header tells none, until chunk 110024 does
inline constexpr Long kVersionNodeHeader = 7500;  // names and containers in the node header; lights with all values
inline constexpr Long kVersionLastChannel = 9400; // the fourteenth channel of old materials
inline constexpr Long kVersionLightSize = 9420;   // before: a light's size factor goes to its object
inline constexpr Long kVersionGreyAlpha = 11005;  // before: a gradient's transparency has coloured knots
inline constexpr Long kVersionTransform = 11600;  // the whole transform; Arrays in place of Memory values
inline constexpr Long kVersionDisplay = 11611;    // before: a display tag's settings in a chunk of their own
inline constexpr Long kVersionArrayOrder = 11904; // before: the type of an Array before its length
inline constexpr Long kVersionColumns = 11925;    // before: legacy arrays, some with lengths by another element size
inline constexpr Long kVersionRequired = 12600;   // what LoadRequireCurrent asks for
inline constexpr Long kVersionCurrent = 13000;    // what is written

} // namespace _torvane_
