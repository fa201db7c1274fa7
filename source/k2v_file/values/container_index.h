// The elements of a container by their ids, while a file is read into it: a container itself is scanned for every id.
#pragma once

#include "torvane/values/base_container.h"

namespace _torvane_
{

// Whoever has one of these changes the container through it alone. The index is made at the first search.
class ContainerIndex
{
 public:
  // `steps` counts the places that are looked at, for tests of the work that a file costs. Both outlive the index.
  ContainerIndex(BaseContainer& container, LLong& steps) : container_(container), steps_(steps) {}
  ~ContainerIndex();
  ContainerIndex(const ContainerIndex&) = delete;
  ContainerIndex& operator=(const ContainerIndex&) = delete;

  BaseContainer& GetContainer() { return container_; }
  // All of these give null when memory is short.
  // A new element at the end, empty.
  GeData* Append(Long id);
  // The first element of that id, emptied, or a new one.
  GeData* Set(Long id);
  // The index of the container that the first element of that id holds. Where it holds none, `flush` tells whether a
  // container is appended or takes the element's place. The index lasts as long as this one and the element.
  ContainerIndex* Enter(Long id, Bool flush);

 private:
  struct Slot
  {
    GeData* value;          // null in a free slot
    ContainerIndex* nested; // owned; null until the element's container is entered
    Long id;
  };

  Bool Build();
  Bool Grow(Long capacity);
  // The slot of that id, or the free one where it belongs. There is one.
  Slot& Probe(Long id);
  Slot* Find(Long id);
  Bool Note(Long id, GeData* value);

  BaseContainer& container_;
  LLong& steps_;
  Slot* slots_ = nullptr; // owned; null until the first search
  Long capacity_ = 0;     // a power of two
  Long used_ = 0;
  ContainerIndex* others_ = nullptr; // owned: of containers that aren't the first elements of their ids
  ContainerIndex* sibling_ = nullptr;
};

} // namespace _torvane_
