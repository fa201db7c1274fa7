#include "host/model/property.h"

#include <algorithm>
#include <cmath>

#include "host/model/turning.h"

namespace host
{

namespace
{

constexpr AEGP_StreamType kSpatial = AEGP_StreamType_ThreeD_SPATIAL;
constexpr AEGP_StreamType kOneD = AEGP_StreamType_OneD;

constexpr StreamInfo kStreams[kStreamCount] = {
    {AEGP_LayerStream_ANCHORPOINT, "anchor point", kSpatial, {0, 0, 0}},
    {AEGP_LayerStream_POSITION, "position", kSpatial, {0, 0, 0}},
    {AEGP_LayerStream_SCALE, "scale", AEGP_StreamType_ThreeD, {100, 100, 100}},
    {AEGP_LayerStream_ROTATE_Z, "rotation Z", kOneD, {0}},
    {AEGP_LayerStream_ROTATE_X, "rotation X", kOneD, {0}},
    {AEGP_LayerStream_ROTATE_Y, "rotation Y", kOneD, {0}},
    {AEGP_LayerStream_ORIENTATION, "orientation", kSpatial, {0, 0, 0}},
    {AEGP_LayerStream_ZOOM, "zoom", kOneD, {0}},
    {AEGP_LayerStream_FOCUS_DISTANCE, "focus distance", kOneD, {0}}, // the zoom's first value, in truth
    {AEGP_LayerStream_INTENSITY, "intensity", kOneD, {100}},
    {AEGP_LayerStream_COLOR, "colour", AEGP_StreamType_COLOR, {1, 1, 1}},
    {AEGP_LayerStream_CONE_ANGLE, "cone angle", kOneD, {90}},
    {AEGP_LayerStream_CONE_FEATHER, "cone feather", kOneD, {50}},
    {AEGP_LayerStream_SHADOW_DARKNESS, "shadow darkness", kOneD, {100}},
    {AEGP_LayerStream_CASTS_SHADOWS, "casts shadows", kOneD, {0}},
};

} // namespace

const StreamInfo* FindStreamInfo(AEGP_LayerStream id)
{
  const auto found = std::find_if(std::begin(kStreams), std::end(kStreams), [id](const auto& s) { return s.id == id; });
  return found == std::end(kStreams) ? nullptr : found;
}

std::size_t StreamIndex(const StreamInfo& info) { return static_cast<std::size_t>(&info - kStreams); }

Value Property::At(double frame, bool preExpression) const
{
  if (!preExpression && !samples_.empty()) {
    const double last = static_cast<double>(samples_.size() - 1);
    return samples_[static_cast<std::size_t>(std::clamp(std::round(frame), 0.0, last))];
  }
  if (split_.empty())
    return KeyedAt(frame);
  Value value{};
  for (std::size_t c = 0; c < split_.size(); ++c)
    value[c] = split_[c].At(frame, preExpression)[0];
  return value;
}

// The last keyframe that is not after `frame`, which lies in [first time, last time).
std::size_t Property::IntervalAt(double frame) const
{
  const auto holds = [&](std::size_t i) {
    return i + 1 < keyframes_.size() && keyframes_[i].time <= frame && frame < keyframes_[i + 1].time;
  };
  // Frames are mostly asked for in order.
  for (std::size_t i : {lastInterval_, lastInterval_ + 1})
    if (holds(i))
      return lastInterval_ = i;
  const auto after = std::upper_bound(keyframes_.begin(), keyframes_.end(), frame,
                                      [](double f, const Keyframe& key) { return f < key.time; });
  return lastInterval_ = static_cast<std::size_t>(after - keyframes_.begin()) - 1;
}

Value Property::KeyedAt(double frame) const
{
  if (keyframes_.empty())
    return constant_;
  if (frame < keyframes_.front().time)
    return keyframes_.front().value;
  if (frame >= keyframes_.back().time)
    return keyframes_.back().value;
  const std::size_t i = IntervalAt(frame);
  const Keyframe& from = keyframes_[i];
  const Keyframe& to = keyframes_[i + 1];
  if (from.hold == Hold::kValue || frame == from.time)
    return from.value;
  if (from.hold == Hold::kNextValue)
    return to.value;
  return Between(from, to, (frame - from.time) / (to.time - from.time));
}

Value Property::Between(const Keyframe& from, const Keyframe& to, double x) const
{
  const auto eased = [&](std::size_t c) { return from.easing.empty() ? x : Ease(from.easing[c], x); };
  double y = eased(0);
  if (isTurning_)
    return TurnBetween(from.value, to.value, y);
  if (from.path)
    return from.path->At(y);
  Value value{};
  for (std::size_t c = 0; c < static_cast<std::size_t>(info_->Dimensions()); ++c) {
    if (c > 0 && c < from.easing.size())
      y = eased(c);
    const bool isBump = !from.easing.empty() && from.easing[std::min(c, from.easing.size() - 1)].isBump;
    value[c] = from.value[c] + (isBump ? y : (to.value[c] - from.value[c]) * y);
  }
  return value;
}

std::size_t Property::KeyframeCount() const
{
  std::size_t count = keyframes_.size() + leftOut_;
  for (const Property& component : split_)
    count = std::max(count, component.KeyframeCount());
  return count;
}

bool Property::IsTimeVarying() const
{
  return keyframes_.size() > 1 || samples_.size() > 1 ||
         std::any_of(split_.begin(), split_.end(), [](const Property& c) { return c.IsTimeVarying(); });
}

bool Property::HasExpression() const
{
  return !expression_.empty() ||
         std::any_of(split_.begin(), split_.end(), [](const Property& c) { return c.HasExpression(); });
}

bool Property::IsExpressionLost() const
{
  if (!samples_.empty())
    return false;
  return !expression_.empty() ||
         std::any_of(split_.begin(), split_.end(), [](const Property& c) { return c.IsExpressionLost(); });
}

} // namespace host
