// Keyframes that rove: their times follow from the ease of the run that they are in.
#pragma once

#include "host/model/property.h"

#include <optional>

namespace host::projects
{

struct RovingRun
{
  Keyframe start;
  double endTime;
  std::vector<Value> points;    // 3 n + 1 control points of the n joined paths
  std::optional<Easing> easing; // of the whole run; none: linear

  double Length() const { return BezierPath(points).Length(); }
};

// Appends the run's keyframes but its last to `keys` and gives how many: one for each path, with its part of the ease,
// where the layer passes the roving ones once; a single one along all paths where it turns back.
std::size_t SplitRun(RovingRun run, std::vector<Keyframe>& keys);

} // namespace host::projects
