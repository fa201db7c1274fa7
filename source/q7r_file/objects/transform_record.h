// The transform chunk of an object that the editor shows as usual and of which nothing is frozen, prepared once, see
// prepared_record.h.
#pragma once

#include "torvane/math/vector.h"
#include "torvane/stream/prepared_record.h"

namespace _torvane_
{

class HyperFile;

class TransformRecord
{
 public:
  // The vectors: the relative position, scale and rotation. The numbers: the editor and the render mode, whether the
  // object is disabled, and the rotation order.
  struct Fields
  {
    Vector vectors[3];
    Long numbers[4];
  };

  // The one of this process; null when memory is short.
  static const TransformRecord* Get();
  // For Get alone.
  Bool Learn();

  // Passes over the chunk, whose start was read, and gives what it tells; false, and nothing is read, if it is another
  // one.
  Bool Take(HyperFile& file, Fields& fields) const;

 private:
  Bool FindFields(const Fields& fields);

  PreparedRecord record_;
  RecordPart body_;
  LLong vectors_[3] = {}; // where the fields are, from the begin of the body
  LLong numbers_[4] = {};
};

} // namespace _torvane_
