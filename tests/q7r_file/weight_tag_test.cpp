// The joint weight tag: its bytes, the data of every level, copies, its tree of rows, and the bind pose.
#include "support/library.h"

namespace
{

// A matrix with the offset (n, 0, 0) and axes of length `scale`.
Matrix Frame(Real n, Real scale) { return {{n, 0, 0}, {scale, 0, 0}, {0, scale, 0}, {0, 0, scale}}; }

// The matrices are Frame(4, 0.5) and, of the joint, Frame(1, 2).
const std::string kOneJoint = "L1 Y4,0,0,0.5,0,0,0,0.5,0,0,0,0.5 L0 k Y1,0,0,2,0,0,0,2,0,0,0,2 R2.5 L0 L0 L0 U0 U0 U0 "
                              "U0 L0 L0 U0 U0 U0 U0 L0 L0 ";

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

} // namespace

TEST(WeightTag, BeginsWithItsEntriesAndNoJoints)
{
  Rig rig;
  EXPECT_TRUE(rig.tag->GetDataInstance().GetReal(2007) == 1.0 && rig.Tree().GetRowCount() == 0);
  EXPECT_TRUE(rig.data->GetJointCount() == 0 && rig.data->GetJoint(0) == nullptr);
  EXPECT_FALSE(WeightTagData().Init()); // without a tag
}

TEST(WeightTag, InvertsTheMatricesThatItReads)
{
  for (const char* rest : {"", "[1021281,1 Y3,0,0,8,0,0,0,8,0,0,0,8 k ]"}) {
    Rig rig;
    MemoryReadFile memory(ByteWriter().Header().Append(Record(kOneJoint + rest)).End().bytes);
    const Long level = *rest ? 6 : 3;
    ASSERT_TRUE(rig.data->ReadData(memory.file, kChunkNodeData, level));
    EXPECT_EQ(rig.data->GetReadLevel(), level);
    EXPECT_EQ(rig.data->GetGlobalInverse(), Frame(-8, 2));
    EXPECT_EQ(rig.data->GetJoint(0)->bindInverse, Frame(-0.5, 0.5));
    EXPECT_EQ(rig.data->GetJoint(0)->restInverse, *rest ? Frame(-0.375, 0.125) : Frame(-0.5, 0.5));
    EXPECT_EQ(rig.data->GetJoint(0)->index, -1);
  }
}

TEST(WeightTag, RefusesAnotherChunkInTheRestPosesPlaceAndStaysInStep)
{
  Rig rig;
  MemoryReadFile memory(ByteWriter().Header().Append(Record(kOneJoint + "[1021282,1 L1 ]")).End().bytes);
  EXPECT_FALSE(rig.data->ReadData(memory.file, kChunkNodeData, 6));
  EXPECT_TRUE(memory.file.SkipToEndChunk() && memory.file.GetFile().GetRemaining() == 0);
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
  EXPECT_TRUE(rig.data->GetTreeChanges() == 3 && rig.data->GetGlobalMatrix().off == Vector(4, 0, 0));
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
  EXPECT_TRUE(rig.data->RefreshBindPose(0) && rig.data->GetJoint(0)->length == 5.0);
  EXPECT_EQ(rig.data->GetJoint(0)->bindInverse.off, Vector(-1, 0, 0));
  EXPECT_EQ(rig.data->GetJoint(1)->bindMatrix, Matrix());
  rig.data->GetJoint(1)->object = nullptr; // as after reading: found in the tree
  EXPECT_TRUE(rig.data->RefreshBindPose(-1));
  EXPECT_TRUE(rig.data->GetJoint(1)->bindMatrix.off == Vector(1, 3, 4) && rig.data->GetJoint(1)->length == 0.0);
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
  EXPECT_TRUE(copied.GetTarget() == copy.GetDown() && copied.second->GetLink() == copy.GetDown());
  EXPECT_TRUE(copied.entries[0]->link.GetLink() == copy.GetDown() && copied.entries[0]->value == 8);
  EXPECT_TRUE(copied.index == 4 && copied.restMatrix == Frame(1, 2));
  EXPECT_EQ(copied.weights.ReadPointWeight(2), 1.0);
  EXPECT_EQ(data->GetGlobalMatrix(), Frame(3, 1));

  EXPECT_TRUE(rig.data->CopyTo(*rig.data, 0, nullptr) && rig.data->GetJointCount() == 1);
  WeightTagData loose;
  EXPECT_FALSE(rig.data->CopyTo(loose, 0, nullptr));
}
