#include "torvane/tags/weight_tag_data.h"

#include "k2v_file/stream/chunk_visitor.h"
#include "k2v_file/stream/value_forms.h"
#include "torvane/math/ge_math.h"
#include "torvane/objects/base_object.h"
#include "torvane/tags/base_tag.h"
#include "torvane/tags/joint_tree.h"

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

GeAliasLink* NeedLink(GeAliasLink*& link)
{
  if (!link)
    link = NewObj<GeAliasLink>();
  return link;
}

Bool CopyLink(const GeAliasLink* link, GeAliasLink*& destination, TransArray* translation)
{
  return !link || (NeedLink(destination) && link->CopyLinkTo(destination, translation));
}

Bool NoteMemory(ChunkReader& v)
{
  v.File().SetError(FILEERROR_MEMORY);
  return v.Note(false);
}

Bool VisitLink(ChunkReader& v, GeAliasLink*& link) { return NeedLink(link) ? v.Link(*link) : NoteMemory(v); }

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
  VisitLink(v, record.joint);
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
  return v.Good() && (dataLevel < kLevelSecondLinks || VisitLink(v, record.second));
}

// `target` as the object that it is, if it is found among `top`, the objects behind it, and all below these; else null.
BaseObject* FindInTree(BaseObject* top, const GeListNode* target)
{
  for (BaseObject* object = top; object;) {
    if (object == target)
      return object;
    BaseObject* next = object->GetDown();
    while (!next && object) {
      next = object->GetNext();
      object = object->GetUp();
    }
    object = next;
  }
  return nullptr;
}

GeAliasID NodeIdOf(const GeAliasLink* link)
{
  const GeAliasGoal* goal = link ? link->GetLinkGoal() : nullptr;
  return goal ? goal->GetGoalId() : 0;
}

// Brings the row of a node to `place`, and `place` behind it; what was there before goes.
Bool PlaceRow(JointTreeData& tree, Long& place, GeAliasID node, Long kind)
{
  if (node == 0)
    return true;
  const Long found = tree.FindRow(node, kind, place);
  if (found >= 0)
    tree.RemoveRows(place, found);
  else if (!tree.InsertRow(place, node, kind))
    return false;
  ++place;
  return true;
}

} // namespace

// ---------------------------------------------------------------------------------------------------------------

JointRecord::~JointRecord()
{
  FlushEntries();
  DeleteObj(joint);
  DeleteObj(second);
}

GeAliasLink* JointRecord::NeedJoint() { return NeedLink(joint); }

GeAliasLink* JointRecord::NeedSecond() { return NeedLink(second); }

JointEntry* JointRecord::AddEntry()
{
  JointEntry* entry = NewObj<JointEntry>();
  if (entry && !entries.Append(entry))
    DeleteObj(entry);
  return entry;
}

void JointRecord::FlushEntries()
{
  for (JointEntry* entry : entries)
    DeleteObj(entry);
  entries.Flush();
}

Bool JointRecord::CopyTo(JointRecord& destination, TransArray* translation) const
{
  destination.bindMatrix = bindMatrix;
  destination.bindInverse = bindInverse;
  destination.restMatrix = restMatrix;
  destination.restInverse = restInverse;
  destination.length = length;
  destination.flags = flags;
  destination.index = index;
  if (!CopyLink(joint, destination.joint, translation) || !CopyLink(second, destination.second, translation) ||
      !weights.CopyTo(destination.weights) || !pairs.CopyTo(destination.pairs))
    return false;
  destination.FlushEntries();
  for (const JointEntry* entry : entries) {
    JointEntry* copy = destination.AddEntry();
    if (!copy || !entry->link.CopyLinkTo(&copy->link, translation))
      return false;
    copy->number = entry->number;
    copy->value = entry->value;
  }
  return true;
}

// ---------------------------------------------------------------------------------------------------------------

WeightTagData::~WeightTagData() { FlushJoints(); }

void WeightTagData::FlushJoints()
{
  for (JointRecord* record : joints_)
    DeleteObj(record);
  joints_.Flush();
}

JointRecord* WeightTagData::AppendJoint()
{
  JointRecord* record = NewObj<JointRecord>();
  if (record && !joints_.Append(record))
    DeleteObj(record);
  return record;
}

Bool WeightTagData::Init()
{
  if (!node_)
    return false;
  GeData tree;
  BaseContainer& settings = node_->GetDataInstance();
  settings.SetReal(kWeightStrength, 1.0);
  return tree.SetType(kCustomJointTree) && settings.SetData(kWeightTree, tree);
}

void WeightTagData::SetGlobalMatrix(const Matrix& matrix)
{
  globalMatrix_ = matrix;
  globalInverse_ = Invert(matrix);
}

// ---------------------------------------------------------------------------------------------------------------

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

// ---------------------------------------------------------------------------------------------------------------

const NodeKind& WeightTagData::GetOwnerKind() const { return BaseTag::kNodeKind; }

Bool WeightTagData::CopyTo(PrivateChunk& destination, ULong flags, TransArray* translation)
{
  auto* target = NodeCast<WeightTagData>(&destination);
  if (!target)
    return false;
  if (target == this)
    return true;
  if (!target->node_ || target->node_->GetType() != kTagWeight || !NodeData::CopyTo(destination, flags, translation))
    return false;
  target->globalMatrix_ = globalMatrix_;
  target->globalInverse_ = globalInverse_;
  target->FlushJoints();
  for (const JointRecord* record : joints_) {
    JointRecord* copy = target->AppendJoint();
    if (!copy || !record->CopyTo(*copy, translation))
      return false;
  }
  return target->joints_.GetCount() == joints_.GetCount();
}

// The one joint that is selected; null when none or more than one is.
JointRecord* WeightTagData::GetSelectedJoint()
{
  JointRecord* selected = nullptr;
  for (JointRecord* record : joints_) {
    if ((record->flags & kJointSelected) == 0)
      continue;
    if (selected)
      return nullptr;
    selected = record;
  }
  return selected;
}

Bool WeightTagData::GetParameter(const ParameterPath& path, GeData& value)
{
  if (path[0].id != kWeightSecondLink)
    return NodeData::GetParameter(path, value);
  const JointRecord* record = GetSelectedJoint();
  if (record && record->second)
    value = GeData(*record->second);
  else
    value.Free();
  return true;
}

Bool WeightTagData::SetParameter(const ParameterPath& path, const GeData& value)
{
  if (path[0].id != kWeightSecondLink)
    return NodeData::SetParameter(path, value);
  JointRecord* record = GetSelectedJoint();
  const GeAliasLink* link = value.GetAliasLink();
  return !record || !link || CopyLink(link, record->second, nullptr);
}

// ---------------------------------------------------------------------------------------------------------------

BaseObject* WeightTagData::GetTagObject() const
{
  const auto* tag = NodeCast<BaseTag>(node_);
  return tag ? tag->GetObject() : nullptr;
}

Long WeightTagData::FindJoint(const BaseObject* joint) const
{
  for (Long i = 0; joint && i < joints_.GetCount(); ++i) {
    if (joints_[i]->GetTarget() == joint)
      return i;
  }
  return -1;
}

Long WeightTagData::InsertJointRecord(BaseObject* joint)
{
  BaseObject* owner = GetTagObject();
  const Long present = FindJoint(joint);
  if (!owner || !joint || present >= 0)
    return owner ? present : -1;
  JointRecord* record = AppendJoint();
  const Long index = joints_.GetCount() - 1;
  if (!record)
    return -1;
  record->object = joint;
  if (GeAliasLink* link = record->NeedJoint())
    link->SetLink(joint);
  if (record->GetTarget() != joint || !RefreshTree()) {
    DeleteObj(record);
    joints_.Remove(index);
    return -1;
  }
  if (index == 0)
    SetGlobalMatrix(owner->GetGlobalMatrix());
  return index;
}

Bool WeightTagData::DeleteJointRecord(const BaseObject* joint)
{
  const Long index = FindJoint(joint);
  if (index < 0)
    return false;
  DeleteObj(joints_[index]);
  joints_.Remove(index);
  RefreshTree();
  return true;
}

// The object behind a joint's link. A file may have linked anything: what is not known to be an object is looked for.
BaseObject* WeightTagData::FindObject(const JointRecord& record) const
{
  const GeListNode* target = record.GetTarget();
  if (!target)
    return nullptr;
  if (target == record.object)
    return record.object;
  BaseObject* top = GetTagObject();
  while (top && top->GetUp())
    top = top->GetUp();
  if (top && top->GetListHead())
    top = NodeCast<BaseObject>(top->GetListHead()->GetFirst());
  return FindInTree(top, target);
}

Bool WeightTagData::RefreshBindPose(Long index)
{
  if (index != -1)
    return HasJoint(index) && RefreshBindPose(*joints_[index]);
  Bool done = true;
  for (JointRecord* record : joints_)
    done = RefreshBindPose(*record) && done;
  return done;
}

Bool WeightTagData::RefreshBindPose(JointRecord& record)
{
  BaseObject* joint = FindObject(record);
  if (!joint)
    return false;
  record.bindMatrix = joint->GetGlobalMatrix();
  record.bindInverse = Invert(record.bindMatrix);
  BaseObject* child = joint->GetDown();
  while (child && child->GetType() != joint->GetType())
    child = child->GetNext();
  record.length = child ? Length(child->GetGlobalMatrix().off - record.bindMatrix.off) : 0.0;
  return true;
}

JointTreeData* WeightTagData::NeedTree()
{
  BaseContainer& settings = node_->GetDataInstance();
  if (!settings.GetCustomDataType(kWeightTree, kCustomJointTree)) {
    GeData tree;
    if (!tree.SetType(kCustomJointTree) || !settings.SetData(kWeightTree, tree))
      return nullptr;
  }
  return NodeCast<JointTreeData>(settings.GetCustomDataType(kWeightTree, kCustomJointTree));
}

// Gives each joint and each of its entries a row in the tree, and takes out the rows of what is gone.
Bool WeightTagData::RefreshTree()
{
  ++treeChanges_;
  JointTreeData* tree = node_ ? NeedTree() : nullptr;
  Long place = 0;
  Bool done = tree != nullptr;
  for (const JointRecord* record : joints_) {
    done = done && PlaceRow(*tree, place, NodeIdOf(record->joint), kJointRowJoint);
    for (Long i = 0; done && i < record->entries.GetCount(); ++i)
      done = PlaceRow(*tree, place, NodeIdOf(&record->entries[i]->link), kJointRowEntry);
  }
  if (done)
    tree->RemoveRows(place, tree->GetRowCount());
  return done;
}

} // namespace _torvane_
