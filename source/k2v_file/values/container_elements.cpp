// The elements of a container: where they lie, those of defaults that it shares, and its own in their place.
#include <algorithm>
#include <iterator>

#include "k2v_file/values/container_defaults.h"

namespace _torvane_
{

namespace
{

constexpr Long kFirstBlock = 2;
constexpr Long kLargestBlock = 64;
constexpr Long kMostChanged = 4; // shared elements that are changed one by one

} // namespace

// A run of places for elements, which follow. Elements never move: their values are handed out by address.
struct BaseContainer::Block
{
  Block* next;
  Element* free; // places of removed elements, linked through `next`; used of the newest block alone
  Long capacity;
  Long used;

  Element* Elements() { return reinterpret_cast<Element*>(this + 1); }
};

const BaseContainer::Element* BaseContainer::GetFirstPlace() const { return defaults_ ? defaults_->first : head_; }

BaseContainer::Element* BaseContainer::FindOwn(Long id) const
{
  Element* element = head_;
  while (element && element->id != id)
    element = element->next;
  return element;
}

// Shows the elements of a table. The container is empty.
void BaseContainer::Share(const Defaults& defaults)
{
  defaults_ = &defaults;
  dirty_ = static_cast<UWord>(dirty_ + defaults.count);
}

// True if one more of the shared elements may be changed on its own.
Bool BaseContainer::TakesChange() const
{
  Long count = 0;
  for (const Element* element = head_; element; element = element->next)
    ++count;
  return IsShared() && count < kMostChanged;
}

GeData* BaseContainer::ReplaceShared(Long id)
{
  Element* own = TakesChange() ? NewOwn(id) : nullptr;
  if (!own)
    return nullptr;
  Link(own);
  return &own->value;
}

// Makes the first of the shared elements the container's own, and shares no others. What was its own before is among
// them and stays where it lies. False, with nothing changed, when memory is short.
Bool BaseContainer::TakeFirst(Long count)
{
  BaseContainer taken;
  if (count > 0 && !taken.AddBlock(count))
    return false;
  Element* changed[kMostChanged] = {};
  std::size_t changes = 0;
  for (Element* element = head_; element; element = element->next)
    changed[changes++] = element;
  const auto changedOf = [&changed](const Element& place) {
    Element* const* found = std::find_if(std::begin(changed), std::end(changed),
                                         [&place](const Element* each) { return each && each->id == place.id; });
    return found == std::end(changed) ? nullptr : *found;
  };
  const Element* place = defaults_->first;
  for (Long i = 0; i < count; ++i, place = place->next) {
    Element* copy = changedOf(*place) ? nullptr : taken.NewOwn(place->id);
    if (copy && !copy->value.Assign(place->value, 0, nullptr))
      return false;
    if (copy)
      taken.Link(copy);
  }
  Element* copy = std::exchange(taken.head_, nullptr);
  taken.tail_ = nullptr;
  place = defaults_->first;
  for (Long i = 0; i < count; ++i, place = place->next) {
    Element* element = changedOf(*place);
    if (!element)
      element = std::exchange(copy, copy->next);
    element->next = nullptr;
    taken.Link(element);
  }
  if (taken.blocks_) {
    taken.blocks_->next = std::exchange(blocks_, nullptr);
    head_ = tail_ = nullptr;
  }
  Swap(taken);
  return true;
}

// The value of an element of this container, to be changed; null without an element and when memory is short.
GeData* BaseContainer::Change(const Element* element)
{
  if (!element)
    return nullptr;
  if (!IsShared() || FindOwn(element->id) == element)
    return &const_cast<Element*>(element)->value;
  const Long id = element->id;
  if (!TakesChange())
    return TakeCopy() ? &FindOwn(id)->value : nullptr;
  Element* own = NewOwn(id);
  GeData* value = FillNew(own, element->value);
  if (value)
    Link(own);
  return value;
}

// Exchanges the elements.
void BaseContainer::Swap(BaseContainer& other)
{
  std::swap(head_, other.head_);
  std::swap(tail_, other.tail_);
  std::swap(blocks_, other.blocks_);
  std::swap(defaults_, other.defaults_);
}

// The places of a small container stay: most often the elements that a file holds take those of the defaults.
void BaseContainer::Flush()
{
  dirty_ = static_cast<UWord>(dirty_ + GetCount());
  if (!tail_ || IsShared() || blocks_->capacity == kLargestBlock)
    return FreeElements();
  for (Element* element = head_; element; element = element->next)
    element->value.Free();
  tail_->next = blocks_->free;
  blocks_->free = head_;
  head_ = tail_ = nullptr;
}

// Containers that lie in containers are put into a list and freed one after the other, however deep they are nested.
void BaseContainer::FreeElements()
{
  if (!blocks_) {
    defaults_ = nullptr;
    return;
  }
  BaseContainer* pending = nullptr;
  DropElements(pending);
  while (pending) {
    BaseContainer* container = pending;
    pending = container->pending_;
    container->DropElements(pending);
    DeleteObj(container);
  }
}

void BaseContainer::DropElements(BaseContainer*& pending)
{
  for (Element* element = head_; element;) {
    Element* next = element->next;
    GeData& value = element->value;
    if (value.type_ == kDataContainer) {
      BaseContainer* nested = value.payload_.container;
      value.type_ = kDataNil;
      nested->pending_ = pending;
      pending = nested;
    }
    element->~Element();
    element = next;
  }
  head_ = tail_ = nullptr;
  defaults_ = nullptr;
  while (blocks_) {
    Block* block = blocks_;
    blocks_ = block->next;
    GeFree(block);
  }
}

// A nil element that is in no list yet; null when memory is short.
BaseContainer::Element* BaseContainer::NewOwn(Long id)
{
  Element* place = blocks_ ? blocks_->free : nullptr;
  if (place) {
    blocks_->free = place->next;
  } else {
    if (!blocks_ || blocks_->used == blocks_->capacity) {
      Long capacity = blocks_ ? blocks_->capacity * 2 : IsShared() ? 1 : kFirstBlock;
      if (capacity > kLargestBlock)
        capacity = kLargestBlock;
      if (!AddBlock(capacity))
        return nullptr;
    }
    place = blocks_->Elements() + blocks_->used++;
  }
  return ::new (static_cast<void*>(place)) Element{nullptr, id < 0 ? -1 : id, GeData()};
}

Bool BaseContainer::AddBlock(Long capacity)
{
  void* place = GeAllocNC(static_cast<LLong>(sizeof(Block)) + capacity * static_cast<LLong>(sizeof(Element)));
  if (!place)
    return false;
  blocks_ = ::new (place) Block{blocks_, nullptr, capacity, 0};
  return true;
}

// Puts an element behind the container's own ones.
void BaseContainer::Link(Element* element)
{
  (tail_ ? tail_->next : head_) = element;
  tail_ = element;
}

// Takes an element out of the list and destroys it. `previous` is null for the head.
void BaseContainer::Unlink(Element* element, Element* previous)
{
  (previous ? previous->next : head_) = element->next;
  if (tail_ == element)
    tail_ = previous;
  Recycle(element);
  ++dirty_;
}

// Frees the value of an element that is in no list and keeps its place for the next one.
void BaseContainer::Recycle(Element* element)
{
  element->value.Free();
  element->next = blocks_->free;
  blocks_->free = element;
}

const BaseContainer::Element* BaseContainer::Find(Long id) const
{
  const Element* place = FindOwn(id);
  if (place || !IsShared())
    return place;
  place = defaults_->first;
  while (place && place->id != id)
    place = place->next;
  return place;
}

} // namespace _torvane_
