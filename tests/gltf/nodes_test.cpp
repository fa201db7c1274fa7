// The tree, names, places and what is seen.
#include "tests/gltf/converted_scene.h"

namespace
{

using namespace gltf_test;

struct Turn
{
  double x, y, z, w;
};

Turn operator*(const Turn& a, const Turn& b)
{
  return {a.w * b.x + a.x * b.w + a.y * b.z - a.z * b.y, a.w * b.y - a.x * b.z + a.y * b.w + a.z * b.x,
          a.w * b.z + a.x * b.y - a.y * b.x + a.z * b.w, a.w * b.w - a.x * b.x - a.y * b.y - a.z * b.z};
}

Turn X(double a) { return {std::sin(a / 2), 0, 0, std::cos(a / 2)}; }
Turn Y(double a) { return {0, std::sin(a / 2), 0, std::cos(a / 2)}; }
Turn Z(double a) { return {0, 0, std::sin(a / 2), std::cos(a / 2)}; }

// The rotation of each order as a product of right-handed turns in glTF's axes.
Turn TurnOf(Long order, double a, double b, double c)
{
  switch (order) {
  case 0:
    return Z(-c) * X(a) * Y(b);
  case 1:
    return X(a) * Z(-c) * Y(b);
  case 2:
    return X(a) * Y(b) * Z(-c);
  case 3:
    return Y(b) * X(a) * Z(-c);
  case 4:
    return Y(b) * Z(-c) * X(a);
  case 5:
    return Z(-c) * Y(b) * X(a);
  default:
    return Y(a) * X(b) * Z(-c);
  }
}

using GltfNodes = GltfScene;

TEST_F(GltfNodes, KeepTheTreeInItsOrderUnderUniqueNames)
{
  BaseObject* top = Add(kObjectNull, "a");
  Add(kObjectNull, "a", top);
  Add(kObjectNull, "", Add(kObjectNull, "a.2", top));
  Add(kObjectNull, "a");
  Add(kObjectNull, "");
  BaseObject* odd = Add(kObjectNull, "");
  odd->SetName(FromUnits({u'x', 0xD800, u'y', 0xD83D, 0xDE00, 0x7}));
  const Converted scene = Convert();
  std::vector<std::string> names;
  for (const Json& node : scene.json["nodes"])
    names.push_back(node.value("name", ""));
  EXPECT_EQ(names, (std::vector<std::string>{"a", "a.2", "a.2.2", "", "a.3", "", "x\xEF\xBF\xBDy\xF0\x9F\x98\x80\a"}));
  EXPECT_EQ(scene.json["scenes"][0]["nodes"], Json({0, 4, 5, 6}));
  EXPECT_EQ(scene.json["nodes"][0]["children"], Json({1, 2}));
  EXPECT_EQ(scene.json["nodes"][2]["children"], Json({3}));
  EXPECT_EQ(scene.Extras("a.2.2"), Json({{"name", "a.2"}, {"type", 5140}}));
}

TEST_F(GltfNodes, AnEmptySceneHasNeitherNodesNorBuffer)
{
  const Converted scene = Convert();
  for (const char* name : {"nodes", "buffers", "bufferViews", "accessors", "meshes", "cameras", "animations"})
    EXPECT_FALSE(scene.json.contains(name)) << name;
  EXPECT_FALSE(scene.json["scenes"][0].contains("nodes"));
  EXPECT_EQ(scene.json["scene"], 0);
  EXPECT_EQ(scene.json["asset"]["version"], "2.0");
  EXPECT_EQ(scene.json["asset"]["generator"].get<std::string>().substr(0, 4), "q7r ");
}

TEST_F(GltfNodes, TurnByEveryOrder)
{
  const Vector angles[] = {{kQuarter, 0, 0}, {0.3, -1.1, 2.5}, {-2.9, 0.4, -0.7}, {3.1, 3.0, -3.1}};
  for (Long order = 0; order <= 6; ++order) {
    for (const Vector& a : angles) {
      BaseObject* object = Add(kObjectNull, ("o" + std::to_string(order)).c_str());
      object->SetRotationOrder(order);
      object->SetRelRot(a);
      const Converted scene = Convert();
      Turn turn = TurnOf(order, a.x, a.y, a.z);
      const double sign = turn.w < 0 ? -1 : 1;
      const Json& node = scene.json["nodes"].back();
      ExpectNear(node["rotation"], {sign * turn.x, sign * turn.y, sign * turn.z, sign * turn.w});
      EXPECT_EQ(node["extras"]["q7r"]["rotationOrder"], order);
      ExpectNear(node["extras"]["q7r"]["angles"], {a.x, a.y, a.z});
    }
  }
}

TEST_F(GltfNodes, HoldPlacesInMetresAndLeaveOutDefaults)
{
  Add(kObjectNull, "rest");
  BaseObject* placed = Add(kObjectNull, "placed");
  placed->SetRelPos({100, 200, 300});
  placed->SetRelScale({-1, 2, 0});
  BaseObject* frozen = Add(kObjectNull, "frozen");
  frozen->SetFrozenRot({0, 0, kQuarter}); // x to -y in the scene
  frozen->SetFrozenPos({0, 0, 10});
  frozen->SetFrozenScale({2, 1, 1});
  frozen->SetRelPos({100, 0, 0});
  frozen->SetRelScale({-3, 1, 1});
  const Converted scene = Convert();
  EXPECT_EQ(scene.Node("rest").size(), 2U) << "more than name and extras";
  ExpectNear(scene.Node("placed")["translation"], {1, 2, -3});
  ExpectNear(scene.Node("placed")["scale"], {-1, 2, 0});
  ExpectNear(scene.Node("frozen")["translation"], {0, -1, -0.1});
  ExpectNear(scene.Node("frozen")["scale"], {-6, 1, 1});
  ExpectNear(scene.Node("frozen")["rotation"], {0, 0, -std::sqrt(0.5), std::sqrt(0.5)});
}

TEST_F(GltfNodes, TakeTheUnitThatTheSceneSays)
{
  using Unit = std::tuple<Real, Long, double, double>;
  Add(kObjectNull, "n")->SetRelPos({100, 0, 0});
  for (const auto& [scale, code, asked, metres] : {Unit{1, 3, 0, 0.01}, Unit{2.5, 4, 0, 0.0025}, Unit{1, 10, 0, 0.0254},
                                                   Unit{0, 3, 0, 0.01}, Unit{-1, 3, 0, 0.01}, Unit{1, 3, 0.5, 0.5}}) {
    GeData value;
    ASSERT_TRUE(value.SetType(kCustomUnitScale));
    auto& unit = static_cast<UnitScaleData&>(*value.GetCustom());
    unit.scale = scale;
    unit.unit = code;
    document->GetDataInstance().SetData(2117, value);
    options.unit = asked;
    const Converted scene = Convert();
    EXPECT_NEAR(scene.Node("n")["translation"][0].get<double>(), 100 * metres, 1e-9);
    EXPECT_EQ(scene.json["scenes"][0]["extras"]["q7r"]["unit"].get<double>(), metres);
  }
  document->GetDataInstance().RemoveData(2117);
  options.unit = 0;
  EXPECT_EQ(Convert().json["scenes"][0]["extras"]["q7r"]["unit"].get<double>(), 0.01);
}

TEST_F(GltfNodes, TellTheSceneItsSettings)
{
  document->GetPref().SetFps(25);
  document->GetPref().SetMaxTime(BaseTime(4, 1));
  document->GetPref().SetMinTime(BaseTime(1, 2));
  RenderData& render = *document->GetActiveRenderData();
  render.SetParameterById(kRenderWidth, 1920.0);
  render.SetParameterById(kRenderHeight, 1080.0);
  Add(kObjectNull, "n");
  BaseObject* camera = Add(kObjectCamera, "first");
  Add(kObjectCamera, "second");
  const Json expected = {{"fps", 25},       {"start", 0.5},     {"end", 4.0}, {"unit", 0.01},
                         {"width", 1920.0}, {"height", 1080.0}, {"camera", 1}};
  EXPECT_EQ(Convert().json["scenes"][0]["extras"]["q7r"], expected);
  ASSERT_TRUE(document->SetSceneCamera(camera));
  EXPECT_EQ(Convert().json["scenes"][0]["extras"]["q7r"], expected);
}

TEST_F(GltfNodes, TellKindsThatHaveNoCounterpart)
{
  for (const Long type : {5159, 5110, 1019362})
    Add(kObjectNull, "child", Add(type, "other"));
  const Converted scene = Convert();
  EXPECT_EQ(scene.json["nodes"].size(), 6U);
  EXPECT_EQ(scene.Lost(Loss::kObject), 3U);
  EXPECT_EQ(scene.Account().Lines(),
            std::vector<std::string>{"3 objects of a kind without a counterpart: an empty node"});
}

class GltfHidden : public GltfScene
{
 protected:
  static constexpr Long kLayerId = 1027565;

  LayerObject* AddLayer(const char* name, bool locked = false)
  {
    LayerObject* layer = AllocLayer();
    layer->SetName(String(name));
    layer->SetFlag(4, locked);
    document->InsertLayer(layer);
    return layer;
  }
  BaseObject* AddIn(BaseObject* parent, const char* name, Long mode, LayerObject* layer, bool standsForLayer = true)
  {
    BaseObject* object = Add(kObjectPlane, name, parent);
    object->SetRenderMode(mode);
    if (standsForLayer)
      object->GetDataInstance().SetLong(kLayerId, 7);
    if (layer)
      object->SetLayer(layer);
    object->MakeTag(kTagTexture);
    return object;
  }
};

TEST_F(GltfHidden, WhatIsNotRenderedIsNotDrawn)
{
  LayerObject* inner = AddLayer("inner");
  LayerObject* locked = AddLayer("locked", true);
  BaseObject* root = Add(kObjectNull, "root");
  BaseObject* off = AddIn(root, "off", 1, nullptr);
  AddIn(off, "hangs on a hidden layer", 2, nullptr);
  AddIn(off, "no layer, hidden parent", 2, nullptr, false);
  AddIn(off, "switched on", 0, nullptr, false);
  BaseObject* nested = AddIn(off, "in hidden composition", 2, inner);
  AddIn(nested, "deeper in hidden composition", 2, inner);
  AddIn(off, "on in hidden composition", 0, inner);
  AddIn(off, "locked layer", 2, locked);
  const Converted scene = Convert();
  const std::vector<std::pair<const char*, bool>> expected = {
      {"off", false},         {"hangs on a hidden layer", true}, {"no layer, hidden parent", false},
      {"switched on", true},  {"in hidden composition", false},  {"deeper in hidden composition", false},
      {"locked layer", true}, {"on in hidden composition", true}};
  for (const auto& [name, seen] : expected) {
    EXPECT_EQ(scene.Node(name).contains("mesh"), seen) << name;
    EXPECT_EQ(scene.Extras(name).contains("hidden"), !seen) << name;
  }
  EXPECT_EQ(scene.Extras("in hidden composition")["layer"], "inner");
}

TEST_F(GltfHidden, HiddenCamerasStayAndHiddenPartsCanBeKept)
{
  BaseObject* plane = AddIn(nullptr, "plane", 1, nullptr);
  Add(kObjectNull, "child", plane)->SetRenderMode(0);
  BaseObject* light = Add(kObjectLight, "light");
  light->SetRenderMode(1);
  Add(kObjectCamera, "camera")->SetRenderMode(1);
  const Converted without = Convert();
  EXPECT_FALSE(without.json.contains("meshes") || without.json.contains("extensions"));
  EXPECT_EQ(without.Node("camera")["camera"], 0);
  options.keepHidden = true;
  const Converted with = Convert();
  ASSERT_EQ(with.json["nodes"].size(), 6U);
  EXPECT_EQ(with.Node("plane")["children"], Json({1, 4}));
  EXPECT_EQ(with.Node("light")["children"], Json({5}));
  EXPECT_FALSE(with.Node("plane").contains("mesh"));
  EXPECT_EQ(with.json["nodes"][4], Json::parse(R"({"mesh": 0, "extensions": {"KHR_node_visibility": {"visible": false}},
    "extras": {"q7r": {"part": "hidden"}}})"));
  EXPECT_EQ(with.json["nodes"][5]["extensions"]["KHR_lights_punctual"]["light"], 0);
  EXPECT_TRUE(with.json["materials"][0]["extensions"].contains("KHR_materials_unlit"))
      << "a hidden light lights nothing";
}

// What lies in a temporary file comes back, in its place, also when more follows.
TEST(GltfLongParts, AreWholeWhereverTheyLie)
{
  gltf::LongText text;
  std::string expected = "before";
  text += expected;
  for (const char* part : {"first", "second"}) {
    gltf::LongText section;
    for (int i = 0; i < 400'000; ++i)
      section += part + std::to_string(i);
    const std::string whole = section.Joined();
    EXPECT_TRUE(whole.size() == section.Size() && whole.starts_with(part) && whole.ends_with("399999"));
    section += "behind";
    text.Take(section);
    EXPECT_EQ(section.Joined(), "");
    text += "between";
    expected += whole + "behind" + "between";
  }
  EXPECT_EQ(text.Size(), expected.size());
  EXPECT_TRUE(text.Joined() == expected);

  gltf::ByteBuffer bytes;
  bytes.Append(expected.data(), expected.size());
  for (const std::size_t offset : {0U, 500'000U, 1'000'000U, 3'000'000U}) {
    EXPECT_TRUE(bytes.Holds(offset, expected.data() + offset, 1'500'000)) << offset;
    EXPECT_FALSE(bytes.Holds(offset, expected.data() + offset + 1, 1'500'000)) << offset;
  }
  bytes.Pad(16);
  std::string whole;
  bytes.ForEachBlock([&](const std::uint8_t* data, std::size_t size) { whole.append(data, data + size); });
  EXPECT_TRUE(whole == expected + std::string((16 - expected.size() % 16) % 16, '\0'));
}

} // namespace
