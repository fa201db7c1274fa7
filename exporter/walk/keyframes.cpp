#include "exporter/walk/keyframes.h"

#include <algorithm>
#include <cmath>

#include "exporter/walk/layer_sample.h"

namespace exporter
{

using namespace _torvane_;

namespace
{

constexpr Real kThinTolerance = 1e-6;
constexpr Long kMostReserved = 16384;          // keys that get room before it is known whether they stay
constexpr std::int64_t kLastKeySecond = 10000; // curves take no keys beyond

// The frames from 0 to this one are sampled, unless keys end before.
Long LastFrame(const ExportContext& context)
{
  const std::int64_t lastKey = kLastKeySecond * std::max(context.framesPerSecond, 1);
  return static_cast<Long>(std::min<std::int64_t>(context.frameCount, lastKey));
}

// Counted from the start of the composition, not of the work area.
A_Time FrameTime(const ExportContext& context, Long frame)
{
  const std::int64_t value = std::int64_t{frame} * context.frameDuration.value;
  return {static_cast<A_long>(value), context.frameDuration.scale};
}

ParameterPath ComponentPath(Long parameter, Long component)
{
  return {ParameterLevel{parameter, kDataVector, 0}, ParameterLevel{kVectorX + component, kDataReal, 0}};
}

} // namespace

std::array<Real, 3> ValueConverter::Convert(const AEGP_StreamVal2& value, const AEGP_StreamVal2& second)
{
  const AEGP_ThreeDVal& v = value.three_d;
  switch (sampling_.mode) {
  case SampleMode::kPosition: {
    const Vector place = FlipY(ToVector(v)) + sampling_.parentShift;
    return {place.x, place.y, place.z};
  }
  case SampleMode::kValue:
    return {v.x / sampling_.divisor, v.y / sampling_.divisor, v.z / sampling_.divisor};
  case SampleMode::kFieldOfView:
    return {FieldOfView(value.one_d, sampling_.width, pixelAspect_)};
  case SampleMode::kAngle:
    return {DegreesToRadians(value.one_d)};
  case SampleMode::kCone:
    return {DegreesToRadians(value.one_d), InnerAngle(value.one_d, second.one_d)};
  case SampleMode::kEnumeration:
    if (value.one_d == 2.0)
      lastEnumerator_ = 8.0;
    else if (value.one_d == 3.0)
      lastEnumerator_ = 10.0;
    return {lastEnumerator_};
  case SampleMode::kSwitch:
    return {value.one_d == 0.0 ? 0.0 : 1.0};
  case SampleMode::kColor:
    return {value.color.redF, value.color.greenF, value.color.blueF};
  }
  return {};
}

SampledTrack::SampledTrack(BaseObject* object, const ParameterPath& path, const String& name, Content content)
    : object_(object),
      track_(CTrack::Alloc(object, path, name)),
      curve_(track_ ? track_->GetCurve(1, 1) : nullptr),
      content_(content),
      comparesData_(track_ && track_->GetKind() != kTrackValue)
{}

bool SampledTrack::IsSame(Real a, Real b) const
{
  // Numbers in a track that compares data, and the other way round, all look the same.
  if (comparesData_ != (content_ == Content::kData))
    return true;
  return comparesData_ ? a == b : std::abs(a - b) < kThinTolerance;
}

void SampledTrack::Reserve(Long count)
{
  if (curve_)
    curve_->Reserve(std::min(count, kMostReserved));
}

void SampledTrack::Add(const BaseTime& time, Real value)
{
  if (!track_)
    return;
  if (isEmpty_) {
    isEmpty_ = false;
    AddSampledKey(time, value);
    previous_ = value;
    return;
  }
  if (hasPending_) {
    if (!IsSame(previous_, pending_) || !IsSame(value, pending_))
      AddSampledKey(pendingTime_, pending_);
    previous_ = pending_;
  }
  hasPending_ = true;
  pendingTime_ = time;
  pending_ = value;
}

void SampledTrack::AddSampledKey(const BaseTime& time, Real value)
{
  constexpr ULong kSwitches = kKeyMaskAutomatic | kKeyMaskClamp;
  if (!curve_)
    return;
  if (content_ == Content::kValue) {
    curve_->SetKeyValue(time, value == 0.0 ? 0.0 : value, kSwitches); // as CKey::SetValue: -0.0 leaves the 0.0
    return;
  }
  KeyValues key;
  Long place = 0;
  key.time = time;
  key.switches = kSwitches;
  if (curve_->SetKeyValues(key, &place))
    curve_->GetKey(place)->SetGeData(curve_, static_cast<Long>(value));
}

bool SampledTrack::IsConstant()
{
  if (!curve_ || curve_->GetKeyCount() != 2)
    return !curve_ || curve_->GetKeyCount() < 2;
  if (comparesData_)
    return curve_->GetKey(0)->GetGeData().IsEqual(curve_->GetKey(1)->GetGeData());
  KeyValues first;
  KeyValues last;
  curve_->GetKeyValues(0, first);
  curve_->GetKeyValues(1, last);
  return first.value == last.value;
}

void SampledTrack::Finish()
{
  if (!track_)
    return;
  if (hasPending_)
    AddSampledKey(pendingTime_, pending_);
  if (IsConstant())
    track_.reset();
  else
    curve_->Trim();
  Insert();
}

void SampledTrack::Insert()
{
  if (track_ && object_->InsertTrackLast(track_.get()))
    static_cast<void>(track_.release()); // the object owns it now
}

VectorTracks::VectorTracks(BaseObject* object, Long parameter, const char* const (&names)[3])
    : tracks_{{object, ComponentPath(parameter, 0), names[0]},
              {object, ComponentPath(parameter, 1), names[1]},
              {object, ComponentPath(parameter, 2), names[2]}}
{}

void VectorTracks::Reserve(Long count)
{
  for (SampledTrack& track : tracks_)
    track.Reserve(count);
}

void VectorTracks::Add(const BaseTime& time, const Vector& value)
{
  tracks_[0].Add(time, value.x);
  tracks_[1].Add(time, value.y);
  tracks_[2].Add(time, value.z);
}

void VectorTracks::Finish()
{
  for (SampledTrack& track : tracks_)
    track.Finish();
}

void VectorTracks::Insert()
{
  for (SampledTrack& track : tracks_)
    track.Insert();
}

bool SampleStream(ExportContext& context, HostCalls& host, AEGP_StreamRefH stream, std::span<SampledTrack> tracks,
                  const StreamSampling& sampling)
{
  if (!stream || tracks.empty() || !tracks[0])
    return false;
  ValueConverter converter(context, sampling);
  AEGP_StreamVal2 value = {};
  AEGP_StreamVal2 second = {};
  const Long lastFrame = LastFrame(context);
  for (Long frame = 0; frame <= lastFrame; ++frame) {
    const A_Time time = FrameTime(context, frame);
    ReadStream(host, stream, time, value);
    if (sampling.secondStream)
      ReadStream(host, sampling.secondStream, time, second);
    if (!host.Good())
      break;
    const BaseTime keyTime = KeyTime(context, frame);
    const std::array<Real, 3> values = converter.Convert(value, second);
    for (std::size_t i = 0; i < tracks.size() && i < values.size(); ++i)
      tracks[i].Add(keyTime, values[i]);
  }
  for (SampledTrack& track : tracks)
    track.Finish();
  return host.Good();
}

bool SampleTransform(ExportContext& context, HostCalls& host, const HostStream& anchorStream,
                     const HostStream& scaleStream, TransformTracks& tracks, const TransformRules& rules)
{
  if (!context.positionStream || !context.rotateXStream || !context.rotateYStream || !context.rotateZStream ||
      !context.orientationStream)
    return false;
  LayerSample sample;
  TransformConverter converter(rules);
  const Long lastFrame = LastFrame(context);
  for (VectorTracks* vector : {&tracks.position, &tracks.rotation, &tracks.scale})
    vector->Reserve(lastFrame + 1);
  for (Long frame = 0; frame <= lastFrame; ++frame) {
    if (!ReadLayerSample(host, context, anchorStream, scaleStream, FrameTime(context, frame), rules, sample))
      break;
    const SceneTransform& transform = converter.Convert(sample);
    const BaseTime keyTime = KeyTime(context, frame);
    tracks.position.Add(keyTime, transform.position);
    tracks.rotation.Add(keyTime, transform.rotation);
    tracks.scale.Add(keyTime, transform.scale);
  }
  for (VectorTracks* vector : {&tracks.position, &tracks.rotation, &tracks.scale})
    vector->Finish();
  return host.Good();
}

} // namespace exporter
