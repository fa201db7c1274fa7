// Records that a file holds many times over, alike but for some fields: keys, for one. Their bytes are taken once from
// what the general way writes, with marks where the fields go; so the order of the values stays in the one place that
// tells it. A record is then written by a copy with the fields put in, and read by a comparison of all that isn't a
// field. The first byte that differs sends a reader back to the general way.
#pragma once

#include "torvane/types.h"

namespace _torvane_
{

class PrivateChunk;

class PreparedRecord
{
 public:
  static constexpr LLong kLargest = 480; // bytes: files below 500 tell their progress at every value, which is counted
  static constexpr LLong kHeadSize = 9;  // of the chunk start that opens a record

  // Writes `sample`, a node, as a chunk of that label, and reads it back into `copy` to learn what reading takes.
  // False when it doesn't fit and when memory is short.
  Bool Learn(PrivateChunk& sample, PrivateChunk& copy, Long label);
  // The place of the one run of bytes that is equal to `mark`; they are a field from now on. -1 if they stand there
  // not once, or more than once.
  LLong TakeField(const void* mark, LLong size);

  const UChar* GetBytes() const { return bytes_; }
  LLong GetSize() const { return size_; }
  // How many values the progress of a file counts in a record.
  LLong GetWriteTicks() const { return writeTicks_; }
  LLong GetReadTicks() const { return readTicks_; }

  // True if the bytes of a record behind its first `begun` ones, which start at `place`, are equal to these but for the
  // fields.
  Bool Matches(const UChar* place, LLong begun) const;
  // How many records in a row may begin at `place`, by their heads.
  LLong CountHeads(const UChar* place, LLong size) const;

  // The general way alone, for all files of the process: for tests that compare the two ways.
  static void SetEnabled(Bool enabled);
  static Bool IsEnabled();

 private:
  UChar bytes_[kLargest] = {};
  UChar fixed_[kLargest] = {}; // 255 for each byte that is compared
  LLong size_ = 0;
  LLong writeTicks_ = 0;
  LLong readTicks_ = 0;
};

} // namespace _torvane_
