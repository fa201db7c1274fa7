#include "torvane/math/ge_math.h"

#include <cmath>

#include "k2v_file/math/tolerances.h"

namespace _torvane_
{

namespace
{

constexpr Real kAxisTolerance = 0.01; // of axes that count as orthogonal or equally long
constexpr Real kParallel = 0.001;     // an axis this near to the third needs another helper
constexpr Real kGrey = 0.001;         // below this saturation a colour is grey

Vector Rotate(const Matrix& m, const Vector& v) { return v.x * m.v1 + v.y * m.v2 + v.z * m.v3; }

} // namespace

Matrix Multiply(const Matrix& a, const Matrix& b) noexcept
{
  return {a * b.off, Rotate(a, b.v1), Rotate(a, b.v2), Rotate(a, b.v3)};
}

Matrix Invert(const Matrix& m) noexcept
{
  Vector row1 = Cross(m.v2, m.v3);
  Vector row2 = Cross(m.v3, m.v1);
  Vector row3 = Cross(m.v1, m.v2);
  Real determinant = Dot(m.v1, row1);
  if (determinant == 0.0)
    return {};
  Real scale = 1.0 / determinant;
  Matrix inverse({}, Vector(row1.x, row2.x, row3.x) * scale, Vector(row1.y, row2.y, row3.y) * scale,
                 Vector(row1.z, row2.z, row3.z) * scale);
  inverse.off = -Rotate(inverse, m.off);
  return inverse;
}

Matrix MatrixScale(const Vector& v) noexcept { return {{}, {v.x, 0.0, 0.0}, {0.0, v.y, 0.0}, {0.0, 0.0, v.z}}; }

Matrix MatrixRotateX(Real angle) noexcept
{
  Real s = std::sin(angle);
  Real c = std::cos(angle);
  return {{}, {1.0, 0.0, 0.0}, {0.0, c, -s}, {0.0, s, c}};
}

Matrix MatrixRotateY(Real angle) noexcept
{
  Real s = std::sin(angle);
  Real c = std::cos(angle);
  return {{}, {c, 0.0, s}, {0.0, 1.0, 0.0}, {-s, 0.0, c}};
}

Matrix MatrixRotateZ(Real angle) noexcept
{
  Real s = std::sin(angle);
  Real c = std::cos(angle);
  return {{}, {c, -s, 0.0}, {s, c, 0.0}, {0.0, 0.0, 1.0}};
}

Real SafeAsin(Real x) noexcept { return x >= 1.0 ? kHalfPi : x <= -1.0 ? -kHalfPi : std::asin(x); }

Real SafeAcos(Real x) noexcept { return x >= 1.0 ? 0.0 : x <= -1.0 ? kPi : std::acos(x); }

Vector VectorToAngles(const Vector& direction) noexcept
{
  Real r = std::sqrt(direction.x * direction.x + direction.z * direction.z);
  if (r < kNoRadius)
    return {0.0, direction.y > 0.0 ? kHalfPi : -kHalfPi, 0.0};
  Real side = SafeAsin(direction.x / r);
  return {direction.z > 0.0 ? -side : kPi + side, std::atan(direction.y / r), 0.0};
}

void MatrixToAxisAngle(const Matrix& matrix, Vector& axis, Real& angle) noexcept
{
  Vector a = Normalize(matrix.v1);
  Vector b = Normalize(matrix.v2);
  Vector c = Normalize(matrix.v3);
  axis = Normalize(Vector(b.z - c.y, c.x - a.z, a.y - b.x));
  angle = SafeAcos((a.x + b.y + c.z - 1.0) / 2.0);
  if (axis == Vector()) {
    axis = {0.0, 1.0, 0.0};
    angle = 0.0;
  }
}

Matrix AxisAngleToMatrix(const Vector& axis, Real angle) noexcept
{
  if (Length(axis) == 0.0 || angle == 0.0)
    return {};
  Vector n = Normalize(axis);
  Vector p = Cross(n, {0.0, 0.0, 1.0});
  Vector q;
  if (Length(p) > kParallel) {
    q = Cross(p, n);
  } else {
    q = Cross({1.0, 0.0, 0.0}, n);
    p = Cross(n, q);
  }
  Matrix frame({}, p, n, q);
  return Multiply(Multiply(frame, MatrixRotateY(angle)), Invert(frame));
}

Vector ReflectVector(const Vector& v, const Vector& n) noexcept { return v - 2.0 * Dot(n, v) * n; }

Vector PointLineOffset(const Vector& origin, const Vector& direction, const Vector& point) noexcept
{
  Real square = Dot(direction, direction);
  if (square == 0.0)
    return {};
  Real t = Dot(point - origin, direction) / square;
  return point - (origin + t * direction);
}

Bool IsOrthogonal(const Matrix& m) noexcept
{
  return Dot(m.v1, m.v2) < kAxisTolerance && Dot(m.v2, m.v3) < kAxisTolerance && Dot(m.v1, m.v3) < kAxisTolerance;
}

Bool IsUniformOrthogonal(const Matrix& m) noexcept
{
  Real l1 = Length(m.v1);
  Real l2 = Length(m.v2);
  Real l3 = Length(m.v3);
  return IsOrthogonal(m) && std::fabs(l1 - l2) < kAxisTolerance && std::fabs(l2 - l3) < kAxisTolerance &&
         std::fabs(l1 - l3) < kAxisTolerance;
}

Vector RgbToHsv(const Vector& rgb) noexcept
{
  Real most = std::fmax(rgb.x, std::fmax(rgb.y, rgb.z));
  Real least = std::fmin(rgb.x, std::fmin(rgb.y, rgb.z));
  if (most <= 0.0)
    return {};
  Real saturation = 1.0 - least / most;
  if (saturation < kGrey)
    return {0.0, 0.0, least};
  Real d = most - least;
  Real hue = rgb.x == most   ? (rgb.y - rgb.z) / d
             : rgb.y == most ? 2.0 + (rgb.z - rgb.x) / d
                             : 4.0 + (rgb.x - rgb.y) / d;
  hue /= 6.0;
  return {hue < 0.0 ? hue + 1.0 : hue, saturation, most};
}

Vector HsvToRgb(const Vector& hsv) noexcept
{
  Real s = hsv.y;
  Real v = hsv.z;
  if (s < kGrey)
    return {v, v, v};
  Real x = hsv.x == 1.0 ? 0.0 : 6.0 * hsv.x;
  Real sector = std::floor(x);
  Real f = x - sector;
  Real p = v * (1.0 - s);
  Real q = v * (1.0 - s * f);
  Real t = v * (1.0 - s * (1.0 - f));
  const Vector sectors[] = {{v, t, p}, {q, v, p}, {p, v, t}, {p, q, v}, {t, p, v}, {v, p, q}};
  return sectors[sector >= 0.0 && sector < 5.0 ? static_cast<int>(sector) : 5];
}

void RandomGenerator::Init(ULong seed) noexcept
{
  seed_ = seed;
  hasSpare_ = false;
}

Real RandomGenerator::Get01() noexcept
{
  constexpr ULong kFactor = 69069;
  constexpr ULong kMask = 0x7FFFFFFF;
  seed_ = (seed_ + 1) * kFactor & kMask;
  return seed_ / 2147483649.0;
}

Real RandomGenerator::Get11() noexcept { return Get01() * 2.0 - 1.0; }

// The polar method: it makes numbers of deviation 1 in pairs.
Real RandomGenerator::GetGaussian() noexcept
{
  if (hasSpare_) {
    hasSpare_ = false;
    return spare_;
  }
  Real u = 0.0;
  Real v = 0.0;
  Real s = 0.0;
  do {
    u = Get11();
    v = Get11();
    s = u * u + v * v;
  } while (s >= 1.0 || s == 0.0);
  Real factor = std::sqrt(-2.0 * std::log(s) / s);
  spare_ = u * factor;
  hasSpare_ = true;
  return v * factor;
}

} // namespace _torvane_
