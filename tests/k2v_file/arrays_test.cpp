#include "support/library.h"

namespace
{

using LongArray = GeTempDynArray<Long>;

std::vector<Long> Values(const LongArray& array) { return {array.begin(), array.end()}; }

void Fill(LongArray& array, Long count)
{
  for (Long i = 0; i < count; ++i)
    ASSERT_TRUE(array.Append(i));
}

TEST(DynArray, GrowsByItsIncrementOrTwofold)
{
  const Long rows[][4] = {{4, 0, 1, 4}, {4, 0, 5, 8}, {4, 0, 9, 16}, {4, 3, 5, 7}, {4, 3, 8, 10}};
  for (const auto& [first, increment, count, capacity] : rows) {
    LongArray array(first, increment);
    Fill(array, count);
    EXPECT_EQ(array.GetCapacity(), capacity);
    array.Reset();
    EXPECT_EQ(array.GetCapacity(), capacity);
    array.Flush();
    EXPECT_EQ(array.GetCapacity(), 0);
  }
  LongArray none(0, 5);
  EXPECT_FALSE(none.Append(1));
  LongArray shrinking(4, -1);
  Fill(shrinking, 4);
  EXPECT_FALSE(shrinking.Append(4));
  EXPECT_EQ(shrinking.GetCount(), 4);
}

TEST(DynArray, EditsWithinItsBounds)
{
  LongArray array(2);
  Fill(array, 3);
  EXPECT_TRUE(array.Insert(99, 8) && array.Insert(-5, 9));
  EXPECT_EQ(Values(array), (std::vector<Long>{9, 0, 1, 2, 8}));
  EXPECT_TRUE(array.Append(array[0])); // from the block that may be replaced
  EXPECT_FALSE(array.Remove(6) || array.Remove(-1));
  EXPECT_TRUE(array.Remove(0));
  array.Swap(0, 4);
  array.Swap(0, 5);
  EXPECT_EQ(Values(array), (std::vector<Long>{9, 1, 2, 8, 0}));
  Long last = -1;
  EXPECT_TRUE(array.Pop(&last) && last == 0);
  EXPECT_TRUE(array.SetCount(6));
  EXPECT_EQ(Values(array), (std::vector<Long>{9, 1, 2, 8, 0, 0}));
  EXPECT_FALSE(array.SetCount(-1));
}

TEST(DynArray, MovesInFrontOfTheElementAtTheTarget)
{
  const std::vector<Long> same = {0, 1, 2, 3};
  const std::tuple<Long, Long, std::vector<Long>> rows[] = {
      {0, 3, {1, 2, 0, 3}}, {0, 4, {1, 2, 3, 0}}, {3, 0, {3, 0, 1, 2}}, {2, 1, {0, 2, 1, 3}}, {1, 1, same},
      {1, 2, same},         {0, 5, same},         {-1, 2, same},        {4, 1, same},         {2, -1, same},
  };
  for (const auto& [from, to, values] : rows) {
    LongArray array;
    Fill(array, 4);
    array.Move(from, to);
    EXPECT_EQ(Values(array), values) << from << " to " << to;
  }
}

TEST(DynArray, StaysAsItWasWhenMemoryRunsOut)
{
  LongArray array(4), copy;
  Fill(array, 4);
  counting_memory::FailAfter(0);
  EXPECT_FALSE(array.Append(5) || array.Insert(0, 5) || array.SetCount(5) || array.CopyTo(copy));
  counting_memory::FailNever();
  EXPECT_EQ(Values(array), (std::vector<Long>{0, 1, 2, 3}));
  Fill(copy, 7);
  EXPECT_TRUE(array.CopyTo(copy) && copy.CopyTo(copy));
  EXPECT_EQ(Values(copy), Values(array));
  EXPECT_EQ(copy.GetCapacity(), 4); // the way to grow comes along
}

Long CompareLongs(const void* a, const void* b)
{
  Long left = *static_cast<const Long*>(a);
  Long right = *static_cast<const Long*>(b);
  return left < right ? -1 : left > right ? 1 : 0;
}

TEST(ToolDynArray, HandlesPointersByIdentityAndByOrder)
{
  Long numbers[] = {30, 10, 20, 10};
  GeToolDynArray array(2);
  EXPECT_EQ(array.Pop(), nullptr);
  for (Long& number : numbers)
    ASSERT_TRUE(array.Append(&number));
  EXPECT_TRUE(array.Find(&numbers[2]) == 2 && array.Find(&array) == -1);
  EXPECT_FALSE(array.RemoveObject(&array));
  array.Sort(CompareLongs);
  const Long sought = 10;
  EXPECT_EQ(array.Search(&sought, CompareLongs), array[0]);
  EXPECT_EQ(array.Pop(), &numbers[0]);
  EXPECT_TRUE(array.RemoveObject(&numbers[2]));
  const Long missing = 20;
  EXPECT_FALSE(array.Search(&missing, CompareLongs) || array.Search(nullptr, CompareLongs));
}

// Orders elements of any size by the number in their first bytes.
class ByteOrder : public GeSortAndSearch
{
 public:
  explicit ByteOrder(std::size_t keyBytes) : keyBytes_(keyBytes) {}
  Long Compare(const void* a, const void* b) override { return std::memcmp(a, b, keyBytes_); }

 private:
  std::size_t keyBytes_;
};

TEST(SortAndSearch, AgreesWithTheStandardLibraryOnAnyElementSize)
{
  std::mt19937 random(7);
  for (std::size_t size : {1u, 2u, 3u, 4u, 6u, 12u}) {
    for (std::size_t count = 0; count < 70; ++count) {
      std::vector<std::vector<UChar>> elements(count, std::vector<UChar>(size));
      std::vector<UChar> block;
      for (auto& element : elements) {
        for (UChar& byte : element)
          byte = static_cast<UChar>(random() % 5);
        block.insert(block.end(), element.begin(), element.end());
      }
      ByteOrder order(size);
      order.Sort(block.data(), static_cast<Long>(count), static_cast<Long>(size));
      std::sort(elements.begin(), elements.end());
      std::vector<UChar> sorted;
      for (const auto& element : elements)
        sorted.insert(sorted.end(), element.begin(), element.end());
      ASSERT_EQ(block, sorted);
    }
  }
}

TEST(SortAndSearch, FindsTheFirstOfEqualsAndThePlaceOfAMissingKey)
{
  ByteOrder order(1);
  std::mt19937 random(8);
  for (int round = 0; round < 2000; ++round) {
    std::vector<UChar> values(1 + random() % 12);
    for (UChar& value : values)
      value = static_cast<UChar>(random() % 20);
    std::sort(values.begin(), values.end());
    const UChar key = static_cast<UChar>(random() % 20);
    Long position = -1;
    void* found = order.SearchOrInsertPos(&key, values.data(), static_cast<Long>(values.size()), 1, position);
    auto bound = std::lower_bound(values.begin(), values.end(), key);
    ASSERT_EQ(position, bound - values.begin());
    const bool held = bound != values.end() && *bound == key;
    ASSERT_EQ(found, held ? &*bound : nullptr);
    ASSERT_EQ(order.Search(&key, values.data(), static_cast<Long>(values.size()), 1), found);
  }
  UChar value = 1;
  EXPECT_FALSE(order.Search(nullptr, &value, 1, 1) || order.Search(&value, nullptr, 1, 1));
  EXPECT_FALSE(order.Search(&value, &value, 0, 1) || order.Search(&value, &value, 1, 0));
}

struct Entry
{
  ULong key;
  Long value;
};

TEST(SortSearchArray, KeepsElementsInTheOrderOfTheirKeys)
{
  GeTempDynSortSearchArray<Entry, ULong, GeMemberOrder<&Entry::key>> array(2);
  EXPECT_EQ(array.Find(5), nullptr);
  const ULong large = 0xF0000000u; // keys without a sign
  for (ULong key : {7u, 3u, large, 5u})
    ASSERT_TRUE(array.Insert({key, static_cast<Long>(key & 15)}));
  EXPECT_TRUE(array.IsSorted());
  EXPECT_TRUE(array[0].key == 3u && array[3].key == large);
  ASSERT_TRUE(array.Append({4, 44}));
  EXPECT_FALSE(array.IsSorted());
  Long position = -1;
  ASSERT_NE(array.Find(4, position), nullptr); // sorts first
  EXPECT_EQ(position, 1);
  EXPECT_EQ(array.Find(6, position), nullptr);
  EXPECT_EQ(position, 3);
  EXPECT_TRUE(array.RemoveKey(4));
  EXPECT_FALSE(array.RemoveKey(4));
  ASSERT_TRUE(array.Insert({5, 55}));
  EXPECT_EQ(array.Find(5)->value, 55); // before its equal
  decltype(array) copy;
  EXPECT_TRUE(array.CopyTo(copy) && copy.Find(large)->value == 0);
}

class Node : public GeTempPublicNode2D<Node>
{
 public:
  explicit Node(int value) : number(value) {}
  int number;
};

std::vector<int> Numbers(const GeTempPublicList2D<Node>& list)
{
  std::vector<int> forward, backward;
  for (const Node* node = list.GetFirst(); node; node = node->GetNext())
    forward.push_back(node->number);
  for (const Node* node = list.GetLast(); node; node = node->GetPrev())
    backward.insert(backward.begin(), node->number);
  EXPECT_EQ(forward, backward);
  EXPECT_EQ(static_cast<std::size_t>(list.GetCount()), forward.size());
  return forward;
}

TEST(List, KeepsBothDirectionsInStepThroughEveryChange)
{
  Node a(1), b(2), outside(3);
  EXPECT_EQ(a.GetNext(), nullptr);
  {
    GeTempPublicList2D<Node> list, other;
    EXPECT_TRUE(list.IsEmpty() && list.GetFirst() == nullptr);
    list.InsertLast(&a);
    list.InsertFirst(&b);
    Node* made = NewObj<Node>(4);
    ASSERT_NE(made, nullptr);
    made->InsertAfter(&b);
    EXPECT_EQ(Numbers(list), (std::vector<int>{2, 4, 1}));
    a.InsertBefore(made); // moves within the list
    EXPECT_EQ(Numbers(list), (std::vector<int>{2, 1, 4}));
    DeleteObj(made);      // leaves the list
    other.InsertLast(&b); // leaves the first list
    EXPECT_EQ(Numbers(list), std::vector<int>{1});
    EXPECT_EQ(Numbers(other), std::vector<int>{2});
    outside.Remove();
  }
  EXPECT_FALSE(a.IsInList()); // the lists are gone
  EXPECT_FALSE(b.IsInList());
}

} // namespace
