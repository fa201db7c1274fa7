// The colours of a gradient: its sorted knots, the blend between two of them, and the mirrored gradient.
#include "int_customgui_gradient/gradient_knots.h"
#include "int_customgui_gradient/gradient_sort.h"
#include "k2v_file/memory/count_before.h"

namespace _torvane_
{

namespace
{

constexpr Long kLastInterpolation = 7;

// Knots at one position keep their order in the container.
struct GradientOrder
{
  static Bool IsBehind(const GradientKnot& a, const GradientKnot& b)
  {
    return a.position > b.position || (a.position == b.position && a.index > b.index);
  }
};

struct PlaceOrder
{
  static Bool IsBehind(const GradientKnot& a, const GradientKnot& b) { return a.index > b.index; }
};

using GradientSort = CShellSort<GradientKnot, GradientOrder>;

Bool UsesBias(Long interpolation) { return interpolation == 0 || interpolation == 2 || interpolation == 3; }

// Remaps the way from a knot to the next one so that the bias point is its middle.
Real ApplyBias(Real fraction, Real bias)
{
  if (fraction < bias)
    return 0.5 * fraction / bias;
  return bias < 1.0 ? 0.5 + 0.5 * (fraction - bias) / (1.0 - bias) : 0.5;
}

Vector ColorOf(const GradientKnot& knot) { return knot.color * knot.brightness; }

void SwapKnots(GradientKnot& a, GradientKnot& b)
{
  const GradientKnot kept = a;
  a = b;
  b = kept;
}

} // namespace

void GradientData::FreeGradientCache()
{
  GeFree(knotCache_);
  knotCount_ = 0;
  if (alpha_)
    alpha_->FreeGradientCache();
}

// Takes `count` knots out of their container, in its order.
Bool GradientData::FillCache(Long count)
{
  knotCache_ =
      static_cast<GradientKnot*>(GeAlloc(static_cast<LLong>(count) * static_cast<LLong>(sizeof(GradientKnot))));
  if (!knotCache_)
    return false;
  ForEachKnot(*this, [&](const BaseContainer& source, ULong place) {
    GradientKnot& knot = knotCache_[knotCount_++];
    knot.color = source.GetVector(kKnotColor);
    if (IsAlpha())
      knot.color = Vector(knot.color.x, knot.color.x, knot.color.x);
    knot.brightness = source.GetReal(kKnotBrightness);
    knot.position = source.GetReal(kKnotPosition);
    knot.bias = source.GetReal(kKnotBias);
    knot.index = place;
    return true;
  });
  return true;
}

Bool GradientData::PrepareGradient()
{
  FreeGradientCache();
  if (alpha_ && !alpha_->PrepareGradient())
    return false;
  const Long count = CountKnots(*this);
  if (count == 0)
    return true;
  if (!FillCache(count)) {
    FreeGradientCache();
    return false;
  }
  GradientSort::Sort(knotCache_, knotCount_);
  interpolation_ = settings_.GetLong(kGradientInterpolation);
  cacheFlag_ = settings_.GetBool(kGradientCacheFlag) ? 1 : 0;
  return true;
}

// The last knot that isn't behind the position; -1 before the first one.
Long GradientData::FindLowerKnot(Real position) const
{
  return CountBefore(knotCount_, [&](Long knot) { return knotCache_[knot].position <= position; }) - 1;
}

Bool GradientData::EvaluateGradient(Real position, Vector& color) const
{
  if (knotCount_ == 0 || interpolation_ < 0 || interpolation_ > kLastInterpolation)
    return false;
  const Long lower = FindLowerKnot(position);
  if (lower < 0 || lower == knotCount_ - 1) {
    color = ColorOf(knotCache_[lower < 0 ? 0 : lower]);
    return true;
  }
  const GradientKnot& from = knotCache_[lower];
  const GradientKnot& to = knotCache_[lower + 1];
  Real fraction = (position - from.position) / (to.position - from.position);
  if (UsesBias(interpolation_))
    fraction = ApplyBias(fraction, from.bias);
  color = ColorOf(from) + (ColorOf(to) - ColorOf(from)) * fraction;
  return true;
}

// Writes the cached values back to the knots that they came from, and leaves the cache in the order of the container.
void GradientData::StoreCache()
{
  CShellSort<GradientKnot, PlaceOrder>::Sort(knotCache_, knotCount_);
  const GradientKnot* knot = knotCache_;
  ForEachKnot(*this, [&](BaseContainer& target, ULong) {
    target.SetVector(kKnotColor, knot->color);
    target.SetReal(kKnotBrightness, knot->brightness);
    target.SetReal(kKnotPosition, knot->position);
    target.SetReal(kKnotBias, knot->bias);
    ++knot;
    return true;
  });
}

// The bias of a stretch belongs to the knot at its lower end. Mirrored, that is the knot which was its upper end and
// now stands before it: so each bias moves one knot forward, and the first one's, which rules no stretch, to the last.
void GradientData::MirrorGradient()
{
  if (CountKnots(*this) < 2 || !PrepareGradient() || !knotCache_)
    return;
  for (Long low = 0, high = knotCount_ - 1; low < high; ++low, --high)
    SwapKnots(knotCache_[low], knotCache_[high]);
  const Real firstBias = 1.0 - knotCache_[0].bias;
  for (Long i = 0; i < knotCount_; ++i) {
    GradientKnot& knot = knotCache_[i];
    knot.position = 1.0 - knot.position;
    knot.bias = i + 1 < knotCount_ ? 1.0 - knotCache_[i + 1].bias : firstBias;
  }
  StoreCache();
  FreeGradientCache();
}

} // namespace _torvane_
