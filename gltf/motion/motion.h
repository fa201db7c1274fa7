// How an object moves: its position, rotation and scale in its parent's frame, still and at any time.
#pragma once

#include <vector>

#include "gltf/motion/sampling.h"
#include "gltf/motion/tracks.h"
#include "torvane/objects/base_object.h"

namespace gltf
{

// Position, rotation and scale, of the axes and in the unit of the scene.
struct Place
{
  Matrix rotation; // without offset
  Vector position;
  Vector scale{1.0, 1.0, 1.0};

  Matrix AsMatrix() const
  {
    Matrix matrix = Scaled(rotation, scale);
    matrix.off = position;
    return matrix;
  }
};

// The rest of an object: its own values, the frozen part included.
Place RestOf(const _torvane_::BaseObject& object);

// The tracks that drive an object's place. Relative values move on top of the frozen ones; a component of an absolute
// value with a track counts as it is.
class Motion
{
 public:
  // Takes the tracks of all transform parameters.
  Motion(const _torvane_::BaseObject& object, TrackSet& tracks);

  bool IsStill() const { return first_ > last_; }
  // The times of the first and the last key.
  Real First() const { return first_; }
  Real Last() const { return last_; }
  Place At(Real time) const;

  // The channels, in metres, mirrored and thinned; empty where nothing moves.
  Samples Translation(Real unit, Timeline& timeline, Output& output) const;
  Samples Rotation(Timeline& timeline, Output& output) const;
  Samples Scale(Timeline& timeline, Output& output) const;

 private:
  enum Which
  {
    kRelPos,
    kRelRot,
    kRelScale,
    kFrozenPos,
    kFrozenRot,
    kFrozenScale,
    kAbsPos,
    kAbsRot,
    kAbsScale,
    kCount,
  };
  struct State // the values of all vectors at one time
  {
    Real values[kCount][3];
    Vector operator[](Which which) const { return {values[which][0], values[which][1], values[which][2]}; }
  };

  State StateAt(Real time) const;
  bool HasTracks(Which which) const;
  // The absolute value: derived, but for the components of `absolute` that have a track.
  Vector WithTracks(Which absolute, const State& state, Vector derived) const;
  Matrix FrozenRotation(const State& state) const;
  Vector PositionOf(const State& state) const;
  Matrix RotationOf(const State& state) const;
  Vector ScaleOf(const State& state) const;
  // Samples what the vectors `from` make.
  template <class Compute>
  Samples SampleOf(std::initializer_list<Which> from, std::size_t width, bool bent, Timeline& timeline, Output& output,
                   Compute&& compute) const;

  Input inputs_[kCount][3];
  Long order_;
  bool frozenTurns_;
  Matrix frozen_; // the frozen rotation of the rest
  Real first_;
  Real last_;
};

} // namespace gltf
