#include "exporter/walk/camera.h"

#include <cmath>

#include "exporter/walk/keyframes.h"
#include "exporter/walk/layer_transform.h"
#include "exporter/walk/scene_parameters.h"

namespace exporter
{

using namespace _torvane_;

namespace
{

constexpr Real kDefaultAperture = 36.0;

// Zoom: an angle, animated as one.
void ExportZoom(ExportContext& context, HostCalls& host, Real width)
{
  HostStream zoom;
  zoom.Open(host, context.layer, AEGP_LayerStream_ZOOM);
  if (!zoom)
    return;
  AEGP_StreamVal2 value = {};
  if (ReadStream(host, zoom.Get(), context.workAreaStart, value))
    context.object->SetParameterById(kCameraFieldOfView, FieldOfView(value.one_d, width, context.pixelAspect));
  if (StreamVaries(host, zoom.Get()) > 0) {
    SampledTrack track(context.object, kCameraFieldOfView, "Field of View");
    SampleStream(context, host, zoom.Get(), {&track, 1}, {.mode = SampleMode::kFieldOfView, .width = width});
  }
  zoom.Dispose(host);
}

void ExportFocus(ExportContext& context, HostCalls& host)
{
  HostStream focus;
  focus.Open(host, context.layer, AEGP_LayerStream_FOCUS_DISTANCE);
  if (!focus)
    return;
  AEGP_StreamVal2 value = {};
  if (ReadStream(host, focus.Get(), context.workAreaStart, value))
    context.object->SetParameterById(kCameraFocusDistance, PixelsToMillimetres(value.one_d));
  if (StreamVaries(host, focus.Get()) > 0) {
    SampledTrack track(context.object, kCameraFocusDistance, "Focus Distance");
    SampleStream(context, host, focus.Get(), {&track, 1},
                 {.mode = SampleMode::kValue, .divisor = kPixelsPerMillimetre});
  }
  focus.Dispose(host);
}

} // namespace

Real ApertureWidth(AEGP_FilmSizeUnits units, Real size, Real width, Real height)
{
  Real aperture = kDefaultAperture;
  const Real millimetres = PixelsToMillimetres(size);
  const Real ratio = height / width;
  if (units == AEGP_FilmSizeUnits_HORIZONTAL)
    aperture = millimetres;
  else if (units == AEGP_FilmSizeUnits_VERTICAL)
    aperture = width * millimetres / height;
  else if (units == AEGP_FilmSizeUnits_DIAGONAL)
    aperture = std::sqrt(millimetres * millimetres / (1.0 + ratio * ratio));
  return aperture < 1.0 ? kDefaultAperture : aperture;
}

bool ExportCamera(ExportContext& context, A_long width, A_long height)
{
  BaseObject* camera = AllocObject(kObjectCamera);
  if (!camera)
    return false;
  context.document->InsertObject(camera);
  context.document->SetSceneCamera(camera);
  context.object = camera;
  if (!ExportTransform(context, 0, 0))
    return false;
  HostCalls host(*context.suites);
  AEGP_CameraType type = AEGP_CameraType_NONE;
  AEGP_FilmSizeUnits units = AEGP_FilmSizeUnits_NONE;
  A_FpLong filmSize = 0.0;
  host(&AEGP_CameraSuite2::AEGP_GetCameraType, context.layer, &type);
  camera->SetParameterById(kCameraProjection,
                           type == AEGP_CameraType_ORTHOGRAPHIC ? kProjectionParallel : kProjectionPerspective);
  host(&AEGP_CameraSuite2::AEGP_GetCameraFilmSize, context.layer, &units, &filmSize);
  // The aperture comes first: the field of view is kept as the focal length that belongs to it.
  camera->SetParameterById(kCameraAperture, ApertureWidth(units, filmSize, width, height));
  ExportZoom(context, host, width);
  ExportFocus(context, host);
  return host.Good();
}

} // namespace exporter
