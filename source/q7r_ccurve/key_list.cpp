#include "torvane/animation/key_list.h"

#include "q7r_ccurve/key_record.h"
#include "q7r_ccurve/key_times.h"
#include "torvane/stream/hyper_file.h"

namespace _torvane_
{

Bool KeyList::EntersChunk(Long id)
{
  if (!RootCKey::EntersChunk(id))
    return false;
  rows_.Flush();
  return true;
}

Bool KeyList::ReadChunk(HyperFile& file, Long id, Long level)
{
  if (id == kLabelKey)
    return TakeRecords(file) || ReadKey(file);
  if (id != kChunkList)
    return RootCKey::ReadChunk(file, id, level);
  rows_.Flush();
  const Bool read = RootCKey::ReadChunk(file, id, level);
  rows_.Trim();
  return read;
}

// Takes the key whose chunk has begun, and those behind it, as long as they are records of plain keys. False, with
// nothing read, if the first one isn't.
Bool KeyList::TakeRecords(HyperFile& file)
{
  const KeyRecord* record = IsEmpty() ? KeyRecord::Get() : nullptr;
  if (!record)
    return false;
  LLong begun = PreparedRecord::kHeadSize;
  while (const UChar* place = file.NextRecord(record->GetRecord(), record->GetRecord().GetRest(begun))) {
    PlainKey key;
    record->Take(place, begun, key);
    if (!IsKeyTime(key.row.time))
      break;
    if (begun > 0 && !rows_.ReserveMore(file.CountRecords(record->GetRecord(), begun)))
      break;
    if (!rows_.Insert(rows_.GetCount(), key))
      break;
    file.PassRecord(record->GetRecord(), record->GetRecord().GetRest(begun));
    begun = 0;
  }
  return begun == 0;
}

// A key in the general way. It stays a node if it isn't plain or others are nodes already.
Bool KeyList::ReadKey(HyperFile& file)
{
  auto* key = NewObj<CKey>();
  if (!key)
    return false;
  key->SetDocument(GetDocument());
  // The file's sticky error stops whatever follows a key that reads badly; the key itself stays.
  key->ReadChunkLoop(file, true);
  PlainKey plain;
  if (IsEmpty() && key->ToPlain(plain) && rows_.Insert(rows_.GetCount(), plain)) {
    DeleteObj(key);
    return true;
  }
  if (MakeNodes())
    return Append(key, true);
  DeleteObj(key);
  file.SetError(FILEERROR_MEMORY);
  return false;
}

void KeyList::WriteMembers(HyperFile& file)
{
  const KeyRecord* record = GetRowCount() > 0 ? KeyRecord::Get() : nullptr;
  if (!rows_.DrawMarkers()) {
    file.SetError(FILEERROR_MEMORY);
    return;
  }
  for (Long i = 0; i < GetRowCount(); ++i) {
    const PlainKey plain = rows_.Get(i);
    UChar spare[PreparedRecord::kLargest];
    if (UChar* place = record ? file.BeginRecord(record->GetRecord(), spare) : nullptr) {
      record->Put(place, plain);
      file.EndRecord(record->GetRecord(), place, spare);
    } else {
      CKey key;
      key.FromPlain(plain);
      key.WriteAsChunk(file, kLabelKey);
    }
  }
  RootCKey::WriteMembers(file);
}

Bool KeyList::CopyTo(PrivateChunk& destination, ULong flags, TransArray* translation)
{
  if (flags & kCopyNoBranches)
    return true;
  auto* target = NodeCast<KeyList>(&destination);
  if (!target)
    return false;
  target->rows_.Flush();
  return RootCKey::CopyTo(destination, flags, translation) && rows_.CopyTo(target->rows_, flags);
}

Bool KeyList::MakeNodes()
{
  for (Long i = 0; i < GetRowCount(); ++i) {
    auto* key = NewObj<CKey>();
    if (!key) {
      while (BaseList2D* made = GetFirst()) {
        made->Remove();
        DeleteObj(made);
      }
      return false;
    }
    key->FromPlain(rows_.Get(i));
    Append(key, true);
  }
  rows_.Flush();
  return true;
}

} // namespace _torvane_
