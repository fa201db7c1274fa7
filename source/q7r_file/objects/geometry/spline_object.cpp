#include "torvane/objects/spline_object.h"

#include "q7r_file/objects/geometry/geometry_tags.h"
#include "q7r_file/types/object_data_makers.h"
#include "torvane/objects/point_object_data.h"

namespace _torvane_
{

namespace
{

constexpr Real kFiveDegrees = 0.08726646259971647;

Bool HasTangents(Long type) { return type == 1 || type == 2 || type == 4; }

void DeleteTag(BaseTag* tag)
{
  if (!tag)
    return;
  tag->RemoveFromList();
  DeleteObj(tag);
}

Bool ResizeSegments(BaseObject& object, Long count)
{
  if (count == -1)
    return true;
  if (count < 1) {
    DeleteTag(GetSegmentTag(object));
    return true;
  }
  auto* segments = NeedTag<SegmentTag>(object, kTagSegment);
  return segments && segments->ResizeTagArray(count);
}

} // namespace

BaseObject* MakeSplineObject() { return NewObj<SplineObject>(); }

SplineObject::SplineObject() : PointObject(kObjectSpline)
{
  data_.SetLong(kSplineType, kSplineLinear);
  data_.SetLong(1001, 3);
  data_.SetBool(1002, false);
  data_.SetLong(1003, 8);
  data_.SetReal(1004, kFiveDegrees);
  data_.SetReal(1005, 5.0);
}

Bool SplineObject::ReadChunk(HyperFile& file, Long id, Long level)
{
  if (!PointObject::ReadChunk(file, id, level)) {
    auto* points = NodeCast<PointObjectData>(objectData_);
    return points && points->ReadData(file, id, level);
  }
  if (id == kChunkNodeHeader && !name_.Content())
    name_ = String("Spline");
  return true;
}

SegmentTag* GetSegmentTag(const BaseObject& object) { return FindTag<SegmentTag>(object, kTagSegment); }

TangentTag* GetTangentTag(const BaseObject& object) { return FindTag<TangentTag>(object, kTagTangent); }

Bool SetSplineType(BaseObject& object, Long type)
{
  if (HasTangents(type)) {
    auto* tangents = NeedTag<TangentTag>(object, kTagTangent);
    if (!tangents || !tangents->ResizeTagArray(GetPointCount(object)))
      return false;
  } else {
    DeleteTag(GetTangentTag(object));
  }
  object.GetDataInstance().SetLong(kSplineType, type);
  return true;
}

Bool ResizeSpline(BaseObject& object, Long points, Long segments)
{
  Bool resized = ResizeSegments(object, segments);
  TangentTag* tangents = points > 0 ? GetTangentTag(object) : nullptr;
  if (tangents)
    resized = tangents->ResizeTagArray(points) && resized;
  if (points != GetPointCount(object))
    resized = ResizePoints(object, points) && resized;
  return resized;
}

SplineObject* AllocSpline(Long points, Long type)
{
  if (points > kMaxSplinePoints)
    return nullptr;
  auto* spline = NodeCast<SplineObject>(AllocObject(kObjectSpline));
  if (spline && (!SetSplineType(*spline, type) || (points >= 1 && !ResizeSpline(*spline, points, -1))))
    DeleteObj(spline);
  return spline;
}

} // namespace _torvane_
