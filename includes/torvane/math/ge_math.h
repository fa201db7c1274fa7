// Rotations, frames, colours and repeatable random numbers. Angles are radians.
#pragma once

#include "torvane/math/vector.h"
#include "torvane/types.h"

namespace _torvane_
{

inline constexpr Real kPi = 3.14159265358979323846;
inline constexpr Real kTwoPi = 2.0 * kPi;
inline constexpr Real kHalfPi = 0.5 * kPi;

constexpr Real DegreesToRadians(Real degrees) { return degrees * kPi / 180.0; }
constexpr Real RadiansToDegrees(Real radians) { return radians * (180.0 / kPi); }

// Rotation orders: 0 to 5 are the six sequences of the axes. In the scene's own order, which every other number
// stands for too, the first angle turns about y, the second about x, the third about z.
inline constexpr Long kRotationOrderScene = 6;

// a after b: the image of b's frame under a.
Matrix Multiply(const Matrix& a, const Matrix& b) noexcept;
// The general inverse, offset included; the identity for a determinant of exactly 0.
Matrix Invert(const Matrix& m) noexcept;

Matrix MatrixScale(const Vector& v) noexcept;
Matrix MatrixRotateX(Real angle) noexcept;
Matrix MatrixRotateY(Real angle) noexcept;
Matrix MatrixRotateZ(Real angle) noexcept;

// A rotation without offset; exactly the identity for three angles of 0.
Matrix AnglesToMatrix(const Vector& angles, Long order) noexcept;
// The angles of the frame, whose scale does not count. Finite also when an axis has no length.
Vector MatrixToAngles(const Matrix& matrix, Long order) noexcept;
// The same for axes that have length 1 already.
Vector AxesToAngles(const Vector& v1, const Vector& v2, const Vector& v3, Long order) noexcept;
// Of the two triples that mean the rotation of `angles`, each moved by whole turns next to `reference`, the one that
// is nearer by the sum of its three distances; the first on a tie.
Vector ClosestAngles(const Vector& reference, const Vector& angles, Long order) noexcept;
// Heading and pitch that point the third axis along a direction.
Vector VectorToAngles(const Vector& direction) noexcept;
// The axis has length 1 and the sense that turns the frame back: AxisAngleToMatrix of it gives the inverse rotation.
// (0, 1, 0) with an angle of 0 when the frame has no axis.
void MatrixToAxisAngle(const Matrix& matrix, Vector& axis, Real& angle) noexcept;
// The identity for an axis without length or an angle of 0.
Matrix AxisAngleToMatrix(const Vector& axis, Real angle) noexcept;

// A frame at `position` whose third axis points to `target`, its second one turned away from `up`. The identity at
// `position` where the target or `up` lies on it.
Matrix LookAtMatrix(const Vector& position, const Vector& target, const Vector& up) noexcept;

// The arc functions, with arguments outside -1 to 1 taken as the limit.
Real SafeAsin(Real x) noexcept;
Real SafeAcos(Real x) noexcept;

// v mirrored at the plane with the normal n of length 1.
Vector ReflectVector(const Vector& v, const Vector& n) noexcept;
// From the foot of the perpendicular on the line to the point; zero for a direction without length.
Vector PointLineOffset(const Vector& origin, const Vector& direction, const Vector& point) noexcept;

// Each dot product of two axes is below 0.01, signed: strongly obtuse axes pass.
Bool IsOrthogonal(const Matrix& m) noexcept;
// Also the lengths of the axes differ by less than 0.01.
Bool IsUniformOrthogonal(const Matrix& m) noexcept;

// Components from 0 to 1, in both directions; the hue is a fraction of the circle.
Vector RgbToHsv(const Vector& rgb) noexcept;
Vector HsvToRgb(const Vector& hsv) noexcept;

// A small generator that gives the same sequence for the same seed everywhere.
class RandomGenerator
{
 public:
  RandomGenerator() noexcept = default;
  explicit RandomGenerator(ULong seed) noexcept { Init(seed); }

  void Init(ULong seed) noexcept;
  // From 0 to below 1.
  Real Get01() noexcept;
  // From -1 to below 1.
  Real Get11() noexcept;
  // Normally distributed about 0.5 with a deviation of 0.09, and about 0 with 0.18.
  Real GetGaussian01() noexcept { return 0.5 + 0.09 * GetGaussian(); }
  Real GetGaussian11() noexcept { return 0.18 * GetGaussian(); }

 private:
  Real GetGaussian() noexcept;

  ULong seed_ = 100;
  Bool hasSpare_ = false;
  Real spare_ = 0.0;
};

} // namespace _torvane_
