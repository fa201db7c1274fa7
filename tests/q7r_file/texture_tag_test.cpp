// The texture tag: its old chunk, what it computes, and its links through files, copies and merges.
#include "support/library.h"

namespace
{

// "1000=0.5 1002=-": the numbers of these entries, with "-" where there is none.
std::string Entries(const TextureTag& tag, std::initializer_list<Long> ids)
{
  std::string text;
  for (Long id : ids) {
    const GeData* value = tag.GetDataInstance().FindData(id);
    char number[40] = "-";
    if (value)
      std::snprintf(number, sizeof number, "%.10g",
                    value->GetType() == kDataReal ? value->GetReal() : value->GetLong());
    text += (text.empty() ? "" : " ") + std::to_string(id) + "=" + number;
  }
  return text;
}

Real RealOf(TextureTag& tag, Long id)
{
  const GeData value = ParameterOf(tag, id);
  return value.GetType() == kDataLong ? value.GetLong() : value.GetReal();
}

} // namespace

TEST(TextureTag, TakesPlaceLinksAndAspectsFromItsOldChunk)
{
  const std::tuple<const char*, Long, bool, bool, const char*> rows[] = {
      {"old texture 6", 13000, true, true, "1018=1.5 1020=0.5 1200=0"},
      {"old texture 5", 11600, true, true, "1018=1.5 1020=0.5 1200=1"},
      {"old texture 4", 11600, true, true, "1018=1.333333333 1020=1 1200=1"},
      {"old texture 3", 13000, true, false, "1018=1.333333333 1020=1 1200=1"},
      {"old texture 2 before 11600", 7000, false, false, "1018=1.333333333 1020=1 1200=1"}};
  for (const auto& [name, version, hasFirst, hasSecond, entries] : rows) {
    SCOPED_TRACE(name);
    const RecordSample& sample = FindRecordSample(name);
    TextureTag tag;
    tag.TextureMatrix();
    BaseMaterial first(kMaterialStandard), second(kMaterialStandard);
    if (sample.level % 2 == 0)
      tag.GetDataInstance().RemoveData(kTextureMaterial); // the entry is made anew
    {
      ByteWriter whole;
      whole.Header("Q7R6", version).Start(110010, sample.level).Append(Record(sample.body)).End().End();
      for (const char* goal : {"05", "06"}) // headers that say no more than the id of the node's goal
        whole.Append(Record(std::string("[110050,0 L0 L0 K C1 M61676F616C3100000000000000") + goal + " S ] ]"));
      MemoryReadFile memory(whole.bytes);
      ASSERT_TRUE(tag.ReadChunkLoop(memory.file, true));
      ASSERT_TRUE(version < 7500 ||
                  (first.ReadChunkLoop(memory.file, true) && second.ReadChunkLoop(memory.file, true)));
    }
    EXPECT_TRUE(tag.Position() == Vector(1, 1.5, 0.75) && tag.Size() == Vector(2, 2.5, 1.75));
    EXPECT_TRUE(tag.Rotation() == Vector(3, 3.5, 2.75) && tag.TextureMatrix().off == Vector(1, 1.5, 0.75));
    EXPECT_EQ(tag.GetMaterial(), hasFirst ? &first : nullptr);
    EXPECT_EQ(tag.GetDataInstance().GetLink(1017), hasSecond ? &second : nullptr);
    EXPECT_EQ(Entries(tag, {1018, 1020, 1200}), entries);
  }
  TextureTag tag;
  const std::string four = FindRecordSample("old texture 4").body;
  ASSERT_TRUE(ReadInto(tag, Record("[110010,5 " + four + " L16 L0 R2 R0 ]"))); // no quotients
  EXPECT_EQ(Entries(tag, {1018, 1020}), "1018=1 1020=1");
  TextureTag untouched;
  ASSERT_TRUE(ReadInto(untouched, Record("[110010,-1 " + four + " ]")));
  EXPECT_EQ(Entries(untouched, {1000, 1002, 1011}), "1000=0 1002=1 1011=-");
  EXPECT_EQ(ReadError(untouched, Record("[110010,3 V1 L5 ]")), -100);
}

TEST(TextureTag, ComputesTilesFromLengthsAndBack)
{
  TextureTag tag;
  for (const auto& [tiles, length] : {std::tuple<Long, Long>{1014, 1002}, std::tuple<Long, Long>{1015, 1003}}) {
    ASSERT_TRUE(tag.SetParameterById(tiles, GeData(4.0)));
    EXPECT_EQ(RealOf(tag, length), 0.25);
    EXPECT_EQ(tag.GetDataInstance().GetReal(tiles), 4.0); // also an entry of its own
    ASSERT_TRUE(tag.SetParameterById(tiles, GeData(0.0)));
    EXPECT_EQ(RealOf(tag, length), 0.25);
    EXPECT_EQ(RealOf(tag, tiles), 4.0);
    for (Real tiny : {0.0, 1e-7, -1e-7}) {
      tag.SetParameterById(length, GeData(tiny));
      EXPECT_EQ(RealOf(tag, tiles), 0.0);
    }
    tag.SetParameterById(length, GeData(-1.1e-7));
    EXPECT_NEAR(RealOf(tag, tiles), -9090909.09, 0.01);
  }
  TextureTag fresh;
  const BaseContainer before = fresh.GetDataInstance();
  EXPECT_TRUE(fresh.SetParameterById(1014, GeData(0.0)));
  EXPECT_EQ(fresh.GetDataInstance().GetCount(), before.GetCount());
}

TEST(TextureTag, FindsAndStoresListedAspects)
{
  // given: by that position
  const std::tuple<Long, Long, Real, Long, Real> rows[] = {
      {10000, 1018, 1.0, 1, 1.0},
      {10000, 1018, 1.3333333333, 2, 1.3333333333333333},
      {10000, 1018, 1.7778, 3, 16.0 / 9},
      {10000, 1018, 1.7800, 0, 1.78},
      {10000, 1018, 1.4992, 4, 1.5},
      {10000, 1018, 1.5555555555555556, 5, 1.5555555555555556},
      {10000, 1018, 1.85185, 6, 1.85185},
      {10000, 1018, 2.3888888, 7, 2.38888888},
      {10000, 1018, 1.0011, 0, 1.0011},
      {10001, 1020, 0.9009, 2, 0.9},
      {10001, 1020, 1.0666, 3, 1.066666666666},
      {10001, 1020, 1.2, 4, 1.2},
      {10001, 1020, 4.0 / 3, 5, 1.3333333333333},
      {10001, 1020, 1.4222, 6, 1.422222222222},
      {10001, 1020, 2.0, 7, 2.0},
      {10001, 1020, 0.0, 0, 0.0},
  };
  for (const auto& [preset, entry, aspect, position, given] : rows) {
    TextureTag tag;
    tag.SetParameterById(entry, GeData(aspect));
    EXPECT_EQ(RealOf(tag, preset), position) << aspect;
    EXPECT_TRUE(tag.SetParameterById(preset, GeData(position)));
    EXPECT_EQ(RealOf(tag, entry), given);
    EXPECT_EQ(tag.GetDataInstance().GetLong(preset), position);
    for (Long none : {9, 8, -1})
      EXPECT_TRUE(tag.SetParameterById(preset, GeData(none)));
    EXPECT_EQ(RealOf(tag, entry), given);
  }
}

TEST(TextureTag, BuildsItsMatrixFromPlaceSizeAndRotation)
{
  TextureTag tag;
  EXPECT_EQ(tag.TextureMatrix(), Matrix({}, {100, 0, 0}, {0, 100, 0}, {0, 0, 100}));
  tag.SetPosition({1, 2, 3});
  tag.SetSize({2, 3, 4});
  EXPECT_EQ(tag.TextureMatrix(), Matrix({1, 2, 3}, {2, 0, 0}, {0, 3, 0}, {0, 0, 4}));
  // An entry alone is not seen; a parameter is, also one component.
  tag.GetDataInstance().SetVector(1012, {9, 9, 9});
  EXPECT_EQ(tag.TextureMatrix().v1, Vector(2, 0, 0));
  tag.SetParameterById(1013, GeData(Vector(0.1, 0.2, 0.3)));
  const Matrix turned = AnglesToMatrix({0.1, 0.2, 0.3}, 6);
  EXPECT_EQ(tag.TextureMatrix(), Matrix({1, 2, 3}, 9 * turned.v1, 9 * turned.v2, 9 * turned.v3));
  tag.SetParameter({{1011, 23, 0}, {1001, 19, 0}}, GeData(7.0));
  EXPECT_EQ(tag.TextureMatrix().off, Vector(1, 7, 3));
}

TEST(TextureTag, TakesAMatrixApartNearItsPresentRotation)
{
  TextureTag tag;
  tag.SetRotation({6.3, 0, 0});
  Matrix matrix = AnglesToMatrix({0.1, 0, 0}, 6);
  matrix.v1 *= 2.0;
  matrix.v3 *= 0.5;
  matrix.off = {5, 6, 7};
  tag.SetTextureMatrix(matrix);
  EXPECT_EQ(tag.Position(), Vector(5, 6, 7));
  EXPECT_NEAR(Length(tag.Size() - Vector(2, 1, 0.5)), 0.0, 1e-12);
  EXPECT_NEAR(Length(tag.Rotation() - Vector(0.1 + kTwoPi, 0, 0)), 0.0, 1e-12);
  const Matrix& back = tag.TextureMatrix();
  EXPECT_NEAR(Length(back.v1 - matrix.v1) + Length(back.v2 - matrix.v2) + Length(back.v3 - matrix.v3), 0.0, 1e-12);
  tag.SetTextureMatrix(Matrix({1, 1, 1}, {}, {}, {}));
  EXPECT_TRUE(tag.Size() == Vector() && tag.Rotation() == Vector());
}

TEST(TextureTag, CopiesItsEntriesButComputesItsMatrixAnew)
{
  TextureTag source, target;
  source.SetPosition({1, 2, 3});
  target.SetPosition({4, 4, 4});
  EXPECT_EQ(target.TextureMatrix().off, Vector(4, 4, 4));
  ASSERT_TRUE(source.CopyWithTranslation(target, 0, nullptr));
  EXPECT_EQ(target.TextureMatrix().off, Vector(1, 2, 3));
  TextureTag other;
  EXPECT_TRUE(source.CopyTextureCache(other, 0, nullptr)); // never computed: nor is it there
  EXPECT_EQ(other.TextureMatrix().off, Vector());
  target.CopyTextureCache(other, 0, nullptr);
  EXPECT_EQ(other.TextureMatrix().off, Vector(1, 2, 3));
}

TEST(TextureTag, KeepsItsMaterialThroughFilesCopiesAndMerges)
{
  DocumentPtr document = NewDocument();
  BaseObject* object = AllocObject(kObjectPlane);
  document->InsertObject(object);
  Material* material = AllocMaterial();
  document->InsertMaterial(material);
  document->InsertMaterial(AllocMaterial());
  static_cast<TextureTag*>(object->MakeTag(kTagTexture))->SetMaterial(material);

  auto expectLink = [](const char* how, BaseDocument& found) {
    auto* tag = static_cast<TextureTag*>(found.GetFirstObject()->GetTag(kTagTexture));
    ASSERT_NE(tag, nullptr) << how;
    EXPECT_EQ(tag->GetMaterial(&found), found.GetFirstMaterial()->GetNext()) << how;
    EXPECT_NE(tag->GetMaterial(&found), nullptr) << how;
  };
  expectLink("as made", *document);
  DocumentPtr read = LoadFromBytes(SaveToBytes(*document));
  ASSERT_NE(read, nullptr);
  expectLink("read", *read);
  DocumentPtr copy(static_cast<BaseDocument*>(read->MakeClone(0, nullptr)));
  ASSERT_NE(copy, nullptr);
  expectLink("copied", *copy);
  std::unique_ptr<GeListNode> clone(read->GetFirstObject()->MakeClone(0, nullptr));
  auto* tag = static_cast<TextureTag*>(static_cast<BaseObject&>(*clone).GetTag(kTagTexture));
  EXPECT_EQ(tag->GetMaterial(), read->GetFirstMaterial()->GetNext()); // the copy of an object stays with the material
  EXPECT_EQ(tag->GetMaterial(document.get()), nullptr);               // which is another document's

  TempFolder folder;
  Filename name;
  name.SetString(String((folder / "scene.q7r").c_str(), STRINGENCODING_UTF8));
  ASSERT_TRUE(SaveDocument(copy.get(), name, 0));
  ASSERT_TRUE(MergeDocument(read.get(), name, LoadObjects | LoadMaterials));
  expectLink("merged", *read);
  EXPECT_EQ(read->GetMaterialRoot()->GetCount(), 4);
}
