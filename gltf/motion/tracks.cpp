#include "gltf/motion/tracks.h"

#include <algorithm>
#include <iterator>
#include <set>
#include <utility>

#include "torvane/animation/ctrack.h"
#include "torvane/objects/base_object.h"
#include "torvane/objects/camera_object_data.h"
#include "torvane/objects/light_parameters.h"

namespace gltf
{

using namespace _torvane_;

namespace
{

constexpr Long kTimeTrack = -1;
constexpr int kWhole = -1;
constexpr int kNoComponent = -2;

int ComponentOf(const ParameterPath& path)
{
  if (path.GetLevelCount() < 2)
    return kWhole;
  const Long id = path[1].id;
  return path.GetLevelCount() == 2 && id >= kVectorX && id <= kVectorZ ? id - kVectorX : kNoComponent;
}

Loss LossOf(Long id)
{
  switch (id) {
  case kTimeTrack:
    return Loss::kTimeTrack;
  case kCameraFocusDistance:
    return Loss::kFocusTrack;
  case kLightShadowDensity:
    return Loss::kShadowTrack;
  case kObjectEditorMode:
  case kObjectRenderMode:
  case kObjectEnabled:
    return Loss::kVisibilityTrack;
  default:
    return Loss::kOtherTrack;
  }
}

// Parameters whose keys may go into a file.
bool HasCounterpart(Long id)
{
  constexpr Long kIds[] = {kObjectRelPos,    kObjectRelRot,      kObjectRelScale,    kObjectFrozenPos,
                           kObjectFrozenRot, kObjectFrozenScale, kObjectAbsPos,      kObjectAbsRot,
                           kObjectAbsScale,  kCameraFieldOfView, kCameraFocalLength, kCameraApertureWidth,
                           kLightColor,      kLightBrightness,   kLightInnerAngle,   kLightOuterAngle};
  return std::find(std::begin(kIds), std::end(kIds), id) != std::end(kIds);
}

const CCurve* CurveOf(CTrack& track)
{
  const CCurve* curve = track.GetCurve(1, 0);
  return curve && curve->GetKeyCount() > 0 ? curve : nullptr;
}

} // namespace

TrackSet::TrackSet(const BaseList2D& node)
{
  std::set<std::pair<Long, int>> seen;
  for (CTrack* track = node.GetFirstTrack(); track; track = track->GetNext()) {
    const ParameterPath& path = track->GetPath();
    const Track entry = {path[0].id, ComponentOf(path), CurveOf(*track), false};
    if (entry.curve && seen.insert({entry.id, entry.component}).second)
      tracks_.push_back(entry);
  }
}

const CCurve* TrackSet::Take(Long id, int component)
{
  for (Track& track : tracks_) {
    if (track.id == id && track.component == component) {
      track.used = true;
      return track.curve;
    }
  }
  return nullptr;
}

void TrackSet::TakeVector(Long id, const Vector& still, Input (&inputs)[3])
{
  const Real values[] = {still.x, still.y, still.z};
  for (int c = 0; c < 3; ++c)
    inputs[c] = {Take(id, c), values[c]};
}

void TrackSet::TakeAll()
{
  for (Track& track : tracks_)
    track.used = true;
}

void TrackSet::TellRest(Account& account) const
{
  for (const Track& track : tracks_) {
    if (!track.used)
      account.Tell(LossOf(track.id));
  }
}

std::size_t TrackSet::CountKeys() const
{
  std::size_t count = 0;
  for (const Track& track : tracks_)
    count += static_cast<std::size_t>(track.curve->GetKeyCount());
  return count;
}

Real TrackSet::Earliest() const
{
  Real earliest = 0.0;
  for (const Track& track : tracks_) {
    KeyValues first;
    if (HasCounterpart(track.id) && track.curve->GetKeyValues(0, first))
      earliest = std::min(earliest, first.time.Get());
  }
  return std::max(earliest, -kTimeLimit);
}

void TellTracks(const BaseList2D& node, Loss loss, Account& account)
{
  for (CTrack* track = node.GetFirstTrack(); track; track = track->GetNext()) {
    if (CurveOf(*track))
      account.Tell(loss);
  }
}

} // namespace gltf
