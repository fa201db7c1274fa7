// From the host's pixels, y down, with anchor points and a product of rotations, to the scene's units, y up, with one
// position, rotation and scale. A host pixel is one scene unit.
#pragma once

#include "torvane/math/ge_math.h"
#include "torvane/math/vector.h"

namespace exporter
{

using _torvane_::Matrix;
using _torvane_::Real;
using _torvane_::Vector;

// The order of the angles of every object that the exporter rotates.
inline constexpr _torvane_::Long kExportRotationOrder = 2;

// The inner cone angle in radians of a light with an outer angle in degrees and a feather in percent.
constexpr Real InnerAngle(Real outerDegrees, Real feather)
{
  return _torvane_::DegreesToRadians((1.0 - feather / 100.0) * outerDegrees);
}

// Film sizes and focus distances: host pixels at 72 to the inch.
inline constexpr Real kMillimetresPerInch = 25.4;
inline constexpr Real kPixelsPerInch = 72.0;
inline constexpr Real kPixelsPerMillimetre = 2.834645669291339;
constexpr Real PixelsToMillimetres(Real pixels) { return pixels * kMillimetresPerInch / kPixelsPerInch; }

using _torvane_::DegreesToRadians;

// The host's y axis points down.
constexpr Vector FlipY(const Vector& v) { return {v.x, -v.y, v.z}; }

// The transform streams of a layer at one time, as the host gives them.
struct LayerSample
{
  Vector position = Vector();
  Vector anchor = Vector(); // the point of interest of a camera or light
  Real rotateX = 0.0;
  Real rotateY = 0.0;
  Real rotateZ = 0.0;
  Vector orientation = Vector(); // like the rotations in degrees
  Vector scale = Vector();       // percent
};

// How the samples of one object are to be taken.
struct TransformRules
{
  Real width = 0.0; // pixels of the layer's source; 0 for cameras and lights
  Real height = 0.0;
  Vector parentShift = Vector(); // added to every position, see ParentShift
  bool useAnchor = false;        // the object's axis stands at the centre of its plane, away from the layer's anchor
  bool lookAtTarget = false;     // the rotation begins with the look from the position to the point of interest
  bool useRotation = false;
  bool useScale = false;
};

struct SceneTransform
{
  Vector position = Vector();
  Vector rotation = Vector(); // radians, in kExportRotationOrder; zero without useRotation
  Vector scale = Vector(1.0, 1.0, 1.0);
};

// `previousRotation` is the result of the frame before, null for the first: the angles are then those of the same
// rotation that lie closest to it, so that keys don't jump by whole turns.
SceneTransform ConvertTransform(const LayerSample& sample, const TransformRules& rules, const Vector* previousRotation);

// Converts the samples of one object one after the other, each with the rotation before it. What stands still isn't
// computed again: a sample that is the one before, its axes, either of the two products that they are made of. Which of
// a rotation's angles are closest is asked until it gives the same again, since it may differ in the last digit.
class TransformConverter
{
 public:
  // `rules` outlives the converter.
  explicit TransformConverter(const TransformRules& rules) : rules_(rules) {}
  const SceneTransform& Convert(const LayerSample& sample);

 private:
  // A rotation about the host's axes.
  struct Turn
  {
    const Matrix& Of(Real x, Real y, Real z); // degrees

    Vector degrees = Vector();
    Matrix matrix; // of these
  };

  void TakeAxes(const LayerSample& sample);
  void Place(const LayerSample& sample);

  const TransformRules& rules_;
  bool isFirst_ = true;
  bool isSettled_ = false; // the last sample again would give the last result again
  LayerSample last_;
  Turn orientation_;
  Turn rotation_;
  Matrix axes_;              // of the last sample, at length 1
  Vector angles_ = Vector(); // of the axes
  SceneTransform result_;
};

// Where a child of a layer of `width` by `height` pixels has to be moved: the host counts from the layer's corner, the
// scene from its centre.
constexpr Vector ParentShift(Real width, Real height) { return {-(width * 0.5), height * 0.5, 0.0}; }

// The horizontal angle in radians of a camera with a zoom in pixels, for a composition of `width` pixels.
Real FieldOfView(Real zoom, Real width, Real pixelAspect);

} // namespace exporter
