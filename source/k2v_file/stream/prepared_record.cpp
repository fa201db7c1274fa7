#include "torvane/stream/prepared_record.h"

#include <atomic>
#include <cstring>

#include "k2v_file/stream/write_in_memory.h"
#include "torvane/nodes/private_chunk.h"

namespace _torvane_
{

namespace
{

std::atomic<Bool> gEnabled{true};

// Reads the one chunk of a file in memory into `copy`, and counts the values.
Bool CountReadTicks(const UChar* file, LLong size, PrivateChunk& copy, LLong& ticks)
{
  Filename source;
  source.SetMemoryRead(file, size);
  HyperFile reader;
  UChar tag = 0;
  Long id = 0;
  Long level = 0;
  if (!reader.Open(kSceneIdent, source, kHyperFileRead))
    return false;
  ticks = 0;
  reader.SetReadProgress([](Long, void* count) { ++*static_cast<LLong*>(count); }, &ticks); // at every value
  return reader.ReadValueHeader(tag) && reader.ReadChunkStart(id, level) && copy.ReadChunkLoop(reader, true);
}

} // namespace

void PreparedRecord::SetEnabled(Bool enabled) { gEnabled.store(enabled, std::memory_order_relaxed); }

Bool PreparedRecord::IsEnabled() { return gEnabled.load(std::memory_order_relaxed); }

Bool PreparedRecord::Learn(PrivateChunk& sample, PrivateChunk& copy, Long label)
{
  const auto write = [&](HyperFile& writer) {
    sample.WriteAsChunk(writer, label);
    writeTicks_ = writer.GetTicks();
  };
  return WriteInMemory(write, [&](const UChar* file, LLong fileSize, LLong header) {
    const LLong size = fileSize - header;
    if (size > kLargest || !CountReadTicks(file, fileSize, copy, readTicks_))
      return false;
    size_ = size;
    std::memcpy(bytes_, file + header, static_cast<std::size_t>(size));
    std::memset(fixed_, 255, static_cast<std::size_t>(size));
    return true;
  });
}

LLong PreparedRecord::TakeField(const void* mark, LLong size)
{
  LLong place = -1;
  for (LLong i = 0; i + size <= size_; ++i) {
    if (std::memcmp(bytes_ + i, mark, static_cast<std::size_t>(size)) != 0)
      continue;
    if (place >= 0)
      return -1;
    place = i;
  }
  if (place >= 0)
    std::memset(fixed_ + place, 0, static_cast<std::size_t>(size));
  return place;
}

// Eight bytes at a time; the last eight may overlap those before them.
Bool PreparedRecord::Matches(const UChar* place, LLong begun) const
{
  constexpr LLong kWord = sizeof(ULLong);
  const auto word = [](const UChar* from) {
    ULLong bytes = 0;
    std::memcpy(&bytes, from, sizeof bytes);
    return bytes;
  };
  const LLong count = size_ - begun;
  if (count < kWord)
    return false;
  const auto differs = [&](LLong i) { return (word(place + i) ^ word(bytes_ + begun + i)) & word(fixed_ + begun + i); };
  ULLong different = differs(count - kWord);
  for (LLong i = 0; i + kWord <= count; i += kWord)
    different |= differs(i);
  return different == 0;
}

LLong PreparedRecord::CountHeads(const UChar* place, LLong size) const
{
  LLong count = 0;
  while (size >= size_ && std::memcmp(place, bytes_, kHeadSize) == 0) {
    ++count;
    place += size_;
    size -= size_;
  }
  return count;
}

// ---------------------------------------------------------------------------------------------------------------

// Near the bound of nesting the general way is taken, which tells where it is passed.
Bool HyperFile::TakesRecords(LLong ticks) const
{
  constexpr Long kLevels = 8;
  return error_ == FILEERROR_NONE && PreparedRecord::IsEnabled() && !singlePrecision_ &&
         loopDepth_ + kLevels <= kMaxLoopDepth && (!HasHook() || ticks < GetTicksToDue());
}

UChar* HyperFile::BeginRecord(const PreparedRecord& record, UChar* spare)
{
  if (!TakesRecords(record.GetWriteTicks()))
    return nullptr;
  UChar* place = TakeRoom(spare, record.GetSize());
  std::memcpy(place, record.GetBytes(), static_cast<std::size_t>(record.GetSize()));
  return place;
}

Bool HyperFile::EndRecord(const PreparedRecord& record, const UChar* place, const UChar* spare)
{
  const LLong start = file_.GetPosition();
  if (!FinishRoom(place, spare, record.GetSize()))
    return FailFromFile(start);
  TickMany(record.GetWriteTicks());
  return true;
}

const UChar* HyperFile::NextRecord(const PreparedRecord& record, LLong begun) const
{
  if (version_ < kVersionCurrent || !TakesRecords(record.GetReadTicks()))
    return nullptr;
  const UChar* place = file_.ReadWindow(record.GetSize() - begun);
  return place && record.Matches(place, begun) ? place : nullptr;
}

void HyperFile::PassRecord(const PreparedRecord& record, LLong begun)
{
  file_.CommitRead(record.GetSize() - begun);
  TickMany(record.GetReadTicks() - (begun > 0 ? 1 : 0)); // the chunk start's
}

LLong HyperFile::CountRecords(const PreparedRecord& record, LLong begun) const
{
  const LLong held = file_.GetReadLeft();
  const LLong first = record.GetSize() - begun;
  return held < first ? 0 : 1 + record.CountHeads(file_.ReadWindow(held) + first, held - first);
}

} // namespace _torvane_
