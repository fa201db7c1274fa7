#include "torvane/nodes/kept_chunks.h"

#include "torvane/ids.h"
#include "torvane/stream/hyper_file.h"

namespace _torvane_
{

void KeptChunks::Flush()
{
  while (Chunk* chunk = first_) {
    first_ = chunk->next;
    DeleteObj(chunk);
  }
  last_ = nullptr;
}

KeptChunks::Chunk* KeptChunks::Append(Long id)
{
  Chunk* chunk = NewObj<Chunk>(id);
  if (!chunk)
    return nullptr;
  (last_ ? last_->next : first_) = chunk;
  last_ = chunk;
  return chunk;
}

Bool KeptChunks::Keeps(const HyperFile& file, Long id)
{
  return !IsLibraryChunk(id) && file.GetFileVersion() >= kVersionCurrent;
}

Bool KeptChunks::Read(HyperFile& file, Long id, Long level)
{
  if (!Keeps(file, id))
    return false;
  Chunk* chunk = Append(id);
  if (!chunk) {
    file.SetError(FILEERROR_MEMORY);
    return false;
  }
  return chunk->body.Read(file, level);
}

void KeptChunks::Write(HyperFile& file) const
{
  for (const Chunk* chunk = first_; chunk; chunk = chunk->next) {
    file.WriteChunkStart(chunk->id, chunk->body.GetLevel());
    chunk->body.Write(file);
    file.WriteChunkEnd();
  }
}

Bool KeptChunks::CopyTo(KeptChunks& destination) const
{
  if (&destination == this)
    return true;
  destination.Flush();
  for (const Chunk* chunk = first_; chunk; chunk = chunk->next) {
    Chunk* copy = destination.Append(chunk->id);
    if (!copy || !chunk->body.CopyTo(copy->body)) {
      destination.Flush();
      return false;
    }
  }
  return true;
}

} // namespace _torvane_
