#include "export_fixture.h"
#include "exporter/walk/camera.h"

using namespace export_test;

TEST(Camera, TakesItsApertureFromTheFilm)
{
  // Behind 400 by 300 pixels a diagonal of 5 is 4 wide.
  // size: pixels; 72 are 25.4 mm
  const std::tuple<const char*, AEGP_FilmSizeUnits, Real, Real> cases[] = {{"horizontal", 1, 72, 25.4},
                                                                           {"vertical", 2, 54, 25.4},
                                                                           {"diagonal", 3, 90, 25.4},
                                                                           {"no units", 0, 72, 36},
                                                                           {"other units", 4, 72, 36},
                                                                           {"less than a millimetre", 1, 2.8, 36},
                                                                           {"a millimetre", 1, 2.9, 2.9 * 25.4 / 72},
                                                                           {"nothing", 3, 0, 36}};
  for (const auto& [what, units, size, aperture] : cases)
    EXPECT_NEAR(exporter::ApertureWidth(units, size, 400, 300), aperture, 1e-12) << what;
}

TEST(Camera, HasProjectionViewFieldAndFocus)
{
  const std::string film = R"("camera":{"type":"orthographic","filmSize":72,"focusDistance":{"k":720}},"pe":{"k":500})";
  Exported exported(Composition(Layer(13, "Plain", "", R"("pe":{"k":1000})") + "," + Layer(13, "Film", "", film)));
  // The zoom is as long as the composition is wide, or half of that; the focus distance follows it unless it is set.
  const std::tuple<const char*, Long, Real, Real, Real, Real> cases[] = {
      {"Plain", 0, 36, 2 * std::atan(0.5), 1000 * 25.4 / 72, 36}, {"Film", 4, 25.4, kHalfPi, 254, 12.7}};
  for (const auto& [name, projection, aperture, field, focus, focalLength] : cases) {
    EXPECT_EQ(exported.Parameter(name, 1001).GetLong(), projection) << name;
    EXPECT_NEAR(exported.Parameter(name, 1006).GetReal(), aperture, 1e-9) << name;
    EXPECT_NEAR(exported.Parameter(name, 1008).GetReal(), field, 1e-12) << name;
    EXPECT_NEAR(exported.Parameter(name, 1010).GetReal(), focus, 1e-9) << name;
    EXPECT_NEAR(exported.Object(name).GetDataInstance().GetReal(500), focalLength, 1e-9) << name;
  }
}

TEST(Camera, InANestedCompositionSeesItsWidthAtTheRootsPixelAspect)
{
  Exported exported(Composition(
      Layer(0, "N", "", R"("refId":"in")"),
      R"("ae":{"pixelAspect":[2,1]},"assets":[{"id":"in","w":300,"h":200,"ae":{"pixelAspect":[3,1]},"layers":[)" +
          Layer(13, "Cam", "", R"("pe":{"k":600})") + "]}]"));
  EXPECT_NEAR(exported.Parameter("Cam", 1008).GetReal(), 2 * std::atan(0.5), 1e-12); // 150 / (600 / 2)
}

TEST(Camera, AnimatesZoomAndFocus)
{
  Exported exported(Composition(
      Layer(13, "Cam", "",
            R"("camera":{"focusDistance":)" + Ramp("[0]", "[720]") + R"(},"pe":)" + Ramp("[500]", "[1000]")),
      R"("ae":{"workArea":[2,4]})"));
  const BaseObject& camera = exported.Object("Cam");
  EXPECT_EQ(Tracks(camera), "Field of View:3 Focus Distance:3");
  EXPECT_EQ(Keys(camera, 1010), "0:0 0.04:25.4 0.08:50.8");
  CTrack* field = FindTrack(camera, 1008);
  EXPECT_TRUE(field->GetPath().IsExactly(ParameterPath(1008)));
  for (Long frame = 0; frame <= 2; ++frame)
    EXPECT_NEAR(field->GetCurve(1, 0)->GetKey(frame)->GetValue(), 2 * std::atan(500 / (500 + 50.0 * frame)), 1e-12);
  EXPECT_NEAR(exported.Parameter("Cam", 1008).GetReal(), 2 * std::atan(500.0 / 600), 1e-12); // where the area starts
  EXPECT_NEAR(exported.Parameter("Cam", 1010).GetReal(), 50.8, 1e-9);
}

TEST(Camera, TheLastOneIsLookedThrough)
{
  Exported exported(Composition(Layer(13, "First", "") + "," + Layer(13, "Last", "") + "," + Solid("A")));
  auto* panel = static_cast<ViewPanel*>(exported.document->GetViewPanelRoot()->GetFirst());
  ASSERT_NE(panel, nullptr);
  EXPECT_EQ(panel->GetBaseDraw(0)->GetSceneCamera().GetLink(), &exported.Object("Last"));
}

TEST(Light, HasTypeBrightnessColourShadowAndCone)
{
  struct Case
  {
    const char* what;
    const char* light;
    Long type;
    Real intensity;
    Vector color;
    Long shadow;
    Real density, inner, outer; // below 0: as in a new light
  };
  const char* full = R"("intensity":{"k":150},"color":{"k":[0.25,0.5,0.75]},"castsShadows":{"k":1},)"
                     R"("shadowDarkness":{"k":0},"coneAngle":{"k":90},"coneFeather":{"k":50})";
  const auto light = [&](const char* type) { return std::string(R"({"type":")") + type + "\"," + full + "}"; };
  const std::string spot = light("spot"), point = light("point"), parallel = light("parallel"),
                    ambient = light("ambient");
  const Vector mixed(0.25, 0.5, 0.75);
  const Case cases[] = {
      {"a plain light is a point", "{}", 0, 1, {1, 1, 1}, 0, 1, -1, -1},
      {"spot", spot.c_str(), 1, 1.5, mixed, 1, 0, kPi / 4, kHalfPi},
      {"a plain spot", R"({"type":"spot"})", 1, 1, {1, 1, 1}, 0, 1, kPi / 4, kHalfPi},
      {"point", point.c_str(), 0, 1.5, mixed, 1, 0, -1, -1},
      {"parallel", parallel.c_str(), 4, 1.5, mixed, 1, 0, -1, -1},
      {"ambient", ambient.c_str(), 4, 1.5, mixed, -1, -1, -1, -1},
  };
  std::unique_ptr<BaseObject> fresh(AllocObject(5102));
  for (const Case& c : cases) {
    Exported exported(Composition(Layer(14, "L", "", std::string(R"("light":)") + c.light)));
    const auto isReal = [&](Long id, Real expected) {
      GeData value;
      fresh->GetParameterById(id, value);
      EXPECT_NEAR(exported.Parameter("L", id).GetReal(), expected < 0 ? value.GetReal() : expected, 1e-12)
          << c.what << ' ' << id;
    };
    EXPECT_EQ(exported.Parameter("L", 90002).GetLong(), c.type) << c.what;
    isReal(90001, c.intensity);
    EXPECT_EQ(exported.Parameter("L", 90000).GetVector(), c.color) << c.what;
    EXPECT_EQ(exported.Parameter("L", 90003).GetLong(), c.shadow < 0 ? 0 : c.shadow) << c.what;
    isReal(50001, c.density);
    isReal(90010, c.inner);
    isReal(90011, c.outer);
    EXPECT_EQ(Tracks(exported.Object("L")), "") << c.what;
  }
}

TEST(Light, AnimatesAllButTheSwitchOfItsShadow)
{
  const auto ramp = [](const char* key, const std::string& from, const std::string& to) {
    return std::string("\"") + key + "\":" + Ramp(from, to);
  };
  const std::string all = ramp("intensity", "[0]", "[100]") + "," + ramp("shadowDarkness", "[100]", "[0]") + "," +
                          ramp("color", "[0,1,0.5]", "[1,0,0.5]") + "," +
                          R"("castsShadows":{"k":[{"t":0,"s":[0],"h":1},{"t":2,"s":[1]}]})" + "," +
                          R"("coneFeather":{"k":[{"t":0,"s":[50]},{"t":10,"s":[0]}]},"coneAngle":{"k":180})";
  Exported exported(
      Composition(Layer(14, "L", "", R"("light":{"type":"spot",)" + all + "}"), R"("ae":{"workArea":[2,4]})"));
  const BaseObject& light = exported.Object("L");
  // The outer angle doesn't change.
  EXPECT_EQ(Tracks(light), "Intensity:3 Shadow Density:3 Color.R:3 Color.G:3 Inner Angle:3");
  EXPECT_EQ(Keys(light, 90001), "0:0 0.04:0.1 0.08:0.2");
  EXPECT_EQ(Keys(light, 50001), "0:1 0.04:0.9 0.08:0.8");
  EXPECT_EQ(Keys(light, 90000, 0), "0:0 0.04:0.1 0.08:0.2");
  EXPECT_EQ(Keys(light, 90000, 1), "0:1 0.04:0.9 0.08:0.8");
  EXPECT_EQ(Keys(light, 90010), "0:1.5708 0.04:1.72788 0.08:1.88496"); // half, 0.55 and 0.6 of pi
  EXPECT_TRUE(FindTrack(light, 90000, 1)->GetPath().IsExactly({ParameterLevel{90000, 23, 0}, {1001, 19, 0}}));
  EXPECT_EQ(exported.Parameter("L", 90003).GetLong(), 1); // as where the work area starts
  EXPECT_NEAR(exported.Parameter("L", 90001).GetReal(), 0.2, 1e-12);
}
