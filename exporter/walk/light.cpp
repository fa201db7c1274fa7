#include "exporter/walk/light.h"

#include "exporter/walk/keyframes.h"
#include "exporter/walk/layer_transform.h"
#include "exporter/walk/scene_parameters.h"

namespace exporter
{

using namespace _torvane_;

namespace
{

constexpr const char* kColorTrackNames[] = {"Color.R", "Color.G", "Color.B"};

// A value in percent, animated.
void ExportPercentage(ExportContext& context, HostCalls& host, AEGP_LayerStream which, Long parameter,
                      const char* trackName)
{
  HostStream stream;
  stream.Open(host, context.layer, which);
  if (!stream)
    return;
  constexpr Real kPercent = 100.0;
  AEGP_StreamVal2 value = {};
  if (ReadStream(host, stream.Get(), context.workAreaStart, value))
    context.object->SetParameterById(parameter, value.one_d / kPercent);
  if (StreamVaries(host, stream.Get()) > 0) {
    SampledTrack track(context.object, parameter, trackName);
    SampleStream(context, host, stream.Get(), {&track, 1}, {.mode = SampleMode::kValue, .divisor = kPercent});
  }
  stream.Dispose(host);
}

// A switch in the host that can be animated there; the scene keeps its state at the work area's start.
void ExportShadow(ExportContext& context, HostCalls& host)
{
  HostStream stream;
  stream.Open(host, context.layer, AEGP_LayerStream_CASTS_SHADOWS);
  AEGP_StreamVal2 value = {};
  if (stream && ReadStream(host, stream.Get(), context.workAreaStart, value))
    context.object->SetParameterById(kLightShadow, value.one_d == 0.0 ? kLightShadowNone : kLightShadowOn);
  stream.Dispose(host);
}

void ExportColor(ExportContext& context, HostCalls& host)
{
  HostStream stream;
  stream.Open(host, context.layer, AEGP_LayerStream_COLOR);
  if (!stream)
    return;
  AEGP_StreamVal2 value = {};
  AEGP_StreamType type = 0;
  if (ReadStream(host, stream.Get(), context.workAreaStart, value))
    context.object->SetParameterById(kLightColor, Vector(value.color.redF, value.color.greenF, value.color.blueF));
  host(&AEGP_StreamSuite9::AEGP_GetStreamType, stream.Get(), &type); // only its failure counts
  if (StreamVaries(host, stream.Get()) > 0) {
    VectorTracks tracks(context.object, kLightColor, kColorTrackNames);
    if (tracks)
      SampleStream(context, host, stream.Get(), tracks.All(), {.mode = SampleMode::kColor});
  }
  stream.Dispose(host);
}

// The cone of a spot light: the outer angle, and the inner one that the feather leaves.
void ExportCone(ExportContext& context, HostCalls& host)
{
  HostStream angle;
  HostStream feather;
  angle.Open(host, context.layer, AEGP_LayerStream_CONE_ANGLE);
  feather.Open(host, context.layer, AEGP_LayerStream_CONE_FEATHER);
  if (!angle || !feather)
    return;
  AEGP_StreamVal2 outer = {};
  AEGP_StreamVal2 percent = {};
  ReadStream(host, angle.Get(), context.workAreaStart, outer);
  if (ReadStream(host, feather.Get(), context.workAreaStart, percent)) {
    context.object->SetParameterById(kLightOuterAngle, DegreesToRadians(outer.one_d));
    context.object->SetParameterById(kLightInnerAngle, InnerAngle(outer.one_d, percent.one_d));
  }
  const bool angleVaries = StreamVaries(host, angle.Get()) > 0;
  const bool featherVaries = StreamVaries(host, feather.Get()) > 0;
  if (angleVaries || featherVaries) {
    SampledTrack tracks[] = {{context.object, kLightOuterAngle, "Outer Angle"},
                             {context.object, kLightInnerAngle, "Inner Angle"}};
    if (tracks[0] && tracks[1])
      SampleStream(context, host, angle.Get(), tracks, {.mode = SampleMode::kCone, .secondStream = feather.Get()});
  }
  angle.Dispose(host);
  feather.Dispose(host);
}

Long ToLightType(AEGP_LightType type)
{
  switch (type) {
  case AEGP_LightType_SPOT:
    return kLightTypeSpot;
  case AEGP_LightType_POINT:
    return kLightTypePoint;
  default:
    return kLightTypeOther;
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
  light->SetParameterById(kLightType, ToLightType(type));
  if (!ExportTransform(context, 0, 0))
    return false;
  ExportPercentage(context, host, AEGP_LayerStream_INTENSITY, kLightIntensity, "Intensity");
  ExportShadow(context, host);
  ExportPercentage(context, host, AEGP_LayerStream_SHADOW_DARKNESS, kLightShadowDensity, "Shadow Density");
  ExportColor(context, host);
  if (type == AEGP_LightType_SPOT)
    ExportCone(context, host);
  return host.Good();
}

} // namespace exporter
