#include "exporter/walk/layer_index.h"

#include <new>

#include "torvane/objects/object_walk.h"

namespace exporter
{

using namespace _torvane_;

Long GetLayerId(const BaseObject& object) { return object.GetDataInstance().GetLong(kKeyLayerId, kNoLayerId); }

BaseObject* FindLayerObject(BaseObject* first, Long layerId)
{
  if (layerId == kNoLayerId)
    return nullptr;
  for (BaseObject* object = first; object; object = GetNextDepthFirst(object)) {
    if (GetLayerId(*object) == layerId)
      return object;
  }
  return nullptr;
}

void LayerIndex::Add(Long layerId, BaseObject* object)
{
  if (!complete_)
    return;
  auto found = entries_.end();
  try {
    found = entries_.try_emplace(layerId).first;
  } catch (const std::bad_alloc&) {
    complete_ = false; // searching needs no memory
    return;
  }
  Entry& entry = found->second;
  if (entry.copies > 0 && (entry.number >= firstOfUse_ || entry.composition != composition_))
    trusted_ = false;
  entry = {object, composition_, count_, entry.copies + 1};
  ++count_;
}

BaseObject* LayerIndex::Find(BaseObject* first, Long layerId)
{
  if (!complete_)
    return FindLayerObject(first, layerId);
  auto found = entries_.find(layerId);
  if (found == entries_.end() || layerId == kNoLayerId)
    return nullptr;
  const Entry& entry = found->second;
  // Moving an object of another use would mix the two.
  trusted_ = trusted_ && entry.number >= firstOfUse_ && entry.composition == composition_;
  if (trusted_ || entry.copies == 1)
    return entry.newest;
  return FindLayerObject(first, layerId);
}

} // namespace exporter
