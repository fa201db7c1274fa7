// Rotation matrices to and from three angles in seven orders.
#include <cmath>

#include "torvane/math/ge_math.h"

#include "k2v_file/math/tolerances.h"

namespace _torvane_
{

namespace
{

constexpr Real kGimbalLock = 0.005; // at or below this cosine of the middle angle the other two cannot be told apart

// ---- Angles to matrix

// Sines and cosines of the angles about the three axes.
struct Turns
{
  Real sx, cx, sy, cy, sz, cz;

  Turns(Real x, Real y, Real z)
      : sx(std::sin(x)), cx(std::cos(x)), sy(std::sin(y)), cy(std::cos(y)), sz(std::sin(z)), cz(std::cos(z))
  {}
};

Matrix MatrixOfOrder0(const Turns& t)
{
  const auto& [sx, cx, sy, cy, sz, cz] = t;
  return {{},
          {cy * cz + sy * sx * sz, -cy * sz + sy * sx * cz, sy * cx},
          {cx * sz, cx * cz, -sx},
          {-sy * cz + cy * sx * sz, sy * sz + cy * sx * cz, cy * cx}};
}

Matrix MatrixOfOrder1(const Turns& t)
{
  const auto& [sx, cx, sy, cy, sz, cz] = t;
  return {{},
          {cy * cz, -cy * sz * cx + sy * sx, cy * sz * sx + sy * cx},
          {sz, cz * cx, -cz * sx},
          {-sy * cz, sy * sz * cx + cy * sx, -sy * sz * sx + cy * cx}};
}

Matrix MatrixOfOrder2(const Turns& t)
{
  const auto& [sx, cx, sy, cy, sz, cz] = t;
  return {{},
          {cz * cy, -sz * cx + cz * sy * sx, sz * sx + cz * sy * cx},
          {sz * cy, cz * cx + sz * sy * sx, -cz * sx + sz * sy * cx},
          {-sy, cy * sx, cy * cx}};
}

Matrix MatrixOfOrder3(const Turns& t)
{
  const auto& [sx, cx, sy, cy, sz, cz] = t;
  return {{},
          {cz * cy - sz * sx * sy, -sz * cx, cz * sy + sz * sx * cy},
          {sz * cy + cz * sx * sy, cz * cx, sz * sy - cz * sx * cy},
          {-cx * sy, sx, cx * cy}};
}

Matrix MatrixOfOrder4(const Turns& t)
{
  const auto& [sx, cx, sy, cy, sz, cz] = t;
  return {{},
          {cz * cy, -sz, cz * sy},
          {cx * sz * cy + sx * sy, cx * cz, cx * sz * sy - sx * cy},
          {sx * sz * cy - cx * sy, sx * cz, sx * sz * sy + cx * cy}};
}

Matrix MatrixOfOrder5(const Turns& t)
{
  const auto& [sx, cx, sy, cy, sz, cz] = t;
  return {{},
          {cy * cz, -cy * sz, sy},
          {sx * sy * cz + cx * sz, -sx * sy * sz + cx * cz, -sx * cy},
          {-cx * sy * cz + sx * sz, cx * sy * sz + sx * cz, cx * cy}};
}

constexpr Matrix (*kMatrixOfOrder[])(const Turns&) = {MatrixOfOrder0, MatrixOfOrder1, MatrixOfOrder2,
                                                      MatrixOfOrder3, MatrixOfOrder4, MatrixOfOrder5};

// ---- Matrix to angles: a, b and c are the axes at length 1. Each order repairs the one angle that is left in gimbal
// lock in its own way; scenes depend on that.

// Most angles are too far from a right one to ask for their cosine.
Bool IsLocked(Real angle) { return std::fabs(angle) > 1.5 && std::fabs(std::cos(angle)) <= kGimbalLock; }

Vector AnglesOfOrder0(const Vector& a, const Vector& b, const Vector& c)
{
  Real x = SafeAsin(-b.z);
  if (!IsLocked(x))
    return {x, std::atan2(a.z, c.z), std::atan2(b.x, b.y)};
  Real y = std::atan2(a.y, a.x);
  return {x, b.z > 0.0 ? kTwoPi - y : y, 0.0};
}

Vector AnglesOfOrder1(const Vector& a, const Vector& b, const Vector& c)
{
  Real z = SafeAsin(b.x);
  if (!IsLocked(z))
    return {std::atan2(-b.z, b.y), std::atan2(-c.x, a.x), z};
  Real y = std::atan2(a.z, -a.y);
  return {0.0, b.x < 0.0 ? kPi - y : y, z};
}

Vector AnglesOfOrder2(const Vector& a, const Vector& b, const Vector& c)
{
  Real y = SafeAsin(-c.x);
  if (!IsLocked(y))
    return {std::atan2(c.y, c.z), y, std::atan2(b.x, a.x)};
  Real x = std::atan2(-a.y, b.y);
  return {c.x < 0.0 ? -x : x, y, 0.0};
}

Vector AnglesOfOrder3(const Vector& a, const Vector& b, const Vector& c)
{
  Real x = SafeAsin(c.y);
  if (!IsLocked(x))
    return {x, std::atan2(-c.x, c.z), std::atan2(-a.y, b.y)};
  Real y = std::atan2(b.x, a.x);
  return {x, c.y < 0.0 ? -y : y, 0.0};
}

Vector AnglesOfOrder4(const Vector& a, const Vector& b, const Vector& c)
{
  Real z = SafeAsin(-a.y);
  if (!IsLocked(z))
    return {std::atan2(c.y, b.y), std::atan2(a.z, a.x), z};
  Real x = std::atan2(c.x, b.x);
  return {a.y > 0.0 ? x + kPi : x, 0.0, z};
}

Vector AnglesOfOrder5(const Vector& a, const Vector& b, const Vector& c)
{
  Real y = SafeAsin(a.z);
  if (!IsLocked(y))
    return {std::atan2(-b.z, c.z), y, std::atan2(-a.y, a.x)};
  Real x = std::atan2(b.x, -c.x);
  return {a.z < 0.0 ? x - kPi : x, y, 0.0};
}

Vector AnglesOfSceneOrder(const Vector& a, const Vector&, const Vector& c)
{
  Real r = std::sqrt(c.x * c.x + c.z * c.z);
  if (r < kNoRadius) {
    Bool up = c.y > 0.0;
    Real roll = SafeAcos(a.x);
    Bool turned = up ? a.z < 0.0 : a.z > 0.0;
    return {0.0, up ? kHalfPi : -kHalfPi, turned ? kTwoPi - roll : roll};
  }
  Real side = SafeAsin(c.x / r);
  Real heading = c.z > 0.0 ? -side : kPi + side;
  if (heading < 0.0)
    heading += kTwoPi;
  Real roll = SafeAcos(Dot({std::cos(heading), 0.0, std::sin(heading)}, a));
  return {heading, std::atan(c.y / r), a.y > 0.0 ? kTwoPi - roll : roll};
}

using AnglesFunction = Vector (*)(const Vector&, const Vector&, const Vector&);
constexpr AnglesFunction kAnglesOfOrder[] = {AnglesOfOrder0, AnglesOfOrder1, AnglesOfOrder2,
                                             AnglesOfOrder3, AnglesOfOrder4, AnglesOfOrder5};

Bool IsAxisOrder(Long order) { return order >= 0 && order < kRotationOrderScene; }

// ---- The nearest triple

// The other triple with the same rotation.
Vector SecondAngles(const Vector& a, Long order)
{
  switch (order) {
  case 0:
  case 3:
    return {kPi - a.x, kPi + a.y, kPi + a.z};
  case 1:
  case 4:
    return {kPi + a.x, kPi + a.y, kPi - a.z};
  default:
    return {kPi + a.x, kPi - a.y, kPi + a.z};
  }
}

// Moves the angle by whole turns next to the reference and gives the distance that is left.
Real MoveNear(Real reference, Real& angle)
{
  Real turns = (angle - reference) / kTwoPi;
  Real distance = (turns - std::floor(turns)) * kTwoPi;
  angle = reference + distance;
  if (distance >= kPi) {
    distance -= kTwoPi;
    angle -= kTwoPi;
  }
  return std::fabs(distance);
}

Real MoveNear(const Vector& reference, Vector& angles)
{
  Real distance = MoveNear(reference.x, angles.x);
  distance += MoveNear(reference.y, angles.y);
  return distance + MoveNear(reference.z, angles.z);
}

} // namespace

Matrix AnglesToMatrix(const Vector& angles, Long order) noexcept
{
  if (angles == Vector())
    return {};
  if (IsAxisOrder(order))
    return kMatrixOfOrder[order](Turns(angles.x, angles.y, angles.z));
  return MatrixOfOrder3(Turns(angles.y, angles.x, angles.z));
}

Vector MatrixToAngles(const Matrix& matrix, Long order) noexcept
{
  return AxesToAngles(Normalize(matrix.v1), Normalize(matrix.v2), Normalize(matrix.v3), order);
}

Vector AxesToAngles(const Vector& v1, const Vector& v2, const Vector& v3, Long order) noexcept
{
  AnglesFunction angles = IsAxisOrder(order) ? kAnglesOfOrder[order] : AnglesOfSceneOrder;
  return angles(v1, v2, v3);
}

Vector ClosestAngles(const Vector& reference, const Vector& angles, Long order) noexcept
{
  Vector first = angles;
  Vector second = SecondAngles(angles, order);
  Real firstDistance = MoveNear(reference, first);
  Real secondDistance = MoveNear(reference, second);
  return firstDistance > secondDistance ? second : first;
}

Matrix LookAtMatrix(const Vector& position, const Vector& target, const Vector& up) noexcept
{
  Matrix frame;
  frame.off = position;
  const Vector forward = target - position;
  const Vector down = position - up;
  if (Length(forward) == 0.0 || Length(down) == 0.0)
    return frame;
  frame.v3 = Normalize(forward);
  frame.v1 = Normalize(Cross(frame.v3, down));
  if (frame.v1 == Vector())
    frame.v1 = Vector(1.0, 0.0, 0.0);
  frame.v2 = Normalize(Cross(frame.v3, frame.v1));
  return frame;
}

} // namespace _torvane_
