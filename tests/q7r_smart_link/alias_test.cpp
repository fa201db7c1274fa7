#include <set>

#include "support/library.h"
#include "torvane/time/reproducible_run.h"

namespace
{

// A node's address, for goals whose node nobody looks into.
GeListNode* FakeNode(std::uintptr_t number) { return reinterpret_cast<GeListNode*>(number * 64); }

std::string BytesOf(GeAliasID id)
{
  std::uint8_t bytes[sizeof id];
  std::memcpy(bytes, &id, sizeof id);
  return ToHex(bytes, sizeof bytes);
}

// "alias2" or "agoal1" with an id.
std::string Record(std::string_view mark, GeAliasID id)
{
  std::string record(mark);
  record.append(reinterpret_cast<const char*>(&id), sizeof id);
  return record;
}

std::vector<GeAliasLink*> OwnersOf(const GeAliasGoal& goal)
{
  std::vector<GeAliasLink*> owners;
  GoalIterator iterator;
  for (void* owner = goal.FirstLinkOfGoal(iterator, 0); owner; owner = goal.NextLinkOfGoal(iterator, 0))
    owners.push_back(static_cast<GeAliasLink*>(owner));
  return owners;
}

TEST(Alias, FollowsItsGoalUntilThatGoes)
{
  GeAliasLink link;
  EXPECT_EQ(link.GetLink(), nullptr);
  {
    GeAliasGoal goal(FakeNode(1)), other(FakeNode(2));
    EXPECT_EQ(goal.GetGoalId(), 0U);
    link.SetLinkGoal(&other);
    link.SetLinkGoal(&goal);
    EXPECT_EQ(link.GetLink(), FakeNode(1));
    EXPECT_TRUE(goal.GetGoalId() != 0 && other.GetGoalId() == 0);
    goal.resolvable = false;
    EXPECT_TRUE(link.GetLink() == nullptr && link.GetLinkGoal() == &goal);
  }
  EXPECT_TRUE(link.GetLink() == nullptr && link.GetLinkGoal() == nullptr);
  GeAliasGoal later(FakeNode(3));
  link.SetLinkGoal(&later);
  EXPECT_EQ(link.GetLink(), FakeNode(3));
  link.ClearLink();
  EXPECT_FALSE(later.HasLinks());
}

// A translation takes numbers by the lot, and gives back what it didn't use if it can.
TEST(Alias, TargetsAreNumberedInARowWhoeverMakesThem)
{
  const auto takeNumber = [] {
    GeAliasGoal goal(FakeNode(1));
    GeAliasLink link;
    link.SetLinkGoal(&goal);
    return goal.GetGoalId();
  };
  constexpr std::size_t kCounts[] = {1, 63, 64, 65, 1000};
  GeAliasID last = takeNumber();
  for (const std::size_t count : kCounts) {
    for (const bool meanwhile : {false, true}) {
      std::vector<GeAliasGoal> goals(count);
      std::vector<GeAliasLink> links(count);
      std::set<GeAliasID> numbers{last};
      TransArray translation;
      for (std::size_t i = 0; i < count; ++i) {
        translation.RegisterGoal(i + 1, goals[i]);
        translation.RegisterLink(i + 1, links[i], nullptr);
        numbers.insert(goals[i].GetGoalId());
        if (meanwhile)
          numbers.insert(takeNumber());
      }
      if (const ReproducibleRun run(1, DateTime()); meanwhile) {
        GeAliasGoal late;
        GeAliasLink link;
        translation.RegisterGoal(count + 1, late);
        translation.RegisterLink(count + 1, link, nullptr);
        EXPECT_EQ(late.GetGoalId(), GeAliasID{1} << 32);
      }
      translation.FinishTranslation(false);
      EXPECT_EQ(numbers.size(), 1 + count + (meanwhile ? count : 0));
      EXPECT_TRUE(meanwhile || *numbers.rbegin() == last + count);
      const GeAliasID next = takeNumber();
      EXPECT_TRUE(next > *numbers.rbegin() && (meanwhile || next == last + count + 1)) << count;
      last = next;
    }
  }
}

TEST(Alias, CopiesTargetAndLabelWithoutATranslation)
{
  GeAliasGoal goal(FakeNode(1));
  GeAliasLink source, copy;
  copy.SetName(String("old"));
  source.SetLinkGoal(&goal);
  EXPECT_TRUE(source.CopyLinkTo(&copy, nullptr) && copy.GetName() == nullptr);
  source.SetName(String("label"));
  GeAliasLink* clone = source.CloneLink(nullptr);
  EXPECT_EQ(*clone->GetName(), String("label"));
  EXPECT_TRUE(clone->IsEqual(copy) && clone->CopyLinkTo(clone, nullptr) && clone->GetLink() == FakeNode(1));
  DeleteObj(clone);
  EXPECT_TRUE(source.CopyLinkTo(nullptr, nullptr));
  GeAliasLink().CopyLinkTo(&copy, nullptr);
  EXPECT_EQ(copy.GetLinkGoal(), nullptr);
}

TEST(Alias, WalksTheOwnersOfTheLinksInTheOrderOfTheirCreation)
{
  GeAliasGoal goal(FakeNode(7)), empty;
  GeAliasLink links[3];
  for (GeAliasLink& link : links)
    link.SetLinkGoal(&goal);
  links[0].SetLinkOwner(&links[0]);
  links[2].SetLinkOwner(&links[2]);
  std::vector<GeAliasLink*> owners = OwnersOf(goal);
  ASSERT_EQ(owners.size(), 3U);
  EXPECT_TRUE(owners[0] == &links[0] && owners[2] == &links[2]);
  EXPECT_NE(owners[1], nullptr); // the shared empty object
  GoalIterator iterator;
  EXPECT_EQ(goal.FirstLinkOfGoal(iterator, 1), goal.node);
  EXPECT_EQ(empty.FirstLinkOfGoal(iterator, 0), nullptr);
  GeAliasGoal other(FakeNode(8));
  GeAliasLink before;
  before.SetLinkOwner(&before);
  before.SetLinkGoal(&other);
  goal.MoveLinksTo(other);
  owners = OwnersOf(other);
  ASSERT_EQ(owners.size(), 4U);
  EXPECT_TRUE(owners[0] == &before && owners[3] == &links[2] && OwnersOf(goal).empty());
}

TEST(Alias, LetsLinksAndGoalsGoWhileTheyAreWalked)
{
  auto goal = std::make_unique<GeAliasGoal>(FakeNode(1));
  std::optional<GeAliasLink> links[6];
  for (auto& link : links) {
    link.emplace();
    link->SetLinkOwner(&link);
    link->SetLinkGoal(goal.get());
  }
  GoalIterator first, second;
  EXPECT_TRUE(goal->FirstLinkOfGoal(first, 0) == &links[0] && goal->FirstLinkOfGoal(second, 0) == &links[0]);
  links[0].reset();
  links[1].reset(); // the next of both
  links[2]->ClearLink();
  EXPECT_EQ(GeAliasGoal::NextLinkOfGoal(first, 0), &links[3]);
  links[5].reset();
  goal.reset();
  EXPECT_EQ(GeAliasGoal::NextLinkOfGoal(first, 0), nullptr);
  EXPECT_EQ(GeAliasGoal::NextLinkOfGoal(second, 0), nullptr);
}

TEST(Alias, WritesIdAndLabelInOneBlock)
{
  GeAliasGoal goal, lonely;
  GeAliasLink link, labelled;
  link.SetLinkGoal(&goal);
  labelled.SetName(String("A\xE9"));
  EXPECT_EQ(ToHex(WriteToMemory([&](HyperFile& file) { link.WriteLink(file); })),
            "80 00 00 00 0E 61 6C 69 61 73 32 " + BytesOf(goal.GetGoalId()));
  EXPECT_EQ(ToHex(WriteToMemory([&](HyperFile& file) { labelled.WriteLink(file); })),
            "80 00 00 00 14 61 6C 69 61 73 32 00 00 00 00 00 00 00 00 00 00 00 02 41 E9");
  EXPECT_EQ(ToHex(WriteToMemory([&](HyperFile& file) { goal.WriteGoal(file); })),
            "80 00 00 00 0E 61 67 6F 61 6C 31 " + BytesOf(goal.GetGoalId()));
  EXPECT_EQ(ToHex(WriteToMemory([&](HyperFile& file) { lonely.WriteGoal(file); })),
            "80 00 00 00 0E 61 67 6F 61 6C 31 00 00 00 00 00 00 00 00");
}

TEST(Alias, ReadsLinksOfEveryFormAndIgnoresForeignBlocks)
{
  const std::string id5 = Record("alias2", 5), large(8, '\xFF');
  // name: null for none
  const std::tuple<std::string, bool, const char*> cases[] = {
      {id5, true, nullptr},
      {id5 + std::string("\0\0\0\2xy", 6), true, "xy"},
      {id5 + std::string("\0\0\0\1xy", 6), true, "x"},
      {id5 + std::string("\0\0\0\0", 4), true, ""},
      {id5 + std::string("\xFF\xFF\xFF\xFFxy", 6), true, "xy"},
      {id5 + std::string("\0\0\0", 3), true, nullptr},
      {Record("alias2", 0) + std::string("\0\0\0\2xy", 6), false, "xy"},
      {id5.substr(0, 13), false, nullptr},
      {Record("alias1", 5), false, nullptr},
      {Record("agoal1", 5), false, nullptr},
      {"x", false, nullptr},
  };
  for (const auto& [block, resolves, name] : cases) {
    for (bool large139 : {false, true}) {
      ByteWriter bytes;
      bytes.Header();
      if (large139)
        bytes.U8(139).I64(static_cast<std::int64_t>(block.size())).Raw(block);
      else
        bytes.Memory(block);
      bytes.Memory(Record("agoal1", 5));
      MemoryReadFile source(bytes.bytes);
      GeAliasLink link;
      GeAliasGoal goal(FakeNode(1));
      EXPECT_TRUE(link.ReadLink(source.file) && goal.ReadGoal(source.file));
      EXPECT_EQ(link.GetLink(), resolves ? FakeNode(1) : nullptr) << ToHex(bytes.bytes);
      ASSERT_EQ(link.GetName() != nullptr, name != nullptr) << ToHex(bytes.bytes);
      if (name) {
        EXPECT_EQ(*link.GetName(), String(name));
      }
    }
  }
  MemoryReadFile source(ByteWriter().Header().Memory("").Memory("").bytes);
  GeAliasLink link;
  GeAliasGoal goal;
  EXPECT_FALSE(link.ReadLink(source.file) || goal.ReadGoal(source.file));
}

TEST(Alias, TakesAnIdOnlyFromAGoalBlockOfExactSize)
{
  for (const std::string& block : {Record("agoal1", 5) + "x", Record("agoal2", 5), Record("alias2", 5)}) {
    MemoryReadFile source(ByteWriter().Header().Memory(Record("alias2", 5)).Memory(block).bytes);
    GeAliasLink link, old;
    GeAliasGoal goal(FakeNode(1));
    old.SetLinkGoal(&goal);
    EXPECT_TRUE(link.ReadLink(source.file) && goal.ReadGoal(source.file) && link.GetLink() == nullptr);
    EXPECT_EQ(old.GetLink(), nullptr); // a goal that is read loses the links that it had
  }
}

// A link in a container is stored by copy while it waits for its goal, and the container may be copied then too.
TEST(Alias, ResolvesAContainersLinkThatIsReadBeforeItsGoal)
{
  ByteWriter bytes;
  bytes.Header().Start(132, 1).Long(-1).Long(9).Long(133).Memory(Record("alias2", 77)).End();
  bytes.Memory(Record("agoal1", 77));
  GeAliasGoal goal(FakeNode(4));
  BaseContainer container, copy, translated;
  {
    MemoryReadFile source(bytes.bytes);
    ASSERT_TRUE(source.file.ReadContainer(container, true));
    copy = container;
    AliasTranslator translator;
    ASSERT_TRUE(translator.MakeTranslator() && container.CopyTo(translated, 0, translator.GetArray()));
    translator.Finish(true);
    container.InsertData(10, *container.FindData(9));
    ASSERT_TRUE(goal.ReadGoal(source.file));
  }
  EXPECT_TRUE(container.GetData(9).GetLink() == FakeNode(4) && container.GetData(10).GetLink() == FakeNode(4));
  EXPECT_EQ(copy.GetData(9).GetLink(), FakeNode(4));
  EXPECT_EQ(translated.GetData(9).GetLink(), FakeNode(4));
  EXPECT_EQ(OwnersOf(goal).size(), 4U);
}

// Registers goals and links in random order, lets some go in between, and compares with a plain map of ids.
TEST(Alias, ResolvesLinksAndGoalsInAnyOrder)
{
  for (unsigned seed = 0; seed < 40; ++seed) {
    std::mt19937 random(seed);
    const std::size_t ids = 1 + random() % 60;
    std::vector<std::unique_ptr<GeAliasGoal>> goals(ids);
    std::vector<std::unique_ptr<GeAliasLink>> links(ids * 3);
    std::vector<std::size_t> linkId(links.size());
    std::vector<std::size_t> order(goals.size() + links.size());
    for (std::size_t i = 0; i < order.size(); ++i)
      order[i] = i;
    std::shuffle(order.begin(), order.end(), random);
    // Scattered ids, counted ones that lie apart, and a run of them.
    const auto idOf = [step = std::array<GeAliasID, 3>{0x100000001, 77, 1}[seed % 3]](std::size_t number) {
      return number * step + 1;
    };

    TransArray translation;
    std::map<std::size_t, GeAliasGoal*> expected;
    for (std::size_t entry : order) {
      if (entry < goals.size()) {
        if (random() % 4 == 0)
          continue; // a goal that never comes
        goals[entry] = std::make_unique<GeAliasGoal>(FakeNode(entry + 1));
        EXPECT_TRUE(translation.RegisterGoal(idOf(entry), *goals[entry]));
        expected[entry] = goals[entry].get();
      } else {
        const std::size_t number = entry - goals.size();
        links[number] = std::make_unique<GeAliasLink>();
        linkId[number] = random() % ids;
        EXPECT_TRUE(translation.RegisterLink(idOf(linkId[number]), *links[number], nullptr));
      }
      if (std::unique_ptr<GeAliasLink>& victim = links[random() % links.size()]; random() % 8 == 0)
        victim.reset();
    }
    translation.FinishTranslation(false);
    EXPECT_EQ(translation.GetCount(), 0);
    for (std::size_t number = 0; number < links.size(); ++number) {
      if (links[number]) {
        EXPECT_EQ(links[number]->GetLinkGoal(), expected[linkId[number]]) << "seed " << seed;
      }
    }
    for (const auto& goal : goals) { // only real links are left on them
      const auto pointing = std::count_if(links.begin(), links.end(), [&](const auto& link) {
        return link && goal && link->GetLinkGoal() == goal.get();
      });
      EXPECT_EQ(goal ? OwnersOf(*goal).size() : 0, static_cast<std::size_t>(pointing));
    }
    // Everything goes in random order.
    std::shuffle(order.begin(), order.end(), random);
    for (std::size_t entry : order) {
      if (entry < goals.size())
        goals[entry].reset();
      else
        links[entry - goals.size()].reset();
      for (std::size_t number = 0; number < links.size(); ++number) {
        if (links[number] && expected[linkId[number]] && !goals[linkId[number]]) {
          EXPECT_EQ(links[number]->GetLinkGoal(), nullptr);
        }
      }
    }
  }
}

TEST(Alias, KeepsACopysLinksInsideTheCopyAndTheOthersAtTheirOldTarget)
{
  GeAliasGoal inside(FakeNode(1)), insideCopy(FakeNode(2)), outside(FakeNode(3));
  auto gone = std::make_unique<GeAliasGoal>(FakeNode(4));
  GeAliasLink toInside, toOutside, toGone, toNothing, copies[4];
  toInside.SetLinkGoal(&inside);
  toOutside.SetLinkGoal(&outside);
  toGone.SetLinkGoal(gone.get());
  for (bool keep : {true, false}) {
    AliasTranslator translator;
    ASSERT_TRUE(translator.MakeTranslator());
    TransArray* array = translator.GetArray();
    EXPECT_TRUE(toInside.CopyLinkTo(&copies[0], array) && inside.CopyGoalTo(insideCopy, array));
    EXPECT_TRUE(toOutside.CopyLinkTo(&copies[1], array) && toGone.CopyLinkTo(&copies[2], array));
    EXPECT_TRUE(toNothing.CopyLinkTo(&copies[3], array));
    EXPECT_EQ(copies[1].GetLink(), nullptr); // not yet
    gone.reset();
    translator.Finish(keep);
    EXPECT_EQ(copies[0].GetLink(), FakeNode(2));
    EXPECT_EQ(copies[1].GetLink(), keep ? FakeNode(3) : nullptr);
    EXPECT_TRUE(copies[2].GetLink() == nullptr && copies[3].GetLink() == nullptr);
    EXPECT_EQ(toInside.GetLink(), FakeNode(1));
  }
  EXPECT_TRUE(inside.CopyGoalTo(insideCopy, nullptr)); // without an array nothing happens
  EXPECT_EQ(copies[0].GetLink(), FakeNode(2));
}

TEST(Alias, GivesLinksBackToACommonTargetInTheOrderOfTheirIds)
{
  GeAliasGoal target(FakeNode(9));
  GeAliasLink links[40];
  TransArray translation;
  for (std::size_t i = 0; i < std::size(links); ++i) {
    links[i].SetLinkOwner(&links[i]);
    translation.RegisterLink(1000 - i, links[i], &target);
  }
  translation.FinishTranslation(true);
  std::vector<GeAliasLink*> owners = OwnersOf(target);
  ASSERT_EQ(owners.size(), std::size(links));
  for (std::size_t i = 0; i < owners.size(); ++i)
    EXPECT_EQ(owners[i], &links[owners.size() - 1 - i]);
}

TEST(Alias, ReportsARegistrationForAGoalThatHasGone)
{
  TransArray translation;
  GeAliasGoal again(FakeNode(2));
  GeAliasLink link;
  {
    GeAliasGoal goal(FakeNode(1));
    EXPECT_TRUE(translation.RegisterGoal(5, goal));
  }
  EXPECT_TRUE(translation.RegisterLink(5, link, nullptr) && translation.RegisterGoal(5, again));
  EXPECT_EQ(TakeReports(), (Reports{"q7r_smart_link:843", "q7r_smart_link:794"}));
  EXPECT_EQ(link.GetLink(), nullptr);
  link.SetLinkGoal(&again);
  EXPECT_TRUE(translation.RegisterLink(0, link, nullptr) && translation.RegisterGoal(0, again));
  EXPECT_EQ(link.GetLink(), nullptr);
  translation.FinishTranslation(true);
}

TEST(Alias, HandsLinksOnWhenAnIdGetsASecondGoal)
{
  TransArray translation;
  GeAliasGoal first(FakeNode(1)), second(FakeNode(2));
  GeAliasLink link;
  translation.RegisterGoal(5, first);
  translation.RegisterLink(5, link, nullptr);
  translation.RegisterGoal(5, second);
  translation.FinishTranslation(false);
  EXPECT_EQ(link.GetLink(), FakeNode(2));
  EXPECT_FALSE(first.HasLinks());
}

TEST(Alias, TranslatesAndCopiesAllLinksOrTellsThatMemoryIsShort)
{
  struct Net
  {
    GeAliasGoal goals[20];
    GeAliasLink links[20], copies[20];
  };
  const auto make = [] {
    auto net = std::make_unique<Net>();
    bool done = true;
    {
      TransArray translation;
      for (std::size_t i = 0; i < 20; ++i) {
        if (i % 2)
          done = translation.RegisterGoal(i + 1, net->goals[i]) && done;
        done = translation.RegisterLink(i + 1, net->links[i], nullptr) && done;
        if (i % 2 == 0)
          done = translation.RegisterGoal(i + 1, net->goals[i]) && done;
      }
      translation.FinishTranslation(false);
    }
    for (std::size_t i = 0; i < 20; ++i) {
      GeAliasGoal* goal = net->links[i].GetLinkGoal();
      EXPECT_TRUE(!goal || goal == &net->goals[i]);
      const Bool copied = net->links[i].CopyLinkTo(&net->copies[i], nullptr);
      EXPECT_EQ(copied, net->copies[i].GetLinkGoal() == goal);
      done = done && copied;
    }
    return done ? std::move(net) : nullptr;
  };
  EveryFailedAllocation(make, [](const auto& net) {
    std::vector<std::ptrdiff_t> ends;
    for (const auto& links : {net->links, net->copies}) {
      for (std::size_t i = 0; i < 20; ++i)
        ends.push_back(links[i].GetLinkGoal() ? links[i].GetLinkGoal() - net->goals : -1);
    }
    return ends;
  });
  EXPECT_EQ(CountReports(), 0);
}

TEST(Alias, NeedsLittleMemoryForARegistration)
{
  constexpr std::size_t kCount = 20000;
  std::vector<GeAliasGoal> goals(kCount);
  std::vector<GeAliasLink> links(kCount);
  std::vector<std::size_t> order(kCount);
  for (std::size_t i = 0; i < kCount; ++i)
    order[i] = i;
  std::shuffle(order.begin(), order.end(), std::mt19937(1));
  TransArray translation;
  counting_memory::ResetPeak();
  const counting_memory::Counts before = counting_memory::Get();
  for (std::size_t i : order) {
    translation.RegisterLink(order[i] + 1, links[order[i]], nullptr);
    translation.RegisterGoal(i + 1, goals[i]);
  }
  const counting_memory::Counts after = counting_memory::Get();
  // A link's place, and the trunk in a page.
  EXPECT_LT(after.allocations - before.allocations, static_cast<LLong>(kCount) * 11 / 10);
  EXPECT_LT(after.peakBytes - before.bytes, static_cast<LLong>(kCount) * 110);
  translation.FinishTranslation(false);
  for (std::size_t i = 0; i < kCount; ++i)
    EXPECT_EQ(links[i].GetLinkGoal(), &goals[i]);
}

} // namespace
