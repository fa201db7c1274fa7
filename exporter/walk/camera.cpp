#include "exporter/walk/camera.h"

#include <cmath>

#include "exporter/walk/layer_transform.h"
#include "exporter/walk/value_stream.h"
#include "torvane/objects/camera_object_data.h"

namespace exporter
{

using namespace _torvane_;

namespace
{

constexpr Real kDefaultAperture = 36.0;

constexpr ValueStream kZoom = {
    .stream = AEGP_LayerStream_ZOOM,
    .parameter = {kCameraFieldOfView, "Field of View"},
    .mode = SampleMode::kFieldOfView,
};

constexpr ValueStream kFocus = {
    .stream = AEGP_LayerStream_FOCUS_DISTANCE,
    .parameter = {kCameraFocusDistance, "Focus Distance"},
    .mode = SampleMode::kValue,
    .divisor = kPixelsPerMillimetre,
    .firstValue = PixelsToMillimetres,
};

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
  camera->SetParameterById(kCameraApertureWidth, ApertureWidth(units, filmSize, width, height));
  ExportValueStream(context, host, kZoom, width);
  ExportValueStream(context, host, kFocus);
  return host.Good();
}

} // namespace exporter
