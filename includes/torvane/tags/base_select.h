// A set of element numbers (points, polygons, edges) as ascending runs: small for the ranges that people select.
#pragma once

#include "torvane/memory/memory.h"
#include "torvane/types.h"

namespace _torvane_
{

class BaseFile;
class HyperFile;

inline constexpr Long kChunkSelect = 110011;
inline constexpr Long kLevelSelect = 0;

// All numbers from `first` to `last`.
struct SelectSegment
{
  Long first;
  Long last;
};

// The elements are numbers from 0 on: a negative number is never in the set, and adding one changes nothing. Operations
// that give a Bool give false only when memory is short, unless they say otherwise; the set then is as it was.
//
// A lookup notes where it found its number, IsSelected included: two threads must not look up in one set at once.
class BaseSelect
{
 public:
  BaseSelect() = default;
  ~BaseSelect() { GeFree(segments_); }
  BaseSelect(const BaseSelect&) = delete;
  BaseSelect& operator=(const BaseSelect&) = delete;

  // Each makes a new array of just the size that is needed when the number of segments changes: to fill a set with many
  // scattered numbers use the range operations below or AssignSegments.
  Bool SelectAdd(Long n);
  Bool SelectRemove(Long n);
  Bool SelectToggle(Long n);
  // The set becomes the range, and empty for a `last` below `first`.
  Bool SelectAll(Long first, Long last);
  Bool SelectNone();

  // Adds, takes out and toggles a whole set at once, in time and memory of the segments of both. An empty `other`, or
  // range, changes nothing.
  Bool SelectMerge(const BaseSelect& other);
  Bool SelectDeselect(const BaseSelect& other);
  Bool SelectToggleRange(Long first, Long last);

  // In ascending order of n a lookup takes no search.
  Bool IsSelected(Long n) const
  {
    Long index = -1;
    return FindSegment(n, index);
  }
  // `index` gets the last segment that starts at or before n, -1 if there is none. True if n is in it.
  Bool FindSegment(Long n, Long& index) const;
  LLong SelectedCount() const;

  Long SegmentCount() const { return segmentCount_; }
  // False for an index that is not from 0 to SegmentCount() - 1. Either place may be null.
  Bool GetSegment(Long index, Long* first, Long* last) const;
  // The segments, ascending, with at least one number missing between two of them. Null when the set is empty. Who
  // changes them keeps that order.
  SelectSegment* SegmentArray() { return segments_; }
  const SelectSegment* SegmentArray() const { return segments_; }
  // Makes room for `count` segments; 0 or less empties the set. With a file they are read from it as pairs of numbers
  // in its byte order; segments that overlap or stand in no order are brought into order. Without a file the array, of
  // zeros when its size has changed, is the caller's to fill. False also when the file can't give as many. A failure
  // with a file leaves the set empty.
  Bool AssignSegments(BaseFile* file, Long count);

  // The destination becomes equal to this set; it is empty after a failure.
  Bool CopySelect(BaseSelect& destination) const;
  // A new set, which the caller deletes with DeleteObj, or null.
  BaseSelect* CloneSelect() const;

  // The segment that the next lookup tries first.
  Long GetLastHit() const { return lastHit_; }
  // Raised by every change.
  ULong GetChangeCount() const { return changeCount_; }

  // Writes the set as chunk (kChunkSelect, kLevelSelect).
  void WriteChunks(HyperFile& file);
  // Takes the body of that chunk and its end tag; false for another chunk and a negative level, with nothing read, and
  // after an error. Segments of a file that overlap or stand in no order are brought into order.
  Bool ReadChunk(HyperFile& file, Long id, Long level);

 private:
  using Rule = Bool (*)(Bool here, Bool there);

  Bool Splice(Long index, Long removed, const SelectSegment* added, Long addedCount);
  Bool Combine(const SelectSegment* others, Long otherCount, Rule rule);
  void Replace(SelectSegment* segments, Long count);
  Bool ReadSegments(BaseFile& file, Long count);
  void BringIntoOrder();

  SelectSegment* segments_ = nullptr; // owned; null when empty
  Long segmentCount_ = 0;
  mutable Long lastHit_ = 0;
  ULong changeCount_ = 0;
};

} // namespace _torvane_
