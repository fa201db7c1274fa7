#include <cstring>

#include "torvane/animation/key_list.h"

namespace _torvane_
{

namespace
{

// By the bits: what isn't kept must come back as it was.
Bool HasTangents(const KeyRowTangents& tangents)
{
  const KeyRowTangents none;
  return std::memcmp(&tangents, &none, sizeof none) != 0; // NOLINT(bugprone-suspicious-memory-comparison)
}

} // namespace

Bool KeyRows::SetTangents(Long index, const KeyRowTangents& tangents)
{
  if (tangents_.GetCount() == 0) {
    if (!HasTangents(tangents))
      return true;
    if (!tangents_.SetCount(rows_.GetCount()))
      return false;
    for (KeyRowTangents& each : tangents_)
      each = KeyRowTangents();
  }
  tangents_[index] = tangents;
  return true;
}

Bool KeyRows::Insert(Long index, const KeyRow& row, const KeyRowTangents& tangents)
{
  if (!(index == rows_.GetCount() ? rows_.Append(row) : rows_.Insert(index, row)))
    return false;
  if (tangents_.GetCount() > 0 ? tangents_.Insert(index, tangents) : SetTangents(index, tangents))
    return true;
  rows_.Remove(index);
  return false;
}

// At least half as many again as there are, so that many small requests don't move them each time.
Bool KeyRows::ReserveMore(LLong count)
{
  constexpr LLong kMost = 0x7FFFFFFF;
  const LLong present = rows_.GetCount();
  if (present + count <= rows_.GetCapacity())
    return true;
  const LLong wanted = present + (count > present / 2 ? count : present / 2);
  return wanted <= kMost && rows_.Reserve(static_cast<Long>(wanted));
}

Bool KeyRows::CopyTo(KeyRows& destination, ULong flags) const
{
  destination.Flush();
  if (!destination.rows_.Reserve(rows_.GetCount()) || !tangents_.CopyTo(destination.tangents_)) {
    destination.Flush();
    return false;
  }
  for (const KeyRow& row : rows_) {
    KeyRow copy = row;
    copy.markerDrawn = false; // a copy is never the same node
    if (flags & kCopyNoInfo)
      copy.info = 0;
    destination.rows_.Append(copy);
  }
  return true;
}

void KeyRows::Remove(Long index)
{
  rows_.Remove(index);
  if (tangents_.GetCount() > 0)
    tangents_.Remove(index);
}

void KeyRows::Flush()
{
  rows_.Flush();
  tangents_.Flush();
}

} // namespace _torvane_
