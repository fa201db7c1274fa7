// Sampled animation: which frames are read, what their keys are, and which of them are left.

#include "export_fixture.h"
#include "exporter/entry/plugin_state.h"
#include "exporter/walk/keyframes.h"

namespace
{

using namespace export_test;

constexpr Long kPosition = 903;
constexpr Long kIntensity = 90001;

// A one-dimensional property that has these values, one a frame.
std::string Samples(const std::string& values) { return R"({"k":0,"x":"time","samples":[)" + values + "]}"; }

TEST(Keyframes, AreAutomaticClampedSplineKeysOnThreeTracks)
{
  // An anchor at the corner of 100 by 50 pixels shifts the centre by (50, -25).
  Exported exported(Composition(Solid("A", R"("p":)" + Ramp("[0,0,7]", "[100,50,7]"))));
  const BaseObject& object = exported.Object("A");
  EXPECT_EQ(Tracks(object), "Position X:11 Position Y:11"); // z doesn't change
  EXPECT_EQ(Keys(object, kPosition, 0),
            "0:50 0.04:60 0.08:70 0.12:80 0.16:90 0.2:100 0.24:110 0.28:120 0.32:130 0.36:140 0.4:150");
  EXPECT_EQ(Keys(object, kPosition, 1),
            "0:-25 0.04:-30 0.08:-35 0.12:-40 0.16:-45 0.2:-50 0.24:-55 0.28:-60 0.32:-65 0.36:-70 0.4:-75");
  CTrack* track = FindTrack(object, kPosition, 1);
  EXPECT_TRUE(track->GetPath().IsExactly({ParameterLevel{903, 23, 0}, ParameterLevel{1001, 19, 0}}));
  EXPECT_EQ(track->GetKind(), kTrackValue);
  const CKey& key = *track->GetCurve(1, 0)->GetKey(3);
  EXPECT_TRUE(key.GetNBit(-2) == 0x4200u && key.GetInterpolation() == kInterpolationSpline);
  EXPECT_TRUE(key.GetTime().GetNumerator() == 3 && key.GetTime().GetDenominator() == 25);
  EXPECT_EQ(key.GetGeData().GetRawType(), kDataNil);
}

// The intensity rises by 10 % a frame; samples are taken from composition time 0 on, whatever the work area's start,
// and the single value at its start.
TEST(Keyframes, CountFromCompositionTimeZero)
{
  const std::tuple<const char*, const char*, const char*, Real> cases[] = {
      {"from the start", R"("fr":25,"ip":0,"op":3)", "0:0 0.04:0.1 0.08:0.2 0.12:0.3", 0},
      {"a later work area", R"("fr":25,"ip":0,"op":20,"ae":{"workArea":[5,8]})", "0:0 0.04:0.1 0.08:0.2 0.12:0.3", 0.5},
      {"a work area before time 0", R"("fr":25,"ip":-5,"op":-3)", "0:0 0.04:0.1 0.08:0.2", -0.5},
      {"29.97 counts a frame less, on times of 30", R"("fr":29.97,"ip":0,"op":3)", "0:0 0.0333333:0.1 0.0666667:0.2",
       0},
      {"59.94 too", R"("fr":59.94,"ip":0,"op":2)", "0:0 0.0166667:0.1", 0},
      {"one frame has two samples", R"("fr":25,"ip":2,"op":3)", "0:0 0.04:0.1", 0.2},
      {"one frame at 29.97 has one, which is no track", R"("fr":29.97,"ip":2,"op":3)", "-", 0.2},
      {"half a frame a second", R"("fr":0.4,"ip":0,"op":2)", "0:0 1:0.1 2:0.2", 0},
  };
  const std::string light = R"({"ty":14,"nm":"L","ks":{},"light":{"intensity":)" +
                            std::string(R"({"k":[{"t":-10,"s":[-100]},{"t":90,"s":[900]}]}}})");
  for (const auto& [what, timing, keys, first] : cases) {
    Exported exported("{" + std::string(timing) + R"(,"w":9,"h":9,"layers":[)" + light + "]}");
    EXPECT_EQ(Keys(exported.Object("L"), kIntensity), keys) << what;
    EXPECT_DOUBLE_EQ(exported.Parameter("L", kIntensity).GetReal(), first) << what;
  }
}

TEST(Keyframes, AreThinnedByTheValuesBesideThem)
{
  // percent: the samples; six frames are read
  const std::tuple<const char*, const char*, const char*> cases[] = {
      {"a constant is no track", "50,50,50,50,50,50", "-"},
      {"a step keeps its two sides", "0,0,0,100,100,100", "0:0 0.08:0 0.12:1 0.2:1"},
      {"a pulse", "0,0,100,0,0,0", "0:0 0.04:0 0.08:1 0.12:0 0.2:0"},
      {"a straight line keeps all", "0,10,20,30,40,50", "0:0 0.04:0.1 0.08:0.2 0.12:0.3 0.16:0.4 0.2:0.5"},
      // Each step is below the tolerance of 1e-6, and each key is compared with the one before it, kept or not.
      {"a drift", "0,0.00009,0.00018,0.00027,0.00036,0.00045", "0:0 0.2:4.5e-06"},
      {"steps just above the tolerance", "0,0.00011,0.00011,0.00022,0.00033,0.00033",
       "0:0 0.04:1.1e-06 0.08:1.1e-06 0.12:2.2e-06 0.16:3.3e-06 0.2:3.3e-06"},
      {"ends that differ by next to nothing stay", "0,0,0,0,0,0.0000000001", "0:0 0.2:1e-12"},
      {"equal ends with something between stay", "0,0,0,100,0,0", "0:0 0.08:0 0.12:1 0.16:0 0.2:0"},
  };
  for (const auto& [what, percent, keys] : cases) {
    Exported exported(Composition(Layer(14, "L", "", R"("light":{"intensity":)" + Samples(percent) + "}"),
                                  R"("ae":{"workArea":[0,5]})"));
    EXPECT_EQ(Keys(exported.Object("L"), kIntensity), keys) << what;
  }
}

TEST(Keyframes, AreMadeForWhatVaries)
{
  const std::tuple<const char*, const char*, const char*> cases[] = {
      {"a constant", R"({"k":50})", ""},
      {"one key", R"({"k":[{"t":3,"s":[50]}]})", ""}, // sampled, but constant
      {"two keys", R"({"k":[{"t":3,"s":[50]},{"t":4,"s":[60]}]})", "Intensity:4"},
      {"keys behind the work area", R"({"k":[{"t":30,"s":[50]},{"t":40,"s":[60]}]})", ""},
      {"an expression that varies", R"({"k":50,"x":"time","samples":[50,60]})", "Intensity:3"},
      {"an expression that doesn't", R"({"k":50,"x":"50"})", ""},
      {"an expression on keys", R"({"k":[{"t":3,"s":[50]},{"t":4,"s":[60]}],"x":"value"})", "Intensity:4"},
  };
  for (const auto& [what, intensity, tracks] : cases) {
    Exported exported(Composition(Layer(14, "L", "", std::string(R"("light":{"intensity":)") + intensity + "}")));
    EXPECT_EQ(Tracks(exported.Object("L")), tracks) << what;
  }
}

// A context over one light whose intensity has these values.
class Sampling
{
 public:
  explicit Sampling(const std::string& values)
      : host_(host::LoadCompositionText(
            Composition(Layer(14, "L", "", R"("light":{"intensity":)" + Samples(values) + "}")), "t.json", "/")),
        suites_(host_.Basic()),
        calls_(suites_)
  {
    context_.suites = &suites_;
    context_.frameDuration = {1, 25};
    context_.framesPerSecond = 25;
    AEGP_LayerH layer = nullptr;
    AEGP_CompH composition = nullptr;
    AEGP_ItemH item = nullptr;
    calls_(&AEGP_ItemSuite13::AEGP_GetActiveItem, &item);
    calls_(&AEGP_CompSuite15::AEGP_GetCompFromItem, item, &composition);
    calls_(&AEGP_LayerSuite13::AEGP_GetCompLayerByIndex, composition, 0, &layer);
    stream_.Open(calls_, layer, AEGP_LayerStream_INTENSITY);
  }
  ~Sampling() { stream_.Dispose(calls_); }

  // Samples into a track of the object.
  bool Run(BaseObject& object, const ParameterPath& path, exporter::SampleMode mode,
           exporter::SampledTrack::Content content, Long lastFrame)
  {
    context_.frameCount = lastFrame;
    exporter::SampledTrack track(&object, path, "T", content);
    return exporter::SampleStream(context_, calls_, stream_.Get(), {&track, 1}, {.mode = mode});
  }

 private:
  host::StandaloneHost host_;
  exporter::ExportSuites suites_;
  exporter::HostCalls calls_;
  exporter::ExportContext context_;
  exporter::HostStream stream_;
};

TEST(SampleStream, TurnsEnumeratorsIntoDataAndDegreesIntoRadians)
{
  using exporter::SampleMode;
  using Content = exporter::SampledTrack::Content;
  Sampling sampling("1,2,2,2,3,5,180");
  BaseObject object(5140);
  // 2 is 8, 3 is 10, and anything else repeats the number before. A path up to 10 that isn't a Real compares data.
  EXPECT_TRUE(sampling.Run(object, ParameterPath({5, 15, 0}), SampleMode::kEnumeration, Content::kData, 6));
  std::string keys;
  CCurve* curve = FindTrack(object, 5)->GetCurve(1, 0);
  for (Long i = 0; i < curve->GetKeyCount(); ++i) {
    keys += std::to_string(curve->GetKey(i)->GetTime().GetFrame(25)) + ":" +
            std::to_string(curve->GetKey(i)->GetGeData().GetLong()) + " ";
    EXPECT_EQ(curve->GetKey(i)->GetValue(), 0.0);
  }
  EXPECT_EQ(keys, "0:0 1:8 3:8 4:10 6:10 ");
  EXPECT_TRUE(sampling.Run(object, ParameterPath(20), SampleMode::kAngle, Content::kValue, 6));
  curve = FindTrack(object, 20)->GetCurve(1, 0);
  EXPECT_EQ(curve->GetKey(curve->GetKeyCount() - 1)->GetValue(), kPi);
  // In a track of numbers all data look the same: two keys of equal value are left, and so nothing.
  EXPECT_TRUE(sampling.Run(object, ParameterPath(30), SampleMode::kEnumeration, Content::kData, 6));
  EXPECT_EQ(FindTrack(object, 30), nullptr);
}

TEST(SampleStream, NeedsAStreamAndATrack)
{
  Sampling sampling("1,2");
  ASSERT_FALSE(exporter::SampledTrack(nullptr, ParameterPath(20), "T"));
  BaseObject object(5140);
  EXPECT_FALSE(
      sampling.Run(object, ParameterPath(), exporter::SampleMode::kValue, exporter::SampledTrack::Content::kValue, 2));
  EXPECT_EQ(object.GetFirstTrack(), nullptr);
}

} // namespace
