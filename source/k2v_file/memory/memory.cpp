#include "torvane/memory/memory.h"

#include <cstring>

#include "torvane/hooks.h"

namespace _torvane_
{

constinit thread_local ULong detail::failedAllocations = 0;

namespace
{

void* Counted(void* block) noexcept
{
  if (!block)
    ++detail::failedAllocations;
  return block;
}

} // namespace

void* GeAlloc(LLong size) noexcept { return size > 0 ? Counted(MemAllocClear(size)) : nullptr; }

void* GeAllocNC(LLong size) noexcept { return size > 0 ? Counted(MemAlloc(size)) : nullptr; }

void* GeRealloc(void* block, LLong size) noexcept { return size > 0 ? Counted(MemRealloc(block, size)) : nullptr; }

void GeCopyMem(void* destination, const void* source, LLong size) noexcept
{
  if (destination && source && size > 0)
    std::memcpy(destination, source, static_cast<std::size_t>(size));
}

void detail::FreeBlock(void* block) noexcept
{
  if (block)
    MemFree(&block);
}

} // namespace _torvane_
