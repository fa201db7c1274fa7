#include "node_index.h"

#include <algorithm>
#include <string>
#include <unordered_set>

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

std::vector<long long> NodeIndex::PathOf(const GeListNode* node)
{
  std::vector<long long> path;
  const auto* named = NodeCast<BaseList2D>(node);
  while (const RootList2D* list = named ? ListOf(*named) : nullptr) {
    const Places& places = PlacesIn(*list);
    const auto found = places.find(named);
    if (found == places.end())
      return {};
    path.push_back(static_cast<long long>(found->second));
    named = list->GetOwner();
  }
  std::reverse(path.begin(), path.end());
  return path;
}

void NodeIndex::TellPath(ValueSink& sink, const GeListNode* node)
{
  const std::vector<long long> path = PathOf(node);
  if (path.empty())
    return sink.Null();
  sink.BeginArray(ValueSink::Layout::kLine);
  for (const long long place : path)
    sink.Integer(place);
  sink.EndArray();
}

void NodeIndex::TellLinks(ValueSink& sink, const BaseContainer& container)
{
  sink.BeginObject(ValueSink::Layout::kLine);
  std::unordered_set<Long> told;
  BaseContainer::Iterator iterator;
  Long id = 0;
  const GeData* value = nullptr;
  for (bool more = container.BrowseFirst(iterator, id, value); more; more = container.BrowseNext(iterator, id, value)) {
    const GeListNode* target = value->GetAliasLink() ? value->GetLink() : nullptr;
    if (!target || PathOf(target).empty() || !told.insert(id).second)
      continue;
    sink.Key(std::to_string(id));
    TellPath(sink, target);
  }
  sink.EndObject();
}

} // namespace q7r
