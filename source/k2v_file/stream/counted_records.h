// Records behind a count in a file.
#pragma once

#include <type_traits>

#include "k2v_file/stream/chunk_visitor.h"

namespace _torvane_
{

// Makes room for one record more in a block that holds `held` of the `count` that are to come: the block grows as they
// come, and in the end is of just their size. Null for the first. False when memory is short; the block stays.
template <class T>
Bool MakeRoomForRecord(T*& block, Long& capacity, Long held, Long count)
{
  static_assert(std::is_trivially_copyable_v<T>, "records move with their block");
  constexpr Long kFirstRecords = 65536;
  constexpr LLong kSize = sizeof(T);
  if (held < capacity)
    return true;
  const Long grown = capacity == 0 ? kFirstRecords : (capacity > count / 2 ? count : 2 * capacity);
  const Long larger = grown < count ? grown : count;
  auto* moved = static_cast<T*>(GeRealloc(block, larger * kSize));
  if (!moved)
    return false;
  block = moved;
  capacity = larger;
  return true;
}

// Reads `count` records into a new block, each by `visit(reader, record)` onto an empty one. A count that the rest of
// the file can't hold, at `bytesEach` bytes a record at least, is an error before anything is allocated. The block
// (null for a count of 0) is the caller's, and `read` tells how many records it holds; after a failure too, the one
// that it fell on included.
template <class T, class Visit>
Bool ReadRecords(ChunkReader& reader, Long count, LLong bytesEach, T*& block, Long& read, Visit&& visit)
{
  block = nullptr;
  read = 0;
  if (!reader.Note(reader.Good() && reader.File().HasRoomFor(count, bytesEach)))
    return false;
  for (Long capacity = 0; read < count;) {
    if (!MakeRoomForRecord(block, capacity, read, count)) {
      reader.File().SetError(FILEERROR_MEMORY);
      return reader.Note(false);
    }
    T& record = block[read++];
    record = T{};
    if (!visit(reader, record))
      return false;
  }
  return true;
}

} // namespace _torvane_
