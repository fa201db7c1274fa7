// Chunks of other programs that stand among a node's own.
#pragma once

#include "torvane/memory/memory.h"
#include "torvane/stream/raw_chunk_body.h"
#include "torvane/types.h"

namespace _torvane_
{

// A list of chunks, in the order in which they were read.
class KeptChunks
{
 public:
  KeptChunks() = default;
  ~KeptChunks() { Flush(); }
  KeptChunks(const KeptChunks&) = delete; // use CopyTo
  KeptChunks& operator=(const KeptChunks&) = delete;

  struct Chunk
  {
    explicit Chunk(Long chunkId) : id(chunkId) {}

    Long id;
    RawChunkBody body;
    Chunk* next = nullptr;
  };

  Bool IsEmpty() const { return !first_; }
  // The chunks one by one; null when nothing is kept.
  const Chunk* GetFirst() const { return first_; }
  void Flush();
  // False for a chunk of this library's own numbers, since whoever refused it had a reason, and in older files, whose
  // values may have other forms.
  static Bool Keeps(const HyperFile& file, Long id);
  // Adds the chunk whose start was just read and consumes it with its end. False on an error of the file, which is
  // FILEERROR_MEMORY when memory is short. False, and nothing is read, for a chunk that isn't kept.
  Bool Read(HyperFile& file, Long id, Long level);
  void Write(HyperFile& file) const;
  // Replaces what the destination has. False when memory is short: the destination is then empty.
  Bool CopyTo(KeptChunks& destination) const;

 private:
  Chunk* Append(Long id);

  Chunk* first_ = nullptr; // owned
  Chunk* last_ = nullptr;
};

} // namespace _torvane_
