// The stream target of BaseFile: what a read-only source of bytes must answer.
#pragma once

#include "torvane/types.h"

namespace _torvane_
{

class FileStream
{
 public:
  // Reads up to `size` bytes and gives how many came; fewer only at the end of the stream, negative on failure.
  virtual LLong Read(void* destination, LLong size) = 0;

  // Moves to `position`, counted from the start. False on failure.
  virtual Bool Seek(LLong position) = 0;

  // The stream's size in bytes. False when it cannot be told.
  virtual Bool Stat(LLong& size) = 0;

 protected:
  ~FileStream() = default;
};

} // namespace _torvane_
