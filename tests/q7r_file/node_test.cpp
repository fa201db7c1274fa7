// Named nodes: their chunks in every form, their bits, identifiers, parameters and copies.
#include "support/library.h"

namespace
{

TEST(Node, BitOperationsTellWhatChanged)
{
  BaseList2D node;
  EXPECT_TRUE(node.ChangeNBit(127, 1));
  EXPECT_FALSE(node.ChangeNBit(127, 0x11)); // the high half of a mode is ignored
  EXPECT_EQ(node.GetNBit(-4), 0x80000000u);
  EXPECT_TRUE(node.ChangeNBit(127, 2));
  EXPECT_FALSE(node.ChangeNBit(127, 2));
  EXPECT_TRUE(node.ChangeNBit(3, 3) && node.ChangeNBit(3, 3));
  EXPECT_FALSE(node.ChangeNBit(3, 4));
  EXPECT_TRUE(node.ChangeNBit(130, 1)); // lands in the last word
  EXPECT_TRUE(node.GetNBit(-4) == 4u && node.GetNBit(-5) == 0u);
  EXPECT_EQ(CountReports(), 1);
}

TEST(Node, KeepsExtraIdentifiersThroughAFile)
{
  const std::uint8_t bytes[] = {1, 2, 3};
  BaseList2D node(1);
  EXPECT_EQ(node.GetUniqueIDCount(), 1);
  EXPECT_FALSE(node.AddUniqueID(kMarkerAppId, bytes, 3));
  EXPECT_TRUE(node.AddUniqueID(20, bytes, 3) && node.AddUniqueID(10, bytes, 2));
  EXPECT_TRUE(node.AddUniqueID(20, bytes, 1)); // replaces, with another size
  EXPECT_FALSE(node.AddUniqueID(20, nullptr, 1) || node.AddUniqueID(20, bytes, -1));
  ASSERT_EQ(node.GetUniqueIDCount(), 3);
  Bytes written = BytesOf(node);
  const Bytes chunk = Record("[110068,1 L2 L10 M0102 L20 M01 ]");
  EXPECT_NE(std::search(written.begin(), written.end(), chunk.begin(), chunk.end()), written.end());
  BaseList2D back(1);
  ASSERT_TRUE(ReadInto(back, written));
  Long appId = 0;
  const void* data = nullptr;
  LLong size = 0;
  ASSERT_TRUE(back.GetUniqueIDByIndex(2, appId, data, size));
  EXPECT_EQ(appId, 20);
  EXPECT_EQ(size, 1);
  EXPECT_FALSE(back.GetUniqueIDByIndex(3, appId, data, size));
  EXPECT_EQ(std::memcmp(back.GetMarker().bytes, node.GetMarker().bytes, 16), 0);
  // An entry of a file that bears the marker's number isn't the marker.
  ASSERT_TRUE(ReadInto(back, ByteWriter().Start(110068, 1).Long(1).Long(kMarkerAppId).Memory(Bytes{7}).End().bytes));
  ASSERT_TRUE(back.GetUniqueIDByIndex(1, appId, data, size));
  EXPECT_TRUE(appId == kMarkerAppId && size == 1 && *static_cast<const UChar*>(data) == 7);
}

// In falling order and twice: two hundred thousand took eight seconds when each was put at its place. The last one of
// an id stays.
TEST(Node, ReadsExtraIdentifiersInAnyOrder)
{
  const Long count = 200000;
  ByteWriter writer;
  writer.Start(110068, 1).Long(count + 1).Long(7).Memory("first");
  for (Long id = count; id > 0; --id)
    writer.Long(id).Memory("xy");
  BaseList2D node(1);
  MemoryReadFile memory(ByteWriter().Header().Append(writer.End().bytes).End().bytes);
  ASSERT_TRUE(node.ReadChunkLoop(memory.file, true));
  EXPECT_LT(memory.file.GetLookupCount(), 40LL * count); // a sort's, no search for each
  ASSERT_EQ(node.GetUniqueIDCount(), count + 1);
  Long appId = 0;
  const void* data = nullptr;
  LLong size = 0;
  for (Long index : {1, 7, count}) {
    EXPECT_TRUE(node.GetUniqueIDByIndex(index, appId, data, size));
    EXPECT_TRUE(appId == index && size == 2) << index;
  }
}

TEST(Node, CopiesWithAMarkerOfItsOwn)
{
  LayerObject* source = AllocLayer();
  source->SetName("L");
  source->SetInfo(9);
  source->GetDataInstance().SetLong(1, 2);
  source->ChangeNBit(40, 1);
  auto* copy = static_cast<LayerObject*>(source->MakeClone(kCopyNoInfo, nullptr));
  ASSERT_NE(copy, nullptr);
  EXPECT_TRUE(copy->GetName() == String("L"));
  EXPECT_TRUE(copy->GetDataInstance().GetLong(1) == 2 && copy->GetNBit(40) == 1u && copy->GetInfo() == 0u);
  EXPECT_NE(std::memcmp(copy->GetMarker().bytes, source->GetMarker().bytes, 16), 0);
  DeleteObj(copy);
  DeleteObj(source);
}

ParameterPath Path(ParameterLevel a, ParameterLevel b) { return {a, b}; }

TEST(NodeParameters, WalkGroupsAndVectorComponents)
{
  BaseList2D node;
  GeData value;
  EXPECT_FALSE(node.GetParameter(ParameterPath(12), value));
  EXPECT_TRUE(node.SetParameter(ParameterPath(12), GeData(4)));
  ASSERT_TRUE(node.GetParameter(ParameterPath(12), value));
  EXPECT_EQ(value.GetLong(), 4);

  EXPECT_TRUE(node.SetParameter(Path({700, kDataGroup, 0}, {3, kDataReal, 0}), GeData(0.5)));
  ASSERT_NE(node.GetDataInstance().GetContainerInstance(700), nullptr);
  ASSERT_TRUE(node.GetParameter(Path({700, kDataGroup, 0}, {3, kDataReal, 0}), value));
  EXPECT_EQ(value.GetReal(), 0.5);
  ASSERT_TRUE(node.GetParameter(Path({701, kDataGroup, 0}, {3, kDataReal, 0}), value)); // missing: nil, but true
  EXPECT_EQ(value.GetType(), kDataNil);

  node.GetDataInstance().SetVector(20, Vector(1, 2, 3));
  EXPECT_TRUE(node.SetParameter(Path({20, kDataVector, 0}, {kVectorY, kDataReal, 0}), GeData(9.0)));
  EXPECT_TRUE(node.GetDataInstance().GetVector(20) == Vector(1, 9, 3));
  EXPECT_EQ(node.GetDataInstance().GetReal(kVectorY), 9.0); // the walk goes on to the component's level
  ASSERT_TRUE(node.GetParameter(Path({20, kDataVector, 0}, {kVectorZ, kDataReal, 0}), value));
  EXPECT_EQ(value.GetReal(), 3.0);
  // Below a group the Vector is still that of the top container.
  ASSERT_TRUE(node.GetParameter({{700, kDataGroup, 0}, {20, kDataVector, 0}, {kVectorX, kDataReal, 0}}, value));
  EXPECT_EQ(value.GetReal(), 1.0);
  EXPECT_TRUE(node.SetParameter(Path({20, kDataLong, 0}, {1, 0, 0}), GeData(5))); // any other type: nothing
  EXPECT_TRUE(node.GetDataInstance().GetVector(20) == Vector(1, 9, 3));
}

TEST(NodeParameters, DynamicOnesTakeTheSmallestFreeKey)
{
  BaseList2D node;
  BaseContainer real = MakeDynamicSettings(kDataReal, "Speed");
  EXPECT_TRUE(real.GetReal(5) == -1e20 && real.GetLong(12) == 0x66726561);
  EXPECT_TRUE(real.GetString(1) == String("Speed") && real.GetString(2) == String("Speed"));
  EXPECT_EQ(MakeDynamicSettings(kDataLong, "").GetLong(5), -2147483647);
  EXPECT_NE(MakeDynamicSettings(kDataLink, "").GetContainerInstance(17), nullptr);
  ParameterPath first = node.AddDynamicParameter(real);
  ParameterPath second = node.AddDynamicParameter(MakeDynamicSettings(kDataLong, "Count"));
  EXPECT_TRUE(first.IsExactly(Path({700, 5, 0}, {1, kDataReal, 0})));
  EXPECT_TRUE(second.IsExactly(Path({700, 5, 0}, {2, kDataLong, 0})) && node.RemoveDynamicParameter(first));
  EXPECT_EQ(node.FindDynamicParameter(first), nullptr);
  EXPECT_EQ(node.AddDynamicParameter(real)[1].id, 1);
  EXPECT_FALSE(node.RemoveDynamicParameter(Path({701, 5, 0}, {2, 0, 0})));
  // They stand in the header behind the name.
  BaseList2D back;
  ASSERT_TRUE(ReadInto(back, BytesOf(node)));
  ASSERT_NE(back.FindDynamicParameter(second), nullptr);
  EXPECT_TRUE(back.FindDynamicParameter(second)->GetString(1) == String("Count"));
}

} // namespace
