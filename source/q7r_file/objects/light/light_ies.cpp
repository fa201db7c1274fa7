// A measured distribution on a light.
#include "torvane/document/base_document.h"
#include "torvane/objects/light_object_data.h"
#include "torvane/objects/unit_factors.h"
#include "torvane/values/ge_data.h"

namespace _torvane_
{

namespace
{

// Entries of the light's object that tell of its distribution.
constexpr Long kKeySizeX = 100010;
constexpr Long kKeySizeY = 100011;
constexpr Long kKeySizeZ = 100012;
constexpr Long kKeyShape = 100015;
constexpr Long kKeyMaxCandela = 90043;
constexpr Long kKeyManufacturer = 90050; // and the four other texts behind it
constexpr Long kShapeOfUnknown = 1;

LightObjectData* LightDataOf(const BaseObject* object)
{
  return object && object->GetType() == kObjectLight ? NodeCast<LightObjectData>(object->GetObjectData()) : nullptr;
}

// From metres to the unit of a document.
Real UnitFactor(const BaseDocument* document)
{
  if (!document)
    return 1.0;
  UnitScaleData metres(*FindCustomDataType(kCustomUnitScale));
  metres.scale = 1.0;
  metres.unit = kUnitMetre;
  const CustomData* unit = document->GetDataInstance().GetCustomDataType(kKeyDocumentUnit, kCustomUnitScale);
  return ConvertUnits(&metres, NodeCast<UnitScaleData>(unit));
}

void SetEntries(BaseContainer& settings, const IESLight& light, const Vector& size)
{
  settings.SetBool(90042, true);
  settings.SetBool(90046, true);
  settings.SetLong(90037, 1);
  settings.SetReal(kKeyMaxCandela, light.maxCandela);
  Long key = kKeyManufacturer;
  for (const String* text :
       {&light.manufacturer, &light.luminaireCatalogue, &light.luminaire, &light.lampCatalogue, &light.lamp})
    settings.SetString(key++, *text);
  settings.SetReal(kKeySizeX, size.x);
  settings.SetReal(kKeySizeY, size.y);
  settings.SetReal(kKeySizeZ, size.z);
  settings.SetLong(kKeyShape, light.shape == -1 ? kShapeOfUnknown : light.shape);
}

} // namespace

const NodeKind& LightObjectData::GetOwnerKind() const { return BaseObject::kNodeKind; }

Bool SetIESLight(BaseObject* object, IESLight* parsed, BaseDocument* document)
{
  LightObjectData* data = LightDataOf(object);
  if (!data)
    return false;
  if (parsed && parsed == data->GetIES()) // setting a light's own again
    return true;
  data->AdoptIES(nullptr);
  if (!parsed)
    return true;
  parsed->Normalise();
  IESLight* light = CopyIESLight(parsed);
  if (!light)
    return true;
  data->AdoptIES(light);
  data->SetParameter(kLightType, GeData(static_cast<Long>(kLightIES)));
  const Vector size = light->size * UnitFactor(document);
  SetEntries(object->GetDataInstance(), *light, size);
  data->SetParameter(90013, GeData(0.5 * size.x));
  data->SetParameter(90014, GeData(static_cast<Long>(10)));
  data->SetParameter(90025, GeData(1000.0));
  return true;
}

IESLight* GetIESLight(const BaseObject* object)
{
  const LightObjectData* data = LightDataOf(object);
  return data ? data->GetIES() : nullptr;
}

} // namespace _torvane_
