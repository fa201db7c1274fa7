#include "torvane/values/base_container.h"

#include <algorithm>
#include <bit>
#include <iterator>

#include "k2v_file/values/container_defaults.h"
#include "torvane/memory/assertion.h"

namespace _torvane_
{

namespace
{

constexpr Long kFirstBlock = 2;
constexpr Long kLargestBlock = 64;
constexpr Long kMostChanged = 4; // shared elements that are changed one by one
constexpr ULLong kSameBits = 8;  // Reals whose bit patterns are closer than this count as the same

constinit const GeData kNothing{};

Bool IsSameReal(Real a, Real b)
{
  LLong x = std::bit_cast<LLong>(a);
  LLong y = std::bit_cast<LLong>(b);
  ULLong distance =
      x > y ? static_cast<ULLong>(x) - static_cast<ULLong>(y) : static_cast<ULLong>(y) - static_cast<ULLong>(x);
  return distance < kSameBits;
}

Bool IsSameVector(const Vector& a, const Vector& b)
{
  return IsSameReal(a.x, b.x) && IsSameReal(a.y, b.y) && IsSameReal(a.z, b.z);
}

// True if a value of the same type doesn't count as a change.
Bool IsSameValue(const GeData& a, const GeData& b)
{
  switch (a.GetRawType()) {
  case kDataReal:
    return IsSameReal(a.GetReal(), b.GetReal());
  case kDataVector:
    return IsSameVector(a.GetVector(), b.GetVector());
  default:
    return a.IsEqual(b);
  }
}

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

// ---------------------------------------------------------------------------------------------------------------

BaseContainer::BaseContainer(const BaseContainer& other) : id_(other.id_)
{
  if (!AppendCopies(other, 0, nullptr))
    FreeElements();
}

BaseContainer::BaseContainer(BaseContainer&& other) noexcept : id_(other.id_)
{
  Swap(other);
  dirty_ = other.dirty_;
  savedDirty_ = other.savedDirty_;
}

// CopyTo leaves a container that is copied to itself alone.
// NOLINTNEXTLINE(bugprone-unhandled-self-assignment)
BaseContainer& BaseContainer::operator=(const BaseContainer& other)
{
  if (this != &other && !other.CopyTo(*this, 0, nullptr))
    Flush();
  return *this;
}

BaseContainer& BaseContainer::operator=(BaseContainer&& other) noexcept
{
  if (this == &other)
    return *this;
  BaseContainer taken(std::move(other)); // `other` may lie inside of this container
  Swap(taken);
  id_ = taken.id_;
  ++dirty_;
  return *this;
}

BaseContainer::~BaseContainer() { FreeElements(); }

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

// ---------------------------------------------------------------------------------------------------------------

// The element's value, or null after a copy that found no memory.
GeData* BaseContainer::FillNew(Element* element, const GeData& value)
{
  if (!element)
    return nullptr;
  if (element->value.Assign(value, 0, nullptr))
    return &element->value;
  Recycle(element);
  return nullptr;
}

GeData* BaseContainer::InsertData(Long id, const GeData& value)
{
  Element* element = NewElement(id);
  GeData* stored = FillNew(element, value);
  if (stored)
    Append(element);
  return stored;
}

GeData* BaseContainer::InsertData(Long id, GeData&& value)
{
  Element* element = NewElement(id);
  if (!element)
    return nullptr;
  ::new (static_cast<void*>(&element->value)) GeData(std::move(value)); // a nil value owns nothing that would be lost
  Append(element);
  return &element->value;
}

GeData* BaseContainer::InsertDataAfter(Long id, const GeData& value, const GeData* after)
{
  Long index = 0;
  const Element* found = GetFirstPlace();
  for (; found && &Shown(found)->value != after; found = found->next)
    ++index;
  if (found && !found->next)
    return InsertData(id, value);
  Element* element = NewElement(id);
  GeData* stored = FillNew(element, value);
  if (!stored)
    return nullptr;
  Element* previous = found ? const_cast<Element*>(FindAt(index)) : nullptr;
  Element*& place = previous ? previous->next : head_;
  element->next = place;
  place = element;
  if (!tail_)
    tail_ = element;
  ++dirty_;
  return stored;
}

GeData* BaseContainer::SetData(Long id, const GeData& value)
{
  const Element* element = Find(id);
  if (!element)
    return InsertData(id, value);
  GeData* place = Change(element);
  if (!place)
    return nullptr;
  GeData& stored = *place;
  if (stored.type_ == value.type_) {
    if (stored.type_ == kDataContainer && stored.payload_.container == value.payload_.container) {
      ReportAssertion("k2v_file", __LINE__, "a container was set onto itself");
      return &stored;
    }
    if (!IsSameValue(stored, value))
      ++dirty_;
  } else {
    ++dirty_;
    if (stored.type_ == kDataReal && value.type_ == kDataLong)
      return &(stored = GeData(value.GetReal()));
    if (stored.type_ == kDataLong && value.type_ == kDataReal)
      return &(stored = GeData(value.GetLong()));
  }
  return stored.Assign(value, 0, nullptr) ? &stored : nullptr;
}

Bool BaseContainer::RemoveData(Long id) { return RemoveIndex(FindIndex(id)); }

Bool BaseContainer::RemoveIndex(Long index)
{
  if (!TakeCopy())
    return false;
  Element* previous = nullptr;
  Element* element = index < 0 ? nullptr : head_;
  for (; element && index > 0; --index) {
    previous = element;
    element = element->next;
  }
  if (element)
    Unlink(element, previous);
  return element != nullptr;
}

// ---------------------------------------------------------------------------------------------------------------

Long BaseContainer::FindIndex(Long id) const
{
  Long index = 0;
  for (const Element* place = GetFirstPlace(); place; place = place->next, ++index) {
    if (place->id == id)
      return index;
  }
  return -1;
}

Long BaseContainer::GetCount() const
{
  if (IsShared())
    return defaults_->count;
  Long count = 0;
  for (const Element* element = head_; element; element = element->next)
    ++count;
  return count;
}

// The element at a position, or null.
const BaseContainer::Element* BaseContainer::FindAt(Long index) const
{
  const Element* place = index < 0 ? nullptr : GetFirstPlace();
  for (; place && index > 0; --index)
    place = place->next;
  return place ? Shown(place) : nullptr;
}

GeData* BaseContainer::GetIndexData(Long index) { return Change(FindAt(index)); }

const GeData* BaseContainer::GetIndexData(Long index) const
{
  const Element* element = FindAt(index);
  return element ? &element->value : nullptr;
}

Long BaseContainer::GetIndexId(Long index) const
{
  const Element* element = FindAt(index);
  return element ? element->id : -1;
}

// What a link, a container or a custom value leads to can be changed.
const GeData& BaseContainer::GetData(Long id)
{
  const Element* element = Find(id);
  if (!element || element->value.type_ < kDataContainer)
    return element ? element->value : kNothing;
  const GeData* value = Change(element);
  return value ? *value : kNothing;
}

const GeData& BaseContainer::GetData(Long id) const
{
  const Element* element = Find(id);
  return element ? element->value : kNothing;
}

GeData* BaseContainer::FindData(Long id) { return Change(Find(id)); }

const GeData* BaseContainer::FindData(Long id) const
{
  const Element* element = Find(id);
  return element ? &element->value : nullptr;
}

Bool BaseContainer::BrowseFirst(Iterator& iterator, Long& id, const GeData*& value) const
{
  iterator.place_ = GetFirstPlace();
  return Visit(iterator, id, value);
}

Bool BaseContainer::BrowseNext(Iterator& iterator, Long& id, const GeData*& value) const
{
  iterator.place_ = iterator.place_ ? iterator.place_->next : nullptr;
  return Visit(iterator, id, value);
}

Bool BaseContainer::Visit(const Iterator& iterator, Long& id, const GeData*& value) const
{
  const Element* place = iterator.place_;
  if (!place)
    return false;
  id = place->id;
  value = &Shown(place)->value;
  return true;
}

// ---------------------------------------------------------------------------------------------------------------

// Fills this container, which is new. Nested containers are copied here and not by their values, to need little of the
// stack for each level.
Bool BaseContainer::AppendCopies(const BaseContainer& source, ULong flags, TransArray* translation)
{
  Long count = 0;
  for (const Element* element = source.head_; element; element = element->next)
    ++count;
  if (count > 0 && !AddBlock(count))
    return false;
  defaults_ = source.defaults_;
  for (const Element* element = source.head_; element; element = element->next) {
    Element* copy = NewOwn(element->id);
    if (!copy)
      return false;
    Link(copy);
    if (element->value.type_ != kDataContainer) {
      if (!copy->value.Assign(element->value, flags, translation))
        return false;
      continue;
    }
    const BaseContainer* nested = element->value.payload_.container;
    if (!copy->value.SetType(kDataContainer))
      return false;
    BaseContainer& target = *copy->value.payload_.container;
    target.id_ = nested->id_;
    if (!target.AppendCopies(*nested, flags, translation))
      return false;
  }
  dirty_ = static_cast<UWord>(dirty_ + GetCount());
  return true;
}

// Works on the side first: either container may lie inside of the other.
Bool BaseContainer::CopyTo(BaseContainer& destination, ULong flags, TransArray* translation) const
{
  if (&destination == this)
    return true;
  BaseContainer copy(id_);
  if (!copy.AppendCopies(*this, flags, translation))
    return false;
  destination.dirty_ = static_cast<UWord>(destination.dirty_ + destination.GetCount() + copy.dirty_);
  destination.id_ = copy.id_;
  destination.Swap(copy);
  return true;
}

BaseContainer* BaseContainer::GetClone(ULong flags, TransArray* translation) const
{
  BaseContainer* clone = NewObj<BaseContainer>();
  if (clone && !CopyTo(*clone, flags, translation))
    DeleteObj(clone);
  return clone;
}

Bool BaseContainer::IsEqual(const BaseContainer& other) const
{
  const Element* a = GetFirstPlace();
  const Element* b = other.GetFirstPlace();
  Bool equal = id_ == other.id_;
  for (; equal && a && b; a = a->next, b = b->next) {
    const GeData& value = Shown(a)->value;
    const GeData& same = other.Shown(b)->value;
    equal = a->id == b->id && value.GetType() == same.GetType() && value.IsEqual(same);
  }
  return equal && !a && !b;
}

// ---------------------------------------------------------------------------------------------------------------

namespace
{

// What `get` gives of a value, or `missing` for an entry that isn't there.
template <class Value, class Default>
Value ValueOr(const GeData* data, Value (GeData::*get)() const, const Default& missing)
{
  return data ? (data->*get)() : static_cast<Value>(missing);
}

} // namespace

Bool BaseContainer::GetBool(Long id, Bool defaultValue) const
{
  return ValueOr(FindData(id), &GeData::GetBool, defaultValue);
}
Long BaseContainer::GetLong(Long id, Long defaultValue) const
{
  return ValueOr(FindData(id), &GeData::GetLong, defaultValue);
}
LLong BaseContainer::GetLLong(Long id, LLong defaultValue) const
{
  return ValueOr(FindData(id), &GeData::GetLLong, defaultValue);
}
Real BaseContainer::GetReal(Long id, Real defaultValue) const
{
  return ValueOr(FindData(id), &GeData::GetReal, defaultValue);
}
Vector BaseContainer::GetVector(Long id, const Vector& defaultValue) const
{
  return ValueOr(FindData(id), &GeData::GetVector, defaultValue);
}
Matrix BaseContainer::GetMatrix(Long id, const Matrix& defaultValue) const
{
  return ValueOr(FindData(id), &GeData::GetMatrix, defaultValue);
}
BaseTime BaseContainer::GetTime(Long id, const BaseTime& defaultValue) const
{
  return ValueOr(FindData(id), &GeData::GetTime, defaultValue);
}
String BaseContainer::GetString(Long id, const String& defaultValue) const
{
  return ValueOr(FindData(id), &GeData::GetString, defaultValue);
}
Filename BaseContainer::GetFilename(Long id, const Filename& defaultValue) const
{
  return ValueOr(FindData(id), &GeData::GetFilename, defaultValue);
}
void* BaseContainer::GetPointer(Long id, void* defaultValue) const
{
  return ValueOr(FindData(id), &GeData::GetPointer, defaultValue);
}

BaseContainer* BaseContainer::GetContainerInstance(Long id) { return GetData(id).GetContainer(); }

const BaseContainer* BaseContainer::GetContainerInstance(Long id) const { return GetData(id).GetContainer(); }

CustomData* BaseContainer::GetCustomDataType(Long id, Long type) { return GetData(id).GetCustomDataType(type); }

const CustomData* BaseContainer::GetCustomDataType(Long id, Long type) const
{
  return GetData(id).GetCustomDataType(type);
}

} // namespace _torvane_
