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

  // Passes over the rest of a tag's chunk, whose start was read, and gives what it tells; false, and nothing is read,
  // if it tells more.
  Bool Take(HyperFile& file, NodeMarker& marker, GeAliasID& material) const;

 private:
  PreparedRecord record_;
  LLong marker_ = 0; // where the fields are, from the begin of the record
  LLong material_ = 0;
};

} // namespace _torvane_
