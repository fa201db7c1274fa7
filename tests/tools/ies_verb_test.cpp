// The verb ies on makers' files and on files that it can't read; lights, cameras and views in tree.

#include "support/library.h"
#include "support/run_q7r.h"

namespace
{

const std::string kFile = "IESNA91\n[MANUFAC] Sun\n[LUMINAIRE] Disc \"A\"\nTILT=NONE\n"
                          "1 -1 2 2 1 1 1 -1 0 0  1 1 50  0 180  0  100 100\n";

std::string Write(const TempFolder& folder, const std::string& name, const std::string& text)
{
  WriteWholeFile(folder / name, {text.begin(), text.end()});
  return folder / name;
}

// Standard output as JSON.
Json Parsed(const RunResult& run)
{
  EXPECT_EQ(run.status, 0) << run.err;
  EXPECT_EQ(run.err, "");
  return Json::parse(run.out, nullptr, false);
}

void ExpectParts(const std::string& text, const std::vector<std::string>& parts)
{
  for (const std::string& part : parts)
    EXPECT_NE(text.find(part), std::string::npos) << part << " is not in\n" << text;
}

} // namespace

TEST(IESVerb, TellsTheMakersLumens)
{
  const std::filesystem::path folder = TEST_SOURCE_DIR "/../shared/ies";
  if (!std::filesystem::exists(folder))
    GTEST_SKIP() << "makers' files are not beside this tree";
  for (const auto& [name, lumens, vertical, horizontal] :
       {std::tuple<const char*, double, Long, Long>{"luminaire-1", 9217.18, 74, 12},
        {"luminaire-3", 13359.57, 37, 25},
        {"luminaire-5", 753.8, 37, 5}}) {
    const Json json = Parsed(RunQ7r("ies --json " + Quoted((folder / (std::string(name) + ".ies")).string())));
    EXPECT_NEAR(json["lumens"].get<double>(), lumens, 0.001 * lumens) << name;
    EXPECT_EQ(json["verticalAngles"].size(), vertical);
    EXPECT_EQ(json["candela"].size(), horizontal);
    EXPECT_EQ(json["candela"][1].size(), vertical);
  }
}

TEST(IESVerb, TellsWhatAFileHolds)
{
  const TempFolder folder;
  const std::string path = Write(folder, "disc.ies", kFile);
  const RunResult run = RunQ7r("ies " + Quoted(path));
  EXPECT_EQ(run.status, 0) << run.err;
  ExpectParts(run.out, {"IESNA91", "Sun", "Disc \"A\"", "0.3048 x 0.3048 x 0.3048 m", "2, 0 to 180 degrees",
                        "1, 0 to 0 degrees", "200\n", "12.56637\n", "2513.274\n"});
  const Json json = Parsed(RunQ7r("ies --json " + Quoted(path)));
  const Json expected = {{"schema", 1},
                         {"fileVersion", 1},
                         {"tiltMode", 1},
                         {"manufacturer", "Sun"},
                         {"luminaireCatalogue", ""},
                         {"luminaire", "Disc \"A\""},
                         {"lampCatalogue", ""},
                         {"lamp", ""},
                         {"shape", 0},
                         {"shapeWords", "round"},
                         {"size", {0.3048, 0.3048, 0.3048}},
                         {"verticalCount", 2},
                         {"horizontalCount", 1},
                         {"verticalAngles", {0.0, 180.0}},
                         {"horizontalAngles", {0.0}},
                         {"candela", {{200.0, 200.0}}},
                         {"maxCandela", 200.0},
                         {"totalFlux", json["totalFlux"]},
                         {"lumens", json["lumens"]}};
  EXPECT_EQ(json, expected);
  EXPECT_NEAR(json["lumens"].get<double>(), 200 * 4 * 3.141592653589793, 1e-9);
  // The last factor is the lamp's power: no power at all changes nothing either.
  for (const char* power : {"0", "0.1", "-3", "1e9"}) {
    std::string file = kFile;
    file.replace(file.find("50 "), 2, power);
    EXPECT_EQ(Parsed(RunQ7r("ies --json " + Quoted(Write(folder, "power.ies", file)))), json) << power;
  }
}

TEST(IESVerb, SaysInAPlainSentenceWhyAFileCannotBeRead)
{
  const TempFolder folder;
  const std::pair<std::string, std::string> cases[] = {
      {folder / "none.ies", "No such file"},
      {Write(folder, "text.ies", "Once upon a time, there was light."), "no photometric file"},
      {Write(folder, "cut.ies", kFile.substr(0, kFile.size() - 5)), "numbers"},
      {Write(folder, "tilt.ies", "IESNA91\nTILT=lamp.tlt\n1 2 3"), "numbers"},
  };
  for (const auto& [path, says] : cases) {
    const RunResult run = RunQ7r("ies " + Quoted(path));
    EXPECT_EQ(run.status, 2);
    EXPECT_EQ(run.out, "");
    EXPECT_EQ(std::count(run.err.begin(), run.err.end(), '\n'), 1) << run.err;
    ExpectParts(run.err, {path, says});
    const RunResult json = RunQ7r("ies --json " + Quoted(path));
    EXPECT_EQ(json.status, 2);
    EXPECT_EQ(json.err, "");
    ExpectParts(json.out, {Json(path).dump(), says, "\"error\""});
  }
  EXPECT_EQ(RunQ7r("ies").status, 2);
  ExpectParts(RunQ7r("ies --help").out, {"Usage: q7r", "Example: q7r ies"});
}

TEST(Tree, ShowsLightsCamerasAndViews)
{
  const TempFolder folder;
  const DocumentPtr document = NewDocument();
  for (Long type : {kObjectLight, kObjectLight, kObjectCamera}) {
    BaseObject* object = AllocObject(type);
    object->SetName(type == kObjectCamera ? "Eye" : document->GetFirstObject() ? "Measured" : "Spot");
    document->InsertObject(object);
  }
  BaseObject* eye = document->GetFirstObject();
  BaseObject* measured = eye->GetNext();
  BaseObject* spot = measured->GetNext();
  document->SetSceneCamera(eye);
  eye->SetParameterById(kCameraApertureWidth, GeData(18.0));
  spot->SetParameterById(kLightType, GeData(static_cast<Long>(kLightSpot)));
  spot->SetParameterById(kLightShadow, GeData(Long{1}));
  spot->SetParameterById(kLightShadowDensity, GeData(0.4));
  IESLight* ies = nullptr;
  ASSERT_EQ(LoadIESFile(ies, Filename(Write(folder, "disc.ies", kFile).c_str())), 1);
  ASSERT_TRUE(SetIESLight(measured, ies, document.get()));
  DeleteObj(ies);
  const std::string path = folder / "scene.q7r";
  WriteWholeFile(path, SaveToBytes(*document));

  const RunResult text = RunQ7r("tree " + Quoted(path));
  EXPECT_EQ(text.status, 0) << text.err;
  ExpectParts(text.out, {"perspective, focal length 36 mm, aperture 18 mm, field of view 28.0725 degrees, focus 2000",
                         "spot, color (1, 1, 1), intensity 100 %, shadow 40 %, inner 0 degrees, outer 30 degrees",
                         "measured, color (1, 1, 1), intensity 100 %, distribution \"Disc \"A\"\", output 125664 lm "
                         "times the power in watts",
                         "    perspective through \"Eye\"\n    parallel, along an axis\n"
                         "    parallel, along an axis\n    parallel\n"});
  const Json json = Parsed(RunQ7r("tree --json " + Quoted(path)));
  const Json& objects = json["objects"];
  ASSERT_EQ(objects.size(), 3);
  EXPECT_EQ(objects[0]["params"], Json::object());
  EXPECT_EQ(objects[0]["data"]["1010"], 2000.0);
  EXPECT_EQ(objects[2]["params"].size(), 99);
  EXPECT_EQ(objects[2]["params"]["90002"], 1);
  EXPECT_EQ(objects[2]["params"]["90000"], Json({1.0, 1.0, 1.0}));
  EXPECT_EQ(objects[2]["params"]["90011"], 0.5235987755982988);
  EXPECT_EQ(objects[1]["params"]["90002"], 9);
  EXPECT_EQ(objects[1]["ies"]["luminaire"], "Disc \"A\"");
  EXPECT_FALSE(objects[1]["ies"].contains("lumens") || objects[2].contains("ies"));
  ASSERT_EQ(json["views"].size(), 1);
  const Json& draws = json["views"][0]["draws"];
  ASSERT_EQ(draws.size(), 4);
  EXPECT_EQ(draws[0]["sceneCamera"], "Eye");
  EXPECT_EQ(draws[1]["sceneCamera"], nullptr);
  EXPECT_EQ(draws[1]["camera"]["1001"], 6);
  EXPECT_EQ(draws[1]["camera"]["pos"], Json({600.0001, 300.0, -600.0}));
  EXPECT_EQ(draws[3]["data"]["1003"], 6);
}
