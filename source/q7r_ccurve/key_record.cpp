#include "q7r_ccurve/key_record.h"

#include <cstring>

#include "k2v_file/stream/learned_once.h"
#include "torvane/bytes/base_file.h"

namespace _torvane_
{

namespace
{

// Numbers like no other in a record, with the number of the field in the low byte.
constexpr ULLong kRealMark = 0x4012345678ABCD00;
constexpr ULong kLongMark = 0x5AC3E100;
constexpr UChar kMarkerMark = 0xA0;

} // namespace

void KeyRecord::Put(UChar* place, const PlainKey& key) const
{
  const auto& [row, tangents, bits, marker] = key;
  const Real reals[kReals] = {row.time.GetNumerator(),
                              row.time.GetDenominator(),
                              tangents.leftTime.GetNumerator(),
                              tangents.leftTime.GetDenominator(),
                              tangents.rightTime.GetNumerator(),
                              tangents.rightTime.GetDenominator(),
                              row.value,
                              tangents.leftValue,
                              tangents.rightValue};
  const ULong longs[kLongs] = {static_cast<ULong>(bits.interpolation), bits.info, bits.nbits[0], bits.nbits[1],
                               bits.nbits[2]};
  for (Long i = 0; i < kReals; ++i)
    bytes::PutBig(place + reals_[i], bytes::CleanBits(reals[i]));
  for (Long i = 0; i < kLongs; ++i)
    bytes::PutBig(place + longs_[i], longs[i]);
  std::memcpy(place + marker_, marker.bytes, sizeof marker.bytes);
}

void KeyRecord::Take(const UChar* place, LLong begun, PlainKey& key) const
{
  Real reals[kReals];
  ULong longs[kLongs];
  for (Long i = 0; i < kReals; ++i)
    reals[i] = bytes::CleanReal(bytes::GetBig<ULLong>(place + (reals_[i] - begun)));
  for (Long i = 0; i < kLongs; ++i)
    longs[i] = bytes::GetBig<ULong>(place + (longs_[i] - begun));
  auto& [row, tangents, bits, marker] = key;
  row = {BaseTime::Raw(reals[0], reals[1]), reals[6]};
  tangents = {BaseTime::Raw(reals[2], reals[3]), BaseTime::Raw(reals[4], reals[5]), reals[7], reals[8]};
  bits = {static_cast<Long>(longs[0]), longs[1], {longs[2], longs[3], longs[4]}, 1};
  std::memcpy(marker.bytes, place + (marker_ - begun), sizeof marker.bytes);
}

// A key with a mark in each field, written in the general way.
Bool KeyRecord::Learn()
{
  UChar bytes[PreparedRecord::kLargest] = {};
  NodeMarker marker;
  for (Long i = 0; i < kReals; ++i) {
    reals_[i] = i * static_cast<LLong>(sizeof(ULLong));
    bytes::PutBig(bytes + reals_[i], kRealMark + static_cast<ULLong>(i));
  }
  for (Long i = 0; i < kLongs; ++i) {
    longs_[i] = (kReals + i) * static_cast<LLong>(sizeof(ULLong));
    bytes::PutBig(bytes + longs_[i], kLongMark + static_cast<ULong>(i));
  }
  marker_ = (kReals + kLongs) * static_cast<LLong>(sizeof(ULLong));
  for (UChar& byte : marker.bytes)
    byte = static_cast<UChar>(kMarkerMark + (&byte - marker.bytes));
  std::memcpy(bytes + marker_, marker.bytes, sizeof marker.bytes);

  PlainKey key;
  Take(bytes, 0, key);
  CKey sample;
  CKey copy;
  sample.FromPlain(key);
  if (!record_.Learn(sample, copy, kLabelKey))
    return false;
  Bool found = true;
  auto find = [&](LLong& place, LLong size) {
    place = record_.TakeField(bytes + place, size);
    found = found && place >= 0;
  };
  for (LLong& place : reals_)
    find(place, sizeof(ULLong));
  for (LLong& place : longs_)
    find(place, sizeof(ULong));
  find(marker_, sizeof marker.bytes);
  return found;
}

const KeyRecord* KeyRecord::Get() { return GetLearned<KeyRecord>(); }

} // namespace _torvane_
