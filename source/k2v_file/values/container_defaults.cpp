#include "k2v_file/values/container_defaults.h"

#include "torvane/links/alias.h"

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
  switch (row.form) {
  case DefaultForm::kBool:
  case DefaultForm::kLong:
    value = GeData(static_cast<Long>(row.number));
    break;
  case DefaultForm::kReal:
    value = GeData(row.number);
    break;
  case DefaultForm::kTime:
    value.payload_.time = ::new (payload) BaseTime(row.number, 1.0);
    value.type_ = kDataTime;
    break;
  case DefaultForm::kGrey:
    value.payload_.vector = ::new (payload) Vector(row.number, row.number, row.number);
    value.type_ = kDataVector;
    break;
  case DefaultForm::kVector:
    value.payload_.vector = ::new (payload) Vector(row.vector);
    value.type_ = kDataVector;
    break;
  case DefaultForm::kString:
    value.payload_.string = Empty<String>();
    value.type_ = kDataString;
    break;
  case DefaultForm::kFilename:
    value.payload_.filename = Empty<Filename>();
    value.type_ = kDataFilename;
    break;
  case DefaultForm::kLink:
    value.payload_.link = Empty<GeAliasLink>();
    value.type_ = kDataLink;
    break;
  case DefaultForm::kContainer:
    value.payload_.container = row.container ? const_cast<BaseContainer*>(&row.container()) : Empty<BaseContainer>();
    value.type_ = kDataContainer;
    break;
  }
}

void BaseContainer::BuildDefaults(const ContainerDefault* rows, LLong count, void* places)
{
  auto* place = static_cast<UChar*>(places);
  for (LLong i = 0; i < count; ++i, place += kDefaultSize) {
    auto* element = ::new (static_cast<void*>(place)) Element{nullptr, rows[i].id, GeData()};
    BuildDefault(element->value, rows[i], place + sizeof(Element));
    Append(element);
  }
}

Bool BaseContainer::SetDefaults(const BaseContainer& defaults)
{
  if (!head_) {
    FreeElements();
    Share(defaults);
    return true;
  }
  for (const Element* element = defaults.head_; element; element = element->next) {
    if (!SetData(element->id, element->value))
      return false;
  }
  return true;
}

} // namespace _torvane_
