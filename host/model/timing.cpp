#include "host/model/timing.h"

#include <algorithm>
#include <cmath>
#include <limits>

namespace host
{

A_Time FrameDuration(double framesPerSecond)
{
  const double whole = std::round(framesPerSecond);
  if (whole >= 1 && std::abs(framesPerSecond - whole) <= 1e-6)
    return {1, static_cast<A_u_long>(whole)};
  const double nominal = std::round(framesPerSecond * 1001 / 1000);
  if (nominal >= 1 && std::abs(framesPerSecond - nominal * 1000 / 1001) <= 1e-4)
    return {1001, static_cast<A_u_long>(nominal) * 1000};
  return {1000, static_cast<A_u_long>(std::max(1.0, std::round(framesPerSecond * 1000)))};
}

std::optional<A_Time> FramesToTime(std::int64_t frames, A_Time frameDuration)
{
  constexpr std::int64_t kMax = std::numeric_limits<A_long>::max();
  if (frames > kMax / frameDuration.value || frames < -kMax / frameDuration.value)
    return std::nullopt;
  return A_Time{static_cast<A_long>(frames * frameDuration.value), frameDuration.scale};
}

double FrameAt(A_Time time, A_Time frameDuration)
{
  // Both products fit: |value| is at most 2^31 and a scale is below 2^32.
  const std::int64_t above = std::int64_t{time.value} * std::int64_t{frameDuration.scale};
  const std::int64_t below = std::int64_t{time.scale} * std::int64_t{frameDuration.value};
  const std::int64_t whole = above / below;
  const double part = static_cast<double>(above % below) / static_cast<double>(below);
  const double nearest = std::round(part);
  return static_cast<double>(whole) + (std::abs(part - nearest) <= 1e-9 ? nearest : part);
}

} // namespace host
