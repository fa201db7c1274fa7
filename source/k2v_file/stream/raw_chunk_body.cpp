#include "torvane/stream/raw_chunk_body.h"

#include <cstring>

#include "k2v_file/stream/raw_values.h"
#include "torvane/stream/hyper_file.h"

namespace _torvane_
{

Bool RawChunkBody::IsEqual(const RawChunkBody& other) const
{
  return level_ == other.level_ && size_ == other.size_ &&
         (size_ == 0 || std::memcmp(data_, other.data_, static_cast<std::size_t>(size_)) == 0);
}

void RawChunkBody::Free()
{
  GeFree(data_);
  size_ = 0;
  level_ = 0;
}

Bool RawChunkBody::Read(HyperFile& file, Long level)
{
  Free();
  level_ = level;
  return file.ReadRawChunk(data_, size_, true) && ModernizeValues(data_, size_, file);
}

void RawChunkBody::Write(HyperFile& file) const { file.WriteRawChunk(data_, size_, true); }

Bool RawChunkBody::CopyTo(RawChunkBody& destination) const
{
  if (&destination == this)
    return true;
  destination.Free();
  destination.level_ = level_;
  if (size_ <= 0)
    return true;
  destination.data_ = GeAllocNC(size_);
  if (!destination.data_)
    return false;
  GeCopyMem(destination.data_, data_, size_);
  destination.size_ = size_;
  return true;
}

} // namespace _torvane_
