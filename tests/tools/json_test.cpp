// What --json prints: all of it fits docs/json-schema.json, and says what it should.

#include "support/full_scene.h"
#include "support/json_schema.h"
#include "support/library.h"
#include "support/run_q7r.h"

namespace
{

const JsonSchema& Schema()
{
  static const JsonSchema schema(Json::parse(std::ifstream(TEST_SOURCE_DIR "/docs/json-schema.json")));
  return schema;
}

std::string Write(const TempFolder& folder, const std::string& name, const Bytes& bytes)
{
  WriteWholeFile(folder / name, bytes);
  return folder / name;
}

std::string WriteText(const TempFolder& folder, const std::string& name, const std::string& text)
{
  return Write(folder, name, {text.begin(), text.end()});
}

// An unknown object, with chunks that nobody knows around it.
Bytes StrangeScene()
{
  return WithHeader(Record("[110059,0 [777002,1 L5 ] [110107,0 [110100,0 [5154,0 [777001,3 B1 ] "
                           "[110064,9 L1012345 L SFog R0.25 ] [110108,0 [110100,0 [5691,0 [110064,8 L1012346 L SMark "
                           "X110000000000000001 ] ] ] ] ] ] ] ]"));
}

Json Parsed(const std::string& text)
{
  Json json = Json::parse(text, nullptr, false);
  EXPECT_FALSE(json.is_discarded()) << text;
  return json;
}

} // namespace

TEST(Json, FitsTheSchemaInEveryVerb)
{
  const TempFolder folder;
  const std::string full = Write(folder, "full.q7r", SaveToBytes(*full_scene::MakeFullScene()));
  const std::string strange = Write(folder, "strange.q7r", StrangeScene());
  const std::string comp =
      WriteText(folder, "comp.json", R"({"fr":25,"ip":0,"op":50,"w":10,"h":5,"nm":"M","layers":[]})");
  const std::string cut = WriteText(folder, "cut.q7r", std::string("QQ7RQ7R6\0\0\x32\xC8\0\x01\0\0", 16));
  const std::string ies =
      WriteText(folder, "disc.ies", "IESNA91\nTILT=NONE\n1 -1 2 2 1 1 1 -1 0 0  1 1 50  0 180 0 9 9\n");
  const std::tuple<const char*, std::string, int> cases[] = {
      {"info", "info " + Quoted(full), 0},
      {"tree", "tree " + Quoted(full), 0},
      {"tree", "tree --no-keys --depth 0 " + Quoted(full), 0},
      {"tree", "tree --objects '*any?hin*' " + Quoted(full), 0},
      {"tree", "tree " + Quoted(strange), 0},
      {"dump", "dump " + Quoted(full), 0},
      {"dump", "dump --bytes " + Quoted(strange), 0},
      {"check", "check " + Quoted(full), 1},
      {"check", "check " + Quoted(cut), 1},
      {"ies", "ies " + Quoted(ies), 0},
      {"compositions", "compositions " + Quoted(comp), 0},
      {"diff", "diff " + Quoted(full) + " " + Quoted(strange), 1},
      {"diff", "diff --all " + Quoted(full) + " " + Quoted(full), 0},
      {"written", "resave " + Quoted(full) + " " + Quoted(folder / "again.q7r"), 0},
      {"error", "resave " + Quoted(full) + " " + Quoted(folder / "again.q7r"), 2},
      {"error", "info " + Quoted(folder / "none.q7r"), 2},
      {"error", "tree " + Quoted(cut), 2},
      {"error", "dance", 2},
      {"error", "tree --loud " + Quoted(full), 2},
  };
  for (const auto& [form, arguments, status] : cases) {
    SCOPED_TRACE(arguments);
    const RunResult run = RunQ7r(arguments + " --json");
    EXPECT_EQ(run.status, status);
    EXPECT_EQ(run.err, "");
    std::istringstream lines(run.out);
    std::string text = run.out;
    for (bool more = form != std::string("dump") || std::getline(lines, text); more;
         more = form == std::string("dump") && std::getline(lines, text)) {
      const Json json = Parsed(text);
      ASSERT_EQ(Schema().Fault(json, form), "");
      ASSERT_EQ(json["schema"], 1);
      if (text.size() == run.out.size() && text.size() < 4000) {
        ASSERT_EQ(Schema().Fault(json), "");
      }
    }
  }
}

// What lets the schema and the program drift apart unseen.
TEST(Json, SchemaRefusesWhatItDoesNotKnow)
{
  const Json error = Json::parse(R"({"schema": 1, "error": {"file": "a", "offset": 1, "path": null, "message": "m"}})");
  ASSERT_EQ(Schema().Fault(error), "");
  const std::pair<const char*, Json> changes[] = {{"/more", 1},           {"/schema", 2},     {"/error/offset", "1"},
                                                  {"/error/offset", 1.5}, {"/error/line", 1}, {"/error", 1}};
  for (const auto& [place, value] : changes) {
    Json changed = error;
    changed[Json::json_pointer(place)] = value;
    EXPECT_NE(Schema().Fault(changed, "error"), "") << place;
  }
  Json without = error;
  without["error"].erase("message");
  EXPECT_NE(Schema().Fault(without, "error"), "");
  EXPECT_NE(JsonSchema(Json::parse(R"({"type": "integer", "multipleOf": 2})")).Fault(2), "");
}

TEST(Json, TellsWhereAndWhy)
{
  const TempFolder folder;
  const std::string cut =
      WriteText(folder, "cut.q7r", std::string("QQ7RQ7R6\0\0\x32\xC8\0\x01\0\x01\xAD\xEB\0\0\0\0\x0F\0\0\0", 26));
  const Json error = Parsed(RunQ7r("tree --json " + Quoted(cut)).out)["error"];
  EXPECT_EQ(error["file"], cut);
  EXPECT_EQ(error["path"], "110059");
  EXPECT_GE(error["offset"], 22);
  EXPECT_NE(error["message"].get<std::string>().find("byte"), std::string::npos);
  const Json missing = Parsed(RunQ7r("info --json " + Quoted(folder / "none.q7r")).out)["error"];
  EXPECT_EQ(missing["message"], "No such file or directory");
  EXPECT_EQ(missing["offset"], nullptr);
  const std::tuple<const char*, const char*, Json, Json> inputs[] = {
      {"a.json", "{\"w\":\n", 6, nullptr}, {"b.json", "{\"w\": \"x\"}", nullptr, "/w"}, {"c.aep", "RIFX", 0, nullptr}};
  for (const auto& [name, text, offset, path] : inputs) {
    const std::string input = WriteText(folder, name, text);
    const Json wrong = Parsed(RunQ7r("compositions --json " + Quoted(input)).out)["error"];
    EXPECT_EQ(Json({wrong["file"], wrong["offset"], wrong["path"]}), Json({input, offset, path})) << wrong;
  }
}

TEST(Json, KeepsEveryCharacterAndDigit)
{
  const TempFolder folder;
  const DocumentPtr document = NewDocument();
  BaseObject* object = AllocObject(kObjectCamera);
  const UniChar name[] = {'"', '\\', '/', 1, 0x1F, 0x7F, '\n', 0xE9, 0x20AC, 0xD83D, 0xDE00, 0xD800};
  object->SetName(String(name, 12));
  object->SetRelPos({0.1, -1e-300, 12345678901234567.0});
  object->GetDataInstance().SetLLong(770000, -9007199254740993);
  document->InsertObject(object);
  const std::string scene = Write(folder, "scene.q7r", SaveToBytes(*document));
  const std::string text = RunQ7r("tree --json " + Quoted(scene)).out;
  const Json told = Parsed(text)["objects"][0];
  EXPECT_EQ(told["name"], "\"\\/\x01\x1F\x7F\n\xC3\xA9\xE2\x82\xAC\xF0\x9F\x98\x80\xEF\xBF\xBD");
  EXPECT_EQ(told["pos"], Json({0.1, -1e-300, 12345678901234567.0}));
  EXPECT_EQ(told["data"]["770000"], -9007199254740993);
  EXPECT_NE(text.find("\"focalLength\": 36.0"), std::string::npos);
  EXPECT_EQ(told["named"]["projectionWords"], "perspective");
}

TEST(Tree, ChoosesObjectsKeysAndDepth)
{
  const TempFolder folder;
  const DocumentPtr document = NewDocument();
  BaseObject* parent = nullptr;
  for (const char* name : {"Body", "Arm left", "Hand"}) {
    BaseObject* object = AllocObject(kObjectNull);
    object->SetName(name);
    object->SetRelPos({1, 0, 0});
    if (parent)
      object->InsertUnderLast(parent);
    else
      document->InsertObject(object);
    parent = object;
  }
  CTrack* track = CTrack::Alloc(parent, kObjectRenderMode, "Turn");
  track->GetCurve(1, 1)->AddKey(BaseTime(1, 2));
  parent->InsertTrackLast(track);
  const std::string scene = Quoted(Write(folder, "scene.q7r", SaveToBytes(*document)));
  const auto objects = [&](const std::string& options) {
    return Parsed(RunQ7r("tree --json " + options + " " + scene).out)["objects"];
  };
  const Json arm = objects("--objects " + Quoted("A*l?ft"));
  ASSERT_EQ(arm.size(), 1U);
  EXPECT_EQ(arm[0]["below"], "Body");
  EXPECT_EQ(arm[0]["global"][0], 2.0);
  EXPECT_EQ(arm[0]["children"][0]["tracks"][0]["keys"].size(), 1U);
  EXPECT_EQ(objects("--objects Leg").size(), 0U);
  EXPECT_FALSE(objects("--no-keys")[0]["children"][0]["children"][0]["tracks"][0].contains("keys"));
  const Json body = objects("--depth 1")[0];
  EXPECT_EQ(body["children"][0]["childCount"], 1);
  EXPECT_FALSE(body["children"][0].contains("children"));
  EXPECT_NE(RunQ7r("tree --depth 0 " + scene).out.find("Null \"Body\"  pos (1, 0, 0)\n    (1 child)\n"),
            std::string::npos);
  EXPECT_NE(RunQ7r("tree --objects Hand " + scene).out.find("Hand\"  below \"Body/Arm left\"  pos (1, 0, 0)\n"),
            std::string::npos);
}

// Two files that differ in the last byte of a long block alone.
TEST(Dump, TellsAnyTwoFilesApart)
{
  const TempFolder folder;
  std::string outputs[4][2];
  const char* const forms[4] = {"dump ", "dump --json ", "dump --bytes ", "dump --bytes --json "};
  for (int i = 0; i < 2; ++i) {
    ByteWriter w;
    w.Header().Start(110059, 0).Memory(std::string(5000, 'a') + (i == 0 ? "b" : "c")).End();
    const std::string path = Quoted(Write(folder, "scene.q7r", w.bytes));
    for (int form = 0; form < 4; ++form)
      outputs[form][i] = RunQ7r(forms[form] + path).out;
  }
  for (int form = 0; form < 4; ++form)
    EXPECT_NE(outputs[form][0], outputs[form][1]) << forms[form];
  EXPECT_NE(outputs[0][0].find("5001 bytes 61 61"), std::string::npos);
  EXPECT_NE(outputs[2][0].find(" 61 62\n"), std::string::npos);
  EXPECT_NE(outputs[3][1].find("6163\"}"), std::string::npos);
}
