// The two curves behind keyframes: the easing curve of time and the path of a point through space.
#pragma once

#include <array>
#include <cstddef>
#include <vector>

namespace host
{

// Three components; a property of one dimension uses the first and keeps the others 0.
using Value = std::array<double, 3>;

// The inner control points of an easing curve, whose ends are (0, 0) and (1, 1). A bump leaves its value and comes back
// to it: it ends at (1, 0), and its heights are in the unit of the property.
struct Easing
{
  double x1, y1, x2, y2;
  bool isBump = false;
};

// The height of the curve where its abscissa is `x`, from 0 to 1. The abscissa is met to 1e-9 or better. Where control
// points outside 0 to 1 make the abscissa run back, one of the places is taken.
double Ease(const Easing& easing, double x);

// One cubic Bezier curve or more, each beginning where the one before it ends, walked by arc length. The first walk
// measures the path, so that later ones are cheap; for that reason one path may not be walked by two threads at a time.
class BezierPath
{
 public:
  BezierPath(const Value& p0, const Value& p1, const Value& p2, const Value& p3);
  // 3 n + 1 control points for n curves, n at least 1.
  explicit BezierPath(std::vector<Value> points);

  const std::vector<Value>& Points() const { return points_; }

  // Arc length, to a relative 1e-6 or better.
  double Length() const;

  // The point at the fraction of the arc length. Below 0 and above 1 the path goes on straight along its end tangent.
  // A path without length gives its start.
  Value At(double fraction) const;

 private:
  // The length from the path's start up to the parameter `u`, which grows by 1 along each curve.
  struct Mark
  {
    double u, length;
  };

  std::size_t CurveAt(double u) const;
  Value Point(double u) const;
  double Speed(double u) const;
  double Integrate(double from, double to) const;
  void Measure(double from, double to, double length, double tolerance, int depth) const;
  double ParameterAt(double length) const;
  Value EndTangent(bool atStart) const;

  std::vector<Value> points_;
  std::vector<Value> hodograph_; // control points of the derivative, three for each curve
  mutable std::vector<Mark> marks_;
};

} // namespace host
