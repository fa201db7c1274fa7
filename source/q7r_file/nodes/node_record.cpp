#include "q7r_file/nodes/node_record.h"

#include <cstring>

#include "k2v_file/stream/learned_once.h"
#include "k2v_file/stream/value_forms.h"

namespace _torvane_
{

namespace
{

// Texts and numbers like no other in a node.
constexpr UniChar kNameMark[] = {0xA1B2, 0xC3D4, 0xE5F6, 0xA7B8};
constexpr ULong kNumberMark = 0x5AC3E200; // with the number of the field in the low byte
constexpr UChar kByteMark = 0xA0;

// A node whose fields can be set.
class MarkedNode : public BaseList2D
{
 public:
  void Set(const NodeRecord::Start& start, const NodeMarker& marker, const NodeRecord::NodeBits& nbits)
  {
    info_ = start.info;
    data_.SetId(start.containerId);
    name_ = String::Constant(kNameMark);
    marker_ = marker;
    markerDrawn_ = true;
    std::memcpy(nbits_, nbits, sizeof nbits_);
  }
};

} // namespace

const NodeRecord* NodeRecord::Get() { return GetLearned<NodeRecord>(); }

Bool NodeRecord::Learn()
{
  const Start start = {kNumberMark, static_cast<Long>(kNumberMark + 1)};
  const NodeBits nbits = {kNumberMark + 2, kNumberMark + 3, kNumberMark + 4, kNumberMark + 5};
  NodeMarker marker;
  for (UChar& byte : marker.bytes)
    byte = static_cast<UChar>(kByteMark + (&byte - marker.bytes));
  MarkedNode sample;
  MarkedNode copy;
  sample.Set(start, marker, nbits);
  return record_.Learn(sample, copy, kObjectGeneric) && FindFields(start, marker, nbits);
}

Bool NodeRecord::FindFields(const Start& start, const NodeMarker& marker, const NodeBits& nbits)
{
  UChar name[sizeof kNameMark];
  for (std::size_t i = 0; i < std::size(kNameMark); ++i)
    bytes::PutBig(name + 2 * i, kNameMark[i]);
  const LLong namePlace = record_.TakeField(name, sizeof name);
  start_ = {record_.FindChunk(kChunkNodeHeader), namePlace - StoredSize(kTagString)};
  rest_ = {namePlace + static_cast<LLong>(sizeof name), record_.GetSize() - StoredSize(kTagChunkEnd), 1};
  Bool found = namePlace >= 0 && start_.from >= 0;
  const auto find = [&](const void* mark, LLong size, const RecordPart& part) {
    const LLong place = record_.TakeField(mark, size);
    found = found && place >= part.from && place + size <= part.to;
    return place - part.from;
  };
  const auto findNumber = [&](ULong mark, const RecordPart& part) {
    UChar number[sizeof mark];
    bytes::PutBig(number, mark);
    return find(number, sizeof number, part);
  };
  info_ = findNumber(start.info, start_);
  containerId_ = findNumber(static_cast<ULong>(start.containerId), start_);
  for (std::size_t i = 0; i < std::size(nbits_); ++i)
    nbits_[i] = findNumber(nbits[i], rest_);
  marker_ = find(marker.bytes, sizeof marker.bytes, rest_);
  return found;
}

NodeRecord::Start NodeRecord::GetStart(const UChar* place) const
{
  return {bytes::GetBig<ULong>(place + info_), static_cast<Long>(bytes::GetBig<ULong>(place + containerId_))};
}

void NodeRecord::GetRest(const UChar* place, NodeMarker& marker, NodeBits& nbits) const
{
  std::memcpy(marker.bytes, place + marker_, sizeof marker.bytes);
  for (std::size_t i = 0; i < std::size(nbits_); ++i)
    nbits[i] = bytes::GetBig<ULong>(place + nbits_[i]);
}

} // namespace _torvane_
