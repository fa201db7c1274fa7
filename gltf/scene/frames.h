// From the scene's axes to those of glTF: a mirror in z and a scale, K = diag(u, u, -u).
#pragma once

#include "torvane/math/ge_math.h"
#include "torvane/math/vector.h"

namespace gltf
{

using _torvane_::Matrix;
using _torvane_::Real;
using _torvane_::Vector;

struct Quaternion
{
  Real x = 0.0;
  Real y = 0.0;
  Real z = 0.0;
  Real w = 1.0;
};

// A point or an offset, in metres.
inline Vector ToPlace(const Vector& v, Real unit) { return {unit * v.x, unit * v.y, -unit * v.z}; }
inline Vector ToDirection(const Vector& v) { return {v.x, v.y, -v.z}; }

// The mirrored rotation, of length 1; the first of the largest components is worked out from the diagonal. The
// identity for a matrix that is no rotation.
Quaternion ToQuaternion(const Matrix& rotation);
// The one of the two that stand for a rotation with w >= 0.
Quaternion Upright(const Quaternion& q);

// The matrix with its axes multiplied by the components of `scale`.
Matrix Scaled(Matrix matrix, const Vector& scale);

} // namespace gltf
