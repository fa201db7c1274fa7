#include "torvane/tags/weight_tag_data.h"

#include "torvane/math/ge_math.h"
#include "torvane/objects/base_object.h"
#include "torvane/tags/base_tag.h"
#include "torvane/tags/joint_tree.h"
#include "torvane/values/ge_data.h"

namespace _torvane_
{

namespace
{

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
  return !record || !link || (record->NeedSecond() && link->CopyLinkTo(record->second, nullptr));
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
