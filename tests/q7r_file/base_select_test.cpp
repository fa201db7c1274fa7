// Sets of element numbers: against a plain bit set, at their edges, and in a file.
#include <bitset>

#include "support/library.h"

namespace
{

using Segments = std::vector<std::pair<Long, Long>>;

Segments SegmentsOf(const BaseSelect& set)
{
  Segments segments;
  for (Long i = 0; i < set.SegmentCount(); ++i)
    segments.emplace_back(set.SegmentArray()[i].first, set.SegmentArray()[i].last);
  return segments;
}

void Fill(BaseSelect& set, const Segments& segments)
{
  ASSERT_TRUE(set.AssignSegments(nullptr, static_cast<Long>(segments.size())));
  for (std::size_t i = 0; i < segments.size(); ++i)
    set.SegmentArray()[i] = {segments[i].first, segments[i].second};
}

bool ReadFrom(BaseSelect& set, const Bytes& body, Long level = 0)
{
  ByteWriter whole;
  whole.Header().Append(body);
  MemoryReadFile memory(whole.bytes);
  const bool read = set.ReadChunk(memory.file, kChunkSelect, level);
  EXPECT_TRUE(!read || memory.file.GetPosition() == memory.file.GetLength());
  return read;
}

constexpr std::size_t kSpace = 150;
using Bits = std::bitset<kSpace>;

Segments SegmentsOf(const Bits& bits)
{
  Segments segments;
  for (std::size_t n = 0; n < kSpace; ++n) {
    if (!bits[n])
      continue;
    if (n > 0 && bits[n - 1])
      segments.back().second = static_cast<Long>(n);
    else
      segments.emplace_back(static_cast<Long>(n), static_cast<Long>(n));
  }
  return segments;
}

// One random operation on both; the numbers of `other` are `otherBits`.
void Operate(BaseSelect& set, Bits& bits, const BaseSelect& other, const Bits& otherBits, std::mt19937& random)
{
  const std::size_t n = random() % kSpace;
  const Long number = static_cast<Long>(n);
  const std::size_t length = random() % 12;
  const std::size_t end = std::min(n + length, kSpace); // one behind the range
  Bits range;
  for (std::size_t i = n; i < end; ++i)
    range.set(i);
  switch (random() % 20) {
  case 0:
    ASSERT_TRUE(set.SelectMerge(other));
    bits |= otherBits;
    break;
  case 1:
    ASSERT_TRUE(set.SelectDeselect(other));
    bits &= ~otherBits;
    break;
  case 2:
    ASSERT_TRUE(set.SelectToggleRange(number, static_cast<Long>(end) - 1));
    bits ^= range;
    break;
  case 3:
    if (random() % 20 == 0) {
      ASSERT_TRUE(set.SelectAll(number, static_cast<Long>(end) - 1));
      bits = range;
    }
    break;
  case 4:
  case 5:
  case 6:
    ASSERT_TRUE(set.SelectToggle(number));
    bits.flip(n);
    break;
  default:
    const bool add = random() % 2 == 0;
    ASSERT_TRUE(add ? set.SelectAdd(number) : set.SelectRemove(number));
    bits.set(n, add);
    break;
  }
}

} // namespace

TEST(BaseSelect, AgreesWithAPlainBitSetOverManyOperations)
{
  std::mt19937 random(20240607);
  BaseSelect sets[2];
  Bits bits[2];
  for (int step = 0; step < 20000; ++step) {
    const std::size_t one = random() % 2;
    Operate(sets[one], bits[one], sets[1 - one], bits[1 - one], random);
    ASSERT_EQ(SegmentsOf(sets[one]), SegmentsOf(bits[one])) << step;
    ASSERT_EQ(sets[one].SelectedCount(), static_cast<LLong>(bits[one].count())) << step;
    for (std::size_t i = 0; i < 20; ++i) { // some in a row, some anywhere
      const std::size_t n = i < 10 ? (static_cast<std::size_t>(step) + i) % kSpace : random() % kSpace;
      ASSERT_EQ(sets[one].IsSelected(static_cast<Long>(n)), bits[one][n]) << step << ": " << n;
    }
  }
}

TEST(BaseSelect, ComesToTheseSegments)
{
  const std::tuple<Segments, std::function<Bool(BaseSelect&)>, Segments> rows[] = {
      {Segments{}, [](BaseSelect& s) { return s.SelectAdd(5) && s.SelectAdd(7) && s.SelectAdd(6); }, {{5, 7}}},
      {{{5, 7}}, [](BaseSelect& s) { return s.SelectRemove(6); }, {{5, 5}, {7, 7}}},
      {{{5, 5}}, [](BaseSelect& s) { return s.SelectRemove(5) && !s.SegmentArray(); }, {}},
      {{{1, 2}}, [](BaseSelect& s) { return s.SelectAll(4, 3) && !s.SegmentArray(); }, {}},
      {{{2, 5}}, [](BaseSelect& s) { return s.SelectToggleRange(0, 3); }, {{0, 1}, {4, 5}}},
      {{{2, 5}}, [](BaseSelect& s) { return s.SelectToggleRange(6, 8); }, {{2, 8}}},
      {{{2, 5}}, [](BaseSelect& s) { return s.SelectMerge(s); }, {{2, 5}}},
      {{{2, 5}, {9, 9}}, [](BaseSelect& s) { return s.SelectDeselect(s); }, {}},
      {{{2, 5}}, [](BaseSelect& s) { return s.SelectDeselect(BaseSelect()); }, {{2, 5}}},
      {{{2, 5}},
       [](BaseSelect& s) { return s.GetSegment(0, nullptr, nullptr) && !s.GetSegment(1, nullptr, nullptr); },
       {{2, 5}}},
      {{{2, 5}}, [](BaseSelect& s) { return !s.GetSegment(-1, nullptr, nullptr) && s.SelectNone(); }, {}},
      // Both ends of the numbers.
      {Segments{}, [](BaseSelect& s) { return s.SelectAdd(-1) && s.SelectRemove(-1) && !s.IsSelected(-1); }, {}},
      {{{0, 0}}, [](BaseSelect& s) { return !s.IsSelected(-1) && s.SelectAdd(INT_MIN); }, {{0, 0}}},
      {Segments{}, [](BaseSelect& s) { return s.SelectAll(-7, 2) && s.SelectToggleRange(-9, 0); }, {{1, 2}}},
      {{{INT_MAX - 1, INT_MAX - 1}},
       [](BaseSelect& s) { return s.SelectAdd(INT_MAX) && s.IsSelected(INT_MAX); },
       {{INT_MAX - 1, INT_MAX}}},
      {Segments{},
       [](BaseSelect& s) { return s.SelectAll(0, INT_MAX) && s.SelectedCount() == (LLong{1} << 31); },
       {{0, INT_MAX}}},
      {{{0, INT_MAX}}, [](BaseSelect& s) { return s.SelectToggleRange(1, INT_MAX - 1); }, {{0, 0}, {INT_MAX, INT_MAX}}},
  };
  int number = 0;
  for (const auto& [start, change, end] : rows) {
    SCOPED_TRACE(++number);
    BaseSelect set;
    Fill(set, start);
    const ULong before = set.GetChangeCount();
    EXPECT_TRUE(change(set));
    EXPECT_EQ(SegmentsOf(set), end);
    EXPECT_TRUE(start == end || set.GetChangeCount() > before);
  }
}

// A hint that is a segment ahead when its first number comes up is how a search is saved.
TEST(BaseSelect, WalksAlongWithAscendingLookups)
{
  constexpr Long kSegments = 250000; // (0, 1), (4, 5), (8, 9), ...
  BaseSelect set;
  ASSERT_TRUE(set.AssignSegments(nullptr, kSegments));
  for (Long i = 0; i < kSegments; ++i)
    set.SegmentArray()[i] = {4 * i, 4 * i + 1};
  Long wrong = 0;
  for (Long n = 0; n < 4 * kSegments - 1; ++n) {
    wrong += set.IsSelected(n) != (n % 4 < 2);
    wrong += set.GetLastHit() != (n + 1) / 4;
  }
  EXPECT_EQ(wrong, 0);
  Long index = 0;
  EXPECT_FALSE(set.FindSegment(403, index));
  EXPECT_EQ(index, 100) << "a miss gives the segment before";
  set.SelectAll(10, 12); // the hint is now out of range
  EXPECT_FALSE(set.FindSegment(9, index));
  EXPECT_EQ(index, -1);
  EXPECT_TRUE(set.FindSegment(12, index));
}

TEST(BaseSelect, StaysAsItWasWhenMemoryIsShort)
{
  BaseSelect set;
  Fill(set, {{5, 7}, {9, 9}});
  BaseSelect other;
  Fill(other, {{6, 6}});
  const std::function<Bool()> changes[] = {
      [&] { return set.SelectAdd(1); },
      [&] { return set.SelectAdd(8); },
      [&] { return set.SelectRemove(6); },
      [&] { return set.SelectRemove(9); },
      [&] { return set.SelectAll(1, 2); },
      [&] { return set.SelectMerge(other); },
      [&] { return set.SelectDeselect(other); },
      [&] { return set.SelectToggleRange(1, 2); },
      [&] { return set.AssignSegments(nullptr, 3); },
      [&] { return set.CloneSelect() != nullptr; },
  };
  for (const auto& change : changes) {
    EXPECT_FALSE(counting_memory::WithoutMemory(change));
    EXPECT_EQ(SegmentsOf(set), (Segments{{5, 7}, {9, 9}}));
  }
  EXPECT_EQ(counting_memory::WithoutMemory([&] { return set.CloneSelect(); }, 1), nullptr);
}

TEST(BaseSelect, IsCopied)
{
  BaseSelect set;
  Fill(set, {{5, 7}, {9, 9}});
  BaseSelect target;
  target.SelectAll(0, 99);
  const ULong before = target.GetChangeCount();
  EXPECT_TRUE(set.CopySelect(target) && set.CopySelect(set));
  EXPECT_GT(target.GetChangeCount(), before);
  BaseSelect* clone = set.CloneSelect();
  set.SelectNone();
  EXPECT_EQ(SegmentsOf(target), (Segments{{5, 7}, {9, 9}}));
  EXPECT_EQ(SegmentsOf(*clone), (Segments{{5, 7}, {9, 9}}));
  DeleteObj(clone);
  EXPECT_TRUE(set.CopySelect(target) && target.SegmentArray() == nullptr);
}

TEST(BaseSelect, ReadsAMillionSingleNumbersInAFewAllocations)
{
  constexpr Long kCount = 1000000;
  ByteWriter body;
  body.Long(kCount);
  for (Long i = 0; i < kCount; ++i)
    body.Long(2 * i).Long(2 * i);
  body.End();
  BaseSelect set;
  const LLong before = counting_memory::Get().allocations;
  ASSERT_TRUE(ReadFrom(set, body.bytes));
  EXPECT_LT(counting_memory::Get().allocations - before, 30);
  EXPECT_EQ(set.SelectedCount(), kCount);
  EXPECT_TRUE(set.IsSelected(2 * kCount - 2));
}

TEST(BaseSelect, TakesPairsFromAPlainFile)
{
  Bytes bytes = FromHex("00000002 00000003  00000007 00000007");
  Filename name;
  name.SetMemoryRead(bytes.data(), static_cast<LLong>(bytes.size()));
  BaseFile file;
  ASSERT_TRUE(file.Open(name, kFileRead));
  BaseSelect set;
  EXPECT_TRUE(set.AssignSegments(&file, 2));
  EXPECT_EQ(SegmentsOf(set), (Segments{{2, 3}, {7, 7}}));
  EXPECT_FALSE(set.AssignSegments(&file, INT_MAX));
  EXPECT_EQ(set.SegmentCount(), 0);
  EXPECT_TRUE(set.SelectAdd(1) && set.AssignSegments(&file, 0) && set.SegmentArray() == nullptr);
}
