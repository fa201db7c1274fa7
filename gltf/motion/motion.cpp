#include "gltf/motion/motion.h"

#include <algorithm>
#include <limits>

namespace gltf
{

using namespace _torvane_;

namespace
{

constexpr double kMetre = 1.0; // the least size that places are thinned by

Vector MultiplyEach(const Vector& a, const Vector& b) { return {a.x * b.x, a.y * b.y, a.z * b.z}; }

void Store(const Vector& v, Real* values)
{
  values[0] = v.x;
  values[1] = v.y;
  values[2] = v.z;
}

} // namespace

Place RestOf(const BaseObject& object)
{
  Place place;
  place.rotation = object.GetNormalizedLocalMatrix();
  place.position = place.rotation.off;
  place.rotation.off = Vector();
  place.scale = object.GetAbsScale();
  return place;
}

Motion::Motion(const BaseObject& object, TrackSet& tracks)
    : order_(object.GetRotationOrder()), first_(std::numeric_limits<Real>::infinity()), last_(-first_)
{
  tracks.TakeVector(kObjectRelPos, object.GetRelPos(), inputs_[kRelPos]);
  tracks.TakeVector(kObjectRelRot, object.GetRelRot(), inputs_[kRelRot]);
  tracks.TakeVector(kObjectRelScale, object.GetRelScale(), inputs_[kRelScale]);
  tracks.TakeVector(kObjectFrozenPos, object.GetFrozenPos(), inputs_[kFrozenPos]);
  tracks.TakeVector(kObjectFrozenRot, object.GetFrozenRot(), inputs_[kFrozenRot]);
  tracks.TakeVector(kObjectFrozenScale, object.GetFrozenScale(), inputs_[kFrozenScale]);
  tracks.TakeVector(kObjectAbsPos, object.GetAbsPos(), inputs_[kAbsPos]);
  tracks.TakeVector(kObjectAbsRot, object.GetAbsRot(), inputs_[kAbsRot]);
  tracks.TakeVector(kObjectAbsScale, object.GetAbsScale(), inputs_[kAbsScale]);
  frozenTurns_ = HasTracks(kFrozenRot);
  frozen_ = object.GetFrozenTransformMatrix();
  frozen_.off = Vector();
  for (const auto& vector : inputs_) {
    for (const Input& input : vector) {
      if (!input.curve)
        continue;
      KeyValues key;
      input.curve->GetKeyValues(0, key);
      first_ = std::min(first_, key.time.Get());
      input.curve->GetKeyValues(input.curve->GetKeyCount() - 1, key);
      last_ = std::max(last_, key.time.Get());
    }
  }
}

bool Motion::HasTracks(Which which) const
{
  return std::any_of(std::begin(inputs_[which]), std::end(inputs_[which]),
                     [](const Input& input) { return input.curve != nullptr; });
}

Motion::State Motion::StateAt(Real time) const
{
  State state;
  for (int which = 0; which < kCount; ++which) {
    for (int c = 0; c < 3; ++c) {
      const Input& input = inputs_[which][c];
      state.values[which][c] = input.curve ? input.curve->GetValue(time) : input.still;
    }
  }
  return state;
}

Vector Motion::WithTracks(Which absolute, const State& state, Vector derived) const
{
  Real values[3];
  Store(derived, values);
  for (int c = 0; c < 3; ++c) {
    if (inputs_[absolute][c].curve)
      values[c] = state.values[absolute][c];
  }
  return {values[0], values[1], values[2]};
}

Matrix Motion::FrozenRotation(const State& state) const
{
  return frozenTurns_ ? AnglesToMatrix(state[kFrozenRot], order_) : frozen_;
}

Vector Motion::PositionOf(const State& state) const
{
  return WithTracks(kAbsPos, state, FrozenRotation(state) * state[kRelPos] + state[kFrozenPos]);
}

Matrix Motion::RotationOf(const State& state) const
{
  if (HasTracks(kAbsRot))
    return AnglesToMatrix(state[kAbsRot], order_);
  return Multiply(FrozenRotation(state), AnglesToMatrix(state[kRelRot], order_));
}

Vector Motion::ScaleOf(const State& state) const
{
  return WithTracks(kAbsScale, state, MultiplyEach(state[kRelScale], state[kFrozenScale]));
}

Place Motion::At(Real time) const
{
  const State state = StateAt(time);
  return {RotationOf(state), PositionOf(state), ScaleOf(state)};
}

template <class Compute>
Samples Motion::SampleOf(std::initializer_list<Which> from, std::size_t width, bool bent, Timeline& timeline,
                         Output& output, Compute&& compute) const
{
  State state;
  std::vector<Input> inputs;
  std::vector<Real*> places;
  for (int which = 0; which < kCount; ++which) {
    for (int c = 0; c < 3; ++c) {
      state.values[which][c] = inputs_[which][c].still;
      if (inputs_[which][c].curve && std::find(from.begin(), from.end(), which) != from.end()) {
        inputs.push_back(inputs_[which][c]);
        places.push_back(&state.values[which][c]);
      }
    }
  }
  if (inputs.empty())
    return {};
  const Shape shape = {width, bent, [&](const Real* values, Real* out) {
                         for (std::size_t i = 0; i < places.size(); ++i)
                           *places[i] = values[i];
                         compute(state, out);
                       }};
  return Sample(inputs, shape, timeline, output);
}

Samples Motion::Translation(Real unit, Timeline& timeline, Output& output) const
{
  Samples samples = SampleOf({kRelPos, kFrozenPos, kFrozenRot, kAbsPos}, 3, frozenTurns_, timeline, output,
                             [&](const State& state, Real* out) { Store(ToPlace(PositionOf(state), unit), out); });
  Thin(samples, kMetre);
  return samples;
}

Samples Motion::Rotation(Timeline& timeline, Output& output) const
{
  Samples samples =
      SampleOf({kRelRot, kFrozenRot, kAbsRot}, 4, true, timeline, output, [&](const State& state, Real* out) {
        const Quaternion q = ToQuaternion(RotationOf(state));
        out[0] = q.x;
        out[1] = q.y;
        out[2] = q.z;
        out[3] = q.w;
      });
  MakeContinuous(samples);
  Thin(samples, 0.0);
  return samples;
}

Samples Motion::Scale(Timeline& timeline, Output& output) const
{
  const bool bent = HasTracks(kRelScale) && HasTracks(kFrozenScale);
  Samples samples = SampleOf({kRelScale, kFrozenScale, kAbsScale}, 3, bent, timeline, output,
                             [&](const State& state, Real* out) { Store(ScaleOf(state), out); });
  Thin(samples, 0.0);
  return samples;
}

} // namespace gltf
