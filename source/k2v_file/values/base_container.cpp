#include "torvane/values/base_container.h"

#include <bit>

#include "k2v_file/values/container_defaults.h"
#include "torvane/memory/assertion.h"

namespace _torvane_
{

namespace
{

constexpr ULLong kSameBits = 8; // Reals whose bit patterns are closer than this count as the same

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

} // namespace _torvane_
