#include "support/library.h"

namespace
{

CKey* Add(CCurve& curve, Real seconds, Real value, Long interpolation = kInterpolationSpline)
{
  CKey* key = curve.AddKey(BaseTime(seconds));
  if (key) {
    key->SetValue(&curve, value);
    key->SetInterpolation(&curve, interpolation);
  }
  return key;
}

// "0:1 0.5:2" for the keys at 0 and 0.5 s.
std::string Keys(const CCurve& curve)
{
  std::ostringstream keys;
  for (Long i = 0; i < curve.GetKeyCount(); ++i)
    keys << (i ? " " : "") << curve.GetKey(i)->GetTime().Get() << ':' << curve.GetKey(i)->GetValue();
  return keys.str();
}

TEST(Curve, TakesKeysWithinTenThousandSeconds)
{
  CCurve curve;
  const std::pair<BaseTime, Long> cases[] = {{{0, 1}, 0},           {{10000, 1}, 1},         {{10000001, 1000}, -1},
                                             {{-10000, 1}, 0},      {{-10000001, 1000}, -1}, {{1, 2}, 2},
                                             {{20000001, 2000}, -1}};
  for (const auto& [time, wanted] : cases) { // -1: refused
    Long index = 99;
    EXPECT_EQ(curve.AddKey(time, &index) != nullptr, wanted >= 0) << time.Get();
    EXPECT_EQ(index, wanted) << time.Get();
  }
  EXPECT_EQ(Keys(curve), "-10000:0 0:0 0.5:0 10000:0");
}

TEST(Curve, AKeyAtATakenTimeResetsTheOneThere)
{
  CCurve curve;
  CKey* first = Add(curve, 1, 5, kInterpolationStep);
  Add(curve, 2, 6);
  Long index = -1;
  EXPECT_EQ(curve.AddKey(BaseTime(4, 4), &index), first); // the same time in other numbers
  EXPECT_EQ(index, 0);
  EXPECT_EQ(first->GetInterpolation(), kInterpolationSpline);
  EXPECT_EQ(Keys(curve), "1:0 2:6");
  CKey own;
  own.SetTime(BaseTime(2, 1));
  EXPECT_EQ(curve.InsertKey(&own), curve.GetKey(1)); // `own` stays the caller's
}

TEST(Curve, FindsTheKeyAtBeforeAndBehindATime)
{
  CCurve curve;
  for (Real time : {1.0, 2.0, 4.0})
    Add(curve, time, 0);
  // behind: indices
  for (const auto& [time, exact, before, behind] : {std::tuple<Real, Long, Long, Long>{0.5, -1, -1, 0},
                                                    {1, 0, 0, 0},
                                                    {1.5, -1, 0, 1},
                                                    {2, 1, 1, 1},
                                                    {3, -1, 1, 2},
                                                    {4, 2, 2, 2},
                                                    {5, -1, 2, -1}}) {
    const std::pair<Long, Long> modes[] = {{kFindExact, exact}, {kFindBefore, before}, {kFindAfter, behind}};
    for (auto [mode, expected] : modes) {
      Long index = 99;
      EXPECT_EQ(curve.FindKey(BaseTime(time), &index, mode), curve.GetKey(expected)) << time << " " << mode;
      EXPECT_EQ(index, expected) << time << " " << mode;
    }
  }
}

// The index and the list that owns the keys stay in step: the file is written from the list.
TEST(Curve, AnyOrderOfInsertionsAndDeletionsKeepsTheOrderOfTime)
{
  std::mt19937 random(7);
  std::map<Long, Real> model;
  CCurve curve;
  for (Long step = 0; step < 2000; ++step) {
    const Long time = static_cast<Long>(random() % 300);
    if (random() % 3) {
      curve.AddKey(BaseTime(time, 30))->SetValue(&curve, step);
      model[time] = step;
    } else if (!model.empty()) {
      auto victim = model.lower_bound(time);
      if (victim == model.end())
        --victim;
      EXPECT_TRUE(curve.DelKey(static_cast<Long>(std::distance(model.begin(), victim))));
      model.erase(victim);
    }
  }
  EXPECT_FALSE(curve.DelKey(-1) || curve.DelKey(curve.GetKeyCount()));
  CCurve read;
  ASSERT_TRUE(ReadInto(read, BytesOf(curve)));
  for (const CCurve* c : {&curve, &read}) {
    ASSERT_EQ(c->GetKeyCount(), static_cast<Long>(model.size()));
    Long index = 0;
    for (auto [time, value] : model) {
      const CKey* key = c->GetKey(index++);
      EXPECT_TRUE(key->GetTime() == BaseTime(time, 30) && key->GetValue() == value) << index;
    }
  }
}

TEST(Curve, AKeyThatGetsAnotherTimeMovesToItsPlace)
{
  CCurve curve;
  for (Long time : {1, 2, 3})
    curve.AddKey(BaseTime(time, 1))->SetValue(&curve, time);
  auto values = [&] {
    std::vector<Real> all;
    for (Long i = 0; i < curve.GetKeyCount(); ++i)
      all.push_back(curve.GetKey(i)->GetValue());
    return all;
  };
  CKey* key = curve.GetKey(0);
  ASSERT_TRUE(key->SetParameterById(kKeyTime, GeData(BaseTime(5, 2))));
  EXPECT_EQ(values(), (std::vector<Real>{2, 1, 3}));
  EXPECT_EQ(key->GetNext(), curve.GetKey(2));
  EXPECT_TRUE(key->SetTime(BaseTime(9, 1)));
  EXPECT_EQ(values(), (std::vector<Real>{2, 3, 1}));
  EXPECT_TRUE(!key->SetTime(BaseTime(10001, 1)) && key->GetTime() == BaseTime(9, 1));
  EXPECT_TRUE(curve.GetKey(1)->CopyWithTranslation(*curve.GetKey(0), 0, nullptr)); // brings its time along
  EXPECT_EQ(values(), (std::vector<Real>{3, 3, 1}));
  key->RemoveFromList();
  EXPECT_TRUE(!key->GetCurve() && curve.GetKeyCount() == 2);
  DeleteObj(key);
  key = curve.GetKey(1);
  DeleteObj(key);
  EXPECT_EQ(values(), (std::vector<Real>{3}));
}

TEST(Curve, WritesNothingForNoKeys)
{
  CCurve curve;
  EXPECT_EQ(ToHex(WithoutMarkers(BytesOf(curve))), ToHex(Record("$Node")));
  Add(curve, 2, 7);
  EXPECT_TRUE(curve.DelKey(0));
  EXPECT_EQ(ToHex(WithoutMarkers(BytesOf(curve))), ToHex(Record("$Node")));
}

TEST(Curve, ReadsWhatStandsInItsChunk)
{
  CCurve curve;
  Add(curve, 9, 9);
  EXPECT_TRUE(ReadInto(curve, Record("[110419,0 [110100,0 ] ]")));
  EXPECT_EQ(curve.GetKeyCount(), 0);
  EXPECT_TRUE(ReadInto(curve, Record("[110419,0 ]"))); // an empty chunk

  // A key too late for the curve is not one of its keys, but is written back.
  const Bytes late = Record("$Node [110419,0 [110100,0 [5352,0 $Node [110416,0 T1 T T R5 R R L1 L ] ] "
                            "[5352,0 $Node [110416,0 T10001 T T R7 R R L1 L ] ] ] ]");
  EXPECT_TRUE(ReadInto(curve, late));
  EXPECT_EQ(Keys(curve), "1:5");
  EXPECT_EQ(ToHex(WithoutMarkers(BytesOf(curve))), ToHex(late));

  MemoryReadFile memory(WithHeader(Record("L1 ]")));
  EXPECT_FALSE(curve.ReadChunk(memory.file, 110419, 0));
  EXPECT_EQ(memory.file.GetError(), FILEERROR_WRONG_VALUE);
}

TEST(Curve, EveryFailedAllocationLeavesACurveThatWorks)
{
  EveryFailedAllocation(
      [] {
        std::unique_ptr<CCurve> curve(NewObj<CCurve>());
        for (Long i = 0; curve && i < 40; ++i) {
          if (!Add(*curve, i, i))
            curve.reset();
        }
        return curve;
      },
      [](const auto& curve) { return Keys(*curve); });
}

TEST(CurveValue, FollowsTheInterpolationOfTheKeyBefore)
{
  CCurve curve;
  EXPECT_EQ(curve.GetValue(1.0), 0.0);
  Add(curve, 0, 1, kInterpolationLinear);
  Add(curve, 2, 5, kInterpolationStep);
  Add(curve, 4, 9, kInterpolationSpline); // without tangents
  Add(curve, 6, 7, kInterpolationStep);
  const std::pair<Real, Real> values[] = {{-1, 1}, {0, 1}, {0.5, 2}, {2, 5}, {3.999, 5},
                                          {4, 9},  {5, 8}, {6, 7},   {7, 7}};
  for (auto [time, value] : values)
    EXPECT_NEAR(curve.GetValue(time), value, 1e-12) << time;
  EXPECT_EQ(curve.GetValue(BaseTime(1, 2)), 2.0);
}

TEST(CurveValue, SolvesTheSplineForTheTime)
{
  struct Tangent
  {
    Real time, value;
  };
  // left: of the keys (0, 0) and (2, 1), which the curve runs between
  const std::tuple<const char*, Tangent, Tangent, Real, Real> cases[] = {
      // Thirds of the interval: time runs evenly, and the value is 3u^2 - 2u^3.
      {"flat thirds", {2.0 / 3, 0}, {-2.0 / 3, 0}, 0.5, 0.15625},
      // Time 2(1 - (1-s)^3) reaches 1.75 at s = 1/2; the value there is (3 * 0.5 + 3 * 1 + 1) / 8.
      {"a tangent twice as long as the interval is halved", {4, 1}, {0, 0}, 1.75, 0.6875},
      {"the same from the other end", {0, 0}, {-4, -1}, 0.25, 0.3125},
      {"tangents that point away count for nothing", {-1, 5}, {1, 5}, 0.5, 0.25},
      // Time 2(3s^2 - 2s^3) is 0.3125 at s = 1/4; the value there is 1 - (3/4)^3.
      {"a tangent without time lifts the value", {0, 1}, {0, 0}, 0.3125, 37.0 / 64},
  };
  for (const auto& [what, right, left, time, value] : cases) {
    CCurve curve;
    Add(curve, 0, 0)->SetRight(BaseTime::Raw(right.time, 1), right.value);
    Add(curve, 2, 1)->SetLeft(BaseTime::Raw(left.time, 1), left.value);
    EXPECT_NEAR(curve.GetValue(time), value, 1e-9) << what;
  }
}

TEST(CurveTangents, WeighTheStepsByOneSpan)
{
  CCurve curve;
  for (const auto& [time, value] : {std::pair<Real, Real>{0.3, 0}, {2.0, 1}, {2.6, 3}})
    Add(curve, time, value)->ChangeNBit(46, 1);
  EXPECT_EQ(curve.GetTangents(1).rightValue, 0.4347826086956521); // with the sum of both steps: ...522
}

TEST(CurveTangents, FollowTheBitsOfTheKey)
{
  constexpr ULong kAuto = 0x4000, kClamp = 0x200, kFlat = 0x10000, kNone = 0x20000;
  struct Case
  {
    const char* what;
    Real values[3]; // at 0, 1 and 3 s
    Long index;
    ULong bits;
    KeyTangents expected;
  };
  // Stored tangents: (-0.5, -2) and (0.25, 3). Automatic ones of the middle key: the weight is 1/3, so the step is
  // 2/3 + 2/3 s and for 0, 4, 6 a value of 2/3 + 8/3; a quarter of it, in whole milliseconds, is 0.333 s and 5/6.
  const Case cases[] = {
      {"as stored", {0, 4, 6}, 1, 0, {-0.5, -2, 0.25, 3}},
      {"flat", {0, 4, 6}, 1, kFlat, {-0.5, 0, 0.25, 0}},
      {"none", {0, 4, 6}, 1, kNone, {0, 0, 0, 0}},
      {"automatic", {0, 4, 6}, 1, kAuto, {-0.333, -5.0 / 6, 0.333, 5.0 / 6}},
      {"automatic tangents aren't flattened", {0, 4, 6}, 1, kAuto | kFlat | kNone, {-0.333, -5.0 / 6, 0.333, 5.0 / 6}},
      {"automatic at the start", {0, 4, 6}, 0, kAuto, {-0.25, 0, 0.25, 0}},
      {"automatic at the end", {0, 4, 6}, 2, kAuto, {-0.5, 0, 0.5, 0}},
      {"clamped on the way up", {0, 4, 6}, 1, kAuto | kClamp, {-0.333, -5.0 / 6, 0.333, 5.0 / 6}},
      {"clamped at the top", {0, 4, 3}, 1, kAuto | kClamp, {-0.333, 0, 0.333, 0}},
      {"clamped at the bottom", {0, -4, 3}, 1, kClamp, {-0.5, 0, 0.25, 0}},
      {"clamped beside an equal value", {4, 4, 6}, 1, kAuto | kClamp, {-0.333, 0, 0.333, 0}},
      {"clamped before an almost equal value", {0, 4, 4 + 9e-7}, 1, kClamp, {-0.5, 0, 0.25, 0}},
      {"not clamped just beyond the tolerance", {0, 4, 4 + 2e-6}, 1, kClamp, {-0.5, -2, 0.25, 3}},
      {"clamped at an end", {0, 4, 6}, 2, kClamp, {-0.5, 0, 0.25, 0}},
      {"no such key", {0, 4, 6}, 3, kAuto, {0, 0, 0, 0}},
  };
  for (const Case& c : cases) {
    CCurve curve;
    for (Long i = 0; i < 3; ++i) {
      CKey* key = Add(curve, i == 2 ? 3 : i, c.values[i]);
      key->SetLeft(BaseTime(-1, 2), -2);
      key->SetRight(BaseTime(1, 4), 3);
      for (Long bit = 0; bit < 32; ++bit)
        if (c.bits >> bit & 1)
          key->ChangeNBit(32 + bit, 1);
    }
    const KeyTangents tangents = curve.GetTangents(c.index);
    EXPECT_DOUBLE_EQ(tangents.leftTime, c.expected.leftTime) << c.what;
    EXPECT_DOUBLE_EQ(tangents.leftValue, c.expected.leftValue) << c.what;
    EXPECT_DOUBLE_EQ(tangents.rightTime, c.expected.rightTime) << c.what;
    EXPECT_DOUBLE_EQ(tangents.rightValue, c.expected.rightValue) << c.what;
  }
}

} // namespace
