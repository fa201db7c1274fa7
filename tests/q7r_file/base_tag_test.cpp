// Plain tags and plug-in tags: their chunks, their copies, and which class the factory makes.
#include "support/library.h"

namespace
{

const char* const kUnknownChunk = "[110064,6 L1234567 L0 STg B1 [7,1 L42 ] ]";

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

TEST(BaseTag, WritesWhatItsDataHold)
{
  BaseTag plugin(kTagPlugin, 5698);
  plugin.SetNodeData(NewObj<AnsweringData>());
  EXPECT_NE(ToHex(BytesOf(plugin)).find(ToHex(Record("[110064,2 L5698 L0 S L7 ]"))), std::string::npos);
}

TEST(BaseTag, SkipsChunksThatItDoesNotKnowAndKeepsItsOwnName)
{
  BaseTag tag(kTagPlugin);
  tag.SetName(String("mine"));
  const std::string unknown = kUnknownChunk; // the second replaces the first
  ASSERT_TRUE(ReadInto(tag, Record("[9,0 SA ] " + unknown + " " + unknown)));
  EXPECT_TRUE(tag.GetName() == String("mine") && tag.GetRawSize() == 17);
}

TEST(BaseTag, CopiesOntoATagOfTheSameTypeOnly)
{
  BaseTag source(kTagTarget);
  source.SetName(String("aim"));
  source.GetDataInstance().SetLong(1234, 5);
  BaseTag same(kTagTarget), other(kTagProtection);
  BaseTag disguised(kTagPlugin, kTagTarget); // the same number, but another class
  EXPECT_TRUE(source.CopyWithTranslation(same, 0, nullptr));
  EXPECT_TRUE(same.GetName() == String("aim") && same.GetDataInstance().GetLong(1234) == 5);
  EXPECT_FALSE(source.CopyWithTranslation(other, 0, nullptr) || source.CopyWithTranslation(disguised, 0, nullptr));

  BaseTag unknown(kTagPlugin);
  ASSERT_TRUE(ReadInto(unknown, Record(kUnknownChunk)));
  EveryFailedAllocation([&] { return std::unique_ptr<GeListNode>(unknown.MakeClone(0, nullptr)); },
                        [](const auto& clone) { return static_cast<BaseTag&>(*clone).GetRawSize() == 17; });
}

TEST(BaseTag, MakesTheTypesOfItsTable)
{
  const std::tuple<Long, Long, Long> rows[] = {
      {5600, 5600, 5600},       {5616, 5616, 5616},          {5629, 5629, 5629}, {5673, 5673, 5673},
      {5676, 5676, 5676},       {5678, 5678, 5691},          {5691, -1, 5691},   {5701, 5701, 5701},
      {1019365, 1019365, 5691}, {465000404, 465000404, 5691}};
  for (const auto& [asked, type, diskType] : rows) {
    BaseTag* tag = MakeTag(asked);
    ASSERT_NE(tag, nullptr);
    EXPECT_EQ(tag->GetType(), type) << asked;
    EXPECT_EQ(tag->GetDiskType(), diskType) << asked;
    EXPECT_EQ(tag->GetNodeData() != nullptr, asked == kTagWeight) << asked;
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
  EXPECT_TRUE(object.GetFirstTag() == newest && object.GetTag(kTagTarget) == newest);
  EXPECT_TRUE(object.GetTag(5698) == plugin && object.GetTag(kTagPlugin) == nullptr);
  EXPECT_TRUE(plugin->GetPrev() == first && plugin->GetObject() == &object);
  plugin->SetNodeData(NewObj<AnsweringData>());
  EXPECT_EQ(ParameterOf(*plugin, 5).GetLong(), 99) << "the behaviour object answers first";
  plugin->SetParameterById(6, GeData(static_cast<Long>(3)));
  EXPECT_EQ(plugin->GetDataInstance().GetLong(6), 3);
}
