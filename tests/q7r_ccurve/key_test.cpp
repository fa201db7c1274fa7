#include "support/library.h"

namespace
{

// A key whose every field differs from its default and from every other field.
void Fill(CKey& key)
{
  key.SetTime(BaseTime(3, 2));
  key.SetLeft(BaseTime(-1, 4), -5);
  key.SetRight(BaseTime(1, 8), 6);
  key.SetValue(nullptr, 1.5);
  key.SetInterpolation(nullptr, kInterpolationStep);
  key.SetGeData(nullptr, Long{7});
}

TEST(Key, PassesOverAChunkBelowItsLevels)
{
  CKey key, fresh;
  EXPECT_TRUE(ReadInto(key, Record("[110416,-1 T3 T1 T1 R1 R2 R3 L3 L15 L7 ]")) && key.IsEqual(fresh));
}

TEST(Key, ParametersReachFieldsAndBits)
{
  CKey key;
  Fill(key);
  GeData value;
  const std::pair<Long, BaseTime> times[] = {{901, {3, 2}}, {911, {-1, 4}}, {912, {1, 8}}};
  for (const auto& [id, time] : times) {
    EXPECT_EQ(ParameterOf(key, id).GetTime(), time) << id;
    EXPECT_TRUE(key.SetParameterById(id, BaseTime(id, 1)));
  }
  EXPECT_TRUE(key.SetParameterById(913, 13.0) && key.SetParameterById(914, 14.0));
  EXPECT_TRUE(key.SetParameterById(924, Long{2}));
  EXPECT_TRUE(key.GetTime() == BaseTime(901, 1) && key.GetLeftTime() == BaseTime(911, 1));
  EXPECT_TRUE(key.GetRightTime() == BaseTime(912, 1) && key.GetLeftValue() == 13.0);
  EXPECT_TRUE(key.GetRightValue() == 14.0 && key.GetInterpolation() == kInterpolationLinear);
  EXPECT_FALSE(key.GetParameterById(910, value) && value.GetRawType() != kDataNil);

  const std::pair<Long, ULong> switches[] = {{902, 0x100},  {915, 0x400},   {917, 0x1000},   {918, 0x2000},
                                             {919, 0x4000}, {921, 0x10000}, {922, 0x20000},  {923, 0x200},
                                             {925, 0x40},   {926, 0x80},    {1234, 0x400000}};
  for (auto [id, mask] : switches) {
    for (bool on : {true, false}) {
      EXPECT_TRUE(key.SetParameterById(id, on));
      EXPECT_EQ(key.GetNBit(-2), on ? mask : 0u) << id;
      EXPECT_EQ(ParameterOf(key, id).GetBool(), on) << id;
    }
  }
}

TEST(Key, EqualityLooksAtEveryFieldAndResetLeavesTheTime)
{
  const std::function<void(CKey&)> changes[] = {
      [](CKey& key) { key.SetTime(BaseTime(9, 1)); },
      [](CKey& key) { key.SetValue(nullptr, 9); },
      [](CKey& key) { key.SetLeft(BaseTime(9, 1), -5); },
      [](CKey& key) { key.SetLeft(BaseTime(-1, 4), 9); },
      [](CKey& key) { key.SetRight(BaseTime(9, 1), 6); },
      [](CKey& key) { key.SetRight(BaseTime(1, 8), 9); },
      [](CKey& key) { key.SetInterpolation(nullptr, kInterpolationLinear); },
      [](CKey& key) { key.SetGeData(nullptr, Long{9}); },
  };
  CKey key;
  Fill(key);
  key.SetGeData(nullptr, 7.0);
  EXPECT_EQ(key.GetGeData().GetRawType(), kDataReal); // the same number of another type is stored
  for (const auto& change : changes) {
    CKey other;
    Fill(other);
    EXPECT_TRUE(key.IsEqual(other));
    change(other);
    EXPECT_FALSE(key.IsEqual(other)) << &change - changes;
  }
  CKey fresh;
  fresh.SetTime(key.GetTime());
  key.Reset();
  EXPECT_TRUE(key.IsEqual(fresh));
}

} // namespace
