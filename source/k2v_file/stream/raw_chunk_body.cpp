#include "torvane/stream/raw_chunk_body.h"

#include <cstring>

#include "k2v_file/stream/raw_values.h"
#include "torvane/stream/hyper_file.h"

namespace _torvane_
{

Bool RawChunkBody::IsEqual(const RawChunkBody& other) const
{
  const LLong size = GetSize();
  return GetLevel() == other.GetLevel() && size == other.GetSize() &&
         (size == 0 || std::memcmp(GetData(), other.GetData(), static_cast<std::size_t>(size)) == 0);
}

void RawChunkBody::Free()
{
  if (!content_)
    return;
  GeFree(content_->data);
  GeFree(content_);
}

// Takes bytes over. False when memory is short: they are freed, and there are none.
Bool RawChunkBody::Keep(void* data, LLong size, Long level)
{
  Free();
  if (!data && level == 0)
    return true;
  content_ = static_cast<Content*>(GeAllocNC(sizeof *content_));
  if (content_)
    *content_ = {data, size, level};
  else
    GeFree(data);
  return content_ != nullptr;
}

Bool RawChunkBody::Read(HyperFile& file, Long level)
{
  void* data = nullptr;
  LLong size = 0;
  const Bool read = file.ReadRawChunk(data, size, true) && ModernizeValues(data, size, file);
  if (Keep(data, size, level))
    return read;
  file.SetError(FILEERROR_MEMORY);
  return false;
}

void RawChunkBody::Write(HyperFile& file) const { file.WriteRawChunk(GetData(), GetSize(), true); }

Bool RawChunkBody::CopyTo(RawChunkBody& destination) const
{
  if (&destination == this)
    return true;
  destination.Free();
  const LLong size = GetSize();
  void* copy = size > 0 ? GeAllocNC(size) : nullptr;
  GeCopyMem(copy, GetData(), size);
  const Bool copied = copy || size <= 0;
  return destination.Keep(copy, copied ? size : 0, GetLevel()) && copied;
}

} // namespace _torvane_
