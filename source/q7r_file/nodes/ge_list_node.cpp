#include "k2v_file/stream/chunk_visitor.h"
#include "q7r_file/nodes/node_tools.h"
#include "torvane/memory/assertion.h"
#include "torvane/nodes/private_chunk.h"

namespace _torvane_
{

namespace
{

constexpr Long kWordCount = 4;
constexpr Long kWordBits = 32;
constexpr Long kModeMask = 0xF0; // bits of a mode that carry no order

enum NBitMode : Long
{
  kNBitSet = 1,
  kNBitClear = 2,
  kNBitToggle = 3,
};

} // namespace

template <>
struct ChunkFields<GeListNode>
{
  template <class Visitor>
  static Bool VisitNodeBits(GeListNode& node, Visitor& v)
  {
    Long count = kWordCount;
    v.Long(count);
    for (Long i = 0; i < count && v.Good(); ++i) {
      if (i < kWordCount)
        v.LongInto(node.nbits_[i]);
      else
        v.template Skip<Long>();
    }
    if (v.Level() >= 2) {
      if (!Visitor::kReading && node.GoalIsWrittenElsewhere())
        v.ConstantUChar(0);
      else
        v.Goal(node.goal_);
    }
    return v.Good();
  }
};

Bool GeListNode::ReadChunk(HyperFile& file, Long id, Long level)
{
  if (PrivateChunk::ReadChunk(file, id, level))
    return true;
  if (id != kChunkNodeBits)
    return false;
  return ReadChunkBody(file, level,
                       [this](ChunkReader& v) { return ChunkFields<GeListNode>::VisitNodeBits(*this, v); });
}

void GeListNode::WriteChunks(HyperFile& file)
{
  PrivateChunk::WriteChunks(file);
  WriteChunk(file, kChunkNodeBits, kLevelNodeBits,
             [this](ChunkWriter& v) { return ChunkFields<GeListNode>::VisitNodeBits(*this, v); });
}

Bool GeListNode::CopyTo(PrivateChunk& destination, ULong flags, TransArray* translation)
{
  auto* target = NodeCast<GeListNode>(&destination);
  if (!target)
    return false;
  if (!PrivateChunk::CopyTo(destination, flags, translation))
    return false;
  for (Long i = 0; i < kWordCount; ++i)
    target->nbits_[i] = nbits_[i];
  if ((flags & kCopyNoGoal) || !translation)
    return true;
  return goal_.CopyGoalTo(target->goal_, translation);
}

ULong GeListNode::GetNBit(Long bit) const
{
  if (bit < -kWordCount) {
    ReportAssertion("q7r_file", __LINE__, "a node bit of an impossible number was asked for");
    return 0;
  }
  if (bit < 0)
    return nbits_[-1 - bit];
  Long word = bit / kWordBits < kWordCount ? bit / kWordBits : kWordCount - 1;
  return (nbits_[word] >> (bit % kWordBits)) & 1;
}

Bool GeListNode::ChangeNBit(Long bit, Long mode)
{
  if (bit < 0) {
    ReportAssertion("q7r_file", __LINE__, "a node bit of an impossible number was to be changed");
    return false;
  }
  ULong& word = nbits_[bit / kWordBits < kWordCount ? bit / kWordBits : kWordCount - 1];
  ULong mask = 1U << (bit % kWordBits);
  Bool isSet = (word & mask) != 0;
  switch (mode & ~kModeMask) {
  case kNBitSet:
    word |= mask;
    return !isSet;
  case kNBitClear:
    word &= ~mask;
    return isSet;
  case kNBitToggle:
    word ^= mask;
    return true;
  default:
    return false;
  }
}

void GeListNode::RemoveFromList() { Remove(); }

GeListNode* GeListNode::MakeClone(ULong flags, TransArray* translation)
{
  return CloneNode(*this, MakeEmpty(), flags, translation);
}

} // namespace _torvane_
