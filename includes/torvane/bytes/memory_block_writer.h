// Memory that grows by whole blocks while bytes are written to its end: what a file written to memory is kept in.
#pragma once

#include "torvane/types.h"

namespace _torvane_
{

// Blocks have 50000 bytes first, then twice the former size up to 2000000; every block but the last is full. Starts
// without a block. One thread at a time.
class MemoryBlockWriter
{
 public:
  MemoryBlockWriter() noexcept = default;
  ~MemoryBlockWriter() { Clear(); }
  MemoryBlockWriter(const MemoryBlockWriter&) = delete;
  MemoryBlockWriter& operator=(const MemoryBlockWriter&) = delete;

  // Frees everything.
  void Clear() noexcept;

  // Appends `size` bytes. False for a negative size and when memory runs out: the bytes that still fitted stay.
  Bool Write(const void* data, LLong size) noexcept;

  Long GetBlockCount() const noexcept { return count_; }
  // The n-th block and the bytes in it; false for a number out of range. The block stays the writer's.
  Bool GetBlock(Long n, const void*& data, LLong& size) const noexcept;
  // The bytes of all blocks.
  LLong GetSize() const noexcept { return size_; }

 private:
  struct Block
  {
    UChar* data;
    LLong capacity;
  };

  Bool AddBlock() noexcept;

  Block* table_ = nullptr;
  Long tableCapacity_ = 0;
  Long count_ = 0;
  LLong lastFill_ = 0; // bytes in the last block
  LLong size_ = 0;
};

} // namespace _torvane_
