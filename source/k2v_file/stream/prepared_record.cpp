#include "torvane/stream/prepared_record.h"

#include <cstring>

#include "k2v_file/stream/wide_registers.h"
#include "k2v_file/stream/write_in_memory.h"
#include "torvane/nodes/private_chunk.h"

namespace _torvane_
{

namespace
{

// The values that have been read up to each byte behind the header.
struct TickCounter
{
  const HyperFile& file;
  LLong header;
  UChar counts[PreparedRecord::kLargest + 1] = {};

  static void Note(Long, void* counter)
  {
    auto& [file, header, counts] = *static_cast<TickCounter*>(counter);
    ++counts[file.GetPosition() - header];
  }
};

using Row = ULLong __attribute__((vector_size(16)));
using WideRow = ULLong __attribute__((vector_size(32)));

// Notes which bits of a row differ, of the bytes that `fixed` has set.
template <class R>
inline __attribute__((always_inline)) void CompareRow(R& different, LLong from, const UChar* place, const UChar* known,
                                                      const UChar* fixed)
{
  R a;
  R b;
  R mask;
  std::memcpy(&a, place + from, sizeof a);
  std::memcpy(&b, known + from, sizeof b);
  std::memcpy(&mask, fixed + from, sizeof mask);
  different |= (a ^ b) & mask;
}

// True if the bytes that `fixed` has set are the same, a row at a time. The last row may overlap the one before it, so
// there must be enough for one.
template <class R>
inline __attribute__((always_inline)) Bool AreSame(const UChar* place, const UChar* known, const UChar* fixed,
                                                   LLong count)
{
  constexpr LLong kSize = sizeof(R);
  constexpr LLong kRows = 4; // in a round
  LLong i = 0;
  R different = {};
  for (; i + kRows * kSize <= count; i += kRows * kSize) {
    CompareRow(different, i, place, known, fixed);
    CompareRow(different, i + kSize, place, known, fixed);
    CompareRow(different, i + 2 * kSize, place, known, fixed);
    CompareRow(different, i + 3 * kSize, place, known, fixed);
  }
  for (; i + kSize <= count; i += kSize)
    CompareRow(different, i, place, known, fixed);
  CompareRow(different, count - kSize, place, known, fixed);
  ULLong any = 0;
  for (std::size_t part = 0; part < sizeof(R) / sizeof any; ++part)
    any |= different[part];
  return any == 0;
}

WITH_WIDE_REGISTERS Bool AreSameInWideRows(const UChar* place, const UChar* known, const UChar* fixed, LLong count)
{
  return AreSame<WideRow>(place, known, fixed, count);
}

} // namespace

void PreparedRecord::SetEnabled(Bool enabled) { enabled_.store(enabled, std::memory_order_relaxed); }

// Reads the one chunk of a file in memory into `copy`, and counts the values.
Bool PreparedRecord::CountReadTicks(const UChar* file, LLong size, LLong header, PrivateChunk& copy)
{
  Filename source;
  source.SetMemoryRead(file, size);
  HyperFile reader;
  UChar tag = 0;
  Long id = 0;
  Long level = 0;
  if (!reader.Open(kSceneIdent, source, kHyperFileRead))
    return false;
  TickCounter counter{reader, header};
  reader.SetReadProgress(TickCounter::Note, &counter);
  reader.TellEveryValue();
  if (!reader.ReadValueHeader(tag) || !reader.ReadChunkStart(id, level) || !copy.ReadChunkLoop(reader, true))
    return false;
  for (LLong i = 1; i <= size - header; ++i)
    readTicks_[i] = static_cast<UChar>(readTicks_[i - 1] + counter.counts[i]);
  return true;
}

Bool PreparedRecord::Learn(PrivateChunk& sample, PrivateChunk& copy, Long label)
{
  const auto write = [&](HyperFile& writer) {
    sample.WriteAsChunk(writer, label);
    writeTicks_ = writer.GetTicks();
  };
  return WriteInMemory(write, [&](const UChar* file, LLong fileSize, LLong header) {
    const LLong size = fileSize - header;
    if (size > kLargest || !CountReadTicks(file, fileSize, header, copy))
      return false;
    size_ = size;
    std::memcpy(bytes_, file + header, static_cast<std::size_t>(size));
    std::memset(fixed_, 255, static_cast<std::size_t>(size));
    return true;
  });
}

LLong PreparedRecord::TakeField(const void* mark, LLong size, LLong head)
{
  LLong place = -1;
  for (LLong i = 0; i + size <= size_; ++i) {
    if (std::memcmp(bytes_ + i, mark, static_cast<std::size_t>(size)) != 0)
      continue;
    if (place >= 0)
      return -1;
    place = i;
  }
  if (place < 0)
    return -1;
  std::memset(fixed_ + place + head, 0, static_cast<std::size_t>(size - head));
  return place + head;
}

void PreparedRecord::SetNumberField(LLong place) { std::memset(fixed_ + place, 0, sizeof(ULong)); }

Bool PreparedRecord::TakeFieldsOf(const PreparedRecord& other, const RecordPart& part, LLong place)
{
  if (place < 0 || place + part.GetSize() > size_ || !other.Matches(bytes_ + place, part))
    return false;
  std::memcpy(fixed_ + place, other.fixed_ + part.from, static_cast<std::size_t>(part.GetSize()));
  return true;
}

LLong PreparedRecord::FindChunk(Long id) const
{
  UChar head[1 + sizeof(Long)] = {kTagChunkStart};
  bytes::PutBig(head + 1, static_cast<ULong>(id));
  for (LLong i = 0; i + kHeadSize <= size_; ++i) {
    if (std::memcmp(bytes_ + i, head, sizeof head) == 0)
      return i + kHeadSize;
  }
  return -1;
}

Bool PreparedRecord::Matches(const UChar* place, const RecordPart& part) const
{
  const LLong count = part.GetSize();
  const UChar* known = bytes_ + part.from;
  const UChar* fixed = fixed_ + part.from;
  if (count >= static_cast<LLong>(sizeof(WideRow)) && HasWideRegisters())
    return AreSameInWideRows(place, known, fixed, count);
  return count >= static_cast<LLong>(sizeof(Row)) && AreSame<Row>(place, known, fixed, count);
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

Bool HyperFile::MayHoldRecords(LLong ticks) const { return version_ >= kVersionCurrent && TakesRecords(ticks); }

const UChar* HyperFile::NextRecord(const PreparedRecord& record, const RecordPart& part, LLong ahead) const
{
  if (!MayHoldRecords(record.GetReadTicks(part)))
    return nullptr;
  const UChar* place = file_.ReadWindow(ahead + part.GetSize());
  return place && record.Matches(place + ahead, part) ? place + ahead : nullptr;
}

void HyperFile::PassRecord(const PreparedRecord& record, const RecordPart& part)
{
  file_.CommitRead(part.GetSize());
  chunkDepth_ -= part.closes;
  TickMany(record.GetReadTicks(part));
}

LLong HyperFile::CountRecords(const PreparedRecord& record, LLong begun) const
{
  const LLong held = file_.GetReadLeft();
  const LLong first = record.GetSize() - begun;
  return held < first ? 0 : 1 + record.CountHeads(file_.ReadWindow(held) + first, held - first);
}

} // namespace _torvane_
