// Tangents and values of a curve.
#include <cmath>

#include "k2v_file/memory/count_before.h"
#include "torvane/animation/ccurve.h"

namespace _torvane_
{

namespace
{

constexpr Real kClampTolerance = 1e-6;
constexpr Real kAutomaticPart = 0.25; // of the way to the neighbours

// One end's tangent, its time counted into the interval of length `span`: a longer one is shortened along its own
// direction, one that points out of the interval becomes zero.
void Shorten(Real& time, Real& value, Real span)
{
  if (time < 0.0) {
    time = value = 0.0;
  } else if (time > span) {
    value *= span / time;
    time = span;
  }
}

Real Bezier(Real a, Real b, Real c, Real d, Real s)
{
  Real r = 1.0 - s;
  return r * r * r * a + 3.0 * r * r * s * b + 3.0 * r * s * s * c + s * s * s * d;
}

// The parameter at which the Bezier 0, b, c, 1 reaches x. It rises from 0 to 1 since b and c lie between them.
Real SolveBezier(Real b, Real c, Real x)
{
  Real low = 0.0;
  Real high = 1.0;
  for (int i = 0; i < 60 && high - low > 1e-15; ++i) {
    Real middle = 0.5 * (low + high);
    if (Bezier(0.0, b, c, 1.0, middle) < x)
      low = middle;
    else
      high = middle;
  }
  return 0.5 * (low + high);
}

// A cubic Bezier whose inner control points are the key plus its right tangent and the next key plus its left one.
Real SplineValue(const KeyValues& a, const KeyValues& b, KeyTangents right, KeyTangents left, Real u)
{
  Real span = b.time.Get() - a.time.Get();
  Real leftTime = -left.leftTime;
  Shorten(right.rightTime, right.rightValue, span);
  Shorten(leftTime, left.leftValue, span);
  Real s = SolveBezier(right.rightTime / span, 1.0 - leftTime / span, u);
  return Bezier(a.value, a.value + right.rightValue, b.value + left.leftValue, b.value, s);
}

// Automatic tangents are kept in steps of a thousandth of a second.
Real InMilliseconds(Real seconds) { return BaseTime(seconds).Get(); }

struct Step
{
  Real time;
  Real value;
};

} // namespace

KeyTangents CCurve::AutomaticTangents(Long index) const
{
  const Bool before = index > 0;
  const Bool behind = index + 1 < GetKeyCount();
  if (!before && !behind)
    return {};
  auto stepTo = [this](Long to) {
    return Step{TimeOf(to).Get() - TimeOf(to - 1).Get(), ValueOf(to) - ValueOf(to - 1)};
  };
  Step step = stepTo(behind ? index + 1 : index);
  if (before && behind) {
    Step back = stepTo(index);
    Real span = TimeOf(index + 1).Get() - TimeOf(index - 1).Get(); // not the sum of the two, which is rounded twice
    Real weight = span == 0.0 ? 0.0 : back.time / span;
    step.time = step.time * weight + back.time * (1.0 - weight);
    step.value = step.value * weight + back.value * (1.0 - weight);
  }
  return {InMilliseconds(-step.time * kAutomaticPart), -step.value * kAutomaticPart,
          InMilliseconds(step.time * kAutomaticPart), step.value * kAutomaticPart};
}

// A key at an end, at a turning point, or beside an equal value.
Bool CCurve::IsClamped(Long index) const
{
  if (index == 0 || index + 1 == GetKeyCount())
    return true;
  Real down = ValueOf(index - 1) - ValueOf(index);
  Real up = ValueOf(index + 1) - ValueOf(index);
  return (down > 0.0 && up > 0.0) || (down < 0.0 && up < 0.0) || std::fabs(down) < kClampTolerance ||
         std::fabs(up) < kClampTolerance;
}

KeyTangents CCurve::GetTangents(Long index) const
{
  KeyValues key;
  if (!GetKeyValues(index, key))
    return {};
  KeyTangents tangents = {key.leftTime.Get(), key.leftValue, key.rightTime.Get(), key.rightValue};
  ULong mask = key.switches;
  Bool flat = false;
  if (mask & kKeyMaskAutomatic) {
    tangents = AutomaticTangents(index);
    flat = index == 0 || index == GetKeyCount() - 1;
  } else {
    if (mask & kKeyMaskZero)
      tangents = {};
    flat = (mask & kKeyMaskZeroValue) != 0;
  }
  if (mask & kKeyMaskClamp)
    flat = flat || IsClamped(index);
  if (flat)
    tangents.leftValue = tangents.rightValue = 0.0;
  return tangents;
}

Real CCurve::GetValue(Real time) const
{
  if (GetKeyCount() == 0)
    return 0.0;
  // The last key that isn't behind the time.
  const Long index = CountBefore(GetKeyCount(), [&](Long place) { return TimeOf(place).Get() <= time; }) - 1;
  if (index < 0)
    return ValueOf(0);
  KeyValues a;
  KeyValues b;
  GetKeyValues(index, a);
  Real start = a.time.Get();
  if (!GetKeyValues(index + 1, b) || time <= start)
    return a.value;
  Real span = b.time.Get() - start;
  Real u = (time - start) / span;
  switch (a.interpolation) {
  case kInterpolationSpline:
    return SplineValue(a, b, GetTangents(index), GetTangents(index + 1), u);
  case kInterpolationLinear:
    return a.value + (b.value - a.value) * u;
  default:
    return a.value;
  }
}

} // namespace _torvane_
