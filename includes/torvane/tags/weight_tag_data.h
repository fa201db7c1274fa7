// The behaviour of the joint weight tag: the joints that move the points of an object, each with a bind pose and its
// weights.
#pragma once

#include "torvane/links/alias.h"
#include "torvane/math/vector.h"
#include "torvane/nodes/private_chunk.h"
#include "torvane/tags/joint_weight_table.h"

namespace _torvane_
{

class BaseObject;
class JointTreeData;

// Entries of a weight tag's container.
inline constexpr Long kWeightStrength = 2007; // Real
inline constexpr Long kWeightTree = 2009;     // a JointTreeData: the joints as rows

// Computed: the second link of the selected joint, if just one is selected.
inline constexpr Long kWeightSecondLink = 2008;

inline constexpr Long kLevelWeightData = 6;
inline constexpr Long kChunkJointRest = 1021281;
inline constexpr Long kLevelJointRest = 1;

// One thing that a joint lists besides its weights.
struct JointEntry
{
  ULong number = 0; // stands before the link in a file; kept
  GeAliasLink link;
  Long value = 0;
};

inline constexpr ULong kJointSelected = 1; // bit of JointRecord::flags

// What a joint has besides its links, weights and lists: a copy takes it over in one piece.
struct JointPose
{
  Matrix bindMatrix; // the joint's global matrix in the bind pose
  Matrix bindInverse;
  Matrix restMatrix; // of a second pose
  Matrix restInverse;
  Real length = 0.0;
  ULong flags = 0;
  Long index = -1; // for the use of an application; not in a file
};

struct JointRecord : JointPose
{
  JointRecord() = default;
  ~JointRecord();
  JointRecord(const JointRecord&) = delete; // use CopyTo
  JointRecord& operator=(const JointRecord&) = delete;

  // The links, made when they are first needed; null when memory is short.
  GeAliasLink* NeedJoint();
  GeAliasLink* NeedSecond();
  // Whatever the joint link names, or null.
  GeListNode* GetTarget() const { return joint ? joint->GetLink() : nullptr; }
  // An entry at the end; null when memory is short.
  JointEntry* AddEntry();
  void FlushEntries();
  // False when memory is short: the destination, a new record, then holds a part.
  Bool CopyTo(JointRecord& destination, TransArray* translation) const;

  GeAliasLink* joint = nullptr;  // owned
  GeAliasLink* second = nullptr; // owned
  JointWeightTable weights;
  JointPairList pairs;
  GeTempDynArray<JointEntry*> entries; // owned
  BaseObject* object = nullptr;        // what the joint link was set to; used only while it still names that
};

class WeightTagData : public NodeData
{
 public:
  static constexpr NodeKindOf<WeightTagData> kNodeKind{"weight data", &NodeData::kNodeKind};
  const NodeKind& GetNodeKind() const override { return kNodeKind; }
  const NodeKind& GetOwnerKind() const override;

  ~WeightTagData() override;

  Bool IsInstanceOf(Long type) const override { return type == kTagWeight || NodeData::IsInstanceOf(type); }
  Long GetChunkLevel() const override { return kLevelWeightData; }
  // Sets the entries of the tag's container; false without a tag.
  Bool Init() override;
  // Replaces the joints by those of a file, from all levels.
  Bool ReadData(HyperFile& file, Long id, Long level) override;
  void WriteChunks(HyperFile& file) override;
  // Fails unless the destination's node is a weight tag.
  Bool CopyTo(PrivateChunk& destination, ULong flags, TransArray* translation) override;
  Bool GetParameter(const ParameterPath& path, GeData& value) override;
  Bool SetParameter(const ParameterPath& path, const GeData& value) override;
  // A hook for clients; does nothing here.
  virtual void Refresh() {}

  Long GetJointCount() const { return joints_.GetCount(); }
  // The joint at an index; null out of range.
  JointRecord* GetJoint(Long index) { return HasJoint(index) ? joints_[index] : nullptr; }
  const JointRecord* GetJoint(Long index) const { return HasJoint(index) ? joints_[index] : nullptr; }
  // The index of a joint's record, or -1.
  Long FindJoint(const BaseObject* joint) const;
  // Adds a record and gives its index, or that of the record which the joint has. -1 when no object holds the tag, for
  // a null joint, and when memory is short. The first joint also sets the global matrix, to that of the object.
  Long InsertJointRecord(BaseObject* joint);
  // False when the joint has no record.
  Bool DeleteJointRecord(const BaseObject* joint);
  // Takes the bind pose and the length from the joint, which must stand in the tree of the tag's object or have been
  // given to InsertJointRecord; -1 does so for all. The length is the distance to the first child of the joint's own
  // type, 0 without one. False for another index out of range, and when a joint is not there.
  Bool RefreshBindPose(Long index);

  const Matrix& GetGlobalMatrix() const { return globalMatrix_; }
  const Matrix& GetGlobalInverse() const { return globalInverse_; }
  void SetGlobalMatrix(const Matrix& matrix);
  // The level of the data that was read; 0 on new data.
  Long GetReadLevel() const { return readLevel_; }
  // Counts the refreshes of the tree.
  Long GetTreeChanges() const { return treeChanges_; }

 private:
  Bool HasJoint(Long index) const { return index >= 0 && index < joints_.GetCount(); }
  void FlushJoints();
  JointRecord* AppendJoint();
  JointRecord* GetSelectedJoint();
  BaseObject* GetTagObject() const;
  BaseObject* FindObject(const JointRecord& record) const;
  Bool RefreshBindPose(JointRecord& record);
  JointTreeData* NeedTree();
  Bool RefreshTree();
  Bool ReadRestPoses(HyperFile& file);
  Bool ReadRestPose(HyperFile& file, JointRecord& record);

  Matrix globalMatrix_;
  Matrix globalInverse_;
  GeTempDynArray<JointRecord*> joints_; // owned
  Long readLevel_ = 0;
  Long treeChanges_ = 0;
};

} // namespace _torvane_
