#include "node_details.h"

#include "geometry_details.h"
#include "scene_file.h"
#include "torvane/base_tag.h"

namespace q7r
{

using namespace _torvane_;

std::string TagWords(BaseTag& tag)
{
  if (tag.GetType() != kTagTarget)
    return TagCountWords(tag);
  const BaseList2D* target = tag.GetDataInstance().GetLink(kTargetLink);
  return target ? "-> \"" + ToUtf8(target->GetName()) + "\"" : std::string();
}

} // namespace q7r
