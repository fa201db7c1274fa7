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
  // Where an object has the relative position, scale and rotation; the editor and the render mode, whether it is
  // disabled, and the rotation order. The fields go straight to their places: a copy of what was put together a moment
  // ago makes the processor wait.
  struct Fields
  {
    Vector* vectors[3];
    Long* numbers[4];
  };

  // The one of this process; null when memory is short.
  static const TransformRecord* Get();
  // For Get alone.
  Bool Learn();

  const PreparedRecord& GetRecord() const { return record_; }
  // The chunk without its start.
  const RecordPart& GetBody() const { return body_; }
  // Sets what a body at `place` tells.
  void Get(const UChar* place, const Fields& fields) const;

 private:
  Bool FindFields(const Fields& fields);

  PreparedRecord record_;
  RecordPart body_;
  LLong vectors_[3] = {}; // where the fields are, from the begin of the body
  LLong numbers_[4] = {};
};

} // namespace _torvane_
