// Many files at a time, standard input and output, scenes that come out the same again, pictures and their paths.

#include "support/run_q7r.h"

namespace
{

namespace fs = std::filesystem;

constexpr const char* kShot = R"({"fr":25,"ip":0,"op":9,"w":90,"h":50,"nm":"Main","assets":[
  {"id":"a","u":"pictures/","p":"a.png","w":9,"h":9},{"id":"b","p":"gone.png","w":9,"h":9},
  {"id":"c","p":"c.png","w":9,"h":9,"ae":{"path":"C:\\footage\\c.png"}},{"id":"d","p":"unused.png","w":9,"h":9}],
  "layers":[{"ddd":1,"ty":2,"refId":"a","ks":{}},{"ddd":1,"ty":2,"refId":"b","ks":{}},
  {"ddd":1,"ty":2,"refId":"b","ks":{}},{"ddd":1,"ty":2,"refId":"c","ks":{}},{"ddd":0,"ty":2,"refId":"d","ks":{}}]})";

constexpr const char* kSolid = R"({"fr":25,"ip":0,"op":9,"w":90,"h":50,"layers":[
  {"ddd":1,"ty":1,"nm":"Wall","sw":9,"sh":9,"sc":"#fff","ks":{"p":{"k":[1,2,3]}}},
  {"ddd":1,"ty":13,"nm":"Eye","ks":{},"pe":{"k":80}},
  {"ddd":1,"ty":4,"nm":"Lamp","ks":{}}]})";

class ManyFiles : public testing::Test
{
 protected:
  std::string Write(const std::string& name, const std::string& text) const
  {
    fs::create_directories(fs::path(folder_ / name).parent_path());
    WriteWholeFile(folder_ / name, {text.begin(), text.end()});
    return Quoted(folder_ / name);
  }
  std::string Place(const std::string& name) const { return Quoted(folder_ / name); }
  std::string Scene(const std::string& name) const
  {
    EXPECT_EQ(RunQ7r("export " + Write(name + ".json", kSolid) + " " + Place(name)).status, 0);
    return Place(name);
  }
  // With a file, as it stands on a command line, as standard input.
  RunResult Piped(const std::string& arguments, const std::string& input) const
  {
    return RunQ7r(arguments + " <" + input);
  }

  TempFolder folder_;
};

std::size_t Count(const std::string& text, const std::string& part)
{
  std::size_t count = 0;
  for (std::size_t at = text.find(part); at != std::string::npos; at = text.find(part, at + part.size()))
    ++count;
  return count;
}

TEST_F(ManyFiles, AreLookedAtInTurnAndPastABadOne)
{
  const std::string a = Scene("a.q7r"), b = Scene("b.q7r"), bad = Write("bad.q7r", "no scene");
  const std::string files = a + " " + bad + " " + b;
  for (const std::string verb : {"info", "tree", "dump", "check"}) {
    SCOPED_TRACE(verb);
    const RunResult run = RunQ7r(verb + " " + files);
    EXPECT_EQ(run.status, 2);
    EXPECT_EQ(Count(run.out, folder_ / "a.q7r"), 1U) << run.out;
    EXPECT_EQ(Count(run.out, folder_ / "b.q7r"), 1U) << run.out;
    EXPECT_EQ(run.err, "q7r: " + (folder_ / "bad.q7r") + ": not a scene file but a text\n");
    EXPECT_EQ(RunQ7r(verb + " " + a + " " + b).status, 0);
  }
  // --quiet: what is wrong alone.
  const RunResult quiet = RunQ7r("check --quiet " + files);
  EXPECT_EQ(quiet.out, "");
  EXPECT_EQ(quiet.status, 2);

  const std::string ies = Quoted(TEST_SOURCE_DIR "/README.md");
  EXPECT_EQ(Count(RunQ7r("ies " + ies + " " + ies).err, "README.md"), 2U);
  const std::string json = RunQ7r("info --json " + a + " " + b).out;
  EXPECT_EQ(Count(json, "\"objects\": 3"), 2U) << json;
}

TEST_F(ManyFiles, GoIntoAFolderWithTheirNames)
{
  const std::string a = Write("in/a.json", kSolid), b = Write("in/b.lottie.json", kSolid), bad = Write("bad.json", "{");
  const RunResult run = RunQ7r("export " + a + " " + bad + " " + b + " --jobs 3 -o " + Place("new/scenes"));
  EXPECT_EQ(run.status, 2) << run.err;
  EXPECT_EQ(Count(run.err, "a.q7r: 3 layers: 1 camera, 1 solid") + Count(run.err, "bad.json: byte"), 2U) << run.err;
  for (const std::string name : {"a", "b.lottie"})
    EXPECT_EQ(RunQ7r("check " + Place("new/scenes/" + name + ".q7r")).status, 0);
  const std::string scenes = Place("new/scenes/a.q7r") + " " + Place("new/scenes/b.lottie.q7r");
  EXPECT_EQ(RunQ7r("resave " + scenes + " --quiet -o " + Place("again")).out, "");
  EXPECT_EQ(RunQ7r("convert " + scenes + " -o " + Place("models/")).status, 0);
  for (const std::string name : {"again/a.q7r", "again/b.lottie.q7r", "models/a.glb", "models/b.lottie.glb"})
    EXPECT_GT(ReadWholeFile(folder_ / name).size(), 0U) << name;
  EXPECT_EQ(RunQ7r("export " + a + " -o " + Place("one")).status, 0);
  EXPECT_EQ(RunQ7r("export " + a + " -o " + Place("two.q7r")).status, 0);
  EXPECT_GT(ReadWholeFile(folder_ / "one/a.q7r").size() * ReadWholeFile(folder_ / "two.q7r").size(), 0U);
  EXPECT_NE(RunQ7r("export " + a + " " + b + " -o " + Place("two.q7r")).err.find("two.q7r: is no folder"),
            std::string::npos);
  // What is there stays, and two files of one name don't overwrite each other.
  const RunResult second = RunQ7r("resave " + scenes + " -o " + Place("again"));
  EXPECT_EQ(second.status, 2);
  EXPECT_EQ(Count(second.err, "exists already; --force replaces it\n"), 2U) << second.err;
  const RunResult same = RunQ7r("export " + a + " " + Write("other/a.json", kSolid) + " -o " + Place("c"));
  EXPECT_NE(same.err.find("other/a.json: would be written to "), std::string::npos) << same.err;
}

#ifndef _WIN32 // where what is read back here is taken for a text

TEST_F(ManyFiles, ComeFromStandardInputAndGoToStandardOutput)
{
  const std::string scene = Scene("a.q7r"), composition = Place("a.q7r.json");
  const RunResult exported = Piped("export --reproducible - -", composition);
  EXPECT_EQ(exported.status, 0) << exported.err;
  const std::string copy = Write("copy.q7r", exported.out);
  EXPECT_EQ(RunQ7r("check " + copy).status, 0);
  for (const std::string& arguments :
       std::vector<std::string>{"info -", "tree -", "dump -", "check -", "resave - " + Place("r.q7r"),
                                "merge - " + scene + " -o " + Place("m.q7r"), "convert - " + Place("a.glb")}) {
    const RunResult run = Piped(arguments, copy);
    EXPECT_EQ(run.status, 0) << arguments << run.err;
  }
  EXPECT_NE(Piped("check -", copy).out.find("standard input: good"), std::string::npos);
  EXPECT_EQ(Piped("resave - -", copy).out.substr(0, 4), "QQ7R");
  EXPECT_EQ(Piped("convert - -", copy).out.substr(0, 4), "glTF");
  EXPECT_EQ(Piped("info -", Write("empty", "")).err, "q7r: standard input: not a scene file: it is empty\n");
  EXPECT_NE(Piped("compositions --json -", composition).out.find("\"exported\": 2"), std::string::npos);
}

#endif

TEST_F(ManyFiles, ComeOutTheSameWhenTheyAreToBeReproducible)
{
  const std::string one = Write("in/one.json", kSolid), two = Write("in/two.json", std::string(kSolid) + " ");
  const auto bytes = [&](const std::string& name) { return ReadWholeFile(folder_ / name); };
  const auto run = [&](const std::string& arguments, const std::string& date = {}) {
    const RunResult result = RunQ7r(arguments + " --force --reproducible", date);
    EXPECT_EQ(result.status, 0) << arguments << result.err;
  };
  run("export " + two + " " + one + " --jobs 1 -o " + Place("x"));
  run("export " + one + " " + two + " --jobs 2 -o " + Place("y"));
  for (const std::string name : {"one.q7r", "two.q7r"})
    EXPECT_EQ(bytes("x/" + name), bytes("y/" + name));
  EXPECT_NE(bytes("x/one.q7r"), bytes("x/two.q7r")) << "other identifiers follow from other content";
  EXPECT_NE(RunQ7r("info " + Place("x/one.q7r")).out.find("1980/01/01 00:00:00"), std::string::npos);
#ifndef _WIN32
  run("export " + one + " " + Place("d.q7r"), "TZ=Asia/Tokyo SOURCE_DATE_EPOCH=1700000000");
  EXPECT_NE(RunQ7r("info " + Place("d.q7r")).out.find("2023/11/14 22:13:20"), std::string::npos);
  run("resave " + Place("d.q7r") + " " + Place("d2.q7r"));
  EXPECT_NE(RunQ7r("info " + Place("d2.q7r")).out.find("2023/11/14 22:13:20"), std::string::npos);
  const RunResult bad =
      RunQ7r("resave --reproducible " + Place("d.q7r") + " " + Place("e.q7r"), "SOURCE_DATE_EPOCH=now");
  EXPECT_EQ(bad.status, 2);
  EXPECT_NE(bad.err.find("SOURCE_DATE_EPOCH is \"now\""), std::string::npos) << bad.err;
#endif
  for (const std::string name : {"1.q7r", "2.q7r"}) {
    run("merge " + Place("x/one.q7r") + " " + Place("x/two.q7r") + " -o " + Place("m" + name));
    run("resave " + Place("x/one.q7r") + " " + Place("r" + name));
  }
  EXPECT_EQ(bytes("m1.q7r"), bytes("m2.q7r"));
  EXPECT_EQ(bytes("r1.q7r"), bytes("r2.q7r"));
}

TEST_F(ManyFiles, TellMissingPicturesOnceAndHoldPathsFromTheScene)
{
  const std::string shot = Write("shot/shot.json", kShot);
  Write("shot/pictures/a.png", "");
  fs::create_directories(folder_ / "scenes");
  const RunResult run = RunQ7r("export --relative " + shot + " " + Place("scenes/../scenes/s.q7r"));
  EXPECT_EQ(run.status, 1);
  EXPECT_EQ(Count(run.err, "warning: " + (folder_ / "shot/shot.json") + ": the picture "), 2U) << run.err;
  EXPECT_EQ(Count(run.err, "gone.png\" is not there"), 1U) << run.err;
  const std::string dump = RunQ7r("dump " + Place("scenes/s.q7r")).out;
  const bool isSlash = fs::path::preferred_separator == '/';
  EXPECT_EQ(Count(dump, isSlash ? "\"../shot/pictures/a.png\"" : R"("..\\shot\\pictures\\a.png")"), 1U) << dump;
  EXPECT_EQ(Count(dump, isSlash ? R"("C:\\footage\\c.png")" : R"(footage\\c.png")"), 1U);
  const RunResult quiet = RunQ7r("export --quiet " + shot + " " + Place("scenes/q.q7r"));
  EXPECT_EQ(quiet.status, 1);
  EXPECT_EQ(quiet.out + quiet.err, "");
}

} // namespace
