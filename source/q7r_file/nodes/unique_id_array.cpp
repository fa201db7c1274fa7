#include "torvane/nodes/base_list.h"

namespace _torvane_
{

namespace
{

class EntryOrder : public GeSortAndSearch
{
 public:
  Long Compare(const void* a, const void* b) override
  {
    ++comparisons;
    const auto& first = *static_cast<const UniqueIDEntry*>(a);
    const auto& second = *static_cast<const UniqueIDEntry*>(b);
    if (first.appId != second.appId)
      return first.appId < second.appId ? -1 : 1;
    return first.order - second.order;
  }

  LLong comparisons = 0;
};

} // namespace

Bool UniqueIDArray::SetEntry(Long appId, const void* data, LLong size)
{
  UniqueIDEntry* entry = Find(appId);
  if (entry && entry->size == size) {
    GeCopyMem(entry->data, data, size);
    return true;
  }
  void* block = GeAllocNC(size);
  if (!block && size > 0) {
    if (entry) {
      GeFree(entry->data);
      RemoveKey(appId);
    }
    return false;
  }
  GeCopyMem(block, data, size);
  if (AdoptEntry(appId, block, size))
    return true;
  GeFree(block);
  return false;
}

Bool UniqueIDArray::AdoptEntry(Long appId, void* data, LLong size)
{
  if (UniqueIDEntry* entry = Find(appId)) {
    GeFree(entry->data);
    *entry = {appId, 0, size, data};
    return true;
  }
  return Insert({appId, 0, size, data});
}

Bool UniqueIDArray::AppendEntry(Long appId, void* data, LLong size) { return Append({appId, GetCount(), size, data}); }

LLong UniqueIDArray::SettleEntries()
{
  EntryOrder order;
  GeTempDynArray<UniqueIDEntry>::Sort(order);
  Long kept = 0;
  for (Long i = 0; i < GetCount(); ++i) {
    UniqueIDEntry& entry = (*this)[i];
    if (i + 1 < GetCount() && (*this)[i + 1].appId == entry.appId)
      GeFree(entry.data);
    else
      (*this)[kept++] = entry;
  }
  while (GetCount() > kept)
    Pop();
  return order.comparisons;
}

void UniqueIDArray::FreeEntries()
{
  for (UniqueIDEntry& entry : *this)
    GeFree(entry.data);
  Reset();
}

} // namespace _torvane_
