// What a container does with the nodes that its links point at.
#include "torvane/values/base_container.h"

#include "torvane/links/alias.h"
#include "torvane/nodes/base_list.h"

namespace _torvane_
{

void BaseContainer::SetLink(Long id, BaseList2D* target)
{
  GeAliasLink link;
  link.SetLink(target);
  SetData(id, GeData(link));
}

BaseList2D* BaseContainer::GetLink(Long id, const BaseDocument* document) const
{
  // A file may point a link at a thing that has a goal but is no named node, such as the document's preferences.
  auto* node = NodeCast<BaseList2D>(GetData(id).GetLink());
  const BaseDocument* owner = node ? node->GetDocument() : nullptr;
  return document && owner && owner != document ? nullptr : node;
}

} // namespace _torvane_
