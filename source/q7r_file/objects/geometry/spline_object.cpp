#include "torvane/objects/spline_object.h"

#include "k2v_file/values/container_defaults.h"
#include "q7r_file/objects/geometry/geometry_tags.h"
#include "torvane/objects/point_object_data.h"

namespace _torvane_
{

namespace
{

constexpr ContainerDefault kSplineDefaults[] = {
    {kSplineType, DefaultForm::kLong, kSplineLinear},
    {1001, DefaultForm::kLong, 3},
    {1002, DefaultForm::kBool, 0},
    {1003, DefaultForm::kLong, 8},
    {1004, DefaultForm::kReal, 0.08726646259971647}, // five degrees
    {1005, DefaultForm::kReal, 5.0},
};

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

SplineObject::SplineObject(Long type) : PointObject(type) { data_.SetDefaults(DefaultsOf<kSplineDefaults>()); }

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
