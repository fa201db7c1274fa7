#include "node_details.h"

#include "geometry_details.h"
#include "scene_file.h"
#include "torvane/tags/base_tag.h"
#include "torvane/tags/texture_tag.h"

namespace q7r
{

using namespace _torvane_;

std::string TagWords(BaseTag& tag)
{
  Long link = 0;
  if (tag.GetType() == kTagTarget)
    link = kTargetLink;
  else if (tag.GetType() == kTagTexture)
    link = kTextureMaterial;
  else
    return TagCountWords(tag);
  const BaseList2D* target = tag.GetDataInstance().GetLink(link);
  return target ? "-> \"" + ToUtf8(target->GetName()) + "\"" : std::string();
}

} // namespace q7r
