// An ordered list of ids and values. Order is that of insertion and is what a file keeps. There is no index: containers
// are small, and every lookup scans from the start.
#pragma once

#include "torvane/memory/memory.h"
#include "torvane/types.h"
#include "torvane/values/ge_data.h"

namespace _torvane_
{

class BaseDocument;
class BaseList2D;
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

  // Appends without searching, so that a second element of the same id can arise. A negative id is stored as -1. The
  // element's value, or null when memory is short.
  GeData* InsertData(Long id, const GeData& value);
  GeData* InsertData(Long id, GeData&& value);
  // Inserts behind the element that holds `after`; at the head when no element does.
  GeData* InsertDataAfter(Long id, const GeData& value, const GeData* after);
  // Sets the first element of that id, or appends. A stored Real stays a Real when a Long comes, and a stored Long
  // stays one when a Real comes, truncated. The element's value, or null when memory is short.
  GeData* SetData(Long id, const GeData& value);
  Bool RemoveData(Long id);     // the first of that id
  Bool RemoveIndex(Long index); // by position

  Long FindIndex(Long id) const; // position of the first of that id, or -1
  Long GetCount() const;
  GeData* GetIndexData(Long index) const; // null out of range
  Long GetIndexId(Long index) const;      // -1 out of range
  const GeData& GetData(Long id) const;   // a nil value when absent
  GeData* FindData(Long id) const;        // null when absent

  // Replaces the destination's id and elements by copies; each element removed and each one added counts as a change
  // there. False when memory is short: the destination is then unchanged.
  Bool CopyTo(BaseContainer& destination, ULong flags, TransArray* translation) const;
  // A new container that the caller owns; null when memory is short.
  BaseContainer* GetClone(ULong flags, TransArray* translation) const;
  // Sets a copy of every element of `source`, which doesn't lie inside of this container. False when memory is short.
  Bool MergeFrom(const BaseContainer& source);

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

  BaseContainer* GetContainerInstance(Long id) const; // null when absent or of another type
  // The target of the link of that id, or null. With a document, a target that belongs to another document gives null.
  BaseList2D* GetLink(Long id, const BaseDocument* document = nullptr) const;
  CustomData* GetCustomDataType(Long id, Long type) const;

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
  // Stands on an element; valid as long as that element.
  class Iterator
  {
    friend class BaseContainer;
    Element* element_ = nullptr;
  };
  // Gives each element's id and value in order; false at the end.
  Bool BrowseFirst(Iterator& iterator, Long& id, GeData*& value) const;
  Bool BrowseNext(Iterator& iterator, Long& id, GeData*& value) const;

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
  struct Block;

  Element* NewElement(Long id);
  Bool AddBlock(Long capacity);
  void Append(Element* element);
  void Unlink(Element* element, Element* previous);
  void Recycle(Element* element);
  GeData* FillNew(Element* element, const GeData& value);
  Element* Find(Long id) const;
  Element* FindAt(Long index) const;
  static Bool Visit(const Iterator& iterator, Long& id, GeData*& value);
  void Swap(BaseContainer& other);
  Bool AppendCopies(const BaseContainer& source, ULong flags, TransArray* translation);
  BaseContainer* EnterGroup(Long id);
  Bool SetComponent(Long id, Long componentId, Real value);
  void FreeElements();
  void DropElements(BaseContainer*& pending);

  Element* head_ = nullptr;
  Element* tail_ = nullptr;
  Element* free_ = nullptr;          // places of removed elements, linked through `next`
  Block* blocks_ = nullptr;          // where the elements lie, the newest first; owned
  BaseContainer* pending_ = nullptr; // the next container in the list of those that wait to be freed
  Long id_;
  UWord dirty_ = 0;
  UWord savedDirty_ = 0;
};

} // namespace _torvane_
