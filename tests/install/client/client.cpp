// A program of the library's user: it has its own hooks and uses nothing but the installed package.
#include <cstdlib>

#include "torvane/hooks.h"
#include "torvane/memory.h"

using namespace _torvane_;

namespace
{

long gBlocks = 0;

void* Counted(void* block)
{
  gBlocks += block != nullptr;
  return block;
}

} // namespace

namespace _torvane_
{

void* MemAlloc(LLong size) { return Counted(std::malloc(static_cast<std::size_t>(size))); }

void* MemAllocClear(LLong size) { return Counted(std::calloc(1, static_cast<std::size_t>(size))); }

void* MemRealloc(void* block, LLong size)
{
  void* moved = std::realloc(block, static_cast<std::size_t>(size));
  gBlocks += !block && moved;
  return moved;
}

void MemFree(void** block)
{
  gBlocks -= *block != nullptr;
  std::free(*block);
  *block = nullptr;
}

} // namespace _torvane_

int main()
{
  void* block = GeAlloc(16);
  bool taken = gBlocks == 1;
  GeFree(block);
  return taken && gBlocks == 0 ? EXIT_SUCCESS : EXIT_FAILURE;
}
