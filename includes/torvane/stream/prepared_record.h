// Records that a file holds many times over, alike but for some fields: keys, for one. Their bytes are taken once from
// what the general way writes, with marks where the fields go; so the order of the values stays in the one place that
// tells it. A record is then written by a copy with the fields put in, and read by a comparison of all that isn't a
// field. The first byte that differs sends a reader back to the general way.
#pragma once

#include <atomic>

#include "torvane/types.h"

namespace _torvane_
{

class PrivateChunk;

// A stretch of a record: the bytes from `from` on up to `to`, whole values.
struct RecordPart
{
  LLong from = 0;
  LLong to = 0;
  Long closes = 0; // chunks that began before it and end in it

  LLong GetSize() const { return to - from; }
};

class PreparedRecord
{
 public:
  static constexpr LLong kLargest = 1200; // in bytes
  static constexpr LLong kHeadSize = 9;   // of the chunk start that opens a record

  // Writes `sample`, a node, as a chunk of that label, and reads it back into `copy` to learn what reading takes.
  // False when it doesn't fit and when memory is short.
  Bool Learn(PrivateChunk& sample, PrivateChunk& copy, Long label);
  // The place of the one run of bytes that is equal to `mark`; from its first `head` bytes on they are a field from now
  // on, whose place is given. -1 if they stand there not once, or more than once.
  LLong TakeField(const void* mark, LLong size, LLong head = 0);
  // Four bytes at `place`, a number's, are a field from now on.
  void SetNumberField(LLong place);
  // What is a field in that part of another record is one from `place` on. False if this record holds anything else
  // there.
  Bool TakeFieldsOf(const PreparedRecord& other, const RecordPart& part, LLong place);
  // Where the body of the first chunk of that id begins; -1 without one.
  LLong FindChunk(Long id) const;

  const UChar* GetBytes() const { return bytes_; }
  LLong GetSize() const { return size_; }
  // What is left of a record of which `begun` bytes were read: none, or the start of its chunk.
  RecordPart GetRest(LLong begun) const { return {begun, size_, begun > 0 ? 1 : 0}; }
  // How many values the progress of a file counts in a record, or in a part of it.
  LLong GetWriteTicks() const { return writeTicks_; }
  LLong GetReadTicks(const RecordPart& part) const { return readTicks_[part.to] - readTicks_[part.from]; }

  // True if the bytes at `place` are equal to those of the part but for the fields.
  Bool Matches(const UChar* place, const RecordPart& part) const;
  // How many records in a row may begin at `place`, by their heads.
  LLong CountHeads(const UChar* place, LLong size) const;

  // The general way alone, for all files of the process: for tests that compare the two ways.
  static void SetEnabled(Bool enabled);
  static Bool IsEnabled() { return enabled_.load(std::memory_order_relaxed); }

 private:
  Bool CountReadTicks(const UChar* file, LLong size, LLong header, PrivateChunk& copy);

  inline static std::atomic<Bool> enabled_{true};

  UChar bytes_[kLargest] = {};
  UChar fixed_[kLargest] = {}; // 255 for each byte that is compared
  LLong size_ = 0;
  LLong writeTicks_ = 0;
  UChar readTicks_[kLargest + 1] = {}; // up to each byte
};

} // namespace _torvane_
