// Chunks of keys, curves and tracks.
#pragma once

#include "torvane/types.h"

namespace _torvane_
{

inline constexpr Long kChunkKey = 110416;
inline constexpr Long kChunkKeys = 110419;
inline constexpr Long kChunkCurve = 110415;
inline constexpr Long kChunkCurves = 110418;
inline constexpr Long kLevelCurves = 3;
inline constexpr Long kChunkTrackSettings = 110414;
inline constexpr Long kLevelTrackSettings = 2;

inline constexpr Long kDiskTypePluginNode = 5353; // a node whose tracks are of kind kTrackPlugin

} // namespace _torvane_
