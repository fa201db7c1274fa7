// An ordered list of ids and values. Order is that of insertion and is what a file keeps. There is no index: containers
// are small, and every lookup scans from the start.
//
// New nodes of a class share one table of default elements, in static memory. A container has elements of its own in
// place of those that it changes, and takes a copy of all when there are more than a few or when some are added or
// removed. Whatever gives a value that can be changed counts as a change; asking a container that is const does not,
// and what its values lead to (links, containers, custom objects) is to be left as it is.
#pragma once

#include "torvane/memory/memory.h"
#include "torvane/types.h"
#include "torvane/values/ge_data.h"

namespace _torvane_
{

class BaseDocument;
class BaseList2D;
class ContainerIndex;
struct ContainerDefault;
class HyperFile;
class TransArray;

class BaseContainer
{
 public:
  explicit BaseContainer(Long id = -1) : id_(id) {}
  BaseContainer(const BaseContainer& other);
  BaseContainer(BaseContainer&& other) noexcept;
  BaseContainer& operator=(const BaseContainer& other);
  BaseContainer& operator=(BaseContainer&& other) noexcept;
  ~BaseContainer();

  Long GetId() const { return id_; }
  void SetId(Long id) { id_ = id; }

  // Removes all elements; the id stays.
  void Flush();

  // Makes room for so many elements in one block, if there is no room for any. False when memory is short.
  Bool Reserve(Long count) { return blocks_ || count < 1 || AddBlock(count); }
  // Appends without searching, so that a second element of the same id can arise. A negative id is stored as -1. The
  // element's value, or null when memory is short.
  GeData* InsertData(Long id, const GeData& value);
  GeData* InsertData(Long id, GeData&& value);
  // Inserts behind the element that holds `after`; at the head when no element does.
  GeData* InsertDataAfter(Long id, const GeData& value, const GeData* after);
  // Sets the first element of that id, or appends. A stored Real stays a Real when a Long comes, and a stored Long
  // stays one when a Real comes, truncated. The element's value, or null when memory is short.
  GeData* SetData(Long id, const GeData& value);
  // The first of that id, or the one at a position. False when there is none.
  Bool RemoveData(Long id);
  Bool RemoveIndex(Long index);

  Long FindIndex(Long id) const; // position of the first of that id, or -1
  Long GetCount() const;
  Long GetIndexId(Long index) const; // -1 out of range
  // Null out of range, and when a value that can be changed needs memory that there isn't. The same holds below.
  GeData* GetIndexData(Long index);
  const GeData* GetIndexData(Long index) const;
  const GeData& GetData(Long id); // a nil value when absent
  const GeData& GetData(Long id) const;
  GeData* FindData(Long id); // null when absent
  const GeData* FindData(Long id) const;
  // A value that a file is to fill, nil, in the place of a shared one of that id that the container hasn't changed.
  // Null when memory is short, and when too many were changed to do so for one more.
  GeData* ReplaceShared(Long id);

  // Replaces the destination's id and elements by copies; each element removed and each one added counts as a change
  // there. False when memory is short: the destination is then unchanged.
  Bool CopyTo(BaseContainer& destination, ULong flags, TransArray* translation) const;
  // A new container that the caller owns; null when memory is short.
  BaseContainer* GetClone(ULong flags, TransArray* translation) const;
  // Sets every element of `defaults`, a container from DefaultsOf; an empty container shares them. False when memory is
  // short.
  Bool SetDefaults(const BaseContainer& defaults);
  // A table of elements that containers share: container_defaults.h.
  struct Defaults;
  // Makes this new container that of a table, whose rows have different ids. `places` has kDefaultSize bytes for each
  // of the rows, and outlives all containers, as `defaults` does.
  void BuildDefaults(const ContainerDefault* rows, Defaults& defaults, void* places);

  // A getter gives the default only when the id is absent.
  Bool GetBool(Long id, Bool defaultValue = false) const;
  Long GetLong(Long id, Long defaultValue = 0) const;
  LLong GetLLong(Long id, LLong defaultValue = 0) const;
  Real GetReal(Long id, Real defaultValue = 0.0) const;
  Vector GetVector(Long id, const Vector& defaultValue = Vector()) const;
  Matrix GetMatrix(Long id, const Matrix& defaultValue = Matrix()) const;
  BaseTime GetTime(Long id, const BaseTime& defaultValue = BaseTime()) const;
  String GetString(Long id, const String& defaultValue = String()) const;
  Filename GetFilename(Long id, const Filename& defaultValue = Filename()) const;
  void* GetPointer(Long id, void* defaultValue = nullptr) const;

  // Without memory an entry keeps its value, or is left without one: an AllocationWatch tells, and so does the result
  // of SetData.
  void SetBool(Long id, Bool value) { SetData(id, GeData(value)); }
  void SetLong(Long id, Long value) { SetData(id, GeData(value)); }
  void SetLLong(Long id, LLong value) { SetData(id, GeData(value)); }
  void SetReal(Long id, Real value) { SetData(id, GeData(value)); }
  void SetVector(Long id, const Vector& value) { SetData(id, GeData(value)); }
  void SetMatrix(Long id, const Matrix& value) { SetData(id, GeData(value)); }
  void SetTime(Long id, const BaseTime& value) { SetData(id, GeData(value)); }
  void SetString(Long id, const String& value) { SetData(id, GeData(value)); }
  void SetFilename(Long id, const Filename& value) { SetData(id, GeData(value)); }
  void SetPointer(Long id, void* value) { SetData(id, GeData(value)); }
  void SetContainer(Long id, const BaseContainer& value) { SetData(id, GeData(value)); }
  void SetLink(Long id, BaseList2D* target); // null sets an empty link

  BaseContainer* GetContainerInstance(Long id); // null when absent or of another type
  const BaseContainer* GetContainerInstance(Long id) const;
  // The target of the link of that id, or null. With a document, a target that belongs to another document gives null.
  BaseList2D* GetLink(Long id, const BaseDocument* document = nullptr) const;
  CustomData* GetCustomDataType(Long id, Long type);
  const CustomData* GetCustomDataType(Long id, Long type) const;

  // Same id, same elements in the same order.
  Bool IsEqual(const BaseContainer& other) const;

 private:
  struct Element
  {
    Element* next;
    Long id;
    GeData value;
  };

 public:
  // The room that BuildDefaults takes for an element and its payload.
  static constexpr std::size_t kDefaultSize = sizeof(Element) + sizeof(Vector);

  // Stands on an element; valid as long as that element.
  class Iterator
  {
    friend class BaseContainer;
    const Element* place_ = nullptr; // of a shared element also where one of the container's own is shown
  };
  // Gives each element's id and value in order; false at the end.
  Bool BrowseFirst(Iterator& iterator, Long& id, const GeData*& value) const;
  Bool BrowseNext(Iterator& iterator, Long& id, const GeData*& value) const;

  // The change counter, 16 bits wide.
  UWord GetDirty() const { return dirty_; }
  void MarkDirty() { ++dirty_; }
  void SaveDirty() { savedDirty_ = dirty_; }
  Bool IsDirty() const { return dirty_ != savedDirty_; }

  // A parameter by its path: nested containers are stepped into through levels of kDataGroup, a component of a Vector
  // is selected through a level of kDataVector. Setting creates missing nested containers.
  Bool GetParameter(const ParameterPath& path, GeData& value) const;
  Bool SetParameter(const ParameterPath& path, const GeData& value);

 private:
  friend class ContainerIndex; // finds elements by id while a file is read
  friend class HyperFile;      // compares and writes shared elements as bytes

  struct Block;

  // The elements in order: the container's own, or the shared ones, for which Shown gives what takes their place.
  const Element* GetFirstPlace() const;
  const Element* Shown(const Element* place) const
  {
    const Element* own = defaults_ ? FindOwn(place->id) : nullptr;
    return own ? own : place;
  }
  Element* FindOwn(Long id) const;
  Element* NewOwn(Long id);
  Element* NewElement(Long id) { return TakeCopy() ? NewOwn(id) : nullptr; }
  Bool TakesChange() const;
  Bool AddBlock(Long capacity);
  void Link(Element* element);
  void Append(Element* element)
  {
    Link(element);
    ++dirty_;
  }
  void Unlink(Element* element, Element* previous);
  void Recycle(Element* element);
  GeData* FillNew(Element* element, const GeData& value);
  const Element* Find(Long id) const;
  const Element* FindAt(Long index) const;
  static void BuildDefault(GeData& value, const ContainerDefault& row, void* payload);
  void Swap(BaseContainer& other);
  void Share(const Defaults& defaults);
  Bool IsShared() const { return defaults_ != nullptr; }
  Bool TakeCopy() { return !IsShared() || TakeFirst(GetCount()); }
  Bool TakeFirst(Long count);
  GeData* Change(const Element* element);
  Bool Visit(const Iterator& iterator, Long& id, const GeData*& value) const;
  Bool AppendCopies(const BaseContainer& source, ULong flags, TransArray* translation);
  BaseContainer* EnterGroup(Long id);
  Bool SetComponent(Long id, Long componentId, Real value);
  void FreeElements();
  void DropElements(BaseContainer*& pending);

  Element* head_ = nullptr; // of the container's own elements; where it shares others, in no order
  Element* tail_ = nullptr;
  Block* blocks_ = nullptr; // where they lie, the newest first; owned
  // NOLINTBEGIN(readability-identifier-naming): private, although members of an unnamed union
  union
  {
    const Defaults* defaults_ = nullptr; // the elements that it shares
    BaseContainer* pending_;             // of a container that waits to be freed: the next one that does
  };
  // NOLINTEND(readability-identifier-naming)
  Long id_;
  UWord dirty_ = 0;
  UWord savedDirty_ = 0;
};

} // namespace _torvane_
