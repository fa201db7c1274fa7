#include "torvane/tags/joint_tree.h"

namespace _torvane_
{

JointTreeData::~JointTreeData() { RemoveRows(0, rows_.GetCount()); }

Bool JointTreeData::IsEqual(const CustomData& other) const
{
  const auto* tree = NodeCast<JointTreeData>(&other);
  if (!tree || !OpaqueCustomData::IsEqual(other) || rows_.GetCount() != tree->rows_.GetCount())
    return false;
  for (Long i = 0; i < rows_.GetCount(); ++i) {
    if (rows_[i]->node != tree->rows_[i]->node || !rows_[i]->settings.IsEqual(tree->rows_[i]->settings))
      return false;
  }
  return true;
}

Bool JointTreeData::CopyTo(CustomData& destination, TransArray* translation) const
{
  auto* tree = NodeCast<JointTreeData>(&destination);
  if (tree == this)
    return true;
  if (!tree || !OpaqueCustomData::CopyTo(destination, translation))
    return false;
  tree->RemoveRows(0, tree->rows_.GetCount());
  for (const JointRow* row : rows_) {
    const Long end = tree->rows_.GetCount();
    if (!tree->InsertRow(end, row->node, row->GetKind()) ||
        !row->settings.CopyTo(tree->rows_[end]->settings, 0, translation))
      return false;
  }
  return true;
}

Long JointTreeData::FindRow(GeAliasID node, Long kind, Long start) const
{
  for (Long i = start; i < rows_.GetCount(); ++i) {
    const Long found = rows_[i]->GetKind();
    if (rows_[i]->node == node && found == kind)
      return i;
    if (kind == kJointRowEntry && found == kJointRowJoint)
      break;
  }
  return -1;
}

Bool JointTreeData::InsertRow(Long index, GeAliasID node, Long kind)
{
  JointRow* row = NewObj<JointRow>();
  if (!row)
    return false;
  row->node = node;
  if (row->settings.SetData(kJointRowKind, GeData(kind)) && rows_.Insert(index, row))
    return true;
  DeleteObj(row);
  return false;
}

void JointTreeData::RemoveRows(Long first, Long end)
{
  for (Long i = end - 1; i >= first; --i) {
    DeleteObj(rows_[i]);
    rows_.Remove(i);
  }
}

} // namespace _torvane_
