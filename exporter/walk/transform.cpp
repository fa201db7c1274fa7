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

// By the bits: -0.0 is not 0.0.
template <class T>
bool IsSame(const T& a, const T& b)
{
  return std::memcmp(&a, &b, sizeof a) == 0; // NOLINT(bugprone-suspicious-memory-comparison)
}

// True if the axes of both are the same.
bool HasSameFrame(const LayerSample& a, const LayerSample& b, const TransformRules& rules)
{
  const bool sameLook = !rules.lookAtTarget || (IsSame(a.position, b.position) && IsSame(a.anchor, b.anchor));
  return sameLook && IsSame(a.orientation, b.orientation) && IsSame(a.rotateX, b.rotateX) &&
         IsSame(a.rotateY, b.rotateY) && IsSame(a.rotateZ, b.rotateZ);
}

} // namespace

const Matrix& TransformConverter::Turn::Of(Real x, Real y, Real z)
{
  const Vector wanted(x, y, z);
  if (!IsSame(wanted, degrees)) {
    degrees = wanted;
    matrix = RotationMatrix(x, y, z);
  }
  return matrix;
}

// Takes the axes of the sample, at length 1, and their angles.
void TransformConverter::TakeAxes(const LayerSample& sample)
{
  const Vector& o = sample.orientation;
  Matrix frame = orientation_.Of(o.x, o.y, o.z);
  if (rules_.lookAtTarget) {
    const Vector position = FlipY(sample.position);
    frame = Multiply(LookAtMatrix(position, FlipY(sample.anchor), position + Vector(0.0, 1.0, 0.0)), frame);
  }
  frame = Multiply(frame, rotation_.Of(sample.rotateX, sample.rotateY, sample.rotateZ));
  axes_.v1 = Normalize(frame.v1);
  axes_.v2 = Normalize(frame.v2);
  axes_.v3 = Normalize(frame.v3);
  angles_ = AxesToAngles(axes_.v1, axes_.v2, axes_.v3, kExportRotationOrder);
}

// Takes position and scale of the sample.
void TransformConverter::Place(const LayerSample& sample)
{
  const Vector plain = FlipY(sample.position);
  if (rules_.useScale)
    result_.scale = sample.scale * 0.01;
  const Vector offset = rules_.useAnchor ? AnchorOffset(sample.anchor, rules_, result_.scale) : Vector();
  result_.position = plain + offset;
  if (rules_.useRotation)
    result_.position = plain + axes_.v1 * offset.x + axes_.v2 * offset.y + axes_.v3 * offset.z;
  result_.position += rules_.parentShift;
}

const SceneTransform& TransformConverter::Convert(const LayerSample& sample)
{
  if (isSettled_ && IsSame(sample, last_))
    return result_;
  if (rules_.useRotation && (isFirst_ || !HasSameFrame(sample, last_, rules_)))
    TakeAxes(sample);
  Place(sample);
  const Vector previous = result_.rotation;
  if (rules_.useRotation)
    result_.rotation = isFirst_ ? angles_ : ClosestAngles(previous, angles_, kExportRotationOrder);
  isSettled_ = !isFirst_ && IsSame(previous, result_.rotation);
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
