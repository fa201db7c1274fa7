#include "exporter/walk/light.h"

#include "exporter/walk/layer_transform.h"
#include "exporter/walk/value_stream.h"
#include "torvane/objects/light_parameters.h"

namespace exporter
{

using namespace _torvane_;

namespace
{

constexpr Real kPercent = 100.0;

// In the order in which the host is asked. What casts shadows can be animated in the host; the scene keeps the state at
// the work area's start.
constexpr ValueStream kValueStreams[] = {
    {AEGP_LayerStream_INTENSITY, {kLightBrightness, "Intensity"}, SampleMode::kValue, kPercent},
    {AEGP_LayerStream_CASTS_SHADOWS, {kLightShadow}, SampleMode::kSwitch},
    {AEGP_LayerStream_SHADOW_DARKNESS, {kLightShadowDensity, "Shadow Density"}, SampleMode::kValue, kPercent},
    {AEGP_LayerStream_COLOR, {kLightColor}, SampleMode::kColor},
};

// The cone of a spot light: the outer angle, and the inner one that the feather leaves.
constexpr ValueStream kCone = {
    .stream = AEGP_LayerStream_CONE_ANGLE,
    .parameter = {kLightOuterAngle, "Outer Angle"},
    .mode = SampleMode::kCone,
    .secondParameter = {kLightInnerAngle, "Inner Angle"},
    .secondStream = AEGP_LayerStream_CONE_FEATHER,
};

LightType ToLightType(AEGP_LightType type)
{
  switch (type) {
  case AEGP_LightType_SPOT:
    return kLightSpot;
  case AEGP_LightType_POINT:
    return kLightPoint;
  default:
    return kLightOther;
  }
}

} // namespace

bool ExportLight(ExportContext& context)
{
  BaseObject* light = AllocObject(kObjectLight);
  if (!light)
    return false;
  context.document->InsertObject(light);
  context.object = light;
  HostCalls host(*context.suites);
  AEGP_LightType type = AEGP_LightType_AMBIENT;
  host(&AEGP_LightSuite2::AEGP_GetLightType, context.layer, &type);
  light->SetParameterById(kLightType, Long{ToLightType(type)});
  if (!ExportTransform(context, 0, 0))
    return false;
  for (const ValueStream& row : kValueStreams)
    ExportValueStream(context, host, row);
  if (type == AEGP_LightType_SPOT)
    ExportValueStream(context, host, kCone);
  return host.Good();
}

} // namespace exporter
