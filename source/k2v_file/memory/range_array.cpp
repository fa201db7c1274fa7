#include "torvane/memory/range_array.h"

#include <cstring>

#include "k2v_file/memory/count_before.h"

namespace _torvane_
{

namespace
{

constexpr Long kFirstCapacity = 4;

// The number of the first range among `count` sorted ones that ends at n or behind it; `count` if there is none.
Long LowerBound(const GeRange* ranges, Long count, Long n)
{
  return CountBefore(count, [&](Long place) { return ranges[place].last < n; });
}

// Whether n + 1 == m, at the ends of the number range too.
Bool IsJustBefore(Long n, Long m) { return LLong{n} + 1 == m; }

} // namespace

// ---- The rules

template <class S>
Bool GeRangeRules<S>::TestIndex(Long n) const noexcept
{
  Long place = Store().FindFrom(n);
  return place != kNoRange && Store().At(place).first <= n;
}

template <class S>
Bool GeRangeRules<S>::AddIndex(Long n) noexcept
{
  Long place = Store().FindFrom(n);
  if (place != kNoRange && Store().At(place).first <= n)
    return true;
  Long previous = Store().Previous(place);
  if (previous != kNoRange && IsJustBefore(Store().At(previous).last, n)) {
    Store().At(previous).last = n;
    if (place != kNoRange && IsJustBefore(n, Store().At(place).first)) {
      Store().At(previous).last = Store().At(place).last;
      Store().RemoveAt(place);
    }
  } else if (place != kNoRange && IsJustBefore(n, Store().At(place).first)) {
    Store().At(place).first = n;
  } else if (Store().InsertAt(place, {n, n}) == kNoRange) {
    return false;
  }
  ++total_;
  return true;
}

template <class S>
Bool GeRangeRules<S>::RemoveIndex(Long n) noexcept
{
  Long place = Store().FindFrom(n);
  if (place == kNoRange || Store().At(place).first > n)
    return true;
  GeRange range = Store().At(place);
  if (range.first == range.last) {
    Store().RemoveAt(place);
  } else if (range.first == n) {
    Store().At(place).first = n + 1;
  } else if (range.last == n) {
    Store().At(place).last = n - 1;
  } else {
    Long low = Store().InsertAt(place, {range.first, n - 1});
    if (low == kNoRange)
      return false;
    Store().At(Store().Next(low)).first = n + 1;
  }
  --total_;
  return true;
}

template <class S>
Bool GeRangeRules<S>::SetRange(Long first, Long last) noexcept
{
  if (last < first) {
    Store().Clear();
    return true;
  }
  if (Store().GetRangeCount() == 0) {
    if (Store().InsertAt(kNoRange, {first, last}) == kNoRange)
      return false;
  } else {
    // The first range has its memory already.
    while (Store().GetRangeCount() > 1)
      Store().RemoveAt(Store().Previous(kNoRange));
    Store().At(0) = {first, last};
  }
  total_ = LLong{last} - first + 1;
  return true;
}

// ---- The flat form

void GeRangeArray::Clear() noexcept
{
  GeFree(block_);
  count_ = capacity_ = 0;
  total_ = 0;
}

Bool GeRangeArray::GetRange(Long n, GeRange& range) const noexcept
{
  if (n < 0 || n >= count_)
    return false;
  range = At(n);
  return true;
}

Long GeRangeArray::FindFrom(Long n) const noexcept
{
  Long place = LowerBound(Entries(), count_, n);
  return place < count_ ? place : kNoRange;
}

Long GeRangeArray::InsertAt(Long place, GeRange range) noexcept
{
  if (count_ == capacity_ && !detail::GrowArray(block_, capacity_, count_, kFirstCapacity, 0, sizeof(GeRange)))
    return kNoRange;
  if (place == kNoRange)
    place = count_;
  GeRange* at = Entries() + place;
  std::memmove(at + 1, at, static_cast<std::size_t>(count_ - place) * sizeof(GeRange));
  *at = range;
  ++count_;
  return place;
}

void GeRangeArray::RemoveAt(Long place) noexcept
{
  --count_;
  GeRange* at = Entries() + place;
  std::memmove(at, at + 1, static_cast<std::size_t>(count_ - place) * sizeof(GeRange));
  // Without memory for the smaller block the larger one serves on.
  if (capacity_ > kFirstCapacity && count_ <= capacity_ / 2)
    detail::SetArrayCapacity(block_, capacity_, capacity_ / 2, sizeof(GeRange));
}

// ---- The paged form

void GePagedRangeArray::Clear() noexcept
{
  for (Page*& page : pages_)
    GeFree(page);
  pages_.Flush();
  count_ = cursor_ = 0;
  total_ = 0;
}

Bool GePagedRangeArray::GetRange(Long n, GeRange& range) const noexcept
{
  if (n < 0 || n >= count_)
    return false;
  Long number = 0;
  while (n >= pages_[number]->count)
    n -= pages_[number++]->count;
  range = pages_[number]->entries[n];
  return true;
}

Long GePagedRangeArray::Next(Long place) const noexcept
{
  Long number = place / kPageEntries;
  if (place % kPageEntries + 1 < pages_[number]->count)
    return place + 1;
  return number + 1 < pages_.GetCount() ? (number + 1) * kPageEntries : kNoRange;
}

Long GePagedRangeArray::Previous(Long place) const noexcept
{
  if (place > 0 && place % kPageEntries > 0)
    return place - 1;
  Long number = place == kNoRange ? pages_.GetCount() : place / kPageEntries;
  return number > 0 ? (number - 1) * kPageEntries + pages_[number - 1]->count - 1 : kNoRange;
}

Long GePagedRangeArray::FindFrom(Long n) const noexcept
{
  if (count_ == 0)
    return kNoRange;
  if (const GeRange& range = At(cursor_); range.first <= n && n <= range.last)
    return cursor_;
  Long place = FindInPages(n);
  cursor_ = place != kNoRange && At(place).first <= n ? place : 0;
  return place;
}

Long GePagedRangeArray::FindInPages(Long n) const noexcept
{
  // The last page that begins at n or before it.
  const Long begun = CountBefore(pages_.GetCount(), [&](Long page) { return pages_[page]->entries[0].first <= n; });
  const Long number = begun > 0 ? begun - 1 : 0;
  Long position = LowerBound(pages_[number]->entries, pages_[number]->count, n);
  if (position < pages_[number]->count)
    return number * kPageEntries + position;
  return number + 1 < pages_.GetCount() ? (number + 1) * kPageEntries : kNoRange;
}

// A new empty page with this number, or null.
GePagedRangeArray::Page* GePagedRangeArray::InsertPage(Long number) noexcept
{
  // Places are page numbers times 512 and must stay within 32 bits.
  constexpr Long kMostPages = 0x7FFFFFFF / kPageEntries;
  if (pages_.GetCount() >= kMostPages)
    return nullptr;
  Page* page = static_cast<Page*>(GeAllocNC(sizeof(Page)));
  if (!page)
    return nullptr;
  page->count = 0;
  if (!pages_.Insert(number, page))
    GeFree(page);
  return page;
}

// Adds a page behind the full page `number` (or a first one, behind page -1) and brings the place along. A page that
// is added to at its end stays full; any other gives its upper half to the new one.
Bool GePagedRangeArray::SplitPage(Long& number, Long& position) noexcept
{
  Page* added = InsertPage(number + 1);
  if (!added)
    return false;
  constexpr Long kHalf = kPageEntries / 2;
  if (number < 0 || position == kPageEntries) {
    ++number;
    position = 0;
    return true;
  }
  Page* full = pages_[number];
  std::memcpy(added->entries, full->entries + kHalf, kHalf * sizeof(GeRange));
  added->count = full->count = kHalf;
  if (position > kHalf) {
    ++number;
    position -= kHalf;
  }
  return true;
}

Long GePagedRangeArray::InsertAt(Long place, GeRange range) noexcept
{
  Long number = place == kNoRange ? pages_.GetCount() - 1 : place / kPageEntries;
  Long position = place != kNoRange ? place % kPageEntries : number < 0 ? 0 : pages_[number]->count;
  if ((number < 0 || pages_[number]->count == kPageEntries) && !SplitPage(number, position))
    return kNoRange;
  Page* page = pages_[number];
  GeRange* at = page->entries + position;
  std::memmove(at + 1, at, static_cast<std::size_t>(page->count - position) * sizeof(GeRange));
  *at = range;
  ++page->count;
  ++count_;
  cursor_ = 0;
  return number * kPageEntries + position;
}

void GePagedRangeArray::RemoveAt(Long place) noexcept
{
  Long number = place / kPageEntries;
  Page* page = pages_[number];
  --page->count;
  --count_;
  GeRange* at = page->entries + place % kPageEntries;
  std::memmove(at, at + 1, static_cast<std::size_t>(page->count - place % kPageEntries) * sizeof(GeRange));
  if (page->count == 0) {
    pages_.Remove(number);
    GeFree(page);
  }
  cursor_ = 0;
}

template class GeRangeRules<GeRangeArray>;
template class GeRangeRules<GePagedRangeArray>;

} // namespace _torvane_
