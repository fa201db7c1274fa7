#include "gltf/scene/camera.h"

#include <algorithm>
#include <cmath>

#include "gltf/motion/animation.h"
#include "torvane/objects/camera_object_data.h"

namespace gltf
{

using namespace _torvane_;

namespace
{

constexpr Real kDefaultMillimetres = 36.0; // of focal length and aperture
constexpr Real kDefaultFocusDistance = 2000.0;
constexpr Long kPerspective = 0;
constexpr Long kParallel = 4;
constexpr Real kNear = 10.0; // scene units
constexpr Real kFar = 100000.0;
constexpr Real kLeastView = 0.001;

// The vertical angle of view, from half of the horizontal one's tangent.
Real VerticalAngle(Real tangent, Real aspect)
{
  const Real angle = 2.0 * std::atan(tangent / aspect);
  return angle > kLeastView ? std::min(angle, kPi - kLeastView) : kLeastView; // also for a NaN
}

Real TangentOfLens(Real focalLength, Real aperture)
{
  // Without a focal length everything is seen.
  return focalLength == 0.0 ? HUGE_VAL : 0.5 * aperture / focalLength;
}

Real TangentOfAngle(Real angle) { return std::tan(0.5 * std::clamp(angle, 0.0, kPi)); }

Json Perspective(const BaseContainer& lens, const SceneSettings& settings)
{
  const Real tangent = TangentOfLens(lens.GetReal(kCameraFocalLength, kDefaultMillimetres),
                                     lens.GetReal(kCameraApertureWidth, kDefaultMillimetres));
  return {{"aspectRatio", settings.aspect},
          {"yfov", VerticalAngle(tangent, settings.aspect)},
          {"znear", kNear * settings.unit}};
}

// A pixel of the scene is a pixel of the picture.
Json Orthographic(const SceneSettings& settings)
{
  const Real half = 0.5 * settings.height * settings.unit;
  return {{"xmag", settings.aspect * half},
          {"ymag", half},
          {"zfar", kFar * settings.unit},
          {"znear", kNear * settings.unit}};
}

// The field of view, by its own track or by those of the lens.
Samples SampleView(Context& context, const BaseContainer& lens, TrackSet& tracks)
{
  const Real aspect = context.settings.aspect;
  Shape shape = {1, true, [aspect](const Real* inputs, Real* values) {
                   values[0] = VerticalAngle(TangentOfAngle(inputs[0]), aspect);
                 }};
  std::vector<Input> inputs = {{tracks.Take(kCameraFieldOfView), 0.0}};
  const Input focal = {tracks.Take(kCameraFocalLength), lens.GetReal(kCameraFocalLength, kDefaultMillimetres)};
  const Input aperture = {tracks.Take(kCameraApertureWidth), lens.GetReal(kCameraApertureWidth, kDefaultMillimetres)};
  if (!inputs[0].curve) {
    inputs = {focal, aperture};
    shape.compute = [aspect](const Real* lengths, Real* values) {
      values[0] = VerticalAngle(TangentOfLens(lengths[0], lengths[1]), aspect);
    };
  }
  Samples samples = Sample(inputs, shape, context.timeline, context.output);
  Thin(samples, 0.0);
  return samples;
}

} // namespace

std::size_t AddCamera(Context& context, const BaseObject& object, TrackSet& tracks)
{
  Output& output = context.output;
  const BaseContainer& lens = object.GetDataInstance();
  const Long projection = lens.GetLong(kCameraProjection);
  const bool perspective = projection == kPerspective;
  if (!perspective && projection != kParallel)
    output.account.Tell(Loss::kProjection);
  Json camera = {{"type", perspective ? "perspective" : "orthographic"}};
  camera[perspective ? "perspective" : "orthographic"] =
      perspective ? Perspective(lens, context.settings) : Orthographic(context.settings);
  camera["extras"]["q7r"] = {{"focalLength", Finite(lens.GetReal(kCameraFocalLength, kDefaultMillimetres))},
                             {"aperture", Finite(lens.GetReal(kCameraApertureWidth, kDefaultMillimetres))},
                             {"focusDistance", Finite(lens.GetReal(kCameraFocusDistance, kDefaultFocusDistance))}};
  const std::size_t index = output.cameras.Add(camera);
  if (perspective)
    AddPointerChannel(output, "/cameras/" + std::to_string(index) + "/perspective/yfov",
                      SampleView(context, lens, tracks), context.options.pointers);
  return index;
}

} // namespace gltf
