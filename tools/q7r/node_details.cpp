#include "node_details.h"

#include "scene_file.h"
#include "torvane/base_material.h"
#include "torvane/base_tag.h"

namespace q7r
{

using namespace _torvane_;

Json ObjectParams(BaseObject&) { return Json::object(); }

Json TagValues(BaseTag&) { return nullptr; }

Json MaterialsJson(BaseDocument& document)
{
  Json materials = Json::array();
  for (BaseList2D* material = document.GetFirstMaterial(); material; material = material->GetNext())
    materials.push_back({{"type", material->GetType()},
                         {"name", ToJson(material->GetName())},
                         {"data", ToJson(material->GetDataInstance())}});
  return materials;
}

Json ViewsJson(BaseDocument&) { return Json::array(); }

std::string ObjectWords(BaseObject&) { return {}; }

std::string TagWords(BaseTag& tag)
{
  if (tag.GetType() != kTagTarget)
    return {};
  const BaseList2D* target = tag.GetDataInstance().GetLink(kTargetLink);
  return target ? "-> \"" + ToUtf8(target->GetName()) + "\"" : std::string();
}

std::vector<std::string> MaterialLines(BaseDocument& document)
{
  std::vector<std::string> lines;
  for (BaseList2D* material = document.GetFirstMaterial(); material; material = material->GetNext())
    lines.push_back("\"" + ToUtf8(material->GetName()) + "\"");
  return lines;
}

std::vector<std::string> ViewLines(BaseDocument&) { return {}; }

} // namespace q7r
