#include "k2v_file/values/container_index.h"

namespace _torvane_
{

namespace
{

constexpr Long kFirstCapacity = 8;

// Negative ids are stored as one.
Long StoredId(Long id) { return id < 0 ? -1 : id; }

} // namespace

ContainerIndex::~ContainerIndex()
{
  for (Long i = 0; i < capacity_; ++i)
    DeleteObj(slots_[i].nested);
  GeFree(slots_);
  while (ContainerIndex* other = others_) {
    others_ = other->sibling_;
    DeleteObj(other);
  }
}

ContainerIndex::Slot& ContainerIndex::Probe(Long id)
{
  const ULong mask = static_cast<ULong>(capacity_) - 1;
  ULong hash = static_cast<ULong>(id) * 0x9E3779B1U;
  hash ^= hash >> 15;
  for (ULong place = hash & mask;; place = (place + 1) & mask) {
    ++steps_;
    Slot& slot = slots_[place];
    if (!slot.value || slot.id == id)
      return slot;
  }
}

Bool ContainerIndex::Grow(Long capacity)
{
  auto* fresh = static_cast<Slot*>(GeAlloc(capacity * static_cast<LLong>(sizeof(Slot))));
  if (!fresh)
    return false;
  Slot* old = std::exchange(slots_, fresh);
  const Long count = std::exchange(capacity_, capacity);
  for (Long i = 0; i < count; ++i) {
    if (old[i].value)
      Probe(old[i].id) = old[i];
  }
  GeFree(old);
  return true;
}

// Takes an element in unless one of that id stands before it.
Bool ContainerIndex::Note(Long id, GeData* value)
{
  if (used_ >= capacity_ / 2 && !Grow(capacity_ == 0 ? kFirstCapacity : 2 * capacity_))
    return false;
  Slot& slot = Probe(StoredId(id));
  if (slot.value)
    return true;
  slot = {value, nullptr, StoredId(id)};
  ++used_;
  return true;
}

Bool ContainerIndex::Build()
{
  if (slots_)
    return true;
  if (!Grow(kFirstCapacity))
    return false;
  // Elements that are shared are made the container's own: their values are about to be changed.
  if (container_.IsShared() && !container_.TakeCopy())
    return false;
  for (auto* element = container_.head_; element; element = element->next) {
    ++steps_;
    if (!Note(element->id, &element->value))
      return false;
  }
  return true;
}

ContainerIndex::Slot* ContainerIndex::Find(Long id)
{
  if (id < -1) // no element has it
    return nullptr;
  Slot& slot = Probe(id);
  return slot.value ? &slot : nullptr;
}

GeData* ContainerIndex::Append(Long id)
{
  GeData* value = container_.InsertData(id, GeData());
  return value && (!slots_ || Note(id, value)) ? value : nullptr;
}

GeData* ContainerIndex::Set(Long id)
{
  if (!Build())
    return nullptr;
  Slot* slot = Find(id);
  if (!slot)
    return Append(id);
  DeleteObj(slot->nested);
  if (slot->value->GetRawType() != kDataNil) {
    container_.MarkDirty();
    slot->value->Free();
  }
  return slot->value;
}

ContainerIndex* ContainerIndex::Enter(Long id, Bool flush)
{
  if (!Build())
    return nullptr;
  Slot* slot = Find(id);
  if (slot && slot->nested)
    return slot->nested;
  GeData* value = slot ? slot->value : nullptr;
  if (!value || !value->GetContainer()) {
    value = flush ? Append(id) : Set(id);
    if (!value || !value->SetType(kDataContainer))
      return nullptr;
    slot = &Probe(StoredId(id));
  }
  ContainerIndex* nested = NewObj<ContainerIndex>(*value->GetContainer(), steps_);
  if (slot->value == value)
    slot->nested = nested;
  else if (nested)
    nested->sibling_ = std::exchange(others_, nested);
  return nested;
}

} // namespace _torvane_
