// The record of a plain key in a file: prepared once, see prepared_record.h.
#pragma once

#include "torvane/animation/key_list.h"
#include "torvane/stream/prepared_record.h"

namespace _torvane_
{

class KeyRecord
{
 public:
  // The one of this process; null when memory is short.
  static const KeyRecord* Get();
  // For Get alone.
  Bool Learn();

  const PreparedRecord& GetRecord() const { return record_; }
  // The fields into the bytes of a record, and out of those behind its first `begun` ones, which hold none.
  void Put(UChar* place, const PlainKey& key) const;
  void Take(const UChar* place, LLong begun, PlainKey& key) const;

 private:
  static constexpr Long kReals = 9;
  static constexpr Long kLongs = 5;

  PreparedRecord record_;
  LLong reals_[kReals] = {}; // where the fields are, in the order of the functions in the source file
  LLong longs_[kLongs] = {};
  LLong marker_ = 0;
};

} // namespace _torvane_
