// Objects that look at a target: their rotation, still and in motion.
#pragma once

#include <cstdint>
#include <optional>
#include <vector>

#include "gltf/motion/motion.h"
#include "gltf/scene/scene_tree.h"

namespace gltf
{

// Works out where objects are in the world. Targets that look at each other in a loop are taken by their own angles
// where the loop closes.
class Targets
{
 public:
  // Both must outlive this.
  Targets(const SceneTree& tree, const ByObject<const Motion>& motions);

  // What an object looks at: its index, or kNone.
  std::size_t TargetOf(std::size_t index) const { return targets_.empty() ? kNone : targets_[index]; }
  // The rotation of an object that has a target, in its parent's frame, with every object at rest.
  Matrix RestOf(std::size_t index);
  // The same at every frame from the first to the last key of all that has a part in it; empty where none moves.
  Samples Rotation(std::size_t index, Timeline& timeline, Output& output);

 private:
  struct Span // what a rotation depends on
  {
    Real first;
    Real last;
    std::size_t objects;
  };

  Matrix RotationAt(std::size_t index, const std::optional<Real>& time);
  Matrix WorldOf(std::size_t index, const std::optional<Real>& time, int depth);
  Vector PointOf(std::size_t index, const std::optional<Real>& time, int depth);
  Place OwnPlaceOf(std::size_t index, const std::optional<Real>& time) const;
  Place PlaceOf(std::size_t index, const std::optional<Real>& time, const Matrix& parent, int depth);
  Matrix LookFrom(std::size_t index, const Vector& from, const std::optional<Real>& time, const Matrix& parent,
                  int depth);
  Span SpanOf(std::size_t index);
  void NewTime();

  const SceneTree& tree_;
  const ByObject<const Motion>& motions_;
  std::vector<std::size_t> targets_; // by object; empty if no object has one
  struct World
  {
    Matrix matrix;
    std::uint32_t stamp = 0; // when it was worked out
    bool busy = false;       // it is being worked out
  };
  std::vector<World> worlds_;
  std::uint32_t stamp_ = 0;
};

} // namespace gltf
