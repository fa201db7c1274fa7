#include <memory>

#include <gtest/gtest.h>

#include "animation_bytes.h"
#include "support/counting_memory.h"
#include "support/text.h"
#include "torvane/animation/ctrack.h"
#include "torvane/bytes/file_errors.h"
#include "torvane/objects/base_object.h"

namespace
{

using namespace animation_test;
using namespace _torvane_;

using TrackPtr = std::unique_ptr<CTrack>;

TrackPtr PositionX(BaseList2D& node)
{
  return TrackPtr(CTrack::Alloc(&node, ParameterPath({903, 23, 0}, {1000, 19, 0}), "T"));
}

// Three empty curves stand in every file; of the six that follow only those that exist.
ByteWriter Expected(const std::vector<int>& extraSlots)
{
  ByteWriter w;
  Node(w, u"T", 0x40000).Start(110418, 3);
  Curve(w, true, 2, 7);
  for (int slot = 0; slot < 9; ++slot) {
    const bool present = std::find(extraSlots.begin(), extraSlots.end(), slot) != extraSlots.end();
    if (slot >= 3)
      w.Bool(present);
    if (slot < 3 || present)
      Curve(w, present, slot, 0);
  }
  w.End().Start(110414, 2).Long(3).Long(4).Memory(std::string_view("alias2\0\0\0\0\0\0\0\0", 14));
  w.Start(1, 2).Long(2).Long(903).Long(23).Long(0).Long(1000).Long(19).Long(0).End();
  w.Long(1).Long(-1).Long(-1).Long(-1).Long(-1).End();
  return w;
}

TEST(Track, WritesReadsAndClonesItsCurvesBySlot)
{
  struct Case
  {
    const char* what;
    std::vector<std::pair<Long, int>> curves; // number and slot: the last two are crossed
  };
  const Case cases[] = {
      {"no extra curve", {}},
      {"curves 2 and 8", {{2, 0}, {8, 6}}},
      {"curve 9 comes last", {{9, 8}}},
      {"curve 10 comes before it", {{10, 7}}},
  };
  counting_memory::BalanceCheck balance;
  for (const Case& c : cases) {
    SCOPED_TRACE(c.what);
    BaseList2D node(1);
    TrackPtr track = PositionX(node);
    track->GetCurve(1, 0)->AddKey(BaseTime(2, 1))->SetValue(nullptr, 7);
    EXPECT_TRUE(track->SetParameterById(905, true));
    EXPECT_TRUE(track->SetParameterById(910, Long{3}) && track->SetParameterById(911, Long{4}));
    std::vector<int> slots;
    for (auto [number, slot] : c.curves) {
      EXPECT_EQ(track->GetCurve(number, 0), nullptr);
      track->GetCurve(number, 1)->AddKey(BaseTime(slot, 1));
      slots.push_back(slot);
    }
    const std::string expected = ToHex(Expected(slots).bytes);
    EXPECT_EQ(ToHex(WithoutMarkers(BytesOf(*track))), expected);
    CTrack read;
    ASSERT_TRUE(ReadInto(read, Expected(slots).bytes));
    EXPECT_EQ(ToHex(WithoutMarkers(BytesOf(read))), expected);
    TrackPtr clone(static_cast<CTrack*>(track->MakeClone(0, nullptr)));
    ASSERT_NE(clone, nullptr);
    EXPECT_EQ(ToHex(WithoutMarkers(BytesOf(*clone))), expected);
    for (auto [number, slot] : c.curves)
      EXPECT_EQ(read.GetCurve(number, 0)->GetKey(0)->GetTime(), BaseTime(slot, 1)) << number;
  }
}

TEST(Track, RefusesAnythingButACurveInACurvesPlace)
{
  ByteWriter w;
  w.Header().Start(110416, 0).End().End();
  MemoryReadFile memory(w.bytes);
  CTrack track;
  EXPECT_FALSE(track.ReadChunk(memory.file, 110418, 3));
  EXPECT_EQ(memory.file.GetError(), FILEERROR_WRONG_VALUE);
}

TEST(Track, TakesItsKindFromThePath)
{
  struct Case
  {
    const char* what;
    Long nodeType;
    ParameterPath path;
    Long kind;
    const char* name;
    ParameterPath kept;
  };
  const ParameterPath component({903, 23, 0}, {1000, 19, 0});
  const Case cases[] = {
      {"a component", 1, component, kTrackValue, "N", component},
      {"a number over 10 of any type", 1, ParameterPath({11, 133, 0}), kTrackValue, "N", ParameterPath({11, 133, 0})},
      {"a Real up to 10", 1, ParameterPath({10, 19, 0}), kTrackValue, "N", ParameterPath({10, 19, 0})},
      {"another type up to 10", 1, ParameterPath({10, 15, 0}), kTrackData, "N", ParameterPath({10, 15, 0})},
      {"a Real at the end of a path", 1, ParameterPath({9, 23, 0}, {5, 19, 0}), kTrackValue, "N",
       ParameterPath({9, 23, 0}, {5, 19, 0})},
      {"time", 1, ParameterPath(-1), kTrackValue, "Time Track", ParameterPath({-1, 19, 0})},
      {"a plug-in's node", 5353, ParameterPath(-1), kTrackPlugin, "N", ParameterPath(-1)},
  };
  for (const Case& c : cases) {
    BaseList2D node(c.nodeType);
    TrackPtr track(CTrack::Alloc(&node, c.path, "N"));
    ASSERT_NE(track, nullptr) << c.what;
    EXPECT_EQ(track->GetKind(), c.kind) << c.what;
    EXPECT_EQ(Utf8(track->GetName()), c.name) << c.what;
    EXPECT_TRUE(track->GetPath().IsExactly(c.kept)) << c.what;
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
  GeData value;
  for (bool on : {false, true}) {
    EXPECT_TRUE(track.SetParameterById(904, on) && track.SetParameterById(905, on));
    EXPECT_EQ(track.GetNBit(-1), on ? 0x40000u : 0x20000u); // the first one is stored the other way round
    for (Long id : {904, 905}) {
      EXPECT_TRUE(track.GetParameterById(id, value));
      EXPECT_EQ(value.GetBool(), on) << id;
    }
  }
  GeAliasLink link;
  link.SetLink(&target);
  EXPECT_TRUE(track.SetParameterById(909, GeData(link)));
  EXPECT_TRUE(track.GetParameterById(909, value));
  EXPECT_EQ(value.GetLink(), &target);
}

} // namespace
