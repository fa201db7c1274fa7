// The custom value 1024869: the joints of a weight tag as rows that an application shows. How an application stores
// the tree is its own matter: bytes from a file are kept and written back, and the rows live in memory alone.
#pragma once

#include "torvane/links/alias.h"
#include "torvane/values/base_container.h"
#include "torvane/values/custom_data.h"

namespace _torvane_
{

// Entry of a row's container, and its values.
inline constexpr Long kJointRowKind = 1000; // Long
inline constexpr Long kJointRowJoint = 1;
inline constexpr Long kJointRowEntry = 2; // an entry of the joint above it

struct JointRow
{
  GeAliasID node = 0; // the id of the goal that the row stands for
  BaseContainer settings;

  Long GetKind() const { return settings.GetLong(kJointRowKind); }
};

// Owns its rows, which stand in the order of the joints, the entries of a joint behind it.
class JointTreeData : public OpaqueCustomData
{
 public:
  static constexpr NodeKindOf<JointTreeData> kNodeKind{"joint tree", &OpaqueCustomData::kNodeKind};
  const NodeKind& GetNodeKind() const override { return kNodeKind; }

  explicit JointTreeData(const CustomDataType& type) : OpaqueCustomData(type) {}
  ~JointTreeData() override;

  Bool IsEqual(const CustomData& other) const override;
  Bool CopyTo(CustomData& destination, TransArray* translation) const override;

  Long GetRowCount() const { return rows_.GetCount(); }
  // The row at an index from 0 to GetRowCount() - 1.
  JointRow& GetRow(Long index) { return *rows_[index]; }
  const JointRow& GetRow(Long index) const { return *rows_[index]; }
  // The first row of a kind for a node from `start` on, or -1. Entries are looked for up to the next joint only.
  Long FindRow(GeAliasID node, Long kind, Long start = 0) const;
  // A new row before the one at `index`. False when memory is short.
  Bool InsertRow(Long index, GeAliasID node, Long kind);
  // Removes the rows from `first` to before `end`.
  void RemoveRows(Long first, Long end);

 private:
  GeTempDynArray<JointRow*> rows_; // owned
};

} // namespace _torvane_
