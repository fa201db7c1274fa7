#include "support/library.h"

namespace
{

using TrackPtr = std::unique_ptr<CTrack>;

TrackPtr PositionX(BaseList2D& node)
{
  return TrackPtr(CTrack::Alloc(&node, ParameterPath({903, 23, 0}, {1000, 19, 0}), "T"));
}

// Three empty curves stand in every file; of the six that follow only those that exist.
Bytes Expected(const std::vector<int>& extraSlots)
{
  const auto keyed = [](int seconds, int value) {
    return "[110415,0 $Node [110419,0 [110100,0 [5352,0 $Node [110416,0 T" + std::to_string(seconds) + " T T R" +
           std::to_string(value) + " R R L1 L ] ] ] ] ] ";
  };
  std::string curves = keyed(2, 7);
  for (int slot = 0; slot < 9; ++slot) {
    const bool present = std::find(extraSlots.begin(), extraSlots.end(), slot) != extraSlots.end();
    curves += slot < 3 ? "" : present ? "B1 " : "B ";
    curves += present ? keyed(slot, 0) : slot < 3 ? "[110415,0 $Node ] " : "";
  }
  return Record("[110050,7 L L K C ST L L1 L k C1 $NoMarker B ] [110069,2 L4 L262144 L L L C ] [110418,3 " + curves +
                "] [110414,2 L3 L4 k [1,2 L2 L903 L23 L L1000 L19 L ] L1 L-1 L-1 L-1 L-1 ]");
}

TEST(Track, WritesReadsAndClonesItsCurvesBySlot)
{
  // curves: number and slot: the last two are crossed
  const std::tuple<const char*, std::vector<std::pair<Long, int>>> cases[] = {{"no extra curve", {}},
                                                                              {"curves 2 and 8", {{2, 0}, {8, 6}}},
                                                                              {"curve 9 comes last", {{9, 8}}},
                                                                              {"curve 10 comes before it", {{10, 7}}}};
  for (const auto& [what, curves] : cases) {
    SCOPED_TRACE(what);
    BaseList2D node(1);
    TrackPtr track = PositionX(node);
    track->GetCurve(1, 0)->AddKey(BaseTime(2, 1))->SetValue(nullptr, 7);
    EXPECT_TRUE(track->SetParameterById(905, true));
    EXPECT_TRUE(track->SetParameterById(910, Long{3}) && track->SetParameterById(911, Long{4}));
    std::vector<int> slots;
    for (auto [number, slot] : curves) {
      EXPECT_EQ(track->GetCurve(number, 0), nullptr);
      track->GetCurve(number, 1)->AddKey(BaseTime(slot, 1));
      slots.push_back(slot);
    }
    const std::string expected = ToHex(Expected(slots));
    EXPECT_EQ(ToHex(WithoutMarkers(BytesOf(*track))), expected);
    CTrack read;
    ASSERT_TRUE(ReadInto(read, Expected(slots)));
    EXPECT_EQ(ToHex(WithoutMarkers(BytesOf(read))), expected);
    TrackPtr clone(static_cast<CTrack*>(track->MakeClone(0, nullptr)));
    ASSERT_NE(clone, nullptr);
    EXPECT_EQ(ToHex(WithoutMarkers(BytesOf(*clone))), expected);
    for (auto [number, slot] : curves)
      EXPECT_EQ(read.GetCurve(number, 0)->GetKey(0)->GetTime(), BaseTime(slot, 1)) << number;
  }
}

TEST(Track, RefusesAnythingButACurveInACurvesPlace)
{
  MemoryReadFile memory(WithHeader(Record("[110416,0 ] ]")));
  CTrack track;
  EXPECT_FALSE(track.ReadChunk(memory.file, 110418, 3));
  EXPECT_EQ(memory.file.GetError(), FILEERROR_WRONG_VALUE);
}

TEST(Track, TakesItsKindFromThePath)
{
  const ParameterPath component({903, 23, 0}, {1000, 19, 0});
  const std::tuple<const char*, Long, ParameterPath, Long, const char*, ParameterPath> cases[] = {
      {"a component", 1, component, kTrackValue, "N", component},
      {"a number over 10 of any type", 1, ParameterPath({11, 133, 0}), kTrackValue, "N", ParameterPath({11, 133, 0})},
      {"a Real up to 10", 1, ParameterPath({10, 19, 0}), kTrackValue, "N", ParameterPath({10, 19, 0})},
      {"another type up to 10", 1, ParameterPath({10, 15, 0}), kTrackData, "N", ParameterPath({10, 15, 0})},
      {"a Real at the end of a path", 1, ParameterPath({9, 23, 0}, {5, 19, 0}), kTrackValue, "N",
       ParameterPath({9, 23, 0}, {5, 19, 0})},
      {"time", 1, ParameterPath(-1), kTrackValue, "Time Track", ParameterPath({-1, 19, 0})},
      {"a plug-in's node", 5353, ParameterPath(-1), kTrackPlugin, "N", ParameterPath(-1)},
  };
  for (const auto& [what, nodeType, path, kind, name, kept] : cases) {
    BaseList2D node(nodeType);
    TrackPtr track(CTrack::Alloc(&node, path, "N"));
    ASSERT_NE(track, nullptr) << what;
    EXPECT_EQ(track->GetKind(), kind) << what;
    EXPECT_EQ(Utf8(track->GetName()), name) << what;
    EXPECT_TRUE(track->GetPath().IsExactly(kept)) << what;
  }
  BaseList2D node(1);
  EXPECT_EQ(CTrack::Alloc(nullptr, component, "N"), nullptr);
  EXPECT_EQ(CTrack::Alloc(&node, ParameterPath(), "N"), nullptr);
}

TEST(Track, OtherCurveNumbersGiveTheMainCurve)
{
  CTrack track;
  CCurve* main = track.GetCurve(1, 0);
  ASSERT_NE(main, nullptr);
  for (Long number : {-1, 0, 11, 1000})
    EXPECT_EQ(track.GetCurve(number, 1), main) << number;
}

TEST(Track, FlagsAndLinkAreParameters)
{
  BaseObject target(5140);
  CTrack track;
  for (bool on : {false, true}) {
    EXPECT_TRUE(track.SetParameterById(904, on) && track.SetParameterById(905, on));
    EXPECT_EQ(track.GetNBit(-1), on ? 0x40000u : 0x20000u); // the first one is stored the other way round
    for (Long id : {904, 905})
      EXPECT_EQ(ParameterOf(track, id).GetBool(), on) << id;
  }
  GeAliasLink link;
  link.SetLink(&target);
  EXPECT_TRUE(track.SetParameterById(909, GeData(link)));
  EXPECT_EQ(ParameterOf(track, 909).GetLink(), &target);
}

} // namespace
