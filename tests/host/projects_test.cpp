// What an After Effects project becomes: items, settings, layers, the values of their streams.
#include "project_stage.h"

#include "host/writer/composition_writer.h"

namespace project_tests
{

TEST(ProjectForms, GiveTheSameCompositions)
{
  Layer layer;
  layer.name = "A & \"B\" <\xC3\xBC>";
  layer.source = 60;
  Add(layer.transform, "ADBE Position", Body({.components = 3, .form = 0x0E, .value = {1.5, -2, 3}}));
  const std::vector<Node> root = Root({Folder("In", {Folder("Deeper", {MakeItem(WithLayers({MakeLayer(layer)}))})}),
                                       Footage(60, "C:\\Shots\\Sky & Sea.png", false, Settings(64, 48))});
  const std::string binary = BinaryFile(root), xml = XmlFile(root);
  std::string texts[2];
  for (std::size_t i = 0; i < 2; ++i)
    texts[i] = host::WriteComposition(Open(i == 0 ? binary : xml)->Read(0)).text;
  EXPECT_EQ(texts[0], texts[1]);
  EXPECT_NE(texts[0].find("Sky & Sea.png"), std::string::npos) << texts[0];
  EXPECT_NE(texts[0].find("-2.0"), std::string::npos);
}

TEST(ProjectCompositions, StateTheirTimesExactly)
{
  Comp television{.ticksPerFrame = 800, .ticksPerSecond = 23976, .rate = 29, .rateFraction = 63570};
  television.duration[0] = 2894 * 800;
  television.duration[1] = 23976;
  Comp cut = television;
  cut.areaStart[0] = 200; // 600ths of a second: a third of one is frame 9.99
  cut.areaStart[1] = 600;
  cut.areaEnd[0] = 800 * 40;
  cut.areaEnd[1] = 23976;
  Comp between{}; // on no frame
  between.areaStart[0] = 1;
  between.areaStart[1] = 50;
  using Time = std::pair<A_long, A_u_long>;
  const std::tuple<Comp, Time, Time, Time, double> cases[] = {
      {Comp{}, {1, 25}, {0, 25}, {250, 25}, 25},
      {television, {100, 2997}, {0, 2997}, {289400, 2997}, 29.970001220703125},
      {cut, {100, 2997}, {1000, 2997}, {3000, 2997}, 29.970001220703125},
      {between, {1, 25}, {1, 50}, {499, 50}, 25}};
  for (const auto& [comp, frame, start, duration, rate] : cases) {
    const Stage stage(Read(comp));
    const AEGP_CompH active = stage.ActiveComp();
    EXPECT_EQ(frame, Fraction(Answer(stage.comps->AEGP_GetCompFrameDuration, active)));
    EXPECT_EQ(start, Fraction(Answer(stage.comps->AEGP_GetCompWorkAreaStart, active)));
    EXPECT_EQ(duration, Fraction(Answer(stage.comps->AEGP_GetCompWorkAreaDuration, active)));
    EXPECT_EQ(rate, Answer(stage.comps->AEGP_GetCompFramerate, active));
  }
}

TEST(ProjectCompositions, AreListedWithWhatAnExportMakesOfThem)
{
  Comp inner{
      .id = 2, .name = "Inner", .layers = {MakeLayer({.id = 20, .kind = 2}), MakeLayer({.id = 21, .switches = 0})}};
  Comp outer = WithLayers({MakeLayer({.id = 10, .source = 2}), MakeLayer({.id = 11, .source = 2}),
                           MakeLayer({.id = 12, .kind = 1, .switches = 0}), MakeLayer({.id = 13, .kind = 4})});
  const auto list = Open(BinaryFile(Root({MakeItem(outer), Folder("F", {MakeItem(inner)})}, 2)))->Compositions();
  ASSERT_EQ(2U, list.size());
  EXPECT_TRUE(list[0].name == "Main" && list[0].layers == 4U);
  EXPECT_EQ(5U, list[0].exported); // two uses with a camera each, and a light
  EXPECT_TRUE(list[1].exported == 1U && list[1].id == "2");
  EXPECT_FALSE(list[0].isActive);
  EXPECT_TRUE(list[1].isActive);
  EXPECT_TRUE(list[1].frames == 250 && list[1].seconds == 10);
}

TEST(ProjectLayers, OfAllKindsAreWhatTheyWere)
{
  struct Case
  {
    Layer layer;
    AEGP_ObjectType type;
    AEGP_LayerFlags flags;
    const char* source;
  };
  constexpr AEGP_LayerFlags kVideo = AEGP_LayerFlag_VIDEO_ACTIVE, k3D = AEGP_LayerFlag_LAYER_IS_3D;
  constexpr AEGP_LayerFlags kLook = AEGP_LayerFlag_LOOK_AT_POI;
  const Case cases[] = {
      {{.source = 50}, AEGP_ObjectType_AV, kVideo | k3D, "Wall"},
      {{.source = 50, .switches = 0x84, .moreSwitches = 0x20},
       AEGP_ObjectType_AV,
       AEGP_LayerFlag_LOCKED | AEGP_LayerFlag_NULL_LAYER | k3D,
       "Wall"},
      {{.source = 50, .switches = 0x02}, AEGP_ObjectType_AV, kVideo, "Wall"}, // an adjustment layer
      {{.source = 2}, AEGP_ObjectType_AV, kVideo | k3D, "Inner"},
      {{.source = 2}, AEGP_ObjectType_AV, kVideo | k3D, "Inner"},
      {{.source = 61}, AEGP_ObjectType_AV, kVideo, "hum.wav"}, // a sound is never 3D
      {{.kind = 3, .switches = 0}, AEGP_ObjectType_TEXT, kVideo, nullptr},
      {{.kind = 4}, AEGP_ObjectType_VECTOR, kVideo | k3D, nullptr},
      {{.kind = 2, .switches = 0}, AEGP_ObjectType_CAMERA, kVideo | k3D, nullptr}, // as old files have it
      {{.kind = 2, .switches = 0x44}, AEGP_ObjectType_CAMERA, kVideo | k3D | kLook, nullptr},
      {{.kind = 1, .switches = 0x44, .lightKind = 0}, AEGP_ObjectType_LIGHT, kVideo | k3D | kLook, nullptr},
      {{.kind = 1, .switches = 0x44, .lightKind = 1}, AEGP_ObjectType_LIGHT, kVideo | k3D | kLook, nullptr},
      {{.kind = 1, .switches = 0x44, .lightKind = 2}, AEGP_ObjectType_LIGHT, kVideo | k3D, nullptr},
      {{.kind = 1, .switches = 0x44, .lightKind = 3}, AEGP_ObjectType_LIGHT, kVideo | k3D, nullptr},
      {{.kind = 5}, AEGP_ObjectType_NONE, kVideo, nullptr},
      {{.source = 999}, AEGP_ObjectType_AV, kVideo | k3D, nullptr},
  };
  std::vector<Node> nodes;
  for (const Case& each : cases) {
    Layer layer = each.layer;
    layer.id = 100 + static_cast<unsigned>(nodes.size());
    layer.parent = nodes.empty() ? 0 : 100;
    layer.name = nodes.size() % 2 ? "Own name" : "";
    nodes.push_back(MakeLayer(layer));
  }
  Comp inner{.id = 2, .name = "Inner", .rate = 30};
  const host::Project project =
      Read(WithLayers(nodes), {kSolid, MakeItem(inner), Footage(61, "/a/hum.wav", false, Settings(0, 0))});
  ASSERT_EQ(std::size(cases), project.root->layers.size());
  for (std::size_t i = 0; i < std::size(cases); ++i) {
    SCOPED_TRACE(i);
    const host::Layer& layer = *project.root->layers[i];
    EXPECT_TRUE(cases[i].type == layer.type && cases[i].flags == layer.flags);
    EXPECT_EQ((cases[i].flags & k3D) != 0, layer.is3D);
    EXPECT_EQ(100 + static_cast<A_long>(i), layer.id);
    EXPECT_EQ(i % 2 ? "Own name" : "", layer.name);
    EXPECT_EQ(i ? project.root->layers[0] : nullptr, layer.parent);
    ASSERT_EQ(cases[i].source != nullptr, layer.source != nullptr);
    if (layer.source) {
      EXPECT_EQ(cases[i].source, layer.source->name);
    }
  }
  EXPECT_EQ(project.root->layers[3]->source, project.root->layers[4]->source);
  // The lost source, the model, the place of lights that aren't spot lights, and parallel and ambient ones.
  ASSERT_EQ(4U, project.warnings.size());
  EXPECT_EQ("shot.aep: layer \"Own name\": its source, item 999, is not in the project", project.warnings[0]);
}

TEST(ProjectLayers, BeginAndEndWithTheirSource)
{
  const Node remapped = Body({.keys = {PlainKey(0, kLinear, kLinear, {0}, {{}})}});
  Comp inner{.id = 2, .name = "Inner"}; // 10 s
  const std::tuple<Layer, double, double, double> cases[] = {
      // in, out and start in frames
      {{.source = 50, .start = {-1, 1}, .in = {2, 1}, .out = {400, 10}}, 25, 975, -25},
      {{.source = 2, .in = {-1, 1}, .out = {40, 1}}, 0, 250, 0},
      {{.source = 2, .stretch = {1, 2}, .start = {1, 1}, .in = {2, 1}, .out = {40, 1}}, 50, 150, 25},
      {{.source = 2, .stretch = {-1, 1}, .start = {10, 1}, .in = {8, 1}, .out = {40, 1}}, -750, 50, 250},
      {{.source = 2, .out = {40, 1}, .more = {MatchName("ADBE Time Remapping"), remapped}}, 0, 1000, 0},
      {{.source = 60, .out = {40, 1}}, 0, 75, 0}, // 1.5 s at 24, made to have 12, twice, cut to half by a stretch
  };
  std::vector<Node> nodes;
  for (const auto& each : cases)
    nodes.push_back(MakeLayer(std::get<Layer>(each)));
  const Data movie = Settings(8, 8).Ratio(38, 3, 4).U32(56, 24).U8(129, 2).U16(148, 12);
  const host::Project project =
      Read(WithLayers(nodes), {kSolid, MakeItem(inner), Footage(60, "/a/b.mov", false, movie)});
  for (std::size_t i = 0; i < std::size(cases); ++i) {
    SCOPED_TRACE(i);
    const host::LayerSpan& span = project.root->layers[i]->span.value();
    const auto& [layer, in, out, start] = cases[i];
    EXPECT_DOUBLE_EQ(in, span.in);
    EXPECT_DOUBLE_EQ(out, span.out);
    EXPECT_DOUBLE_EQ(start, span.start);
  }
}

TEST(ProjectFootage, KeepsPathsCountsAndColours)
{
  const Data sequence = Settings(64, 48).U32(172, 7).U32(176, 106).U32(180, 4);
  const Data unknown = Settings(64, 48).U32(172, 0xFFFFFFFF).U32(176, 0xFFFFFFFF);
  const std::tuple<Node, const char*, const char*, A_long> cases[] = {
      {Footage(60, "/Users/me/Sky.png", false, Settings(64, 48)), "Sky.png", "/Users/me/Sky.png", 1},
      {Footage(60, "C:\\Shots\\Sky.png", false, Settings(64, 48), {}, "Mine"), "Mine", "C:\\Shots\\Sky.png", 1},
      {Footage(60, "D:\\Seq", true, sequence, {Utf8("leaf_"), Utf8(".png")}), "leaf_0007.png", "D:\\Seq\\leaf_0007.png",
       100},
      {Footage(60, "/seq/", true, sequence, {Utf8(".png")}), "0007.png", "/seq/0007.png", 100},
      {Footage(60, "/seq", true, sequence, {List("StVc", {Utf8("b.png"), Utf8("a.png")}), Utf8(".png")}), "b.png",
       "/seq/b.png", 2},
      {Footage(60, "/seq", true, unknown, {Utf8("x"), Utf8(".png")}), "x.png", "/seq/x.png", 1},
      {Item(7, 60, "", {List("Pin ", {Chunk("sspc", Settings(64, 48)), Chunk("opti", Data(60).Text(10, "Later"))})}),
       "Later", "", 1},
      {Solid(60, "W\xE4nde", 64, 48, kGrey), "W\xC3\xA4nde", "", 1}, // Windows-1252
  };
  for (const auto& [footage, name, path, files] : cases) {
    SCOPED_TRACE(path);
    const host::Project project = Read(WithLayers({MakeLayer({.source = 60})}), {footage});
    const host::Item& item = *project.root->layers[0]->source;
    EXPECT_TRUE(item.name == name && item.path == path && item.files == files);
    EXPECT_TRUE(item.width == 64 && item.height == 48);
    EXPECT_TRUE(project.warnings.empty());
  }
  const host::Project solid = Read(WithLayers({MakeLayer({.source = 50})}), {kSolid});
  EXPECT_EQ(0.1F, solid.root->layers[0]->source->color.blueF);
}

TEST(ProjectProperties, HaveUnitsAndDefaults)
{
  // 2000 x 1000 with pixels of 3/2: the default zoom is 2000 x 3/2 x 25/18.
  constexpr double kZoom = 2000 * 1.5 * 25 / 18;
  Comp comp{.width = 2000, .height = 1000, .pixelAspect = {3, 2}};
  Layer camera{.id = 10, .kind = 2}, zoomed{.id = 11, .kind = 2}, light{.id = 12, .kind = 1, .lightKind = 1};
  Layer solid{.id = 13, .source = 50}, flat{.id = 14, .source = 50, .switches = 0},
      null{.id = 15, .source = 50, .switches = 0x84};
  Layer lamp{.id = 16, .kind = 1, .lightKind = 1};
  Add(zoomed.camera, "ADBE Camera Zoom", Body({.value = {700}}));
  for (Layer* layer : {&solid, &flat}) {
    Add(layer->transform, "ADBE Anchor Point", Body({.components = 3, .form = 0x0E, .value = {0.25, 0.5, 0.1}}));
    Add(layer->transform, "ADBE Scale", Body({.components = 3, .value = {0.5, 2, 3}}));
    Add(layer->transform, "ADBE Rotate Z", Body({.value = {12.5}}));
  }
  const std::string turned = Data().Reals(0, {10, 20, 30});
  std::string littleEndian;
  for (std::size_t i = 0; i < 24; ++i)
    littleEndian += turned[i / 8 * 8 + 7 - i % 8];
  Node angles = Body({});
  angles.children[2].data = littleEndian;
  Add(solid.transform, "ADBE Orientation", List("otst", {angles}));
  Add(lamp.light, "ADBE Light Color", Body({.components = 4, .form = 0x06, .value = {255, 51, 102, 255}}));
  Add(lamp.light, "ADBE Light Shadow Darkness", Body({.value = {140}}));
  Add(lamp.light, "ADBE Casts Shadows", Body({.value = {1}}));
  for (const Layer& layer : {camera, zoomed, light, solid, flat, null, lamp})
    comp.layers.push_back(MakeLayer(layer));
  const host::Project read = Read(comp, {kSolid});
  ASSERT_EQ(1U, read.warnings.size()); // an untouched light among oblong pixels
  const Stage stage(Read(comp, {kSolid}));
  const std::tuple<A_long, AEGP_LayerStream, Value> cases[] = {
      {0, AEGP_LayerStream_ZOOM, {kZoom}},
      {0, AEGP_LayerStream_FOCUS_DISTANCE, {kZoom}},
      {0, AEGP_LayerStream_POSITION, {1000, 500, -kZoom}},
      {0, AEGP_LayerStream_ANCHORPOINT, {1000, 500, 0}},
      {1, AEGP_LayerStream_POSITION, {1000, 500, -700}},
      {1, AEGP_LayerStream_FOCUS_DISTANCE, {kZoom}},
      {2, AEGP_LayerStream_POSITION, {1000 + 0.03 * kZoom, 500 - 0.03 * kZoom, -kZoom / 4}},
      {2, AEGP_LayerStream_INTENSITY, {100}},
      {2, AEGP_LayerStream_COLOR, {1, 1, 1}},
      {2, AEGP_LayerStream_CONE_ANGLE, {90}},
      {2, AEGP_LayerStream_CONE_FEATHER, {50}},
      {2, AEGP_LayerStream_CASTS_SHADOWS, {0}},
      {2, AEGP_LayerStream_SHADOW_DARKNESS, {100}},
      {3, AEGP_LayerStream_ANCHORPOINT, {100, 100, 20}},
      {3, AEGP_LayerStream_SCALE, {50, 200, 300}},
      {3, AEGP_LayerStream_ORIENTATION, {10, 20, 30}},
      {3, AEGP_LayerStream_POSITION, {1000, 500, 0}},
      {3, AEGP_LayerStream_ROTATE_Z, {12.5}},
      {4, AEGP_LayerStream_SCALE, {50, 200, 100}},
      {5, AEGP_LayerStream_ANCHORPOINT, {0, 0, 0}},
      {6, AEGP_LayerStream_COLOR, {0.2, 0.4, 1}},
      {6, AEGP_LayerStream_SHADOW_DARKNESS, {140}},
      {6, AEGP_LayerStream_CASTS_SHADOWS, {1}},
  };
  for (const auto& [layer, stream, expected] : cases) {
    SCOPED_TRACE(std::to_string(layer) + ", stream " + std::to_string(stream));
    ExpectNear(expected, At(stage, stream, 0, layer));
  }
}

// The parameter at which x comes to u, by halving, and y there.
double Curve(double ox, double oy, double ix, double iy, double u, double end = 1)
{
  double low = 0, high = 1;
  const auto at = [](double p1, double p2, double p3, double k) {
    return 3 * (1 - k) * (1 - k) * k * p1 + 3 * (1 - k) * k * k * p2 + k * k * k * p3;
  };
  for (int i = 0; i < 200; ++i)
    (at(ox, ix, 1, (low + high) / 2) < u ? low : high) = (low + high) / 2;
  return at(oy, iy, end, low);
}

TEST(ProjectKeyframes, EaseEachComponentByItsOwnSpeed)
{
  constexpr double kNan = std::numeric_limits<double>::quiet_NaN();
  // to: 2 seconds apart; atHalf: at a quarter of the way in time
  const auto key = [](std::int64_t t, Way in, Way out, double value, const Ease& ease) {
    return PlainKey(t, in, out, {value}, {ease});
  };
  constexpr std::int64_t kEnd = 51200;
  const std::tuple<const char*, std::string, std::string, double> cases[] = {
      {"linear, with rubbish in its slots", key(0, kLinear, kLinear, 10, {kNan, kNan, kNan, kNan}),
       key(kEnd, kLinear, kLinear, 50, {kNan, kNan, kNan, kNan}), 20},
      {"hold", key(0, kLinear, kHold, 10, {}), key(kEnd, kBezier, kLinear, 50, {5, 0.5, 0, 0}), 10},
      {"eased", key(0, kLinear, kBezier, 10, {0, 0, 0, 0.5}), key(kEnd, kBezier, kLinear, 50, {0, 0.25, 0, 0}),
       10 + 40 * Curve(0.5, 0, 0.75, 1, 0.25)},
      {"with speeds", key(0, kLinear, kBezier, 10, {0, 0, 30, 0.5}), key(kEnd, kBezier, kLinear, 50, {-10, 0.25, 0, 0}),
       10 + 40 * Curve(0.5, 30 * 0.5 * 2 / 40, 0.75, 1 + 10 * 0.25 * 2 / 40, 0.25)},
      {"linear out, Bezier in", key(0, kLinear, kLinear, 10, {kNan, kNan, kNan, kNan}),
       key(kEnd, kBezier, kLinear, 50, {0, 0.8, 0, 0}), 10 + 40 * Curve(1.0 / 6, 1.0 / 6, 0.2, 1, 0.25)},
      {"Bezier out, linear in", key(0, kLinear, kBezier, 10, {0, 0, 0, 0.8}), key(kEnd, kLinear, kLinear, 50, {}),
       10 + 40 * Curve(0.8, 0, 5.0 / 6, 5.0 / 6, 0.25)},
      {"a bump", key(0, kLinear, kBezier, 10, {0, 0, 30, 0.5}), key(kEnd, kBezier, kLinear, 10, {-20, 0.25, 0, 0}),
       10 + Curve(0.5, 30 * 0.5 * 2, 0.75, 20 * 0.25 * 2, 0.25, 0)},
      {"nothing", key(0, kLinear, kBezier, 10, {0, 0, 0, 0.5}), key(kEnd, kBezier, kLinear, 10, {0, 0.25, 0, 0}), 10},
  };
  for (const auto& [name, from, to, atHalf] : cases) {
    SCOPED_TRACE(name);
    const Comp comp = WithProperty("ADBE Rotate Z", Body({.keys = {from, to}}));
    ExpectNear({atHalf}, ValueOf(comp, AEGP_LayerStream_ROTATE_Z, 12.5));
    // Reversed, from 4 s back to 2 s, the same values come the other way round.
    Layer reversed{.stretch = {-1, 1}, .start = {4, 1}};
    const Comp back = WithProperty("ADBE Rotate Z", Body({.keys = {from, to}}), reversed);
    ExpectNear({atHalf}, ValueOf(back, AEGP_LayerStream_ROTATE_Z, 100 - 12.5));
  }
  // Components of a scale, each with its own; speeds are in stored units. The depth of a flat layer stands.
  const std::vector<std::string> keys = {
      PlainKey(0, kLinear, kBezier, {1, 1, 1}, {{0, 0, 0, 0.5}, {0, 0, 0.5, 0.5}, {0, 0, 9, 0.5}}),
      PlainKey(kEnd, kLinear, kLinear, {3, 1, 5}, {{}, {}, {}})};
  const Comp scaled = WithProperty("ADBE Scale", Body({.components = 3, .keys = keys}), {.switches = 0});
  const double bump = Curve(0.5, 0.5 * 0.5 * 2, 5.0 / 6, 0, 0.25, 0);
  ExpectNear({100 + 200 * Curve(0.5, 0, 5.0 / 6, 5.0 / 6, 0.25), 100 + 100 * bump, 100},
             ValueOf(scaled, AEGP_LayerStream_SCALE, 12.5));
}

TEST(ProjectKeyframes, CountTimeFromTheLayersStart)
{
  const std::vector<std::string> keys = {PlainKey(-12800, kLinear, kLinear, {10}, {{}}),
                                         PlainKey(38400, kLinear, kLinear, {50}, {{}})};
  // Keyframes at -0.5 s and 1.5 s of layer time, 10 and 50
  const std::tuple<Layer, double, double> cases[] = {{{}, -12.5, 10},
                                                     {{}, 12.5, 30},
                                                     {{.start = {-1, 2}}, 0, 30 - 10 + 0.0 + 0},
                                                     {{.start = {1, 3}}, 25.0 / 3 + 37.5, 50},
                                                     {{.start = {1, 3}}, 25.0 / 3, 20},
                                                     {{.stretch = {2, 1}}, 25, 30},
                                                     {{.stretch = {1, 3}, .start = {2, 1}}, 50 + 12.5 / 3, 30},
                                                     {{.stretch = {-1, 1}, .start = {2, 1}}, 50 - 12.5, 30}};
  for (const auto& [layer, frame, value] : cases) {
    const double start = static_cast<double>(layer.start[0]) / static_cast<double>(layer.start[1]);
    const double stretch = static_cast<double>(layer.stretch[0]) / static_cast<double>(layer.stretch[1]);
    const double layerTime = (frame / 25 - start) / stretch;
    const double expected = 10 + 40 * std::clamp((layerTime + 0.5) / 2, 0.0, 1.0);
    const host::Project project = Read(WithProperty("ADBE Rotate X", Body({.keys = keys}), layer), {kSolid});
    const auto& property =
        project.layers[0].streams[host::StreamIndex(*host::FindStreamInfo(AEGP_LayerStream_ROTATE_X))];
    EXPECT_NEAR(expected, property->At(frame)[0], 1e-9) << frame;
  }
  // A hold switches exactly at its frame, whichever way the layer runs, in frames of 100/2997 s.
  Comp television{.ticksPerFrame = 800, .ticksPerSecond = 23976, .rate = 29, .rateFraction = 63570};
  const std::vector<std::string> holds = {PlainKey(0, kLinear, kHold, {1}, {{}}),
                                          PlainKey(80000, kLinear, kHold, {2}, {{}})};
  for (const bool runsBack : {false, true}) {
    Layer layer{.source = 50, .stretch = {runsBack ? -1 : 1, 1}, .start = {runsBack ? 200 * 800 : 0, 23976}};
    Add(layer.transform, "ADBE Rotate X", Body({.keys = holds, .ticksPerSecond = 23976}));
    television.layers = {MakeLayer(layer)};
    const Stage stage(Read(television, {kSolid}));
    const auto at = [&](A_long frame) { return stage.ValueAt(0, AEGP_LayerStream_ROTATE_X, {frame * 100, 2997})[0]; };
    EXPECT_EQ(runsBack ? 2 : 1, at(99));
    EXPECT_EQ(2, at(100));
    EXPECT_EQ(runsBack ? 1 : 2, at(101));
  }
}

TEST(ProjectKeyframes, RunAlongPathsByLength)
{
  // A quarter circle of radius 300, nearly, and a straight way of 400.
  constexpr double kArm = 300 * 0.5522847498;
  const auto keys = [&](bool isRoving, Way out, const Ease& first, const Ease& last) {
    return std::vector<std::string>{
        WideKey(0, kLinear, out, {0, 0, 0}, first, {}, {kArm, 0, 0}),
        WideKey(30000, kBezier, kBezier, {300, 300, 0}, {9, 0.9, 9, 0.9}, {0, -kArm, 0}, {0, 0, 0}, isRoving),
        WideKey(102400, out, kLinear, {300, 700, 0}, last, {}, {})};
  };
  const auto value = [&](const std::vector<std::string>& list, double frame) {
    return ValueOf(WithProperty("ADBE Position", Body({.components = 3, .form = 0x0E, .keys = list})),
                   AEGP_LayerStream_POSITION, frame);
  };
  const host::BezierPath arc({0, 0, 0}, {kArm, 0, 0}, {300, 300 - kArm, 0}, {300, 300, 0});
  const double whole = arc.Length() + 400;
  const auto along = [&](double share) {
    return share * whole < arc.Length() ? arc.At(share * whole / arc.Length())
                                        : Value{300, 300 + share * whole - arc.Length(), 0};
  };
  // Linear, roving: even speed through all of it. 4 seconds are 100 frames.
  for (const double frame : {0.0, 20.0, 53.7, 80.0, 100.0, 120.0})
    ExpectNear(along(std::min(frame / 100, 1.0)), value(keys(true, kLinear, {}, {}), frame), 1e-6);
  // Eased, roving: one ease for the whole run.
  const Ease slow{0, 0, 0, 0.6}, fast{300, 0.3, 0, 0};
  for (const double frame : {10.0, 40.0, 60.0, 95.0})
    ExpectNear(along(Curve(0.6, 0, 0.7, 1 - 300 * 0.3 * 4 / whole, frame / 100)),
               value(keys(true, kBezier, slow, fast), frame), 1e-6);
  // A run that turns back beyond its end and goes on straight there.
  const Ease back{-900, 0.6, 0, 0};
  for (const double frame : {50.0, 70.0, 90.0})
    ExpectNear(along(Curve(0.6, 0, 0.4, 1 + 900 * 0.6 * 4 / whole, frame / 100)),
               value(keys(true, kBezier, slow, back), frame), 1e-6);
  // Standing: each interval has its own ease. The first is a quarter circle in 30000 ticks.
  const double u = 12 * 1024 / 30000.0, rise = 9 * 0.9 * (30000 / 25600.0) / arc.Length();
  ExpectNear(arc.At(Curve(1.0 / 6, 1.0 / 6, 0.1, 1 - rise, u)), value(keys(false, kLinear, {}, {}), 12), 1e-6);
}

TEST(ProjectKeyframes, TurnOrientationsTheShortestWay)
{
  const auto turned = [&](const std::vector<std::vector<double>>& angles, double frame) {
    std::vector<std::string> keys;
    std::vector<Node> values;
    for (const auto& a : angles) {
      keys.push_back(
          WideKey(static_cast<std::int64_t>(keys.size()) * 102400, kLinear, kLinear, {NAN}, {}, {NAN}, {NAN}));
      values.push_back(Chunk("otda", Data().Reals(0, a)));
    }
    const Node orientation = List("otst", {Body({.form = 0x06, .keys = keys}), List("otky", values)});
    return ValueOf(WithProperty("ADBE Orientation", orientation), AEGP_LayerStream_ORIENTATION, frame);
  };
  ExpectNear({0, 359.95, 0}, turned({{0, 359.9, 0}, {0, 0.1, 0}}, 25));
  ExpectNear({0, 0, 359.95}, turned({{0, 0, 359.9}, {0, 0, 0.1}}, 25));
  ExpectNear({0, 0.1, 0}, turned({{0, 359.9, 0}, {0, 0.1, 0}}, 100));
  ExpectNear({350, 0, 0}, turned({{30, 0, 0}, {310, 0, 0}}, 50));
  // From Z by 90 degrees to X by 90 degrees: a third of the way about the axis between, by 40 degrees or so; half way
  // the turn is R = Rx(45 and a bit)...: checked by its matrix being half of the relative turn.
  const Value half = turned({{0, 0, 90}, {90, 0, 0}}, 50);
  ExpectNear({45 - 9.735610317245, 30 - 10.528779365509, 45 - 9.735610317245}, half, 60); // within the octant
  ExpectNear(half, turned({{90, 0, 0}, {0, 0, 90}}, 50), 1e-9);
  // Straight up there is no telling X from Z.
  ExpectNear({0, 90, 0}, turned({{0, 80, 0}, {0, 100, 0}}, 50), 1e-6);
}

TEST(ProjectProperties, MayBeSeparatedOrHaveExpressions)
{
  Layer layer{.name = "Wall", .source = 50};
  Add(layer.transform, "ADBE Position", Body({.components = 3, .form = 0x0E, .value = {1, 2, 3}, .switches = 3}));
  Add(layer.transform, "ADBE Position_0", Body({.value = {11}, .after = {Utf8("wiggle(1, 2)")}}));
  Add(layer.transform, "ADBE Position_1",
      Body({.keys = {PlainKey(0, kLinear, kLinear, {5}, {{}}), PlainKey(25600, kLinear, kLinear, {7}, {{}})}}));
  Add(layer.transform, "ADBE Rotate X", Body({.value = {4}, .after = {Chunk("expr", "time * 9")}}));
  Add(layer.transform, "ADBE Rotate Y", Body({.value = {5}, .after = {Utf8("time")}, .expressionOff = 1}));
  Layer flat = layer;
  flat.switches = 0;
  flat.id = 11;
  flat.name = "Flat";
  const host::Project project = Read(WithLayers({MakeLayer(layer), MakeLayer(flat)}), {kSolid});
  const std::vector<std::string> warnings = {
      "shot.aep: separated positions that lack a dimension were never seen: taken as the composition's centre",
      "shot.aep: layer \"Wall\": the expression of position is not evaluated",
      "shot.aep: layer \"Wall\": the expression of rotation X is not evaluated",
      "shot.aep: layer \"Flat\": the expression of position is not evaluated"};
  EXPECT_EQ(warnings, project.warnings);
  const Stage stage(Read(WithLayers({MakeLayer(layer)}), {kSolid}));
  ExpectNear({11, 6, 0}, At(stage, AEGP_LayerStream_POSITION, 12.5));
  ExpectNear({4}, At(stage, AEGP_LayerStream_ROTATE_X, 12.5));
  for (const auto& [stream, expected] :
       {std::pair{AEGP_LayerStream_POSITION, 1}, std::pair{AEGP_LayerStream_ROTATE_Y, 0}}) {
    const AEGP_StreamRefH handle = stage.Stream(0, stream);
    EXPECT_EQ(expected, Answer(stage.streams->AEGP_GetExpressionState, 0, handle));
    EXPECT_EQ(0, stage.streams->AEGP_DisposeStream(handle));
  }
}

} // namespace project_tests
