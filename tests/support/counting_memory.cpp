#include "support/counting_memory.h"

#include <atomic>
#include <cstdlib>
#include <cstring>

#include "torvane/hooks.h"

namespace
{

using _torvane_::LLong;

// Each block carries its size in front, in a header as large as the strictest alignment.
constexpr std::size_t kHeader = alignof(std::max_align_t);

std::atomic<LLong> gBlocks{0};
std::atomic<LLong> gBytes{0};
std::atomic<LLong> gPeak{0};
std::atomic<LLong> gAllocations{0};
std::atomic<LLong> gFailAt{-1};
std::atomic<bool> gFailOnce{false};

bool MustFail()
{
  LLong number = gAllocations.fetch_add(1);
  LLong failAt = gFailAt.load();
  return failAt >= 0 && (gFailOnce ? number == failAt : number >= failAt);
}

void FailAt(LLong count, bool once)
{
  gFailOnce = once;
  gFailAt = gAllocations.load() + count;
}

void* Finish(void* raw, LLong size)
{
  if (!raw)
    return nullptr;
  std::memcpy(raw, &size, sizeof size);
  gBlocks.fetch_add(1);
  LLong bytes = gBytes.fetch_add(size) + size;
  LLong peak = gPeak.load();
  while (bytes > peak && !gPeak.compare_exchange_weak(peak, bytes)) {
  }
  return static_cast<char*>(raw) + kHeader;
}

void* RawOf(void* block) { return static_cast<char*>(block) - kHeader; }

LLong SizeOf(void* block)
{
  LLong size = 0;
  std::memcpy(&size, RawOf(block), sizeof size);
  return size;
}

} // namespace

namespace _torvane_
{

void* MemAlloc(LLong size)
{
  return MustFail() ? nullptr : Finish(std::malloc(static_cast<std::size_t>(size) + kHeader), size);
}

void* MemAllocClear(LLong size)
{
  return MustFail() ? nullptr : Finish(std::calloc(1, static_cast<std::size_t>(size) + kHeader), size);
}

void* MemRealloc(void* block, LLong size)
{
  void* moved = MemAlloc(size);
  if (moved && block) {
    LLong old = SizeOf(block);
    std::memcpy(moved, block, static_cast<std::size_t>(old < size ? old : size));
    MemFree(&block);
  }
  return moved;
}

void MemFree(void** block)
{
  if (*block) {
    gBlocks.fetch_sub(1);
    gBytes.fetch_sub(SizeOf(*block));
    std::free(RawOf(*block));
    *block = nullptr;
  }
}

} // namespace _torvane_

namespace counting_memory
{

Counts Get() { return {gBlocks, gBytes, gPeak, gAllocations}; }

void ResetPeak() { gPeak = gBytes.load(); }

void FailAfter(LLong count) { FailAt(count, false); }

void FailOnceAfter(LLong count) { FailAt(count, true); }

bool FailNever()
{
  const LLong failAt = gFailAt.exchange(-1);
  return failAt >= 0 && gAllocations > failAt;
}

} // namespace counting_memory
