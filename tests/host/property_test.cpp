// The value of a stream at a time.
#include "stage.h"

#include "host/model/timing.h"

#include <cmath>
#include <tuple>

namespace
{

using host::Value;
using stage::ExpectNear;
using stage::Stage;

// A solid with this position, which the host is asked for.
Stage WithPosition(const std::string& position)
{
  return Stage(R"({"ty": 1, "ddd": 1, "ks": {"p": )" + position + "}}");
}

Value PositionAt(const Stage& stage, double frame)
{
  // At 25 frames a second; a scale of 25000 gives thousandths of a frame.
  return stage.ValueAt(0, AEGP_LayerStream_POSITION, {static_cast<A_long>(std::lround(frame * 1000)), 25000});
}

TEST(PropertyValue, FollowsTheKindOfTheInterval)
{
  const char* const linear = R"({"k": [{"t": 10, "s": [0, 10, 20]}, {"t": 20, "s": [100, 10, -20]}]})";
  const char* const hold = R"({"k": [{"t": 0, "s": [1, 2, 3], "h": 1}, {"t": 10, "s": [4, 5, 6]}]})";
  const char* const old = R"({"k": [{"t": 0, "s": [1, 2], "e": [5, 6]}, {"t": 8, "e": [7, 6]}, {"t": 16}]})";
  // x(u) = 1.5 u (1 - u) + u^3, y(u) = 3 u^2 - 2 u^3: u = 1/4 lies at x = 19/64 and y = 10/64
  const char* const eased = R"({"k": [{"t": 0, "s": [0, 64, 1], "o": {"x": 0.5, "y": 0}, "i": {"x": [0.5], "y": [1]}},
                                      {"t": 64, "s": [64, 0, 1]}]})";
  // component 1 has its own, straight, curve; component 2 takes the first's
  const char* const apart = R"({"k": [{"t": 0, "s": [0, 0, 0], "o": {"x": [0.5, 0.2], "y": [0, 0.2]},
                                       "i": {"x": [0.5, 0.7], "y": [1, 0.7]}}, {"t": 64, "s": [64, 64, 64]}]})";
  const char* const outOnly = R"({"k": [{"t": 0, "s": [0], "o": {"x": 0.9, "y": 0}}, {"t": 10, "s": [10]}]})";
  const char* const split = R"({"s": true, "x": {"k": [{"t": 0, "s": [0]}, {"t": 4, "s": [8]}]}, "y": {"k": 7},
                                "z": {"k": [{"t": 0, "s": 1, "h": 1}, {"t": 2, "s": 9}]}})";
  const std::tuple<const char*, double, Value> cases[] = {
      {R"({"k": [7, 8, 9]})", 3, {7, 8, 9}},
      {R"({"k": [7]})", 3, {7, 0, 0}},
      {R"({"k": 7})", 3, {7, 0, 0}},
      {R"({"k": [7, 8, 9, 10, 11]})", 3, {7, 8, 9}},
      {linear, 0, {0, 10, 20}},
      {linear, 10, {0, 10, 20}},
      {linear, 12.5, {25, 10, 10}},
      {linear, 20, {100, 10, -20}},
      {linear, 400, {100, 10, -20}},
      {hold, 9.999, {1, 2, 3}},
      {hold, 10, {4, 5, 6}},
      {old, 4, {3, 4, 0}},
      {old, 12, {6, 6, 0}},
      {old, 16, {7, 6, 0}},
      {eased, 19, {10, 54, 1}},
      {eased, 32, {32, 32, 1}},
      {apart, 19, {10, 19, 10}},
      {outOnly, 3, {3, 0, 0}},
      {split, 1, {2, 7, 1}},
      {split, 3, {6, 7, 9}},
      {R"({"s": true, "y": {"k": 5}})", 0, {0, 5, 0}},
  };
  for (const auto& [position, frame, expected] : cases) {
    SCOPED_TRACE(std::string(position) + " at " + std::to_string(frame));
    ExpectNear(expected, PositionAt(WithPosition(position), frame), 1e-9);
  }
}

TEST(PropertyValue, SolvesTheEasingForItsAbscissa)
{
  // The curve is run through by its parameter, so that no equation is solved here.
  const host::Easing easings[] = {{0.167, 0.167, 0.833, 0.833},
                                  {0.9, 0, 0.1, 1},
                                  {0, 0, 1, 1},
                                  {0.999, 0, 0.999, 1},
                                  {0, 1, 0, 1},
                                  {1, 0, 0, 1},
                                  {0.3, -2, 0.7, 3}};
  for (const host::Easing& e : easings)
    for (double u = 0.03; u < 1; u += 0.097) {
      const double a = 3 * (1 - u) * (1 - u) * u, b = 3 * (1 - u) * u * u, c = u * u * u;
      EXPECT_NEAR(a * e.y1 + b * e.y2 + c, host::Ease(e, a * e.x1 + b * e.x2 + c), 1e-9) << e.x1 << ' ' << u;
    }
}

// Arc length by many short chords, from the formula of the curve alone.
struct Chords
{
  Chords(const Value (&p)[4], int count)
  {
    points.push_back(p[0]);
    lengths.push_back(0);
    for (int i = 1; i <= count; ++i) {
      const double u = double(i) / count, v = 1 - u;
      Value point{};
      for (std::size_t c = 0; c < 3; ++c)
        point[c] = v * v * v * p[0][c] + 3 * v * v * u * p[1][c] + 3 * v * u * u * p[2][c] + u * u * u * p[3][c];
      const Value& last = points.back();
      lengths.push_back(lengths.back() + std::hypot(point[0] - last[0], point[1] - last[1], point[2] - last[2]));
      points.push_back(point);
    }
  }

  std::vector<Value> points;
  std::vector<double> lengths;
};

TEST(PropertyValue, WalksAPathByItsArcLength)
{
  const Value paths[][4] = {
      {{0, 0, 0}, {100, 0, 0}, {100, 100, 50}, {0, 100, 80}},
      {{0, 0, 0}, {300, 300, 0}, {0, 300, 0}, {300, 0, 0}},  // with a cusp
      {{0, 0, 0}, {1000, 1, 0}, {-900, -1, 0}, {100, 0, 0}}, // nearly folded on itself
      {{5, 5, 5}, {5, 5, 5}, {5, 5, 400}, {5, 5, 400}},      // straight, at rest at both ends
      {{0, 0, 0}, {1, 1e5, 0}, {2, -1e5, 0}, {1e-3, 0, 0}},
  };
  for (const auto& p : paths) {
    const Chords chords(p, 100000);
    const host::BezierPath path(p[0], p[1], p[2], p[3]);
    const double length = chords.lengths.back();
    EXPECT_NEAR(length, path.Length(), 1e-6 * length);
    for (std::size_t i = 0; i < chords.points.size(); i += 4321) {
      SCOPED_TRACE(i);
      ExpectNear(chords.points[i], path.At(chords.lengths[i] / length), 2e-6 * length);
    }
  }
}

TEST(PropertyValue, MeetsTheClosedFormOnAParabola)
{
  // y = x^2 from 0 to 1; the length up to x is (2x sqrt(1 + 4x^2) + asinh 2x) / 4
  const host::BezierPath path({0, 0, 0}, {1.0 / 3, 0, 0}, {2.0 / 3, 1.0 / 3, 0}, {1, 1, 0});
  const auto length = [](double x) { return (2 * x * std::sqrt(1 + 4 * x * x) + std::asinh(2 * x)) / 4; };
  EXPECT_NEAR(1.4789428575445975, path.Length(), 1e-6);
  for (double x : {0.0, 0.2, 0.5, 0.9, 1.0})
    ExpectNear({x, x * x, 0}, path.At(length(x) / length(1)), 1e-6);
}

TEST(PropertyValue, LeavesAPathStraightBeyondItsEnds)
{
  // y(u) at x = u, since x1 = 1/3 and x2 = 2/3: -0.28 for u = 0.2 and 1.28 for u = 0.8 with y1 = -1, y2 = 2
  const std::string easing = R"("o": {"x": 0.333333333333333333, "y": -1}, "i": {"x": 0.666666666666666667, "y": 2})";
  const Stage bent = WithPosition(R"({"k": [{"t": 0, "s": [0, 0], "to": [100, 0], "ti": [0, -100], )" + easing +
                                  R"(}, {"t": 10, "s": [100, 100]}]})");
  const Value p[4] = {{0, 0, 0}, {100, 0, 0}, {100, 0, 0}, {100, 100, 0}};
  const double length = Chords(p, 100000).lengths.back();
  const auto y = [](double u) { return 3 * (1 - u) * (1 - u) * u * -1 + 3 * (1 - u) * u * u * 2 + u * u * u; };
  ExpectNear({y(0.2) * length, 0, 0}, PositionAt(bent, 2), 1e-3);
  ExpectNear({100, 100 + (y(0.8) - 1) * length, 0}, PositionAt(bent, 8), 1e-3);
  EXPECT_LT(y(0.2), 0);
  EXPECT_GT(y(0.8), 1);
  // A handle without length leaves its direction to the next point: here along the straight line.
  const Stage line = WithPosition(R"({"k": [{"t": 0, "s": [0, 0], "to": [250, 0], "ti": [0, 0], )" + easing +
                                  R"(}, {"t": 10, "s": [300, 0]}]})");
  ExpectNear({300 * y(0.8), 0, 0}, PositionAt(line, 8), 1e-3);
  // Along a straight way arc length is plain distance, whatever the handles.
  const Stage plain =
      WithPosition(R"({"k": [{"t": 0, "s": [0, 0], "to": [250, 0], "ti": [-10, 0]}, {"t": 4, "s": [300, 0]}]})");
  ExpectNear({75, 0, 0}, PositionAt(plain, 1), 3e-4);
  // A path without length stays at its start.
  ExpectNear({4, 4, 0}, host::BezierPath({4, 4, 0}, {4, 4, 0}, {4, 4, 0}, {4, 4, 0}).At(0.7), 0);
}

TEST(PropertyValue, ComesFromSamplesWhenThereAreSome)
{
  const Stage stage =
      WithPosition(R"({"k": [1, 2, 3], "x": "time * 30", "samples": [[0, 0, 0], [10, 1], [20, 2, 5]]})");
  ExpectNear({0, 0, 0}, PositionAt(stage, -3), 0);
  ExpectNear({10, 1, 0}, PositionAt(stage, 1.4), 0);
  ExpectNear({20, 2, 5}, PositionAt(stage, 1.6), 0);
  ExpectNear({20, 2, 5}, PositionAt(stage, 90), 0);
  ExpectNear({1, 2, 3}, stage.ValueAt(0, AEGP_LayerStream_POSITION, {1, 25}, 1), 0); // before the expression
  EXPECT_TRUE(stage.host.GetProject().warnings.empty());
}

TEST(PropertyValue, IsFoundInAnyOrderOfFrames)
{
  std::string keys;
  for (int i = 0; i < 200; ++i)
    keys += (i ? "," : "") + std::string(R"({"t": )") + std::to_string(i * 2) + R"(, "s": [)" +
            std::to_string(i % 2 ? 10 : i) + "]}";
  const Stage stage = WithPosition(R"({"k": [)" + keys + "]}");
  for (int frame : {0, 1, 2, 397, 398, 5, 4, 3, 200, 7, 399}) {
    const int half = frame / 2;
    EXPECT_EQ(frame > 398 ? 10
              : frame % 2 ? (half % 2 ? (10 + half + 1) / 2.0 : (half + 10) / 2.0)
              : frame % 4 ? 10
                          : half,
              PositionAt(stage, frame)[0])
        << frame;
  }
}

TEST(PropertyState, CountsKeysAndTellsWhatVaries)
{
  const std::tuple<const char*, A_long, bool, bool> cases[] = {
      {R"({"k": [1, 2, 3]})", 0, false, false},
      {R"({"k": [{"t": 0, "s": [1, 2]}]})", 1, false, false},
      {R"({"k": [{"t": 0, "s": [1]}, {"t": 9, "s": [1]}]})", 2, true, false},
      {R"({"k": 1, "x": ""})", 0, false, false},
      {R"({"k": 1, "x": "time"})", 0, false, true},
      {R"({"k": 1, "x": "time", "samples": [1]})", 0, false, true},
      {R"({"k": 1, "x": "time", "samples": [1, 2]})", 0, true, true},
      {R"({"s": true, "x": {"k": 1}, "y": {"k": [{"t": 0, "s": 1}, {"t": 1, "s": 1}]}, "z": {"k": 0, "x": "t"}})", 2,
       true, true},
  };
  for (const auto& [position, keys, varies, hasExpression] : cases) {
    SCOPED_TRACE(position);
    const Stage stage = WithPosition(position);
    const AEGP_StreamRefH stream = stage.Stream(0, AEGP_LayerStream_POSITION);
    EXPECT_EQ(keys, stage::Answer(stage.keyframes->AEGP_GetStreamNumKFs, stream));
    EXPECT_EQ(varies, stage::Answer(stage.streams->AEGP_IsStreamTimevarying, stream));
    EXPECT_EQ(hasExpression, stage::Answer(stage.streams->AEGP_GetExpressionState, 0, stream));
  }
}

TEST(FrameOfATime, IsExactForWholeFrames)
{
  const A_Time television{1001, 30000};
  for (A_long frame : {-7, 0, 1, 29, 12345, 2000000})
    EXPECT_EQ(frame, host::FrameAt({frame * 1001, 30000}, television));
  EXPECT_EQ(0.5, host::FrameAt({1, 50}, {1, 25}));
  EXPECT_EQ(-0.5, host::FrameAt({-1, 50}, {1, 25}));
  EXPECT_EQ(1, host::FrameAt({2147483646, 2147483647}, {1, 1})); // 0.5e-9 off
  EXPECT_NE(1, host::FrameAt({2147483640, 2147483647}, {1, 1})); // 3.3e-9 off
}

} // namespace
