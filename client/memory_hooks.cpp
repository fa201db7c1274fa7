// The memory hooks: the heap of the C library.
#include <cstdint>
#include <cstdlib>

#ifdef __linux__
#include <sys/mman.h>
#endif

#include "torvane/hooks.h"

namespace _torvane_
{

namespace
{

// Asks for large pages under what is large: the points of a mesh then come in tens of pages, not in thousands. Only a
// wish, whose failure changes nothing.
void* InLargePages([[maybe_unused]] void* block, [[maybe_unused]] LLong size)
{
#ifdef __linux__
  constexpr std::uintptr_t kLargePage = std::uintptr_t{1} << 21;
  if (block && size >= static_cast<LLong>(2 * kLargePage)) {
    const std::uintptr_t start = reinterpret_cast<std::uintptr_t>(block);
    const std::uintptr_t first = (start + kLargePage - 1) / kLargePage * kLargePage;
    const std::uintptr_t last = (start + static_cast<std::uintptr_t>(size)) / kLargePage * kLargePage;
    ::madvise(reinterpret_cast<void*>(first), last - first, MADV_HUGEPAGE);
  }
#endif
  return block;
}

} // namespace

void* MemAlloc(LLong size) { return InLargePages(std::malloc(static_cast<std::size_t>(size)), size); }

void* MemAllocClear(LLong size) { return InLargePages(std::calloc(1, static_cast<std::size_t>(size)), size); }

void* MemRealloc(void* block, LLong size)
{
  return InLargePages(std::realloc(block, static_cast<std::size_t>(size)), size);
}

void MemFree(void** block)
{
  std::free(*block);
  *block = nullptr;
}

} // namespace _torvane_
