// Where the program's outputs go: odd names, links, devices, rights, limits; how long a listing becomes.

#include <thread>

#include "support/library.h"
#include "support/run_q7r.h"

namespace
{

namespace fs = std::filesystem;

const std::string kComposition = R"({"fr":25,"ip":0,"op":50,"w":100,"h":50,"nm":"Main","layers":[
  {"ddd":1,"ty":1,"nm":"Wall","sw":100,"sh":50,"sc":"#ff8000","ks":{"p":{"k":[10,20,30]}}}]})";

class Output : public testing::Test
{
 protected:
  Output()
  {
    WriteWholeFile(folder_ / "c.json", {kComposition.begin(), kComposition.end()});
    EXPECT_EQ(RunQ7r("export " + Quoted(folder_ / "c.json") + " " + Quoted(folder_ / "s.q7r")).status, 0);
    scene_ = ReadWholeFile(folder_ / "s.q7r").size();
  }

  RunResult Export(const std::string& output, const std::string& more = {}) const
  {
    return RunQ7r("export " + Quoted(folder_ / "c.json") + " " + Quoted(output) + more);
  }
  std::size_t SizeOf(const std::string& name) const { return ReadWholeFile(folder_ / name).size(); }

  TempFolder folder_;
  std::size_t scene_ = 0; // bytes of the composition's scene
};

} // namespace

#ifndef _WIN32

TEST_F(Output, HasTheNameThatWasAskedFor)
{
  const std::string names[] = {
      "en\u2013dash.q7r", "\xF0\x9F\x98\x80/\u2013/x.q7r", "no utf-8 \xFF\xFE.q7r",
      "\xE9t\xE9/a.q7r",  std::string(251, 'n') + ".q7r",  "with a\nline.q7r",
      "?odd.q7r",
  };
  for (const std::string& name : names) {
    SCOPED_TRACE(name);
    fs::create_directories(fs::path(folder_ / name).parent_path());
    const auto before = std::distance(fs::recursive_directory_iterator(folder_.Path()), {});
    for (const char* more : {"", " --force"}) {
      const RunResult run = Export(folder_ / name, more);
      EXPECT_EQ(run.status, 0) << run.err;
      EXPECT_EQ(SizeOf(name), scene_);
    }
    EXPECT_EQ(RunQ7r("info " + Quoted(folder_ / name)).status, 0);
    EXPECT_EQ(RunQ7r("resave --force " + Quoted(folder_ / name) + " " + Quoted(folder_ / name)).status, 0);
    EXPECT_EQ(std::distance(fs::recursive_directory_iterator(folder_.Path()), {}), before + 1);
  }
  for (const char* name : {".", "..", "out/", "./"}) {
    const RunResult run = RunQ7r("export " + Quoted(folder_ / "c.json") + " " + name);
    EXPECT_EQ(run.status, 2) << name;
    EXPECT_NE(run.err.find("is no file name"), std::string::npos) << run.err;
  }
}

TEST_F(Output, KeepsLinksRightsAndFilesOfOthers)
{
  WriteWholeFile(folder_ / "old.q7r", {1, 2, 3});
  WriteWholeFile(folder_ / "old.q7r.part", {4, 5});
  fs::permissions(folder_ / "old.q7r", fs::perms(0640));
  fs::create_symlink("old.q7r", folder_ / "link.q7r");
  fs::create_symlink("link.q7r", folder_ / "twice.q7r");
  fs::create_symlink("new.q7r", folder_ / "ahead.q7r");
  fs::create_symlink("round.q7r", folder_ / "round.q7r");
  for (const char* name : {"twice.q7r", "ahead.q7r"})
    EXPECT_EQ(Export(folder_ / name, " --force").status, 0) << name;
  EXPECT_TRUE(fs::is_symlink(folder_ / "link.q7r") && fs::is_symlink(folder_ / "twice.q7r"));
  EXPECT_TRUE(fs::is_symlink(folder_ / "ahead.q7r") && !fs::is_symlink(folder_ / "new.q7r"));
  EXPECT_EQ(SizeOf("old.q7r"), scene_);
  EXPECT_EQ(SizeOf("new.q7r"), scene_);
  EXPECT_EQ(fs::status(folder_ / "old.q7r").permissions(), fs::perms(0640));
  EXPECT_EQ(SizeOf("old.q7r.part"), 2);
  const RunResult round = Export(folder_ / "round.q7r", " --force");
  EXPECT_EQ(round.status, 2);
  EXPECT_NE(round.err.find("symbolic links"), std::string::npos) << round.err;
}

TEST_F(Output, OfManyRunsIsOneWholeFile)
{
  std::vector<std::thread> runs;
  for (int i = 0; i < 4; ++i)
    runs.emplace_back([&] { EXPECT_EQ(Export(folder_ / "all.q7r", " --force").status, 0); });
  for (std::thread& run : runs)
    run.join();
  EXPECT_EQ(SizeOf("all.q7r"), scene_);
  EXPECT_EQ(std::distance(fs::directory_iterator(folder_.Path()), {}), 3);
}

// The devices are those of a system that has them all.
TEST_F(Output, GoesIntoDevices)
{
  if (!fs::exists("/dev/full"))
    GTEST_SKIP() << "there is no /dev/full";
  const RunResult piped = RunQ7r("export " + Quoted(folder_ / "c.json") + " /dev/stdout");
  EXPECT_EQ(piped.status, 0) << piped.err;
  EXPECT_EQ(piped.out.size(), scene_);
  EXPECT_EQ(RunQ7r("resave " + Quoted(folder_ / "s.q7r") + " /dev/null").status, 0);
  const RunResult full = RunQ7r("resave " + Quoted(folder_ / "s.q7r") + " /dev/full");
  EXPECT_EQ(full.status, 2);
  EXPECT_NE(full.err.find("/dev/full: No space left on device"), std::string::npos) << full.err;
  EXPECT_FALSE(fs::exists("/dev/stdout.q7r"));
  EXPECT_TRUE(fs::is_character_file("/dev/null") && fs::is_character_file("/dev/full"));
}

TEST_F(Output, SaysWhyThereIsNone)
{
  const std::string scene = Quoted(folder_ / "s.q7r");
  const std::string old = Quoted(folder_ / "old.q7r");
  for (const char* name : {"old.q7r", "old.gltf", "old.bin"})
    WriteWholeFile(folder_ / name, {1, 2, 3});
  for (const std::string& verb :
       {"info " + scene, "info --json " + scene, "tree " + scene, "tree --json " + scene, "dump " + scene,
        "dump --json " + scene, "check " + scene, std::string("--help"), std::string("--version"),
        "resave --force " + scene + " " + old, "export --force " + Quoted(folder_ / "c.json") + " " + old,
        "convert --force " + scene + " " + Quoted(folder_ / "old.gltf")}) {
    SCOPED_TRACE(verb);
    const RunResult full = RunQ7r(verb + " >/dev/full");
    EXPECT_EQ(full.status, 2);
    EXPECT_NE(full.err.find("standard output: No space left on device"), std::string::npos) << full.err;
    EXPECT_EQ(RunQ7r(verb + " >&-").status, 2);
    for (const char* name : {"old.q7r", "old.gltf", "old.bin"})
      EXPECT_EQ(SizeOf(name), 3);
  }
  for (const std::string& verb :
       {"export --force " + Quoted(folder_ / "c.json") + " " + old, "resave --force " + scene + " " + old}) {
    const RunResult limited = RunQ7r(verb, "ulimit -f 1;");
    EXPECT_EQ(limited.status, 2) << verb;
    EXPECT_NE(limited.err.find("old.q7r: File too large"), std::string::npos) << limited.err;
    EXPECT_EQ(SizeOf("old.q7r"), 3);
  }
  EXPECT_EQ(std::distance(fs::directory_iterator(folder_.Path()), {}), 5);
}

#endif

// Chunks within chunks: a line tells its innermost chunk, and that is enough to find all.
TEST_F(Output, OfADumpGrowsWithTheFileNotWithItsDepth)
{
  for (const int depth : {30, 3000}) {
    ByteWriter w;
    w.Header();
    for (int i = 0; i < depth; ++i)
      w.Start(7, 1).Long(i);
    for (int i = 0; i < depth; ++i)
      w.End();
    WriteWholeFile(folder_ / "deep.q7r", w.bytes);
    const RunResult text = RunQ7r("dump " + Quoted(folder_ / "deep.q7r"));
    EXPECT_EQ(text.status, 0) << text.err;
    EXPECT_LT(text.out.size(), 20 * w.bytes.size());
    EXPECT_NE(text.out.find("(" + std::to_string(depth) + ") Long " + std::to_string(depth - 1) + "\n"),
              std::string::npos);
    const RunResult lines = RunQ7r("dump --json " + Quoted(folder_ / "deep.q7r"));
    EXPECT_LT(lines.out.size(), 30 * w.bytes.size());
    std::istringstream stream(lines.out);
    std::vector<long> open;
    for (std::string line; std::getline(stream, line);) {
      const nlohmann::json json = nlohmann::json::parse(line);
      if (json["kind"] == "end")
        open.pop_back();
      EXPECT_EQ(json["parent"], open.empty() ? nlohmann::json() : nlohmann::json(open.back()));
      EXPECT_EQ(json["depth"], open.size());
      if (json["kind"] == "chunk")
        open.push_back(json["offset"]);
    }
    EXPECT_TRUE(open.empty());
  }
}

TEST_F(Output, OfInfoCountsTheTracksOfEveryNode)
{
  using namespace _torvane_;
  const DocumentPtr document = NewDocument();
  document->InsertObject(AllocObject(5140));
  BaseMaterial* material = AllocMaterial();
  document->InsertMaterial(material);
  BaseShader* shader = MakeShader(5833);
  ASSERT_TRUE(shader && material->InsertShaderLast(shader));
  document->InsertLayer(AllocLayer());
  int wanted = 0;
  for (BaseList2D* node : {static_cast<BaseList2D*>(document->GetFirstObject()), static_cast<BaseList2D*>(material),
                           static_cast<BaseList2D*>(shader), static_cast<BaseList2D*>(document->GetFirstLayer()),
                           static_cast<BaseList2D*>(document->GetFirstRenderData())}) {
    ASSERT_NE(node, nullptr) << wanted;
    CTrack* track = NewObj<CTrack>();
    ASSERT_TRUE(node->InsertTrackLast(track));
    track->GetCurve(1, 1);
    ++wanted;
  }
  WriteWholeFile(folder_ / "tracks.q7r", SaveToBytes(*document));
  const RunResult run = RunQ7r("info --json " + Quoted(folder_ / "tracks.q7r"));
  EXPECT_EQ(nlohmann::json::parse(run.out)["tracks"], wanted) << run.out;
}

// Layers by kind, with those of nested compositions; warnings by kind; the names that a user may have meant.
TEST_F(Output, OfAnExportSaysWhatWasLeftOutAndWhy)
{
  const std::string layers = R"~({"ddd":1,"ty":13,"nm":"Eye","ks":{}},{"ddd":1,"ty":1,"nm":"Wall","sw":9,"sh":9,
    "sc":"#fff","ks":{"p":{"k":[1,2,3],"x":"wiggle(1)"}}},{"ddd":1,"ty":1,"nm":"Floor","sw":9,"sh":9,"sc":"#fff",
    "ks":{"p":{"k":[1,2,3],"x":"wiggle(2)"}}},{"ty":3,"nm":"Flat","ks":{}},{"ty":4,"nm":"S","ks":{}})~";
  const std::string nested = R"~({"ddd":1,"ty":0,"refId":"n","w":9,"h":9,"nm":"In","ks":{}})~";
  const auto run = [&](const std::string& inside, const std::string& more) {
    const std::string text = R"~({"fr":25,"ip":0,"op":5,"w":9,"h":9,"nm":"Main","assets":[{"id":"n","nm":"In","layers":[
      {"ddd":1,"ty":3,"nm":"N","ks":{}},{"ddd":1,"ty":5,"nm":"T","ks":{}}]}],"layers":[)~" +
                             inside + "]}";
    WriteWholeFile(folder_ / "c.json", {text.begin(), text.end()});
    return Export(folder_ / "out.q7r", " --force" + more);
  };
  const RunResult some = run(layers + "," + nested, "");
  EXPECT_EQ(some.status, 1);
  EXPECT_NE(some.err.find("8 layers: 1 camera, 2 solids, 1 null, 1 nested composition; left out: 1 text layer, 1 shape "
                          "layer, 1 layer with its 3D switch off; 0 tracks, 0 keys\n"),
            std::string::npos)
      << some.err;
  EXPECT_NE(some.err.find("(and 1 more like this"), std::string::npos) << some.err;
  EXPECT_EQ(some.err.find("Floor"), std::string::npos) << some.err;
  EXPECT_NE(run(layers, " --verbose").err.find("Floor"), std::string::npos);
  const RunResult none = run(R"~({"ty":4,"nm":"S","ks":{}})~", "");
  EXPECT_EQ(none.status, 0) << none.err;
  EXPECT_NE(none.err.find("1 layer; left out: 1 shape layer; 0 tracks, 0 keys\nthe scene is empty"), std::string::npos)
      << none.err;
  const RunResult unknown = run(layers, " --composition Moon");
  EXPECT_EQ(unknown.status, 2);
  EXPECT_NE(unknown.err.find("\"Moon\"; it has \"Main\", \"In\""), std::string::npos) << unknown.err;
}
