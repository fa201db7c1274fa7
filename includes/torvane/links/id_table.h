// A table of pointers by number, for what a TransArray knows of an id. It owns nothing that they lead to.
#pragma once

#include <cstdint>
#include <utility>

#include "torvane/memory/memory.h"
#include "torvane/types.h"

namespace _torvane_
{

// Names a goal within one file; 0 means no link. A trunk takes its number from a process-wide counter that starts
// at 1, so that the same run writes the same bytes.
using GeAliasID = ULLong;

// Finds and adds in constant time, whatever the ids: the address of the table takes part in an id's place, so that
// nobody can make up a file of ids that all fall into one slot.
template <class T>
class IdTable
{
 public:
  struct Slot
  {
    GeAliasID id;
    T* item; // null in a free slot
  };

  IdTable() = default;
  ~IdTable() { GeFree(slots_); }
  IdTable(const IdTable&) = delete;
  IdTable& operator=(const IdTable&) = delete;

  Bool IsEmpty() const { return count_ == 0; }
  // Null where nothing stands under that id.
  T* Find(GeAliasID id) const { return slots_ ? SlotOf(id).item : nullptr; }
  // Puts `item` under an id that isn't there yet. False, with nothing changed, when memory is short.
  Bool Add(GeAliasID id, T& item)
  {
    if (count_ >= capacity_ / 4 * 3 && !Grow())
      return false;
    SlotOf(id) = {id, &item};
    ++count_;
    return true;
  }
  void Clear()
  {
    GeFree(slots_);
    capacity_ = 0;
    count_ = 0;
  }

  // All slots, in no order, the free ones too.
  Slot* begin() { return slots_; }
  Slot* end() { return slots_ + capacity_; }

 private:
  static constexpr LLong kFirstCapacity = 16;

  static ULLong Mix(ULLong value)
  {
    value = (value ^ (value >> 30)) * 0xBF58476D1CE4E5B9;
    value = (value ^ (value >> 27)) * 0x94D049BB133111EB;
    return value ^ (value >> 31);
  }
  // The slot that holds the id or the free one where it belongs. The table is never full.
  Slot& SlotOf(GeAliasID id) const
  {
    const ULLong mask = static_cast<ULLong>(capacity_) - 1;
    ULLong place = Mix(id ^ reinterpret_cast<std::uintptr_t>(slots_)) & mask;
    while (slots_[place].item && slots_[place].id != id)
      place = (place + 1) & mask;
    return slots_[place];
  }
  Bool Grow()
  {
    IdTable<T> larger;
    const LLong capacity = capacity_ ? capacity_ * 2 : kFirstCapacity;
    larger.slots_ = static_cast<Slot*>(GeAlloc(capacity * static_cast<LLong>(sizeof(Slot))));
    if (!larger.slots_)
      return false;
    larger.capacity_ = capacity;
    for (const Slot& slot : *this) {
      if (slot.item)
        larger.SlotOf(slot.id) = slot;
    }
    std::swap(slots_, larger.slots_);
    capacity_ = capacity;
    return true;
  }

  Slot* slots_ = nullptr; // a power of two of them, a quarter free
  LLong capacity_ = 0;
  LLong count_ = 0;
};

} // namespace _torvane_
