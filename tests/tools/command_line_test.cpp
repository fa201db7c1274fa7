// The program as its users meet it: results, exit status, and one plain line for everything that goes wrong.

#include "support/record_samples.h"
#include "support/run_q7r.h"

namespace
{

constexpr const char* kComposition = R"({"fr":25,"ip":0,"op":50,"w":1000,"h":500,"nm":"Main","layers":[
  {"ddd":1,"ty":13,"nm":"Eye","ks":{"p":{"k":[500,250,-800]}},"pe":{"k":800}},
  {"ddd":1,"ty":3,"nm":"Carrier","ind":1,"ks":{}},
  {"ddd":1,"ty":1,"nm":"Wall","parent":1,"sw":100,"sh":50,"sc":"#ff8000","ks":{"p":{"k":[10,20,30]}}}]})";

class CommandLine : public testing::Test
{
 protected:
  std::string Write(const std::string& name, const Bytes& bytes) const
  {
    WriteWholeFile(folder_ / name, bytes);
    return folder_ / name;
  }
  std::string Write(const std::string& name, const std::string& text) const
  {
    return Write(name, Bytes(text.begin(), text.end()));
  }
  // A scene made by the program itself.
  std::string Scene(const std::string& name = "scene.q7r") const
  {
    const RunResult run = RunQ7r("export " + Quoted(Write("in.json", kComposition)) + " " + Quoted(folder_ / name));
    EXPECT_EQ(run.status, 0) << run.err;
    return folder_ / name;
  }

  TempFolder folder_;
};

// Nothing on standard output and one line that holds all of `parts` on standard error.
void ExpectRefusal(const RunResult& run, const std::vector<std::string>& parts, int status = 2)
{
  EXPECT_EQ(run.status, status);
  EXPECT_EQ(run.out, "");
  EXPECT_EQ(std::count(run.err.begin(), run.err.end(), '\n'), 1) << run.err;
  for (const std::string& part : parts)
    EXPECT_NE(run.err.find(part), std::string::npos) << run.err << "does not say: " << part;
}

bool Contains(const Bytes& all, const Bytes& part)
{
  return std::search(all.begin(), all.end(), part.begin(), part.end()) != all.end();
}

TEST_F(CommandLine, ExportsASceneThatTheOtherVerbsUnderstand)
{
  const std::string scene = Scene();
  const RunResult check = RunQ7r("check " + Quoted(scene));
  EXPECT_EQ(check.status, 0) << check.out;
  EXPECT_NE(check.out.find("good"), std::string::npos);
  const RunResult tree = RunQ7r("tree " + Quoted(scene));
  EXPECT_EQ(tree.status, 0);
  for (const char* word : {"Eye", "Carrier", "Wall", "Camera", "Null", "Plane"})
    EXPECT_NE(tree.out.find(word), std::string::npos) << word << " is not in\n" << tree.out;
  const RunResult info = RunQ7r("info --json " + Quoted(scene));
  EXPECT_EQ(info.status, 0);
  for (const char* word : {"\"version\": 13000", "\"fps\": 25", "\"objects\": 4", "\"renderSettings\": 1"})
    EXPECT_NE(info.out.find(word), std::string::npos) << word << " is not in\n" << info.out;
  const RunResult dump = RunQ7r("dump " + Quoted(scene));
  EXPECT_EQ(dump.status, 0);
  EXPECT_NE(dump.out.find("110059"), std::string::npos);
}

TEST_F(CommandLine, RefusesCompositionsAndPathsWithOneLine)
{
  const std::string good = Write("good.json", kComposition);
  const std::string out = folder_ / "out.q7r";
  const std::tuple<const char*, std::string, std::vector<std::string>> cases[] = {
      {"no file", Quoted(folder_ / "none.json") + " " + Quoted(out), {"none.json"}},
      {"an empty file", Quoted(Write("empty.json", "")) + " " + Quoted(out), {"empty.json"}},
      {"no JSON",
       Quoted(Write("text.json", "Once upon a time")) + " " + Quoted(out),
       {"text.json", "neither an After Effects project nor"}},
      {"JSON that ends early",
       Quoted(Write("cut.json", "{\n \"w\": 1,")) + " " + Quoted(out),
       {"cut.json", "line 2, column", "ends before"}},
      {"a scene", Quoted(Write("s.q7r", "QQ7RQ7R6")) + " " + Quoted(out), {"s.q7r: is a scene file"}},
      {"JSON of something else", Quoted(Write("list.json", "[1, 2]")) + " " + Quoted(out), {"list.json"}},
      {"an unknown composition", Quoted(good) + " " + Quoted(out) + " --composition Moon", {"good.json", "Moon"}},
      {"a missing folder", Quoted(good) + " " + Quoted(folder_ / "missing/out.q7r"), {"missing/out.q7r"}},
      {"a folder as the output", Quoted(good) + " " + Quoted(folder_ / "folder"), {"folder.q7r", "folder"}},
  };
  std::filesystem::create_directory(folder_ / "folder.q7r");
  for (const auto& [name, arguments, says] : cases) {
    SCOPED_TRACE(name);
    ExpectRefusal(RunQ7r("export " + arguments), says);
    EXPECT_FALSE(std::filesystem::exists(out));
  }
}

TEST_F(CommandLine, LeavesAnExistingFileAloneWithoutForce)
{
  const std::string scene = Scene();
  const std::string other = Scene("other.q7r");
  const std::string old = Write("old.q7r", "precious");
  const std::string in = folder_ / "in.json";
  for (const std::string& arguments :
       {"export " + Quoted(in) + " " + Quoted(old), "resave " + Quoted(scene) + " " + Quoted(old),
        "merge " + Quoted(scene) + " " + Quoted(other) + " -o " + Quoted(old)}) {
    SCOPED_TRACE(arguments);
    Write("old.q7r", "precious");
    ExpectRefusal(RunQ7r(arguments), {"old.q7r", "--force"});
    EXPECT_EQ(ReadWholeFile(old).size(), 8U);
    const RunResult forced = RunQ7r(arguments + " --force");
    EXPECT_EQ(forced.status, 0) << forced.err;
    EXPECT_EQ(RunQ7r("info " + Quoted(old)).status, 0);
  }
}

TEST_F(CommandLine, SaysWhatIsWrongWithASceneFileAndDestroysNothing)
{
  const Bytes whole = ReadWholeFile(Scene());
  std::mt19937 random(5);
  Bytes noise(5000);
  std::generate(noise.begin(), noise.end(), [&] { return static_cast<std::uint8_t>(random()); });
  Bytes inside = whole;
  std::copy(noise.begin(), noise.begin() + 400, inside.begin() + 300);
  struct Case
  {
    const char* name;
    Bytes bytes;
    int checkStatus;
    const char* says = "byte ";
  };
  const Case cases[] = {{"empty.q7r", {}, 2, "not a scene file: it is empty"},
                        {"header.q7r", Bytes(whole.begin(), whole.begin() + 13), 1},
                        {"cut.q7r", Bytes(whole.begin(), whole.begin() + static_cast<long>(whole.size() / 2)), 1},
                        {"ident.q7r", ByteWriter().Header("Q7R5").Start(110059, 0).End().bytes, 2},
                        {"noise.q7r", noise, 2, "not a scene file"},
                        {"photo.q7r", {0xFF, 0xD8, 0xFF, 0xE0}, 2, "not a scene file but a JPEG picture"},
                        {"c.json", Bytes(kComposition, kComposition + 9), 2, "not a scene file but JSON"},
                        {"notes.txt", {'h', 'e', 'y'}, 2, "not a scene file but a text"},
                        {"inside.q7r", inside, 1}};
  for (const Case& c : cases) {
    SCOPED_TRACE(c.name);
    const std::string file = Write(c.name, c.bytes);
    for (const std::string& arguments :
         {"info " + Quoted(file), "tree " + Quoted(file), "resave " + Quoted(file) + " " + Quoted(folder_ / "new.q7r"),
          "resave --force " + Quoted(file) + " " + Quoted(file),
          "merge " + Quoted(folder_ / "scene.q7r") + " " + Quoted(file) + " -o " + Quoted(folder_ / "new.q7r")})
      ExpectRefusal(RunQ7r(arguments), {"q7r: " + file + ": ", c.says});
    const RunResult check = RunQ7r("check " + Quoted(file));
    EXPECT_EQ(check.status, c.checkStatus) << check.out << check.err;
    EXPECT_NE((check.out + check.err).find(c.says), std::string::npos);
    EXPECT_EQ(ReadWholeFile(file), c.bytes) << "the damaged file was touched";
    EXPECT_FALSE(std::filesystem::exists(folder_ / "new.q7r"));
  }
  ExpectRefusal(RunQ7r("info " + Quoted(folder_ / "none.q7r")),
                {(folder_ / "none.q7r") + ": No such file or directory"});
}

TEST_F(CommandLine, TellsArgumentsThatItCannotTake)
{
  const std::pair<const char*, const char*> cases[] = {
      {"", "which verb? (q7r --help"},
      {"help exprot", "there is no verb \"exprot\"; did you mean export?"},
      {"version", "there is no verb \"version\"; did you mean --version?"},
      {"info \"\"", "\"\": is no file name"},
      {"export \"\" a.q7r", "\"\": is no file name"},
      {"export a.json b --samples", "export: --samples needs a value"},
      {"dance", "there is no verb \"dance\" (q7r --help"},
      {"exprot a b", "there is no verb \"exprot\"; did you mean export?"},
      {"--verison", "there is no option --verison; did you mean --version?"},
      {"info", "info: FILE is required (q7r info --help"},
      {"export only-one.json", "only-one.json: where to?"},
      {"export a b c", "many files need a folder"},
      {"export a b --compositon=Main", "export: there is no option --compositon; did you mean --composition?"},
      {"tree a.q7r --loud", "tree: there is no option --loud (q7r tree --help"},
      {"merge a.q7r b.q7r", "merge: --output is required"},
      {"resave a b --jobs 0", "resave: --jobs: "},
      {"export a b --quiet --verbose", "--quiet excludes --verbose"},
      {"extract a -o b c", "extract: \"c\" is one argument too many"},
  };
  for (const auto& [arguments, says] : cases)
    ExpectRefusal(RunQ7r(arguments), {says});
  for (const char* verb : {"", "export", "info", "tree", "dump", "check", "resave", "merge", "diff"}) {
    const RunResult run = RunQ7r(std::string(verb) + " --help");
    EXPECT_EQ(run.status, 0) << verb;
    EXPECT_NE(run.out.find("Usage: q7r"), std::string::npos) << run.out;
    EXPECT_EQ(RunQ7r(std::string("help ") + verb).out, run.out);
  }
  EXPECT_EQ(RunQ7r("--version").status, 0);
}

// What every status means stands in two places.
TEST_F(CommandLine, TellsItsStatusInHelpAsInTheReadme)
{
  const std::string help = RunQ7r("--help").out;
  const Bytes bytes = ReadWholeFile(TEST_SOURCE_DIR "/README.md");
  const std::string readme(bytes.begin(), bytes.end());
  for (const std::string status : {"0", "1", "2"}) {
    const std::size_t row = readme.find("| " + status + " | ");
    ASSERT_NE(row, std::string::npos) << status;
    const std::string meaning = readme.substr(row + 6, readme.find(" |", row + 6) - row - 6);
    EXPECT_NE(help.find("  " + status + "  " + meaning + "\n"), std::string::npos) << meaning;
  }
}

// What other programs put into a scene: an object, a tag, a value and chunks of kinds that nobody here knows.
TEST_F(CommandLine, ResavesWhatItDoesNotKnowByteForByte)
{
  const std::string objectData = "[110064,9 L1012345 L SFog R0.25 [9,2 Sdeep ] ]";
  const std::string tagData = "[110064,8 L1012346 L SMark M6F6620616E6F74686572 X110000000000000001 ]";
  const std::string value = "L1000077 [0,4 L5 V1,2,3 ]";
  const std::string objectChunk = "[777001,3 B1 [5,5 L6 ] ]";
  const std::string documentChunk = "[777002,1 Sof-the-document X1D40000000 ]";
  const Bytes strange = Record("[110059,0 " + documentChunk + " [110107,0 [110100,0 [5154,0 [110050,0 L L [132,1 " +
                               "L1012345 L40 " + value + " ] C SFog ] " + objectChunk + " " + objectData +
                               " [110108,0 [110100,0 [5691,0 " + tagData + " ] ] ] ] ] ] ]");
  const std::string once = folder_ / "once.q7r";
  const std::string twice = folder_ / "twice.q7r";
  const RunResult first = RunQ7r("resave " + Quoted(Write("strange.q7r", ByteWriter().Header().Append(strange).bytes)) +
                                 " " + Quoted(once));
  ASSERT_EQ(first.status, 0) << first.err;
  const RunResult second = RunQ7r("resave " + Quoted(once) + " " + Quoted(twice));
  ASSERT_EQ(second.status, 0) << second.err;
  EXPECT_EQ(RunQ7r("check " + Quoted(once)).status, 0);
  for (const std::string& part : {objectData, tagData, value, objectChunk, documentChunk})
    EXPECT_TRUE(Contains(ReadWholeFile(once), Record(part)) && Contains(ReadWholeFile(twice), Record(part))) << part;
  EXPECT_EQ(ReadWholeFile(once).size(), ReadWholeFile(twice).size());
}

TEST_F(CommandLine, MergesWhatOtherFilesHold)
{
  const std::string all = folder_ / "all.q7r";
  const RunResult run = RunQ7r("merge " + Quoted(Scene("a.q7r")) + " " + Quoted(Scene("b.q7r")) + " -o " + Quoted(all));
  ASSERT_EQ(run.status, 0) << run.err;
  const RunResult info = RunQ7r("info --json " + Quoted(all));
  EXPECT_NE(info.out.find("\"objects\": 8"), std::string::npos) << info.out;
}

} // namespace
