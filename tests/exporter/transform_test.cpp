#include <gtest/gtest.h>
#include <tuple>

#include "exporter/walk/transform.h"

namespace
{

using namespace exporter;
using _torvane_::kHalfPi;
using _torvane_::kPi;
using _torvane_::LookAtMatrix;

void ExpectNear(const Vector& actual, const Vector& expected, const char* what)
{
  EXPECT_NEAR(actual.x, expected.x, 1e-12) << what;
  EXPECT_NEAR(actual.y, expected.y, 1e-12) << what;
  EXPECT_NEAR(actual.z, expected.z, 1e-12) << what;
}

TEST(Transform, TurnsHostPixelsIntoSceneUnits)
{
  const Vector full(100, 100, 100), none;
  const TransformRules plane = {.width = 100, .height = 50, .useAnchor = true, .useScale = true};
  TransformRules turned = plane;
  turned.useRotation = true;
  TransformRules shifted = plane;
  shifted.parentShift = ParentShift(200, 100);
  const TransformRules camera = {.lookAtTarget = true, .useRotation = true};
  const std::tuple<const char*, LayerSample, TransformRules, Vector, Vector, Vector> cases[] = {
      {"anchor at the centre", {{10, 20, 30}, {50, 25, 0}, 0, 0, 0, none, full}, plane, {10, -20, 30}, none, {1, 1, 1}},
      {"anchor at the corner of a plane at half its size",
       {none, none, 0, 0, 0, none, {50, 50, 50}},
       plane,
       {25, -12.5, 0},
       none,
       {0.5, 0.5, 0.5}},
      {"anchor in depth", {none, {50, 25, 7}, 0, 0, 0, none, {100, 100, 200}}, plane, {0, 0, -14}, none, {1, 1, 2}},
      {"a quarter turn about the corner",
       {none, none, 0, 0, 90, none, full},
       turned,
       {-25, -50, 0},
       {0, 0, kHalfPi},
       {1, 1, 1}},
      {"turns whose order matters: orientation first",
       {none, {50, 25, 0}, 0, 0, 90, {90, 0, 0}, full},
       turned,
       none,
       {kHalfPi, 0, kHalfPi},
       {1, 1, 1}},
      {"child of a layer of 200 by 100",
       {{10, 20, 30}, {50, 25, 0}, 0, 0, 0, none, full},
       shifted,
       {-90, 30, 30},
       none,
       {1, 1, 1}},
      {"camera that looks along +x and is then turned about x",
       {none, {100, 0, 0}, 0, 0, 0, {90, 0, 0}, none},
       camera,
       none,
       {kHalfPi, 0, -kHalfPi},
       {1, 1, 1}},
      {"camera on its target", {{5, 6, 7}, {5, 6, 7}, 0, 0, 0, none, none}, camera, {5, -6, 7}, none, {1, 1, 1}},
  };
  for (const auto& [what, sample, rules, position, rotation, scale] : cases) {
    const SceneTransform result = ConvertTransform(sample, rules, nullptr);
    ExpectNear(result.position, position, what);
    ExpectNear(result.rotation, rotation, what);
    ExpectNear(result.scale, scale, what);
  }
}

TEST(Transform, FollowsThePreviousRotationAcrossWholeTurns)
{
  const TransformRules rules = {.useRotation = true};
  const LayerSample sample = {.rotateZ = 10};
  const Vector previous(0, 0, 4 * kPi);
  ExpectNear(ConvertTransform(sample, rules, nullptr).rotation, {0, 0, kPi / 18}, "first frame");
  ExpectNear(ConvertTransform(sample, rules, &previous).rotation, {0, 0, 4 * kPi + kPi / 18}, "later frame");
}

TEST(Transform, LooksFromAPointToAnother)
{
  const Vector up(0, 1, 0);
  const Matrix ahead = LookAtMatrix({}, {0, 0, 9}, up);
  EXPECT_EQ(ahead, Matrix());
  const Matrix right = LookAtMatrix({}, {3, 0, 0}, up);
  EXPECT_EQ(right, Matrix({}, {0, 0, -1}, {0, 1, 0}, {1, 0, 0}));
  // Straight up there is no sideways: the x axis is taken.
  const Matrix above = LookAtMatrix({1, 2, 3}, {1, 5, 3}, {1, 3, 3});
  EXPECT_EQ(above, Matrix({1, 2, 3}, {1, 0, 0}, {0, 0, -1}, {0, 1, 0}));
  EXPECT_EQ(LookAtMatrix({1, 2, 3}, {4, 2, 3}, {1, 2, 3}), Matrix({1, 2, 3}, {1, 0, 0}, {0, 1, 0}, {0, 0, 1}));
}

TEST(Transform, DerivesAnglesOfCamerasAndCones)
{
  EXPECT_DOUBLE_EQ(FieldOfView(1000, 1000, 1.0), 0.92729521800161223); // 2 atan(1/2)
  EXPECT_DOUBLE_EQ(FieldOfView(1000, 1000, 2.0), kHalfPi);
  EXPECT_DOUBLE_EQ(InnerAngle(90, 50), kPi / 4);
  EXPECT_DOUBLE_EQ(PixelsToMillimetres(720), 254.0);
}

} // namespace
