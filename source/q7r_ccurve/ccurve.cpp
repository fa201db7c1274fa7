#include "torvane/animation/ccurve.h"

#include "k2v_file/stream/chunk_visitor.h"
#include "q7r_file/nodes/node_tools.h"
#include "torvane/animation/animation_ids.h"

namespace _torvane_
{

namespace
{

constexpr Real kKeyTimeLimit = 10000.0; // seconds, either way

Bool IsKeyTime(const BaseTime& time)
{
  return time.Compare(BaseTime::Raw(-kKeyTimeLimit, 1.0)) >= 0 && time.Compare(BaseTime::Raw(kKeyTimeLimit, 1.0)) <= 0;
}

} // namespace

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
Bool CCurve::RebuildIndex()
{
  keys_.Reset();
  for (auto* key = NodeCast<CKey>(keyRoot_.GetFirst()); key; key = key->GetNext()) {
    if (IsKeyTime(key->GetTime()) && !keys_.Append(key))
      return false;
  }
  return true;
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
  Long place = PlaceOf(key->GetTime());
  CKey* present = GetKey(place);
  if (present && present->GetTime() == key->GetTime()) {
    present->Reset();
    if (index)
      *index = place;
    return present;
  }
  if (!keys_.Insert(place, key)) {
    if (index)
      *index = -1;
    return nullptr;
  }
  keyRoot_.InsertAfter(key, GetKey(place - 1));
  if (index)
    *index = place;
  return key;
}

// The index of the first key that isn't before `time`. Keys mostly come in order, so the ends are looked at first.
Long CCurve::PlaceOf(const BaseTime& time) const
{
  Long low = 0;
  Long high = keys_.GetCount();
  if (high == 0 || GetKey(high - 1)->GetTime() < time)
    return high;
  if (GetKey(0)->GetTime() >= time)
    return 0;
  while (low < high) {
    Long middle = low + (high - low) / 2;
    if (GetKey(middle)->GetTime() < time)
      low = middle + 1;
    else
      high = middle;
  }
  return low;
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
  return index >= 0 && index < keys_.GetCount() ? static_cast<CKey*>(keys_[index]) : nullptr;
}

Bool CCurve::DelKey(Long index)
{
  CKey* key = GetKey(index);
  if (!key)
    return false;
  DeleteObj(key); // leaves the index
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
