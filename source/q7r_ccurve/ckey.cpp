#include "torvane/animation/ckey.h"

#include "k2v_file/stream/chunk_visitor.h"
#include "q7r_ccurve/key_times.h"
#include "q7r_file/nodes/node_tools.h"
#include "torvane/animation/animation_ids.h"
#include "torvane/animation/ccurve.h"

namespace _torvane_
{

namespace
{

// The switches of a key: a parameter and the node bit behind it.
struct KeySwitch
{
  Long parameter;
  Long bit;
};

constexpr KeySwitch kSwitches[] = {{902, 40}, {915, 42}, {917, 44}, {918, 45}, {919, 46}, {921, 48},
                                   {922, 49}, {923, 41}, {925, 38}, {926, 39}, {1234, 54}};

// Bits whose changes carry a mark of their own in the mode.
constexpr Long kMarkedBits[] = {38, 39, 40, 41, 42, 44, 45, 46, 48, 49};
constexpr Long kModeMark = 240;

const KeySwitch* FindSwitch(Long parameter)
{
  for (const KeySwitch& row : kSwitches) {
    if (row.parameter == parameter)
      return &row;
  }
  return nullptr;
}

} // namespace

CKey::CKey() : BaseList2D(kLabelKey) {}

// A list that frees its members has unlinked them.
CKey::~CKey()
{
  if (IsInList())
    CKey::RemoveFromList();
}

CCurve* CKey::GetCurve() const { return listHead_ ? NodeCast<CCurve>(listHead_->GetOwner()) : nullptr; }

void CKey::RemoveFromList()
{
  if (CCurve* curve = GetCurve())
    curve->ForgetKey(*this);
  BaseList2D::RemoveFromList();
}

Bool CKey::SetTime(const BaseTime& time)
{
  if (CCurve* curve = GetCurve())
    return curve->MoveKey(*this, time);
  time_ = time;
  return true;
}

template <>
struct ChunkFields<CKey>
{
  template <class Visitor>
  static Bool VisitBody(CKey& key, Visitor& v)
  {
    v.Time(key.time_);
    v.Time(key.leftTime_);
    v.Time(key.rightTime_);
    v.Real(key.value_);
    v.Real(key.leftValue_);
    v.Real(key.rightValue_);
    v.Long(key.interpolation_);
    if constexpr (Visitor::kReading)
      return v.Note(v.Good() && key.keyData_.Read(v.File()));
    else
      return v.Note(v.Good() && key.keyData_.Write(v.File()));
  }
};

void CKey::WriteChunks(HyperFile& file)
{
  BaseList2D::WriteChunks(file);
  WriteChunk(file, kChunkKey, 0, [this](ChunkWriter& v) { return ChunkFields<CKey>::VisitBody(*this, v); });
}

Bool CKey::ReadChunk(HyperFile& file, Long id, Long level)
{
  if (BaseList2D::ReadChunk(file, id, level))
    return true;
  return id == kChunkKey && level >= 0 &&
         ReadChunkBody(file, level, [this](ChunkReader& v) { return ChunkFields<CKey>::VisitBody(*this, v); });
}

Bool CKey::CopyTo(PrivateChunk& destination, ULong flags, TransArray* translation)
{
  auto* target = NodeCast<CKey>(&destination);
  if (!target)
    return false;
  if (!target->SetTime(time_))
    return false;
  static_cast<KeyShape&>(*target) = *this;
  return target->keyData_.CopyFrom(keyData_, flags, translation) && BaseList2D::CopyTo(destination, flags, translation);
}

GeListNode* CKey::MakeClone(ULong flags, TransArray* translation)
{
  return CloneNode(*this, NewObj<CKey>(), flags, translation);
}

Bool CKey::GetParameter(const ParameterPath& path, GeData& value)
{
  Long id = path[0].id;
  if (const KeySwitch* row = FindSwitch(id)) {
    value = GeData(GetNBit(row->bit) != 0);
    return true;
  }
  switch (id) {
  case kKeyTime:
    value = GeData(time_);
    return value.GetType() == kDataTime;
  case kKeyLeftTime:
    value = GeData(leftTime_);
    return value.GetType() == kDataTime;
  case kKeyRightTime:
    value = GeData(rightTime_);
    return value.GetType() == kDataTime;
  case kKeyLeftValue:
    value = GeData(leftValue_);
    return true;
  case kKeyRightValue:
    value = GeData(rightValue_);
    return true;
  case kKeyInterpolation:
    value = GeData(interpolation_);
    return true;
  default:
    return BaseList2D::GetParameter(path, value);
  }
}

Bool CKey::SetParameter(const ParameterPath& path, const GeData& value)
{
  Long id = path[0].id;
  if (const KeySwitch* row = FindSwitch(id)) {
    ChangeNBit(row->bit, value.GetBool() ? 1 : 2);
    return true;
  }
  switch (id) {
  case kKeyTime:
    return SetTime(value.GetTime());
  case kKeyLeftTime:
    leftTime_ = value.GetTime();
    return true;
  case kKeyRightTime:
    rightTime_ = value.GetTime();
    return true;
  case kKeyLeftValue:
    leftValue_ = value.GetReal();
    return true;
  case kKeyRightValue:
    rightValue_ = value.GetReal();
    return true;
  case kKeyInterpolation:
    interpolation_ = value.GetLong();
    return true;
  default:
    return BaseList2D::SetParameter(path, value);
  }
}

Bool CKey::ChangeNBit(Long bit, Long mode)
{
  for (Long marked : kMarkedBits) {
    if (bit == marked)
      return BaseList2D::ChangeNBit(bit, mode | kModeMark);
  }
  return BaseList2D::ChangeNBit(bit, mode);
}

void CKey::SetValue(CCurve*, Real value)
{
  if (value_ != value)
    value_ = value;
}

void CKey::SetGeData(CCurve*, const GeData& data)
{
  if (keyData_.GetRawType() != data.GetRawType() || !keyData_.IsEqual(data))
    keyData_ = data;
}

void CKey::SetInterpolation(CCurve*, Long type) { interpolation_ = type; }

void CKey::SetLeft(const BaseTime& time, Real value)
{
  leftTime_ = time;
  leftValue_ = value;
}

void CKey::SetRight(const BaseTime& time, Real value)
{
  rightTime_ = time;
  rightValue_ = value;
}

void CKey::Reset()
{
  static_cast<KeyShape&>(*this) = KeyShape();
  keyData_.Free();
}

Bool CKey::IsEqual(const CKey& other) const
{
  return time_ == other.time_ && static_cast<const KeyShape&>(*this) == other && keyData_.IsEqual(other.keyData_);
}

Bool CKey::ToPlain(PlainKey& key) const
{
  if (!IsBare() || keyData_.GetRawType() != kDataNil || nbits_[3] != 0 || !IsKeyTime(time_))
    return false;
  key.row = {time_, value_};
  key.tangents = {leftTime_, rightTime_, leftValue_, rightValue_};
  key.bits = {interpolation_, info_, {nbits_[0], nbits_[1], nbits_[2]}, markerDrawn_ ? 1U : 0U};
  key.marker = markerDrawn_ ? marker_ : NodeMarker();
  return true;
}

void CKey::FromPlain(const PlainKey& key)
{
  const auto& [row, tangents, bits, marker] = key;
  time_ = row.time;
  value_ = row.value;
  interpolation_ = bits.interpolation;
  SetLeft(tangents.leftTime, tangents.leftValue);
  SetRight(tangents.rightTime, tangents.rightValue);
  marker_ = marker;
  markerDrawn_ = bits.markerDrawn != 0;
  info_ = bits.info;
  for (Long i = 0; i < 3; ++i)
    nbits_[i] = bits.nbits[i];
}

} // namespace _torvane_
