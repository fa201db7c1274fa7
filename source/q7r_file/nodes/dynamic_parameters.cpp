// Parameters added at run time: one nested container of settings for each, keyed by a number.
#include "torvane/nodes/base_list.h"

namespace _torvane_
{

namespace
{

// Keys of a settings container.
constexpr Long kSettingName = 1;
constexpr Long kSettingShortName = 2;
constexpr Long kSettingVersion = 3;
constexpr Long kSettingAnimate = 10;
constexpr Long kSettingMatrix = 16;
constexpr Long kSettingAccepts = 17;

enum class Form
{
  kLong,
  kReal,
  kVector, // all three components
  kMatrix,
  kAccepts, // a container that names what a link may point at
};

struct Setting
{
  Long type;
  Long key;
  Form form;
  Real number;
};

constexpr Long kUnitFree = 0x66726561;
constexpr Long kUnitWhole = 0x666C6E67;

// What each data type adds to the common settings, in order: limits, whether a limit holds, step, animation, unit and
// the element that edits it.
constexpr Setting kSettings[] = {
    {kDataColorAlias, 5, Form::kVector, 0.0},
    {kDataColorAlias, 6, Form::kVector, 1.0},
    {kDataColorAlias, 7, Form::kLong, 0},
    {kDataColorAlias, 8, Form::kLong, 0},
    {kDataColorAlias, 9, Form::kVector, 0.01},
    {kDataColorAlias, kSettingAnimate, Form::kLong, 1},
    {kDataColorAlias, 12, Form::kLong, kUnitFree},
    {kDataColorAlias, 21, Form::kLong, 1000492},
    {8, 21, Form::kLong, 8},
    {11, 21, Form::kLong, 11},
    {13, 21, Form::kLong, 13},
    {kDataLong, 5, Form::kLong, -2147483647.0},
    {kDataLong, 6, Form::kLong, 2147483647.0},
    {kDataLong, 7, Form::kLong, 0},
    {kDataLong, 8, Form::kLong, 0},
    {kDataLong, 9, Form::kLong, 1},
    {kDataLong, kSettingAnimate, Form::kLong, 1},
    {kDataLong, 12, Form::kLong, kUnitWhole},
    {kDataLong, 21, Form::kLong, kDataLong},
    {kDataReal, 5, Form::kReal, -1e20},
    {kDataReal, 6, Form::kReal, 1e20},
    {kDataReal, 7, Form::kLong, 0},
    {kDataReal, 8, Form::kLong, 0},
    {kDataReal, 9, Form::kReal, 1.0},
    {kDataReal, kSettingAnimate, Form::kLong, 1},
    {kDataReal, 12, Form::kLong, kUnitFree},
    {kDataReal, 21, Form::kLong, kDataReal},
    {kDataVector, 5, Form::kVector, -1e20},
    {kDataVector, 6, Form::kVector, 1e20},
    {kDataVector, 7, Form::kLong, 0},
    {kDataVector, 8, Form::kLong, 0},
    {kDataVector, 9, Form::kVector, 1.0},
    {kDataVector, kSettingAnimate, Form::kLong, 1},
    {kDataVector, 12, Form::kLong, kUnitFree},
    {kDataVector, 21, Form::kLong, kDataVector},
    {kDataMatrix, kSettingAnimate, Form::kLong, 1},
    {kDataMatrix, 21, Form::kLong, 0},
    {kDataMatrix, kSettingMatrix, Form::kMatrix, 0},
    {kDataString, kSettingAnimate, Form::kLong, 1},
    {kDataString, 21, Form::kLong, kDataString},
    {kDataFilename, kSettingAnimate, Form::kLong, 1},
    {kDataFilename, 21, Form::kLong, 1000478},
    {kDataLink, kSettingAnimate, Form::kLong, 1},
    {kDataLink, 21, Form::kLong, 1009415},
    {kDataLink, kSettingAccepts, Form::kAccepts, 0},
    {kDataLink, 30, Form::kLong, 1},
    {kDataBoolAlias, 5, Form::kLong, 0},
    {kDataBoolAlias, 6, Form::kLong, 1},
    {kDataBoolAlias, 7, Form::kLong, 0},
    {kDataBoolAlias, 8, Form::kLong, 0},
    {kDataBoolAlias, 9, Form::kLong, 1},
    {kDataBoolAlias, kSettingAnimate, Form::kLong, 1},
    {kDataBoolAlias, 21, Form::kLong, kDataBoolAlias},
};

GeData ValueOf(const Setting& setting)
{
  switch (setting.form) {
  case Form::kLong:
    return GeData(static_cast<Long>(setting.number));
  case Form::kReal:
    return GeData(setting.number);
  case Form::kVector:
    return GeData(Vector(setting.number, setting.number, setting.number));
  case Form::kMatrix:
    return GeData(Matrix());
  case Form::kAccepts:
    break;
  }
  BaseContainer accepts;
  accepts.SetString(kChunkNodeHeader, String());
  return GeData(accepts);
}

// The key of a dynamic parameter's path, or 0 for any other path.
Long KeyOf(const ParameterPath& path) { return path[0].Matches({kDynamicParameters, kDataGroup, 0}) ? path[1].id : 0; }

} // namespace

BaseContainer MakeDynamicSettings(Long type, const String& name)
{
  BaseContainer settings(type);
  settings.SetString(kSettingName, String());
  settings.SetString(kSettingShortName, String());
  settings.SetLong(kSettingVersion, 3);
  settings.SetLong(kSettingAnimate, 0);
  for (const Setting& setting : kSettings) {
    if (setting.type == type)
      settings.SetData(setting.key, ValueOf(setting));
  }
  settings.SetString(kSettingName, name);
  settings.SetString(kSettingShortName, name);
  return settings;
}

// The container, made if there is none; null when memory is short.
BaseContainer* BaseList2D::NeedDynamicParameters()
{
  Extras* extras = NeedExtras();
  if (extras && !extras->dynamicParameters)
    extras->dynamicParameters = NewObj<BaseContainer>();
  return extras ? extras->dynamicParameters : nullptr;
}

ParameterPath BaseList2D::AddDynamicParameter(const BaseContainer& settings)
{
  BaseContainer* parameters = NeedDynamicParameters();
  Long key = 1;
  while (parameters && parameters->FindIndex(key) >= 0)
    ++key;
  if (!parameters || !parameters->InsertData(key, GeData(settings)))
    return {};
  return {ParameterLevel{kDynamicParameters, kDataGroup, 0}, ParameterLevel{key, settings.GetId(), 0}};
}

Bool BaseList2D::RemoveDynamicParameter(const ParameterPath& path)
{
  Long key = KeyOf(path);
  return key != 0 && Extra().dynamicParameters && Extra().dynamicParameters->RemoveData(key);
}

const BaseContainer* BaseList2D::FindDynamicParameter(const ParameterPath& path) const
{
  Long key = KeyOf(path);
  return key != 0 && Extra().dynamicParameters ? Extra().dynamicParameters->GetContainerInstance(key) : nullptr;
}

Bool BaseList2D::SetDynamicParameter(const ParameterPath& path, const BaseContainer& settings)
{
  Long key = KeyOf(path);
  BaseContainer* parameters = Extra().dynamicParameters;
  return key != 0 && parameters && parameters->FindIndex(key) >= 0 && parameters->SetData(key, GeData(settings));
}

} // namespace _torvane_
