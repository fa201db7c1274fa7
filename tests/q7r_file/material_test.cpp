// Materials: their defaults, their chunks in every form, what becomes of types that the library doesn't know, shader
// slots, and the links between tags, materials and shaders.
#include <functional>
#include <sstream>

#include <gtest/gtest.h>

#include "q7r_file/node_bytes.h"
#include "support/counting_memory.h"
#include "support/every_failed_allocation.h"
#include "support/scene_bytes.h"
#include "support/temp_folder.h"
#include "support/text.h"
#include "torvane/materials/material.h"
#include "torvane/shaders/base_shader.h"
#include "torvane/tags/texture_tag.h"
#include "torvane/values/ge_data.h"

namespace
{

using namespace _torvane_;

constexpr Long kUnknownType = 1012345;
const Bytes kPicture = {0xFF, 0xD8, 0x01, 0x02};
const Bytes kNothing;

// The kinds of the tables below.
const std::string kBool = "Bool", kLong = "Long", kReal = "Real", kVector = "Vector", kLink = "link";

struct Defaults
{
  const std::string& kind;
  double value;
  const char* ids;
};

const Defaults kBaseDefaults[] = {{kLong, 0, "500 1104 1118"},
                                  {kBool, 0, "501 1106 1107 1117"},
                                  {kBool, 1, "1100 1101 1108 1109"},
                                  {kReal, 1, "1102 1105 1112 1113 1114 1115 1116"},
                                  {kReal, 0.65, "1103"},
                                  {kReal, 10, "1110"},
                                  {kReal, 100, "1111"},
                                  {kLong, 128, "1119"}};

const Defaults kStandardDefaults[] = {
    {kVector, 0.8, "2100"},
    {kVector, 1, "2300 2400 2500 2600 2700 2900 3100 3200 2405"},
    {kReal, 1, "2101 2301 2401 2501 2601 2701 3101 3201 2200 2102 2302 2402 2502 2602 3102 2201"},
    {kLong, 0, "2103 2303 2403 2503 3103 2202"},
    {kLong, 3, "2603"},
    {kBool, 1, "1000 1003 1010 1012 1013 1024 1028 2050 2051 2052 2053 2055 2057 2058 2059 2060 2063"},
    {kBool, 1, "2407 3205 3206 3209 3211"},
    {kBool, 0, "1001 1002 1004 1014 1027 2411 2511 8022 3202 3207 3208 3212 3302 3303 3304 3306"},
    {kReal, 1, "1005 1006 1007 1019 1023 1025 1138 2404 3300"},
    {kReal, 1000, "1008"},
    {kReal, 0.2, "1009 1017"},
    {kVector, 0.1, "1011"},
    {kReal, 0.5, "1016 1121 1131 1135"},
    {kLong, 0, "1018 1134 3305"},
    {kReal, 5, "1020 1026"},
    {kReal, 10, "1021"},
    {kReal, 0, "1022 1136 1137 1139 8020 8021"},
    {kLong, 5, "1122 1132"},
    {kLong, 128, "1123 1133"},
    {kReal, 100, "2406"},
    {kVector, 0, "2408"},
    {kLong, 4, "3203"},
    {kLong, 1, "3210"},
    {kLink, 0, "8000 8001 8002 8003 8004 8005 8006 8007 8008 8009 8012"}};

// Expects the entries of the rows in the container; gives their number.
template <std::size_t N>
Long ExpectDefaults(const BaseContainer& data, const Defaults (&rows)[N])
{
  Long count = 0;
  for (const Defaults& row : rows) {
    std::istringstream ids(row.ids);
    for (Long id = 0; ids >> id; ++count) {
      SCOPED_TRACE(id);
      const GeData& value = data.GetData(id);
      if (row.kind == kVector)
        EXPECT_TRUE(value.GetVector() == Vector(row.value, row.value, row.value));
      else if (row.kind == kLink)
        EXPECT_TRUE(value.GetAliasLink() && !value.GetLink());
      else
        EXPECT_EQ(value.GetReal(), row.value);
      EXPECT_EQ(value.GetType(), row.kind == kVector ? 23 : row.kind == kLink ? 133 : row.kind == kReal ? 19 : 15);
    }
  }
  return count;
}

// The node chunks of a material named "A" with no entry in its container.
std::string NodeHex(const std::string& info, const std::string& container = "")
{
  return "01 0001ADE2 00000007  0F " + info + "  0F 00000000  01 00000084 00000001 0F FFFFFFFF" + container +
         "02  0C 00  82 00000002 0041  0F 00000000  0F 00000001 0F 00000000  80 0000000E 616C69617332 0000000000000000"
         "0C 01 80 00000010 000102030405060708090A0B0C0D0E0F  15 00  02"
         "01 0001ADF5 00000002  0F 00000004  0F 00000000 0F 00000000 0F 00000000 0F 00000000  0C 00  02";
}

void MakePlain(BaseMaterial& material)
{
  material.SetName("A");
  material.GetDataInstance().Flush();
  SetCountingMarker(material);
}

// A chunk (110069, 2) that sets the first word of node bits: seen when what stood before it was read in step.
void AppendWitness(ByteWriter& w) { w.Start(110069, 2).Long(4).Long(99).Long(0).Long(0).Long(0).UChar(0).End(); }

std::string StatesOf(const Material& material)
{
  std::string states;
  for (Long channel = 0; channel <= 12; ++channel)
    states += material.ChannelIsOn(channel) ? '1' : '0';
  return states + (material.ChannelIsOn(-1) ? '1' : '0');
}

BaseMaterial* Reloaded(DocumentPtr& document)
{
  document = LoadFromBytes(SaveToBytes(*document));
  return document ? document->GetFirstMaterial() : nullptr;
}

} // namespace

TEST(Material, StartsWithEveryDefault)
{
  Material material;
  const Long common = ExpectDefaults(material.GetDataInstance(), kBaseDefaults);
  EXPECT_EQ(common + ExpectDefaults(material.GetDataInstance(), kStandardDefaults),
            material.GetDataInstance().GetCount());
  EXPECT_EQ(StatesOf(material), "10000000100000");
  BaseMaterial other(kMaterialPlugin, kUnknownType);
  EXPECT_EQ(ExpectDefaults(other.GetDataInstance(), kBaseDefaults), other.GetDataInstance().GetCount());
}

TEST(Material, AnswersForEveryChannelNumber)
{
  Material material;
  EXPECT_EQ(material.ChannelAt(50), material.ChannelAt(0));
  EXPECT_NE(material.ChannelAt(-1), material.ChannelAt(0));
  EXPECT_EQ(material.ChannelAt(3)->GetType(), 5899);
  material.SwitchChannel(-1, 1);
  material.SwitchChannel(12, 1);
  for (Long none : {-2, 13, 50}) {
    material.SwitchChannel(none, 1);
    EXPECT_EQ(material.ChannelIsOn(none), 0);
  }
  EXPECT_EQ(StatesOf(material), "10000000100011");

  const Long rows[][5] = {{0, 2100, 2101, 2102, 2103},
                          {4, 2600, 2601, 2602, 2603},
                          {5, 2700, 2701, 0, 0},
                          {7, 2900, 0, 0, 0},
                          {10, 3200, 3201, 0, 0},
                          {12, 0, 2200, 2201, 2202},
                          {6, 0, 0, 0, 0},
                          {8, 0, 0, 0, 0},
                          {-1, 0, 0, 0, 0}};
  for (const auto& row : rows) {
    Long ids[4] = {1, 1, 1, 1};
    Material::ChannelParameterIds(row[0], ids[0], ids[1], ids[2], ids[3]);
    for (int i = 0; i < 4; ++i)
      EXPECT_EQ(ids[i], row[i + 1]) << "channel " << row[0];
  }
}

TEST(Material, WritesItsChunksByteForByte)
{
  const std::string empty = "81 00000000";
  BaseMaterial plugin(kMaterialPlugin, kUnknownType);
  MakePlain(plugin);
  EXPECT_EQ(ToHex(BytesOf(plugin)),
            ToHex(FromHex(NodeHex("00000020") +
                          "01 0001ADF0 00000005 0F 000F7279 0F 00000000 82 00000006 004D00610074 02"
                          "01 0001ADBC 00000002 82 00000002 0041" +
                          empty + empty + empty + "15 00 02")));

  Material material;
  MakePlain(material);
  material.GetPreview().SetEncoded(kPicture.data(), 4);
  material.SwitchChannel(-1, 1);
  BaseShader* shader = material.BindChannelBitmap(8000, Filename("B"));
  MakePlain(material);
  SetCountingMarker(*shader);
  std::string states;
  for (int i = 0; i < 14; ++i)
    states += (i == 0 || i == 8 || i == 13 ? "15 01" : "15 00") + std::string("01 0000170B 00000000 02");
  const std::string bytes = ToHex(BytesOf(material));
  const std::string head = ToHex(FromHex("01 0001AE33 00000000 01 0001AE14 00000000 01 0000164B 00000000 01 0001ADE2"));
  const std::string tail =
      ToHex(FromHex(NodeHex("00000000") + "01 0001ADBC 00000002 82 00000002 0041 81 00000004 FFD80102" + empty + empty +
                    "15 00 02  01 00001647 00000000" + states + "02"));
  EXPECT_EQ(bytes.substr(0, head.size()), head); // the shaders stand before all else
  EXPECT_EQ(bytes.substr(bytes.size() - tail.size()), tail);
}

TEST(Material, ReadsChannelsOfEveryAgeAndStaysInStep)
{
  const auto states = [](ByteWriter& w, int count, bool chunks) {
    for (int i = 0; i < count; ++i) {
      w.Bool(i % 2 == 1); // the opposite of a new material's first two
      if (chunks)
        w.Start(5899, 0).End();
    }
  };
  const auto surface = [](ByteWriter& w) {
    w.Bool(false).Bool(true).Real(2).Real(2).Real(2).Real(2).Real(2).Bool(false).Vector(2, 2, 2).Bool(false);
    w.Bool(false).Bool(true).Real(8).Real(2).Long(2).Real(2).Real(2).Real(2).Real(2).Real(2).Bool(false).Real(2).Real(
        2);
  };
  struct Case
  {
    Long version, level;
    const char* states;
    std::function<void(ByteWriter&)> body;
  };
  const Case cases[] = {
      {7499, 0, "01010101010100", [&](ByteWriter& w) { states(w, 12, false), surface(w); }},
      {7499, 1, "01010101010100", [&](ByteWriter& w) { states(w, 13, false), surface(w), w.Bool(false).Bool(true); }},
      {7499, 2, "01010101010100",
       [&](ByteWriter& w) { states(w, 13, false), surface(w), w.Bool(false).Bool(true).Bool(true); }},
      {7499, 4, "01010101010100",
       [&](ByteWriter& w) {
         states(w, 13, false), surface(w);
         w.Bool(false).Bool(true).Bool(true).Start(132, 1).Long(-1).Long(1009).Long(15).Long(7).End().Bool(true);
       }},
      {7499, 9, "01010101010100",
       [&](ByteWriter& w) {
         states(w, 13, false), surface(w);
         w.Bool(false).Bool(true).Bool(true).Start(132, 1).Long(-1).End().Bool(true).Long(5).Start(6, 6).End();
       }},
      {7500, 0, "01010101010100", [&](ByteWriter& w) { states(w, 13, true); }},
      {9399, 0, "01010101010100", [&](ByteWriter& w) { states(w, 13, true); }},
      {9400, 0, "01010101010101", [&](ByteWriter& w) { states(w, 14, true), w.Real(1); }},
      {13000, 0, "01010101010101",
       [&](ByteWriter& w) {
         states(w, 13, true);
         // A channel that holds what old channels did: not this material's.
         w.Bool(true).Start(5899, 0).Start(5704, 0).Vector(1, 1, 1).End().End();
       }},
  };
  for (const Case& c : cases) {
    SCOPED_TRACE(::testing::Message() << "version " << c.version << " level " << c.level);
    ByteWriter w;
    w.Start(5703, c.level);
    c.body(w);
    w.End();
    AppendWitness(w);
    Material material;
    ASSERT_TRUE(ReadInto(material, w.bytes, c.version));
    EXPECT_EQ(material.GetNBit(-1), 99U);
    EXPECT_EQ(StatesOf(material), c.states);
    ExpectDefaults(material.GetDataInstance(), kBaseDefaults);
    ExpectDefaults(material.GetDataInstance(), kStandardDefaults);
  }
}

TEST(Material, PassesOverOldChannelChunks)
{
  for (Long version : {7499, 7500}) {
    for (Long level : {0, 1}) {
      ByteWriter w;
      w.Start(5704, level)
          .Vector(1, 2, 3)
          .Real(1)
          .String(u"file")
          .Real(1)
          .Long(1)
          .Long(2)
          .Vector(1, 2, 3)
          .Real(1)
          .Real(2);
      if (version >= 7500)
        w.Bool(true).Bool(true);
      if (level >= 1)
        w.Filename(u"file");
      w.End();
      BaseChannel channel;
      EXPECT_TRUE(ReadInto(channel, w.bytes, version)) << version << ' ' << level;
    }
  }
  BaseChannel channel;
  MemoryReadFile memory(ByteWriter().Header().bytes);
  EXPECT_TRUE(channel.ReadChunk(memory.file, 5706, 0));
  EXPECT_TRUE(channel.ReadChunk(memory.file, 5707, 0));
  EXPECT_FALSE(channel.ReadChunk(memory.file, 5708, 0));
}

TEST(Material, WithoutANameIsCalledMatOnceItsHeaderIsRead)
{
  for (Long version : {7499, 13000}) {
    ByteWriter w;
    w.Start(110050, 0).Long(0).Long(0).Start(132, 1).Long(-1).End().UChar(0).String(u"").End();
    Material standard;
    BaseMaterial other(kMaterialPlugin);
    EXPECT_TRUE(ReadInto(standard, w.bytes, version) && ReadInto(other, w.bytes, version));
    EXPECT_EQ(Utf8(standard.GetName()), "Mat");
    EXPECT_EQ(Utf8(other.GetName()), "");
  }
}

TEST(Material, OfAnUnknownTypeComesBackByteForByte)
{
  const counting_memory::BalanceCheck balance;
  DocumentPtr document = NewDocument();
  auto* material = static_cast<BaseMaterial*>(document->GetMaterialRoot()->AllocMember(kMaterialPlugin));
  // The level and content that its program gave the chunk.
  ByteWriter own;
  own.Start(110064, 7).Long(kUnknownType).Long(0).String(u"Mat").Real(2.5).Start(5, 6).Long(1).End().End();
  own.Start(110012, 2).String(u"Stone").Image(kPicture).Image(kNothing).Image(kNothing).Bool(false).End();
  ASSERT_TRUE(ReadInto(*material, own.bytes));
  material->SetName("Stone");
  material->InsertShaderLast(MakeShader(kUnknownType));
  document->InsertMaterial(material);
  for (int generation = 0; generation < 2; ++generation) {
    material = Reloaded(document);
    ASSERT_NE(material, nullptr);
    EXPECT_EQ(material->GetType(), kUnknownType);
    EXPECT_EQ(material->GetDiskType(), 5705);
    EXPECT_TRUE(material->IsInstanceOf(kUnknownType));
    EXPECT_FALSE(material->GetInfo() & kMaterialNoPreview);
    ASSERT_NE(material->GetShaders(), nullptr);
    EXPECT_EQ(material->GetShaders()->GetType(), kUnknownType);
    const std::string bytes = ToHex(BytesOf(*material));
    EXPECT_EQ(bytes.substr(bytes.size() - ToHex(own.bytes).size()), ToHex(own.bytes));
    auto* clone = static_cast<BaseMaterial*>(material->MakeClone(0, nullptr));
    const std::string copied = ToHex(BytesOf(*clone));
    EXPECT_EQ(copied.substr(copied.size() - ToHex(own.bytes).size()), ToHex(own.bytes));
    auto* bare = static_cast<BaseMaterial*>(material->MakeClone(kCopyNoMaterialExtra, nullptr));
    EXPECT_EQ(bare->GetPreview().GetEncodedSize(), 0);
    DeleteObj(clone);
    DeleteObj(bare);
  }
}

TEST(Material, IsMadeAndClonedByItsType)
{
  const Long types[][3] = {{5703, 5703, 5703}, {5705, -1, 5705}, {kUnknownType, kUnknownType, 5705}};
  for (const auto& [type, seen, disk] : types) {
    BaseMaterial* material = MakeMaterial(type);
    auto* clone = static_cast<BaseMaterial*>(material->MakeClone(0, nullptr));
    for (BaseMaterial* each : {material, clone}) {
      EXPECT_EQ(each->GetType(), seen);
      EXPECT_EQ(each->GetDiskType(), disk);
      EXPECT_EQ(NodeCast<Material>(each) != nullptr, type == 5703);
      EXPECT_TRUE(each->Execute());
    }
    DeleteObj(material);
    DeleteObj(clone);
  }
  // A plug-in's type with the number of the standard material stays a plug-in's.
  BaseMaterial odd(kMaterialPlugin, 5703);
  auto* clone = static_cast<BaseMaterial*>(odd.MakeClone(0, nullptr));
  EXPECT_EQ(clone->GetDiskType(), 5705);
  DeleteObj(clone);
}

TEST(Material, BindsShadersToItsSlots)
{
  const counting_memory::BalanceCheck balance;
  Material material;
  BaseShader* first = material.BindChannelBitmap(8000, Filename("a.png"));
  ASSERT_NE(first, nullptr);
  EXPECT_EQ(material.BindChannelBitmap(8000, Filename("b.png")), first);
  EXPECT_EQ(Utf8(first->BitmapFilename().GetString()), "a.png");
  BaseShader* second = material.BindChannelShader(8000, kUnknownType);
  EXPECT_EQ(material.ChannelShaderOf(8000), second);
  EXPECT_EQ(material.ChannelShaderOf(8001), nullptr);
  EXPECT_EQ(material.ChannelShaderOf(2100), nullptr);
  EXPECT_EQ(material.GetShaders(), first);
  EXPECT_EQ(first->GetNext(), second);
  EXPECT_EQ(second->GetUp(), nullptr);
  // A link that names no shader is no shader of the slot.
  material.GetDataInstance().SetLink(8002, &material);
  EXPECT_EQ(material.ChannelShaderOf(8002), nullptr);
  EXPECT_EQ(SetMaterialBitmap(nullptr, 8000, Filename("a")), nullptr);
}

TEST(Material, SurvivesTheLackOfMemoryAtEveryStep)
{
  for (bool isBitmap : {true, false}) {
    EveryFailedAllocation([isBitmap] {
      const Owned<Material> material(NewObj<Material>());
      if (!material)
        return false;
      const bool done = isBitmap
                            ? material->BindChannelBitmap(8000, Filename("a picture of a long name.png")) != nullptr
                            : material->BindChannelShader(8000, kUnknownType) != nullptr;
      EXPECT_EQ(material->GetShaders() != nullptr, done); // none is left behind half made
      return done;
    });
  }
}

// ---------------------------------------------------------------------------------------------------------------

namespace
{

// Two objects, each with a texture tag on a material whose first slot is bound to a shader, crosswise: the first object
// has the second material.
DocumentPtr MakeLinkedScene(const char* prefix)
{
  DocumentPtr document = NewDocument();
  BaseMaterial* materials[2];
  for (int i = 0; i < 2; ++i) {
    Material* material = AllocMaterial();
    material->SetName(String(prefix) + String::FromLong(i));
    // The bound shader is the last one of two.
    material->InsertShaderLast(MakeShader(kUnknownType));
    material->BindChannelBitmap(8000, Filename((std::string(prefix) + std::to_string(i)).c_str()));
    document->InsertMaterial(material);
    materials[i] = material;
  }
  for (int i = 0; i < 2; ++i) {
    BaseObject* object = AllocObject(kObjectNull);
    object->SetName(String(prefix) + String::FromLong(i));
    document->InsertObject(object);
    static_cast<TextureTag*>(object->MakeTag(kTagTexture))->SetMaterial(materials[1 - i]);
  }
  return document;
}

// Expects of each object that its tag names the other number's material, and that one its own shader.
void ExpectLinks(BaseDocument& document, int objects)
{
  for (BaseObject* object = document.GetFirstObject(); object; object = object->GetNext(), --objects) {
    std::string name = Utf8(object->GetName());
    SCOPED_TRACE(name);
    name.back() = name.back() == '0' ? '1' : '0';
    BaseList2D* material = static_cast<TextureTag*>(object->GetTag(kTagTexture))->GetMaterial(&document);
    ASSERT_NE(material, nullptr);
    EXPECT_EQ(Utf8(material->GetName()), name);
    EXPECT_EQ(material->GetDocument(), &document);
    BaseShader* shader = static_cast<Material*>(material)->ChannelShaderOf(8000);
    ASSERT_NE(shader, nullptr);
    EXPECT_EQ(shader, material->GetShaders()->GetNext());
    EXPECT_EQ(Utf8(shader->BitmapFilename().GetString()), name);
  }
  EXPECT_EQ(objects, 0);
}

} // namespace

TEST(MaterialLinks, SurviveFileCopyAndMerge)
{
  const counting_memory::BalanceCheck balance;
  DocumentPtr document = MakeLinkedScene("a");
  ExpectLinks(*document, 2);
  ASSERT_NE(Reloaded(document), nullptr);
  ExpectLinks(*document, 2);
  DocumentPtr copy(static_cast<BaseDocument*>(document->MakeClone(0, nullptr)));
  ASSERT_NE(copy, nullptr);
  document.reset();
  ExpectLinks(*copy, 2);

  const TempFolder folder;
  for (const char* prefix : {"b", "c"}) {
    WriteWholeFile(folder / prefix, SaveToBytes(*MakeLinkedScene(prefix)));
    ASSERT_TRUE(MergeDocument(copy.get(), Filename((folder / prefix).c_str()), LoadObjects | LoadMaterials));
  }
  ExpectLinks(*copy, 6);
  ASSERT_NE(Reloaded(copy), nullptr);
  ExpectLinks(*copy, 6);
}

TEST(MaterialLinks, OfACopiedMaterialLeadToItsOwnShaders)
{
  Material material;
  BaseShader* shader = material.BindChannelBitmap(8000, Filename("a.png"));
  Material outside;
  material.GetDataInstance().SetLink(8001, &outside);
  material.SwitchChannel(5, 1);
  auto* clone = static_cast<Material*>(material.MakeClone(0, nullptr));
  ASSERT_NE(clone, nullptr);
  EXPECT_NE(clone->ChannelShaderOf(8000), shader);
  EXPECT_EQ(clone->ChannelShaderOf(8000), clone->GetShaders());
  EXPECT_EQ(clone->GetDataInstance().GetLink(8001), &outside);
  EXPECT_EQ(StatesOf(*clone), "10000100100000");
  DeleteObj(clone);
}
