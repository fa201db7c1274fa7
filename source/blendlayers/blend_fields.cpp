#include "blendlayers/blend_fields.h"

#include <type_traits>

#include "k2v_file/stream/chunk_visitor.h"
#include "k2v_file/values/vector_component.h"
#include "torvane/memory/assertion.h"

namespace _torvane_
{

namespace
{

// What readers of the log know these reports by.
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
  const auto* source = value ? NodeCast<GradientData>(value->GetCustomDataType(kCustomGradient)) : nullptr;
  if (!source)
    return false;
  gradient.FreeGradientCache();
  return CopyGradient(*source, gradient);
}

// Calls the operation with the field's value as what it is: the one place that tells kinds apart.
template <class Operation>
Bool Visit(const BlendField& field, const Operation& operation)
{
  switch (field.kind) {
  case BlendField::kLong:
    return operation(field.As<Long>());
  case BlendField::kBool:
    return operation(field.As<Bool>());
  case BlendField::kReal:
    return operation(field.As<Real>());
  case BlendField::kVector:
    return operation(field.As<Vector>());
  case BlendField::kLink:
    return operation(field.As<GeAliasLink>());
  case BlendField::kGradient:
    return operation(field.As<GradientData>());
  case BlendField::kLayers:
    return operation(field.As<CBlendLayers>());
  }
  return false;
}

// Operations by overloads: the template takes what has no form of its own.
template <class... Overloads>
struct Choose : Overloads...
{
  using Overloads::operator()...;
};
template <class... Overloads>
Choose(Overloads...) -> Choose<Overloads...>;

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

Bool CopyToLink(const GeData& value, GeAliasLink* target)
{
  const GeAliasLink* source = value.GetAliasLink();
  return source && target && source->CopyLinkTo(target, nullptr);
}

} // namespace

// ---------------------------------------------------------------------------------------------------------------

Bool ReadField(HyperFile& file, Long level, const BlendField& field)
{
  return Visit(field, Choose{[&](auto& value) { return ReadValue(file, value); },
                             [&](Bool& value) {
                               value = level >= field.sinceLevel && value;
                               return level < field.sinceLevel || ReadValue(file, value);
                             },
                             [&](GradientData& value) { return ReadGradientField(file, value); },
                             [&](CBlendLayers& value) { return value.ReadList(file, true); }});
}

Bool WriteField(HyperFile& file, const BlendField& field)
{
  return Visit(field, Choose{[&](auto& value) { return WriteValue(file, value); },
                             [&](GradientData& value) { return WriteGradientField(file, value); },
                             [&](CBlendLayers& value) { return value.WriteList(file, kBlendListLevel); }});
}

Bool FieldsDiffer(const BlendField& a, const BlendField& b)
{
  return Visit(a, Choose{[&](auto& value) { return !(value == b.As<std::decay_t<decltype(value)>>()); },
                         [&](GeAliasLink& value) { return !value.IsEqual(b.As<GeAliasLink>()); },
                         [&](GradientData& value) { return GradientsDiffer(value, b.As<GradientData>()); },
                         [&](CBlendLayers& value) { return !value.CompareLayers(b.As<CBlendLayers>()); }});
}

Bool CopyField(const BlendField& source, const BlendField& destination, TransArray* translation)
{
  return Visit(
      source,
      Choose{[&](auto& value) {
               destination.As<std::decay_t<decltype(value)>>() = value;
               return true;
             },
             [&](GeAliasLink& value) { return value.CopyLinkTo(&destination.As<GeAliasLink>(), translation); },
             [&](GradientData& value) {
               auto& copy = destination.As<GradientData>();
               copy.FreeGradientCache();
               return CopyGradient(value, copy, translation);
             },
             [&](CBlendLayers& value) { return value.CopyLayersTo(destination.As<CBlendLayers>(), translation); }});
}

// ---------------------------------------------------------------------------------------------------------------

Bool GetField(const BlendField& field, GeData& value)
{
  return Visit(field, Choose{[&](auto& own) {
                               value = GeData(own);
                               return true;
                             },
                             [&](GradientData& own) {
                               value = GeData(kCustomGradient, own);
                               return true;
                             },
                             [&](CBlendLayers& own) {
                               const GeAliasLink* link = own.GetFirstLink();
                               value = link ? GeData(*link) : GeData(GeAliasLink());
                               return true;
                             }});
}

Bool SetField(const BlendField& field, const GeData& value)
{
  auto take = [](auto& own, auto taken) {
    own = taken;
    return true;
  };
  return Visit(field, Choose{[&](Long& own) { return take(own, value.GetLong()); },
                             [&](Bool& own) { return take(own, value.GetBool()); },
                             [&](Real& own) { return take(own, value.GetReal()); },
                             [&](Vector& own) { return take(own, value.GetVector()); },
                             [&](GeAliasLink& own) { return CopyToLink(value, &own); },
                             [&](GradientData& own) { return TakeGradient(&value, own); },
                             [&](CBlendLayers& own) { return CopyToLink(value, own.GetFirstLink()); }});
}

Bool GetFieldPart(const BlendField& field, const ParameterPath& path, GeData& value)
{
  return Visit(field, Choose{[&](auto&) { return GetField(field, value); },
                             [&](GradientData& own) {
                               ULong flags = 0;
                               const Bool known = own.GetGradientValue(path, value, flags);
                               if (!known)
                                 ReportAssertion(kBlendModule, kLineGradientGet,
                                                 "a layer's gradient lacks the parameter that was asked for");
                               return known;
                             },
                             [&](Vector& own) {
                               if (path[0].id == 0)
                                 return GetField(field, value);
                               const Real* component = ComponentOf(own, path[0].id);
                               if (component)
                                 value = GeData(*component);
                               return component != nullptr;
                             }});
}

Bool SetFieldPart(const BlendField& field, const ParameterPath& path, const GeData& value)
{
  return Visit(field, Choose{[&](auto&) { return SetField(field, value); },
                             [&](Long& own) {
                               own = static_cast<Long>(IntoRange(field, value.GetLong()));
                               return true;
                             },
                             [&](Real& own) {
                               own = IntoRange(field, value.GetReal());
                               return true;
                             },
                             [&](GradientData& own) {
                               ULong flags = 0;
                               const Bool known = own.SetGradientValue(path, value, flags);
                               if (!known)
                                 ReportAssertion(kBlendModule, kLineGradientSet,
                                                 "a layer's gradient lacks the parameter that was to be set");
                               return known;
                             },
                             [&](Vector& own) {
                               if (path[0].id == 0)
                                 return SetField(field, value);
                               Real* component = ComponentOf(own, path[0].id);
                               if (component)
                                 *component = value.GetReal();
                               return component != nullptr;
                             }});
}

} // namespace _torvane_
