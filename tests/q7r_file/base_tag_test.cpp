// Plain tags and plug-in tags: their chunks, their copies, and which class the factory makes.
#include <string>

#include <gtest/gtest.h>

#include "q7r_file/node_bytes.h"
#include "support/counting_memory.h"
#include "support/every_failed_allocation.h"
#include "torvane/objects/base_object.h"
#include "torvane/tags/base_tag.h"
#include "torvane/values/ge_data.h"

namespace
{

using namespace _torvane_;

// The node chunks of a tag with no name and the counting marker.
std::string NodeHex(const std::string& container)
{
  return "01 0001ADE2 00000007  0F 00000000  0F 00000000  01 00000084 00000001 0F FFFFFFFF" + container +
         "02  0C 00  82 00000000  0F 00000000  0F 00000001 0F 00000000"
         "80 0000000E 616C69617332 0000000000000000"
         "0C 01 80 00000010 000102030405060708090A0B0C0D0E0F  15 00  02"
         "01 0001ADF5 00000002  0F 00000004  0F 00000000 0F 00000000 0F 00000000 0F 00000000  0C 00  02";
}

const std::string kUnknownChunk = "01 0001ADF0 00000006  0F 0012D687  0F 00000000  82 00000004 00540067"
                                  "15 01  01 00000007 00000001 0F 0000002A 02  02";

Bytes UnknownChunk() { return FromHex(kUnknownChunk); }

class AnsweringData : public NodeData
{
 public:
  Long GetChunkLevel() const override { return 2; }
  void WriteChunks(HyperFile& file) override { file.WriteLong(7); }
  Bool GetParameter(const ParameterPath& path, GeData& value) override
  {
    value = GeData(static_cast<Long>(99));
    return path[0].id == 5;
  }
};

} // namespace

TEST(BaseTag, WritesItsChunksByteForByte)
{
  BaseTag target(kTagTarget);
  SetCountingMarker(target);
  const std::string emptyLink = "0F 00000085 80 0000000E 616C69617332 0000000000000000";
  EXPECT_EQ(ToHex(BytesOf(target)), ToHex(FromHex(NodeHex("0F 000003E9" + emptyLink + "0F 000003EA" + emptyLink +
                                                          "0F 000003EB 0F 0000000F 0F 00000001"))));
  BaseTag plugin(kTagPlugin, 5698);
  SetCountingMarker(plugin);
  const std::string head = "0F 00001642  0F 00000000  82 00000000";
  EXPECT_EQ(ToHex(BytesOf(plugin)), ToHex(FromHex(NodeHex("") + "01 0001ADF0 00000000" + head + "02")));
  plugin.SetNodeData(NewObj<AnsweringData>());
  EXPECT_EQ(ToHex(BytesOf(plugin)), ToHex(FromHex(NodeHex("") + "01 0001ADF0 00000002" + head + "0F 00000007 02")));
}

TEST(BaseTag, SkipsChunksThatItDoesNotKnowAndKeepsItsOwnName)
{
  BaseTag tag(kTagPlugin);
  tag.SetName(String("mine"));
  Bytes chunks = FromHex("01 00000009 00000000 82 00000002 0041 02");
  const Bytes unknown = UnknownChunk();
  chunks.insert(chunks.end(), unknown.begin(), unknown.end());
  chunks.insert(chunks.end(), unknown.begin(), unknown.end()); // the second replaces the first
  ASSERT_TRUE(ReadInto(tag, chunks));
  EXPECT_EQ(tag.GetName(), String("mine"));
  EXPECT_EQ(tag.GetRawSize(), 17);
}

TEST(BaseTag, CopiesOntoATagOfTheSameTypeOnly)
{
  counting_memory::BalanceCheck balance;
  BaseTag source(kTagTarget);
  source.SetName(String("aim"));
  source.GetDataInstance().SetLong(1234, 5);
  BaseTag same(kTagTarget);
  BaseTag other(kTagProtection);
  BaseTag disguised(kTagPlugin, kTagTarget); // the same number, but another class
  EXPECT_TRUE(source.CopyWithTranslation(same, 0, nullptr));
  EXPECT_EQ(same.GetName(), String("aim"));
  EXPECT_EQ(same.GetDataInstance().GetLong(1234), 5);
  EXPECT_FALSE(source.CopyWithTranslation(other, 0, nullptr));
  EXPECT_FALSE(source.CopyWithTranslation(disguised, 0, nullptr));

  BaseTag unknown(kTagPlugin);
  ASSERT_TRUE(ReadInto(unknown, UnknownChunk()));
  EveryFailedAllocation([&] { return std::unique_ptr<GeListNode>(unknown.MakeClone(0, nullptr)); },
                        [](const auto& clone) { return static_cast<BaseTag&>(*clone).GetRawSize() == 17; });
}

TEST(BaseTag, MakesTheTypesOfItsTable)
{
  struct Row
  {
    Long asked;
    Long type;
    Long diskType;
  };
  const Row rows[] = {{5600, 5600, 5600},       {5616, 5616, 5616},          {5629, 5629, 5629}, {5673, 5673, 5673},
                      {5676, 5676, 5676},       {5678, 5678, 5691},          {5691, -1, 5691},   {5701, 5701, 5701},
                      {1019365, 1019365, 5691}, {465000404, 465000404, 5691}};
  for (const Row& row : rows) {
    BaseTag* tag = MakeTag(row.asked);
    ASSERT_NE(tag, nullptr);
    EXPECT_EQ(tag->GetType(), row.type) << row.asked;
    EXPECT_EQ(tag->GetDiskType(), row.diskType) << row.asked;
    EXPECT_EQ(tag->GetNodeData() != nullptr, row.asked == kTagWeight) << row.asked;
    DeleteObj(tag);
  }
}

TEST(BaseTag, IsFoundOnItsObjectByItsRealType)
{
  BaseObject object(kObjectNull);
  BaseTag* first = object.MakeTag(kTagTarget);
  BaseTag* plugin = MakeTag(5698);
  object.InsertTag(plugin, first);
  object.InsertTag(nullptr);
  BaseTag* newest = object.MakeTag(kTagTarget);
  EXPECT_EQ(object.GetFirstTag(), newest);
  EXPECT_EQ(object.GetTag(kTagTarget), newest);
  EXPECT_EQ(object.GetTag(5698), plugin);
  EXPECT_EQ(object.GetTag(kTagPlugin), nullptr);
  EXPECT_EQ(plugin->GetPrev(), first);
  EXPECT_EQ(plugin->GetObject(), &object);
  plugin->SetNodeData(NewObj<AnsweringData>());
  GeData value;
  EXPECT_TRUE(plugin->GetParameterById(5, value));
  EXPECT_EQ(value.GetLong(), 99) << "the behaviour object answers first";
  plugin->SetParameterById(6, GeData(static_cast<Long>(3)));
  EXPECT_EQ(plugin->GetDataInstance().GetLong(6), 3);
}

TEST(BaseTag, StandsInItsObjectsTagChunk)
{
  BaseObject object(kObjectNull);
  object.MakeTag(kTagProtection);
  const Bytes bytes = BytesOf(object);
  // Chunk 110108, the root's own chunk 110100, and the tag under its number.
  EXPECT_NE(ToHex(bytes).find("01 00 01 AE 1C 00 00 00 00 01 00 01 AE 14 00 00 00 00 01 00 00 15 FD 00 00 00 00 01"),
            std::string::npos);
  BaseObject again(kObjectGeneric);
  ASSERT_TRUE(ReadInto(again, bytes));
  ASSERT_NE(again.GetTag(kTagProtection), nullptr);
  EXPECT_EQ(again.GetTag(kTagProtection)->GetObject(), &again);
}
