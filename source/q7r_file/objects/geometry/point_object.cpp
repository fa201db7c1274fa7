#include "torvane/objects/point_object.h"

#include "q7r_file/objects/geometry/geometry_tags.h"
#include "torvane/objects/point_object_data.h"

namespace _torvane_
{

PointTag* GetPointTag(const BaseObject& object) { return FindTag<PointTag>(object, kTagPoint); }

PolygonTag* GetPolygonTag(const BaseObject& object) { return FindTag<PolygonTag>(object, kTagPolygon); }

PolygonObjectData* GetPolygonData(const BaseObject& object)
{
  return NodeCast<PolygonObjectData>(object.GetObjectData());
}

Long GetPointCount(const BaseObject& object)
{
  const PointTag* tag = GetPointTag(object);
  return tag ? tag->GetCount() : 0;
}

Long GetPolygonCount(const BaseObject& object)
{
  const PolygonTag* tag = GetPolygonTag(object);
  return tag ? tag->GetCount() : 0;
}

Bool ResizePoints(BaseObject& object, Long count)
{
  if (count < 0 || (count == 0 && GetPointCount(object) == 0))
    return true;
  auto* points = NeedTag<PointTag>(object, kTagPoint);
  return points && points->ResizeTagArray(count) && ResizeTags(object, kTagVertexMap, count) &&
         ResizeTags(object, kTagNormal, count);
}

namespace
{

Bool ResizePolygonTags(BaseObject& object, Long count)
{
  if (count < 0 || (count == 0 && GetPolygonCount(object) == 0))
    return true;
  auto* polygons = NeedTag<PolygonTag>(object, kTagPolygon);
  return polygons && polygons->ResizeTagArray(count) && ResizeTags(object, kTagUVW, count);
}

Bool ResizeNgons(const BaseObject& object, Long count)
{
  if (count < 0)
    return true;
  PolygonObjectData* data = GetPolygonData(object);
  return data ? data->ResizeNgons(count) : count == 0;
}

} // namespace

Bool ResizePolygons(BaseObject& object, Long points, Long polygons, Long ngons)
{
  return ResizePoints(object, points) && ResizePolygonTags(object, polygons) && ResizeNgons(object, ngons);
}

Bool AddUVWTag(BaseObject& object)
{
  auto* tag = NodeCast<UVWTag>(MakeTag(kTagUVW));
  if (tag && !tag->ResizeTagArray(GetPolygonCount(object)))
    DeleteObj(tag);
  object.InsertTag(tag);
  return tag != nullptr;
}

} // namespace _torvane_
