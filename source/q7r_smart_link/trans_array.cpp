#include "torvane/links/alias.h"
#include "torvane/memory/assertion.h"

namespace _torvane_
{

namespace
{

constexpr const char* kModule = "q7r_smart_link";
// What readers of the log know these reports by.
constexpr Long kLineOfGoal = 794;
constexpr Long kLineOfLink = 843;
constexpr LLong kFirstTable = 16;
constexpr Long kFirstBlock = 8;
constexpr Long kLargestBlock = 1024;

// Spreads an id over 64 bits.
ULLong Mix(ULLong value)
{
  value = (value ^ (value >> 30)) * 0xBF58476D1CE4E5B9;
  value = (value ^ (value >> 27)) * 0x94D049BB133111EB;
  return value ^ (value >> 31);
}

} // namespace

// What is known of one id. The two links lie in the entry itself, so that a registration takes no memory for them.
struct TransEntry
{
  GeAliasGoal placeholder; // the target of links whose goal hasn't turned up
  GeAliasXLink current;    // stands on the goal that links of this id are to have
  GeAliasXLink origin;     // in a copy, stands on the goal that the source links have
};

// The entries follow.
struct TransArray::Block
{
  Block* next;
  Long capacity;
  Long used;

  TransEntry* Entries() { return reinterpret_cast<TransEntry*>(this + 1); }
};

// The slot of an id: the one that holds it or the free one where it belongs. The table is never full. Its address takes
// part, so that nobody can make up a file of ids that all fall into one slot.
TransArray::Slot& TransArray::SlotOf(GeAliasID id) const
{
  ULLong mask = static_cast<ULLong>(capacity_) - 1;
  ULLong index = Mix(id ^ reinterpret_cast<std::uintptr_t>(table_)) & mask;
  while (table_[index].entry && table_[index].id != id)
    index = (index + 1) & mask;
  return table_[index];
}

// Keeps a quarter of the slots free.
Bool TransArray::GrowTable()
{
  if (count_ < capacity_ / 4 * 3)
    return true;
  LLong newCapacity = capacity_ ? capacity_ * 2 : kFirstTable;
  Slot* newTable = static_cast<Slot*>(GeAlloc(newCapacity * static_cast<LLong>(sizeof(Slot))));
  if (!newTable)
    return false;
  Slot* oldTable = table_;
  LLong oldCapacity = capacity_;
  table_ = newTable;
  capacity_ = newCapacity;
  for (LLong i = 0; i < oldCapacity; ++i) {
    if (oldTable[i].entry)
      SlotOf(oldTable[i].id) = oldTable[i];
  }
  GeFree(oldTable);
  return true;
}

// Where the next entry is to be made; null when memory is short.
TransEntry* TransArray::NextPlace()
{
  if (!blocks_ || blocks_->used == blocks_->capacity) {
    Long capacity = blocks_ ? blocks_->capacity * 2 : kFirstBlock;
    if (capacity > kLargestBlock)
      capacity = kLargestBlock;
    LLong size = static_cast<LLong>(sizeof(Block)) + capacity * static_cast<LLong>(sizeof(TransEntry));
    void* place = GeAllocNC(size);
    if (!place)
      return nullptr;
    blocks_ = ::new (place) Block{blocks_, capacity, 0};
  }
  return blocks_->Entries() + blocks_->used;
}

TransEntry* TransArray::Find(GeAliasID id) const { return table_ ? SlotOf(id).entry : nullptr; }

// An entry for a new id. Its links go to `goal`, or to the entry's placeholder when that is null. Null, with nothing
// changed, when memory is short.
TransEntry* TransArray::Insert(GeAliasID id, GeAliasGoal* goal)
{
  TransEntry* place = GrowTable() ? NextPlace() : nullptr;
  if (!place)
    return nullptr;
  TransEntry* entry = ::new (static_cast<void*>(place)) TransEntry;
  AliasTrunk* trunk = (goal ? goal : &entry->placeholder)->NeedTrunk();
  if (!trunk) {
    entry->~TransEntry();
    return nullptr;
  }
  entry->current.Attach(*trunk);
  SlotOf(id) = {id, entry};
  ++blocks_->used;
  ++count_;
  return entry;
}

Bool TransArray::RegisterGoal(GeAliasID id, GeAliasGoal& goal)
{
  goal.DropLinks();
  if (id == 0)
    return true;
  TransEntry* entry = Find(id);
  if (!entry)
    return Insert(id, &goal) != nullptr;
  if (GeAliasGoal* present = entry->current.GetGoal())
    present->MoveLinksTo(goal);
  else
    ReportAssertion(kModule, kLineOfGoal, "the goal of this id has gone");
  return true;
}

Bool TransArray::RegisterLink(GeAliasID id, GeAliasLink& link, GeAliasGoal* sourceGoal)
{
  link.ClearLink();
  if (id == 0)
    return true;
  TransEntry* entry = Find(id);
  if (!entry)
    entry = Insert(id, nullptr);
  if (!entry)
    return false;
  GeAliasGoal* goal = entry->current.GetGoal();
  if (!goal) {
    ReportAssertion(kModule, kLineOfLink, "the goal of this id has gone");
    return true;
  }
  if (!link.SetLinkGoal(goal))
    return false;
  entry->origin.Detach();
  AliasTrunk* source = sourceGoal ? sourceGoal->NeedTrunk() : nullptr;
  if (source)
    entry->origin.Attach(*source);
  return source || !sourceGoal;
}

// Moves the slots whose goal never came, and whose links have a target to go back to, to the front of the table, which
// is of no other use after that.
LLong TransArray::CollectUnresolved()
{
  LLong found = 0;
  for (LLong i = 0; i < capacity_; ++i) {
    TransEntry* entry = table_[i].entry;
    if (entry && entry->current.GetGoal() == &entry->placeholder && entry->origin.GetGoal())
      table_[found++] = table_[i];
  }
  return found;
}

void TransArray::FinishTranslation(Bool keepToOrigin)
{
  if (keepToOrigin && table_) {
    // In the order of the ids: it is also the order in which links enter the list of a common target.
    class ById : public GeSortAndSearch
    {
      Long Compare(const void* a, const void* b) override
      {
        GeAliasID left = static_cast<const Slot*>(a)->id;
        GeAliasID right = static_cast<const Slot*>(b)->id;
        return left < right ? -1 : left > right ? 1 : 0;
      }
    };
    LLong unresolved = CollectUnresolved();
    ById().Sort(table_, static_cast<Long>(unresolved), static_cast<Long>(sizeof(Slot)));
    for (LLong i = 0; i < unresolved; ++i) {
      TransEntry* entry = table_[i].entry;
      GeAliasGoal* target = entry->origin.GetGoal();
      if (target && target->HasLinks())
        entry->placeholder.MoveLinksTo(*target);
    }
  }
  Clear();
}

void TransArray::Clear()
{
  while (blocks_) {
    Block* block = blocks_;
    blocks_ = block->next;
    for (Long i = 0; i < block->used; ++i)
      block->Entries()[i].~TransEntry();
    GeFree(block);
  }
  GeFree(table_);
  capacity_ = 0;
  count_ = 0;
}

// ---------------------------------------------------------------------------------------------------------------

Bool AliasTranslator::MakeTranslator()
{
  if (!array_)
    array_ = NewObj<TransArray>();
  return array_ != nullptr;
}

void AliasTranslator::Finish(Bool keepToOrigin)
{
  if (array_)
    array_->FinishTranslation(keepToOrigin);
  DeleteObj(array_);
}

} // namespace _torvane_
