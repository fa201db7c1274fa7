// Keyframes of a project as the host evaluates them.
#pragma once

#include "host/model/property.h"
#include "host/reader/projects/property_chunks.h"

namespace host::projects
{

// From layer time to frames of the root composition.
class LayerClock
{
 public:
  LayerClock() = default;
  // `start` in seconds of the layer's composition; the frames of the root a second.
  LayerClock(const Ratio& start, const Ratio& stretch, const Ratio& framesPerSecond)
      : start_(start * framesPerSecond), perSecond_(stretch * framesPerSecond)
  {}

  double FrameAt(const Ratio& seconds) const { return (start_ + seconds * perSecond_).ToDouble(); }
  bool RunsBackwards() const { return perSecond_ < Ratio(0); }

 private:
  Ratio start_;
  Ratio perSecond_{1};
};

// What a property moves like where no file has shown it.
struct KeyframeDoubts
{
  bool overshootsPath = false;
  bool hasSpeedWithoutPath = false; // an orientation or a colour
};

// `record` in the units that are handed out, its first `dimensions` components. Keyframes that rove are put where the
// ease of their whole run brings the layer past them; `leftOut` counts those that are left out because it passes them
// more than once.
std::vector<Keyframe> BuildKeyframes(const PropertyRecord& record, std::size_t dimensions, const LayerClock& clock,
                                     std::size_t& leftOut, KeyframeDoubts& doubts);

} // namespace host::projects
