// The command as its users meet it.
#include "support/run_q7r.h"
#include "tests/gltf/converted_scene.h"

namespace
{

constexpr const char* kComposition = R"({"fr":25,"ip":0,"op":10,"w":1000,"h":500,"nm":"Main","layers":[
  {"ddd":1,"ty":13,"nm":"Eye","ks":{"p":{"k":[500,250,-800]}},"pe":{"k":800}},
  {"ddd":1,"ty":1,"nm":"Wall","sw":100,"sh":50,"sc":"#ff8000",
   "ks":{"p":{"k":[{"t":0,"s":[10,20,30]},{"t":10,"s":[90,20,30]}]}}}]})";

class ConvertVerb : public testing::Test
{
 protected:
  ConvertVerb()
  {
    std::ofstream(folder_ / "in.json") << kComposition;
    EXPECT_EQ(RunQ7r("export " + Quoted(folder_ / "in.json") + " " + Quoted(folder_ / "scene.q7r")).status, 0);
  }
  RunResult Convert(const std::string& output, const std::string& more = "") const
  {
    return RunQ7r("convert " + Quoted(folder_ / "scene.q7r") + " " + Quoted(folder_ / output) + " " + more);
  }
  std::size_t CountFiles() const
  {
    const std::filesystem::directory_iterator all(folder_.Path());
    return static_cast<std::size_t>(std::distance(begin(all), end(all)));
  }

  TempFolder folder_;
};

TEST_F(ConvertVerb, WritesOneFileOrTwo)
{
  const RunResult one = Convert("out.glb");
  EXPECT_EQ(one.status, 0) << one.err;
  EXPECT_EQ(one.err, "");
  EXPECT_NE(one.out.find("out.glb: "), std::string::npos) << one.out;
  EXPECT_EQ(gltf::CheckGlb(ReadWholeFile(folder_ / "out.glb")), "");
  const RunResult two = Convert("my out.GLTF");
  EXPECT_EQ(two.status, 0) << two.err;
  const Json json = Json::parse(ReadOutput(folder_ / "my out.GLTF"));
  EXPECT_EQ(json["buffers"][0]["uri"], "my%20out.bin");
  EXPECT_EQ(json["buffers"][0]["byteLength"], std::filesystem::file_size(folder_ / "my out.bin"));
  EXPECT_EQ(CountFiles(), 5U);
}

TEST_F(ConvertVerb, ExportsStraightThere)
{
  const RunResult run = RunQ7r("export " + Quoted(folder_ / "in.json") + " " + Quoted(folder_ / "straight.glb"));
  EXPECT_EQ(run.status, 0) << run.err;
  EXPECT_EQ(Convert("through.glb").status, 0);
  EXPECT_EQ(ReadWholeFile(folder_ / "straight.glb"), ReadWholeFile(folder_ / "through.glb"));
  EXPECT_EQ(CountFiles(), 4U);
}

TEST_F(ConvertVerb, TakesItsOptions)
{
  EXPECT_EQ(Convert("unit.glb", "--unit 1 --lit --no-pointers --hidden --embed").status, 0);
  const std::vector<std::uint8_t> file = ReadWholeFile(folder_ / "unit.glb");
  const std::string text(file.begin(), file.end());
  EXPECT_NE(text.find(R"("unit":1.0)"), std::string::npos);
  EXPECT_EQ(text.find("KHR_materials_unlit"), std::string::npos);
  for (const char* bad : {"--lit --unlit", "--unit 0", "--unit -1", "--unit x"}) {
    const RunResult run = Convert("bad.glb", bad);
    EXPECT_EQ(run.status, 2) << bad;
    EXPECT_FALSE(std::filesystem::exists(folder_ / "bad.glb"));
  }
}

TEST_F(ConvertVerb, RefusesWithOneSentenceAndTouchesNothing)
{
  std::ofstream(folder_ / "old.glb") << "precious";
  std::ofstream(folder_ / "old.bin") << "precious";
  std::filesystem::create_directory(folder_.Path() / "folder.glb");
  std::filesystem::copy(folder_ / "scene.q7r", folder_ / "scene.glb");
  const std::size_t files = CountFiles();
  for (const char* output : {"out.obj", "out", "old.glb", "old.gltf", "folder.glb", "missing/out.glb"}) {
    const RunResult run = Convert(output);
    EXPECT_EQ(run.status, 2) << output;
    EXPECT_EQ(std::count(run.err.begin(), run.err.end(), '\n'), 1) << run.err;
    EXPECT_EQ(run.out, "");
  }
  const std::string self = Quoted(folder_ / "scene.glb");
  EXPECT_EQ(RunQ7r("convert " + self + " " + self + " --force").status, 2);
  EXPECT_EQ(ReadOutput(folder_ / "old.bin"), "precious");
  EXPECT_EQ(ReadWholeFile(folder_ / "scene.glb"), ReadWholeFile(folder_ / "scene.q7r"));
  EXPECT_EQ(CountFiles(), files);
  EXPECT_EQ(Convert("old.glb", "--force").status, 0);
  EXPECT_EQ(gltf::CheckGlb(ReadWholeFile(folder_ / "old.glb")), "");
}

TEST_F(ConvertVerb, TellsAMissingPictureAndGoesOn)
{
  std::ofstream(folder_ / "picture.json") << R"({"fr":25,"ip":0,"op":10,"w":100,"h":50,"nm":"Main",
    "assets":[{"id":"a","w":10,"h":10,"u":"","p":"gone.png"}],
    "layers":[{"ddd":1,"ty":2,"nm":"Picture","refId":"a","ks":{}}]})";
  const RunResult run = RunQ7r("export " + Quoted(folder_ / "picture.json") + " " + Quoted(folder_ / "picture.gltf"));
  EXPECT_EQ(run.status, 1);
  EXPECT_NE(run.err.find("gone.png: the picture is missing\n"), std::string::npos) << run.err;
  EXPECT_TRUE(std::filesystem::exists(folder_ / "picture.gltf"));
}

} // namespace
