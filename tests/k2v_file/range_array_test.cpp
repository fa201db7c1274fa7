#include "support/library.h"

namespace
{

using Ranges = std::vector<std::pair<Long, Long>>;

template <class Set>
Ranges RangesOf(const Set& set)
{
  Ranges ranges;
  GeRange range{};
  for (Long n = 0; set.GetRange(n, range); ++n)
    ranges.emplace_back(range.first, range.last);
  EXPECT_EQ(static_cast<std::size_t>(set.GetRangeCount()), ranges.size());
  return ranges;
}

template <class Set>
class RangeSet : public testing::Test
{};
using Forms = testing::Types<GeRangeArray, GePagedRangeArray>;
TYPED_TEST_SUITE(RangeSet, Forms, );

TYPED_TEST(RangeSet, MergesAndSplitsRanges)
{
  TypeParam set;
  for (Long n : {1, 2, 3, 4, 9, 8, 6, 7})
    ASSERT_TRUE(set.AddIndex(n));
  EXPECT_EQ(RangesOf(set), (Ranges{{1, 4}, {6, 9}}));
  EXPECT_TRUE(set.AddIndex(5));
  EXPECT_EQ(RangesOf(set), (Ranges{{1, 9}}));
  EXPECT_EQ(set.GetCount(), 9);
  EXPECT_TRUE(set.AddIndex(5) && set.GetCount() == 9);
  EXPECT_TRUE(set.RemoveIndex(5));
  EXPECT_EQ(RangesOf(set), (Ranges{{1, 4}, {6, 9}}));
  EXPECT_EQ(set.GetCount(), 8);
  for (Long n : {5, 1, 4, 0, 100})
    EXPECT_TRUE(set.RemoveIndex(n));
  EXPECT_EQ(RangesOf(set), (Ranges{{2, 3}, {6, 9}}));
  EXPECT_TRUE(set.SetRange(0, 999999));
  EXPECT_EQ(RangesOf(set), (Ranges{{0, 999999}}));
  EXPECT_EQ(set.GetCount(), 1000000);
  EXPECT_TRUE(set.SetRange(3, 2));
  EXPECT_EQ(RangesOf(set), Ranges());
}

TYPED_TEST(RangeSet, ReachesTheEndsOfTheNumbers)
{
  TypeParam set;
  for (Long n : {INT_MAX, INT_MIN, INT_MAX - 1, INT_MIN + 1, 0})
    ASSERT_TRUE(set.AddIndex(n));
  EXPECT_EQ(RangesOf(set), (Ranges{{INT_MIN, INT_MIN + 1}, {0, 0}, {INT_MAX - 1, INT_MAX}}));
  for (Long n : {INT_MAX, INT_MIN, 0})
    EXPECT_TRUE(set.RemoveIndex(n));
  EXPECT_EQ(RangesOf(set), (Ranges{{INT_MIN + 1, INT_MIN + 1}, {INT_MAX - 1, INT_MAX - 1}}));
  EXPECT_TRUE(set.SetRange(INT_MIN, INT_MAX));
  EXPECT_EQ(set.GetCount(), LLong{1} << 32);
}

// Dense phases merge and split, sparse ones fill and empty many pages.
TYPED_TEST(RangeSet, AgreesWithAPlainBitSet)
{
  constexpr Long kNumbers = 6000;
  std::mt19937 random(11);
  TypeParam set;
  std::vector<bool> bits(kNumbers);
  LLong total = 0;
  for (int step = 0; step < 60000; ++step) {
    Long n = static_cast<Long>(random() % kNumbers);
    if (step / 12000 % 2 == 0)
      n = n / 2 * 2; // every other number: one range each
    const bool add = random() % 8 < (step / 6000 % 2 == 0 ? 6u : 2u);
    const auto place = static_cast<std::size_t>(n);
    ASSERT_EQ(set.TestIndex(n), bits[place]);
    ASSERT_TRUE(add ? set.AddIndex(n) : set.RemoveIndex(n));
    total += static_cast<LLong>(add) - static_cast<LLong>(bits[place]);
    bits[place] = add;
    ASSERT_EQ(set.GetCount(), total);
    if (step % 997 != 0)
      continue;
    Ranges expected;
    for (Long i = 0; i < kNumbers; ++i) {
      if (!bits[static_cast<std::size_t>(i)])
        continue;
      if (!expected.empty() && expected.back().second == i - 1)
        expected.back().second = i;
      else
        expected.emplace_back(i, i);
    }
    ASSERT_EQ(RangesOf(set), expected) << "after step " << step;
  }
}

TYPED_TEST(RangeSet, StaysAsItWasWhenMemoryRunsOut)
{
  TypeParam set;
  counting_memory::FailAfter(0);
  EXPECT_FALSE(set.AddIndex(3) || set.SetRange(1, 2));
  counting_memory::FailNever();
  EXPECT_EQ(set.GetCount(), 0);
  // Up to where the next range needs memory, whichever form it is.
  for (Long n = 0; n < 512; ++n)
    ASSERT_TRUE(set.AddIndex(3 * n));
  for (Long n : {1, 2, 4, 5000})
    ASSERT_TRUE(set.AddIndex(n)); // 2 joins two ranges
  const Ranges before = RangesOf(set);
  ASSERT_EQ(before.size(), 512u);
  counting_memory::FailAfter(0);
  EXPECT_FALSE(set.AddIndex(4000) || set.AddIndex(6000) || set.RemoveIndex(2));
  EXPECT_EQ(set.GetCount(), 516);
  EXPECT_EQ(RangesOf(set), before);
  for (Long n = 511; n > 0; --n)
    EXPECT_TRUE(set.RemoveIndex(3 * n)); // shrinking needs none either
  EXPECT_TRUE(set.SetRange(7, 9));
  counting_memory::FailNever();
  EXPECT_EQ(RangesOf(set), (Ranges{{7, 9}}));
}

TEST(RangeArray, DoublesAndHalvesItsBlock)
{
  GeRangeArray set;
  const std::pair<Long, Long> grown[] = {{1, 4}, {4, 4}, {5, 8}, {9, 16}, {17, 32}};
  for (const auto& [ranges, capacity] : grown) {
    for (Long n = set.GetRangeCount(); n < ranges; ++n)
      ASSERT_TRUE(set.AddIndex(2 * n));
    EXPECT_EQ(set.GetCapacity(), capacity);
  }
  const std::pair<Long, Long> shrunk[] = {{17, 32}, {16, 16}, {9, 16}, {8, 8}, {4, 4}, {0, 4}};
  for (const auto& [ranges, capacity] : shrunk) {
    for (Long n = set.GetRangeCount(); n > ranges; --n)
      ASSERT_TRUE(set.RemoveIndex(2 * n - 2));
    EXPECT_EQ(set.GetCapacity(), capacity);
  }
}

// The ranges 0, 4, 8, ... with one more in front of the n-th.
TEST(PagedRangeArray, SplitsAFullPageAtAnyPlace)
{
  for (Long n = 0; n <= GePagedRangeArray::kPageEntries; ++n) {
    GePagedRangeArray set;
    Ranges expected;
    for (Long i = 0; i < GePagedRangeArray::kPageEntries; ++i) {
      ASSERT_TRUE(set.AddIndex(4 * i));
      expected.emplace_back(4 * i, 4 * i);
    }
    ASSERT_TRUE(set.AddIndex(4 * n - 2));
    expected.insert(expected.begin() + n, {4 * n - 2, 4 * n - 2});
    ASSERT_EQ(RangesOf(set), expected) << n;
  }
}

TEST(PagedRangeArray, GivesEmptyPagesBack)
{
  GePagedRangeArray set;
  for (Long n = 0; n < 3 * GePagedRangeArray::kPageEntries; ++n)
    ASSERT_TRUE(set.AddIndex(2 * n));
  const LLong blocks = counting_memory::Get().blocks;
  for (Long n = 512; n < 1024; ++n)
    ASSERT_TRUE(set.RemoveIndex(2 * n));
  EXPECT_EQ(counting_memory::Get().blocks, blocks - 1);
  GeRange range{};
  ASSERT_TRUE(set.GetRange(512, range));
  EXPECT_EQ(range.first, 2048);
  EXPECT_FALSE(set.TestIndex(1024));
  EXPECT_TRUE(set.AddIndex(1500) && set.SetRange(1, 0) && set.GetRangeCount() == 0);
}

TEST(PagedRangeArray, KeepsItsCursorOnTheRangeLastFound)
{
  GePagedRangeArray set;
  for (Long n = 0; n < 1000; ++n)
    ASSERT_TRUE(set.AddIndex(2 * n));
  EXPECT_TRUE(set.TestIndex(2 * 700));
  EXPECT_EQ(set.GetCursor(), 700); // pages that are filled in order are full
  EXPECT_FALSE(set.TestIndex(2 * 700 + 1));
  EXPECT_EQ(set.GetCursor(), 0);
  EXPECT_TRUE(set.TestIndex(2 * 512) && set.GetCursor() == 512);
  EXPECT_TRUE(set.RemoveIndex(0) && set.GetCursor() == 0);
  EXPECT_TRUE(set.TestIndex(2 * 512));
  EXPECT_EQ(set.GetCursor(), 512); // the first page has 511 ranges now
}

} // namespace
