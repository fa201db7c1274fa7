#include "torvane/objects/unit_factors.h"

#include <iterator>

#include "torvane/memory/assertion.h"

namespace _torvane_
{

namespace
{

// By the unit's number: none, kilometre, metre, centimetre, millimetre, micrometre, nanometre, mile, yard, foot, inch.
constexpr Real kMetres[] = {1.0, 1000.0, 1.0, 0.01, 0.001, 1e-06, 1e-09, 1609.344, 0.9144, 0.3048, 0.0254};

} // namespace

Real GetUnitFactor(const UnitScaleData* unit)
{
  if (!unit) {
    ReportAssertion("q7r_file", __LINE__, "a length unit is missing");
    return 1.0;
  }
  const Bool known = unit->unit >= 0 && unit->unit < static_cast<Long>(std::size(kMetres));
  return unit->scale * (known ? kMetres[unit->unit] : 1.0);
}

Real ConvertUnits(const UnitScaleData* from, const UnitScaleData* to)
{
  if (from && to && from->IsEqual(*to))
    return 1.0;
  const Real first = GetUnitFactor(from);
  const Real second = GetUnitFactor(to);
  return first == second || second == 0.0 ? 1.0 : first / second;
}

} // namespace _torvane_
