#include "torvane/animation/key_list.h"
#include "torvane/time/uuid.h"

namespace _torvane_
{

template <class Part>
Bool KeyParts<Part>::Prepare(const Part& part, Long rows, Long capacity)
{
  if (each_.GetCount() > 0)
    return each_.Reserve(capacity);
  if (rows == 0 || IsSame(part, common_))
    return true;
  if (!each_.Reserve(capacity) || !each_.SetCount(rows))
    return false;
  for (Part& each : each_)
    each = common_;
  isNew_ = false;
  return true;
}

template <class Part>
void KeyParts<Part>::Put(Long index, const Part& part)
{
  if (each_.GetCount() > 0)
    each_[index] = part;
}

template <class Part>
void KeyParts<Part>::Insert(Long index, const Part& part, Long rows)
{
  if (rows == 0) {
    common_ = part;
    isNew_ = IsSame(part, Part());
  } else if (each_.GetCount() > 0) {
    static_cast<void>(index == rows ? each_.Append(part) : each_.Insert(index, part)); // there is room
  }
}

template <class Part>
void KeyParts<Part>::Flush()
{
  each_.Flush();
  common_ = Part();
  isNew_ = true;
}

template <class Part>
Bool KeyParts<Part>::CopyTo(KeyParts& destination) const
{
  destination.common_ = common_;
  destination.isNew_ = isNew_;
  return each_.CopyTo(destination.each_);
}

// Room for the parts of a key.
Bool KeyRows::Prepare(const PlainKey& key)
{
  const Long rows = rows_.GetCount();
  const Long capacity = rows_.GetCapacity();
  return tangents_.Prepare(key.tangents, rows, capacity) && bits_.Prepare(key.bits, rows, capacity) &&
         markers_.Prepare(key.marker, rows, capacity);
}

Bool KeyRows::Set(Long index, const PlainKey& key)
{
  if (!Prepare(key))
    return false;
  rows_[index] = key.row;
  tangents_.Put(index, key.tangents);
  bits_.Put(index, key.bits);
  markers_.Put(index, key.marker);
  return true;
}

Bool KeyRows::Insert(Long index, const PlainKey& key)
{
  constexpr Long kFirstRoom = 16;
  const Long rows = rows_.GetCount();
  if (rows == rows_.GetCapacity() && !ReserveMore(rows > kFirstRoom ? rows : kFirstRoom))
    return false;
  if (!Prepare(key))
    return false;
  static_cast<void>(index == rows ? rows_.Append(key.row) : rows_.Insert(index, key.row)); // there is room
  tangents_.Insert(index, key.tangents, rows);
  bits_.Insert(index, key.bits, rows);
  markers_.Insert(index, key.marker, rows);
  return true;
}

// At least as many again as there are: memory that isn't used yet costs less than moving what is large.
Bool KeyRows::ReserveMore(LLong count)
{
  constexpr LLong kMost = 0x7FFFFFFF;
  const LLong present = rows_.GetCount();
  if (present + count <= rows_.GetCapacity())
    return true;
  const LLong wanted = present + (count > present ? count : present);
  if (wanted > kMost)
    return false;
  const Long capacity = static_cast<Long>(wanted);
  return rows_.Reserve(capacity) && tangents_.Reserve(capacity) && bits_.Reserve(capacity) &&
         markers_.Reserve(capacity);
}

Bool KeyRows::DrawMarkers()
{
  for (Long i = 0; i < rows_.GetCount(); ++i) {
    if (bits_.Get(i).markerDrawn != 0)
      continue;
    NodeMarker marker;
    CreateUuid(marker.bytes);
    if (!markers_.Prepare(marker, rows_.GetCount(), rows_.GetCapacity()))
      return false;
    markers_.Put(i, marker);
  }
  bits_.ForEach([](KeyRowBits& bits) { bits.markerDrawn = 1; });
  return true;
}

Bool KeyRows::CopyTo(KeyRows& destination, ULong flags) const
{
  destination.Flush();
  if (!rows_.CopyTo(destination.rows_) || !tangents_.CopyTo(destination.tangents_) ||
      !bits_.CopyTo(destination.bits_)) {
    destination.Flush();
    return false;
  }
  destination.bits_.ForEach([flags](KeyRowBits& bits) {
    bits.markerDrawn = 0; // a copy is never the same node
    if (flags & kCopyNoInfo)
      bits.info = 0;
  });
  return true;
}

void KeyRows::Remove(Long index)
{
  rows_.Remove(index);
  tangents_.Remove(index);
  bits_.Remove(index);
  markers_.Remove(index);
}

void KeyRows::Flush()
{
  rows_.Flush();
  tangents_.Flush();
  bits_.Flush();
  markers_.Flush();
}

void KeyRows::Trim()
{
  rows_.Trim();
  tangents_.Trim();
  bits_.Trim();
  markers_.Trim();
}

} // namespace _torvane_
