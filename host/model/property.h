// An animated property of a layer: what a stream of the host reads.
#pragma once

#include "exporter/host_api/aegp_types.h"
#include "host/model/curves.h"

#include <memory>
#include <string>
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

// What an interval without movement shows between its ends.
enum class Hold
{
  kNone,
  kValue,     // the value of the keyframe that begins it
  kNextValue, // that of the one that ends it: a hold of a layer that runs backwards
};

struct Keyframe
{
  double time = 0; // in frames
  Value value{};   // here; the value at the end of this interval is the next keyframe's
  Hold hold = Hold::kNone;
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
  // The text of its expression, which is not evaluated; empty if there is none.
  const std::string& Expression() const { return expression_; }
  // An expression without samples that stand in for it.
  bool IsExpressionLost() const;

  const Value& Constant() const { return constant_; }
  const std::vector<Keyframe>& Keyframes() const { return keyframes_; }
  const std::vector<Value>& Samples() const { return samples_; }
  // Empty, or the three properties of a split position.
  const std::vector<Property>& Split() const { return split_; }
  // Three angles that turn together by the shortest way from keyframe to keyframe.
  bool IsTurning() const { return isTurning_; }

  // What the reader fills. `keyframes` are in the order of time; `samples` hold one value for each frame from 0.
  void SetConstant(const Value& value) { constant_ = value; }
  void SetKeyframes(std::vector<Keyframe> keyframes) { keyframes_ = std::move(keyframes); }
  void SetSamples(std::vector<Value> samples) { samples_ = std::move(samples); }
  // The same for one of the three of a split position.
  void SetSplitSamples(std::size_t component, std::vector<Value> samples)
  {
    split_.at(component).SetSamples(std::move(samples));
  }
  // A keyframe that only shapes the way between its neighbours may be left out of the list and is counted here.
  void CountKeyframes(std::size_t leftOut) { leftOut_ = leftOut; }
  void SetExpression(std::string text) { expression_ = std::move(text); }
  void SetTurning() { isTurning_ = true; }
  // Three one-dimensional properties whose first components take the place of this one's.
  void SetSplit(std::vector<Property> components) { split_ = std::move(components); }

  // How many handles to this stream a host has given out and not got back.
  int openHandles = 0;

 private:
  Value KeyedAt(double frame) const;
  Value Between(const Keyframe& from, const Keyframe& to, double x) const;
  std::size_t IntervalAt(double frame) const;

  const StreamInfo* info_;
  Value constant_;
  std::vector<Keyframe> keyframes_;
  std::vector<Value> samples_;
  std::vector<Property> split_;
  std::string expression_;
  std::size_t leftOut_ = 0;
  bool isTurning_ = false;
  mutable std::size_t lastInterval_ = 0;
};

} // namespace host
