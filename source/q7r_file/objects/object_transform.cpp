// The transform model of the scene object: a relative transform on top of an optional frozen one. The relative values
// are what users and animation work with; the absolute ones, from which the local matrix is made, follow from both.
#include "torvane/objects/base_object.h"

#include "torvane/tags/base_tag.h"

namespace _torvane_
{

namespace
{

constexpr Vector kNoScale(1.0, 1.0, 1.0);

Vector MultiplyEach(const Vector& a, const Vector& b) { return {a.x * b.x, a.y * b.y, a.z * b.z}; }

// A quotient by 0 is 0.
Vector DivideEach(const Vector& a, const Vector& b)
{
  return {b.x == 0.0 ? 0.0 : a.x / b.x, b.y == 0.0 ? 0.0 : a.y / b.y, b.z == 0.0 ? 0.0 : a.z / b.z};
}

void ScaleAxes(Matrix& matrix, const Vector& scale)
{
  matrix.v1 *= scale.x;
  matrix.v2 *= scale.y;
  matrix.v3 *= scale.z;
}

// A scale of 0 leaves the axis as it is.
void UnscaleAxis(Vector& axis, Real scale)
{
  if (scale != 0.0)
    axis = {axis.x / scale, axis.y / scale, axis.z / scale};
}

Vector NearestAngles(const Vector& reference, const Matrix& matrix, Long order)
{
  return ClosestAngles(reference, MatrixToAngles(matrix, order), order);
}

void Mirror(Vector& axis, Real& length)
{
  axis = -axis;
  length = -length;
}

} // namespace

constinit const BaseObject::FrozenPart BaseObject::kNoFrozenPart{};

// The frozen part, made if there is none; null when memory is short.
BaseObject::FrozenPart* BaseObject::NeedFrozen()
{
  if (!frozen_ && (frozen_ = NewObj<FrozenPart>()))
    TakeRelAsAbs();
  return frozen_;
}

Vector BaseObject::DerivedAbsPos() const
{
  return HasFrozenTransform() ? Frozen().matrix * relPos_ + Frozen().pos : relPos_;
}

Vector BaseObject::DerivedAbsScale() const { return MultiplyEach(relScale_, Frozen().scale); }

Vector BaseObject::DerivedAbsRot() const
{
  return NearestAngles(relRot_, Multiply(Frozen().matrix, GetRelRotation()), rotationOrder_);
}

// Without a frozen part they are the same anyway.
void BaseObject::TakeRelAsAbs()
{
  if (!frozen_)
    return;
  frozen_->absPos = relPos_;
  frozen_->absRot = relRot_;
  frozen_->absScale = relScale_;
}

// What the relative angles stand for. It isn't kept: most objects of a file are never asked for it.
Matrix BaseObject::GetRelRotation() const
{
  return turnedIn_ == kNotTurned ? Matrix() : AnglesToMatrix(relRot_, turnedIn_);
}

// The rotation from the object to its parent, frozen part included, without scale and offset.
Matrix BaseObject::GetRotation() const
{
  return (frozenFlags_ & kFrozenRot) ? Multiply(Frozen().matrix, GetRelRotation()) : GetRelRotation();
}

Matrix BaseObject::GetLocalMatrix() const
{
  Matrix matrix = GetRotation();
  ScaleAxes(matrix, GetAbsScale());
  matrix.off = GetAbsPos();
  return matrix;
}

Matrix BaseObject::GetGlobalMatrix() const
{
  Matrix matrix = GetLocalMatrix();
  for (const BaseObject* up = GetUp(); up; up = up->GetUp())
    matrix = Multiply(up->GetLocalMatrix(), matrix);
  return matrix;
}

Matrix BaseObject::GetUpGlobalMatrix() const
{
  BaseObject* up = GetUp();
  return up ? up->GetGlobalMatrix() : Matrix();
}

Matrix BaseObject::GetNormalizedLocalMatrix() const
{
  Matrix matrix = GetRotation();
  matrix.off = GetAbsPos();
  return matrix;
}

Matrix BaseObject::GetNormalizedGlobalMatrix() const
{
  Matrix matrix = GetNormalizedLocalMatrix();
  for (const BaseObject* up = GetUp(); up; up = up->GetUp())
    matrix = Multiply(up->GetNormalizedLocalMatrix(), matrix);
  matrix.off = GetGlobalMatrix().off;
  return matrix;
}

Matrix BaseObject::GetRelativeMatrix() const
{
  Matrix matrix = GetRelativeNormalizedMatrix();
  ScaleAxes(matrix, relScale_);
  return matrix;
}

Matrix BaseObject::GetRelativeNormalizedMatrix() const
{
  Matrix matrix = GetRelRotation();
  matrix.off = relPos_;
  return matrix;
}

Matrix BaseObject::GetFrozenTransformMatrix() const
{
  if (!HasFrozenTransform())
    return Matrix();
  Matrix matrix = frozen_->matrix;
  matrix.off = frozen_->pos;
  return matrix;
}

void BaseObject::SetRelPos(const Vector& value)
{
  if (value == relPos_ || IsProtected())
    return;
  relPos_ = value;
  if (frozen_)
    frozen_->absPos = DerivedAbsPos();
}

void BaseObject::SetRelScale(const Vector& value)
{
  if (IsProtected())
    return;
  relScale_ = value;
  if (frozen_)
    frozen_->absScale = (frozenFlags_ & kFrozenScale) ? DerivedAbsScale() : relScale_;
}

void BaseObject::SetRelRot(const Vector& value)
{
  if (value == relRot_ || IsProtected())
    return;
  relRot_ = value;
  turnedIn_ = rotationOrder_;
  if (frozen_)
    frozen_->absRot = (frozenFlags_ & kFrozenRot) ? DerivedAbsRot() : relRot_;
}

// The setters of absolute values go through the relative ones and then store the value itself: the way there and back
// would leave it slightly off.

void BaseObject::SetAbsPos(const Vector& value)
{
  if (value == GetAbsPos() || IsProtected())
    return;
  if (!HasFrozenTransform()) {
    SetRelPos(value);
    return;
  }
  SetRelPos(frozen_->inverse * (value - frozen_->pos));
  frozen_->absPos = value;
}

void BaseObject::SetAbsScale(const Vector& value)
{
  if (IsProtected())
    return;
  if (!(frozenFlags_ & kFrozenScale)) {
    SetRelScale(value);
    return;
  }
  SetRelScale(DivideEach(value, frozen_->scale));
  frozen_->absScale = value;
}

void BaseObject::SetAbsRot(const Vector& value)
{
  if (value == GetAbsRot() || IsProtected())
    return;
  if (!HasFrozenTransform()) {
    SetRelRot(value);
    return;
  }
  Matrix relative = Multiply(frozen_->inverse, AnglesToMatrix(value, rotationOrder_));
  Vector angles = NearestAngles(value, relative, rotationOrder_);
  SetRelRot(angles);
  if (angles == relRot_)
    frozen_->absRot = value;
}

void BaseObject::SetFrozenPos(const Vector& value)
{
  if (value == GetFrozenPos() || IsProtected() || !NeedFrozen())
    return;
  frozen_->pos = value;
  SetFrozenFlag(kFrozenPos, value != Vector());
  frozen_->absPos = DerivedAbsPos();
}

void BaseObject::SetFrozenScale(const Vector& value)
{
  if (value == GetFrozenScale() || IsProtected() || !NeedFrozen())
    return;
  frozen_->scale = value;
  SetFrozenFlag(kFrozenScale, value != kNoScale);
  frozen_->absScale = HasFrozenTransform() ? DerivedAbsScale() : relScale_;
}

void BaseObject::SetFrozenRot(const Vector& value)
{
  if (value == GetFrozenRot() || IsProtected() || !NeedFrozen())
    return;
  frozen_->rot = value;
  frozen_->matrix = AnglesToMatrix(value, rotationOrder_);
  Bool turned = frozen_->matrix != Matrix();
  frozen_->inverse = turned ? Invert(frozen_->matrix) : Matrix();
  SetFrozenFlag(kFrozenRot, turned);
  frozen_->absPos = DerivedAbsPos();
  frozen_->absRot = HasFrozenTransform() ? DerivedAbsRot() : relRot_;
}

void BaseObject::SetRotationOrder(Long order)
{
  if (order == rotationOrder_ || IsProtected())
    return;
  relRot_ = MatrixToAngles(GetRelRotation(), order);
  rotationOrder_ = turnedIn_ = order;
  if (frozen_)
    frozen_->absRot = (frozenFlags_ & kFrozenRot) ? DerivedAbsRot() : relRot_;
}

// A matrix tells mirroring only by its handedness. Which axes are the mirrored ones is taken from the scale that the
// object had: z and x keep their sign, and y follows from the handedness.
void BaseObject::SetRelativeMatrix(const Matrix& matrix)
{
  if (matrix == GetRelativeMatrix() || IsProtected())
    return;
  Matrix axes(Vector(), matrix.v1, matrix.v2, matrix.v3);
  Vector scale(Length(axes.v1), Length(axes.v2), Length(axes.v3));
  Vector angles;
  if (relScale_ != Vector()) {
    if (relScale_.z < 0.0)
      Mirror(axes.v3, scale.z);
    if (relScale_.x < 0.0)
      Mirror(axes.v1, scale.x);
    if (Dot(Cross(axes.v1, axes.v2), axes.v3) < 0.0)
      Mirror(axes.v2, scale.y);
    axes = Matrix(Vector(), Normalize(axes.v1), Normalize(axes.v2), Normalize(axes.v3));
    angles = NearestAngles(relRot_, axes, rotationOrder_);
  }
  relPos_ = matrix.off;
  relRot_ = angles;
  relScale_ = scale;
  turnedIn_ = relScale_ != Vector() ? rotationOrder_ : kNotTurned;
  TakeRelAsAbs();
  if (HasFrozenTransform()) {
    frozen_->absPos = DerivedAbsPos();
    frozen_->absRot = DerivedAbsRot();
    frozen_->absScale = DerivedAbsScale();
  }
}

void BaseObject::SetLocalMatrix(const Matrix& matrix)
{
  if (matrix == GetLocalMatrix() || IsProtected())
    return;
  if (!HasFrozenTransform()) {
    SetRelativeMatrix(matrix);
    return;
  }
  Matrix relative = matrix;
  relative.off -= frozen_->pos;
  relative = Multiply(frozen_->inverse, relative);
  UnscaleAxis(relative.v1, frozen_->scale.x);
  UnscaleAxis(relative.v2, frozen_->scale.y);
  UnscaleAxis(relative.v3, frozen_->scale.z);
  SetRelativeMatrix(relative);
}

void BaseObject::SetGlobalMatrix(const Matrix& matrix)
{
  if (matrix == GetGlobalMatrix() || IsProtected())
    return;
  BaseObject* up = GetUp();
  SetLocalMatrix(up ? Multiply(Invert(up->GetGlobalMatrix()), matrix) : matrix);
}

Vector BaseObject::GetGlobalAngles() const { return NearestAngles(relRot_, GetGlobalMatrix(), rotationOrder_); }

void BaseObject::SetGlobalPos(const Vector& value) { SetAbsPos(Invert(GetUpGlobalMatrix()) * value); }

void BaseObject::SetGlobalAngles(const Vector& value)
{
  Matrix local = Multiply(Invert(GetUpGlobalMatrix()), AnglesToMatrix(value, rotationOrder_));
  SetAbsRot(MatrixToAngles(local, rotationOrder_));
}

} // namespace _torvane_
