// What the library asks of its client, memory aside.
#include "exporter/client/alien_nodes.h"
#include "torvane/ge_string.h"
#include "torvane/hooks.h"

namespace exporter
{

using namespace _torvane_;

namespace
{

constexpr Long kWriterId = 1027408;
constexpr const char* kWriterName = "Krokior";

Long MaterialCounter = 0; // the number of the next material that runs

} // namespace

// Polygon objects stand under a label of their own in a file.
BaseObject* AlienRootObject::AllocMember(Long type)
{
  return AllocObject(type == kObjectPolygonLabel ? kObjectPolygon : type);
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
