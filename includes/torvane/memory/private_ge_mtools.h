// The library's own arrays, lists and index sets. They take their memory from the client's hooks and tell by their
// results when there is none; a failed insertion leaves the array as it was. None of them locks.
#pragma once

#include <cstring>
#include <type_traits>

#include "torvane/memory/memory.h"
#include "torvane/types.h"

namespace _torvane_
{

// ---------------------------------------------------------------------------------------------------------------
// Lists

class GeToolList2D;
class GeToolNode2D;

// The neighbours of a node, or an end of a list. Only an end has no link on its outer side.
class GeToolLinks
{
  friend class GeToolList2D;
  friend class GeToolNode2D;

  GeToolLinks* next_ = nullptr;
  GeToolLinks* prev_ = nullptr;
};

// A place in a doubly linked list; the base of everything that a list can hold. Both links are null outside a list.
class GeToolNode2D : public GeMemory, private GeToolLinks
{
 public:
  GeToolNode2D() noexcept = default;
  GeToolNode2D(const GeToolNode2D&) = delete;
  GeToolNode2D& operator=(const GeToolNode2D&) = delete;
  // Leaves its list.
  virtual ~GeToolNode2D() { Remove(); }

  // The neighbours; null at the ends and outside a list.
  GeToolNode2D* GetNext() const noexcept { return next_ && next_->next_ ? static_cast<GeToolNode2D*>(next_) : nullptr; }
  GeToolNode2D* GetPrev() const noexcept { return prev_ && prev_->prev_ ? static_cast<GeToolNode2D*>(prev_) : nullptr; }
  Bool IsInList() const noexcept { return next_ && prev_; }

  // Leaves its list, if it is in one.
  void Remove() noexcept
  {
    if (next_)
      next_->prev_ = prev_;
    if (prev_)
      prev_->next_ = next_;
    next_ = prev_ = nullptr;
  }
  // Enters the list of `place`, behind or before it, after leaving its own. `place` must be another node that is in a
  // list.
  void InsertAfter(GeToolNode2D* place) noexcept
  {
    Remove();
    Link(place, place->next_);
  }
  void InsertBefore(GeToolNode2D* place) noexcept
  {
    Remove();
    Link(place->prev_, place);
  }

 private:
  friend class GeToolList2D;

  void Link(GeToolLinks* before, GeToolLinks* behind) noexcept
  {
    prev_ = before;
    next_ = behind;
    before->next_ = this;
    behind->prev_ = this;
  }
};

// A list of nodes, which it does not own: nodes that are left in it at its end are just unlinked.
class GeToolList2D
{
 public:
  GeToolList2D() noexcept
  {
    head_.next_ = &tail_;
    tail_.prev_ = &head_;
  }
  ~GeToolList2D() { RemoveAll(); }
  GeToolList2D(const GeToolList2D&) = delete;
  GeToolList2D& operator=(const GeToolList2D&) = delete;

  Bool IsEmpty() const noexcept { return head_.next_ == &tail_; }
  // Null in an empty list.
  GeToolNode2D* GetFirst() const noexcept { return IsEmpty() ? nullptr : static_cast<GeToolNode2D*>(head_.next_); }
  GeToolNode2D* GetLast() const noexcept { return IsEmpty() ? nullptr : static_cast<GeToolNode2D*>(tail_.prev_); }
  // Counts by walking the list.
  Long GetCount() const noexcept
  {
    Long count = 0;
    for (const GeToolNode2D* node = GetFirst(); node; node = node->GetNext())
      ++count;
    return count;
  }

  void InsertFirst(GeToolNode2D* node) noexcept
  {
    node->Remove();
    node->Link(&head_, head_.next_);
  }
  void InsertLast(GeToolNode2D* node) noexcept
  {
    node->Remove();
    node->Link(tail_.prev_, &tail_);
  }
  // Unlinks every node.
  void RemoveAll() noexcept
  {
    while (GeToolNode2D* node = GetFirst())
      node->Remove();
  }

 private:
  GeToolLinks head_;
  GeToolLinks tail_;
};

// A node whose neighbours are of type T, a class derived from this one.
template <class T>
class GeTempPublicNode2D : public GeToolNode2D
{
 public:
  T* GetNext() const noexcept { return static_cast<T*>(GeToolNode2D::GetNext()); }
  T* GetPrev() const noexcept { return static_cast<T*>(GeToolNode2D::GetPrev()); }
};

// A list of nodes of type T.
template <class T>
class GeTempPublicList2D : public GeToolList2D
{
 public:
  T* GetFirst() const noexcept { return static_cast<T*>(GeToolList2D::GetFirst()); }
  T* GetLast() const noexcept { return static_cast<T*>(GeToolList2D::GetLast()); }
  void InsertFirst(T* node) noexcept { GeToolList2D::InsertFirst(node); }
  void InsertLast(T* node) noexcept { GeToolList2D::InsertLast(node); }
};

// ---------------------------------------------------------------------------------------------------------------
// Sorting and searching

// Sorts and searches arrays of equal elements by an order that a derived class tells.
class GeSortAndSearch : public GeMemory
{
 public:
  virtual ~GeSortAndSearch() = default;

  // Negative, 0 or positive: the first is before, equal to or behind the second. Takes the addresses of two elements
  // when sorting, of the key and an element when searching.
  virtual Long Compare(const void* a, const void* b) = 0;

  // In place, without memory; equal elements may change their order. O(n log n) always.
  void Sort(void* base, Long count, Long elementSize) noexcept;
  // The first element that is equal to the key in an array in this order, or null.
  void* Search(const void* key, void* base, Long count, Long elementSize) noexcept;
  // As Search. `position` gets the index of the element, or the place where the key belongs.
  void* SearchOrInsertPos(const void* key, void* base, Long count, Long elementSize, Long& position) noexcept;
};

// As GeSortAndSearch::Compare, for pointers: takes the pointers themselves.
using GeCompareFunction = Long (*)(const void* a, const void* b);

// The order of an array of pointers by a plain function.
class GeToolDynArraySort : public GeSortAndSearch
{
 public:
  explicit GeToolDynArraySort(GeCompareFunction compare) noexcept : compare_(compare) {}
  Long Compare(const void* a, const void* b) override;

 private:
  GeCompareFunction compare_;
};

// ---------------------------------------------------------------------------------------------------------------
// Arrays

namespace detail
{
// Makes room for one element more in a block that holds `count` of them: the first capacity, then the increment more,
// or twice as much when there is none. False, and nothing changed, if there is no memory or no larger capacity.
Bool GrowArray(void*& block, Long& capacity, Long count, Long first, Long increment, LLong elementSize) noexcept;
// Moves the elements into a block of exactly this capacity, which is at least their count; what lies behind them is
// undefined.
Bool SetArrayCapacity(void*& block, Long& capacity, Long newCapacity, LLong elementSize) noexcept;
} // namespace detail

// Plain structs by value, copied byte by byte and never constructed or destroyed.
template <class T>
class GeTempDynArray : public GeMemory
{
  static_assert(std::is_trivially_copyable_v<T>, "elements are copied byte by byte");

 public:
  // Starts without a block. An increment of 0 doubles the capacity when it is used up; a first capacity of 0 makes
  // every insertion fail.
  explicit GeTempDynArray(Long firstCapacity = 16, Long increment = 0) noexcept
      : firstCapacity_(firstCapacity), increment_(increment)
  {}
  virtual ~GeTempDynArray() { Flush(); }
  GeTempDynArray(const GeTempDynArray&) = delete;
  GeTempDynArray& operator=(const GeTempDynArray&) = delete;

  Long GetCount() const noexcept { return count_; }
  Long GetCapacity() const noexcept { return capacity_; }
  // The elements, null while there is no block. Valid until the next insertion, SetCount, Reserve or Flush.
  T* Data() noexcept { return static_cast<T*>(block_); }
  const T* Data() const noexcept { return static_cast<const T*>(block_); }
  // Positions from 0 to count - 1 only.
  T& operator[](Long position) noexcept { return Data()[position]; }
  const T& operator[](Long position) const noexcept { return Data()[position]; }
  T* begin() noexcept { return Data(); }
  T* end() noexcept { return Data() + count_; }
  const T* begin() const noexcept { return Data(); }
  const T* end() const noexcept { return Data() + count_; }

  Bool Append(T element) noexcept
  {
    if (!Grow())
      return false;
    Data()[count_++] = element;
    return true;
  }
  // Before the element at `position`, which is brought into the range 0 to count.
  Bool Insert(Long position, T element) noexcept;
  // False for a position that holds nothing.
  Bool Remove(Long position) noexcept;
  // Takes the last element off; false when there is none.
  Bool Pop(T* element = nullptr) noexcept;
  // Nothing for positions that hold nothing.
  void Swap(Long a, Long b) noexcept;
  // Moves one element so that it stands before the one that is at `to` now. Nothing for places out of range.
  void Move(Long from, Long to) noexcept;

  // Room for `capacity` elements in all, exactly.
  Bool Reserve(Long capacity) noexcept
  {
    return capacity <= capacity_ || detail::SetArrayCapacity(block_, capacity_, capacity, kElementSize);
  }
  // Gives back most of the room that no element takes. What there is stays when memory is short.
  void Trim() noexcept
  {
    if (count_ > 0 && capacity_ - count_ > count_ / 16)
      static_cast<void>(detail::SetArrayCapacity(block_, capacity_, count_, kElementSize));
  }
  // Cuts the array, or lengthens it with elements of zero bytes.
  Bool SetCount(Long count) noexcept;
  // Empties the array and frees the block.
  void Flush() noexcept
  {
    GeFree(block_);
    count_ = capacity_ = 0;
  }
  // Empties the array and keeps the block.
  void Reset() noexcept { count_ = 0; }
  // Replaces the destination's elements and its way to grow. On failure it holds what still fitted.
  Bool CopyTo(GeTempDynArray& destination) const noexcept;

  void Sort(GeSortAndSearch& order) noexcept { order.Sort(block_, count_, static_cast<Long>(kElementSize)); }

 private:
  static constexpr LLong kElementSize = sizeof(T); // NOLINT(bugprone-sizeof-expression): T may be a pointer

  Bool Grow() noexcept
  {
    return count_ < capacity_ || detail::GrowArray(block_, capacity_, count_, firstCapacity_, increment_, kElementSize);
  }
  Bool Holds(Long position) const noexcept { return position >= 0 && position < count_; }
  static std::size_t Bytes(Long count) noexcept { return static_cast<std::size_t>(count * kElementSize); }

  void* block_ = nullptr;
  Long count_ = 0;
  Long capacity_ = 0;
  Long firstCapacity_;
  Long increment_;
};

// Pointers to things that the array does not own.
class GeToolDynArray : public GeTempDynArray<void*>
{
 public:
  using GeTempDynArray::GeTempDynArray;

  // Removes the first place of this pointer; false if there is none.
  Bool RemoveObject(const void* object) noexcept { return Remove(Find(object)); }
  // The first place of this pointer, or -1.
  Long Find(const void* object) const noexcept;
  // Takes the last pointer off; null when there is none.
  void* Pop() noexcept;
  void Sort(GeCompareFunction compare) noexcept;
  // The first pointer that compares as equal in an array sorted with the same function, or null. The function gets
  // `key` as its first argument.
  void* Search(const void* key, GeCompareFunction compare) noexcept;
};

// The order of elements by one of their members: GeMemberOrder<&UniqueIDEntry::appId>.
template <auto Member>
struct GeMemberOrder
{
  template <class T>
  static const auto& Key(const T& element) noexcept
  {
    return element.*Member;
  }
  template <class K>
  static Long Compare(const K& a, const K& b) noexcept
  {
    return a < b ? -1 : b < a ? 1 : 0;
  }
};

// Compares two elements by their keys.
template <class T, class K, class Order>
class GeToolTempDynSortArraySort : public GeSortAndSearch
{
 public:
  Long Compare(const void* a, const void* b) override
  {
    return Order::Compare(static_cast<const K&>(Order::Key(*static_cast<const T*>(a))),
                          static_cast<const K&>(Order::Key(*static_cast<const T*>(b))));
  }
};

// Compares a key with an element.
template <class T, class K, class Order>
class GeToolTempDynSortArraySearch : public GeSortAndSearch
{
 public:
  Long Compare(const void* key, const void* element) override
  {
    return Order::Compare(*static_cast<const K*>(key),
                          static_cast<const K&>(Order::Key(*static_cast<const T*>(element))));
  }
};

// Elements of type T in the order of their keys of type K. `Order` has two static operations: Key (element) and
// Compare (two keys: negative, 0, positive); GeMemberOrder makes one of a member.
template <class T, class K, class Order>
class GeTempDynSortSearchArray : public GeTempDynArray<T>
{
 public:
  using GeTempDynArray<T>::GeTempDynArray;

  Bool IsSorted() const noexcept { return sorted_; }
  // Puts the element at its place, before any with an equal key.
  Bool Insert(T element) noexcept
  {
    Long position = 0;
    Find(Order::Key(element), position);
    return GeTempDynArray<T>::Insert(position, element);
  }
  // At the end, without looking at the order: the next search sorts. For filling an array all at once.
  Bool Append(T element) noexcept
  {
    Bool done = GeTempDynArray<T>::Append(element);
    if (done)
      sorted_ = this->GetCount() == 1;
    return done;
  }
  // The first element with this key, or null; `position` gets its index, or the place where the key belongs.
  T* Find(const K& key, Long& position) noexcept
  {
    Sort();
    return static_cast<T*>(
        search_.SearchOrInsertPos(&key, this->Data(), this->GetCount(), static_cast<Long>(sizeof(T)), position));
  }
  T* Find(const K& key) noexcept
  {
    Long position = 0;
    return Find(key, position);
  }
  // Removes the first element with this key; false if there is none.
  Bool RemoveKey(const K& key) noexcept
  {
    Long position = 0;
    return Find(key, position) && this->Remove(position);
  }
  void Sort() noexcept
  {
    if (!sorted_)
      GeTempDynArray<T>::Sort(sort_);
    sorted_ = true;
  }
  Bool CopyTo(GeTempDynSortSearchArray& destination) const noexcept
  {
    destination.sorted_ = sorted_;
    return GeTempDynArray<T>::CopyTo(destination);
  }
  void Swap(Long a, Long b) = delete;
  void Move(Long from, Long to) = delete;

 private:
  Bool sorted_ = true;
  GeToolTempDynSortArraySort<T, K, Order> sort_;
  GeToolTempDynSortArraySearch<T, K, Order> search_;
};

// ---------------------------------------------------------------------------------------------------------------

template <class T>
Bool GeTempDynArray<T>::Insert(Long position, T element) noexcept
{
  if (!Grow())
    return false;
  position = position < 0 ? 0 : position > count_ ? count_ : position;
  T* place = Data() + position;
  std::memmove(static_cast<void*>(place + 1), place, Bytes(count_ - position));
  *place = element;
  ++count_;
  return true;
}

template <class T>
Bool GeTempDynArray<T>::Remove(Long position) noexcept
{
  if (!Holds(position))
    return false;
  --count_;
  T* place = Data() + position;
  std::memmove(static_cast<void*>(place), place + 1, Bytes(count_ - position));
  return true;
}

template <class T>
Bool GeTempDynArray<T>::Pop(T* element) noexcept
{
  if (count_ == 0)
    return false;
  --count_;
  if (element)
    *element = Data()[count_];
  return true;
}

template <class T>
void GeTempDynArray<T>::Swap(Long a, Long b) noexcept
{
  if (!Holds(a) || !Holds(b))
    return;
  T kept = Data()[a];
  Data()[a] = Data()[b];
  Data()[b] = kept;
}

template <class T>
void GeTempDynArray<T>::Move(Long from, Long to) noexcept
{
  if (from < to)
    --to; // the removal moves the tail down
  if (from == to || !Holds(from) || !Holds(to))
    return;
  T element = Data()[from];
  Remove(from);
  Insert(to, element);
}

template <class T>
Bool GeTempDynArray<T>::SetCount(Long count) noexcept
{
  if (count < 0 || !Reserve(count))
    return false;
  if (count > count_)
    std::memset(static_cast<void*>(Data() + count_), 0, Bytes(count - count_));
  count_ = count;
  return true;
}

template <class T>
Bool GeTempDynArray<T>::CopyTo(GeTempDynArray& destination) const noexcept
{
  if (&destination == this)
    return true;
  destination.Flush();
  destination.firstCapacity_ = firstCapacity_;
  destination.increment_ = increment_;
  for (const T& element : *this) {
    if (!destination.Append(element))
      return false;
  }
  return true;
}

} // namespace _torvane_
