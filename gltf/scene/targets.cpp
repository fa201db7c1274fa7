#include "gltf/scene/targets.h"

#include <algorithm>
#include <limits>
#include <unordered_set>

#include "torvane/tags/base_tag.h"

namespace gltf
{

using namespace _torvane_;

namespace
{

constexpr int kMaxDepth = 64; // of targets whose ancestors have targets; beyond it own angles count
constexpr std::size_t kObjectsPerCost = 16;

std::size_t LinkedTarget(const SceneTree& tree, const BaseObject& object)
{
  const BaseTag* tag = object.GetTag(kTagTarget);
  return tag ? tree.Find(tag->GetDataInstance().GetLink(kTargetLink)) : kNone;
}

} // namespace

Targets::Targets(const SceneTree& tree, const ByObject<const Motion>& motions) : tree_(tree), motions_(motions)
{
  for (std::size_t i = 0; i < tree.Count(); ++i) {
    const std::size_t target = LinkedTarget(tree, *tree[i].object);
    if (target == kNone)
      continue;
    if (targets_.empty()) {
      targets_.assign(tree.Count(), kNone);
      worlds_.resize(tree.Count());
    }
    targets_[i] = target;
  }
}

void Targets::NewTime() { ++stamp_; }

Matrix Targets::RestOf(std::size_t index)
{
  NewTime();
  return RotationAt(index, std::nullopt);
}

Matrix Targets::RotationAt(std::size_t index, const std::optional<Real>& time)
{
  const std::size_t parent = tree_[index].parent;
  const Matrix world = parent == kNone ? Matrix() : WorldOf(parent, time, 0);
  return PlaceOf(index, time, world, 0).rotation;
}

// Down from the nearest ancestor whose place is known at this time.
Matrix Targets::WorldOf(std::size_t index, const std::optional<Real>& time, int depth)
{
  std::vector<std::size_t> chain;
  std::size_t top = index;
  for (; top != kNone && worlds_[top].stamp != stamp_; top = tree_[top].parent)
    chain.push_back(top);
  Matrix world = top == kNone ? Matrix() : worlds_[top].matrix;
  for (auto one = chain.rbegin(); one != chain.rend(); ++one) {
    world = Multiply(world, PlaceOf(*one, time, world, depth).AsMatrix());
    worlds_[*one].matrix = world;
    worlds_[*one].stamp = stamp_;
  }
  return world;
}

// Where an object is. Its own rotation, and with it what it looks at, has no part in that.
Vector Targets::PointOf(std::size_t index, const std::optional<Real>& time, int depth)
{
  const std::size_t parent = tree_[index].parent;
  const Matrix world = parent == kNone ? Matrix() : WorldOf(parent, time, depth);
  return world * OwnPlaceOf(index, time).position;
}

Place Targets::OwnPlaceOf(std::size_t index, const std::optional<Real>& time) const
{
  return time && motions_[index] ? motions_[index]->At(*time) : gltf::RestOf(*tree_[index].object);
}

Place Targets::PlaceOf(std::size_t index, const std::optional<Real>& time, const Matrix& parent, int depth)
{
  Place place = OwnPlaceOf(index, time);
  if (targets_[index] != kNone && !worlds_[index].busy && depth < kMaxDepth) {
    worlds_[index].busy = true;
    place.rotation = LookFrom(index, place.position, time, parent, depth + 1);
    worlds_[index].busy = false;
  }
  return place;
}

Matrix Targets::LookFrom(std::size_t index, const Vector& from, const std::optional<Real>& time, const Matrix& parent,
                         int depth)
{
  const Vector to = Invert(parent) * PointOf(targets_[index], time, depth);
  Matrix frame = LookAtMatrix(from, to, from + Vector(0.0, 1.0, 0.0));
  frame.off = Vector();
  return frame;
}

Targets::Span Targets::SpanOf(std::size_t index)
{
  Span span = {std::numeric_limits<Real>::infinity(), -std::numeric_limits<Real>::infinity(), 0};
  std::unordered_set<std::size_t> seen = {index};
  std::vector<std::size_t> open = {index}; // whose rotations have a part in it
  auto take = [&](std::size_t one) {
    ++span.objects;
    if (motions_[one]) {
      span.first = std::min(span.first, motions_[one]->First());
      span.last = std::max(span.last, motions_[one]->Last());
    }
    for (std::size_t above = tree_[one].parent; above != kNone && seen.insert(above).second;
         above = tree_[above].parent)
      open.push_back(above);
  };
  while (!open.empty()) {
    const std::size_t one = open.back();
    open.pop_back();
    take(one);
    if (targets_[one] != kNone)
      take(targets_[one]);
  }
  return span;
}

Samples Targets::Rotation(std::size_t index, Timeline& timeline, Output& output)
{
  const Span span = SpanOf(index);
  if (!(span.first < span.last))
    return {};
  std::vector<Real> times = timeline.Between(span.first, span.last, 1 + span.objects / kObjectsPerCost);
  times.insert(times.begin(), span.first);
  times.push_back(span.last);
  SampleWriter writer(4, timeline, output);
  for (const Real time : times) {
    NewTime();
    const Quaternion q = ToQuaternion(RotationAt(index, time));
    const Real values[] = {q.x, q.y, q.z, q.w};
    writer.Add(time, values);
  }
  Samples samples = writer.Take();
  MakeContinuous(samples);
  Thin(samples, 0.0);
  return samples;
}

} // namespace gltf
