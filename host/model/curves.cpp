#include "host/model/curves.h"

#include <algorithm>
#include <cmath>

namespace host
{

namespace
{

constexpr int kMaxSolverSteps = 200;
constexpr int kMaxSubdivisions = 40; // halvings of a path around a cusp
constexpr double kLengthTolerance = 1e-10;
constexpr double kNothing = 1e-100; // squares of lengths below vanish, and no halving makes them exact

// Gauss-Legendre nodes and weights of order 8, one half; the other is its mirror.
constexpr double kGaussNodes[4] = {0.18343464249564980, 0.52553240991632899, 0.79666647741362674, 0.96028985649753623};
constexpr double kGaussWeights[4] = {0.36268378337836198, 0.31370664587788729, 0.22238103445337447,
                                     0.10122853629037626};

// The root of `function` in [low, high], where it is not above 0 at `low` and not below 0 at `high`: Newton's steps as
// long as they stay between the bounds, halving otherwise. `function` gives value and slope.
template <class Function>
double Solve(double low, double high, double start, double tolerance, Function&& function)
{
  double u = start;
  for (int step = 0; step < kMaxSolverSteps; ++step) {
    const auto [value, slope] = function(u);
    if (std::abs(value) <= tolerance)
      break;
    (value > 0 ? high : low) = u;
    double next = u - value / slope;
    if (!(next > low && next < high))
      next = low + 0.5 * (high - low);
    if (next == u)
      break;
    u = next;
  }
  return u;
}

struct ValueAndSlope
{
  double value, slope;
};

// std::hypot would guard against overflow, which no scene comes near, and take most of the time.
double Norm(const Value& v) { return std::sqrt(v[0] * v[0] + v[1] * v[1] + v[2] * v[2]); }

} // namespace

double Ease(const Easing& easing, double x)
{
  if (x <= 0)
    return 0;
  const double end = easing.isBump ? 0 : 1;
  if (x >= 1)
    return end;
  const double cx = 3 * easing.x1, bx = 3 * (easing.x2 - easing.x1) - cx, ax = 1 - cx - bx;
  const double u = Solve(0, 1, x, 1e-15, [&](double at) {
    return ValueAndSlope{((ax * at + bx) * at + cx) * at - x, (3 * ax * at + 2 * bx) * at + cx};
  });
  const double cy = 3 * easing.y1, by = 3 * (easing.y2 - easing.y1) - cy, ay = end - cy - by;
  return ((ay * u + by) * u + cy) * u;
}

BezierPath::BezierPath(const Value& p0, const Value& p1, const Value& p2, const Value& p3)
    : BezierPath(std::vector<Value>{p0, p1, p2, p3})
{}

BezierPath::BezierPath(std::vector<Value> points) : points_(std::move(points)), hodograph_(points_.size() - 1)
{
  for (std::size_t k = 0; k < hodograph_.size(); ++k)
    for (std::size_t c = 0; c < 3; ++c)
      hodograph_[k][c] = 3 * (points_[k + 1][c] - points_[k][c]);
}

std::size_t BezierPath::CurveAt(double u) const
{
  return std::min(static_cast<std::size_t>(std::max(u, 0.0)), hodograph_.size() / 3 - 1);
}

Value BezierPath::Point(double u) const
{
  const std::size_t curve = CurveAt(u);
  const double t = u - static_cast<double>(curve), v = 1 - t;
  const double weights[4] = {v * v * v, 3 * v * v * t, 3 * v * t * t, t * t * t};
  Value point{};
  for (std::size_t k = 0; k < 4; ++k)
    for (std::size_t c = 0; c < 3; ++c)
      point[c] += weights[k] * points_[3 * curve + k][c];
  return point;
}

double BezierPath::Speed(double u) const
{
  const std::size_t curve = CurveAt(u);
  const Value* slopes = &hodograph_[3 * curve];
  const double t = u - static_cast<double>(curve), v = 1 - t;
  Value derivative{};
  for (std::size_t c = 0; c < 3; ++c)
    derivative[c] = v * v * slopes[0][c] + 2 * v * t * slopes[1][c] + t * t * slopes[2][c];
  return Norm(derivative);
}

double BezierPath::Integrate(double from, double to) const
{
  const double middle = 0.5 * (from + to), half = 0.5 * (to - from);
  double sum = 0;
  for (std::size_t k = 0; k < 4; ++k)
    sum += kGaussWeights[k] * (Speed(middle - half * kGaussNodes[k]) + Speed(middle + half * kGaussNodes[k]));
  return sum * half;
}

void BezierPath::Measure(double from, double to, double length, double tolerance, int depth) const
{
  const double middle = 0.5 * (from + to);
  const double first = Integrate(from, middle), second = Integrate(middle, to);
  // Turned round, so that a length that is no number ends the search.
  const bool isRough = std::abs(first + second - length) > tolerance;
  if (depth > 0 && isRough) {
    Measure(from, middle, first, tolerance, depth - 1);
    Measure(middle, to, second, tolerance, depth - 1);
    return;
  }
  marks_.push_back({middle, marks_.back().length + first});
  marks_.push_back({to, marks_.back().length + second});
}

double BezierPath::Length() const
{
  if (marks_.empty()) {
    double polygon = 0;
    for (const Value& side : hodograph_)
      polygon += Norm(side) / 3;
    marks_.push_back({0, 0});
    for (std::size_t curve = 0; curve < hodograph_.size() / 3; ++curve) {
      const double from = static_cast<double>(curve), to = from + 1;
      Measure(from, to, Integrate(from, to), std::max(kLengthTolerance * polygon, kNothing), kMaxSubdivisions);
    }
  }
  return marks_.back().length;
}

double BezierPath::ParameterAt(double length) const
{
  const auto next = std::upper_bound(marks_.begin() + 1, marks_.end() - 1, length,
                                     [](double wanted, const Mark& mark) { return wanted < mark.length; });
  const Mark& from = next[-1];
  const Mark& to = *next;
  const double piece = to.length - from.length;
  const double start = piece > 0 ? from.u + (to.u - from.u) * (length - from.length) / piece : from.u;
  return Solve(from.u, to.u, start, 1e-12 * marks_.back().length, [&](double u) {
    return ValueAndSlope{from.length + Integrate(from.u, u) - length, Speed(u)};
  });
}

Value BezierPath::EndTangent(bool atStart) const
{
  // Where a handle has no length, the next control point gives the direction.
  for (std::size_t k = 1; k < points_.size(); ++k) {
    const Value& from = atStart ? points_.front() : points_[points_.size() - 1 - k];
    const Value& to = atStart ? points_[k] : points_.back();
    Value way{to[0] - from[0], to[1] - from[1], to[2] - from[2]};
    const double norm = Norm(way);
    if (norm > 0)
      return {way[0] / norm, way[1] / norm, way[2] / norm};
  }
  return {};
}

Value BezierPath::At(double fraction) const
{
  const double length = Length();
  if (!(length > 0))
    return points_[0];
  if (fraction >= 0 && fraction <= 1)
    return Point(ParameterAt(fraction * length));
  const bool isBefore = fraction < 0;
  const Value tangent = EndTangent(isBefore);
  const double way = (isBefore ? fraction : fraction - 1) * length;
  Value point = isBefore ? points_.front() : points_.back();
  for (std::size_t c = 0; c < 3; ++c)
    point[c] += tangent[c] * way;
  return point;
}

} // namespace host
