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
  // What the two parts tell.
  struct Start
  {
    ULong info;
    Long containerId;
  };
  struct Rest
  {
    NodeMarker marker;
    ULong nbits[4];
  };

  // The one of this process; null when memory is short.
  static const NodeRecord* Get();
  // For Get alone.
  Bool Learn();

  // Pass over a part and give what it tells; false, and nothing is read, if something else comes.
  Bool TakeStart(HyperFile& file, Start& start) const;
  Bool TakeRest(HyperFile& file, Rest& rest) const;

 private:
  Bool FindFields(const Start& start, const Rest& rest);

  PreparedRecord record_;
  RecordPart start_;
  RecordPart rest_;
  LLong info_ = 0; // where the fields are, from the begin of their part
  LLong containerId_ = 0;
  LLong marker_ = 0;
  LLong nbits_[4] = {};
};

} // namespace _torvane_
