// Small things that the node classes share.
#pragma once

#include "k2v_file/values/vector_component.h"
#include "torvane/nodes/private_chunk.h"
#include "torvane/stream/hyper_file.h"
#include "torvane/values/ge_data.h"

namespace _torvane_
{

// Copies `source` into `clone`, a new node of its class. A failed copy deletes the clone and gives null; so does a
// clone that could not be made.
template <class Node>
Node* CloneNode(PrivateChunk& source, Node* clone, ULong flags, TransArray* translation)
{
  if (clone && !source.CopyWithTranslation(*clone, flags, translation))
    DeleteObj(clone);
  return clone;
}

// A Vector parameter as a whole, or one component by the path's second level. A component of another number does
// nothing. False only when memory is too short for the value.
Bool GetVectorParameter(const Vector& vector, const ParameterPath& path, GeData& value);
Bool SetVectorParameter(Vector& vector, const ParameterPath& path, const GeData& value);

// Reads what a chunk holds for `inner`: nothing (an end tag alone) or one chunk, which is handed to its ReadChunk; then
// passes over the rest. Any other value there is FILEERROR_WRONG_VALUE.
template <class Inner>
Bool ReadInnerChunk(HyperFile& file, Inner& inner)
{
  UChar tag = 0;
  if (!file.ReadValueHeader(tag))
    return false;
  if (tag == kTagChunkEnd)
    return true;
  if (tag != kTagChunkStart) {
    file.SetError(FILEERROR_WRONG_VALUE);
    return false;
  }
  Long id = 0;
  Long level = 0;
  if (!file.ReadChunkStart(id, level))
    return false;
  // What nobody takes is passed over with the rest of the inner chunk.
  if (!inner.ReadChunk(file, id, level) && !file.SkipToEndChunk())
    return false;
  return file.SkipToEndChunk();
}

} // namespace _torvane_
