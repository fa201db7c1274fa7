#include "exporter/walk/plane.h"

#include "exporter/walk/layer_transform.h"
#include "exporter/walk/scene_parameters.h"

namespace exporter
{

using namespace _torvane_;

namespace
{

void SetPlaneParameters(BaseObject& plane, Real width, Real height)
{
  plane.SetParameterById(kPlaneWidth, width);
  plane.SetParameterById(kPlaneHeight, height);
  plane.SetParameterById(kPlaneWidthSegments, Long{1});
  plane.SetParameterById(kPlaneHeightSegments, Long{1});
  plane.SetParameterById(kPlaneAxis, kPlaneAxisTowardsViewer);
}

} // namespace

BaseObject* ExportPlane(ExportContext& context, AEGP_ItemH item, AEGP_FootageH, bool isSolid, bool)
{
  if (!item)
    return nullptr;
  HostCalls host(*context.suites);
  AEGP_LayerFlags flags = AEGP_LayerFlag_NONE;
  A_long width = 0;
  A_long height = 0;
  host(&AEGP_LayerSuite13::AEGP_GetLayerFlags, context.layer, &flags);
  const bool isNull = isSolid && (flags & AEGP_LayerFlag_NULL_LAYER) != 0;
  BaseObject* object = AllocObject(isNull ? kObjectNull : kObjectPlane);
  if (!object)
    return nullptr;
  context.document->InsertObject(object);
  context.object = object;
  host(&AEGP_ItemSuite13::AEGP_GetItemDimensions, item, &width, &height);
  if (!ExportTransform(context, width, height))
    return nullptr;
  if (!isNull)
    SetPlaneParameters(*object, width, height);
  return host.Good() ? object : nullptr;
}

} // namespace exporter
