// Materials: their channels, what becomes of types that the library doesn't know, shader
// slots, and the links between tags, materials and shaders.
#include "support/library.h"

namespace
{

constexpr Long kUnknownType = 1012345;
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

TEST(Material, AnswersForEveryChannelNumber)
{
  Material material;
  EXPECT_EQ(StatesOf(material), "10000000100000");
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

TEST(Material, WritesItsShadersBeforeAllElse)
{
  Material material;
  material.BindChannelBitmap(8000, Filename("B"));
  const std::string head = ToHex(Record("[110131,0 [110100,0 [5707,0 [110050,7"));
  EXPECT_EQ(ToHex(BytesOf(material)).substr(0, head.size()), head);
}

TEST(Material, PassesOverOldChannelChunks)
{
  for (const char* level : {"0", "1"}) {
    const std::string old = std::string("[5704,") + level + " V1 R1 Sfile R1 L1 L2 V1 R1 R2 ";
    const std::string end = *level == '1' ? "Ffile ]" : "]";
    BaseChannel channel;
    EXPECT_TRUE(ReadInto(channel, Record(old + end), 7499)) << level;
    EXPECT_TRUE(ReadInto(channel, Record(old + "B1 B1 " + end), 7500)) << level;
  }
  BaseChannel channel;
  MemoryReadFile memory(ByteWriter().Header().bytes);
  EXPECT_TRUE(channel.ReadChunk(memory.file, 5706, 0) && channel.ReadChunk(memory.file, 5707, 0));
  EXPECT_FALSE(channel.ReadChunk(memory.file, 5708, 0));
}

TEST(Material, OfAnUnknownTypeComesBackByteForByte)
{
  DocumentPtr document = NewDocument();
  auto* material = static_cast<BaseMaterial*>(document->GetMaterialRoot()->AllocMember(kMaterialPlugin));
  // The level and content that its program gave the chunk.
  const Bytes own = Record("[110064,7 L1012345 L0 SMat R2.5 [5,6 L1 ] ] "
                           "[110012,2 SStone X8100000004FFD80102 2( X8100000000 ) B0 ]");
  ASSERT_TRUE(ReadInto(*material, own));
  material->SetName("Stone");
  material->InsertShaderLast(MakeShader(kUnknownType));
  document->InsertMaterial(material);
  for (int generation = 0; generation < 2; ++generation) {
    material = Reloaded(document);
    ASSERT_NE(material, nullptr);
    EXPECT_TRUE(material->GetType() == kUnknownType && material->GetDiskType() == 5705);
    EXPECT_TRUE(material->IsInstanceOf(kUnknownType));
    EXPECT_FALSE(material->GetInfo() & kMaterialNoPreview);
    ASSERT_NE(material->GetShaders(), nullptr);
    EXPECT_EQ(material->GetShaders()->GetType(), kUnknownType);
    const std::string bytes = ToHex(BytesOf(*material));
    EXPECT_EQ(bytes.substr(bytes.size() - ToHex(own).size()), ToHex(own));
    auto* clone = static_cast<BaseMaterial*>(material->MakeClone(0, nullptr));
    const std::string copied = ToHex(BytesOf(*clone));
    EXPECT_EQ(copied.substr(copied.size() - ToHex(own).size()), ToHex(own));
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
      EXPECT_TRUE(each->GetType() == seen && each->GetDiskType() == disk);
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
  Material material;
  BaseShader* first = material.BindChannelBitmap(8000, Filename("a.png"));
  ASSERT_NE(first, nullptr);
  EXPECT_EQ(material.BindChannelBitmap(8000, Filename("b.png")), first);
  EXPECT_EQ(Utf8(first->BitmapFilename().GetString()), "a.png");
  BaseShader* second = material.BindChannelShader(8000, kUnknownType);
  EXPECT_TRUE(material.ChannelShaderOf(8000) == second && material.ChannelShaderOf(8001) == nullptr);
  EXPECT_TRUE(material.ChannelShaderOf(2100) == nullptr && material.GetShaders() == first);
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
