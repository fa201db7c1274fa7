#include "torvane/animation/ccurve.h"

#include "k2v_file/memory/count_before.h"
#include "k2v_file/stream/chunk_visitor.h"
#include "q7r_ccurve/key_times.h"
#include "q7r_file/nodes/node_tools.h"
#include "torvane/animation/animation_ids.h"

namespace _torvane_
{

void CCurve::WriteChunks(HyperFile& file)
{
  BaseList2D::WriteChunks(file);
  if (keyRoot_.HasContent())
    keyRoot_.WriteAsChunk(file, kChunkKeys);
}

Bool CCurve::ReadChunk(HyperFile& file, Long id, Long level)
{
  if (BaseList2D::ReadChunk(file, id, level))
    return true;
  if (id != kChunkKeys)
    return false;
  keys_.Reset();
  if (!ReadInnerChunk(file, keyRoot_))
    return false;
  if (!RebuildIndex())
    file.SetError(FILEERROR_MEMORY);
  return file.GetError() == FILEERROR_NONE;
}

Bool CCurve::CopyTo(PrivateChunk& destination, ULong flags, TransArray* translation)
{
  auto* target = NodeCast<CCurve>(&destination);
  if (!target)
    return false;
  target->keys_.Reset();
  return BaseList2D::CopyTo(destination, flags, translation) && keyRoot_.CopyTo(target->keyRoot_, flags, translation) &&
         target->RebuildIndex();
}

// Keys beyond the range of times stay in the list, but not in the index.
Bool CCurve::RebuildIndex() const
{
  keys_.Reset();
  for (auto* key = NodeCast<CKey>(keyRoot_.GetFirst()); key; key = key->GetNext()) {
    if (IsKeyTime(key->GetTime()) && !keys_.Append(key))
      return false;
  }
  return true;
}

// Makes the keys nodes. False, with nothing changed, when memory is short.
Bool CCurve::NeedNodes() const
{
  return !HasRows() || (keys_.Reserve(keyRoot_.GetRowCount()) && keyRoot_.MakeNodes() && RebuildIndex());
}

const BaseTime& CCurve::TimeOf(Long index) const
{
  return HasRows() ? keyRoot_.GetRows()[index].time : NodeAt(index)->GetTime();
}

Real CCurve::ValueOf(Long index) const
{
  return HasRows() ? keyRoot_.GetRows()[index].value : NodeAt(index)->GetValue();
}

const CKey* CCurve::PeekKey(Long index, CKey& scratch) const
{
  if (index < 0 || index >= GetKeyCount())
    return nullptr;
  if (!HasRows())
    return NodeAt(index);
  scratch.FromPlain(keyRoot_.GetRows().Get(index));
  return &scratch;
}

Bool CCurve::GetKeyValues(Long index, KeyValues& values) const
{
  if (index < 0 || index >= GetKeyCount())
    return false;
  if (HasRows()) {
    const KeyRow& row = keyRoot_.GetRows()[index];
    const KeyRowTangents tangents = keyRoot_.GetRows().GetTangents(index);
    const KeyRowBits bits = keyRoot_.GetRows().GetBits(index);
    values = {row.time,           tangents.leftTime,   tangents.rightTime, row.value,
              tangents.leftValue, tangents.rightValue, bits.interpolation, bits.nbits[1]};
  } else {
    const CKey& key = *NodeAt(index);
    values = {key.GetTime(),      key.GetLeftTime(),   key.GetRightTime(),     key.GetValue(),
              key.GetLeftValue(), key.GetRightValue(), key.GetInterpolation(), key.GetNBit(-2)};
  }
  return true;
}

Bool CCurve::SetKeyValues(const KeyValues& values, Long* index)
{
  if (index)
    *index = -1;
  if (!IsKeyTime(values.time))
    return false;
  const Long place = PlaceOf(values.time);
  const Bool isNew = place == GetKeyCount() || !(TimeOf(place) == values.time);
  if (!(keyRoot_.IsEmpty() ? SetRowValues(place, values, isNew) : SetNodeValues(place, values, isNew)))
    return false;
  if (index)
    *index = place;
  return true;
}

Bool CCurve::SetKeyValue(const BaseTime& time, Real value, ULong switches)
{
  KeyRows& rows = keyRoot_.GetRows();
  const Long count = rows.GetCount();
  const Bool isLast = count > 0 && rows[count - 1].time < time; // there is no node then
  if (isLast && IsKeyTime(time))
    return rows.Append({time, value}, {.nbits = {0, switches, 0}});
  KeyValues values;
  values.time = time;
  values.value = value;
  values.switches = switches;
  return SetKeyValues(values);
}

Bool CCurve::SetRowValues(Long place, const KeyValues& values, Bool isNew)
{
  KeyRows& rows = keyRoot_.GetRows();
  PlainKey key = {{values.time, values.value},
                  {values.leftTime, values.rightTime, values.leftValue, values.rightValue},
                  isNew ? KeyRowBits() : rows.GetBits(place),
                  isNew ? NodeMarker() : rows.GetMarker(place)};
  key.bits.interpolation = values.interpolation;
  key.bits.nbits[1] = values.switches;
  if (isNew)
    return rows.Insert(place, key);
  return rows.Set(place, key);
}

Bool CCurve::SetNodeValues(Long place, const KeyValues& values, Bool isNew)
{
  CKey* key = isNew ? NewObj<CKey>() : NodeAt(place);
  if (!key)
    return false;
  key->Reset();
  key->value_ = values.value;
  key->interpolation_ = values.interpolation;
  key->nbits_[1] = values.switches;
  key->SetLeft(values.leftTime, values.leftValue);
  key->SetRight(values.rightTime, values.rightValue);
  key->time_ = values.time;
  if (!isNew || InsertKey(key) == key)
    return true;
  DeleteObj(key);
  return false;
}

CKey* CCurve::AddKey(const BaseTime& time, Long* index)
{
  if (index)
    *index = -1;
  if (!IsKeyTime(time))
    return nullptr;
  auto* key = NewObj<CKey>();
  if (!key)
    return nullptr;
  key->SetTime(time);
  CKey* kept = InsertKey(key, index);
  if (kept != key)
    DeleteObj(key);
  return kept;
}

CKey* CCurve::InsertKey(CKey* key, Long* index)
{
  if (index)
    *index = -1;
  if (!NeedNodes())
    return nullptr;
  Long place = PlaceOf(key->GetTime());
  CKey* present = GetKey(place);
  if (present && present->GetTime() == key->GetTime()) {
    present->Reset();
    if (index)
      *index = place;
    return present;
  }
  if (!keys_.Insert(place, key))
    return nullptr;
  keyRoot_.InsertAfter(key, GetKey(place - 1));
  if (index)
    *index = place;
  return key;
}

// The index of the first key that isn't before `time`. Keys mostly come in order, so the ends are looked at first.
Long CCurve::PlaceOf(const BaseTime& time) const
{
  const Long count = GetKeyCount();
  if (count == 0 || TimeOf(count - 1) < time)
    return count;
  if (TimeOf(0) >= time)
    return 0;
  return CountBefore(count, [&](Long index) { return TimeOf(index) < time; });
}

CKey* CCurve::FindKey(const BaseTime& time, Long* index, Long mode) const
{
  Long place = PlaceOf(time);
  CKey* key = GetKey(place);
  if (!key || !(key->GetTime() == time)) {
    if (mode == kFindBefore)
      key = GetKey(--place);
    else if (mode != kFindAfter)
      key = nullptr;
  }
  if (index)
    *index = key ? place : -1;
  return key;
}

CKey* CCurve::GetKey(Long index) const
{
  return index >= 0 && index < GetKeyCount() && NeedNodes() ? NodeAt(index) : nullptr;
}

Bool CCurve::DelKey(Long index)
{
  if (index < 0 || index >= GetKeyCount())
    return false;
  if (HasRows()) {
    keyRoot_.GetRows().Remove(index);
  } else {
    CKey* key = NodeAt(index);
    DeleteObj(key); // leaves the index
  }
  return true;
}

// Takes a key out of the index: it is about to leave the list. The keys of a damaged file may be out of order.
void CCurve::ForgetKey(const CKey& key)
{
  const Long starts[] = {PlaceOf(key.GetTime()), 0};
  for (Long first : starts) {
    for (Long place = first; GetKey(place); ++place) {
      if (GetKey(place) == &key) {
        keys_.Remove(place);
        return;
      }
    }
  }
}

// The index has room for the key again that it just gave up.
Bool CCurve::MoveKey(CKey& key, const BaseTime& time)
{
  if (!IsKeyTime(time))
    return false;
  if (IsKeyTime(key.time_))
    ForgetKey(key);
  key.time_ = time;
  const Long place = PlaceOf(time);
  return keys_.Insert(place, &key) && keyRoot_.InsertAfter(&key, GetKey(place - 1));
}

} // namespace _torvane_
