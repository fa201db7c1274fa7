// Materials in listings: for people with colour, channels and shaders, for programs with everything.

#include "support/library.h"
#include "support/run_q7r.h"

namespace
{

constexpr Long kUnknownType = 1012345;

// A standard material with a bitmap that has a child, and one of an unknown type, in this order.
std::string WriteScene(const TempFolder& folder)
{
  DocumentPtr document = NewDocument();
  BaseMaterial* plugin = MakeMaterial(kUnknownType);
  plugin->SetName("Grain");
  plugin->InsertShaderLast(MakeShader(kUnknownType));
  document->InsertMaterial(plugin);
  Material* material = AllocMaterial();
  material->SetName("Wall");
  material->SwitchChannel(-1, 1);
  material->SwitchChannel(8, 0);
  material->GetDataInstance().SetVector(kMaterialColor, Vector(1, 0.5, 0.25));
  BaseShader* shader = material->BindChannelBitmap(kMaterialColorShader, Filename("wall.png"));
  shader->SetName("Image");
  MakeShader(kUnknownType)->InsertUnderLast(shader);
  document->InsertMaterial(material);
  WriteWholeFile(folder / "scene.q7r", SaveToBytes(*document));
  return folder / "scene.q7r";
}

TEST(MaterialsTree, ListsColourChannelsAndShaders)
{
  const TempFolder folder;
  const RunResult run = RunQ7r("tree " + Quoted(WriteScene(folder)));
  EXPECT_EQ(run.status, 0) << run.err;
  EXPECT_NE(run.out.find("materials\n"
                         "  Material \"Wall\"  color (1, 0.5, 0.25)  channels -1, color\n"
                         "    shader Bitmap \"Image\"  \"wall.png\"\n"
                         "      shader type 1012345\n"
                         "  type 1012345 \"Grain\"\n"
                         "    shader type 1012345\n"
                         "layers\n"),
            std::string::npos)
      << run.out;
}

TEST(MaterialsTree, GivesProgramsEverything)
{
  const TempFolder folder;
  const RunResult run = RunQ7r("tree --json " + Quoted(WriteScene(folder)));
  EXPECT_EQ(run.status, 0) << run.err;
  const auto materials = nlohmann::json::parse(run.out)["materials"];
  ASSERT_EQ(materials.size(), 2U);
  const auto& wall = materials[0];
  EXPECT_EQ(wall["type"], 5703);
  EXPECT_EQ(wall["name"], "Wall");
  EXPECT_EQ(wall["channels"], nlohmann::json::parse("[1,0,0,0,0,0,0,0,0,0,0,0,0,1]"));
  EXPECT_EQ(wall["data"]["2100"], nlohmann::json::parse("[1,0.5,0.25]"));
  EXPECT_EQ(wall["data"]["8000"], "Wall/Image");
  EXPECT_EQ(wall["data"]["8001"], nullptr);
  ASSERT_EQ(wall["shaders"].size(), 1U);
  const auto& shader = wall["shaders"][0];
  EXPECT_EQ(shader["type"], 5833);
  EXPECT_EQ(shader["name"], "Image");
  EXPECT_EQ(shader["data"]["1000"], "wall.png");
  EXPECT_EQ(shader["children"][0]["type"], kUnknownType);
  EXPECT_EQ(materials[1]["type"], kUnknownType);
  EXPECT_EQ(materials[1]["channels"].size(), 0U);
  EXPECT_EQ(materials[1]["shaders"][0]["children"].size(), 0U);
}

} // namespace
