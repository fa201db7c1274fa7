// The joints of a weight tag in a file.
#include "k2v_file/stream/chunk_visitor.h"
#include "k2v_file/stream/value_forms.h"
#include "torvane/math/ge_math.h"
#include "torvane/tags/weight_tag_data.h"

namespace _torvane_
{

namespace
{

// The least that a file holds for one of them: Reals in 4 bytes, lists empty, and so links, which are memory blocks: a
// tag and a length, as many bytes as a ULong.
constexpr LLong kLeastLinkSize = LeastStoredSize(kTagULong);
constexpr LLong kLeastEntrySize = LeastStoredSize(kTagULong) + kLeastLinkSize + LeastStoredSize(kTagLong);
constexpr LLong kLeastListSize = LeastStoredSize(kTagLong, kTagLong, kTagLong, kTagLong, kTagLong);
constexpr LLong kLeastJointSize =
    kLeastLinkSize + LeastStoredSize(kTagMatrix, kTagReal, kTagLong, kTagLong, kTagLong) + kLeastListSize + // weights
    LeastStoredSize(kTagLong) + kLeastListSize + LeastStoredSize(kTagLong); // flags, pairs, the count of entries
static_assert(kLeastEntrySize == 15 && kLeastListSize == 25 && kLeastJointSize == 134);

// The levels of the data from which files hold more, or hold it elsewhere.
constexpr Long kLevelGlobalMatrix = 1; // and a number in front of each joint
constexpr Long kLevelRestMatrix = 4;   // among a joint's values, at this level alone
constexpr Long kLevelRestChunks = 5;
constexpr Long kLevelSecondLinks = 6;

Bool NoteMemory(ChunkReader& v)
{
  v.File().SetError(FILEERROR_MEMORY);
  return v.Note(false);
}

Bool VisitLink(ChunkReader& v, GeAliasLink* link) { return link ? v.Link(*link) : NoteMemory(v); }

Bool VisitLink(ChunkWriter& v, const GeAliasLink* link) { return link ? v.Link(*link) : v.EmptyLink(); }

template <class Visitor>
Bool VisitEntries(Visitor& v, JointRecord& record)
{
  Long count = record.entries.GetCount();
  if (!v.Long(count))
    return false;
  if constexpr (Visitor::kReading)
    v.Note(v.File().HasRoomFor(count, kLeastEntrySize));
  for (Long i = 0; v.Good() && i < count; ++i) {
    if constexpr (Visitor::kReading) {
      if (!record.AddEntry())
        return NoteMemory(v);
    }
    JointEntry& entry = *record.entries[i];
    v.ULong(entry.number);
    v.Link(entry.link);
    v.Long(entry.value);
  }
  return v.Good();
}

template <class Visitor>
Bool VisitJoint(Visitor& v, JointRecord& record)
{
  if (v.Level() >= kLevelGlobalMatrix)
    v.ConstantLong(0);
  VisitLink(v, Visitor::kReading ? record.NeedJoint() : record.joint);
  v.Matrix(record.bindMatrix);
  v.Real(record.length);
  if constexpr (Visitor::kReading)
    v.Note(v.Good() && record.weights.Read(v.File()));
  else
    v.Note(v.Good() && record.weights.Write(v.File()));
  v.LongInto(record.flags);
  if constexpr (Visitor::kReading)
    v.Note(v.Good() && record.pairs.Read(v.File()));
  else
    v.Note(v.Good() && record.pairs.Write(v.File()));
  if (!v.Good() || !VisitEntries(v, record))
    return false;
  return v.Level() != kLevelRestMatrix || v.Matrix(record.restMatrix);
}

// `dataLevel` is that of the data around the chunk.
template <class Visitor>
Bool VisitRestPose(Visitor& v, JointRecord& record, Long dataLevel)
{
  v.Matrix(record.restMatrix);
  return v.Good() &&
         (dataLevel < kLevelSecondLinks || VisitLink(v, Visitor::kReading ? record.NeedSecond() : record.second));
}

} // namespace

void WeightTagData::WriteChunks(HyperFile& file)
{
  ChunkWriter v(file, kLevelWeightData);
  v.Long(joints_.GetCount());
  if (!v.Matrix(globalMatrix_))
    return;
  for (JointRecord* record : joints_)
    v.Note(v.Good() && VisitJoint(v, *record));
  for (JointRecord* record : joints_) {
    v.Note(v.Good() && WriteChunk(file, kChunkJointRest, kLevelJointRest, [record](ChunkWriter& rest) {
             return VisitRestPose(rest, *record, kLevelWeightData);
           }));
  }
  if (!v.Good())
    file.SetError(FILEERROR_WRITE);
}

Bool WeightTagData::ReadData(HyperFile& file, Long, Long level)
{
  FlushJoints();
  readLevel_ = level;
  ChunkReader v(file, level);
  Long count = 0;
  v.Long(count);
  if (level >= kLevelGlobalMatrix)
    v.Matrix(globalMatrix_);
  globalInverse_ = Invert(globalMatrix_);
  if (!v.Good() || !file.HasRoomFor(count, kLeastJointSize))
    return false;
  for (Long i = 0; i < count; ++i) {
    JointRecord* record = AppendJoint();
    if (!record)
      return NoteMemory(v);
    if (!VisitJoint(v, *record))
      return false;
    if (level < kLevelRestMatrix)
      record->restMatrix = record->bindMatrix;
    record->bindInverse = Invert(record->bindMatrix);
    record->restInverse = Invert(record->restMatrix);
  }
  return level < kLevelRestChunks || ReadRestPoses(file);
}

// A chunk for each joint, though some may be missing. The end of the chunk around them is left for the caller.
Bool WeightTagData::ReadRestPoses(HyperFile& file)
{
  for (JointRecord* record : joints_) {
    UChar tag = 0;
    if (!file.ReadValueHeader(tag))
      return false;
    if (tag == kTagChunkEnd)
      return file.GetFile().Seek(-1, kSeekRelative);
    if (tag == kTagChunkStart ? !ReadRestPose(file, *record) : !file.SkipValue(tag))
      return false;
  }
  return true;
}

Bool WeightTagData::ReadRestPose(HyperFile& file, JointRecord& record)
{
  Long id = 0;
  Long level = 0;
  if (!file.ReadChunkStart(id, level))
    return false;
  if (id != kChunkJointRest) {
    file.SkipToEndChunk(); // the caller skips the chunk around it
    return false;
  }
  if (!ReadChunkBody(file, level, [&](ChunkReader& v) { return VisitRestPose(v, record, readLevel_); }))
    return false;
  record.restInverse = Invert(record.restMatrix);
  return true;
}

} // namespace _torvane_
