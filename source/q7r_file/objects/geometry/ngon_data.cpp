#include "k2v_file/stream/counted_records.h"
#include "k2v_file/stream/value_forms.h"
#include "torvane/objects/point_object_data.h"

namespace _torvane_
{

namespace
{

constexpr LLong kEntrySize = sizeof(NgonEntry);
constexpr LLong kEdgeSize = sizeof(ULong);
constexpr LLong kStoredNumberSize = StoredSize(kTagLong);
static_assert(kStoredNumberSize == 5);

} // namespace

Bool NgonData::SetEdges(Long index, const ULong* edges, Long count)
{
  if (index < 0 || index >= count_ || count < 0)
    return false;
  auto* block = static_cast<ULong*>(GeAllocNC(count * kEdgeSize));
  if (!block && count > 0)
    return false;
  GeCopyMem(block, edges, count * kEdgeSize);
  GeFree(entries_[index].edges);
  entries_[index] = {count, block};
  return true;
}

Bool NgonData::Resize(Long count)
{
  if (count == count_)
    return true;
  if (count <= 0) {
    FreeAll();
    return true;
  }
  auto* entries = static_cast<NgonEntry*>(GeAlloc(count * kEntrySize));
  if (!entries)
    return false;
  GeCopyMem(entries, entries_, (count < count_ ? count : count_) * kEntrySize);
  for (Long i = count; i < count_; ++i)
    GeFree(entries_[i].edges);
  GeFree(entries_);
  entries_ = entries;
  count_ = count;
  return true;
}

void NgonData::FreeAll()
{
  for (Long i = 0; i < count_; ++i)
    GeFree(entries_[i].edges);
  GeFree(entries_);
  count_ = 0;
}

Bool NgonData::CopyTo(NgonData& target) const
{
  if (&target == this)
    return true;
  target.FreeAll();
  Bool copied = target.Resize(count_);
  for (Long i = 0; copied && i < count_; ++i)
    copied = target.SetEdges(i, entries_[i].edges, entries_[i].count);
  if (!copied)
    target.FreeAll();
  return copied;
}

void NgonData::Write(ChunkWriter& writer) const
{
  writer.Long(count_);
  for (Long i = 0; i < count_; ++i) {
    const NgonEntry& entry = entries_[i];
    writer.Long(entry.count);
    for (Long edge = 0; edge < entry.count; ++edge)
      writer.ULong(entry.edges[edge]);
  }
}

Bool NgonData::Read(ChunkReader& reader)
{
  FreeAll();
  Long count = 0;
  reader.Long(count);
  return ReadRecords(reader, count, kStoredNumberSize, entries_, count_, [](ChunkReader& v, NgonEntry& entry) {
    Long edges = 0;
    v.Long(edges);
    return ReadRecords(v, edges, kStoredNumberSize, entry.edges, entry.count,
                       [](ChunkReader& inner, ULong& edge) { return inner.ULong(edge); });
  });
}

} // namespace _torvane_
