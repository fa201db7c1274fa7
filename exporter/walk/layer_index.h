// Finds the object that stands for a host layer.
#pragma once

#include <cstdint>
#include <unordered_map>

#include "exporter/host_api/aegp_types.h"
#include "torvane/objects/base_object.h"

namespace exporter
{

inline constexpr _torvane_::Long kNoLayerId = -1;

// The layer id that an object carries; kNoLayerId without one.
_torvane_::Long GetLayerId(const _torvane_::BaseObject& object);

// The rule that every search follows: the first object that carries the id, from `first` on, depth first (an object,
// its children, then the next object). Null when there is none and for kNoLayerId.
_torvane_::BaseObject* FindLayerObject(_torvane_::BaseObject* first, _torvane_::Long layerId);

// Gives the same object as FindLayerObject from the document's first object, without walking the document.
//
// An id that one object carries needs no more than a table. A composition that is used several times repeats its ids,
// and then the search finds the newest copy: objects are made at the top of the document, the layers of one use are
// linked before the next use is walked, and linking moves them only below objects of the same use or below the plane
// that the use stands for. Where this does not hold (an id made twice in one use, or by two compositions; an id of
// which this use has no copy) the index falls back on the search, for good.
class LayerIndex
{
 public:
  // One use of a composition: its creating and its linking pass, nested ones within.
  class Use
  {
   public:
    Use(LayerIndex& index, AEGP_CompH composition)
        : index_(index), outerFirst_(index.firstOfUse_), outerComposition_(index.composition_)
    {
      index_.firstOfUse_ = index_.count_;
      index_.composition_ = composition;
    }
    ~Use()
    {
      index_.firstOfUse_ = outerFirst_;
      index_.composition_ = outerComposition_;
    }
    Use(const Use&) = delete;
    Use& operator=(const Use&) = delete;

   private:
    LayerIndex& index_;
    std::uint64_t outerFirst_;
    AEGP_CompH outerComposition_;
  };

  // True while the newest copy of every id is known to be the first in the document.
  bool IsTrusted() const { return trusted_; }

  // Makes every search a walk: for a document that holds objects which were not entered here.
  void Distrust() { complete_ = false; }

  // Enters an object that stands at the top of the document and carries the id from now on.
  void Add(_torvane_::Long layerId, _torvane_::BaseObject* object);

  // As FindLayerObject(first, layerId), where `first` is the document's first object.
  _torvane_::BaseObject* Find(_torvane_::BaseObject* first, _torvane_::Long layerId);

 private:
  struct Entry
  {
    _torvane_::BaseObject* newest = nullptr;
    AEGP_CompH composition = nullptr;
    std::uint64_t number = 0; // counts all objects entered
    std::uint64_t copies = 0;
  };

  std::unordered_map<_torvane_::Long, Entry> entries_;
  std::uint64_t count_ = 0;
  std::uint64_t firstOfUse_ = 0;
  AEGP_CompH composition_ = nullptr;
  bool complete_ = true; // every object with an id was entered; false when memory for one was short
  bool trusted_ = true;
};

} // namespace exporter
