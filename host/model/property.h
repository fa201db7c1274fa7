// An animated property of a layer: what a stream of the host reads.
#pragma once

#include "exporter/host_api/aegp_types.h"
#include "host/model/curves.h"

#include <memory>
#include <vector>

namespace host
{

// What is fixed for a kind of stream.
struct StreamInfo
{
  AEGP_LayerStream id;
  const char* name; // as users know it
  AEGP_StreamType type;
  Value defaults;

  int Dimensions() const { return type == AEGP_StreamType_OneD ? 1 : 3; }
};

inline constexpr std::size_t kStreamCount = 15;

// The kind of stream with the id; null for an id that no layer here has a stream for.
const StreamInfo* FindStreamInfo(AEGP_LayerStream id);
// The place of a kind of stream in tables of kStreamCount entries.
std::size_t StreamIndex(const StreamInfo& info);

struct Keyframe
{
  double time = 0; // in frames
  Value value{};   // here; the value at the end of this interval is the next keyframe's
  bool isHold = false;
  // One curve for all components, or one for each; none: linear.
  std::vector<Easing> easing;
  // The way to the next keyframe, when it is not straight.
  std::unique_ptr<BezierPath> path;
};

class Property
{
 public:
  explicit Property(const StreamInfo& info) : info_(&info), constant_(info.defaults) {}

  const StreamInfo& Info() const { return *info_; }

  // The value at a frame: that of the samples, if there are any and `preExpression` is false, else that of the
  // keyframes, else the constant. Not for two threads at a time, since paths and the last place found are kept.
  Value At(double frame, bool preExpression = false) const;

  // The largest number of the three components when split.
  std::size_t KeyframeCount() const;
  // More than one keyframe or more than one sample.
  bool IsTimeVarying() const;
  bool HasExpression() const;
  // An expression without samples that stand in for it.
  bool IsExpressionLost() const;

  // What the reader fills. `keyframes` are in the order of time; `samples` hold one value for each frame from 0.
  void SetConstant(const Value& value) { constant_ = value; }
  void SetKeyframes(std::vector<Keyframe> keyframes) { keyframes_ = std::move(keyframes); }
  void SetSamples(std::vector<Value> samples) { samples_ = std::move(samples); }
  void SetHasExpression() { hasExpression_ = true; }
  // Three one-dimensional properties whose first components take the place of this one's.
  void SetSplit(std::vector<Property> components) { split_ = std::move(components); }

  // How many handles to this stream a host has given out and not got back.
  int openHandles = 0;

 private:
  Value KeyedAt(double frame) const;
  std::size_t IntervalAt(double frame) const;

  const StreamInfo* info_;
  Value constant_;
  std::vector<Keyframe> keyframes_;
  std::vector<Value> samples_;
  std::vector<Property> split_;
  bool hasExpression_ = false;
  mutable std::size_t lastInterval_ = 0;
};

} // namespace host
