// What a gradient holds: copying, comparing, its file form and its parameters.
#include "torvane/shaders/gradient.h"

#include <limits>

#include "int_customgui_gradient/gradient_knots.h"
#include "k2v_file/values/vector_component.h"
#include "torvane/memory/assertion.h"
#include "torvane/stream/hyper_file.h"
#include "torvane/values/ge_data.h"

namespace _torvane_
{

namespace
{

constexpr const char* kModule = "int_customgui_gradient";
constexpr Long kLineStaleCache = 107; // what readers of the log know the report by

constexpr Vector kWhite(1.0, 1.0, 1.0);

// The entry of a knot that a field stands for; -1 for a number that is no field.
Long EntryOf(Long field)
{
  constexpr Long kEntries[] = {kKnotColor, kKnotBrightness, kKnotPosition, kKnotBias};
  return field >= kFieldColor && field <= kFieldBias ? kEntries[field] : -1;
}

Bool GetKnotValue(const BaseContainer& knot, Long field, const ParameterPath& path, GeData& value)
{
  if (field != kFieldColor) {
    value = GeData(knot.GetReal(EntryOf(field)));
    return true;
  }
  Vector color = knot.GetVector(kKnotColor);
  if (path[1].id == 0) {
    value = GeData(color);
    return true;
  }
  const Real* component = ComponentOf(color, path[1].id);
  if (component)
    value = GeData(*component);
  return component != nullptr;
}

Bool SetKnotValue(BaseContainer& knot, Long field, const ParameterPath& path, const GeData& value)
{
  if (field != kFieldColor) {
    knot.SetReal(EntryOf(field), value.GetReal());
    return true;
  }
  if (path[1].id == 0) {
    knot.SetVector(kKnotColor, value.GetVector());
    return true;
  }
  Vector color = knot.GetVector(kKnotColor);
  Real* component = ComponentOf(color, path[1].id);
  if (!component)
    return false;
  *component = value.GetReal();
  knot.SetVector(kKnotColor, color);
  return true;
}

} // namespace

GradientData::GradientData() { settings_.SetContainer(kGradientKnots, BaseContainer()); }

GradientData::~GradientData()
{
  FreeGradientCache();
  DropAlpha();
}

GradientData* GradientData::NeedAlpha()
{
  if (!alpha_)
    alpha_ = NewObj<GradientData>();
  if (alpha_)
    alpha_->isAlpha_ = 1;
  return alpha_;
}

// ---------------------------------------------------------------------------------------------------------------
// Copying and comparing

Bool CopyGradient(const GradientData& source, GradientData& destination, TransArray* translation)
{
  if (&source == &destination)
    return true;
  if (destination.knotCache_) {
    ReportAssertion(kModule, kLineStaleCache, "a gradient was copied onto one that is in use");
    destination.FreeGradientCache();
  }
  GradientData* replaced = destination.alpha_; // it may be the source
  destination.alpha_ = nullptr;
  Bool copied = source.settings_.CopyTo(destination.settings_, 0, translation);
  if (copied) {
    destination.isAlpha_ = source.isAlpha_;
    destination.fromOldFile_ = source.fromOldFile_;
    copied =
        !source.alpha_ || (destination.NeedAlpha() && CopyGradient(*source.alpha_, *destination.alpha_, translation));
  }
  DeleteObj(replaced);
  return copied;
}

Bool GradientsDiffer(const GradientData& a, const GradientData& b)
{
  if (a.isAlpha_ != b.isAlpha_ || !a.settings_.IsEqual(b.settings_))
    return true;
  if (!a.alpha_ || !b.alpha_)
    return a.alpha_ != b.alpha_;
  return !a.alpha_->settings_.IsEqual(b.alpha_->settings_);
}

Bool GradientData::IsEqual(const CustomData& other) const
{
  const auto* gradient = NodeCast<GradientData>(&other);
  return gradient && !GradientsDiffer(*this, *gradient);
}

Bool GradientData::CopyTo(CustomData& destination, TransArray* translation) const
{
  auto* target = NodeCast<GradientData>(&destination);
  return target && CopyGradient(*this, *target, translation);
}

// ---------------------------------------------------------------------------------------------------------------
// The file

void NumberKnots(GradientData& gradient, Bool convertAlpha)
{
  Long last = 0;
  ForEachKnot(gradient, [&](const BaseContainer& knot, ULong) {
    const Long id = knot.GetLong(kKnotId);
    last = id > last ? id : last;
    return true;
  });
  ForEachKnot(gradient, [&](BaseContainer& knot, ULong) {
    if (knot.GetLong(kKnotId) == 0 && last < std::numeric_limits<Long>::max())
      knot.SetLong(kKnotId, ++last);
    if (convertAlpha && gradient.IsAlpha()) {
      knot.SetReal(kKnotBrightness, knot.GetReal(kKnotBrightness) * knot.GetVector(kKnotColor).x);
      knot.SetVector(kKnotColor, kWhite);
    }
    return true;
  });
}

Bool GradientData::ReadGradient(HyperFile& file, Long level)
{
  if (level < 1)
    return true;
  FreeGradientCache();
  DropAlpha();
  const Bool old = file.GetFileVersion() < kVersionGreyAlpha;
  fromOldFile_ = old ? 1 : 0;
  Bool hasAlpha = false;
  if (!file.ReadContainer(settings_, true) || !file.ReadBool(hasAlpha))
    return false;
  NumberKnots(*this, false);
  if (!hasAlpha)
    return true;
  if (!NeedAlpha()) {
    file.SetError(FILEERROR_MEMORY);
    return false;
  }
  if (!file.ReadContainer(alpha_->settings_, true))
    return false;
  alpha_->fromOldFile_ = fromOldFile_;
  NumberKnots(*alpha_, old);
  return true;
}

Bool GradientData::WriteGradient(HyperFile& file) const
{
  return file.WriteContainer(settings_) && file.WriteBool(alpha_ != nullptr) &&
         (!alpha_ || file.WriteContainer(alpha_->settings_));
}

Bool GradientData::Read(HyperFile& file, Long level) { return ReadGradient(file, level) && file.SkipToEndChunk(); }

void GradientData::Write(HyperFile& file) const { WriteGradient(file); }

// ---------------------------------------------------------------------------------------------------------------
// Parameters

// The first knot of that id, or null.
BaseContainer* GradientData::FindKnot(Long knotId) const
{
  BaseContainer* found = nullptr;
  ForEachKnot(*this, [&](BaseContainer& knot, ULong) {
    if (knot.GetLong(kKnotId) == knotId)
      found = &knot;
    return found == nullptr;
  });
  return found;
}

// The gradient that an id addresses; the id becomes the one within it. Null when there is no transparency.
const GradientData* GradientData::PartOf(Long& id) const
{
  if (id <= kGradientAlphaOffset)
    return this;
  id -= kGradientAlphaOffset;
  return alpha_;
}

Bool GradientData::GetGradientValue(const ParameterPath& path, GeData& value, ULong& flags) const
{
  Long id = path[0].id;
  const GradientData* part = PartOf(id);
  Bool answered = false;
  if (id == 0) {
    value = GeData(kCustomGradient, *this);
    answered = value.GetCustom() != nullptr;
  } else if (part && id == kGradientInterpolation) {
    value = GeData(part->settings_.GetLong(kGradientInterpolation));
    answered = true;
  } else if (part && id >= kGradientFirstKnot) {
    const Long field = (id - kGradientFirstKnot) % kGradientIdsPerKnot;
    const BaseContainer* knot = part->FindKnot((id - kGradientFirstKnot) / kGradientIdsPerKnot);
    answered = knot && EntryOf(field) >= 0 && GetKnotValue(*knot, field, path, value);
  }
  if (answered)
    flags |= kParameterAnswered;
  return answered;
}

Bool GradientData::SetGradientValue(const ParameterPath& path, const GeData& value, ULong& flags)
{
  Long id = path[0].id;
  auto* part = const_cast<GradientData*>(PartOf(id)); // this gradient or its transparency
  Bool answered = false;
  if (id == 0) {
    const auto* source = NodeCast<GradientData>(value.GetCustomDataType(kCustomGradient));
    FreeGradientCache();
    answered = source && CopyGradient(*source, *this);
  } else if (part && id == kGradientInterpolation) {
    part->settings_.SetLong(kGradientInterpolation, value.GetLong());
    answered = true;
  } else if (part && id >= kGradientFirstKnot) {
    const Long field = (id - kGradientFirstKnot) % kGradientIdsPerKnot;
    BaseContainer* knot = part->FindKnot((id - kGradientFirstKnot) / kGradientIdsPerKnot);
    answered = knot && EntryOf(field) >= 0 && SetKnotValue(*knot, field, path, value);
  }
  if (answered)
    flags |= kParameterAnswered;
  return answered;
}

} // namespace _torvane_
