// The texture tag: its defaults, its old chunk, what it computes, and its links through files, copies and merges.
#include <cmath>
#include <functional>
#include <memory>

#include <gtest/gtest.h>

#include "q7r_file/tag_bytes.h"
#include "support/scene_bytes.h"
#include "support/temp_folder.h"
#include "support/text.h"
#include "torvane/materials/material.h"
#include "torvane/math/ge_math.h"
#include "torvane/objects/base_object.h"
#include "torvane/tags/texture_tag.h"

namespace
{

using namespace _torvane_;

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
  GeData value;
  EXPECT_TRUE(tag.GetParameterById(id, value));
  return value.GetType() == kDataLong ? value.GetLong() : value.GetReal();
}

ByteWriter OldChunk(Long version, Long level, Long height, Real pixelHeight)
{
  const bool old = version < 11600;
  ByteWriter chunk;
  chunk.Start(110010, level).Vector(1, 2, 3).Vector(4, 5, 6).Vector(0.1, 0.2, 0.3);
  if (old)
    chunk.IdentityMatrix().IdentityMatrix();
  chunk.Real(0.5).Real(0.25).Real(2.0).Real(4.0).Bool(false).Bool(true).Bool(true).Long(6).Long(7);
  if (old)
    chunk.Long(98).Long(99);
  if (level >= 1)
    chunk.String(u"skin");
  if (level >= 2 && old)
    chunk.Bool(true);
  if (level >= 3)
    chunk.Memory(Link(5));
  if (level >= 4)
    chunk.Memory(Link(6));
  if (level >= 5)
    chunk.Long(16).Long(height).Real(1.8).Real(pixelHeight);
  if (level >= 6)
    chunk.Bool(false);
  return chunk.Long(77).End();
}

// A node header that says no more than the id of the node's goal.
Bytes HeaderWithGoal(std::uint8_t id)
{
  ByteWriter header;
  header.Start(110050, 0).Long(0).Long(0).Start(132, 1).Long(-1).End().UChar(1);
  header.Memory(std::string("agoal1\0\0\0\0\0\0\0", 13) + static_cast<char>(id)).String(u"");
  return header.End().End().bytes;
}

} // namespace

TEST(TextureTag, HasItsDefaultsInFileOrderAndNoChunkOfItsOwn)
{
  TextureTag tag;
  auto real = [](const char* id, const char* bits) { return std::string("0F") + id + "0F 00000013 13" + bits; };
  auto integer = [](const char* id, const char* value) { return std::string("0F") + id + "0F 0000000F 0F" + value; };
  const std::string link = "0F 00000085 80 0000000E 616C69617332 0000000000000000";
  const std::string zero = "0000000000000000";
  const std::string one = "3FF0000000000000";
  const std::string hex =
      "01 00000084 00000001 0F FFFFFFFF" + real("000003E8", zero.c_str()) + real("000003E9", zero.c_str()) +
      real("000003EA", one.c_str()) + real("000003EB", one.c_str()) + integer("000003EC", "00000000") +
      integer("000003ED", "00000000") + integer("000003EF", "00000001") + integer("000003F0", "00000000") +
      integer("000003F1", "00000000") + "0F 000003F2" + link +
      "0F 000003F4 0F 00000017 17 4059000000000000 4059000000000000 4059000000000000" + "0F 000003F9" + link +
      real("000003FA", "3FF5555555530AED") + real("000003FC", one.c_str()) + integer("000004B0", "00000001") +
      real("000004B1", zero.c_str()) + real("000004B2", zero.c_str()) + "02";
  const Bytes bytes = WriteToMemory([&](HyperFile& file) { file.WriteContainer(tag.GetDataInstance()); });
  EXPECT_EQ(ToHex(bytes), ToHex(FromHex(hex)));
  EXPECT_EQ(ToHex(OwnChunks(tag)), "");
}

TEST(TextureTag, ReadsEveryLevelOfItsOldChunk)
{
  for (Long version : {7000, 11599, 11600, 13000}) {
    for (Long level = 0; level <= 7; ++level) {
      TextureTag tag;
      tag.TextureMatrix();
      BaseMaterial first(kMaterialStandard);
      BaseMaterial second(kMaterialStandard);
      if (level % 2 == 0)
        tag.GetDataInstance().RemoveData(kTextureMaterial); // the entry is made anew
      {
        ByteWriter whole;
        whole.Header("Q7R6", version).Append(OldChunk(version, level, 9, 2.0).bytes).End();
        const std::int32_t node = version < 7500 ? 0 : 1;
        if (node)
          whole.Append(HeaderWithGoal(5)).Append(HeaderWithGoal(6));
        MemoryReadFile memory(whole.bytes);
        ASSERT_TRUE(tag.ReadChunkLoop(memory.file, true)) << version << '/' << level;
        ASSERT_TRUE(!node || (first.ReadChunkLoop(memory.file, true) && second.ReadChunkLoop(memory.file, true)));
      }
      EXPECT_EQ(Entries(tag, {1000, 1001, 1002, 1003, 1004, 1005, 1007, 1008, 1009}),
                "1000=0.5 1001=0.25 1002=2 1003=4 1004=6 1005=7 1007=0 1008=1 1009=1");
      EXPECT_EQ(tag.Position(), Vector(1, 2, 3));
      EXPECT_EQ(tag.Size(), Vector(4, 5, 6));
      EXPECT_EQ(tag.Rotation(), Vector(0.1, 0.2, 0.3));
      EXPECT_EQ(tag.TextureMatrix().off, Vector(1, 2, 3));
      EXPECT_EQ(tag.GetDataInstance().GetString(1006), String(level >= 1 ? "skin" : ""));
      EXPECT_EQ(tag.GetMaterial(), level >= 3 && version >= 7500 ? &first : nullptr) << version << '/' << level;
      EXPECT_EQ(tag.GetDataInstance().GetLink(1017), level >= 4 && version >= 7500 ? &second : nullptr);
      EXPECT_EQ(Entries(tag, {1018, 1020, 1200}),
                std::string(level >= 5 ? "1018=1.777777778 1020=0.9" : "1018=1.333333333 1020=1") +
                    (level >= 6 ? " 1200=0" : " 1200=1"));
    }
  }
  TextureTag tag;
  ASSERT_TRUE(ReadInto(tag, OldChunk(13000, 5, 0, 0.0).bytes));
  EXPECT_EQ(Entries(tag, {1018, 1020}), "1018=1 1020=1");
  TextureTag untouched;
  ASSERT_TRUE(ReadInto(untouched, OldChunk(13000, -1, 1, 1).bytes));
  EXPECT_EQ(Entries(untouched, {1000, 1002, 1011}), "1000=0 1002=1 1011=-");
  EXPECT_EQ(ReadError(untouched, ByteWriter().Start(110010, 3).Vector(1, 2, 3).Long(5).End().bytes), -100);
}

TEST(TextureTag, IsNamedWhenTheFileHasNoName)
{
  TextureTag tag;
  const Bytes unnamed = BytesOf(tag);
  ASSERT_TRUE(ReadInto(tag, unnamed));
  EXPECT_EQ(tag.GetName(), String("Texture"));
}

TEST(TextureTag, ComputesTilesFromLengthsAndBack)
{
  TextureTag tag;
  struct Row
  {
    Long tiles;
    Long length;
  };
  for (const Row& row : {Row{1014, 1002}, Row{1015, 1003}}) {
    ASSERT_TRUE(tag.SetParameterById(row.tiles, GeData(4.0)));
    EXPECT_EQ(RealOf(tag, row.length), 0.25);
    EXPECT_EQ(tag.GetDataInstance().GetReal(row.tiles), 4.0); // also an entry of its own
    ASSERT_TRUE(tag.SetParameterById(row.tiles, GeData(0.0)));
    EXPECT_EQ(RealOf(tag, row.length), 0.25);
    EXPECT_EQ(RealOf(tag, row.tiles), 4.0);
    for (Real tiny : {0.0, 1e-7, -1e-7}) {
      tag.SetParameterById(row.length, GeData(tiny));
      EXPECT_EQ(RealOf(tag, row.tiles), 0.0);
    }
    tag.SetParameterById(row.length, GeData(-1.1e-7));
    EXPECT_NEAR(RealOf(tag, row.tiles), -9090909.09, 0.01);
  }
  TextureTag fresh;
  const BaseContainer before = fresh.GetDataInstance();
  EXPECT_TRUE(fresh.SetParameterById(1014, GeData(0.0)));
  EXPECT_EQ(fresh.GetDataInstance().GetCount(), before.GetCount());
}

TEST(TextureTag, FindsAndStoresListedAspects)
{
  struct Row
  {
    Long preset;
    Long entry;
    Real aspect;
    Long position;
    Real given; // by that position
  };
  const Row rows[] = {
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
  for (const Row& row : rows) {
    TextureTag tag;
    tag.SetParameterById(row.entry, GeData(row.aspect));
    EXPECT_EQ(RealOf(tag, row.preset), row.position) << row.aspect;
    EXPECT_TRUE(tag.SetParameterById(row.preset, GeData(row.position)));
    EXPECT_EQ(RealOf(tag, row.entry), row.given);
    EXPECT_EQ(tag.GetDataInstance().GetLong(row.preset), row.position);
    for (Long none : {9, 8, -1})
      EXPECT_TRUE(tag.SetParameterById(row.preset, GeData(none)));
    EXPECT_EQ(RealOf(tag, row.entry), row.given);
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
  EXPECT_EQ(tag.Size(), Vector());
  EXPECT_EQ(tag.Rotation(), Vector());
}

TEST(TextureTag, CopiesItsEntriesButComputesItsMatrixAnew)
{
  TextureTag source;
  TextureTag target;
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
