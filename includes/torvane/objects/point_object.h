// Objects that consist of points. The geometry itself is in value tags, an entry for each point or polygon; the
// operations here keep all tags of an object in step.
//
// The operations take any object, and look for tags and data by what they are: reading a file may give an object of a
// plain class the type of a polygon object.
#pragma once

#include "torvane/objects/base_object.h"

namespace _torvane_
{

class PointTag;
class PolygonObjectData;
class PolygonTag;

// An object of points that are joined by nothing, and the base of those that join them.
class PointObject : public BaseObject
{
 public:
  static constexpr NodeKindOf<PointObject> kNodeKind{"point object", &BaseObject::kNodeKind};
  const NodeKind& GetNodeKind() const override { return kNodeKind; }

  explicit PointObject(Long type = kObjectPoint) : BaseObject(type) {}

  Bool IsInstanceOf(Long type) const override { return type == kObjectPoint || BaseObject::IsInstanceOf(type); }
  Long GetDiskType() const override { return kObjectPoint; }

 protected:
  BaseObject* MakeEmpty() const override { return NewObj<PointObject>(GetType()); }
};

// Its object data come from the client (PolygonObjectData or a class derived from it) and give the label in a file.
class PolygonObject : public PointObject
{
 public:
  static constexpr NodeKindOf<PolygonObject> kNodeKind{"polygon object", &PointObject::kNodeKind};
  const NodeKind& GetNodeKind() const override { return kNodeKind; }

  explicit PolygonObject(Long type = kObjectPolygon) : PointObject(type) {}

  Bool IsInstanceOf(Long type) const override { return type == kObjectPolygon || PointObject::IsInstanceOf(type); }
  // The label comes from the object data, as for most objects.
  // NOLINTNEXTLINE(bugprone-parent-virtual-call)
  Long GetDiskType() const override { return BaseObject::GetDiskType(); }

 protected:
  BaseObject* MakeEmpty() const override { return NewObj<PolygonObject>(GetType()); }
};

// Null where an object has none.
PointTag* GetPointTag(const BaseObject& object);
PolygonTag* GetPolygonTag(const BaseObject& object);
PolygonObjectData* GetPolygonData(const BaseObject& object);
// The entries of those tags; 0 without one.
Long GetPointCount(const BaseObject& object);
Long GetPolygonCount(const BaseObject& object);

// Gives the object `count` points, and its vertex map and normal tags as many entries. New entries are zero. The point
// tag is made when there is none. A negative count changes nothing. False when memory is short: what was resized before
// stays so.
Bool ResizePoints(BaseObject& object, Long count);

// Points as above; polygons with the texture coordinates; n-gons. A negative number leaves its count alone; 0 n-gons
// frees them. 0 polygons leaves a filled polygon tag as it is, and takes the texture coordinates away. False when
// memory is short, and for n-gons of an object that can't hold them: what was done before stays so.
Bool ResizePolygons(BaseObject& object, Long points, Long polygons, Long ngons);

// Inserts a tag with texture coordinates, all zero, for each polygon. False when memory is short.
Bool AddUVWTag(BaseObject& object);

} // namespace _torvane_
