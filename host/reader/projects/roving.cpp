#include "host/reader/projects/roving.h"

#include <algorithm>
#include <cmath>

namespace host::projects
{

namespace
{

using Controls = std::array<double, 4>; // of one coordinate of the easing curve

double At(const Controls& c, double k)
{
  const double m = 1 - k;
  return m * m * m * c[0] + 3 * m * m * k * c[1] + 3 * m * k * k * c[2] + k * k * k * c[3];
}

// The curve never falls: its derivative, a quadratic Bezier curve, is nowhere below 0.
bool NeverFalls(const Controls& c)
{
  const double a = c[1] - c[0], b = c[2] - c[1], d = c[3] - c[2];
  if (a < 0 || d < 0)
    return false;
  return b >= 0 || b * b <= a * d;
}

// Where a curve that never falls reaches a height, not before `low`.
double ParameterAt(const Controls& c, double height, double low)
{
  double high = 1;
  for (int step = 0; step < 100 && low < high; ++step) {
    const double middle = low + (high - low) / 2;
    if (middle == low || middle == high)
      break;
    (At(c, middle) < height ? low : high) = middle;
  }
  return high;
}

// The control values of the part between two parameters, each polar value by its own corner.
Controls Part(const Controls& c, double from, double to)
{
  const auto polar = [&](double r, double s, double t) {
    const auto mix = [](double a, double b, double k) { return a + (b - a) * k; };
    const double a = mix(c[0], c[1], r), b = mix(c[1], c[2], r), d = mix(c[2], c[3], r);
    return mix(mix(a, b, s), mix(b, d, s), t);
  };
  return {polar(from, from, from), polar(from, from, to), polar(from, to, to), polar(to, to, to)};
}

// The handles of a part, stretched to 0 to 1; those of a straight line where the part has no extent.
std::array<double, 2> Stretch(const Controls& part)
{
  const double extent = part[3] - part[0];
  if (!(extent > 0))
    return {1.0 / 3, 2.0 / 3};
  return {(part[1] - part[0]) / extent, (part[2] - part[0]) / extent};
}

bool IsStraight(const Value& p0, const Value& p1, const Value& p2, const Value& p3)
{
  for (std::size_t c = 0; c < 3; ++c)
    if (p1[c] != p0[c] + (p3[c] - p0[c]) / 3 || p2[c] != p3[c] - (p3[c] - p0[c]) / 3)
      return false;
  return true;
}

} // namespace

std::size_t SplitRun(RovingRun run, std::vector<Keyframe>& keys)
{
  const Easing ease = run.easing.value_or(Easing{1.0 / 3, 1.0 / 3, 2.0 / 3, 2.0 / 3});
  const Controls x{0, ease.x1, ease.x2, 1}, y{0, ease.y1, ease.y2, 1};
  const std::size_t curves = run.points.size() / 3;
  const double whole = run.Length();
  if (!(whole > 0) || !NeverFalls(y)) {
    if (run.easing)
      run.start.easing.push_back(*run.easing);
    if (whole > 0)
      run.start.path = std::make_unique<BezierPath>(std::move(run.points));
    keys.push_back(std::move(run.start));
    return 1;
  }
  const double startTime = run.start.time;
  double length = 0, from = 0;
  for (std::size_t i = 0; i < curves; ++i) {
    const Value* p = &run.points[3 * i];
    auto path = std::make_unique<BezierPath>(p[0], p[1], p[2], p[3]);
    length += path->Length();
    const double to = i + 1 == curves ? 1 : ParameterAt(y, std::min(length / whole, 1.0), from);
    Keyframe key;
    key.time = i == 0 ? startTime : startTime + (run.endTime - startTime) * At(x, from);
    key.value = p[0];
    if (!IsStraight(p[0], p[1], p[2], p[3]))
      key.path = std::move(path);
    if (run.easing) {
      const auto partX = Stretch(Part(x, from, to)), partY = Stretch(Part(y, from, to));
      key.easing.push_back({std::clamp(partX[0], 0.0, 1.0), partY[0], std::clamp(partX[1], 0.0, 1.0), partY[1]});
    }
    keys.push_back(std::move(key));
    from = to;
  }
  return curves;
}

} // namespace host::projects
