// The place of a layer's object: anchors, parents, rotation, targets, and what all kinds of layer share.

#include "export_fixture.h"

namespace
{

using namespace export_test;

constexpr Long kPosition = 903;
constexpr Long kRotation = 904;
constexpr Long kScale = 905;
constexpr Long kLayerId = 1027565;

// A solid of 100 by 50 pixels at (10, 20, 30), its anchor at its centre.
std::string Child(const std::string& more) { return Solid("C", R"("p":{"k":[10,20,30]},"a":{"k":[50,25,0]})", more); }

TEST(LayerPlace, IsCountedFromTheCentreOfParentsThatHaveASize)
{
  // shift: at top level and within a composition of 300 by 200 pixels alike
  const std::tuple<const char*, std::string, Vector> cases[] = {
      {"a solid", Layer(1, "P", "", R"("ind":9,"sw":200,"sh":100,"sc":"#fff")"), {-100, 50, 0}},
      {"footage", Layer(2, "P", "", R"("ind":9,"refId":"still")"), {-4, 3, 0}},
      {"a null", Layer(3, "P", "", R"("ind":9)"), {-50, 50, 0}},
      {"a composition", Layer(0, "P", "", R"("ind":9,"refId":"deep")"), {-20, 10, 0}},
      {"a camera", Layer(13, "P", "", R"("ind":9)"), {}},
      {"a light", Layer(14, "P", "", R"("ind":9)"), {}},
      {"a text", Layer(5, "P", "", R"("ind":9)"), {}},
      {"a 2D solid", R"({"ty":1,"nm":"P","ind":9,"sw":200,"sh":100,"sc":"#fff","ks":{}})", {}},
  };
  const std::string assets = R"({"id":"still","p":"a.png","w":8,"h":6},{"id":"deep","w":40,"h":20,"layers":[]})";
  for (const auto& [what, parent, shift] : cases) {
    const std::string layers = Child(R"("parent":9)") + "," + parent;
    Exported top(Composition(layers, R"("assets":[)" + assets + "]"));
    ExpectNear(top.Object("C").GetRelPos(), Vector(10, -20, 30) + shift, what);
    Exported nested(
        Composition(Layer(0, "N", "", R"("refId":"in")"),
                    R"("assets":[)" + assets + R"(,{"id":"in","w":300,"h":200,"layers":[)" + layers + "]}]"));
    ExpectNear(nested.Object("C").GetRelPos(), Vector(10, -20, 30) + shift, std::string("nested: ") + what);
  }
  Exported alone(Composition(Layer(0, "N", "", R"("refId":"in")"),
                             R"("assets":[{"id":"in","w":300,"h":200,"layers":[)" + Child("") + "]}]"));
  ExpectNear(alone.Object("C").GetRelPos(), {-140, 80, 30}, "nested, without a parent");
}

TEST(LayerPlace, KeysMoveWithAnchorScaleAndParent)
{
  // x: the first two keys of the position
  const std::string p = R"("p":{"k":[10,20,30]},)";
  const std::tuple<const char*, std::string, const char*, const char*, const char*> cases[] = {
      // The offset of the centre is (50 - anchor) * scale; the parent of 200 by 100 pixels takes 100 off.
      {"the anchor", p + R"("a":)" + Ramp("[0,25,0]", "[100,25,0]"), "Position X:11", "0:-40 0.04:-50", "-"},
      {"the scale", p + R"("s":)" + Ramp("[100,100,100]", "[0,100,100]"), "Position X:11 Position X:11",
       "0:-40 0.04:-45", "0:1 0.04:0.9"},
      {"the position of a layer of half its size", R"("s":{"k":[50,100,100]},"p":)" + Ramp("[0,0,0]", "[10,0,0]"),
       "Position X:11", "0:-75 0.04:-74", "-"},
      {"the scale with one key", p + R"("s":{"k":[{"t":0,"s":[50,50,50]}]})", "", "-", "-"},
  };
  for (const auto& [what, ks, tracks, x, scale] : cases) {
    Exported exported(Composition(Solid("C", ks, R"("parent":9)") + "," +
                                  Layer(1, "P", "", R"("ind":9,"sw":200,"sh":100,"sc":"#fff")")));
    const BaseObject& object = exported.Object("C");
    EXPECT_EQ(Tracks(object), tracks) << what;
    EXPECT_EQ(Keys(object, kPosition, 0).substr(0, std::string(x).size()), x) << what;
    EXPECT_EQ(Keys(object, kScale, 0).substr(0, std::string(scale).size()), scale) << what;
  }
}

TEST(LayerRotation, HasItsOrderItsTracksAndNoJumps)
{
  // Two whole turns in ten frames: 72 degrees a frame, counted on.
  Exported exported(Composition(Solid("Turning", R"("a":{"k":[50,25,0]},"rz":)" + Ramp("[0]", "[720]")) + "," +
                                Solid("Turned", R"("s":{"k":[50,100,100]},"or":{"k":[0,0,90]})") + "," +
                                Solid("Still", R"("rx":{"k":0})")));
  const BaseObject& turning = exported.Object("Turning");
  EXPECT_EQ(Tracks(turning), "Rotation Z:11");
  EXPECT_EQ(turning.GetRotationOrder(), 2);
  CCurve* curve = FindTrack(turning, kRotation, 2)->GetCurve(1, 0);
  for (Long frame = 0; frame <= 10; ++frame)
    EXPECT_NEAR(curve->GetKey(frame)->GetValue(), frame * 0.4 * kPi, 1e-9) << frame;
  // The centre lies 25 and -25 from the corner, along axes that were turned by a quarter.
  const BaseObject& turned = exported.Object("Turned");
  ExpectNear(turned.GetRelPos(), {-25, -25, 0}, "position");
  ExpectNear(turned.GetRelRot(), {0, 0, kHalfPi}, "rotation");
  ExpectNear(turned.GetRelScale(), {0.5, 1, 1}, "scale");
  EXPECT_EQ(turned.GetFirstTrack(), nullptr);
  EXPECT_EQ(exported.Object("Still").GetRotationOrder(), BaseObject(5168).GetRotationOrder());
}

// A turn that only begins behind the work area's start counts as rotation from the first frame on.
TEST(LayerRotation, BeginsWithItsKeys)
{
  Exported exported(Composition(Solid("A", R"("a":{"k":[50,25,0]},"ry":)" + Ramp("[0]", "[90]"))));
  EXPECT_EQ(exported.Object("A").GetRotationOrder(), 2);
  ExpectNear(exported.Object("A").GetRelRot(), {}, "first frame");
  EXPECT_EQ(Tracks(exported.Object("A")), "Rotation Y:11");
  EXPECT_NEAR(FindTrack(exported.Object("A"), kRotation, 1)->GetCurve(1, 0)->GetKey(10)->GetValue(), -kHalfPi, 1e-9);
}

TEST(Targets, AreMadeForUnturnedLayersThatLookAtTheirPointOfInterest)
{
  const std::string right = R"("p":{"k":[0,0,0]},"a":{"k":[100,0,0]})";
  const std::tuple<const char*, std::string, const char*, Vector> cases[] = {
      {"camera", Layer(13, "L", right), "Main(L.Target L)", {}},
      {"spot", Layer(14, "L", right, R"("light":{"type":"spot"})"), "Main(L.Target L)", {}},
      {"parallel light", Layer(14, "L", right, R"("light":{"type":"parallel"})"), "Main(L)", {}},
      {"point light", Layer(14, "L", right), "Main(L)", {}},
      {"without orientation towards it", Layer(13, "L", right, R"("ae":{"autoOrient":false})"), "Main(L)", {}},
      {"one-node camera", Layer(13, "L", R"("p":{"k":[0,0,0]})"), "Main(L)", {}},
      // Looking along +x, and then turned about z: the look comes first in the product.
      {"turned camera", Layer(13, "L", right + R"(,"rz":{"k":90})"), "Main(L)", {kHalfPi, -kHalfPi, 0}},
  };
  for (const auto& [what, layer, tree, rotation] : cases) {
    Exported exported(Composition(layer));
    EXPECT_EQ(exported.Tree(), tree) << what;
    BaseObject& object = exported.Object("L");
    BaseTag* tag = object.GetTag(5676);
    ASSERT_EQ(tag != nullptr, Find(exported.Root(), "L.Target") != nullptr) << what;
    if (tag) {
      EXPECT_EQ(tag->GetDataInstance().GetLink(1001), &exported.Object("L.Target")) << what;
      EXPECT_EQ(exported.Object("L.Target").GetType(), 5140) << what;
      ExpectNear(exported.Object("L.Target").GetRelPos(), {100, 0, 0}, what);
    }
    const Matrix expected = AnglesToMatrix(rotation, 2);
    const Matrix actual = AnglesToMatrix(object.GetRelRot(), 2);
    ExpectNear(actual.v1, expected.v1, what);
    ExpectNear(actual.v2, expected.v2, what);
    ExpectNear(actual.v3, expected.v3, what);
  }
}

TEST(Targets, StandInTheParentsSystemButTheirKeysDoNot)
{
  const std::string camera = Layer(13, "L", R"("p":{"k":[1,2,3]},"a":)" + Ramp("[10,20,30]", "[20,20,30]"));
  Exported exported(Composition(Layer(0, "N", "", R"("refId":"in")"),
                                R"("assets":[{"id":"in","w":300,"h":200,"layers":[)" + camera + "]}]"));
  ExpectNear(exported.Object("L").GetRelPos(), {-149, 98, 3}, "camera");
  EXPECT_EQ(exported.Object("L").GetFirstTrack(), nullptr);
  BaseObject& target = exported.Object("L.Target");
  ExpectNear(target.GetRelPos(), {-140, 80, 30}, "target");
  EXPECT_EQ(Tracks(target), "Position X:11");
  EXPECT_EQ(Keys(target, kPosition, 0).substr(0, 14), "0:10 0.04:11 0");
}

// The point of interest moves past a turned camera: its angles take it up, frame by frame, along the shorter way.
TEST(Targets, AreBakedIntoTheAnglesOfATurnedCamera)
{
  Exported exported(Composition(Layer(13, "L", R"("or":{"k":[0,0,1]},"a":)" + Ramp("[-50,0,100]", "[50,0,100]"))));
  const BaseObject& camera = exported.Object("L");
  EXPECT_EQ(Find(exported.Root(), "L.Target"), nullptr);
  ASSERT_NE(FindTrack(camera, kRotation, 1), nullptr);
  for (Long frame = 0; frame <= 10; ++frame) {
    Vector angles = camera.GetRelRot(); // where a component has no track, it keeps its first value
    Real* const parts[] = {&angles.x, &angles.y, &angles.z};
    for (Long component = 0; component < 3; ++component) {
      if (CTrack* track = FindTrack(camera, kRotation, component))
        *parts[component] = track->GetCurve(1, 0)->GetValue(frame / 25.0);
    }
    const Vector ahead = AnglesToMatrix(angles, 2).v3;
    EXPECT_NEAR(ahead.x / ahead.z, (-50.0 + 10.0 * frame) / 100.0, 1e-6) << frame;
  }
}

TEST(Layers, CarryTheirIdAndSwitches)
{
  Exported exported(Composition(Solid("A") + "," + Solid("B", "", R"("hd":true)") + "," + Layer(13, "Cam", "") + "," +
                                Layer(14, "Light", "", R"("hd":true)")));
  const std::pair<const char*, Long> modes[] = {{"A", 2}, {"B", 1}, {"Cam", 2}, {"Light", 1}};
  Long id = 0;
  for (auto [name, mode] : modes) {
    const BaseObject& object = exported.Object(name);
    EXPECT_EQ(object.GetDataInstance().GetLong(kLayerId, -1), ++id) << name;
    EXPECT_EQ(object.GetRenderMode() == 1, mode == 1) << name;
  }
  EXPECT_EQ(exported.Root()->GetDataInstance().GetLong(kLayerId, -1), -1);
}

// The calls in which an export fails when each of them in turn is made to.
std::vector<std::string> CallsOf(const std::string& json)
{
  std::vector<std::string> calls;
  for (std::uint64_t n = 1;; ++n) {
    host::StandaloneHost host(host::LoadCompositionText(json, "test.json", "/"));
    host.Start(EntryPointFunc);
    const std::uint64_t started = host.CallCount();
    host.FailCall(started + n);
    const Owned<BaseDocument> document(BaseDocument::Alloc());
    exporter::ExportComposition(document.get());
    if (started + n > host.CallCount())
      return calls;
    calls.push_back(host.LastError().substr(0, host.LastError().find(':')));
  }
}

TEST(LayerPlace, AsksForTheSizeOfTheParentBehindTheValuesOfTheLayer)
{
  const std::vector<std::string> calls =
      CallsOf(Composition(Child(R"("parent":9)") + "," + Layer(3, "P", "", R"("ind":9)")));
  const auto named = std::find(calls.begin(), calls.end(), "AEGP_GetLayerID");
  const auto next = std::find(named, calls.end(), "AEGP_GetCompLayerByIndex");
  const auto value = std::find(named, next, "AEGP_GetNewStreamValue");
  ASSERT_NE(value, next);
  EXPECT_NE(std::find(value, next, "AEGP_GetItemDimensions"), next);
}

} // namespace
