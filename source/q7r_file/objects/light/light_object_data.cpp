#include "torvane/objects/light_object_data.h"

#include "q7r_file/nodes/node_tools.h"
#include "torvane/objects/base_object.h"
#include "torvane/values/ge_data.h"

namespace _torvane_
{

const LightObjectData::Settings& LightObjectData::GetDefaults()
{
  static const Settings kDefaults = [] {
    Settings settings{};
    for (const LightParameterRange& range : kLightParameters) {
      for (Long id = range.first; id <= range.last; ++id) {
        const LightSlot slot = FindLightSlot(id);
        if (slot.kind == LightKind::kLong)
          settings.longs[slot.index] = static_cast<Long>(range.number);
        else if (slot.kind == LightKind::kReal)
          settings.reals[slot.index] = range.number;
        else if (slot.kind == LightKind::kBool)
          settings.bools[slot.index] = range.number != 0.0;
        else
          settings.vectors[slot.index] = Vector(range.number, range.number, range.number);
      }
    }
    return settings;
  }();
  return kDefaults;
}

// The light's own settings, made from the defaults if there are none; null when memory is short.
LightObjectData::Settings* LightObjectData::NeedSettings()
{
  if (!settings_)
    settings_ = NewObj<Settings>(GetDefaults());
  return settings_;
}

LightObjectData::~LightObjectData()
{
  DeleteObj(settings_);
  DeleteObj(iesLight_);
}

void LightObjectData::AdoptIES(IESLight* light)
{
  if (light == iesLight_)
    return;
  DeleteObj(iesLight_);
  iesLight_ = light;
}

Bool LightObjectData::GetParameter(const ParameterPath& path, GeData& value)
{
  const LightSlot slot = FindLightSlot(path[0].id);
  switch (slot.kind) {
  case LightKind::kLong:
    value = GeData(GetSettings().longs[slot.index]);
    return true;
  case LightKind::kReal:
    value = GeData(GetSettings().reals[slot.index]);
    return true;
  case LightKind::kBool:
    value = GeData(GetSettings().bools[slot.index]);
    return true;
  case LightKind::kVector:
    return GetVectorParameter(GetSettings().vectors[slot.index], path, value);
  default:
    return NodeData::GetParameter(path, value);
  }
}

Bool LightObjectData::SetParameter(const ParameterPath& path, const GeData& value)
{
  const LightSlot slot = FindLightSlot(path[0].id);
  if (slot.kind == LightKind::kNone)
    return NodeData::SetParameter(path, value);
  if (!NeedSettings())
    return false;
  switch (slot.kind) {
  case LightKind::kLong:
    settings_->longs[slot.index] =
        path[0].id == kLightKnotCount ? ClampLightKnotCount(value.GetLong()) : value.GetLong();
    return true;
  case LightKind::kReal:
    settings_->reals[slot.index] = value.GetReal();
    return true;
  case LightKind::kBool:
    settings_->bools[slot.index] = value.GetBool();
    return true;
  case LightKind::kVector:
    return SetVectorParameter(settings_->vectors[slot.index], path, value);
  case LightKind::kNone:
    break;
  }
  return false;
}

Bool LightObjectData::CopyTo(PrivateChunk& destination, ULong flags, TransArray* translation)
{
  auto* target = NodeCast<LightObjectData>(&destination);
  if (!target || !NodeData::CopyTo(destination, flags, translation))
    return false;
  if (target == this)
    return true;
  if (!settings_)
    DeleteObj(target->settings_);
  else if (target->NeedSettings())
    *target->settings_ = *settings_;
  else
    return false;
  target->AdoptIES(CopyIESLight(iesLight_));
  return !iesLight_ || target->iesLight_;
}

} // namespace _torvane_
