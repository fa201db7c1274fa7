#include "node_index.h"

#include "torvane/document/base_document.h"
#include "torvane/materials/base_material.h"

namespace q7r
{

using namespace _torvane_;

namespace
{

// The list that holds a node. Materials that were read don't name theirs.
const RootList2D* ListOf(const BaseList2D& node)
{
  if (!node.GetListHead() && NodeCast<BaseMaterial>(&node) && node.GetDocument())
    return node.GetDocument()->GetMaterialRoot();
  return node.GetListHead();
}

} // namespace

const NodeIndex::Places& NodeIndex::PlacesIn(const RootList2D& list)
{
  const auto [entry, isNew] = lists_.try_emplace(&list);
  if (isNew) {
    for (const BaseList2D* node = list.GetFirst(); node; node = node->GetNext())
      entry->second.emplace(node, entry->second.size());
  }
  return entry->second;
}

Json NodeIndex::PathOf(const GeListNode* node)
{
  Json path = Json::array();
  const auto* named = NodeCast<BaseList2D>(node);
  while (const RootList2D* list = named ? ListOf(*named) : nullptr) {
    const Places& places = PlacesIn(*list);
    const auto found = places.find(named);
    if (found == places.end())
      return nullptr;
    path.insert(path.begin(), found->second);
    named = list->GetOwner();
  }
  return path.empty() ? Json() : path;
}

Json NodeIndex::LinksOf(const BaseContainer& container)
{
  Json links = Json::object();
  BaseContainer::Iterator iterator;
  Long id = 0;
  const GeData* value = nullptr;
  for (bool more = container.BrowseFirst(iterator, id, value); more; more = container.BrowseNext(iterator, id, value)) {
    Json path = value->GetAliasLink() ? PathOf(value->GetLink()) : Json();
    const std::string key = std::to_string(id);
    if (!path.is_null() && !links.contains(key))
      links[key] = std::move(path);
  }
  return links;
}

} // namespace q7r
