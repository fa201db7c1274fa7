#include "torvane/nodes/base_list.h"

namespace _torvane_
{

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
    *entry = {appId, size, data};
    return true;
  }
  return Insert({appId, size, data});
}

void UniqueIDArray::FreeEntries()
{
  for (UniqueIDEntry& entry : *this)
    GeFree(entry.data);
  Reset();
}

} // namespace _torvane_
