#include "torvane/memory/private_ge_mtools.h"

#include <cstring>

namespace _torvane_
{

namespace
{

// Exchanges two elements by units of one size.
template <class Unit>
void SwapUnits(UChar* a, UChar* b, std::size_t size)
{
  for (std::size_t i = 0; i < size; i += sizeof(Unit)) {
    Unit kept;
    Unit moved;
    std::memcpy(&kept, a + i, sizeof(Unit));
    std::memcpy(&moved, b + i, sizeof(Unit));
    std::memcpy(a + i, &moved, sizeof(Unit));
    std::memcpy(b + i, &kept, sizeof(Unit));
  }
}

// An array of elements by number.
struct Elements
{
  UChar* base;
  std::size_t size;

  UChar* At(Long n) const { return base + static_cast<std::size_t>(n) * size; }

  void Swap(Long a, Long b) const
  {
    if (size % sizeof(ULong) == 0)
      SwapUnits<ULong>(At(a), At(b), size);
    else if (size % sizeof(UWord) == 0)
      SwapUnits<UWord>(At(a), At(b), size);
    else
      SwapUnits<UChar>(At(a), At(b), size);
  }
};

// Lets the element `parent` of a heap of `count` elements, numbered from 1, sink to its place.
void SiftDown(GeSortAndSearch& order, const Elements& elements, Long parent, Long count)
{
  while (parent <= count / 2) {
    Long child = 2 * parent;
    if (child < count && order.Compare(elements.At(child - 1), elements.At(child)) < 0)
      ++child;
    if (order.Compare(elements.At(parent - 1), elements.At(child - 1)) >= 0)
      return;
    elements.Swap(parent - 1, child - 1);
    parent = child;
  }
}

} // namespace

void GeSortAndSearch::Sort(void* base, Long count, Long elementSize) noexcept
{
  if (!base || count < 2 || elementSize <= 0)
    return;
  Elements elements{static_cast<UChar*>(base), static_cast<std::size_t>(elementSize)};
  for (Long parent = count / 2; parent >= 1; --parent)
    SiftDown(*this, elements, parent, count);
  for (Long rest = count - 1; rest >= 1; --rest) {
    elements.Swap(0, rest);
    SiftDown(*this, elements, 1, rest);
  }
}

void* GeSortAndSearch::Search(const void* key, void* base, Long count, Long elementSize) noexcept
{
  Long position = 0;
  return SearchOrInsertPos(key, base, count, elementSize, position);
}

void* GeSortAndSearch::SearchOrInsertPos(const void* key, void* base, Long count, Long elementSize,
                                         Long& position) noexcept
{
  position = 0;
  if (!key || !base || count <= 0 || elementSize <= 0)
    return nullptr;
  Elements elements{static_cast<UChar*>(base), static_cast<std::size_t>(elementSize)};
  Long result = Compare(key, elements.At(0));
  if (result == 0)
    return base;
  if (result < 0)
    return nullptr;
  Long low = 1;
  Long high = count - 1;
  while (low <= high) {
    position = low + (high - low) / 2;
    result = Compare(key, elements.At(position));
    if (result == 0) {
      // Element 0 is not equal, so that the walk back ends before it.
      while (Compare(key, elements.At(position - 1)) == 0)
        --position;
      return elements.At(position);
    }
    if (result < 0)
      high = position - 1;
    else
      low = position + 1;
  }
  if (result > 0)
    ++position;
  return nullptr;
}

Long GeToolDynArraySort::Compare(const void* a, const void* b)
{
  return compare_(*static_cast<void* const*>(a), *static_cast<void* const*>(b));
}

Bool detail::GrowArray(void*& block, Long& capacity, Long count, Long first, Long increment, LLong elementSize) noexcept
{
  constexpr LLong kMost = 0x7FFFFFFF;
  LLong grown = capacity == 0 ? first : increment != 0 ? LLong{capacity} + increment : LLong{capacity} * 2;
  if (grown <= count || grown > kMost)
    return false;
  return SetArrayCapacity(block, capacity, static_cast<Long>(grown), elementSize);
}

// What lies behind the elements is never looked at before it is written.
Bool detail::SetArrayCapacity(void*& block, Long& capacity, Long newCapacity, LLong elementSize) noexcept
{
  void* moved = GeRealloc(block, newCapacity * elementSize);
  if (!moved)
    return false;
  block = moved;
  capacity = newCapacity;
  return true;
}

Long GeToolDynArray::Find(const void* object) const noexcept
{
  for (Long i = 0; i < GetCount(); ++i) {
    if ((*this)[i] == object)
      return i;
  }
  return -1;
}

void* GeToolDynArray::Pop() noexcept
{
  void* object = nullptr;
  GeTempDynArray::Pop(&object);
  return object;
}

void GeToolDynArray::Sort(GeCompareFunction compare) noexcept
{
  GeToolDynArraySort order(compare);
  GeTempDynArray::Sort(order);
}

void* GeToolDynArray::Search(const void* key, GeCompareFunction compare) noexcept
{
  GeToolDynArraySort order(compare);
  void* place = key ? order.Search(&key, Data(), GetCount(), static_cast<Long>(sizeof(void*))) : nullptr;
  return place ? *static_cast<void**>(place) : nullptr;
}

} // namespace _torvane_
