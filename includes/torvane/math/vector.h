// Points, directions and coordinate frames as plain values.
#pragma once

#include <cmath>

#include "torvane/types.h"

namespace _torvane_
{

struct Vector
{
  Real x = 0.0;
  Real y = 0.0;
  Real z = 0.0;

  constexpr Vector() = default;
  constexpr Vector(Real xValue, Real yValue, Real zValue) : x(xValue), y(yValue), z(zValue) {}

  constexpr Vector& operator+=(const Vector& v)
  {
    x += v.x;
    y += v.y;
    z += v.z;
    return *this;
  }
  constexpr Vector& operator-=(const Vector& v)
  {
    x -= v.x;
    y -= v.y;
    z -= v.z;
    return *this;
  }
  constexpr Vector& operator*=(Real s)
  {
    x *= s;
    y *= s;
    z *= s;
    return *this;
  }

  friend constexpr Vector operator+(Vector a, const Vector& b) { return a += b; }
  friend constexpr Vector operator-(Vector a, const Vector& b) { return a -= b; }
  friend constexpr Vector operator-(const Vector& v) { return {-v.x, -v.y, -v.z}; }
  friend constexpr Vector operator*(Vector v, Real s) { return v *= s; }
  friend constexpr Vector operator*(Real s, Vector v) { return v *= s; }

  // Exact: no tolerance.
  friend constexpr Bool operator==(const Vector& a, const Vector& b) = default;
};

// An offset and three axes. Applied to a point p it gives off + p.x v1 + p.y v2 + p.z v3; a new one is the identity.
// Products, inverses and rotations are in ge_math.h.
struct Matrix
{
  Vector off;
  Vector v1{1.0, 0.0, 0.0};
  Vector v2{0.0, 1.0, 0.0};
  Vector v3{0.0, 0.0, 1.0};

  constexpr Matrix() = default;
  constexpr Matrix(const Vector& offset, const Vector& axis1, const Vector& axis2, const Vector& axis3)
      : off(offset), v1(axis1), v2(axis2), v3(axis3)
  {}

  // The image of a point.
  friend constexpr Vector operator*(const Matrix& m, const Vector& p)
  {
    return m.off + p.x * m.v1 + p.y * m.v2 + p.z * m.v3;
  }

  // Exact: no tolerance.
  friend constexpr Bool operator==(const Matrix& a, const Matrix& b) = default;
};

constexpr Real Dot(const Vector& a, const Vector& b) { return a.x * b.x + a.y * b.y + a.z * b.z; }

constexpr Vector Cross(const Vector& a, const Vector& b)
{
  return {a.y * b.z - a.z * b.y, a.z * b.x - a.x * b.z, a.x * b.y - a.y * b.x};
}

inline Real Length(const Vector& v) { return std::sqrt(Dot(v, v)); }

// The vector at length 1; the zero vector stays zero.
inline Vector Normalize(const Vector& v)
{
  Real length = Length(v);
  return length == 0.0 ? Vector() : v * (1.0 / length);
}

} // namespace _torvane_
