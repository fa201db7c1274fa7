// A texture tag that says no more than which material it binds, prepared once, see prepared_record.h.
#pragma once

#include "torvane/nodes/base_list.h"
#include "torvane/stream/prepared_record.h"

namespace _torvane_
{

class TextureTagRecord
{
 public:
  // The one of this process; null when memory is short.
  static const TextureTagRecord* Get();
  // For Get alone.
  Bool Learn();

  const PreparedRecord& GetRecord() const { return record_; }
  // The tag's chunk without its start.
  RecordPart GetBody() const { return record_.GetRest(PreparedRecord::kHeadSize); }
  // What a body at `place` tells.
  void Get(const UChar* place, NodeMarker& marker, GeAliasID& material) const;

 private:
  PreparedRecord record_;
  LLong marker_ = 0; // where the fields are, from the begin of the body
  LLong material_ = 0;
};

} // namespace _torvane_
