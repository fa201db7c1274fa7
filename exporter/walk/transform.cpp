#include "exporter/walk/transform.h"

#include <cmath>
#include <cstring>

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

// By the bits: -0.0 is not 0.0.
template <class T>
bool IsSame(const T& a, const T& b)
{
  return std::memcmp(&a, &b, sizeof a) == 0; // NOLINT(bugprone-suspicious-memory-comparison)
}

// True if SampleFrame gives the same for both.
bool HasSameFrame(const LayerSample& a, const LayerSample& b, const TransformRules& rules)
{
  const bool sameLook = !rules.lookAtTarget || (IsSame(a.position, b.position) && IsSame(a.anchor, b.anchor));
  return sameLook && IsSame(a.orientation, b.orientation) && IsSame(a.rotateX, b.rotateX) &&
         IsSame(a.rotateY, b.rotateY) && IsSame(a.rotateZ, b.rotateZ);
}

// Position and scale of a sample with these axes.
SceneTransform Place(const LayerSample& sample, const TransformRules& rules, const Matrix& frame)
{
  SceneTransform result;
  const Vector plain = FlipY(sample.position);
  if (rules.useScale)
    result.scale = sample.scale * 0.01;
  const Vector offset = rules.useAnchor ? AnchorOffset(sample.anchor, rules, result.scale) : Vector();
  result.position = plain + offset;
  if (rules.useRotation)
    result.position =
        plain + Normalize(frame.v1) * offset.x + Normalize(frame.v2) * offset.y + Normalize(frame.v3) * offset.z;
  result.position += rules.parentShift;
  return result;
}

} // namespace

const SceneTransform& TransformConverter::Convert(const LayerSample& sample)
{
  if (rules_.useRotation && (isFirst_ || !HasSameFrame(sample, last_, rules_))) {
    frame_ = SampleFrame(sample, rules_, FlipY(sample.position));
    angles_ = MatrixToAngles(frame_, kExportRotationOrder);
  }
  const Vector previous = result_.rotation;
  result_ = Place(sample, rules_, frame_);
  if (rules_.useRotation)
    result_.rotation = isFirst_ ? angles_ : ClosestAngles(previous, angles_, kExportRotationOrder);
  last_ = sample;
  isFirst_ = false;
  return result_;
}

SceneTransform ConvertTransform(const LayerSample& sample, const TransformRules& rules, const Vector* previousRotation)
{
  SceneTransform result = TransformConverter(rules).Convert(sample);
  if (rules.useRotation && previousRotation)
    result.rotation = ClosestAngles(*previousRotation, result.rotation, kExportRotationOrder);
  return result;
}

Real FieldOfView(Real zoom, Real width, Real pixelAspect)
{
  return 2.0 * std::atan(width * 0.5 / (zoom / pixelAspect));
}

} // namespace exporter
