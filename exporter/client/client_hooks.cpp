// What the library asks of its client, memory aside.
#include <atomic>

#include "exporter/client/alien_nodes.h"
#include "torvane/hooks.h"
#include "torvane/objects/point_object.h"
#include "torvane/tags/value_tags.h"
#include "torvane/text/ge_string.h"

namespace exporter
{

using namespace _torvane_;

namespace
{

constexpr Long kWriterId = 1027408;
constexpr const char* kWriterName = "Krokior";

std::atomic<Long> MaterialCounter = 0; // the number of the next material that runs

} // namespace

Bool AlienPolygonObjectData::Execute()
{
  const auto* object = NodeCast<BaseObject>(GetNode());
  if (!object)
    return false;
  const PointTag* points = GetPointTag(*object);
  const PolygonTag* polygons = GetPolygonTag(*object);
  const Bool noPoints = !points || points->GetCount() == 0;
  const Bool noPolygons = !polygons || polygons->GetCount() == 0;
  return noPolygons || !noPoints;
}

Bool AlienMaterial::Execute()
{
  materialNumber_ = MaterialCounter++;
  return true;
}

BaseList2D* AlienRootMaterial::AllocMember(Long type)
{
  if (type == kMaterialPlugin)
    return NewObj<AlienBaseMaterial>();
  return NewObj<AlienMaterial>();
}

BaseList2D* AlienRootLayer::AllocMember() { return NewObj<AlienLayer>(); }

BaseList2D* AlienRootRenderData::AllocMember() { return NewObj<AlienRenderData>(); }

} // namespace exporter

namespace _torvane_
{

void GetWriterInfo(Long& id, String& name)
{
  id = exporter::kWriterId;
  name = exporter::kWriterName;
}

NodeData* AllocNodeData(Long type, Bool& known)
{
  known = true;
  switch (type) {
  case kObjectPolygon:
    return NewObj<exporter::AlienPolygonObjectData>();
  case kObjectLight:
    return NewObj<exporter::AlienLightObjectData>();
  case kObjectCamera:
    return NewObj<exporter::AlienCameraObjectData>();
  case kObjectPlane:
    return NewObj<exporter::AlienPrimitiveObjectData>(type);
  default:
    known = false;
    return nullptr;
  }
}

RootObject* AllocRootObject() { return NewObj<exporter::AlienRootObject>(); }

RootMaterial* AllocRootMaterial() { return NewObj<exporter::AlienRootMaterial>(); }

RootLayer* AllocRootLayer() { return NewObj<exporter::AlienRootLayer>(); }

RootRenderData* AllocRootRenderData() { return NewObj<exporter::AlienRootRenderData>(); }

} // namespace _torvane_
