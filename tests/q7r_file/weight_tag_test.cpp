// The joint weight tag: its bytes, the data of every level, copies, its tree of rows, and the bind pose.
#include <memory>

#include <gtest/gtest.h>

#include "q7r_file/tag_bytes.h"
#include "support/every_failed_allocation.h"
#include "support/record_samples.h"
#include "support/text.h"
#include "torvane/objects/base_object.h"
#include "torvane/tags/joint_tree.h"
#include "torvane/tags/weight_tag_data.h"
#include "torvane/values/ge_data.h"

namespace
{

using namespace _torvane_;

// A matrix with the offset (n, 0, 0) and axes of length `scale`.
Matrix Frame(Real n, Real scale) { return {{n, 0, 0}, {scale, 0, 0}, {0, scale, 0}, {0, 0, scale}}; }

// The same in a file.
std::string FrameText(int n, const std::string& s)
{
  return "Y" + std::to_string(n) + ",0,0," + s + ",0,0,0," + s + ",0,0,0," + s + " ";
}

// The values of a joint; 2 and 8 are the scales of bind and rest pose.
std::string JointText(Long level, int bind)
{
  return (level >= 1 ? "L99 k " : "k ") + FrameText(bind, "2") +
         "R2.5 L0 L0 L1 A3:3,3,0 U0 U0 U0 U0 L0 L1 A2:-1 L5 U1 U2 U3 U1 L4 L1 A3:-9 L1 U21 k L22 " +
         (level == 4 ? FrameText(bind, "8") : "");
}

std::string RestText(Long level, int n) // with a later writer's value
{
  return "[1021281,3 " + FrameText(n, "8") + (level >= 6 ? "k L7 ] " : "L7 ] ");
}

// An object that holds a weight tag, and its data.
struct Rig
{
  BaseObject object{kObjectNull};
  BaseTag* tag = object.MakeTag(kTagWeight);
  WeightTagData* data = static_cast<WeightTagData*>(tag->GetNodeData());

  const JointTreeData& Tree() const
  {
    return *static_cast<JointTreeData*>(tag->GetDataInstance().GetCustomDataType(2009, 1024869));
  }
  // "joint/entry": the kinds of the rows.
  std::string Rows() const
  {
    std::string text;
    for (Long i = 0; i < Tree().GetRowCount(); ++i)
      text += std::to_string(Tree().GetRow(i).GetKind()) + ":" + std::to_string(Tree().GetRow(i).node) + " ";
    return text;
  }
};

std::string RowOf(int kind, BaseObject& object)
{
  return std::to_string(kind) + ":" + std::to_string(object.GetGoal().GetGoalId()) + " ";
}

// Reads data of a level that lie in a chunk; true if they were taken and the chunk's end came next.
bool ReadData(WeightTagData& data, Long level, const std::string& body, bool expected = true)
{
  AssertionCounter silence;
  MemoryReadFile memory(ByteWriter().Header().Append(Record(body)).End().bytes);
  EXPECT_EQ(data.ReadData(memory.file, kChunkNodeData, level), expected);
  return memory.file.SkipToEndChunk() && memory.file.GetFile().GetRemaining() == 0;
}

} // namespace

TEST(WeightTag, BeginsWithItsEntriesAndNoJoints)
{
  Rig rig;
  EXPECT_EQ(rig.tag->GetDataInstance().GetReal(2007), 1.0);
  EXPECT_EQ(rig.Tree().GetRowCount(), 0);
  EXPECT_EQ(rig.data->GetJointCount(), 0);
  EXPECT_EQ(rig.data->GetJoint(0), nullptr);
  EXPECT_FALSE(WeightTagData().Init()); // without a tag
}

TEST(WeightTag, ReadsTheDataOfEveryLevel)
{
  for (Long level = 0; level <= 7; ++level) {
    Rig rig;
    std::string body = "L2 " + (level >= 1 ? FrameText(4, "0.5") : "") + JointText(level, 1) + JointText(level, 3);
    if (level >= 5) // a value in place of the first joint's chunk, which then is as it was
      body += "L1 " + RestText(level, 16);
    ASSERT_TRUE(ReadData(*rig.data, level, body + "L1")) << level;
    EXPECT_EQ(rig.data->GetReadLevel(), level);
    EXPECT_EQ(rig.data->GetGlobalMatrix(), level >= 1 ? Frame(4, 0.5) : Matrix());
    EXPECT_EQ(rig.data->GetGlobalInverse(), level >= 1 ? Frame(-8, 2) : Matrix());
    ASSERT_EQ(rig.data->GetJointCount(), 2);
    const JointRecord& first = *rig.data->GetJoint(0);
    const JointRecord& second = *rig.data->GetJoint(1);
    EXPECT_EQ(first.bindMatrix, Frame(1, 2));
    EXPECT_EQ(first.bindInverse, Frame(-0.5, 0.5));
    EXPECT_EQ(first.restMatrix, level < 4 ? Frame(1, 2) : level == 4 ? Frame(1, 8) : Matrix()) << level;
    EXPECT_EQ(second.restMatrix, level < 4 ? Frame(3, 2) : level == 4 ? Frame(3, 8) : Frame(16, 8)) << level;
    EXPECT_EQ(second.restInverse, level < 4 ? Frame(-1.5, 0.5) : level == 4 ? Frame(-0.375, 0.125) : Frame(-2, 0.125));
    EXPECT_EQ(first.length, 2.5);
    EXPECT_EQ(first.weights.ReadPointWeight(3), 1.0);
    EXPECT_EQ(first.flags, 5U);
    EXPECT_EQ(first.index, -1);
    EXPECT_EQ(first.pairs.values[0], -9);
    ASSERT_EQ(first.entries.GetCount(), 1);
    EXPECT_EQ(first.entries[0]->number, 21U);
    EXPECT_EQ(first.entries[0]->value, 22);
    EXPECT_EQ(second.second != nullptr, level >= 6);
  }
}

TEST(WeightTag, StaysInStepWithDamagedData)
{
  Rig rig;
  const std::string none = "L1 " + FrameText(0, "1") + JointText(6, 1); // no chunk at all behind the joints
  EXPECT_TRUE(ReadData(*rig.data, 6, none));
  EXPECT_TRUE(ReadData(*rig.data, 6, none + "[1021282,1 L1 ]", false));
  const Bytes whole = ByteWriter().Header().Append(Record(none + RestText(6, 1))).bytes;
  for (std::size_t cut = 13; cut < whole.size(); ++cut) {
    AssertionCounter silence;
    MemoryReadFile memory({whole.begin(), whole.begin() + static_cast<std::ptrdiff_t>(cut)});
    EXPECT_FALSE(rig.data->ReadData(memory.file, kChunkNodeData, 6)) << cut;
  }
  for (Long count : {2147483647, -1, 40}) {
    counting_memory::ResetPeak();
    const LLong before = counting_memory::Get().bytes;
    ReadData(*rig.data, 6, "L" + std::to_string(count) + " Y0 200( X0B0B )", false);
    EXPECT_LT(counting_memory::Get().peakBytes - before, 100000);
  }
}

TEST(WeightTag, AddsEachJointOnceAndKeepsRowsForThem)
{
  Rig rig;
  BaseObject joints[] = {BaseObject(kObjectJoint), BaseObject(kObjectJoint), BaseObject(kObjectJoint)};
  BaseObject listed(kObjectNull);
  rig.object.SetRelPos({4, 0, 0});
  EXPECT_EQ(rig.data->InsertJointRecord(nullptr), -1);
  for (Long i = 0; i < 3; ++i)
    EXPECT_EQ(rig.data->InsertJointRecord(&joints[i]), i);
  EXPECT_EQ(rig.data->InsertJointRecord(&joints[1]), 1);
  EXPECT_EQ(rig.data->GetTreeChanges(), 3);
  EXPECT_EQ(rig.data->GetGlobalMatrix().off, Vector(4, 0, 0));
  EXPECT_EQ(rig.data->GetGlobalInverse().off, Vector(-4, 0, 0));
  EXPECT_EQ(rig.Rows(), RowOf(1, joints[0]) + RowOf(1, joints[1]) + RowOf(1, joints[2]));
  rig.data->GetJoint(1)->AddEntry()->link.SetLink(&listed);
  EXPECT_TRUE(rig.data->DeleteJointRecord(&joints[0]));
  EXPECT_FALSE(rig.data->DeleteJointRecord(&joints[0]));
  EXPECT_EQ(rig.data->GetTreeChanges(), 4);
  EXPECT_EQ(rig.Rows(), RowOf(1, joints[1]) + RowOf(2, listed) + RowOf(1, joints[2]));
  EXPECT_EQ(rig.data->FindJoint(&joints[2]), 1);
  rig.data->GetJoint(0)->FlushEntries();
  EXPECT_EQ(rig.data->InsertJointRecord(&joints[0]), 2);
  EXPECT_EQ(rig.Rows(), RowOf(1, joints[1]) + RowOf(1, joints[2]) + RowOf(1, joints[0]));
  const GeData tree = rig.tag->GetDataInstance().GetData(2009);
  EXPECT_TRUE(tree.IsEqual(rig.tag->GetDataInstance().GetData(2009))); // a copy has the rows
  rig.data->DeleteJointRecord(&joints[2]);
  EXPECT_FALSE(tree.IsEqual(rig.tag->GetDataInstance().GetData(2009)));

  BaseTag loose(kTagPlugin, kTagWeight); // on no object
  loose.SetNodeData(NewObj<WeightTagData>());
  EXPECT_EQ(static_cast<WeightTagData*>(loose.GetNodeData())->InsertJointRecord(&joints[0]), -1);
  BaseObject another(kObjectJoint);
  EveryFailedAllocation([&] {
    const bool inserted = rig.data->InsertJointRecord(&another) == 2;
    EXPECT_EQ(rig.data->GetJointCount(), inserted ? 3 : 2);
    rig.data->DeleteJointRecord(&another);
    return inserted;
  });
}

TEST(WeightTag, TakesTheBindPoseFromTheJoints)
{
  Rig rig;
  auto* parent = NewObj<BaseObject>(kObjectJoint);
  auto* plain = NewObj<BaseObject>(kObjectNull);
  auto* child = NewObj<BaseObject>(kObjectJoint);
  parent->InsertUnder(&rig.object);
  plain->InsertUnder(parent);
  child->InsertUnderLast(parent);
  parent->SetRelPos({1, 0, 0});
  child->SetRelPos({0, 3, 4});
  ASSERT_EQ(rig.data->InsertJointRecord(parent), 0);
  ASSERT_EQ(rig.data->InsertJointRecord(child), 1);
  EXPECT_FALSE(rig.data->RefreshBindPose(2) || rig.data->RefreshBindPose(-2));
  EXPECT_TRUE(rig.data->RefreshBindPose(0));
  EXPECT_EQ(rig.data->GetJoint(0)->length, 5.0);
  EXPECT_EQ(rig.data->GetJoint(0)->bindInverse.off, Vector(-1, 0, 0));
  EXPECT_EQ(rig.data->GetJoint(1)->bindMatrix, Matrix());
  rig.data->GetJoint(1)->object = nullptr; // as after reading: found in the tree
  EXPECT_TRUE(rig.data->RefreshBindPose(-1));
  EXPECT_EQ(rig.data->GetJoint(1)->bindMatrix.off, Vector(1, 3, 4));
  EXPECT_EQ(rig.data->GetJoint(1)->length, 0.0);
  rig.data->GetJoint(1)->joint->SetLink(rig.tag); // no object
  EXPECT_FALSE(rig.data->RefreshBindPose(-1));
}

TEST(WeightTag, AnswersTheSecondLinkOfTheOneSelectedJoint)
{
  Rig rig;
  BaseObject joints[] = {BaseObject(kObjectJoint), BaseObject(kObjectJoint)};
  BaseObject other(kObjectNull);
  for (BaseObject& joint : joints)
    rig.data->InsertJointRecord(&joint);
  GeAliasLink link;
  link.SetLink(&other);
  auto answer = [&] {
    GeData value(Long{1});
    EXPECT_TRUE(rig.tag->GetParameterById(2008, value));
    return value.GetType() == kDataLink ? value.GetLink() : nullptr;
  };
  for (ULong flags : {0U, 2U, 3U}) {
    rig.data->GetJoint(1)->flags = flags;
    EXPECT_EQ(answer(), nullptr);
    EXPECT_TRUE(rig.tag->SetParameterById(2008, GeData(link)));
    EXPECT_EQ(rig.data->GetJoint(1)->second != nullptr, flags == 3);
  }
  EXPECT_EQ(answer(), &other);
  rig.data->GetJoint(0)->flags = 1; // two are selected
  EXPECT_EQ(answer(), nullptr);
  EXPECT_TRUE(rig.tag->SetParameterById(2007, GeData(0.5))); // the tag's own
  EXPECT_EQ(rig.tag->GetDataInstance().GetReal(2007), 0.5);
}

TEST(WeightTag, CopiesItsJointsWithTheirLinks)
{
  counting_memory::BalanceCheck balance;
  Rig rig;
  auto* joint = NewObj<BaseObject>(kObjectJoint);
  joint->InsertUnder(&rig.object);
  rig.data->InsertJointRecord(joint);
  JointRecord& record = *rig.data->GetJoint(0);
  record.NeedSecond()->SetLink(joint);
  record.AddEntry()->link.SetLink(joint);
  record.entries[0]->value = 8;
  record.index = 4;
  record.restMatrix = Frame(1, 2);
  record.weights.WritePointWeight(2, 1.0);
  rig.data->SetGlobalMatrix(Frame(3, 1));
  AliasTranslator translator;
  ASSERT_TRUE(translator.MakeTranslator());
  std::unique_ptr<GeListNode> clone(rig.object.MakeClone(0, translator.GetArray()));
  ASSERT_NE(clone, nullptr);
  translator.Finish(true);
  auto& copy = static_cast<BaseObject&>(*clone);
  auto* data = static_cast<WeightTagData*>(copy.GetTag(kTagWeight)->GetNodeData());
  ASSERT_TRUE(data && data->GetJointCount() == 1);
  const JointRecord& copied = *data->GetJoint(0);
  EXPECT_EQ(copied.GetTarget(), copy.GetDown());
  EXPECT_EQ(copied.second->GetLink(), copy.GetDown());
  EXPECT_EQ(copied.entries[0]->link.GetLink(), copy.GetDown());
  EXPECT_EQ(copied.entries[0]->value, 8);
  EXPECT_EQ(copied.index, 4);
  EXPECT_EQ(copied.restMatrix, Frame(1, 2));
  EXPECT_EQ(copied.weights.ReadPointWeight(2), 1.0);
  EXPECT_EQ(data->GetGlobalMatrix(), Frame(3, 1));

  EXPECT_TRUE(rig.data->CopyTo(*rig.data, 0, nullptr));
  EXPECT_EQ(rig.data->GetJointCount(), 1);
  WeightTagData loose;
  EXPECT_FALSE(rig.data->CopyTo(loose, 0, nullptr));
}
