#include "gltf/scene/frames.h"

#include <cmath>

namespace gltf
{

using namespace _torvane_;

namespace
{

Quaternion Normalised(const Quaternion& q)
{
  const Real length = std::sqrt(q.x * q.x + q.y * q.y + q.z * q.z + q.w * q.w);
  if (!(length > 0.0) || !std::isfinite(length))
    return {};
  return {q.x / length, q.y / length, q.z / length, q.w / length};
}

} // namespace

Quaternion ToQuaternion(const Matrix& rotation)
{
  // The elements in rows and columns; those that have z as just one of the two change their sign.
  const Real m00 = rotation.v1.x, m01 = rotation.v2.x, m02 = -rotation.v3.x;
  const Real m10 = rotation.v1.y, m11 = rotation.v2.y, m12 = -rotation.v3.y;
  const Real m20 = -rotation.v1.z, m21 = -rotation.v2.z, m22 = rotation.v3.z;
  // Four times the square of each component; the largest one is the most accurate to divide by.
  const Real w = 1.0 + m00 + m11 + m22;
  const Real x = 1.0 + m00 - m11 - m22;
  const Real y = 1.0 - m00 + m11 - m22;
  const Real z = 1.0 - m00 - m11 + m22;
  if (w >= x && w >= y && w >= z)
    return Normalised({m21 - m12, m02 - m20, m10 - m01, w});
  if (x >= y && x >= z)
    return Normalised({x, m10 + m01, m02 + m20, m21 - m12});
  if (y >= z)
    return Normalised({m10 + m01, y, m21 + m12, m02 - m20});
  return Normalised({m02 + m20, m21 + m12, z, m10 - m01});
}

Quaternion Upright(const Quaternion& q) { return q.w < 0.0 ? Quaternion{-q.x, -q.y, -q.z, -q.w} : q; }

Matrix Scaled(Matrix matrix, const Vector& scale)
{
  matrix.v1 *= scale.x;
  matrix.v2 *= scale.y;
  matrix.v3 *= scale.z;
  return matrix;
}

} // namespace gltf
