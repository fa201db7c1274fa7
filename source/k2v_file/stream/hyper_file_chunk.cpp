// Walking by tags: skipping values and chunks, raw chunks.
#include "k2v_file/stream/value_forms.h"
#include "torvane/stream/hyper_file.h"

namespace _torvane_
{

Bool HyperFile::WriteChunkStart(Long id, Long level)
{
  if (error_ != FILEERROR_NONE)
    return false;
  LLong start = file_.GetPosition();
  UChar raw[StoredSize(kTagChunkStart)];
  UChar* place = TakeRoom(raw, sizeof raw);
  place[0] = kTagChunkStart;
  bytes::PutBig(place + 1, static_cast<ULong>(id));
  bytes::PutBig(place + 5, static_cast<ULong>(level));
  if (!FinishRoom(place, raw, sizeof raw))
    return FailFromFile(start);
  TickWrite();
  return true;
}

Bool HyperFile::WriteChunkEnd()
{
  if (error_ != FILEERROR_NONE)
    return false;
  LLong start = file_.GetPosition();
  UChar raw[1];
  UChar* place = TakeRoom(raw, sizeof raw);
  place[0] = kTagChunkEnd;
  if (!FinishRoom(place, raw, sizeof raw))
    return FailFromFile(start);
  TickWrite();
  return true;
}

Bool HyperFile::ReadChunkStart(Long& id, Long& level)
{
  if (error_ != FILEERROR_NONE)
    return false;
  if (!ReadChunkHead(id, level))
    return false;
  TickRead();
  return true;
}

// The chunk counts as one that encloses what follows once its id and level are known.
Bool HyperFile::ReadChunkHead(Long& id, Long& level)
{
  --chunkDepth_;
  if (const UChar* place = file_.ReadWindow(8)) {
    id = static_cast<Long>(bytes::GetBig<ULong>(place));
    level = static_cast<Long>(bytes::GetBig<ULong>(place + 4));
    file_.CommitRead(8);
  } else if (!ReadPlainLong(id) || !ReadPlainLong(level)) {
    return false;
  }
  ++chunkDepth_;
  if (chunkDepth_ <= 0)
    return true;
  if (chunkDepth_ > chunkRoom_ && !GrowChunks())
    return Fail(FILEERROR_MEMORY, file_.GetPosition());
  chunks_[chunkDepth_ - 1] = {id, level};
  return true;
}

Bool HyperFile::GrowChunks()
{
  constexpr Long kFirst = 32;
  const Long room = chunkDepth_ <= kFirst / 2 ? kFirst : 2 * chunkDepth_;
  void* grown = GeRealloc(chunks_, room * static_cast<LLong>(sizeof(ChunkPlace)));
  if (!grown)
    return false;
  chunks_ = static_cast<ChunkPlace*>(grown);
  for (; chunkRoom_ < room; ++chunkRoom_)
    chunks_[chunkRoom_] = ChunkPlace();
  return true;
}

Bool HyperFile::ReadChunkEndMark()
{
  if (error_ != FILEERROR_NONE)
    return false;
  return mode_ != kHyperFileWrite || Fail(FILEERROR_WRITE, file_.GetPosition());
}

// Moves over `count` bytes; a count past the end is the error of a read that comes short.
Bool HyperFile::Drop(LLong count, LLong position)
{
  if (file_.ReadWindow(count)) {
    file_.CommitRead(count);
    return true;
  }
  LLong remaining = file_.GetRemaining();
  if (remaining >= 0 && count > remaining)
    file_.SetError(FILEERROR_READ);
  else if (file_.Seek(count, kSeekRelative))
    return true;
  return FailFromFile(position);
}

Bool HyperFile::SkipValue(UChar tag)
{
  if (error_ != FILEERROR_NONE)
    return false;
  if (tag == kTagChunkStart) {
    Long id = 0;
    Long level = 0;
    return ReadChunkStart(id, level);
  }
  LLong start = file_.GetPosition() - 1;
  const ValueForm* form = FindSkippedForm(tag);
  if (!form)
    return Fail(FILEERROR_WRONG_VALUE, start);
  LLong left = 0;
  if (!ReadBodySize(*form, left))
    return false;
  if (!Drop(left, start))
    return false;
  TickRead();
  return true;
}

// Reads what tells the length of a body and gives the bytes that are left of it.
Bool HyperFile::ReadBodySize(const ValueForm& form, LLong& left)
{
  const FileForm layout = FormOf(*this);
  const LLong headSize = GetValueHeadSize(form, layout);
  const LLong start = file_.GetPosition();
  UChar spare[kLargestValueHead];
  const UChar* head = headSize > 0 ? TakeBytes(spare, headSize) : nullptr;
  if (headSize > 0 && !head)
    return FailFromFile(start);
  left = GetValueBodySize(form, layout, head) - headSize;
  return left >= 0 || Fail(FILEERROR_WRONG_VALUE, start);
}

Bool HyperFile::SkipToEndChunk()
{
  if (error_ != FILEERROR_NONE)
    return false;
  // Mostly there is nothing to skip.
  const UChar* next = file_.ReadWindow(1);
  if (next && next[0] == kTagChunkEnd) {
    file_.CommitRead(1);
    --chunkDepth_;
    return true;
  }
  LLong depth = 0;
  do {
    UChar tag = 0;
    if (!ReadValueHeader(tag))
      break;
    if (tag == kTagChunkEnd && --depth < 0)
      return true;
    if (tag == kTagChunkStart)
      ++depth;
    if (tag != kTagChunkEnd)
      SkipValue(tag);
  } while (error_ == FILEERROR_NONE && file_.GetPosition() < length_);
  return error_ != FILEERROR_NONE && Fail(FILEERROR_PREMATURE_END, file_.GetPosition());
}

Bool HyperFile::ReadRawChunk(void*& data, LLong& size, Bool withoutEnd)
{
  data = nullptr;
  size = 0;
  if (error_ != FILEERROR_NONE)
    return false;
  LLong start = file_.GetPosition();
  SkipToEndChunk();
  LLong count = file_.GetPosition() - start;
  if (withoutEnd && count > 0)
    --count;
  if (error_ != FILEERROR_NONE)
    return false;
  if (count == 0)
    return true;
  void* block = GeAllocNC(count);
  if (!block)
    return Fail(FILEERROR_MEMORY, start);
  if (!file_.Seek(start) || file_.ReadBytes(block, count) != count || (withoutEnd && !file_.Seek(1, kSeekRelative))) {
    GeFree(block);
    return Fail(FILEERROR_SEEK, start);
  }
  data = block;
  size = count;
  return true;
}

Bool HyperFile::WriteRawChunk(const void* data, LLong size, Bool withoutEnd)
{
  if (error_ != FILEERROR_NONE)
    return false;
  if (!data)
    return withoutEnd || WriteChunkEnd();
  LLong start = file_.GetPosition();
  return file_.WriteBytes(data, size) || FailFromFile(start);
}

} // namespace _torvane_
