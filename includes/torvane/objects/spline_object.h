// Splines: points that are joined by curves, in segments.
#pragma once

#include "torvane/objects/point_object.h"

namespace _torvane_
{

class SegmentTag;
class TangentTag;

inline constexpr Long kSplineType = 1000; // Long, in the container; kSplineLinear after construction

// Splines of the types 1, 2 and 4 have tangents.
inline constexpr Long kSplineLinear = 0;

inline constexpr Long kMaxSplinePoints = 100000000;

class SplineObject : public PointObject
{
 public:
  static constexpr NodeKindOf<SplineObject> kNodeKind{"spline", &PointObject::kNodeKind};
  const NodeKind& GetNodeKind() const override { return kNodeKind; }

  // Sets the defaults of the container.
  explicit SplineObject(Long type = kObjectSpline);

  Bool IsInstanceOf(Long type) const override { return type == kObjectSpline || PointObject::IsInstanceOf(type); }
  Long GetDiskType() const override { return kObjectSpline; }
  // Also takes the chunks of the object data, which stand among the object's own. A spline without a name is called
  // "Spline".
  Bool ReadChunk(HyperFile& file, Long id, Long level) override;

 protected:
  BaseObject* MakeEmpty() const override { return NewObj<SplineObject>(GetType()); }
};

// Null where an object has none.
SegmentTag* GetSegmentTag(const BaseObject& object);
TangentTag* GetTangentTag(const BaseObject& object);

// A new spline of a type with so many points at the origin. Null for more than kMaxSplinePoints and when memory is
// short. The caller owns it.
SplineObject* AllocSpline(Long points, Long type);

// Makes or deletes the tangents as the type asks, and stores it. False when memory is short: the type is the old one.
Bool SetSplineType(BaseObject& object, Long type);

// Gives the spline so many points, and tangents where it has them, and segments. New entries are zero. 0 segments
// deletes their tag, -1 leaves it as it is; 0 points leaves the tangents as they are, a negative number all of this.
// False when memory is short: the other parts are resized all the same.
Bool ResizeSpline(BaseObject& object, Long points, Long segments);

} // namespace _torvane_
