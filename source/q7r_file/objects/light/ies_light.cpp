// The measured distribution itself: its samples, its copy and its stored form.
#include "torvane/objects/ies_light.h"

#include <cmath>

#include "k2v_file/stream/chunk_visitor.h"
#include "torvane/math/ge_math.h"

namespace _torvane_
{

namespace
{

// So little less than 1 that the poles lie within every table that reaches them.
constexpr Real kPoleFactor = -0.999999;

// The span of the horizontal angles, in degrees, below which a table stands for so much of the circle.
constexpr Real kSpanOfSymmetry = 45.0; // the same all around
constexpr Real kSpanOfQuadrant = 135.0;
constexpr Real kSpanOfHalf = 225.0;
constexpr Real kCircle = 360.0;

constexpr Long kFluxSamples = 65536;
constexpr ULong kFluxSeed = 117641;
constexpr Real kFluxOfSample = 0.00019174759848570515; // 4 pi / kFluxSamples

constexpr Long kRecordVersion = 4;
constexpr Long kVersionTexts = 2;
constexpr Long kVersionFlux = 3;
constexpr Long kVersionReals = 4; // before it: numbers as LReal

Real HermiteValue(Real p0, Real p1, Real m0, Real m1, Real t)
{
  const Real a = m1 + m0 - 2.0 * (p1 - p0);
  return t * t * t * a + t * t * (p1 - p0 - m0 - a) + t * m0 + p0;
}

// A direction of length 1, evenly distributed.
Vector DrawDirection(RandomGenerator& random)
{
  for (;;) {
    Vector point;
    point.x = random.Get11();
    point.y = random.Get11();
    point.z = random.Get11();
    const Real square = Dot(point, point);
    if (square <= 1.0 && square > 0.0)
      return point * (1.0 / std::sqrt(square));
  }
}

// The angles of a direction, in degrees: from the lamp's axis, and around it from 0 to 360.
struct Angles
{
  Real vertical;
  Real horizontal;
};

Angles GetAngles(const Vector& direction)
{
  Real horizontal = 90.0;
  if (direction.y != 0.0)
    horizontal = RadiansToDegrees(std::atan2(direction.x, direction.y));
  else if (direction.x < 0.0)
    horizontal = -90.0;
  if (horizontal < 0.0)
    horizontal += kCircle;
  return {RadiansToDegrees(SafeAcos(kPoleFactor * direction.z)), horizontal};
}

// The directions that every flux is sampled in. To find them takes most of a sample's time.
const Angles (&GetFluxDirections())[kFluxSamples]
{
  static Angles directions[kFluxSamples];
  static const Bool drawn = [] {
    RandomGenerator random(kFluxSeed);
    for (Angles& angles : directions)
      angles = GetAngles(DrawDirection(random));
    return true;
  }();
  (void)drawn;
  return directions;
}

// A number of a stored distribution, whose form changed with the version.
template <class Visitor, class Number>
Bool VisitNumber(Visitor& v, Long version, Number& number)
{
  return version < kVersionReals ? v.LReal(number) : v.Real(number);
}

template <class Visitor>
Bool VisitTable(Visitor& v, Long version, GeTempDynArray<Real>& table, Long count)
{
  if constexpr (Visitor::kReading) {
    table.Flush();
    for (Long i = 0; i < count && v.Good(); ++i) {
      Real number = 0.0;
      v.Note(VisitNumber(v, version, number) && table.Append(number)); // no count is trusted for memory
    }
  } else {
    for (Real number : table)
      VisitNumber(v, version, number);
  }
  return v.Good();
}

Bool CopyText(const String& source, String& destination)
{
  destination = source;
  return destination.GetLength() == source.GetLength();
}

} // namespace

// A place between two neighbours of a table of angles.
struct IESLight::Interval
{
  Long low = 0;
  Long high = 0;
  Real fraction = 0.0;

  // The first interval whose upper angle lies above `position`, or the last one. Angles count from `origin`.
  Interval(const GeTempDynArray<Real>& angles, Real origin, Real position)
  {
    const Long count = angles.GetCount();
    if (count < 2)
      return;
    while (low < count - 2 && !(angles[low + 1] - origin > position))
      ++low;
    high = low + 1;
    const Real width = angles[high] - angles[low];
    fraction = width != 0.0 ? (position - (angles[low] - origin)) / width : 0.0;
  }
};

Bool IESLight::IsComplete() const
{
  return GetVerticalCount() <= kMaxIESAngles && GetHorizontalCount() <= kMaxIESAngles &&
         GetVerticalCount() * GetHorizontalCount() == candela.GetCount();
}

// Where an angle from 0 to below 360 lies among the horizontal angles, which may cover a part of the circle only.
Real IESLight::GetHorizontalPosition(Real angle) const
{
  const Real first = horizontalAngles[0];
  const Real span = horizontalAngles[GetHorizontalCount() - 1] - first;
  if (span < kSpanOfSymmetry)
    return 0.0;
  if (span < kSpanOfQuadrant) {
    const Real half = angle > 180.0 ? 360.0 - angle : angle;
    return half > 90.0 ? 180.0 - half : half;
  }
  if (span < kSpanOfHalf) {
    const Real distance = std::fabs(angle - first);
    return distance > 180.0 ? 360.0 - distance : distance;
  }
  return angle;
}

// A cubic through the row's values; its slopes are those between the neighbours on both sides, or at the ends of the
// table between the last two.
Real IESLight::SampleRow(Long row, const Interval& vertical) const
{
  const Long count = GetVerticalCount();
  const Real* values = candela.Data() + static_cast<LLong>(row) * count;
  const Real width = verticalAngles[vertical.high] - verticalAngles[vertical.low];
  auto tangent = [&](Long before, Long behind) {
    before = before < 0 ? 0 : before;
    behind = behind > count - 1 ? count - 1 : behind;
    const Real distance = verticalAngles[behind] - verticalAngles[before];
    return distance != 0.0 ? (values[behind] - values[before]) / distance * width : 0.0;
  };
  return HermiteValue(values[vertical.low], values[vertical.high], tangent(vertical.low - 1, vertical.high),
                      tangent(vertical.low, vertical.high + 1), vertical.fraction);
}

Real IESLight::SampleIESLight(const Vector& direction) const
{
  if (!HasSamples())
    return 0.0;
  const Angles angles = GetAngles(direction);
  return SampleAt(angles.vertical, angles.horizontal);
}

Bool IESLight::HasSamples() const { return GetVerticalCount() > 0 && GetHorizontalCount() > 0 && IsComplete(); }

Real IESLight::SampleAt(Real vertical, Real horizontal) const
{
  if (!(vertical >= verticalAngles[0] && vertical <= verticalAngles[GetVerticalCount() - 1]))
    return 0.0;
  const Interval rows(horizontalAngles, horizontalAngles[0], GetHorizontalPosition(horizontal));
  const Interval columns(verticalAngles, 0.0, vertical);
  const Real low = SampleRow(rows.low, columns);
  const Real high = rows.high == rows.low ? low : SampleRow(rows.high, columns);
  Real value = low + (high - low) * rows.fraction;
  if (maxCandela > 0.0)
    value /= maxCandela;
  return value > 0.0 ? value : 0.0;
}

void IESLight::FindMaximum()
{
  maxCandela = candela.GetCount() > 0 ? candela[0] : 0.0;
  for (Real value : candela)
    maxCandela = value > maxCandela ? value : maxCandela;
  fluxIsOpen_ = true;
}

void IESLight::Normalise()
{
  FindMaximum();
  GetTotalFlux();
}

Real IESLight::GetTotalFlux() const
{
  if (!fluxIsOpen_)
    return totalFlux_;
  Real sum = 0.0;
  if (HasSamples()) {
    for (const Angles& angles : GetFluxDirections())
      sum += SampleAt(angles.vertical, angles.horizontal);
  }
  fluxIsOpen_ = false;
  return totalFlux_ = sum * kFluxOfSample;
}

void IESLight::SetTotalFlux(Real flux)
{
  totalFlux_ = flux;
  fluxIsOpen_ = false;
}

// The mean all around of the intensities at a vertical angle. A table of a part of the circle stands for the rest by
// symmetry; one that goes all around but ends before it is closed goes on to its first row.
Real IESLight::GetMeanIntensity(Long vertical) const
{
  const Long last = GetHorizontalCount() - 1;
  const Long step = GetVerticalCount();
  const Real* values = candela.Data() + vertical;
  Real span = horizontalAngles[last] - horizontalAngles[0];
  Real sum = 0.0;
  for (Long i = 0; i < last; ++i)
    sum += (horizontalAngles[i + 1] - horizontalAngles[i]) * (values[i * step] + values[(i + 1) * step]) / 2.0;
  if (span >= kSpanOfHalf && span < kCircle) {
    sum += (kCircle - span) * (values[last * step] + values[0]) / 2.0;
    span = kCircle;
  }
  return span > 0.0 ? sum / span : values[0];
}

Real IESLight::GetLumens() const
{
  Real lumens = 0.0;
  if (GetHorizontalCount() == 0 || !IsComplete())
    return lumens;
  for (Long i = 0; i + 1 < GetVerticalCount(); ++i) {
    const Real height =
        std::cos(DegreesToRadians(verticalAngles[i])) - std::cos(DegreesToRadians(verticalAngles[i + 1]));
    lumens += 2.0 * kPi * height * (GetMeanIntensity(i) + GetMeanIntensity(i + 1)) / 2.0;
  }
  return lumens;
}

IESLight* CopyIESLight(const IESLight* source)
{
  IESLight* copy = source ? NewObj<IESLight>() : nullptr;
  if (!copy)
    return nullptr;
  copy->fileVersion = source->fileVersion;
  copy->tiltMode = source->tiltMode;
  copy->shape = source->shape;
  copy->size = source->size;
  copy->maxCandela = source->maxCandela;
  copy->totalFlux_ = source->totalFlux_;
  copy->fluxIsOpen_ = source->fluxIsOpen_;
  if (!CopyText(source->manufacturer, copy->manufacturer) ||
      !CopyText(source->luminaireCatalogue, copy->luminaireCatalogue) ||
      !CopyText(source->luminaire, copy->luminaire) || !CopyText(source->lampCatalogue, copy->lampCatalogue) ||
      !CopyText(source->lamp, copy->lamp) || !source->verticalAngles.CopyTo(copy->verticalAngles) ||
      !source->horizontalAngles.CopyTo(copy->horizontalAngles) || !source->candela.CopyTo(copy->candela))
    DeleteObj(copy);
  return copy;
}

template <>
struct ChunkFields<IESLight>
{
  template <class Visitor>
  static Bool VisitStored(IESLight& light, Visitor& v)
  {
    Long version = kRecordVersion;
    Long verticalCount = light.GetVerticalCount();
    Long horizontalCount = light.GetHorizontalCount();
    v.Long(version);
    v.Long(light.fileVersion);
    v.Long(light.tiltMode);
    VisitNumber(v, version, light.maxCandela);
    v.Long(verticalCount);
    v.Long(horizontalCount);
    for (Long count : {verticalCount, horizontalCount})
      v.Note(count >= 0 && count <= kMaxIESAngles);
    if (!v.Good())
      return false;
    VisitTable(v, version, light.verticalAngles, verticalCount);
    VisitTable(v, version, light.horizontalAngles, horizontalCount);
    VisitTable(v, version, light.candela, verticalCount * horizontalCount);
    if (version >= kVersionTexts) {
      for (String* text :
           {&light.manufacturer, &light.luminaireCatalogue, &light.luminaire, &light.lampCatalogue, &light.lamp})
        v.String(*text);
      v.Long(light.shape);
      v.Vector(light.size);
    }
    Real flux = Visitor::kReading ? 0.0 : light.GetTotalFlux();
    if (version < kVersionFlux)
      light.FindMaximum();
    else if (VisitNumber(v, version, flux))
      light.SetTotalFlux(flux);
    return v.Good();
  }
};

Bool IESLight::Write(HyperFile& file)
{
  ChunkWriter writer(file, 0);
  return ChunkFields<IESLight>::VisitStored(*this, writer);
}

Bool IESLight::Read(HyperFile& file)
{
  ChunkReader reader(file, 0);
  return ChunkFields<IESLight>::VisitStored(*this, reader);
}

} // namespace _torvane_
