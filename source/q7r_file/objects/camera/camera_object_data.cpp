#include "torvane/objects/camera_object_data.h"

#include <cmath>

#include "k2v_file/values/container_defaults.h"
#include "torvane/document/base_document.h"
#include "torvane/tags/base_tag.h"
#include "torvane/values/ge_data.h"

namespace _torvane_
{

namespace
{

// In the order of a new camera's container.
constexpr ContainerDefault kCameraDefaults[] = {
    {kCameraFocalLength, DefaultForm::kReal, 36.0},
    {1000, DefaultForm::kReal, 1.0},
    {kCameraProjection, DefaultForm::kLong, 0},
    {kCameraApertureWidth, DefaultForm::kReal, 36.0},
    {1007, DefaultForm::kBool, true},
    {kCameraUseTarget, DefaultForm::kBool, false},
    {kCameraFocusDistance, DefaultForm::kReal, 2000.0},
    {1111, DefaultForm::kBool, false},
    {1114, DefaultForm::kBool, false},
    {1112, DefaultForm::kReal, 0.0},
    {1115, DefaultForm::kReal, 0.0},
    {1113, DefaultForm::kReal, 1000.0},
    {1116, DefaultForm::kReal, 1000.0},
    {1118, DefaultForm::kReal, 0.0},
    {1119, DefaultForm::kReal, 0.0},
    {1321, DefaultForm::kReal, 0.0},
    {1322, DefaultForm::kReal, 0.0},
    {1122, DefaultForm::kReal, 0.0},
    {1123, DefaultForm::kBool, false},
    {1128, DefaultForm::kReal, 10000.0},
    {1129, DefaultForm::kBool, false},
    {1130, DefaultForm::kLink},
    {kCameraApertureNumber, DefaultForm::kReal, 8.0},
    {kCameraExposureTime, DefaultForm::kReal, 0.03333333333333333},
    {1212, DefaultForm::kReal, 3.141592653589793},
    {1213, DefaultForm::kReal, 0.0},
    {1214, DefaultForm::kReal, 0.7},
    {1220, DefaultForm::kBool, false},
    {kCameraFilmSpeed, DefaultForm::kReal, 200.0},
    {1241, DefaultForm::kReal, 0.0},
    {1300, DefaultForm::kBool, false},
    {1301, DefaultForm::kLong, 6},
    {1302, DefaultForm::kReal, 0.0},
    {1303, DefaultForm::kReal, 0.0},
    {1306, DefaultForm::kReal, 0.0},
    {1305, DefaultForm::kLink},
    {kCameraTemperature, DefaultForm::kReal, 6500.0},
    {1312, DefaultForm::kReal, 0.0},
    {1331, DefaultForm::kReal, 0.0},
    {1333, DefaultForm::kReal, 0.0},
    {1341, DefaultForm::kReal, 0.0},
    {4200, DefaultForm::kLong, 0},
    {4201, DefaultForm::kReal, 6.5},
    {4202, DefaultForm::kLong, 0},
    {4204, DefaultForm::kReal, 800.0},
    {4205, DefaultForm::kReal, 1000.0},
    {4206, DefaultForm::kReal, 1200.0},
    {4207, DefaultForm::kBool, true},
};

// A list of usual values for one stored entry.
struct PresetList
{
  Long id;
  Long storedId;
  Real tolerance;
  Bool refusesOthers; // setting a position outside the list gives false
  Long count;
  const Real* values;
};

constexpr Real kApertureWidths[] = {4.8, 9.6, 36.0, 22.0, 52.5};
constexpr Real kFocalLengths[] = {15.0, 25.0, 36.0, 50.0, 80.0, 135.0, 300.0};
constexpr Real kApertureNumbers[] = {1.0, 1.1, 1.2, 1.4, 1.6, 1.8, 2.0, 2.2,  2.5,  2.8,  3.2,  3.5,  4.0,  4.5,
                                     5.0, 5.6, 6.3, 7.1, 8.0, 9.0, 10., 11.0, 13.0, 14.0, 16.0, 18.0, 20.0, 22.0};
constexpr Real kExposureTimes[] = {
    0.001, 0.002, 0.004, 0.008, 0.016666666666666666, 0.03333333333333333, 0.06666666666666667, 0.125, 0.25, 1.0, 2.0,
    4.0,   8.0,   15.0,  30.0};
constexpr Real kFilmSpeeds[] = {50.0, 100.0, 200.0, 400.0, 800.0, 1600.0, 3200.0, 6400.0};
constexpr Real kTemperatures[] = {2000.0, 3000.0, 4500.0, 5500.0, 6500.0, 7500.0, 9000.0};

template <std::size_t count>
constexpr PresetList Presets(Long id, Long storedId, const Real (&values)[count], Real tolerance = 0.001)
{
  return {id, storedId, tolerance, id == kCameraTemperaturePreset, static_cast<Long>(count), values};
}

constexpr PresetList kPresetLists[] = {
    Presets(kCameraApertureWidthPreset, kCameraApertureWidth, kApertureWidths),
    Presets(kCameraFocalLengthPreset, kCameraFocalLength, kFocalLengths),
    Presets(kCameraApertureNumberPreset, kCameraApertureNumber, kApertureNumbers),
    Presets(kCameraExposureTimePreset, kCameraExposureTime, kExposureTimes, 0.0001),
    Presets(kCameraFilmSpeedPreset, kCameraFilmSpeed, kFilmSpeeds),
    Presets(kCameraTemperaturePreset, kCameraTemperature, kTemperatures),
};

const PresetList* FindPresets(Long id)
{
  for (const PresetList& list : kPresetLists) {
    if (list.id == id)
      return &list;
  }
  return nullptr;
}

Long PositionIn(const PresetList& list, Real value)
{
  for (Long i = 0; i < list.count; ++i) {
    if (std::fabs(value - list.values[i]) < list.tolerance)
      return i + 1;
  }
  return 0;
}

Bool StorePreset(const PresetList& list, Long position, BaseContainer& settings)
{
  if (position < 1 || position > list.count)
    return !list.refusesOthers;
  settings.SetReal(list.storedId, list.values[position - 1]);
  return true;
}

// " 50 mm": what focal length gives the same view on 36 mm film, with up to three places.
String EquivalentText(const BaseContainer& settings)
{
  Real length = 36.0 * settings.GetReal(kCameraFocalLength) / settings.GetReal(kCameraApertureWidth);
  const String number = String::FromReal(length, -1, 3);
  Long end = number.GetLength();
  if (Long point = 0; number.FindFirst(UniChar{u'.'}, point)) {
    while (end > point + 1 && number[end - 1] == u'0')
      --end;
    if (end == point + 1)
      end = point;
  }
  return String(" ") + number.SubStr(0, end) + String(" mm");
}

// The angle over which a camera sees a width that stands at its focal length, all times `factor`; false for a length
// that isn't positive.
Bool GetFieldOfView(const BaseContainer& settings, Real factor, GeData& value)
{
  Real focalLength = settings.GetReal(kCameraFocalLength);
  if (!(focalLength > 0.0))
    return false;
  value = GeData(2.0 * std::atan(0.5 * settings.GetReal(kCameraApertureWidth) / focalLength * factor));
  return true;
}

// Brings 4204 and 4206 into line with what they are computed from.
void UpdateDistancePair(BaseContainer& settings)
{
  const Long choice = settings.GetLong(4208);
  if (settings.GetLong(kCameraProjection) != 0 || choice == 0)
    return;
  const Real distance = settings.GetReal(4205);
  const Real seen = settings.GetReal(kCameraApertureWidth) / settings.GetReal(kCameraFocalLength) * distance;
  const Real part = choice == 1 ? 30.0 : 23.0;
  const Real base = settings.GetReal(4201);
  if (settings.GetLong(4202) != 0) {
    const Real both = 2.0 * part;
    const Real depth = seen * distance / (both * base * (1.0 + seen / both / base));
    settings.SetReal(4204, distance - depth);
    settings.SetReal(4206, distance + depth);
  } else {
    const Real result = base * part * seen / distance;
    settings.SetReal(4204, result);
    settings.SetReal(4206, result);
  }
}

} // namespace

const NodeKind& CameraObjectData::GetOwnerKind() const { return BaseObject::kNodeKind; }

BaseContainer& CameraObjectData::GetSettings() const { return node_->GetDataInstance(); }

Bool CameraObjectData::Init()
{
  if (!node_)
    return false;
  return GetSettings().SetDefaults(DefaultsOf<kCameraDefaults>());
}

// The relation of height to width in which the document is rendered.
Real CameraObjectData::GetAspectFactor() const
{
  BaseDocument* document = node_->GetDocument();
  const RenderData* active = document ? document->GetActiveRenderData() : nullptr;
  if (!active || active->GetDataInstance().GetLong(5033) == 1150)
    return 1.0;
  return 1.0 / active->GetDataInstance().GetReal(kRenderFilmAspect);
}

Bool CameraObjectData::HasTarget() const
{
  const auto* camera = NodeCast<BaseObject>(node_);
  const BaseTag* tag = camera ? camera->GetTag(kTagTarget) : nullptr;
  return tag && tag->GetDataInstance().GetLink(kTargetLink);
}

void CameraObjectData::SetFieldOfView(Real angle, Real factor)
{
  const Real half = 0.5 * angle;
  if (!(half > 0.0))
    return;
  BaseContainer& settings = GetSettings();
  settings.SetReal(kCameraFocalLength, 0.5 * settings.GetReal(kCameraApertureWidth) / std::tan(half) * factor);
}

Bool CameraObjectData::GetParameter(const ParameterPath& path, GeData& value)
{
  if (!node_)
    return false;
  BaseContainer& settings = GetSettings();
  const Long id = path[0].id;
  if (const PresetList* list = FindPresets(id)) {
    value = GeData(PositionIn(*list, settings.GetReal(list->storedId)));
    return true;
  }
  switch (id) {
  case kCameraFieldOfView:
    GetFieldOfView(settings, 1.0, value);
    return true;
  case kCameraVerticalFieldOfView:
    GetFieldOfView(settings, GetAspectFactor(), value);
    return true;
  case kCameraEquivalentText:
    value = GeData(EquivalentText(settings));
    return true;
  case kCameraUseTarget:
    if (!HasTarget())
      settings.SetBool(kCameraUseTarget, false);
    value = GeData(settings.GetBool(kCameraUseTarget));
    return true;
  default:
    return NodeData::GetParameter(path, value);
  }
}

Bool CameraObjectData::SetParameter(const ParameterPath& path, const GeData& value)
{
  if (!node_)
    return false;
  BaseContainer& settings = GetSettings();
  const Long id = path[0].id;
  if (const PresetList* list = FindPresets(id))
    return StorePreset(*list, value.GetLong(), settings);
  switch (id) {
  case kCameraFieldOfView:
    SetFieldOfView(value.GetReal(), 1.0);
    return true;
  case kCameraVerticalFieldOfView:
    SetFieldOfView(value.GetReal(), GetAspectFactor());
    return true;
  case 4201:
  case 4205:
  case 4208:
    settings.SetReal(id, value.GetReal());
    UpdateDistancePair(settings);
    return true;
  default:
    return NodeData::SetParameter(path, value);
  }
}

} // namespace _torvane_
