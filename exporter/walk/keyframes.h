// Animation: streams are read once a frame and become keys. The host's own keyframes, easing and expressions come
// through by being sampled.
#pragma once

#include <array>
#include <span>

#include "exporter/walk/export_context.h"
#include "exporter/walk/transform.h"
#include "torvane/animation/ctrack.h"
#include "torvane/memory/owned.h"

namespace exporter
{

// A new track of an object that takes one value a frame. Keys that add nothing are not made: a value that lies within
// 1e-6 of the value before it and of the one behind it, unless it is the first or the last. (In a track whose kind is
// not a number only equal data count.)
class SampledTrack
{
 public:
  // What a key's number goes into.
  enum class Content
  {
    kValue,
    kData, // an integer beside the value, which stays 0
  };

  // Holds nothing when the object is null or memory is short; adding then does nothing.
  SampledTrack(_torvane_::BaseObject* object, const _torvane_::ParameterPath& path, const _torvane_::String& name,
               Content content = Content::kValue);

  explicit operator bool() const { return track_ != nullptr; }
  // Makes room for the keys of so many values.
  void Reserve(_torvane_::Long count);
  // Times come in ascending order.
  void Add(const _torvane_::BaseTime& time, Real value);
  // Puts the track last among those of the object. One that holds a single value throughout vanishes instead: it has
  // less than two keys, or two of exactly the same value.
  void Finish();
  // Puts the track in without a look at its keys.
  void Insert();

 private:
  bool IsSame(Real a, Real b) const;
  bool IsConstant();
  void AddSampledKey(const _torvane_::BaseTime& time, Real value);

  _torvane_::BaseObject* object_;
  _torvane_::Owned<_torvane_::CTrack> track_;
  _torvane_::CCurve* curve_; // of the track; null if there is none
  Content content_;
  bool comparesData_ = false;
  bool isEmpty_ = true;
  // The last value is held back until the next one shows whether it is needed.
  bool hasPending_ = false;
  _torvane_::BaseTime pendingTime_;
  Real pending_ = 0.0;
  Real previous_ = 0.0; // the one before, with a key or without
};

// The tracks of the three components of a Vector parameter.
class VectorTracks
{
 public:
  VectorTracks(_torvane_::BaseObject* object, _torvane_::Long parameter, const char* const (&names)[3]);

  // True if all three are there.
  explicit operator bool() const { return tracks_[0] && tracks_[1] && tracks_[2]; }
  std::span<SampledTrack, 3> All() { return tracks_; }
  void Reserve(_torvane_::Long count);
  void Add(const _torvane_::BaseTime& time, const Vector& value);
  void Finish();
  void Insert();

 private:
  SampledTrack tracks_[3];
};

inline constexpr const char* kPositionTrackNames[] = {"Position X", "Position Y", "Position Z"};
inline constexpr const char* kRotationTrackNames[] = {"Rotation X", "Rotation Y", "Rotation Z"};
// The path tells scale tracks apart; their names are those of the position.
inline constexpr const char* kScaleTrackNames[] = {"Position X", "Position Y", "Position Z"};

// What becomes of the values of a stream. x, y and z are its components; a track that isn't there takes none.
enum class SampleMode
{
  kPosition = 0,    // x, -y, z, and the parent shift
  kValue = 1,       // x, y, z, each over the divisor
  kFieldOfView = 2, // the angle of a camera whose zoom is x
  kAngle = 3,       // x, from degrees to radians
  kCone = 4,        // outer and inner angle: x, and x less the percentage in the second stream, in radians
  kEnumeration = 5, // 2 becomes 8 and 3 becomes 10; anything else repeats the number before, which is 0 at first
  kColor = 6,       // red, green, blue
  kSwitch,          // 0 or 1; never animated
};

struct StreamSampling
{
  SampleMode mode = SampleMode::kValue;
  Real divisor = 1.0;
  AEGP_StreamRefH secondStream = nullptr;
  Real width = 0.0; // of the composition, for the field of view
  Vector parentShift = Vector();
};

// Turns the values of a stream into those of its tracks, one after the other.
class ValueConverter
{
 public:
  ValueConverter(const ExportContext& context, const StreamSampling& sampling)
      : sampling_(sampling), pixelAspect_(context.pixelAspect)
  {}

  std::array<Real, 3> Convert(const AEGP_StreamVal2& value, const AEGP_StreamVal2& second);

 private:
  const StreamSampling& sampling_;
  Real pixelAspect_;
  Real lastEnumerator_ = 0.0;
};

// Samples a stream over all frames into one to three tracks, of which the first must be there, and finishes them. False
// for a null stream or track and when the host fails: the tracks then end before the failure.
bool SampleStream(ExportContext& context, HostCalls& host, AEGP_StreamRefH stream, std::span<SampledTrack> tracks,
                  const StreamSampling& sampling);

// Tracks of an object's transform. Those of the rotation and of the scale may hold nothing.
struct TransformTracks
{
  VectorTracks position;
  VectorTracks rotation;
  VectorTracks scale;
};

// Samples the streams of the context, and the anchor and the scale if there are such streams, over all frames. False,
// without a look at the tracks, unless the position and all rotation streams are there; also when the host fails: the
// tracks then end before the failure.
bool SampleTransform(ExportContext& context, HostCalls& host, const HostStream& anchorStream,
                     const HostStream& scaleStream, TransformTracks& tracks, const TransformRules& rules);

} // namespace exporter
