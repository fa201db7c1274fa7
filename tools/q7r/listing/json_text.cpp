#include "json_text.h"

#include "scene_file.h"

namespace q7r
{

using namespace _torvane_;

std::string JsonText(double number) { return Json(number).dump(); }

std::string JsonText(const std::string& text)
{
  return Json(text).dump(-1, ' ', false, Json::error_handler_t::replace);
}

Json ToJson(const Vector& vector) { return {vector.x, vector.y, vector.z}; }

Json ToJson(const Matrix& matrix)
{
  Json numbers = Json::array();
  for (const Vector* row : {&matrix.off, &matrix.v1, &matrix.v2, &matrix.v3}) {
    for (double number : {row->x, row->y, row->z})
      numbers.push_back(number);
  }
  return numbers;
}

Json ToJson(const BaseTime& time) { return {time.GetNumerator(), time.GetDenominator()}; }

Json ToJson(const String& text) { return ToUtf8(text); }

Json LinkJson(const GeAliasLink& link)
{
  // A file may point a link at a thing that has a goal but is no named node.
  const auto* node = NodeCast<BaseList2D>(link.GetLink());
  if (!node)
    return nullptr;
  std::string path = ToUtf8(node->GetName());
  // A list head names the node above; only nodes of a hierarchy have one that leads to the root.
  for (const RootList2D* head = node->GetListHead(); head && head->GetOwner(); head = head->GetOwner()->GetListHead())
    path = ToUtf8(head->GetOwner()->GetName()) + "/" + path;
  return path;
}

Json ToJson(const GeData& value)
{
  switch (value.GetRawType()) {
  case kDataLong:
    return value.GetLong();
  case kDataReal:
    return value.GetReal();
  case kDataLLong:
    return value.GetLLong();
  case kDataTime:
    return ToJson(value.GetTime());
  case kDataVector:
    return ToJson(value.GetVector());
  case kDataMatrix:
    return ToJson(value.GetMatrix());
  case kDataString:
    return ToJson(value.GetString());
  case kDataFilename:
    return ToJson(value.GetFilename().GetString());
  case kDataContainer:
    return ToJson(*value.GetContainer());
  case kDataLink:
    return LinkJson(*value.GetAliasLink());
  case kDataUnknown:
    return {{"custom", value.GetUnknown()->type}};
  default:
    break;
  }
  if (value.GetCustom())
    return {{"custom", value.GetCustom()->GetTypeId()}};
  return nullptr;
}

Json ToJson(const BaseContainer& container)
{
  Json object = Json::object();
  BaseContainer::Iterator iterator;
  Long id = 0;
  const GeData* value = nullptr;
  for (bool more = container.BrowseFirst(iterator, id, value); more; more = container.BrowseNext(iterator, id, value)) {
    std::string key = std::to_string(id);
    if (!object.contains(key))
      object[key] = ToJson(*value);
  }
  return object;
}

} // namespace q7r
