#include <filesystem>

#include "export_fixture.h"

namespace
{

using namespace export_test;

// "name" for each material, from the first on.
std::string Materials(const BaseDocument& document)
{
  std::string names;
  for (BaseMaterial* material = document.GetFirstMaterial(); material; material = material->GetNext())
    names += (names.empty() ? "" : " ") + Text(material->GetName());
  return names;
}

Material* MaterialOf(const BaseObject& object)
{
  BaseTag* tag = object.GetTag(5616);
  BaseList2D* node = tag ? tag->GetDataInstance().GetLink(1010) : nullptr;
  return NodeCast<Material>(node);
}

TEST(Planes, HaveTheSizeOfTheirSourceAndNullsNone)
{
  Exported exported(
      Composition(Solid("Solid") + "," + Layer(2, "Image", "", R"("refId":"still")") + "," +
                      Layer(0, "Nested", "", R"("refId":"in")") + "," + Layer(3, "Null", ""),
                  R"("assets":[{"id":"still","p":"a.png","w":8,"h":6},{"id":"in","w":30,"h":20,"layers":[]}])"));
  const std::tuple<const char*, Real, Real> planes[] = {{"Solid", 100, 50}, {"Image", 8, 6}, {"Nested", 30, 20}};
  for (auto [name, width, height] : planes) {
    EXPECT_EQ(exported.Object(name).GetType(), 5168) << name;
    const GeData values[] = {exported.Parameter(name, 1230), exported.Parameter(name, 1231)};
    EXPECT_EQ(values[0].GetRawType(), kDataReal) << name;
    EXPECT_EQ(values[0].GetReal(), width) << name;
    EXPECT_EQ(values[1].GetReal(), height) << name;
    EXPECT_EQ(exported.Parameter(name, 1233).GetLong(), 1) << name;
    EXPECT_EQ(exported.Parameter(name, 1232).GetLong(), 1) << name;
    EXPECT_EQ(exported.Parameter(name, 1300).GetLong(), 5) << name;
  }
  EXPECT_EQ(exported.Object("Null").GetType(), 5140);
  EXPECT_EQ(exported.Object("Null").GetDataInstance().FindIndex(1230), -1);
  // A new material goes to the top; nested compositions and nulls have none.
  EXPECT_EQ(Materials(*exported.document), "Image Solid");
  EXPECT_EQ(MaterialOf(exported.Object("Nested")), nullptr);
}

TEST(Planes, WearTheColourOfTheirSolid)
{
  Exported exported(Composition(Solid("A")));
  const BaseObject& object = exported.Object("A");
  Material* material = MaterialOf(object);
  ASSERT_NE(material, nullptr);
  EXPECT_EQ(Text(material->GetName()), "A");
  ExpectNear(material->GetDataInstance().GetVector(2100), {1, 128.0 / 255, 0}, "#ff8000");
  EXPECT_EQ(material->GetShaders(), nullptr);
  GeData projection;
  object.GetTag(5616)->GetParameterById(1004, projection);
  EXPECT_EQ(projection.GetLong(), 6);
}

TEST(Planes, ShowTheirFootageThroughABitmapShader)
{
  // The work area has seven frames.
  const std::tuple<const char*, Long, Long> cases[] = {
      {"still.png", 1, 0}, {"frames_0000.jpg", 100, 99}, {"shot.mov", 1, 6},
      {"shot.AVI", 50, 6}, {"shot.mpg", 1, 6},           {"shot.mpeg", 1, 0},
      {"mov", 1, 0},       {"shot.mov.png", 4, 3},       {"shot.mp4", 1, 0},
  };
  for (const auto& [file, files, lastFrame] : cases) {
    Exported exported(Composition(Layer(2, "A", "", R"("refId":"a")"),
                                  R"("ae":{"workArea":[1,8]},"assets":[{"id":"a","u":"clips/","w":8,"h":6,"p":")" +
                                      std::string(file) + R"(","ae":{"files":)" + std::to_string(files) + "}}]"));
    Material* material = MaterialOf(exported.Object("A"));
    ASSERT_NE(material, nullptr) << file;
    auto* shader = static_cast<BaseShader*>(material->GetDataInstance().GetLink(8000));
    ASSERT_NE(shader, nullptr) << file;
    EXPECT_EQ(shader, material->GetShaders()) << file;
    EXPECT_EQ(shader->GetType(), 5833) << file;
    EXPECT_EQ(Text(shader->BitmapFilename().GetString()),
              std::filesystem::absolute("/footage/clips/").append(file).make_preferred().string());
    EXPECT_EQ(shader->GetDataInstance().GetLong(2001, -1), lastFrame) << file;
  }
}

TEST(Planes, EachUseOfAnAssetHasAMaterialOfItsOwn)
{
  Exported exported(Composition(Layer(2, "A", "", R"("refId":"a")") + "," + Layer(2, "B", "", R"("refId":"a")"),
                                R"("assets":[{"id":"a","w":8,"h":6,"p":"a.png"}])"));
  EXPECT_EQ(Materials(*exported.document), "B A");
  EXPECT_NE(MaterialOf(exported.Object("A")), MaterialOf(exported.Object("B")));
}

} // namespace
