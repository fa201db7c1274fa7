#include <bit>
#include <iterator>

#include "torvane/animation/key_list.h"

namespace _torvane_
{

namespace
{

// Whether it is anything else than a new part: by the bits, since what isn't kept must come back as it was.
template <class Part>
Bool HasContent(const Part& part)
{
  struct Words
  {
    ULong each[sizeof(Part) / sizeof(ULong)];
  };
  static_assert(sizeof(Words) == sizeof(Part));
  constexpr Words kNone = std::bit_cast<Words>(Part());
  const auto words = std::bit_cast<Words>(part);
  ULong difference = 0;
  for (std::size_t i = 0; i < std::size(words.each); ++i)
    difference |= words.each[i] ^ kNone.each[i];
  return difference != 0;
}

} // namespace

// Makes the parts of all rows if this one needs room. False when memory is short.
template <class Part>
Bool KeyRows::Need(GeTempDynArray<Part>& parts, const Part& part)
{
  if (parts.GetCount() > 0 || rows_.GetCount() == 0 || !HasContent(part))
    return true;
  if (!parts.Reserve(rows_.GetCapacity()) || !parts.SetCount(rows_.GetCount()))
    return false;
  for (Part& each : parts)
    each = Part();
  return true;
}

Bool KeyRows::Set(Long index, const PlainKey& key)
{
  if (!Need(tangents_, key.tangents) || !Need(nodes_, key.node))
    return false;
  rows_[index] = key.row;
  if (tangents_.GetCount() > 0)
    tangents_[index] = key.tangents;
  if (nodes_.GetCount() > 0)
    nodes_[index] = key.node;
  return true;
}

Bool KeyRows::Insert(Long index, const PlainKey& key)
{
  if (!(index == rows_.GetCount() ? rows_.Append(key.row) : rows_.Insert(index, key.row)))
    return false;
  const Long count = rows_.GetCount();
  // Parts that other rows have get one more; parts that only this row has are made for all.
  if ((tangents_.GetCount() == 0 || tangents_.Insert(index, key.tangents)) &&
      (nodes_.GetCount() == 0 || nodes_.Insert(index, key.node)) && Set(index, key))
    return true;
  if (tangents_.GetCount() == count)
    tangents_.Remove(index);
  if (nodes_.GetCount() == count)
    nodes_.Remove(index);
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
  return wanted <= kMost && rows_.Reserve(static_cast<Long>(wanted)) &&
         (nodes_.GetCount() == 0 || nodes_.Reserve(static_cast<Long>(wanted)));
}

Bool KeyRows::CopyTo(KeyRows& destination, ULong flags) const
{
  destination.Flush();
  if (!rows_.CopyTo(destination.rows_) || !tangents_.CopyTo(destination.tangents_) ||
      !nodes_.CopyTo(destination.nodes_)) {
    destination.Flush();
    return false;
  }
  for (KeyRowNode& node : destination.nodes_) {
    node.marker = NodeMarker(); // a copy is never the same node
    node.markerDrawn = 0;
    if (flags & kCopyNoInfo)
      node.info = 0;
  }
  return true;
}

void KeyRows::Remove(Long index)
{
  rows_.Remove(index);
  if (tangents_.GetCount() > 0)
    tangents_.Remove(index);
  if (nodes_.GetCount() > 0)
    nodes_.Remove(index);
}

void KeyRows::Flush()
{
  rows_.Flush();
  tangents_.Flush();
  nodes_.Flush();
}

void KeyRows::Trim()
{
  rows_.Trim();
  tangents_.Trim();
  nodes_.Trim();
}

} // namespace _torvane_
