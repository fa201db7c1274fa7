// What is alike in nearly all nodes of a file, prepared once, see prepared_record.h: the start of a node header without
// parameters and links, and what stands behind the name in a node header, with the chunk of node bits that follows.
#pragma once

#include "torvane/nodes/base_list.h"
#include "torvane/stream/prepared_record.h"

namespace _torvane_
{

class NodeRecord
{
 public:
  // What the first part tells.
  struct Start
  {
    ULong info;
    Long containerId;
  };
  using NodeBits = ULong[4];

  // The one of this process; null when memory is short.
  static const NodeRecord* Get();
  // For Get alone.
  Bool Learn();

  const PreparedRecord& GetRecord() const { return record_; }
  // What stands in front of the name, from the begin of the header's body, and what stands behind it.
  const RecordPart& GetStartPart() const { return start_; }
  const RecordPart& GetRestPart() const { return rest_; }
  // As much of the start as holds its fields.
  RecordPart GetFieldsPart() const { return {start_.from, start_.from + containerId_ + LLong{sizeof(Long)}}; }
  // What a part at `place` tells. The rest goes straight to where it belongs: a copy of fields put together a moment
  // ago makes the processor wait.
  Start GetStart(const UChar* place) const;
  void GetRest(const UChar* place, NodeMarker& marker, NodeBits& nbits) const;

 private:
  Bool FindFields(const Start& start, const NodeMarker& marker, const NodeBits& nbits);

  PreparedRecord record_;
  RecordPart start_;
  RecordPart rest_;
  LLong info_ = 0; // where the fields are, from the begin of their part
  LLong containerId_ = 0;
  LLong marker_ = 0;
  LLong nbits_[4] = {};
};

} // namespace _torvane_
