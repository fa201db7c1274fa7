#include "host/model/turning.h"

#include <algorithm>
#include <cmath>
#include <numbers>

namespace host
{

namespace
{

constexpr double kDegree = std::numbers::pi / 180;

struct Quaternion
{
  double w, x, y, z;
};

Quaternion operator*(const Quaternion& a, const Quaternion& b)
{
  return {a.w * b.w - a.x * b.x - a.y * b.y - a.z * b.z, a.w * b.x + a.x * b.w + a.y * b.z - a.z * b.y,
          a.w * b.y - a.x * b.z + a.y * b.w + a.z * b.x, a.w * b.z + a.x * b.y - a.y * b.x + a.z * b.w};
}

double Dot(const Quaternion& a, const Quaternion& b) { return a.w * b.w + a.x * b.x + a.y * b.y + a.z * b.z; }

Quaternion FromAngles(const Value& degrees)
{
  const auto half = [&](std::size_t c) { return std::remainder(degrees[c], 720) * kDegree / 2; };
  return Quaternion{std::cos(half(0)), std::sin(half(0)), 0, 0} *
         Quaternion{std::cos(half(1)), 0, std::sin(half(1)), 0} *
         Quaternion{std::cos(half(2)), 0, 0, std::sin(half(2))};
}

double ToDegrees(double radians)
{
  const double degrees = radians / kDegree;
  const double turned = degrees < 0 ? degrees + 360 : degrees;
  return turned < 360 ? turned : 0; // what lies just below 0 is rounded to 360
}

// R = Rx Ry Rz. Turned by 90 degrees about Y, only the sum of the two other angles counts: Z takes all of it.
Value ToAngles(const Quaternion& q)
{
  constexpr double kUpright = 1e-10;
  const double sinY = 2 * (q.x * q.z + q.w * q.y);
  const double cosYcosZ = 1 - 2 * (q.y * q.y + q.z * q.z), cosYsinZ = 2 * (q.w * q.z - q.x * q.y);
  const double cosY = std::hypot(cosYcosZ, cosYsinZ);
  const double y = std::atan2(sinY, cosY);
  if (cosY < kUpright)
    return {0, ToDegrees(y), ToDegrees(2 * std::atan2(q.z, q.w))};
  const double x = std::atan2(2 * (q.w * q.x - q.y * q.z), 1 - 2 * (q.x * q.x + q.y * q.y));
  return {ToDegrees(x), ToDegrees(y), ToDegrees(std::atan2(cosYsinZ, cosYcosZ))};
}

} // namespace

Value TurnBetween(const Value& from, const Value& to, double y)
{
  if (from == to)
    return from;
  const Quaternion a = FromAngles(from);
  Quaternion b = FromAngles(to);
  if (Dot(a, b) < 0)
    b = {-b.w, -b.x, -b.y, -b.z};
  // The angle from its sine, which a small one keeps exact.
  const Quaternion way{b.w - a.w, b.x - a.x, b.y - a.y, b.z - a.z};
  const double angle = 2 * std::asin(std::clamp(std::sqrt(Dot(way, way)) / 2, 0.0, 1.0));
  double shareA = 1 - y, shareB = y;
  if (const double sine = std::sin(angle); sine > 1e-12) {
    shareA = std::sin((1 - y) * angle) / sine;
    shareB = std::sin(y * angle) / sine;
  }
  return ToAngles({shareA * a.w + shareB * b.w, shareA * a.x + shareB * b.x, shareA * a.y + shareB * b.y,
                   shareA * a.z + shareB * b.z});
}

} // namespace host
