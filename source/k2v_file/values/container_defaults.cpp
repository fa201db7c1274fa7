#include "k2v_file/values/container_defaults.h"

namespace _torvane_
{

namespace
{

// The one empty value of a type, which is never destroyed.
template <class T>
T* Empty()
{
  alignas(T) static UChar place[sizeof(T)];
  static T* const empty = ::new (static_cast<void*>(place)) T();
  return empty;
}

} // namespace

// Payloads lie behind their element or are shared by all: nothing here is ever freed or changed.
void BaseContainer::BuildDefault(GeData& value, const ContainerDefault& row, void* payload)
{
  using Payload = GeData::Payload;
  const auto hold = [&value](Long type, auto member, auto* object) {
    value.payload_.*member = object;
    value.type_ = type;
  };
  switch (row.form) {
  case DefaultForm::kBool:
  case DefaultForm::kLong:
    value = GeData(static_cast<Long>(row.number));
    return;
  case DefaultForm::kReal:
    value = GeData(row.number);
    return;
  case DefaultForm::kTime:
    return hold(kDataTime, &Payload::time, ::new (payload) BaseTime(row.number, 1.0));
  case DefaultForm::kGrey:
    return hold(kDataVector, &Payload::vector, ::new (payload) Vector(row.number, row.number, row.number));
  case DefaultForm::kVector:
    return hold(kDataVector, &Payload::vector, ::new (payload) Vector(row.vector));
  case DefaultForm::kString:
    return hold(kDataString, &Payload::string, Empty<String>());
  case DefaultForm::kFilename:
    return hold(kDataFilename, &Payload::filename, Empty<Filename>());
  case DefaultForm::kLink:
    value.SetType(kDataLink);
    return;
  case DefaultForm::kContainer:
    return hold(kDataContainer, &Payload::container,
                row.container ? const_cast<BaseContainer*>(&row.container()) : Empty<BaseContainer>());
  }
}

void BaseContainer::BuildDefaults(const ContainerDefault* rows, Defaults& defaults, void* places)
{
  auto* place = static_cast<UChar*>(places);
  Element** last = &defaults.first;
  for (Long i = 0; i < defaults.count; ++i, place += kDefaultSize) {
    auto* element = ::new (static_cast<void*>(place)) Element{nullptr, rows[i].id, GeData()};
    BuildDefault(element->value, rows[i], place + sizeof(Element));
    *last = element;
    last = &element->next;
  }
  Share(defaults);
}

Bool BaseContainer::SetDefaults(const BaseContainer& defaults)
{
  if (!GetFirstPlace()) {
    FreeElements();
    Share(*defaults.defaults_);
    return true;
  }
  for (const Element* place = defaults.GetFirstPlace(); place; place = place->next) {
    if (!SetData(place->id, place->value))
      return false;
  }
  return true;
}

} // namespace _torvane_
