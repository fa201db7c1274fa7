// What a composition file becomes: items, settings, layers and their streams.
#include "stage.h"

#include <filesystem>

#include "support/temp_folder.h"

namespace
{

using stage::Answer;
using stage::Fraction;
using stage::Load;
using stage::Stage;

host::Project LoadText(const std::string& text)
{
  return host::LoadCompositionText(text, "orbit.json", stage::kFolder);
}

TEST(CompositionSettings, GiveTheExactFrameDuration)
{
  const std::tuple<const char*, A_long, A_u_long> cases[] = {
      {"25", 1, 25},          {"30.0000005", 1, 30},        {"1", 1, 1},
      {"999", 1, 999},        {"23.976", 1001, 24000},      {"29.97", 1001, 30000},
      {"59.94", 1001, 60000}, {"29.97002997", 1001, 30000}, {"12.5", 1000, 12500},
      {"29.9", 1000, 29900},  {"0.5", 1000, 500},           {"0.999", 1001, 1000},
      {"0.00001", 1000, 1},   {"30.00001", 1000, 30000},
  };
  for (const auto& [text, value, scale] : cases) {
    SCOPED_TRACE(text);
    const Stage stage(LoadText(std::string(R"({"w": 1, "h": 1, "ip": 0, "op": 9, "layers": [], "fr": )") + text + "}"));
    const A_Time duration = Answer(stage.comps->AEGP_GetCompFrameDuration, stage.ActiveComp());
    EXPECT_EQ(std::pair(value, scale), Fraction(duration));
    EXPECT_EQ(std::stod(text), Answer(stage.comps->AEGP_GetCompFramerate, stage.ActiveComp()));
  }
}

TEST(CompositionSettings, GiveTheWorkAreaAndPixelAspectOfEachComposition)
{
  const char* const assets = R"("assets": [
      {"id": "a", "layers": [], "ae": {"workArea": [-3, 6.4], "pixelAspect": [10, 11]}},
      {"id": "b", "nm": "Inner", "layers": []},
      {"id": "c", "layers": [], "ae": {"workArea": [8, 8]}}])";
  Stage stage(LoadText(std::string(R"({"w": 9, "h": 9, "fr": 29.97, "ip": 1.5, "op": 60, "layers": [],
      "ae": {"workArea": [10, 20]}, )") +
                       assets + "}"));
  const std::tuple<const char*, A_long, A_long, A_Ratio> cases[] = {
      {"orbit", 10 * 1001, 10 * 1001, {1, 1}},
      {"a", -3 * 1001, 9 * 1001, {10, 11}},
      {"Inner", 2 * 1001, 58 * 1001, {1, 1}}, // that of the root's frames
      {"b", 2 * 1001, 58 * 1001, {1, 1}},
      {"c", 8 * 1001, 0, {1, 1}}};
  for (const auto& [composition, start, duration, wanted] : cases) {
    SCOPED_TRACE(composition);
    ASSERT_TRUE(stage.host.ActivateComposition(composition));
    const AEGP_CompH comp = stage.ActiveComp();
    EXPECT_EQ(std::pair(start, 30000u), Fraction(Answer(stage.comps->AEGP_GetCompWorkAreaStart, comp)));
    EXPECT_EQ(std::pair(duration, 30000u), Fraction(Answer(stage.comps->AEGP_GetCompWorkAreaDuration, comp)));
    const A_Ratio aspect = Answer(stage.items->AEGP_GetItemPixelAspectRatio, stage.ActiveItem());
    EXPECT_TRUE(wanted.num == aspect.num && wanted.den == aspect.den);
  }
  EXPECT_FALSE(stage.host.ActivateComposition("nowhere") || stage.host.ActivateComposition(""));
}

struct ItemCase
{
  const char* name;
  const char* path;
  A_long width, height, files;
};

void ExpectItem(const ItemCase& expected, const host::Item& item)
{
  SCOPED_TRACE(expected.name);
  const std::string path =
      *expected.path == '/' ? (stage::kFolder / (expected.path + 1)).make_preferred().string() : expected.path;
  EXPECT_TRUE(expected.name == item.name && item.path == path && expected.width == item.width);
  EXPECT_TRUE(expected.height == item.height && expected.files == item.files);
}

TEST(ProjectItems, TakeNamesSizesAndPathsFromTheirAssets)
{
  const host::Project project = Load(
      R"({"ty": 0, "refId": "plain"}, {"ty": 0, "refId": "plain", "w": 5, "h": 5},
         {"ty": 0, "refId": "sized"}, {"ty": 0, "refId": "used", "w": 40, "h": 30},
         {"ty": 1, "nm": "Wall", "sw": 20, "sh": 10, "sc": "#ff0033"}, {"ty": 1, "sc": "#f80"}, {"ty": 3, "nm": ""})",
      R"("assets": [
        {"id": "plain", "layers": []},
        {"id": "sized", "nm": "Sized", "layers": [], "w": 300.4, "h": 200},
        {"id": "used", "layers": []},
        {"id": "i1", "u": "images/", "p": "sky.png", "w": 64, "h": 48},
        {"id": "i2", "u": "", "p": "a/b/leaf_[000-099].png", "w": 8, "h": 9, "ae": {"files": 100}},
        {"id": "i3", "nm": "Clip", "p": "../clip.mov", "w": 1, "h": 2},
        {"id": "i4", "e": 1, "p": "data:image/png;base64,AA/BB=="},
        {"id": "sound", "u": "audio/", "p": "hum.mp3", "w": 0, "h": 0},
        {"id": "font"}])");
  const ItemCase expected[] = {
      {"orbit", "", 100, 80, 1},
      {"plain", "", 100, 80, 1}, // its first use states no size
      {"Sized", "", 300, 200, 1},
      {"used", "", 40, 30, 1},
      {"sky.png", "/images/sky.png", 64, 48, 1},
      {"leaf_[000-099].png", "/a/b/leaf_[000-099].png", 8, 9, 100},
      {"Clip", "", 1, 2, 1},
      {"i4", "i4", 0, 0, 1},
      {"hum.mp3", "/audio/hum.mp3", 0, 0, 1},
      {"Wall", "", 20, 10, 1},
      {"Solid", "", 100, 100, 1},
      {"Null", "", 100, 100, 1},
  };
  ASSERT_EQ(std::size(expected), project.items.size());
  for (std::size_t i = 0; i < std::size(expected); ++i)
    if (i != 6)
      ExpectItem(expected[i], project.items[i]);
  EXPECT_EQ((stage::kFolder.parent_path() / "clip.mov").string(), project.items[6].path);
}

TEST(ProjectItems, AnswerThroughTheSuites)
{
  const Stage stage(R"({"ty": 1, "sc": "#FF8000", "ddd": 1}, {"ty": 1, "sc": "#0af"}, {"ty": 3, "nm": "Handle"},
                       {"ty": 2, "refId": "i"}, {"ty": 0, "refId": "c"}, {"ty": 5})",
                    R"("assets": [{"id": "i", "p": "x.png", "w": 7, "h": 6, "ae": {"files": 3}},
                                  {"id": "c", "nm": "Raum \u00fc \ud83d\ude80", "layers": []}])");
  const AEGP_FootageSignature kSolid = 0x536F6C69;
  const AEGP_FootageSignature signatures[] = {kSolid, kSolid, kSolid, 0};
  const double colors[][3] = {{1, 128 / 255.0, 0}, {0, 170 / 255.0, 1}, {1, 1, 1}};
  for (A_long i = 0; i < 4; ++i) {
    SCOPED_TRACE(i);
    const AEGP_FootageH footage = Answer(stage.footage->AEGP_GetMainFootageFromItem, stage.Source(i));
    AEGP_ColorVal color{};
    EXPECT_EQ(signatures[i], Answer(stage.footage->AEGP_GetFootageSignature, footage));
    EXPECT_EQ(4, Answer(stage.items->AEGP_GetItemType, stage.Source(i)));
    EXPECT_EQ(i < 3, stage.footage->AEGP_GetSolidFootageColor(stage.Source(i), 0, &color) == 0);
    if (i < 3) {
      EXPECT_EQ(std::tuple(1, colors[i][0], colors[i][1], colors[i][2]),
                std::tuple(color.alphaF, color.redF, color.greenF, color.blueF));
    }
  }
  const AEGP_FootageH footage = Answer(stage.footage->AEGP_GetMainFootageFromItem, stage.Source(3));
  A_long mainFiles = 0, perFrame = 0;
  EXPECT_EQ(0, stage.footage->AEGP_GetFootageNumFiles(footage, &mainFiles, &perFrame));
  EXPECT_TRUE(mainFiles == 3 && perFrame == 1);
  AEGP_MemHandle path = Answer(stage.footage->AEGP_GetFootagePath, footage, 0, 0);
  EXPECT_EQ((stage::kFolder / "x.png").u16string(), stage.TakeText<char16_t>(path));
  EXPECT_NE(0, stage.footage->AEGP_GetFootagePath(footage, 3, 0, &path));

  EXPECT_EQ(2, Answer(stage.items->AEGP_GetItemType, stage.Source(4)));
  EXPECT_EQ(u"Raum \u00fc \U0001F680", stage.ItemName(stage.Source(4)));
  EXPECT_EQ(nullptr, Answer(stage.footage->AEGP_GetMainFootageFromItem, stage.Source(4)));
  EXPECT_EQ(nullptr, stage.Source(5));
  EXPECT_EQ(nullptr, Answer(stage.comps->AEGP_GetCompFromItem, stage.Source(0)));
}

// --- Layers

TEST(Layers, HaveTheirKindFlagsAndPlaceInTheList)
{
  // 0x800 stands for 3D.
  const std::tuple<const char*, AEGP_ObjectType, AEGP_LayerFlags> cases[] = {
      {R"({"ty": 0, "ddd": 1})", 0, 0x801},
      {R"({"ty": 1, "hd": true})", 0, 0},
      {R"({"ty": 2, "hd": false, "ddd": 0})", 0, 1},
      {R"({"ty": 3, "ddd": 1, "ae": {"locked": true}})", 0, 0x10821},
      {R"({"ty": 4, "ddd": 1})", 4, 0x801},
      {R"({"ty": 5, "ddd": 1})", 3, 0x801},
      {R"({"ty": 6, "ddd": 1})", 0, 1},
      {R"({"ty": 8, "ddd": 1})", 0, 0x801},
      {R"({"ty": 9})", 0, 1},
      {R"({"ty": 13})", 2, 0x801},
      {R"({"ty": 13, "ks": {"a": {"k": 0}}})", 2, 0x2801},
      {R"({"ty": 13, "ks": {"a": {"k": 0}}, "ae": {"autoOrient": false}})", 2, 0x801},
      {R"({"ty": 14, "ks": {"a": {"k": 0}}})", 1, 0x801},
      {R"({"ty": 14, "light": {"type": "spot"}, "ks": {"a": {"k": 0}}})", 1, 0x2801},
      {R"({"ty": 14, "light": {"type": "parallel"}, "ks": {"a": {"k": 0}}})", 1, 0x2801},
      {R"({"ty": 14, "light": {"type": "ambient"}, "ks": {"a": {"k": 0}}})", 1, 0x801},
      {R"({"ty": 2, "ks": {"a": {"k": 0}}})", 0, 1},
      {R"({"ty": 7, "ddd": 1})", -1, 1},
      {R"({"ddd": 1})", -1, 1},
  };
  for (const auto& [layer, type, flags] : cases) {
    SCOPED_TRACE(layer);
    const Stage stage(layer);
    EXPECT_EQ(type, Answer(stage.layers->AEGP_GetLayerObjectType, stage.Layer(0)));
    EXPECT_EQ(flags, Answer(stage.layers->AEGP_GetLayerFlags, stage.Layer(0)));
    EXPECT_EQ((flags & 0x800) != 0, Answer(stage.layers->AEGP_IsLayer3D, stage.Layer(0)));
  }
}

TEST(Layers, CountTheirIdsThroughTheAssetsAndFindParentsInTheirList)
{
  Stage stage(R"({"ty": 3, "ind": 7, "parent": 9}, {"ty": 5, "nm": "Titel \u2014", "ind": 9})",
              R"("assets": [{"id": "i", "p": "x.png"}, {"id": "c", "layers": [{"ty": 3, "ind": 9}]},
                            {"id": "d", "layers": [{"ty": 3}, {"ty": 3, "ind": 1, "parent": 2}, {"ty": 3, "ind": 2}]}])");
  const auto id = [&](AEGP_LayerH layer) { return Answer(stage.layers->AEGP_GetLayerID, layer); };
  const auto parent = [&](A_long index) { return Answer(stage.layers->AEGP_GetLayerParent, stage.Layer(index)); };
  EXPECT_EQ(1, id(stage.Layer(0)));
  EXPECT_EQ(stage.Layer(1), parent(0));
  EXPECT_EQ(nullptr, parent(1));
  AEGP_MemHandle name = nullptr, source = nullptr;
  EXPECT_EQ(0, stage.layers->AEGP_GetLayerName(0, stage.Layer(1), &name, nullptr));
  EXPECT_EQ(u"Titel \u2014", stage.TakeText<char16_t>(name));
  EXPECT_EQ(0, stage.layers->AEGP_GetLayerName(0, stage.Layer(0), &name, &source));
  EXPECT_EQ(u"", stage.TakeText<char16_t>(name));
  EXPECT_EQ(u"Null", stage.TakeText<char16_t>(source));
  AEGP_LayerH none = nullptr;
  EXPECT_NE(0, stage.layers->AEGP_GetCompLayerByIndex(stage.ActiveComp(), 2, &none));
  EXPECT_NE(0, stage.layers->AEGP_GetCompLayerByIndex(stage.ActiveComp(), -1, &none));

  ASSERT_TRUE(stage.host.ActivateComposition("d"));
  EXPECT_EQ(3, Answer(stage.layers->AEGP_GetCompNumLayers, stage.ActiveComp()));
  EXPECT_EQ(4, id(stage.Layer(0))); // behind two of the root and one of "c"
  EXPECT_EQ(6, id(parent(1)));
}

TEST(Layers, AnswerForCamerasAndLightsAlone)
{
  const Stage stage(R"({"ty": 13}, {"ty": 13, "camera": {"type": "orthographic", "filmSize": 72,
                       "filmSizeUnits": "diagonal"}}, {"ty": 13, "camera": {"type": "perspective",
                       "filmSizeUnits": "vertical"}}, {"ty": 14}, {"ty": 14, "light": {"type": "parallel"}},
                       {"ty": 14, "light": {"type": "spot"}}, {"ty": 14, "light": {"type": "ambient"}})");
  const AEGP_CameraType types[] = {0, 1, 0};
  const AEGP_FilmSizeUnits units[] = {1, 3, 2};
  const double sizes[] = {102.047244094488, 72, 102.047244094488};
  for (A_long i = 0; i < 3; ++i) {
    AEGP_FilmSizeUnits unit = 9;
    EXPECT_EQ(types[i], Answer(stage.cameras->AEGP_GetCameraType, stage.Layer(i)));
    EXPECT_EQ(sizes[i], Answer(stage.cameras->AEGP_GetCameraFilmSize, stage.Layer(i), &unit));
    EXPECT_EQ(units[i], unit);
  }
  const AEGP_LightType lights[] = {2, 0, 1, 3};
  for (A_long i = 3; i < 7; ++i)
    EXPECT_EQ(lights[i - 3], Answer(stage.lights->AEGP_GetLightType, stage.Layer(i)));
  AEGP_LightType light = 9;
  AEGP_CameraType camera = 9;
  EXPECT_NE(0, stage.lights->AEGP_GetLightType(stage.Layer(0), &light));
  EXPECT_NE(0, stage.cameras->AEGP_GetCameraType(stage.Layer(3), &camera));
}

TEST(Streams, AreLegalByTheKindOfLayer)
{
  using Ids = std::vector<AEGP_LayerStream>;
  const std::pair<const char*, Ids> cases[] = {
      {R"({"ty": 1})", {0, 1, 2, 3}},
      {R"({"ty": 2, "ddd": 1})", {0, 1, 2, 3, 8, 9, 10}},
      {R"({"ty": 6, "ddd": 1})", {0, 1, 2, 3}},
      {R"({"ty": 3, "ddd": 1})", {0, 1, 2, 3, 8, 9, 10}},
      {R"({"ty": 4, "ddd": 1, "ks": {"a": {"k": 0}}})", {1, 3, 8, 9, 10}},
      {R"({"ty": 5})", {1, 3}},
      {R"({"ty": 77, "ddd": 1})", {1, 3}},
      {R"({"ty": 13})", {1, 3, 8, 9, 10, 11, 13}},
      {R"({"ty": 13, "ks": {"a": {"k": 0}}, "ae": {"autoOrient": false}})", {0, 1, 3, 8, 9, 10, 11, 13}},
      {R"({"ty": 14, "ks": {"a": {"k": 0}}})", {1, 3, 8, 9, 10, 16, 17, 20, 28}},
      {R"({"ty": 14, "light": {"type": "parallel"}, "ks": {"a": {"k": 0}}})", {0, 1, 3, 8, 9, 10, 16, 17, 20, 28}},
      {R"({"ty": 14, "light": {"type": "spot"}})", {1, 3, 8, 9, 10, 16, 17, 18, 19, 20, 28}},
      {R"({"ty": 14, "light": {"type": "ambient"}, "ks": {"a": {"k": 0}}})", {16, 17}},
  };
  for (const auto& [layer, wanted] : cases) {
    SCOPED_TRACE(layer);
    Stage stage(layer);
    const auto* older = stage::Acquire<AEGP_StreamSuite7>(stage.host, "AEGP Stream Suite", 7);
    Ids legal, gettable;
    for (AEGP_LayerStream id = -1; id < 40; ++id) {
      const A_Boolean isLegal = Answer(stage.streams->AEGP_IsStreamLegal, stage.Layer(0), id);
      EXPECT_EQ(isLegal, Answer(older->AEGP_IsStreamLegal, stage.Layer(0), id));
      if (isLegal)
        legal.push_back(id);
      if (stage.Stream(0, id))
        gettable.push_back(id);
    }
    EXPECT_EQ(wanted, legal);
    EXPECT_EQ(wanted, gettable);
  }
}

TEST(Streams, ReadTheirPlaceOrTheirDefault)
{
  const char* const solid = R"({"ty": 1, "ddd": 1, "ks": {"a": {"k": [1, 2]}, "s": {"k": [50]}, "r": {"k": 30},
                               "rx": {"k": [40]}, "ry": {"k": 50}, "or": {"k": [5, 6, 7]}}})";
  const char* const spot = R"({"ty": 14, "light": {"type": "spot", "intensity": {"k": 70}, "color": {"k": [1, 0.5]},
                              "coneAngle": {"k": 60}, "coneFeather": {"k": 20}, "castsShadows": {"k": 1},
                              "shadowDarkness": {"k": 30}}})";
  const char* const plainSpot = R"({"ty": 14, "light": {"type": "spot"}})";
  const char* const zooming = R"({"ty": 13, "pe": {"k": [{"t": 5, "s": [800]}, {"t": 9, "s": [400]}]}})";
  const std::tuple<const char*, AEGP_LayerStream, host::Value, AEGP_StreamType> cases[] = {
      {solid, 0, {1, 2, 0}, 1},
      {solid, 1, {0, 0, 0}, 1},
      {solid, 2, {50, 100, 100}, 2},
      {solid, 3, {30}, 5},
      {solid, 8, {40}, 5},
      {solid, 9, {50}, 5},
      {solid, 10, {5, 6, 7}, 1},
      {R"({"ty": 1, "ks": {"r": {"k": 30}, "rz": {"k": 31}}})", 3, {31}, 5},
      {R"({"ty": 1})", 2, {100, 100, 100}, 2},
      {R"({"ty": 13})", 11, {0}, 5},
      {R"({"ty": 13})", 13, {0}, 5},
      {zooming, 11, {400}, 5},
      {zooming, 13, {800}, 5}, // the zoom's first value
      {R"({"ty": 13, "pe": {"k": 800}, "camera": {"focusDistance": {"k": 720}}})", 13, {720}, 5},
      {spot, 16, {70}, 5},
      {spot, 17, {1, 0.5, 1}, 6},
      {spot, 18, {60}, 5},
      {spot, 19, {20}, 5},
      {spot, 28, {1}, 5},
      {spot, 20, {30}, 5},
      {plainSpot, 16, {100}, 5},
      {plainSpot, 17, {1, 1, 1}, 6},
      {plainSpot, 18, {90}, 5},
      {plainSpot, 19, {50}, 5},
      {plainSpot, 28, {0}, 5},
      {plainSpot, 20, {100}, 5},
  };
  for (const auto& [layer, stream, expected, type] : cases) {
    SCOPED_TRACE(std::string(layer) + " stream " + std::to_string(stream));
    const Stage stage(layer);
    EXPECT_EQ(expected, stage.ValueAt(0, stream, {20, 25}));
    EXPECT_EQ(type, Answer(stage.streams->AEGP_GetStreamType, stage.Stream(0, stream)));
  }
}

TEST(LoadComposition, ReadsWhatUsersMadeWithoutAWarning)
{
  const std::filesystem::path folders[] = {TEST_SOURCE_DIR "/examples", TEST_SOURCE_DIR "/../shared/compositions"};
  std::size_t count = 0;
  for (const auto& folder : folders) {
    std::error_code error;
    for (const auto& entry : std::filesystem::directory_iterator(folder, error)) {
      if (entry.path().extension() != ".json")
        continue;
      SCOPED_TRACE(entry.path());
      const host::Project project = host::LoadComposition(entry.path());
      EXPECT_TRUE(project.warnings.empty()) << project.warnings.front();
      EXPECT_FALSE(project.root->layers.empty());
      ++count;
    }
  }
  EXPECT_GE(count, 6u); // the project's own
}

TEST(LoadComposition, FindsParentsAndNestedLayersOfAUsersFile)
{
  const std::filesystem::path file = TEST_SOURCE_DIR "/../shared/compositions/parented-rotation.json";
  if (!std::filesystem::exists(file))
    GTEST_SKIP() << "the users' compositions are not here";
  const Stage stage(host::LoadComposition(file));
  EXPECT_EQ(u"Parented Rotation", stage.ItemName(stage.ActiveItem()));
  EXPECT_EQ(stage.Layer(0), Answer(stage.layers->AEGP_GetLayerParent, stage.Layer(1)));
  EXPECT_EQ(host::Value{45}, stage.ValueAt(0, AEGP_LayerStream_ROTATE_Z, {30, 60}));
  // Half way between two keys of a curve that is the same seen from both ends.
  EXPECT_NEAR(22.5, stage.ValueAt(0, AEGP_LayerStream_ROTATE_Z, {15, 60})[0], 1e-9);
  EXPECT_EQ((host::Value{0, 0, -879.126}), stage.ValueAt(1, AEGP_LayerStream_POSITION, {0, 60}));
}

TEST(LoadComposition, NamesTheFileThatItCannotRead)
{
  const TempFolder folder;
  const std::pair<std::filesystem::path, const char*> cases[] = {
      {folder.Path(), "director"}, {folder.Path() / "missing.json", "No such file or directory"}};
  for ([[maybe_unused]] const auto& [file, cause] : cases) {
    try {
      host::LoadComposition(file);
      ADD_FAILURE() << file;
    } catch (const host::CompositionError& error) {
      const std::string text = error.what();
      EXPECT_TRUE(text.starts_with(file.string() + ": ")) << text;
#ifndef _WIN32 // a folder is refused there in other words
      EXPECT_NE(text.find(cause), std::string::npos) << text;
#endif
    }
  }
}

} // namespace
