// What stands behind each object type: one table, which the object allocator and the copy of an object's data share.
#include <iterator>

#include "q7r_file/objects/opaque_object_data.h"
#include "q7r_file/types/object_data_makers.h"
#include "torvane/hooks.h"
#include "torvane/objects/base_object.h"
#include "torvane/objects/point_object_data.h"

namespace _torvane_
{

namespace
{

BaseObject* MakeBaseObject(Long type) { return NewObj<BaseObject>(type); }
BaseObject* MakePolygon(Long) { return MakePolygonObject(); }
BaseObject* MakeSpline(Long) { return MakeSplineObject(); }

NodeData* MakePlain(Long) { return NewObj<NodeData>(); }
NodeData* MakePoint(Long) { return MakePointObjectData(); }
NodeData* MakeLight(Long) { return MakeLightObjectData(); }
NodeData* MakeCamera(Long) { return MakeCameraObjectData(); }
// Skies, clouds and skin: a new one writes an empty body at level 0.
NodeData* MakeOpaque(Long type) { return NewObj<OpaqueObjectData>(type, 0, kObjectGeneric); }
// A joint stands under the label of polygon objects.
NodeData* MakeJoint(Long type) { return NewObj<OpaqueObjectData>(type, 0, kObjectPolygonLabel); }

// The client's own polygon data, or the library's for a client that knows none.
NodeData* MakePolygonData(Long type)
{
  Bool known = false;
  NodeData* data = AllocNodeData(type, known);
  return data || known ? data : NewObj<PolygonObjectData>();
}

// The types from `first` to `last`.
struct ObjectClass
{
  Long first;
  Long last;
  BaseObject* (*makeObject)(Long type);
  NodeData* (*makeData)(Long type); // null: the object has none
};

constexpr ObjectClass kObjectClasses[] = {
    {kObjectPolygon, kObjectPolygon, MakePolygon, MakePolygonData},
    {kObjectSpline, kObjectSpline, MakeSpline, MakePoint},
    {kObjectLight, kObjectLight, MakeBaseObject, MakeLight},
    {kObjectCamera, kObjectCamera, MakeBaseObject, MakeCamera},
    {5104, 5107, MakeBaseObject, MakePlain},
    {kObjectPointBased, kObjectPointBased, MakeBaseObject, MakePoint},
    {5109, 5126, MakeBaseObject, MakePlain},
    {5128, 5129, MakeBaseObject, MakePlain},
    {5131, 5131, MakeBaseObject, MakePlain},
    {5133, 5134, MakeBaseObject, MakePlain},
    {5136, 5136, MakeBaseObject, MakePlain},
    {kObjectOldSpline, kObjectOldSpline, MakeSpline, MakePoint},
    {kObjectNull, kObjectNull, MakeBaseObject, MakePlain},
    {5142, 5143, MakeBaseObject, MakePlain},
    {5145, 5150, MakeBaseObject, MakePlain},
    {5153, 5153, MakeBaseObject, MakePlain},
    {kObjectGeneric, kObjectGeneric, MakeBaseObject, nullptr},
    {5159, 5186, MakeBaseObject, MakePlain}, // kObjectPlane among them
    {1001002, 1001003, MakeBaseObject, MakePlain},
    {1001253, 1001253, MakeBaseObject, MakePlain},
    {1002603, 1002603, MakeBaseObject, MakePlain},
    {1007455, 1007455, MakeBaseObject, MakePlain},
    {1008796, 1008796, MakeBaseObject, MakePlain},
    {1008982, 1008982, MakeBaseObject, MakePlain},
    {1010865, 1010865, MakeBaseObject, MakePlain},
    {kObjectSky, kObjectSky, MakeBaseObject, MakeOpaque},
    {kObjectCloudGroup, kObjectCloudGroup, MakeBaseObject, MakeOpaque},
    {kObjectCloud, kObjectCloud, MakeBaseObject, MakeOpaque},
    {kObjectJoint, kObjectJoint, MakeBaseObject, MakeJoint},
    {kObjectSkin, kObjectSkin, MakeBaseObject, MakeOpaque},
    {100004007, 100004007, MakeBaseObject, MakePlain},
    {200000118, 200000118, MakeBaseObject, MakePlain},
};

constexpr Bool IsAscending()
{
  Long before = -1;
  for (const ObjectClass& row : kObjectClasses) {
    if (row.first <= before || row.last < row.first)
      return false;
    before = row.last;
  }
  return true;
}
static_assert(IsAscending(), "the search halves the table");

const ObjectClass* FindObjectClass(Long type)
{
  const ObjectClass* first = kObjectClasses;
  std::size_t count = std::size(kObjectClasses);
  while (count > 0) {
    const ObjectClass* middle = first + count / 2;
    if (type > middle->last) {
      count -= count / 2 + 1;
      first = middle + 1;
    } else if (type < middle->first) {
      count /= 2;
    } else {
      return middle;
    }
  }
  return nullptr;
}

} // namespace

BaseObject* AllocObject(Long type)
{
  AllocationWatch watch;
  const ObjectClass* row = FindObjectClass(type);
  BaseObject* object = row ? row->makeObject(type) : nullptr;
  if (!object || !row->makeData)
    return object;
  NodeData* data = row->makeData(type);
  object->SetObjectData(data);
  if (!data || !data->Init())
    DeleteObj(object);
  return watch.Whole(object);
}

NodeData* AllocObjectDataOfType(Long type, Bool& known)
{
  const ObjectClass* row = FindObjectClass(type);
  known = row && row->makeData;
  return known ? row->makeData(type) : nullptr;
}

} // namespace _torvane_
