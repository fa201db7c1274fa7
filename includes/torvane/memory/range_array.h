// Sets of 32-bit numbers as sorted arrays of closed ranges: a run of a million numbers is one entry. Ranges neither
// overlap nor touch. Additions and removals are false only when memory runs out; the set is then as it was.
#pragma once

#include "torvane/memory/private_ge_mtools.h"
#include "torvane/types.h"

namespace _torvane_
{

// Both numbers belong to the range.
struct GeRange
{
  Long first;
  Long last;
};

// The rules of adding and removing one number, over the places of a store S. A place is a number that the store gives
// out; kNoRange stands for the one behind the last range. S has At, Next, Previous, FindFrom, InsertAt and RemoveAt.
template <class S>
class GeRangeRules
{
 public:
  static constexpr Long kNoRange = -1;

  Bool AddIndex(Long n) noexcept;
  Bool RemoveIndex(Long n) noexcept;
  Bool TestIndex(Long n) const noexcept;
  // The set becomes just these numbers; empty if `last` is below `first`.
  Bool SetRange(Long first, Long last) noexcept;
  // How many numbers the set has.
  LLong GetCount() const noexcept { return total_; }

 protected:
  GeRangeRules() noexcept = default;
  LLong total_ = 0;

 private:
  S& Store() noexcept { return static_cast<S&>(*this); }
  const S& Store() const noexcept { return static_cast<const S&>(*this); }
  Bool Join(Long place, Long n) noexcept;
};

// The flat form: one block, from 4 entries on by doubling, halved when half of it is no longer used.
class GeRangeArray : public GeRangeRules<GeRangeArray>
{
 public:
  GeRangeArray() noexcept = default;
  ~GeRangeArray() { Clear(); }
  GeRangeArray(const GeRangeArray&) = delete;
  GeRangeArray& operator=(const GeRangeArray&) = delete;

  void Clear() noexcept;
  Long GetRangeCount() const noexcept { return count_; }
  // The n-th range; false for a number out of range.
  Bool GetRange(Long n, GeRange& range) const noexcept;
  Long GetCapacity() const noexcept { return capacity_; }

 private:
  friend class GeRangeRules<GeRangeArray>;

  GeRange& At(Long place) noexcept { return Entries()[place]; }
  const GeRange& At(Long place) const noexcept { return Entries()[place]; }
  Long Next(Long place) const noexcept { return place + 1 < count_ ? place + 1 : kNoRange; }
  Long Previous(Long place) const noexcept { return place == kNoRange ? count_ - 1 : place - 1; }
  Long FindFrom(Long n) const noexcept;
  Long InsertAt(Long place, GeRange range) noexcept;
  void RemoveAt(Long place) noexcept;
  GeRange* Entries() const noexcept { return static_cast<GeRange*>(block_); }

  void* block_ = nullptr;
  Long count_ = 0;
  Long capacity_ = 0;
};

// The paged form, for sets of very many ranges: pages of 512 entries, and a cursor at the last range found, so that a
// look at the same place again is immediate. Lookups move the cursor: one thread at a time, for tests too.
class GePagedRangeArray : public GeRangeRules<GePagedRangeArray>
{
 public:
  static constexpr Long kPageEntries = 512;

  GePagedRangeArray() noexcept = default;
  ~GePagedRangeArray() { Clear(); }
  GePagedRangeArray(const GePagedRangeArray&) = delete;
  GePagedRangeArray& operator=(const GePagedRangeArray&) = delete;

  void Clear() noexcept;
  Long GetRangeCount() const noexcept { return count_; }
  // The n-th range; false for a number out of range. Walks the pages.
  Bool GetRange(Long n, GeRange& range) const noexcept;
  // Page * 512 + position of the range last found; 0 when the last lookup found none and when
  // ranges have moved since.
  Long GetCursor() const noexcept { return cursor_; }

 private:
  friend class GeRangeRules<GePagedRangeArray>;

  struct Page
  {
    Long count;
    GeRange entries[kPageEntries];
  };

  GeRange& At(Long place) const noexcept { return pages_[place / kPageEntries]->entries[place % kPageEntries]; }
  Long Next(Long place) const noexcept;
  Long Previous(Long place) const noexcept;
  Long FindFrom(Long n) const noexcept;
  Long FindInPages(Long n) const noexcept;
  Long InsertAt(Long place, GeRange range) noexcept;
  void RemoveAt(Long place) noexcept;
  Page* InsertPage(Long number) noexcept;
  Bool SplitPage(Long& number, Long& position) noexcept;

  GeTempDynArray<Page*> pages_;
  Long count_ = 0;
  mutable Long cursor_ = 0;
};

extern template class GeRangeRules<GeRangeArray>;
extern template class GeRangeRules<GePagedRangeArray>;

} // namespace _torvane_
