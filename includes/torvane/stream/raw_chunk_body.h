// The content of a chunk that nobody here understands, kept as it stood in the file.
#pragma once

#include "torvane/memory/memory.h"
#include "torvane/types.h"

namespace _torvane_
{

class HyperFile;

// Owns its bytes: values and nested chunks with their tags, without the end tag of the chunk itself. The bytes are
// those of the file, but Reals of a single-precision file are widened: no file is written in that precision, and a body
// that kept it would throw every later value out of step.
class RawChunkBody
{
 public:
  RawChunkBody() = default;
  ~RawChunkBody() { Free(); }
  RawChunkBody(const RawChunkBody&) = delete; // use CopyTo
  RawChunkBody& operator=(const RawChunkBody&) = delete;

  const void* GetData() const { return content_ ? content_->data : nullptr; } // null when there are no bytes
  LLong GetSize() const { return content_ ? content_->size : 0; }
  // The level of the chunk that the bytes came from.
  Long GetLevel() const { return content_ ? content_->level : 0; }

  Bool IsEqual(const RawChunkBody& other) const;

  // Drops the bytes and sets the level to 0.
  void Free();
  // Drops the bytes and sets the level. Without memory that is 0: an AllocationWatch tells.
  void SetEmpty(Long level) { Keep(nullptr, 0, level); }
  // Replaces the content by the rest of the chunk that the stream stands in, whose end tag is consumed.
  Bool Read(HyperFile& file, Long level);
  // Writes the bytes; the caller opens the chunk, with GetLevel, and closes it.
  void Write(HyperFile& file) const;
  // Gives the destination the level and a copy of the bytes. False when memory is short: it then has no bytes.
  Bool CopyTo(RawChunkBody& destination) const;

 private:
  struct Content
  {
    void* data; // owned
    LLong size;
    Long level;
  };
  Bool Keep(void* data, LLong size, Long level);

  Content* content_ = nullptr; // owned; null for no bytes at level 0, as of nearly all nodes
};

} // namespace _torvane_
