// Tracks as channels: keys, pieces, frames, thinning, and rotations that follow targets.
#include "tests/gltf/converted_scene.h"

namespace
{

using namespace gltf_test;

constexpr Long kLine = kInterpolationLinear, kStep = kInterpolationStep, kSpline = kInterpolationSpline;

class GltfMotion : public GltfScene
{
 protected:
  GltfMotion() { document->GetPref().SetFps(10); }
};

TEST_F(GltfMotion, ComponentsBecomeOneChannelAtTheUnionOfTheirTimes)
{
  BaseObject* object = Add(kObjectNull, "n");
  object->SetRelPos({7, 8, 9});
  AddTrack(*object, Component(kObjectRelPos, 0), {{0, 0}, {1, 100}, {2, 0}});
  AddTrack(*object, Component(kObjectRelPos, 0), {{0, 5}, {1, 6}}); // the first track counts
  AddTrack(*object, Component(kObjectRelPos, 2), {{0, 0}, {0.5, 0}, {1.5, 100}, {2, 100}});
  AddTrack(*object, Component(kObjectRelScale, 1), {{0, -1}, {1, 2}});
  const Converted scene = Convert();
  const auto place = scene.ChannelOf("n", "translation");
  ExpectNear(place.times, {0, 0.5, 1, 1.5, 2});
  ExpectNear(place.values, {0, 0.08, 0, 0.5, 0.08, 0, 1, 0.08, -0.5, 0.5, 0.08, -1, 0, 0.08, -1}, 1e-6);
  EXPECT_EQ(place.interpolation, "LINEAR");
  ExpectNear(scene.ChannelOf("n", "scale").values, {1, -1, 1, 1, 2, 1}, 1e-6);
  ExpectNear(scene.Node("n")["translation"], {0.07, 0.08, -0.09});
  EXPECT_TRUE(scene.ChannelOf("n", "rotation").times.empty());
  EXPECT_EQ(scene.json["animations"].size(), 1U);
}

TEST_F(GltfMotion, SplinesAreBakedOnceAFrame)
{
  BaseObject* object = Add(kObjectNull, "n");
  CTrack* track =
      AddTrack(*object, Component(kObjectRelPos, 0), {{0.05, 0, kSpline}, {0.55, 100, kSpline}, {2, 100, kSpline}});
  track->GetCurve(1, 0)->GetKey(0)->SetRight(BaseTime(0.2), 0); // eased
  const auto place = Convert().ChannelOf("n", "translation");
  ExpectNear(place.times, {0.05, 0.1, 0.2, 0.3, 0.4, 0.5, 0.55, 2}, 1e-6);
  for (std::size_t i = 0; i < place.times.size(); ++i)
    EXPECT_NEAR(place.values[3 * i], 0.01 * track->GetCurve(1, 0)->GetValue(place.times[i]), 1e-5) << i;
}

TEST_F(GltfMotion, FrameTimesAreThoseOfTheWholeRate)
{
  document->GetPref().SetFps(30); // of a composition with 29.97
  BaseObject* object = Add(kObjectNull, "n");
  std::vector<KeyPoint> keys;
  for (int frame = 0; frame <= 300; ++frame)
    keys.push_back({frame / 30.0, std::sin(frame * 0.1) * 100, kSpline});
  CTrack* track = CTrack::Alloc(object, Component(kObjectRelPos, 1), "Track");
  for (int frame = 0; frame <= 300; ++frame)
    track->GetCurve(1, 1)->AddKey(BaseTime(frame, 30))->SetValue(nullptr, keys[static_cast<std::size_t>(frame)].value);
  object->InsertTrackLast(track);
  const auto place = Convert().ChannelOf("n", "translation");
  ASSERT_EQ(place.times.size(), 301U) << "no more than a key a frame";
  for (std::size_t i = 0; i <= 300; ++i)
    EXPECT_EQ(static_cast<float>(place.times[i]), static_cast<float>(static_cast<double>(i) / 30.0));
}

TEST_F(GltfMotion, StepsStaySteps)
{
  BaseObject* steps = Add(kObjectNull, "steps");
  AddTrack(*steps, Component(kObjectRelPos, 0), {{0, 0, kStep}, {1, 100, kStep}, {2, 100, kStep}, {3, 0, kStep}});
  AddTrack(*steps, Component(kObjectRelPos, 1), {{0, 5, kLine}, {3, 5, kLine}});
  BaseObject* mixed = Add(kObjectNull, "mixed");
  AddTrack(*mixed, Component(kObjectRelPos, 0), {{0, 0, kStep}, {1, 100, kLine}, {2, 0, kLine}});
  BaseObject* narrow = Add(kObjectNull, "narrow");
  AddTrack(*narrow, Component(kObjectRelPos, 0), {{0, 0, kStep}, {0.1, 100, kLine}, {0.2, 0, kLine}});
  const Converted scene = Convert();
  const auto pure = scene.ChannelOf("steps", "translation");
  EXPECT_EQ(pure.interpolation, "STEP");
  ExpectNear(pure.times, {0, 1, 3});
  const auto mix = scene.ChannelOf("mixed", "translation");
  EXPECT_EQ(mix.interpolation, "LINEAR");
  ExpectNear(mix.times, {0, 0.9, 1, 2}, 1e-6);
  ExpectNear(mix.values, {0, 0, 0, 0, 0, 0, 1, 0, 0, 0, 0, 0}, 1e-6);
  const auto late = scene.ChannelOf("narrow", "translation");
  ASSERT_EQ(late.times.size(), 4U);
  EXPECT_EQ(static_cast<float>(late.times[1]), std::nextafter(0.1F, 0.0F));
  ExpectNear(late.values, {0, 0, 0, 0, 0, 0, 1, 0, 0, 0, 0, 0}, 1e-6);
}

TEST_F(GltfMotion, RotationsAreBakedAndTakeTheShortWay)
{
  BaseObject* object = Add(kObjectNull, "n");
  object->SetRotationOrder(2);
  AddTrack(*object, Component(kObjectRelRot, 2), {{0, 0}, {1, 4 * kQuarter}, {2, 8 * kQuarter}, {3, 8 * kQuarter}});
  const auto turn = Convert().ChannelOf("n", "rotation");
  ASSERT_EQ(turn.times.size(), 22U);
  for (std::size_t i = 0; i < 21; ++i) {
    const double angle = -4 * kQuarter * turn.times[i];
    ExpectNear({turn.values[4 * i + 2], turn.values[4 * i + 3]}, {std::sin(angle / 2), std::cos(angle / 2)}, 1e-6);
  }
}

TEST_F(GltfMotion, FrozenAndAbsoluteTracksMoveThePlace)
{
  BaseObject* frozen = Add(kObjectNull, "frozen");
  frozen->SetFrozenRot({0, 0, kQuarter});
  frozen->SetRelPos({0, 0, 0});
  AddTrack(*frozen, Component(kObjectRelPos, 0), {{0, 0}, {1, 100}});
  AddTrack(*frozen, Component(kObjectFrozenPos, 1), {{0, 0}, {1, 300}});
  AddTrack(*frozen, Component(kObjectFrozenScale, 0), {{0, 1}, {1, 2}});
  BaseObject* absolute = Add(kObjectNull, "absolute");
  absolute->SetRelPos({10, 20, 30});
  AddTrack(*absolute, Component(kObjectAbsPos, 1), {{0, 0}, {1, 100}});
  AddTrack(*absolute, Component(kObjectAbsScale, 2), {{0, 1}, {1, 3}});
  AddTrack(*absolute, Component(kObjectAbsRot, 0), {{0, 0}, {0.1, kQuarter}});
  const Converted scene = Convert();
  ExpectNear(scene.ChannelOf("frozen", "translation").values, {0, 0, 0, 0, 2, 0}, 1e-6);
  ExpectNear(scene.ChannelOf("frozen", "scale").values, {1, 1, 1, 2, 1, 1}, 1e-6);
  ExpectNear(scene.ChannelOf("absolute", "translation").values, {0.1, 0, -0.3, 0.1, 1, -0.3}, 1e-6);
  ExpectNear(scene.ChannelOf("absolute", "scale").values, {1, 1, 1, 1, 1, 3}, 1e-6);
  ExpectNear(scene.ChannelOf("absolute", "rotation").values, {0, 0, 0, 1, 0, std::sqrt(0.5), 0, std::sqrt(0.5)}, 1e-6);
}

TEST_F(GltfMotion, KeysThatTheirNeighboursGiveBackGo)
{
  std::vector<KeyPoint> line, still;
  for (int i = 0; i <= 100; ++i) {
    line.push_back({i / 10.0, 100.0 * i + (i == 50 ? 0.005 : 0.0)});
    still.push_back({i / 10.0, 3.0});
  }
  BaseObject* object = Add(kObjectNull, "line");
  AddTrack(*object, Component(kObjectRelPos, 0), line);
  AddTrack(*Add(kObjectNull, "still"), Component(kObjectRelPos, 0), still);
  AddTrack(*Add(kObjectNull, "one"), Component(kObjectRelPos, 0), {{1, 5}});
  AddTrack(*Add(kObjectNull, "none"), Component(kObjectRelPos, 0), {});
  const Converted scene = Convert();
  ExpectNear(scene.ChannelOf("line", "translation").times, {0, 10}, 1e-6); // 1e-6 of 100 m are 0.1 mm
  for (const char* name : {"still", "one", "none"})
    EXPECT_TRUE(scene.ChannelOf(name, "translation").times.empty()) << name;
  EXPECT_TRUE(scene.Account().Lines().empty());
}

TEST_F(GltfMotion, EqualTimesAreSharedAndNegativeOnesMoved)
{
  AddTrack(*Add(kObjectNull, "a"), Component(kObjectRelPos, 0), {{-1, 0}, {0, 100}});
  AddTrack(*Add(kObjectNull, "b"), Component(kObjectRelScale, 0), {{-1, 1}, {0, 2}});
  AddTrack(*Add(kObjectNull, "c"), Component(kObjectRelPos, 0), {{0, 0}, {0.001, 50}, {2, 100}});
  const Converted scene = Convert();
  const Json& samplers = scene.json["animations"][0]["samplers"];
  EXPECT_EQ(samplers[0]["input"], samplers[1]["input"]);
  ExpectNear(scene.ChannelOf("a", "translation").times, {0, 1});
  ExpectNear(scene.ChannelOf("c", "translation").times, {1, 1.001, 3}, 1e-7);
  EXPECT_EQ(scene.Lost(Loss::kNegativeTime), 1U);
  EXPECT_EQ(scene.json["scenes"][0]["extras"]["q7r"]["timeOffset"], 1.0);
  EXPECT_EQ(scene.json["animations"][0]["extras"]["q7r"]["timeOffset"], 1.0);
}

TEST_F(GltfMotion, OfTimesThatBecomeEqualTheLaterStays)
{
  AddTrack(*Add(kObjectNull, "n"), Component(kObjectRelPos, 0), {{100, 0}, {9000, 10}, {9000.00001, 100}});
  const auto place = Convert().ChannelOf("n", "translation");
  ExpectNear(place.times, {100, 9000});
  ExpectNear(place.values, {0, 0, 0, 1, 0, 0}, 1e-6);
}

TEST_F(GltfMotion, TellsTracksWithoutAPlace)
{
  BaseObject* object = Add(kObjectNull, "n");
  AddTrack(*object, -1, {{0, 0}, {1, 1}});
  AddTrack(*object, kObjectRenderMode, {{0, 0}, {1, 1}});
  AddTrack(*object, 4711, {{0, 0}, {1, 1}});
  AddTrack(*object, kObjectRelPos, {{0, 0}, {1, 1}});
  const Converted scene = Convert();
  EXPECT_EQ(scene.Lost(Loss::kTimeTrack), 1U);
  EXPECT_EQ(scene.Lost(Loss::kVisibilityTrack), 1U);
  EXPECT_EQ(scene.Lost(Loss::kOtherTrack), 2U);
  EXPECT_FALSE(scene.json.contains("animations"));
}

TEST_F(GltfMotion, ALongStretchOfAFewBytesStaysSmall)
{
  document->GetPref().SetFps(1000);
  for (int i = 0; i < 20; ++i)
    AddTrack(*Add(kObjectNull, "n"), Component(kObjectRelRot, 0), {{-9999, 0, kSpline}, {9999, 1000, kSpline}});
  const Converted scene = Convert();
  EXPECT_GT(scene.Lost(Loss::kCoarse), 0U);
  EXPECT_LT(scene.Model().bytes.Size(), 10'000'000U);
}

// The direction that a node of the file looks along at rest: its -z.
std::vector<double> Forward(const Json& q, std::size_t at = 0)
{
  const double x = q[at], y = q[at + 1], z = q[at + 2], w = q[at + 3];
  return {-2 * (x * z + w * y), -2 * (y * z - w * x), -(1 - 2 * (x * x + y * y))};
}

TEST_F(GltfMotion, TargetsAreLookedAt)
{
  BaseObject* camera = Add(kObjectCamera, "camera");
  camera->SetRelPos({0, 0, -100});
  camera->SetRelRot({1, 2, 3});
  BaseObject* target = Add(kObjectNull, "target");
  target->SetRelPos({100, 0, -100});
  SetTarget(*camera, *target);
  BaseObject* above = Add(kObjectNull, "above");
  above->SetRelPos({100, 50, -100});
  SetTarget(*above, *target);
  BaseObject* same = Add(kObjectNull, "same");
  same->SetRelPos({100, 0, -100});
  SetTarget(*same, *target);
  const Converted scene = Convert();
  ExpectNear(Forward(scene.Node("camera")["rotation"]), {1, 0, 0});
  ExpectNear(Forward(scene.Node("above")["rotation"]), {0, -1, 0});
  EXPECT_FALSE(scene.Node("same").contains("rotation"));
  EXPECT_EQ(scene.Extras("camera")["target"], 1);
  EXPECT_FALSE(scene.Extras("camera").contains("angles"));
}

TEST_F(GltfMotion, TargetsAreFollowedBelowATurningParent)
{
  BaseObject* parent = Add(kObjectNull, "parent");
  BaseObject* camera = Add(kObjectCamera, "camera", parent);
  camera->SetRelPos({0, 0, -100});
  BaseObject* target = Add(kObjectNull, "target");
  target->SetRelPos({0, 0, 1000});
  SetTarget(*camera, *target);
  BaseObject* far = Add(kObjectNull, "far"); // what the target looks at doesn't move it
  AddTrack(*far, Component(kObjectRelPos, 0), {{0, 0}, {2, 100}});
  SetTarget(*target, *far);
  AddTrack(*parent, Component(kObjectRelRot, 0), {{0, 0}, {1, kQuarter}}); // order 6: about y
  AddTrack(*camera, Component(kObjectRelRot, 1), {{0, 0}, {1, 1}});        // doesn't count
  const Converted scene = Convert();
  const auto turn = scene.ChannelOf("camera", "rotation");
  const auto around = scene.ChannelOf("parent", "rotation");
  ASSERT_EQ(turn.times.size(), 11U);
  ASSERT_EQ(around.times.size(), 11U);
  for (std::size_t i = 0; i < 11; ++i) {
    // Both turns together look from the camera's place in the world to the target.
    const double angle = 2 * std::asin(around.values[4 * i + 1]);
    const std::vector<double> local = Forward(turn.values, 4 * i);
    const double x = std::cos(angle) * local[0] + std::sin(angle) * local[2];
    const double z = -std::sin(angle) * local[0] + std::cos(angle) * local[2];
    const double eyeX = std::sin(angle), eyeZ = std::cos(angle);
    const double length = std::hypot(0 - eyeX, -10 - eyeZ);
    ExpectNear({x, local[1], z}, {-eyeX / length, 0, (-10 - eyeZ) / length}, 1e-5);
  }
}

TEST_F(GltfMotion, LoopsOfTargetsEnd)
{
  BaseObject* a = Add(kObjectNull, "a");
  BaseObject* b = Add(kObjectNull, "b", a);
  BaseObject* c = Add(kObjectNull, "c", b);
  b->SetRelPos({1, 2, 3});
  SetTarget(*a, *c);
  SetTarget(*b, *a);
  SetTarget(*c, *c);
  AddTrack(*c, Component(kObjectRelPos, 0), {{0, 0}, {1, 100}});
  BaseObject* up = nullptr;
  BaseObject* objects[300] = {};
  for (BaseObject*& object : objects)
    up = object = Add(kObjectNull, "chain", up);
  for (int i = 0; i < 300; ++i)
    SetTarget(*objects[i], *objects[299 - i]);
  EXPECT_EQ(Convert().json["nodes"].size(), 303U);
}

TEST_F(GltfMotion, NumbersBeyondMeasureAreBroughtIntoRange)
{
  BaseObject* object = Add(kObjectNull, "n");
  object->SetRelPos({NAN, INFINITY, -1e300});
  object->SetRelRot({INFINITY, NAN, 1e300});
  object->SetRelScale({NAN, 1e308, -INFINITY});
  AddTrack(*object, Component(kObjectRelPos, 0), {{0, 1e300, kSpline}, {1, NAN, kSpline}, {2, -INFINITY}});
  AddTrack(*object, Component(kObjectRelRot, 0), {{0, INFINITY}, {1, NAN}});
  BaseObject* camera = Add(kObjectCamera, "camera");
  SetTarget(*camera, *object);
  const Converted scene = Convert(); // is checked
  EXPECT_GT(scene.Lost(Loss::kNumber), 0U);
}

TEST_F(GltfMotion, EqualScenesGiveEqualBytes)
{
  BaseObject* object = Add(kObjectNull, "n");
  AddTrack(*object, Component(kObjectRelPos, 0), {{0, 0, kSpline}, {1, 100}});
  AddPlane("plane", 10, 20, AddMaterial("red", {1, 0, 0}));
  EXPECT_EQ(gltf::ToGlb(Convert().Model()), gltf::ToGlb(Convert().Model()));
}

} // namespace
