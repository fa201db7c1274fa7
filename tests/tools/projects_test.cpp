// The verbs on After Effects projects: lists, extracted compositions that export to the same scene, footage that has
// moved, samples, choices.

#include "host/project_bytes.h"
#include "support/run_q7r.h"

namespace
{

namespace pb = project_bytes;
using ProjectBytes = std::vector<std::uint8_t>;

class ProjectVerbs : public testing::Test
{
 protected:
  std::string Write(const std::string& name, const std::string& bytes) const
  {
    WriteWholeFile(folder_ / name, ProjectBytes(bytes.begin(), bytes.end()));
    return folder_ / name;
  }
  // The scene's tree, without what differs between two exports of one composition.
  nlohmann::json Tree(const std::string& arguments) const
  {
    const std::string scene = folder_ / "scene.q7r";
    const RunResult run = RunQ7r("export " + arguments + " --force " + Quoted(scene));
    EXPECT_EQ(run.err.find("warning: ") == std::string::npos ? 0 : 1, run.status) << arguments << run.err;
    EXPECT_LT(RunQ7r("check " + Quoted(scene)).status, 2) << arguments << ": 1 is a warning";
    nlohmann::json tree = nlohmann::json::parse(RunQ7r("tree --json " + Quoted(scene)).out);
    tree["document"].erase("container"); // who wrote it, and when
    tree["document"]["named"].erase("saveDate");
    return tree;
  }
  // Exports every composition of a project twice: from it, and from what is extracted of it. Gives how many objects
  // that made.
  std::size_t ExpectSameScenes(const std::string& file)
  {
    const RunResult listed = RunQ7r("compositions --json " + Quoted(file));
    EXPECT_EQ(0, listed.status) << listed.err;
    std::size_t exported = 0;
    const nlohmann::json list = nlohmann::json::parse(listed.out);
    for (const nlohmann::json& composition : list["compositions"]) {
      const std::string id = composition["id"], json = folder_ / "extracted.json";
      SCOPED_TRACE(file + ", composition " + id);
      const std::string which = Quoted(file) + " --composition " + id;
      const RunResult run = RunQ7r("extract " + which + " --force -o " + Quoted(json));
      EXPECT_EQ(run.err.find("warning: ") == std::string::npos ? 0 : 1, run.status) << run.err;
      EXPECT_EQ(Tree(which), Tree(Quoted(json)));
      exported += composition["exported"].get<std::size_t>();
    }
    return exported;
  }

  TempFolder folder_;
};

// A wall that turns, bumps and roves, with an expression; a camera; a picture in a nested composition.
std::string Shot(unsigned active = 1)
{
  pb::Layer wall{.id = 10, .name = "Wall", .source = 50, .parent = 12};
  pb::Node turn = pb::Body({.form = 0x06,
                            .keys = {pb::WideKey(0, pb::kLinear, pb::kLinear, {0}, {}),
                                     pb::WideKey(25600, pb::kLinear, pb::kLinear, {0}, {})}});
  pb::Add(wall.transform, "ADBE Orientation",
          pb::List("otst", {turn, pb::List("otky", {pb::Chunk("otda", pb::Data().Reals(0, {0, 350, 5})),
                                                    pb::Chunk("otda", pb::Data().Reals(0, {20, 10, 5}))})}));
  pb::Add(
      wall.transform, "ADBE Position",
      pb::Body({.components = 3,
                .form = 0x0E,
                .keys = {pb::WideKey(0, pb::kLinear, pb::kBezier, {0, 0, 0}, {0, 0, 0, 0.7}, {}, {90, 0, 0.3}),
                         pb::WideKey(9000, pb::kLinear, pb::kLinear, {100, 60, 7}, {}, {0, -33.1, 0}, {0, 20, 0}, true),
                         pb::WideKey(51200, pb::kBezier, pb::kLinear, {10, 300, 9}, {40, 0.4, 0, 0}, {5, 0, 0}, {})}}));
  pb::Add(wall.transform, "ADBE Rotate X", pb::Body({.value = {3}, .after = {pb::Utf8("time * 10")}}));
  pb::Layer handle{.id = 12, .source = 51, .switches = 0x84, .stretch = {-1, 2}, .start = {2, 1}};
  pb::Add(handle.transform, "ADBE Scale",
          pb::Body({.components = 3,
                    .keys = {pb::PlainKey(0, pb::kLinear, pb::kBezier, {1, 1, 1},
                                          {{0, 0, 1, 0.5}, {0, 0, 0, 0.5}, {0, 0, 2, 0.5}}),
                             pb::PlainKey(25600, pb::kLinear, pb::kHold, {2, 1, 1}, {{}, {}, {}}),
                             pb::PlainKey(51200, pb::kLinear, pb::kHold, {3, 1, 1}, {{}, {}, {}})}}));
  pb::Layer camera{.id = 11, .name = "Lens", .kind = 2, .switches = 0x44};
  pb::Add(camera.transform, "ADBE Position", pb::Body({.components = 3, .value = {0, 0, 0}, .switches = 3}));
  pb::Add(camera.transform, "ADBE Position_0", pb::Body({.value = {7}, .after = {pb::Utf8("wiggle(1, 5)")}}));
  pb::Add(camera.transform, "ADBE Position_1",
          pb::Body({.keys = {pb::PlainKey(0, pb::kLinear, pb::kBezier, {5}, {{0, 0, 40, 0.5}}),
                             pb::PlainKey(51200, pb::kBezier, pb::kLinear, {5}, {{40, 0.5, 0, 0}})}}));
  pb::Add(camera.transform, "ADBE Position_2", pb::Body({.value = {-900}}));
  pb::Comp inner{.id = 2,
                 .name = "Inner",
                 .layers = {pb::MakeLayer({.id = 30, .source = 60})},
                 .ticksPerFrame = 800,
                 .ticksPerSecond = 23976,
                 .rate = 29,
                 .rateFraction = 63570,
                 .width = 300};
  inner.duration[0] = 240000;
  inner.duration[1] = 23976;
  pb::Comp main;
  main.duration[0] = 3;
  main.layers = {pb::MakeLayer(wall), pb::MakeLayer(camera), pb::MakeLayer(handle),
                 pb::MakeLayer({.id = 13, .source = 2})};
  const float color[3] = {0.1F, 0.2F, 0.3F};
  return pb::BinaryFile(pb::Root({pb::MakeItem(main), pb::Folder("F", {pb::MakeItem(inner)}),
                                  pb::Solid(50, "Wall", 400, 200, color), pb::Solid(51, "Null 1", 60, 40, color),
                                  pb::Footage(60, "C:\\Old\\pictures\\Sky.PNG", false, pb::Settings(64, 48))},
                                 active));
}

TEST_F(ProjectVerbs, ExtractWhatExportsToTheSameScene)
{
  EXPECT_EQ(6U, ExpectSameScenes(Write("shot.aep", Shot())));
  const std::filesystem::path shared = TEST_SOURCE_DIR "/../shared/projects";
  if (!std::filesystem::exists(shared))
    GTEST_SKIP() << "the shared projects are not here";
  std::size_t exported = 0;
  for (const auto& entry : std::filesystem::directory_iterator(shared))
    if (entry.path().extension() == ".aep" || entry.path().extension() == ".aepx")
      exported += ExpectSameScenes(entry.path().string());
  EXPECT_EQ(8U, exported);
}

// Sets the 3D switch of every layer, in either form, where it stands.
void SwitchTo3D(ProjectBytes& bytes)
{
  constexpr std::size_t kSwitches = 38; // in `ldta`
  const std::string binary = "ldta", xml = "<ldta bdata=\"";
  const bool isXml = bytes[0] == '<';
  const std::string& mark = isXml ? xml : binary;
  for (auto at = bytes.begin(); (at = std::search(at, bytes.end(), mark.begin(), mark.end())) != bytes.end(); ++at) {
    if (!isXml) {
      *(at + static_cast<std::ptrdiff_t>(8 + kSwitches)) |= 0x04; // behind id and size
      continue;
    }
    std::uint8_t& digit = *(at + static_cast<std::ptrdiff_t>(xml.size() + 2 * kSwitches + 1));
    const std::string digits = "0123456789abcdef";
    digit = static_cast<std::uint8_t>(digits[digits.find(static_cast<char>(digit)) | 4]);
  }
}

TEST_F(ProjectVerbs, ExportEveryLayerOfRealProjectsIn3D)
{
  const std::filesystem::path shared = TEST_SOURCE_DIR "/../shared/projects";
  if (!std::filesystem::exists(shared))
    GTEST_SKIP() << "the shared projects are not here";
  std::size_t exported = 0;
  for (const auto& entry : std::filesystem::directory_iterator(shared)) {
    if (entry.path().extension() != ".aep" && entry.path().extension() != ".aepx")
      continue;
    ProjectBytes bytes = ReadWholeFile(entry.path().string());
    SwitchTo3D(bytes);
    const std::string copy = folder_ / entry.path().filename().string();
    WriteWholeFile(copy, bytes);
    exported += ExpectSameScenes(copy);
  }
  EXPECT_EQ(23U, exported);
}

TEST_F(ProjectVerbs, ListAndChoose)
{
  const std::string shot = Write("shot.aep", Shot()), none = Write("none.aep", Shot(0));
  const RunResult list = RunQ7r("compositions " + Quoted(shot));
  EXPECT_EQ(0, list.status);
  EXPECT_EQ("* Main   1920 x 1080  25 fps  3 s (75 frames)  4 layers, 5 exported  id 1\n"
            "  Inner  300 x 1080  29.97 fps  10.01 s (300 frames)  1 layer, 1 exported  id 2\n",
            list.out);
  // What a file holds tells what it is, not its name.
  EXPECT_EQ(list.out, RunQ7r("compositions " + Quoted(Write("binary.aepx", Shot()))).out);
  const std::string json = "\xEF\xBB\xBF{\"fr\":25,\"ip\":0,\"op\":10,\"w\":8,\"h\":4,\"nm\":\"J\",\"layers\":[]}";
  EXPECT_EQ("* J     8 x 4  25 fps  0.4 s (10 frames)  0 layers, 0 exported\n",
            RunQ7r("compositions " + Quoted(Write("json.aep", json))).out);
  const std::string out = " " + Quoted(folder_ / "out.q7r");
  const RunResult choice = RunQ7r("export " + Quoted(none) + out);
  EXPECT_EQ(2, choice.status);
  EXPECT_NE(choice.err.find("please choose"), std::string::npos) << choice.err;
  EXPECT_NE(choice.err.find("Inner  300 x 1080"), std::string::npos) << choice.err;
  const RunResult unknown = RunQ7r("export " + Quoted(shot) + out + " --composition Moon");
  EXPECT_EQ(2, unknown.status);
  EXPECT_NE(unknown.err.find("\"Moon\"; it has \"Main\" (1), \"Inner\" (2)"), std::string::npos) << unknown.err;
  EXPECT_FALSE(std::filesystem::exists(folder_ / "out.q7r"));
  EXPECT_EQ("Inner", Tree(Quoted(none) + " --composition 2")["objects"][0]["name"]);
}

TEST_F(ProjectVerbs, FindMovedFootageAndTakeSamples)
{
  const std::string shot = Write("shot.aep", Shot());
  std::filesystem::create_directories(folder_.Path() / "new/deep/pictures");
  Write("new/deep/pictures/sky.png", "");
  const std::string found = Tree(Quoted(shot) + " --images " + Quoted(folder_ / "new"))["materials"].dump();
  const bool isSlash = std::filesystem::path::preferred_separator == '/';
  EXPECT_NE(found.find(isSlash ? "deep/pictures/sky.png" : "deep\\\\pictures\\\\sky.png"), std::string::npos) << found;
  Write("new/pictures/nothing", "");
  const RunResult lost = RunQ7r("extract " + Quoted(shot) + " -o " + Quoted(folder_ / "a.json") + " --images " +
                                Quoted(folder_ / "new/deep/pictures/.."));
  EXPECT_EQ(lost.err.find("Sky.PNG"), std::string::npos) << lost.err;
  EXPECT_NE(lost.err.find("shot.aep: layer \"Wall\": the expression of rotation X is not evaluated"),
            std::string::npos);

  const std::string baked =
      Write("baked.json", R"({"nm": "Main", "w": 9, "h": 9, "fr": 12.5, "ip": 0, "op": 3, "layers":
    [{"ty": 1, "nm": "Wall", "ddd": 1, "ks": {"rx": {"k": 0, "samples": [10, 20, 40]}}},
     {"ty": 13, "nm": "Eye", "pe": {"k": 1, "samples": [1]}},
     {"ty": 13, "nm": "Lens", "pe": {"k": 1}, "ks": {"p": {"s": true, "x": {"k": 0, "samples": [1, 2]}}}},
     {"ty": 3, "nm": "Null 1", "ks": {"p": {"s": true, "y": {"k": 0, "samples": [1]}}}}]})");
  const RunResult run =
      RunQ7r("extract " + Quoted(shot) + " --force -o " + Quoted(folder_ / "a.json") + " --samples " + Quoted(baked));
  EXPECT_EQ(1, run.status);
  EXPECT_EQ(run.err.find("expression"), std::string::npos) << run.err;
  EXPECT_NE(run.err.find("baked.json: layer \"Eye\": its samples of zoom find no such property"), std::string::npos)
      << run.err;
  const ProjectBytes text = ReadWholeFile(folder_ / "a.json");
  const nlohmann::json layers = nlohmann::json::parse(text.begin(), text.end())["layers"];
  EXPECT_EQ(nlohmann::json::parse("[[10.0], [20.0], [20.0], [40.0], [40.0]]"), layers[0]["ks"]["rx"]["samples"]);
  // Of a separated position one dimension alone; what turns back in another is sampled there.
  const nlohmann::json& position = layers[1]["ks"]["p"];
  EXPECT_EQ(nlohmann::json::parse("[[1.0], [2.0], [2.0]]"), position["x"]["samples"]);
  EXPECT_EQ(76U, position["y"]["samples"].size());
  EXPECT_FALSE(position["z"].contains("samples") || position.contains("samples"));
  EXPECT_NE(run.err.find("layer \"Null 1\": its samples of position find no such property"), std::string::npos);
}

} // namespace
