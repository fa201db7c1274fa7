#include "blendlayers/blend_fields.h"

#include "k2v_file/stream/chunk_visitor.h"
#include "k2v_file/values/vector_component.h"
#include "torvane/memory/assertion.h"

namespace _torvane_
{

namespace
{

constexpr Long kLineGradientGet = 1235;
constexpr Long kLineGradientSet = 1259;

constexpr Long kGradientEntry = 1; // of the container that holds a layer's gradient in a file

// A number that is none counts as too low.
Real IntoRange(const BlendField& field, Real value)
{
  if (!field.HasRange())
    return value;
  if (!(value >= field.low))
    return field.low;
  return value > field.high ? field.high : value;
}

Bool TakeGradient(const GeData* value, GradientData& gradient)
{
  const CustomData* source = value ? value->GetCustomDataType(kCustomGradient) : nullptr;
  if (!source)
    return false;
  gradient.FreeGradientCache();
  return CopyGradient(static_cast<const GradientData&>(*source), gradient);
}

Bool ReadGradientField(HyperFile& file, GradientData& gradient)
{
  BaseContainer container;
  return file.ReadContainer(container, true) && TakeGradient(container.FindData(kGradientEntry), gradient);
}

Bool WriteGradientField(HyperFile& file, const GradientData& gradient)
{
  BaseContainer container;
  GeData value(kCustomGradient, gradient);
  if (!value.GetCustom() || !container.InsertData(kGradientEntry, std::move(value))) {
    file.SetError(FILEERROR_MEMORY);
    return false;
  }
  return file.WriteContainer(container);
}

} // namespace

// ---------------------------------------------------------------------------------------------------------------

BlendField::BlendField(Long& value, Long fieldId, Long fieldSub, Real lowest, Real highest)
    : integer(&value), kind(kLong), id(fieldId), sub(fieldSub), low(lowest), high(highest)
{}

BlendField::BlendField(Bool& value, Long fieldId, Long fieldSub, Long level)
    : flag(&value), kind(kBool), id(fieldId), sub(fieldSub), sinceLevel(level)
{}

BlendField::BlendField(Real& value, Long fieldId, Long fieldSub, Real lowest, Real highest)
    : real(&value), kind(kReal), id(fieldId), sub(fieldSub), low(lowest), high(highest)
{}

BlendField::BlendField(Vector& value, Long fieldId, Long fieldSub)
    : vector(&value), kind(kVector), id(fieldId), sub(fieldSub)
{}

BlendField::BlendField(GeAliasLink& value, Long fieldId) : link(&value), kind(kLink), id(fieldId) {}

BlendField::BlendField(GradientData& value, Long fieldId, Long fieldSub)
    : gradient(&value), kind(kGradient), id(fieldId), sub(fieldSub)
{}

BlendField::BlendField(CBlendLayers& value, Long fieldId) : layers(&value), kind(kLayers), id(fieldId) {}

BlendFields::BlendFields(std::initializer_list<BlendField> list)
{
  for (const BlendField& field : list)
    fields[count++] = field;
}

// ---------------------------------------------------------------------------------------------------------------

Bool ReadField(HyperFile& file, Long level, const BlendField& field)
{
  switch (field.kind) {
  case BlendField::kLong:
    return ReadValue(file, *field.integer);
  case BlendField::kBool:
    *field.flag = level >= field.sinceLevel && *field.flag;
    return level < field.sinceLevel || ReadValue(file, *field.flag);
  case BlendField::kReal:
    return ReadValue(file, *field.real);
  case BlendField::kVector:
    return ReadValue(file, *field.vector);
  case BlendField::kLink:
    return ReadValue(file, *field.link);
  case BlendField::kGradient:
    return ReadGradientField(file, *field.gradient);
  case BlendField::kLayers:
    return field.layers->ReadList(file, true);
  }
  return false;
}

Bool WriteField(HyperFile& file, const BlendField& field)
{
  switch (field.kind) {
  case BlendField::kLong:
    return WriteValue(file, *field.integer);
  case BlendField::kBool:
    return WriteValue(file, *field.flag);
  case BlendField::kReal:
    return WriteValue(file, *field.real);
  case BlendField::kVector:
    return WriteValue(file, *field.vector);
  case BlendField::kLink:
    return WriteValue(file, *field.link);
  case BlendField::kGradient:
    return WriteGradientField(file, *field.gradient);
  case BlendField::kLayers:
    return field.layers->WriteList(file, kBlendListLevel);
  }
  return false;
}

Bool FieldsDiffer(const BlendField& a, const BlendField& b)
{
  switch (a.kind) {
  case BlendField::kLong:
    return *a.integer != *b.integer;
  case BlendField::kBool:
    return *a.flag != *b.flag;
  case BlendField::kReal:
    return *a.real != *b.real;
  case BlendField::kVector:
    return !(*a.vector == *b.vector);
  case BlendField::kLink:
    return !a.link->IsEqual(*b.link);
  case BlendField::kGradient:
    return GradientsDiffer(*a.gradient, *b.gradient);
  case BlendField::kLayers:
    return !a.layers->CompareLayers(*b.layers);
  }
  return true;
}

Bool CopyField(const BlendField& source, const BlendField& destination, TransArray* translation)
{
  switch (source.kind) {
  case BlendField::kLong:
    *destination.integer = *source.integer;
    return true;
  case BlendField::kBool:
    *destination.flag = *source.flag;
    return true;
  case BlendField::kReal:
    *destination.real = *source.real;
    return true;
  case BlendField::kVector:
    *destination.vector = *source.vector;
    return true;
  case BlendField::kLink:
    return source.link->CopyLinkTo(destination.link, translation);
  case BlendField::kGradient:
    destination.gradient->FreeGradientCache();
    return CopyGradient(*source.gradient, *destination.gradient, translation);
  case BlendField::kLayers:
    return source.layers->CopyLayersTo(*destination.layers, translation);
  }
  return false;
}

// ---------------------------------------------------------------------------------------------------------------

Bool GetField(const BlendField& field, GeData& value)
{
  switch (field.kind) {
  case BlendField::kLong:
    value = GeData(*field.integer);
    return true;
  case BlendField::kBool:
    value = GeData(*field.flag);
    return true;
  case BlendField::kReal:
    value = GeData(*field.real);
    return true;
  case BlendField::kVector:
    value = GeData(*field.vector);
    return true;
  case BlendField::kLink:
    value = GeData(*field.link);
    return true;
  case BlendField::kGradient:
    value = GeData(kCustomGradient, *field.gradient);
    return true;
  case BlendField::kLayers: {
    const GeAliasLink* link = field.layers->GetFirstLink();
    value = link ? GeData(*link) : GeData(GeAliasLink());
    return true;
  }
  }
  return false;
}

Bool SetField(const BlendField& field, const GeData& value)
{
  switch (field.kind) {
  case BlendField::kLong:
    *field.integer = value.GetLong();
    return true;
  case BlendField::kBool:
    *field.flag = value.GetBool();
    return true;
  case BlendField::kReal:
    *field.real = value.GetReal();
    return true;
  case BlendField::kVector:
    *field.vector = value.GetVector();
    return true;
  case BlendField::kLink:
  case BlendField::kLayers: {
    const GeAliasLink* source = value.GetAliasLink();
    GeAliasLink* target = field.kind == BlendField::kLink ? field.link : field.layers->GetFirstLink();
    return source && target && source->CopyLinkTo(target, nullptr);
  }
  case BlendField::kGradient:
    return TakeGradient(&value, *field.gradient);
  }
  return false;
}

Bool GetFieldPart(const BlendField& field, const ParameterPath& path, GeData& value)
{
  if (field.kind == BlendField::kGradient) {
    ULong flags = 0;
    if (field.gradient->GetGradientValue(path, value, flags))
      return true;
    ReportAssertion(kBlendModule, kLineGradientGet, "a layer's gradient lacks the parameter that was asked for");
    return false;
  }
  if (field.kind != BlendField::kVector || path[0].id == 0)
    return GetField(field, value);
  const Real* component = ComponentOf(*field.vector, path[0].id);
  if (component)
    value = GeData(*component);
  return component != nullptr;
}

Bool SetFieldPart(const BlendField& field, const ParameterPath& path, const GeData& value)
{
  switch (field.kind) {
  case BlendField::kLong:
    *field.integer = static_cast<Long>(IntoRange(field, value.GetLong()));
    return true;
  case BlendField::kReal:
    *field.real = IntoRange(field, value.GetReal());
    return true;
  case BlendField::kGradient: {
    ULong flags = 0;
    if (field.gradient->SetGradientValue(path, value, flags))
      return true;
    ReportAssertion(kBlendModule, kLineGradientSet, "a layer's gradient lacks the parameter that was to be set");
    return false;
  }
  case BlendField::kVector:
    if (path[0].id != 0) {
      Real* component = ComponentOf(*field.vector, path[0].id);
      if (component)
        *component = value.GetReal();
      return component != nullptr;
    }
    [[fallthrough]];
  default:
    return SetField(field, value);
  }
}

} // namespace _torvane_
