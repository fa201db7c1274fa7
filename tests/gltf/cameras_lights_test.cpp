// Cameras and lights, still and animated.
#include "tests/gltf/converted_scene.h"

namespace
{

using namespace gltf_test;

constexpr double kPi = 3.14159265358979323846;

class GltfViews : public GltfScene
{
 protected:
  GltfViews()
  {
    RenderData& render = *document->GetActiveRenderData();
    render.SetParameterById(kRenderWidth, 1000.0);
    render.SetParameterById(kRenderHeight, 500.0);
    render.SetParameterById(kRenderFilmAspect, 2.0);
    document->GetPref().SetFps(25);
  }
  static const Json& LightOf(const Converted& scene, const char* name)
  {
    const Json& index = scene.Node(name)["extensions"]["KHR_lights_punctual"]["light"];
    return scene.json["extensions"]["KHR_lights_punctual"]["lights"][index.get<std::size_t>()];
  }
  std::string PointerTo(const char* value) { return std::string("/extensions/KHR_lights_punctual/lights/0/") + value; }
};

TEST_F(GltfViews, CamerasHaveTheSceneCameraFirst)
{
  Add(kObjectCamera, "one");
  BaseObject* two = Add(kObjectCamera, "two");
  two->SetParameterById(kCameraFocalLength, 18.0);
  two->SetParameterById(kCameraFocusDistance, 254.0);
  ASSERT_TRUE(document->SetSceneCamera(two));
  const Converted scene = Convert();
  EXPECT_EQ(scene.Node("two")["camera"], 0);
  EXPECT_EQ(scene.Node("one")["camera"], 1);
  EXPECT_EQ(scene.json["scenes"][0]["extras"]["q7r"]["camera"], 1);
  const Json& camera = scene.json["cameras"][0];
  EXPECT_EQ(camera["type"], "perspective");
  EXPECT_FALSE(camera["perspective"].contains("zfar"));
  ExpectNear({camera["perspective"]["yfov"], camera["perspective"]["aspectRatio"], camera["perspective"]["znear"]},
             {2 * std::atan(0.5), 2, 0.1});
  EXPECT_EQ(camera["extras"]["q7r"], Json({{"focalLength", 18.0}, {"aperture", 36.0}, {"focusDistance", 254.0}}));
}

TEST_F(GltfViews, LensesWithoutMeasureAreBroughtIntoRange)
{
  const std::tuple<double, double, double, double> cases[] = {
      {0, 36, 2, kPi - 0.001}, {36, 0, 2, 0.001},   {1e-300, 36, 2, kPi - 0.001},
      {-5, 36, 2, 0.001},      {NAN, 36, 2, 0.001}, {36, 36, 0, 2 * std::atan(0.25)}};
  for (const auto& [focalLength, aperture, aspect, yfov] : cases) {
    if (!document->GetFirstObject())
      Add(kObjectCamera, "camera");
    document->GetFirstObject()->GetDataInstance().SetReal(kCameraFocalLength, focalLength);
    document->GetFirstObject()->GetDataInstance().SetReal(kCameraApertureWidth, aperture);
    document->GetActiveRenderData()->SetParameterById(kRenderFilmAspect, aspect);
    EXPECT_NEAR(Convert().json["cameras"][0]["perspective"]["yfov"].get<double>(), yfov, 1e-9) << focalLength;
  }
}

TEST_F(GltfViews, OtherProjectionsAreParallel)
{
  Add(kObjectCamera, "parallel")->SetParameterById(kCameraProjection, Long{4});
  Add(kObjectCamera, "top")->SetParameterById(kCameraProjection, Long{3});
  const Converted scene = Convert();
  for (const Json& camera : scene.json["cameras"]) {
    EXPECT_EQ(camera["type"], "orthographic");
    const Json& view = camera["orthographic"];
    ExpectNear({view["xmag"], view["ymag"], view["znear"], view["zfar"]}, {5, 2.5, 0.1, 1000});
  }
  EXPECT_EQ(scene.Lost(Loss::kProjection), 1U);
}

TEST_F(GltfViews, FieldsOfViewMove)
{
  BaseObject* wide = Add(kObjectCamera, "wide");
  AddTrack(*wide, kCameraFieldOfView, {{0, kQuarter, kInterpolationStep}, {1, 0.001, kInterpolationStep}});
  AddTrack(*wide, kCameraFocusDistance, {{0, 1}, {1, 2}});
  BaseObject* lens = Add(kObjectCamera, "lens");
  AddTrack(*lens, kCameraFocalLength, {{0, 36}, {0.04, 18}});
  AddTrack(*lens, kCameraApertureWidth, {{0.04, 36}, {0.08, 72}});
  const Converted scene = Convert();
  const auto view = scene.PointerChannel("/cameras/0/perspective/yfov");
  EXPECT_EQ(view.interpolation, "STEP");
  ExpectNear(view.times, {0, 1});
  ExpectNear(view.values, {2 * std::atan(0.5), 0.001}, 1e-6);
  const auto both = scene.PointerChannel("/cameras/1/perspective/yfov");
  ExpectNear(both.times, {0, 0.04, 0.08}, 1e-6);
  ExpectNear(both.values, {2 * std::atan(0.25), 2 * std::atan(0.5), 2 * std::atan(1.0)}, 1e-6);
  EXPECT_EQ(scene.Lost(Loss::kFocusTrack), 1U);
  EXPECT_EQ(scene.json["extensionsUsed"], Json({"KHR_animation_pointer"}));
  EXPECT_FALSE(scene.json.contains("extensionsRequired"));
  options.pointers = false;
  const Converted without = Convert();
  EXPECT_FALSE(without.json.contains("animations") || without.json.contains("extensionsUsed"));
  EXPECT_EQ(without.Lost(Loss::kPointer), 2U);
}

TEST_F(GltfViews, LightsShineAsBrightAsInTheScene)
{
  using Case = std::tuple<const char*, Long, double, Vector, const char*, double, std::vector<double>>;
  const double excess = std::pow(2.055 / 1.055, 2.4); // of a component of 2, linear
  const double near = kPi * 25;                       // half of 1000 pixels are 5 m
  const Case cases[] = {{"point", 0, 1, {1, 1, 1}, "point", near, {1, 1, 1}},
                        {"spot", 1, 0.5, {1, 0.5, 0}, "spot", near / 2, {1, 0.214041140482, 0}},
                        {"parallel", 4, 2, {1, 1, 1}, "directional", 2 * kPi, {1, 1, 1}},
                        {"area", 8, 1, {1, 1, 1}, "directional", kPi, {1, 1, 1}},
                        {"negative", 0, -1, {1, 1, 1}, "point", 0, {1, 1, 1}},
                        {"strong", 4, 1, {2, 1, -1}, "directional", kPi * excess, {1, 1 / excess, 0}}};
  for (const auto& [name, type, brightness, color, kind, intensity, linear] : cases) {
    BaseObject* light = Add(kObjectLight, name);
    light->SetParameterById(kLightType, type);
    light->SetParameterById(kLightBrightness, brightness);
    light->SetParameterById(kLightColor, color);
    light->SetParameterById(kLightShadow, Long{1});
  }
  const Converted scene = Convert();
  for (const auto& [name, type, brightness, color, kind, intensity, linear] : cases) {
    const Json& light = LightOf(scene, name);
    EXPECT_EQ(light["type"], kind) << name;
    EXPECT_NEAR(light["intensity"].get<double>(), intensity, 1e-6) << name;
    ExpectNear(light["color"], linear, 1e-6);
    EXPECT_EQ(light["extras"]["q7r"], Json({{"brightness", brightness}, {"shadow", 1}}));
  }
  EXPECT_EQ(scene.Lost(Loss::kNegativeBrightness), 1U);
}

TEST_F(GltfViews, ConesStayInTheirRange)
{
  for (const auto& [inner, outer, inside, outside] : {std::tuple<double, double, double, double>{1, 2, 0.5, 1},
                                                      {2, 2, 0.999, 1},
                                                      {0, 0, 0, 0.001},
                                                      {-1, 4, 0, kPi / 2},
                                                      {kPi, kPi, 0.999 * kPi / 2, kPi / 2}}) {
    document = NewDocument();
    BaseObject* light = AllocObject(kObjectLight);
    document->InsertObject(light);
    light->SetParameterById(kLightType, Long{1});
    light->SetParameterById(kLightInnerAngle, inner);
    light->SetParameterById(kLightOuterAngle, outer);
    const Converted scene = Convert();
    const Json& spot = scene.json["extensions"]["KHR_lights_punctual"]["lights"][0]["spot"];
    ExpectNear({spot["innerConeAngle"], spot["outerConeAngle"]}, {inside, outside});
  }
}

TEST_F(GltfViews, MeasuredLightsShineAllAround)
{
  BaseObject* light = Add(kObjectLight, "measured");
  light->SetParameterById(kLightType, Long{9});
  auto* measured = NewObj<IESLight>();
  measured->manufacturer = "Maker";
  measured->luminaireCatalogue = "L-1";
  measured->maxCandela = 100;
  measured->horizontalAngles.Append(0);
  for (const double angle : {0, 90, 180}) {
    measured->verticalAngles.Append(angle);
    measured->candela.Append(100);
  }
  NodeCast<LightObjectData>(light->GetObjectData())->AdoptIES(measured);
  const Converted scene = Convert();
  EXPECT_EQ(LightOf(scene, "measured")["type"], "point");
  EXPECT_NEAR(LightOf(scene, "measured")["intensity"].get<double>(), 100, 1e-9);
  EXPECT_EQ(LightOf(scene, "measured")["extras"]["q7r"]["maker"], "Maker");
  EXPECT_EQ(LightOf(scene, "measured")["extras"]["q7r"]["name"], "L-1");
  EXPECT_EQ(LightOf(scene, "measured")["extras"]["q7r"]["maximum"], 100.0);
  EXPECT_EQ(scene.Lost(Loss::kMeasuredLight), 1U);
}

TEST_F(GltfViews, LightsMove)
{
  BaseObject* light = Add(kObjectLight, "light");
  light->SetParameterById(kLightType, Long{1});
  light->SetParameterById(kLightColor, Vector(1, 1, 1));
  AddTrack(*light, kLightBrightness, {{0, 0}, {0.04, 1}});
  AddTrack(*light, Component(kLightColor, 1), {{0, 0}, {0.04, 0.5}});
  AddTrack(*light, kLightInnerAngle, {{0, 2}, {0.04, 1}});
  AddTrack(*light, kLightOuterAngle, {{0, 2}, {0.08, 1}});
  AddTrack(*light, kLightShadowDensity, {{0, 0}, {1, 1}});
  const Converted scene = Convert();
  ExpectNear(scene.PointerChannel(PointerTo("intensity")).values, {0, kPi * 25}, 1e-4);
  ExpectNear(scene.PointerChannel(PointerTo("color")).values, {1, 0, 1, 1, 0.2140411, 1}, 1e-6);
  ExpectNear(scene.PointerChannel(PointerTo("spot/outerConeAngle")).values, {1, 0.5}, 1e-6);
  ExpectNear(scene.PointerChannel(PointerTo("spot/innerConeAngle")).values, {0.999, 0.5, 0.4995}, 1e-6);
  EXPECT_EQ(scene.Lost(Loss::kShadowTrack), 1U);
}

TEST_F(GltfViews, ColoursBeyondFullHangTogetherWithTheIntensity)
{
  BaseObject* light = Add(kObjectLight, "light");
  light->SetParameterById(kLightType, Long{4});
  AddTrack(*light, Component(kLightColor, 0), {{0, 1}, {0.04, 2}});
  AddTrack(*light, kLightBrightness, {{0, 1}, {0.08, 1}});
  const Converted scene = Convert();
  const double excess = std::pow(2.055 / 1.055, 2.4);
  const auto color = scene.PointerChannel(PointerTo("color"));
  const auto intensity = scene.PointerChannel(PointerTo("intensity"));
  ExpectNear(color.values, {1, 1, 1, 1, 1 / excess, 1 / excess, 1, 1 / excess, 1 / excess}, 1e-5);
  ExpectNear(intensity.times, {0, 0.04, 0.08}, 1e-6);
  ExpectNear(intensity.values, {kPi, kPi * excess, kPi * excess}, 1e-4);
}

TEST_F(GltfViews, AColourBeyondFullAtRestAloneLeavesTheIntensity)
{
  BaseObject* light = Add(kObjectLight, "light");
  light->SetParameterById(kLightType, Long{4});
  light->SetParameterById(kLightColor, Vector(2, 0, 0));
  AddTrack(*light, Component(kLightColor, 0), {{0, 1}, {0.04, 0.5}});
  const Converted scene = Convert();
  ExpectNear(scene.PointerChannel(PointerTo("color")).values, {1, 0, 0, 0.2140411, 0, 0}, 1e-6);
  EXPECT_NEAR(LightOf(scene, "light")["intensity"].get<double>(), kPi, 1e-9);
  BaseObject* still = Add(kObjectLight, "still");
  still->SetParameterById(kLightType, Long{4});
  still->SetParameterById(kLightColor, Vector(2, 0, 0));
  AddTrack(*still, Component(kLightColor, 0), {{0, 1}});
  EXPECT_NEAR(LightOf(Convert(), "still")["intensity"].get<double>(), kPi * std::pow(2.055 / 1.055, 2.4), 1e-6)
      << "one key moves nothing";
}

} // namespace
