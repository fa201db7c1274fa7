// The memory hooks: the heap of the C library.
#include <cstdlib>

#include "torvane/hooks.h"

namespace _torvane_
{

void* MemAlloc(LLong size) { return std::malloc(static_cast<std::size_t>(size)); }

void* MemAllocClear(LLong size) { return std::calloc(1, static_cast<std::size_t>(size)); }

void* MemRealloc(void* block, LLong size) { return std::realloc(block, static_cast<std::size_t>(size)); }

void MemFree(void** block)
{
  std::free(*block);
  *block = nullptr;
}

} // namespace _torvane_
