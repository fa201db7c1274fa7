// The memory hooks: the heap of the C library.
#include <algorithm>
#include <atomic>
#include <cstdint>
#include <cstdlib>

#ifdef __linux__
#include <sys/mman.h>
#include <unistd.h>
#endif
#ifdef __GLIBC__
#include <malloc.h>
#endif

#include "torvane/hooks.h"

namespace _torvane_
{

namespace
{

#ifdef __linux__

constexpr std::uintptr_t kLargePage = std::uintptr_t{1} << 21;

// Asks for large pages wherever they fit between two addresses. Only a wish, whose failure changes nothing. It is asked
// for all of a block: one that is half of the one kind and half of the other can't grow without a copy.
void AskForLargePages(std::uintptr_t start, std::uintptr_t end)
{
  static const auto page = static_cast<std::uintptr_t>(::sysconf(_SC_PAGESIZE));
  const std::uintptr_t first = start / page * page;
  const std::uintptr_t last = (end + page - 1) / page * page;
  ::madvise(reinterpret_cast<void*>(first), last - first, MADV_HUGEPAGE);
}

#endif

#ifdef __GLIBC__

// How far the heap of small blocks may grow before it gets large pages: most programs need no more. Later it grows by
// steps, and not by the usual 132 KiB, into which no large page fits.
constexpr std::uintptr_t kPlainHeap = kLargePage;
constexpr std::uintptr_t kHeapStep = 16 * kLargePage;

std::uintptr_t GetHeapEnd() { return reinterpret_cast<std::uintptr_t>(::sbrk(0)); }

// Where the heap ended when it was last looked after.
std::atomic<std::uintptr_t> gHeapEnd{0};

// Looks whether the heap has grown, or given memory back.
void LookAfterHeap()
{
  const std::uintptr_t end = GetHeapEnd();
  if (end == gHeapEnd.load(std::memory_order_relaxed))
    return;
  static const std::uintptr_t plainEnd = end + kPlainHeap;
  const std::uintptr_t known = gHeapEnd.exchange(end, std::memory_order_relaxed);
  if (end <= plainEnd)
    return;
  static const bool growsInSteps = ::mallopt(M_MMAP_THRESHOLD, static_cast<int>(2 * kLargePage)) != 0 &&
                                   ::mallopt(M_TRIM_THRESHOLD, static_cast<int>(2 * kHeapStep)) != 0 &&
                                   ::mallopt(M_TOP_PAD, static_cast<int>(kHeapStep)) != 0;
  if (growsInSteps && end > known)
    AskForLargePages(std::max(known, plainEnd), end);
}

// The first block in what the heap has grown by begins on the page before, since the heap ends on a page's border with
// a few bytes of its own; so all others need no look at the heap's end.
Bool ReachesNextPage(std::uintptr_t block, std::uintptr_t size)
{
  constexpr std::uintptr_t kSmallestPage = 4096;
  constexpr std::uintptr_t kOfHeap = 2 * sizeof(std::size_t); // the head of what comes next
  return block / kSmallestPage != (block + size + kOfHeap) / kSmallestPage;
}

#endif

// The points of a mesh then come in tens of pages, not in thousands, and so do the nodes of a large scene.
void* InLargePages(void* block, [[maybe_unused]] LLong size)
{
#ifdef __linux__
  if (block && size >= static_cast<LLong>(2 * kLargePage)) {
    const auto start = reinterpret_cast<std::uintptr_t>(block);
    AskForLargePages(start, start + static_cast<std::uintptr_t>(size));
    return block;
  }
#ifdef __GLIBC__
  if (ReachesNextPage(reinterpret_cast<std::uintptr_t>(block), static_cast<std::uintptr_t>(size)))
    LookAfterHeap();
#endif
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
