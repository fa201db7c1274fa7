#include "exporter/walk/transform.h"

#include <cmath>

namespace exporter
{

using namespace _torvane_;

namespace
{

// Degrees about the host's axes.
Matrix RotationMatrix(Real x, Real y, Real z)
{
  return AnglesToMatrix({DegreesToRadians(x), DegreesToRadians(-y), DegreesToRadians(z)}, kExportRotationOrder);
}

// From the anchor point to the centre of the source, in scaled units along the object's axes.
Vector AnchorOffset(const Vector& anchor, const TransformRules& rules, const Vector& scale)
{
  return {(rules.width * 0.5 - anchor.x) * scale.x, (anchor.y - rules.height * 0.5) * scale.y, -anchor.z * scale.z};
}

// The axes of the sample; the offset is undefined.
Matrix SampleFrame(const LayerSample& sample, const TransformRules& rules, const Vector& position)
{
  const Vector& o = sample.orientation;
  Matrix frame = RotationMatrix(o.x, o.y, o.z);
  if (rules.lookAtTarget) {
    Vector up = position + Vector(0.0, 1.0, 0.0);
    frame = Multiply(LookAtMatrix(position, FlipY(sample.anchor), up), frame);
  }
  return Multiply(frame, RotationMatrix(sample.rotateX, sample.rotateY, sample.rotateZ));
}

} // namespace

SceneTransform ConvertTransform(const LayerSample& sample, const TransformRules& rules, const Vector* previousRotation)
{
  SceneTransform result;
  const Vector plain = FlipY(sample.position);
  if (rules.useScale)
    result.scale = sample.scale * 0.01;
  const Vector offset = rules.useAnchor ? AnchorOffset(sample.anchor, rules, result.scale) : Vector();
  result.position = plain + offset;
  if (rules.useRotation) {
    Matrix frame = SampleFrame(sample, rules, plain);
    result.position =
        plain + Normalize(frame.v1) * offset.x + Normalize(frame.v2) * offset.y + Normalize(frame.v3) * offset.z;
    result.rotation = MatrixToAngles(frame, kExportRotationOrder);
    if (previousRotation)
      result.rotation = ClosestAngles(*previousRotation, result.rotation, kExportRotationOrder);
  }
  result.position += rules.parentShift;
  return result;
}

Real FieldOfView(Real zoom, Real width, Real pixelAspect)
{
  return 2.0 * std::atan(width * 0.5 / (zoom / pixelAspect));
}

} // namespace exporter
