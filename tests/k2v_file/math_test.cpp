#include "support/library.h"

namespace
{

constexpr Real kClose = 1e-12;
constexpr Long kOrders[] = {0, 1, 2, 3, 4, 5, 6, 7, -1};

void ExpectNear(const Vector& a, const Vector& b, Real tolerance = kClose)
{
  EXPECT_NEAR(a.x, b.x, tolerance);
  EXPECT_NEAR(a.y, b.y, tolerance);
  EXPECT_NEAR(a.z, b.z, tolerance);
}

void ExpectNear(const Matrix& a, const Matrix& b, Real tolerance = kClose)
{
  ExpectNear(a.off, b.off, tolerance);
  ExpectNear(a.v1, b.v1, tolerance);
  ExpectNear(a.v2, b.v2, tolerance);
  ExpectNear(a.v3, b.v3, tolerance);
}

std::mt19937 gRandom(5);

Vector RandomVector(Real limit)
{
  std::uniform_real_distribution<Real> values(-limit, limit);
  return {values(gRandom), values(gRandom), values(gRandom)};
}

TEST(Vector, MultipliesAndNormalizes)
{
  EXPECT_EQ(Cross({1, 2, 3}, {4, 5, 6}), Vector(-3, 6, -3));
  EXPECT_TRUE(Dot({1, 2, 3}, {4, -5, 6}) == 12.0 && Length({2, 3, 6}) == 7.0);
  ExpectNear(Normalize({0, 3, 4}), {0, 0.6, 0.8});
  EXPECT_EQ(Normalize({}), Vector());
  EXPECT_EQ(Vector(1, 2, 3) - 2.0 * Vector(1, 0, -1), Vector(-1, 2, 5));
}

TEST(Matrix, MultipliesAndInverts)
{
  // Twice as large, moved, after a quarter turn about the second axis.
  const Matrix scale({1, 2, 3}, {2, 0, 0}, {0, 2, 0}, {0, 0, 2});
  const Matrix turned = Multiply(scale, Matrix({5, 0, 0}, {0, 0, 1}, {0, 1, 0}, {-1, 0, 0}));
  EXPECT_EQ(turned, Matrix({11, 2, 3}, {0, 0, 2}, {0, 2, 0}, {-2, 0, 0}));
  EXPECT_EQ(turned * Vector(1, 2, 3), Vector(5, 6, 5));
  EXPECT_EQ(Invert(scale), Matrix({-0.5, -1, -1.5}, {0.5, 0, 0}, {0, 0.5, 0}, {0, 0, 0.5}));
  EXPECT_EQ(Invert(Matrix({9, 9, 9}, {1, 2, 3}, {2, 4, 6}, {0, 1, 0})), Matrix());
  for (int i = 0; i < 100; ++i) {
    const Matrix m(RandomVector(9), RandomVector(9), RandomVector(9), RandomVector(9));
    ExpectNear(Multiply(m, Invert(m)), Matrix(), 1e-8);
    ExpectNear(Multiply(Invert(m), m), Matrix(), 1e-8);
  }
  EXPECT_EQ(MatrixScale({2, 3, 4}) * Vector(1, 1, 1), Vector(2, 3, 4));
}

TEST(Rotation, BuildersTurnTheAxesInTheirSense)
{
  ExpectNear(MatrixRotateX(kHalfPi), {{}, {1, 0, 0}, {0, 0, -1}, {0, 1, 0}});
  ExpectNear(MatrixRotateY(kHalfPi), {{}, {0, 0, 1}, {0, 1, 0}, {-1, 0, 0}});
  ExpectNear(MatrixRotateZ(kHalfPi), {{}, {0, -1, 0}, {1, 0, 0}, {0, 0, 1}});
}

// Each order is the product of the three single turns in its sequence, the last one applied first.
TEST(Rotation, AnglesGiveTheProductOfSingleTurns)
{
  const char* sequences[] = {"zxy", "xzy", "xyz", "yxz", "yzx", "zyx"};
  for (Long order : kOrders) {
    const bool scene = order < 0 || order > 5;
    for (int i = 0; i < 20; ++i) {
      const Vector angles = RandomVector(7);
      const Vector turns = scene ? Vector(angles.y, angles.x, angles.z) : angles;
      Matrix product;
      for (const char* axis = sequences[scene ? 3 : order]; *axis; ++axis)
        product = Multiply(product, *axis == 'x'   ? MatrixRotateX(turns.x)
                                    : *axis == 'y' ? MatrixRotateY(turns.y)
                                                   : MatrixRotateZ(turns.z));
      ExpectNear(AnglesToMatrix(angles, order), product);
    }
    EXPECT_EQ(AnglesToMatrix({}, order), Matrix());
  }
}

TEST(Rotation, AnglesComeBackFromAnyScaledMatrix)
{
  for (Long order : kOrders) {
    for (int i = 0; i < 300; ++i) {
      const Vector angles = RandomVector(7);
      const Vector cosines(std::cos(angles.x), std::cos(angles.y), std::cos(angles.z));
      if (std::fabs(cosines.x * cosines.y * cosines.z) < 0.01)
        continue; // too near to gimbal lock
      const Matrix m = AnglesToMatrix(angles, order);
      const Matrix scaled({1, 2, 3}, m.v1 * 2.0, m.v2 * 0.25, m.v3 * 9.0);
      ExpectNear(AnglesToMatrix(MatrixToAngles(scaled, order), order), m, 1e-7);
    }
  }
}

TEST(Rotation, AnglesSurviveGimbalLock)
{
  constexpr Real q = kHalfPi;
  const std::tuple<Long, Vector, Vector> rows[] = {
      {0, {q, 0.3, 0}, {q, 0.3, 0}},
      {0, {-q, 0.3, 0}, {-q, kTwoPi + 0.3, 0}},
      {1, {0, 0.3, q}, {0, 0.3, q}},
      {1, {0, 0.3, -q}, {0, 0.3, -q}},
      {2, {0.3, q, 0}, {0.3, q, 0}},
      {2, {0.3, -q, 0}, {0.3, -q, 0}},
      {3, {q, 0.3, 0}, {q, 0.3, 0}},
      {3, {-q, 0.3, 0}, {-q, 0.3, 0}},
      {4, {0.3, 0, q}, {0.3, 0, q}},
      {4, {0.3, 0, -q}, {0.3, 0, -q}},
      {5, {0.3, q, 0}, {0.3, q, 0}},
      {5, {0.3, -q, 0}, {0.3 - kTwoPi, -q, 0}},
      {6, {0, q, 0.3}, {0, q, 0.3}},
      {6, {0, -q, 0.3}, {0, -q, 0.3}},
      {6, {0, q, -0.3}, {0, q, kTwoPi - 0.3}},
      {6, {0, -q, -0.3}, {0, -q, kTwoPi - 0.3}},
      // Not locked: the heading is brought into the first turn, the roll too.
      {6, {-1, 0.5, -2}, {kTwoPi - 1, 0.5, kTwoPi - 2}},
      {6, {2, 0.5, 1}, {2, 0.5, 1}},
  };
  for (const auto& [order, angles, result] : rows) {
    SCOPED_TRACE(testing::Message() << "order " << order << " angles " << angles.x << " " << angles.y);
    ExpectNear(MatrixToAngles(AnglesToMatrix(angles, order), order), result, 1e-7);
  }
  for (Long order : kOrders) {
    const Vector angles = MatrixToAngles(Matrix({}, {}, {}, {}), order);
    EXPECT_TRUE(std::isfinite(angles.x) && std::isfinite(angles.y) && std::isfinite(angles.z)) << order;
  }
}

TEST(ClosestAngles, ChoosesTheNearerRepresentation)
{
  const Vector angles(0.1, 0.2, 0.3);
  for (Long order : kOrders) {
    const Vector second = order == 0 || order == 3   ? Vector(kPi - 0.1, kPi + 0.2, kPi + 0.3)
                          : order == 1 || order == 4 ? Vector(kPi + 0.1, kPi + 0.2, kPi - 0.3)
                                                     : Vector(kPi + 0.1, kPi - 0.2, kPi + 0.3);
    EXPECT_EQ(ClosestAngles(angles, angles, order), angles);
    const Vector far = second + Vector(4 * kTwoPi, -3 * kTwoPi, 0.05);
    ExpectNear(ClosestAngles(far, angles, order), far - Vector(0, 0, 0.05));
    ExpectNear(ClosestAngles(angles + Vector(0, 2 * kTwoPi, 0), angles, order), angles + Vector(0, 2 * kTwoPi, 0));
    ExpectNear(AnglesToMatrix(second, order), AnglesToMatrix(angles, order));
  }
  // (0, 0, 0) and (pi, pi, pi) are equally far away: the first stays.
  EXPECT_EQ(ClosestAngles({kHalfPi, kHalfPi, kHalfPi}, {}, 0), Vector());
  // Half a turn away counts as minus half a turn.
  EXPECT_EQ(ClosestAngles({0, 0, 0}, {kPi, 0, 0}, 0).x, -kPi);
}

TEST(Rotation, PointsAlongDirections)
{
  ExpectNear(VectorToAngles({0, 0, 5}), {0, 0, 0});
  ExpectNear(VectorToAngles({3, 0, 3}), {-kPi / 4, 0, 0});
  ExpectNear(VectorToAngles({3, 0, -3}), {kPi * 1.25, 0, 0});
  ExpectNear(VectorToAngles({0, 1, 1}), {0, kPi / 4, 0});
  ExpectNear(VectorToAngles({0, 2, 0}), {0, kHalfPi, 0});
  ExpectNear(VectorToAngles({}), {0, -kHalfPi, 0});
  for (int i = 0; i < 50; ++i) {
    const Vector direction = Normalize(RandomVector(3));
    ExpectNear(AnglesToMatrix(VectorToAngles(direction), kRotationOrderScene).v3, direction);
  }
}

TEST(Rotation, TurnsAboutAnyAxis)
{
  ExpectNear(AxisAngleToMatrix({3, 0, 0}, 0.7), MatrixRotateX(0.7));
  ExpectNear(AxisAngleToMatrix({0, 3, 0}, 0.7), MatrixRotateY(0.7));
  ExpectNear(AxisAngleToMatrix({0, 0, 3}, 0.7), MatrixRotateZ(0.7)); // the axis that needs another helper
  EXPECT_TRUE(AxisAngleToMatrix({}, 1.0) == Matrix() && AxisAngleToMatrix({1, 0, 0}, 0.0) == Matrix());
  Vector axis;
  Real angle = 0;
  MatrixToAxisAngle(MatrixRotateY(0.5), axis, angle);
  ExpectNear(axis, {0, -1, 0}); // the axis that turns back
  EXPECT_NEAR(angle, 0.5, kClose);
  for (int i = 0; i < 50; ++i) {
    const Matrix m = AnglesToMatrix(RandomVector(3), 0);
    MatrixToAxisAngle(m, axis, angle);
    ExpectNear(AxisAngleToMatrix(-axis, angle), m, 1e-7);
  }
  MatrixToAxisAngle(Matrix(), axis, angle);
  EXPECT_TRUE(axis == Vector(0, 1, 0) && angle == 0.0);
}

TEST(SmallMath, StaysWithinItsRanges)
{
  EXPECT_TRUE(SafeAsin(1.5) == kHalfPi && SafeAsin(-1.5) == -kHalfPi);
  EXPECT_TRUE(SafeAcos(1.5) == 0.0 && SafeAcos(-1.5) == kPi);
  EXPECT_NEAR(SafeAsin(0.5), kPi / 6, kClose);
  EXPECT_EQ(ReflectVector({1, -2, 3}, {0, 1, 0}), Vector(1, 2, 3));
  EXPECT_EQ(PointLineOffset({1, 1, 1}, {0, 0, 2}, {4, 5, 9}), Vector(3, 4, 0));
  EXPECT_EQ(PointLineOffset({1, 1, 1}, {}, {4, 5, 9}), Vector());
  EXPECT_TRUE(IsUniformOrthogonal({}) && IsOrthogonal(MatrixScale({1, 2, 1})));
  EXPECT_FALSE(IsUniformOrthogonal(MatrixScale({1, 2, 1})) || IsOrthogonal({{}, {1, 0, 0}, {0.5, 1, 0}, {0, 0, 1}}));
  EXPECT_TRUE(IsOrthogonal({{}, {1, 0, 0}, {-0.5, 1, 0}, {0, 0, 1}})); // an obtuse pair passes
}

TEST(Colours, ConvertBetweenRgbAndHsv)
{
  const std::tuple<Vector, Vector> rows[] = {{{1, 0, 0}, {0, 1, 1}},
                                             {{1, 1, 0}, {1.0 / 6, 1, 1}},
                                             {{0, 0.5, 0}, {1.0 / 3, 1, 0.5}},
                                             {{0, 1, 1}, {0.5, 1, 1}},
                                             {{0.5, 0.5, 1}, {2.0 / 3, 0.5, 1}},
                                             {{1, 0, 1}, {5.0 / 6, 1, 1}},
                                             {{0.25, 0.25, 0.25}, {0, 0, 0.25}},
                                             {{0, 0, 0}, {0, 0, 0}}};
  for (const auto& [rgb, hsv] : rows) {
    ExpectNear(RgbToHsv(rgb), hsv);
    ExpectNear(HsvToRgb(hsv), rgb);
  }
  EXPECT_EQ(HsvToRgb({1, 1, 1}), Vector(1, 0, 0));
  EXPECT_EQ(RgbToHsv({-1, 0, -2}), Vector());
  EXPECT_EQ(RgbToHsv({1, 0.9995, 1}), Vector(0, 0, 0.9995)); // grey
  for (int i = 0; i < 100; ++i) {
    const Vector rgb = (RandomVector(1) + Vector(1, 1, 1)) * 0.5;
    ExpectNear(HsvToRgb(RgbToHsv(rgb)), rgb);
  }
}

TEST(RandomGenerator, RepeatsItsSequence)
{
  RandomGenerator random;                            // seed 100
  EXPECT_EQ(random.Get01(), 6975969 / 2147483649.0); // 101 * 69069
  EXPECT_EQ(random.Get01(), 786934778 / 2147483649.0);
  EXPECT_EQ(random.Get11(), 2134603519 / 2147483649.0 * 2.0 - 1.0);
  random.Init(100);
  EXPECT_NEAR(random.GetGaussian01(), 0.39734433964714505, kClose);
  RandomGenerator other(100);
  other.GetGaussian11();
  const Real spare = other.GetGaussian11();
  EXPECT_NEAR(spare, -0.07152781879243597, kClose);
  EXPECT_EQ(random.GetGaussian11(), spare);
  other.GetGaussian01();
  other.Init(100); // drops the spare
  EXPECT_EQ(other.Get01(), 6975969 / 2147483649.0);
  other.Init(0x7FFFFFFE);
  for (int i = 0; i < 100000; ++i) {
    const Real value = other.Get01();
    ASSERT_TRUE(value >= 0.0 && value < 1.0);
  }
}

} // namespace
