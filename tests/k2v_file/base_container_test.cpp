#include "support/library.h"

namespace
{

// "id:value id:value ..." of Longs, walked by the iterator.
std::string Listed(const BaseContainer& container)
{
  std::string text;
  BaseContainer::Iterator iterator;
  Long id = 0;
  const GeData* value = nullptr;
  for (Bool more = container.BrowseFirst(iterator, id, value); more; more = container.BrowseNext(iterator, id, value))
    text += std::to_string(id) + ":" + std::to_string(value->GetLong()) + " ";
  return text;
}

// How far the change counter moves.
UWord Changes(BaseContainer& container, const std::function<void()>& action)
{
  const UWord before = container.GetDirty();
  action();
  return static_cast<UWord>(container.GetDirty() - before);
}

// One element of that value, then the same value or another one set: the changes counted.
UWord ChangesOfSetting(const GeData& stored, const GeData& value)
{
  BaseContainer container;
  container.InsertData(1, stored);
  return Changes(container, [&] { EXPECT_NE(container.SetData(1, value), nullptr); });
}

TEST(BaseContainer, KeepsTheOrderOfInsertionAndDoubleIds)
{
  BaseContainer container(9);
  GeData* first = container.InsertData(5, GeData(1));
  container.InsertData(-7, GeData(2));
  container.InsertData(5, GeData(3));
  GeData* last = container.InsertDataAfter(6, GeData(4), first);
  EXPECT_EQ(Listed(container), "5:1 6:4 -1:2 5:3 ");
  container.InsertDataAfter(8, GeData(5), nullptr);
  container.InsertDataAfter(9, GeData(6), container.GetIndexData(4));
  container.InsertData(10, GeData(7));
  EXPECT_EQ(Listed(container), "8:5 5:1 6:4 -1:2 5:3 9:6 10:7 ");
  EXPECT_TRUE(container.FindIndex(5) == 1 && container.FindIndex(-7) == -1);
  EXPECT_TRUE(container.GetIndexId(3) == -1 && container.GetIndexData(2) == last);
  EXPECT_TRUE(!container.GetIndexData(7) && !container.GetIndexData(-1));
  EXPECT_TRUE(container.RemoveData(5));
  EXPECT_TRUE(container.RemoveIndex(5)); // the last
  EXPECT_FALSE(container.RemoveIndex(5) || container.RemoveData(77));
  container.InsertData(11, GeData(8));
  EXPECT_EQ(Listed(container), "8:5 6:4 -1:2 5:3 9:6 11:8 ");
  EXPECT_EQ(container.GetCount(), 6);
  EXPECT_EQ(Changes(container, [&] { container.Flush(); }), 6);
  EXPECT_EQ(container.GetId(), 9);
  EXPECT_EQ(Listed(container), "");
  container.InsertDataAfter(1, GeData(1), nullptr);
  container.InsertData(2, GeData(2));
  EXPECT_EQ(Listed(container), "1:1 2:2 ");
}

TEST(BaseContainer, KeepsAnElementsTypeBetweenLongAndReal)
{
  BaseContainer container;
  container.InsertData(1, GeData(1.5));
  container.InsertData(2, GeData(7));
  container.SetLong(1, 4);
  container.SetReal(2, -3.9);
  EXPECT_TRUE(container.GetData(1).GetType() == kDataReal && container.GetReal(1) == 4.0);
  EXPECT_TRUE(container.GetData(2).GetType() == kDataLong && container.GetLong(2) == -3);
  container.SetString(2, String("x"));
  EXPECT_EQ(container.GetData(2).GetType(), kDataString);
  container.SetLong(2, 1);
  EXPECT_EQ(container.GetData(2).GetType(), kDataLong);
}

TEST(BaseContainer, CountsOnlyWhatChangesAValue)
{
  const Real one = 1.0, close = std::bit_cast<Real>(std::bit_cast<LLong>(one) + 7),
             far = std::bit_cast<Real>(std::bit_cast<LLong>(one) + 8), nan = std::nan("");
  EXPECT_EQ(ChangesOfSetting(GeData(one), GeData(close)), 0);
  EXPECT_EQ(ChangesOfSetting(GeData(one), GeData(far)), 1);
  EXPECT_EQ(ChangesOfSetting(GeData(0.0), GeData(-0.0)), 1);
  EXPECT_EQ(ChangesOfSetting(GeData(nan), GeData(nan)), 0);
  EXPECT_EQ(ChangesOfSetting(GeData(Vector(one, 2, 3)), GeData(Vector(close, 2, 3))), 0);
  EXPECT_EQ(ChangesOfSetting(GeData(Vector(1, 2, one)), GeData(Vector(1, 2, far))), 1);
  EXPECT_EQ(ChangesOfSetting(GeData(String("a")), GeData(String("a"))), 1);
  EXPECT_EQ(ChangesOfSetting(GeData(Filename("a")), GeData(Filename("A"))), 0);
  EXPECT_EQ(ChangesOfSetting(GeData(1), GeData(1)), 0);
  EXPECT_EQ(ChangesOfSetting(GeData(1), GeData(1.0)), 1);
  EXPECT_EQ(ChangesOfSetting(GeData(BaseContainer(1)), GeData(BaseContainer(1))), 0);
  EXPECT_EQ(ChangesOfSetting(GeData(BaseContainer(1)), GeData(BaseContainer(2))), 1);
  BaseContainer container;
  EXPECT_EQ(Changes(container, [&] { container.SetReal(1, one); }), 1);
  container.SetReal(1, close); // stored although it doesn't count
  EXPECT_EQ(container.GetReal(1), close);
  container.SaveDirty();
  EXPECT_FALSE(container.IsDirty());
  EXPECT_EQ(Changes(container, [&] { container.RemoveData(2); }), 0);
  EXPECT_EQ(Changes(container, [&] { container.RemoveData(1); }), 1);
  EXPECT_TRUE(container.IsDirty());
}

TEST(BaseContainer, TakesValuesThatLieInItself)
{
  BaseContainer container, inner(3);
  inner.SetString(1, String("deep"));
  inner.SetContainer(2, BaseContainer(4));
  container.SetContainer(5, inner);
  GeData* stored = container.FindData(5);
  EXPECT_EQ(Changes(container, [&] { EXPECT_EQ(container.SetData(5, *stored), stored); }), 0);
  EXPECT_EQ(CountReports(), 1);
  container.InsertData(6, *stored);
  EXPECT_EQ(container.GetContainerInstance(6)->GetString(1), String("deep"));
  container.SetContainer(6, container); // a copy of the whole inside of itself
  EXPECT_EQ(container.GetContainerInstance(6)->GetContainerInstance(6)->GetId(), 3);
  container.SetData(5, *stored->GetContainer()->FindData(1));
  EXPECT_EQ(container.GetString(5), String("deep"));
  EXPECT_TRUE(container.GetContainerInstance(6)->CopyTo(container, 0, nullptr)); // out of itself
  EXPECT_TRUE(container.GetCount() == 2 && container.GetContainerInstance(5)->GetCount() == 2);
  BaseContainer* nested = container.GetContainerInstance(5);
  EXPECT_TRUE(container.CopyTo(*nested, 0, nullptr)); // into itself
  EXPECT_EQ(container.GetContainerInstance(5)->GetContainerInstance(5)->GetId(), 3);
  container = std::move(*container.GetContainerInstance(6));
  EXPECT_TRUE(container.GetId() == 3 && container.GetString(1) == String("deep"));
  EXPECT_EQ(CountReports(), 0);
}

TEST(BaseContainer, ComparesIdOrderTypesAndValues)
{
  BaseContainer a(1), b(1);
  EXPECT_TRUE(a.IsEqual(b));
  a.SetLong(1, 2);
  EXPECT_FALSE(a.IsEqual(b));
  b.SetLong(1, 2);
  a.SetPointer(3, this);
  b.SetPointer(3, this);
  EXPECT_TRUE(a.IsEqual(b));
  BaseContainer real(1);
  real.SetReal(1, 2.0);
  real.SetPointer(3, this);
  EXPECT_FALSE(a.IsEqual(real)); // a Long and a Real are equal, but not here
  b.SetId(2);
  EXPECT_FALSE(a.IsEqual(b));
  BaseContainer copy(a);
  EXPECT_TRUE(copy.IsEqual(a));
  copy.SetString(4, String("x"));
  EXPECT_FALSE(copy.IsEqual(BaseContainer(copy))); // texts never are
}

TEST(BaseContainer, GivesTheDefaultOnlyForAnAbsentId)
{
  BaseContainer container;
  container.SetString(1, String("x"));
  EXPECT_EQ(container.GetLong(2, 8), 8);
  EXPECT_EQ(container.GetVector(2, Vector(1, 2, 3)), Vector(1, 2, 3));
  EXPECT_EQ(container.GetString(2, String("d")), String("d"));
  EXPECT_EQ(CountReports(), 0);
  EXPECT_TRUE(container.GetLong(1, 8) == 0 && container.GetContainerInstance(1) == nullptr);
  EXPECT_EQ(CountReports(), 2);
  EXPECT_EQ(container.GetData(2).GetType(), kDataNil);
}

TEST(BaseContainer, WalksAParameterPath)
{
  BaseContainer group(1), container;
  group.SetLong(3, 33);
  group.SetVector(4, Vector(1, 2, 3));
  container.SetContainer(2, group);
  container.SetLong(3, 30);
  container.SetVector(4, Vector(7, 8, 9));
  const std::pair<ParameterPath, GeData> cases[] = {
      {ParameterPath(3), GeData(30)},
      {ParameterPath(99), GeData()},
      {ParameterPath({2, 5, 0}, {3, 15, 0}), GeData(33)},
      {ParameterPath({2, 5, 0}, {99, 15, 0}), GeData()},
      {ParameterPath({99, 5, 0}, {3, 15, 0}), GeData()},
      {ParameterPath({4, 23, 0}, {1001, 19, 0}), GeData(8.0)},
      {ParameterPath({4, 23, 0}, {1003, 19, 0}), GeData()},
      {ParameterPath({2, 5, 0}, {4, 23, 0}, {1002, 19, 0}), GeData(3.0)}, // of the group, not of the top
      {ParameterPath({3, 15, 0}, {4, 19, 0}), GeData(30)},
      {ParameterPath({2, 5, 0}, {4, 15, 0}, {1, 15, 0}), GeData(group)}, // back to the first level's id
  };
  for (const auto& [path, wanted] : cases) {
    GeData value(12345);
    EXPECT_TRUE(container.GetParameter(path, value));
    EXPECT_TRUE(value.IsEqual(wanted)) << path[0].id << " " << path[1].id;
  }
  GeData value;
  EXPECT_FALSE(container.GetParameter(ParameterPath(), value));
}

TEST(BaseContainer, SetsAParameterByItsPathAndMakesWhatIsMissing)
{
  BaseContainer container;
  container.SetString(2, String("in the way"));
  EXPECT_TRUE(container.SetParameter(ParameterPath({2, 5, 0}, {3, 5, 0}, {4, 15, 0}), GeData(44)));
  EXPECT_EQ(container.GetContainerInstance(2)->GetContainerInstance(3)->GetLong(4), 44);
  EXPECT_EQ(container.GetCount(), 1);
  BaseContainer* group = container.GetContainerInstance(2);
  const ParameterPath component({2, 5, 0}, {5, 23, 0}, {1001, 19, 0});
  EXPECT_GE(Changes(container, [&] { EXPECT_TRUE(container.SetParameter(component, GeData(6))); }), 1);
  EXPECT_EQ(group->GetVector(5), Vector(0, 6, 0));
  EXPECT_EQ(group->GetCount(), 2); // the component leaves no entry of its own
  EXPECT_TRUE(container.SetParameter(ParameterPath({5, 23, 0}, {1005, 19, 0}), GeData(6.0)));
  EXPECT_EQ(container.FindData(5), nullptr);
  EXPECT_TRUE(container.SetParameter(ParameterPath({8, 15, 0}, {9, 15, 0}), GeData(1)));
  EXPECT_EQ(container.GetLong(8), 1);
  EXPECT_FALSE(container.SetParameter(ParameterPath(), GeData(1)));
  // The value may lie in an element that a new group takes the place of.
  EXPECT_TRUE(container.SetParameter(ParameterPath({8, 5, 0}, {1, 15, 0}), *container.FindData(8)));
  EXPECT_EQ(container.GetContainerInstance(8)->GetLong(1), 1);
}

// A container in a container in a container ..., of that depth, as a file holds it.
ByteWriter Nested(int depth)
{
  ByteWriter bytes;
  bytes.Header();
  for (int i = 0; i < depth; ++i)
    bytes.Start(132, 1).Long(i).Long(1).Long(i + 1 < depth ? 132 : 0);
  for (int i = 0; i < depth; ++i)
    bytes.End();
  return bytes;
}

TEST(BaseContainer, ReadsWritesCopiesComparesAndFreesDeepNesting)
{
  const std::vector<std::uint8_t> bytes = Nested(HyperFile::kMaxLoopDepth).bytes;
  MemoryReadFile source(bytes);
  BaseContainer container;
  ASSERT_TRUE(source.file.ReadContainer(container, true));
  BaseContainer copy(container);
  EXPECT_TRUE(copy.IsEqual(container));
  EXPECT_EQ(WriteToMemory([&](HyperFile& file) { EXPECT_TRUE(file.WriteContainer(copy)); }, true), bytes);

  BaseContainer endless; // freeing has no limit
  for (int i = 0; i < 100000; ++i) {
    BaseContainer outer;
    GeData value;
    value.SetType(kDataContainer);
    *value.GetContainer() = std::move(endless);
    outer.InsertData(1, std::move(value));
    endless = std::move(outer);
  }
}

TEST(BaseContainer, GivesNullAndStaysAsItWasWhenMemoryRunsOut)
{
  BaseContainer container;
  for (Long i = 0; i < 6; ++i)
    container.InsertData(i, GeData(String("text")));
  const GeData text(String("another"));
  const auto changed = [](BaseContainer& target, bool done) {
    EXPECT_TRUE(done || (target.GetCount() == 1 && target.GetLong(1) == 1)); // all or as before
    return done;
  };
  EveryFailedAllocation([&] {
    const GeData* inserted = container.InsertData(9, text);
    EXPECT_EQ(container.GetCount(), inserted ? 7 : 6);
    container.RemoveData(9);
    return inserted != nullptr;
  });
  EveryFailedAllocation([&] {
    BaseContainer target(1);
    return target.InsertData(1, GeData(1)) && changed(target, container.CopyTo(target, 0, nullptr));
  });
  EveryFailedAllocation([&] {
    BaseContainer target(1);
    const ParameterPath path({2, 5, 0}, {3, 5, 0}, {4, 15, 0});
    return target.SetParameter(path, text) && target.FindData(2);
  });
  EveryFailedAllocation([&] {
    BaseContainer* clone = container.GetClone(0, nullptr);
    const bool made = clone != nullptr;
    EXPECT_TRUE(!made || clone->GetCount() == 6);
    DeleteObj(clone);
    return made;
  });
}

TEST(ParameterPathTest, MatchesWithWildcardsUpToTheEndOfTheOther)
{
  const ParameterPath one({1, 0, 0}), typed({1, 19, 7}), two({1, 5, 0}, {2, 15, 0}), other({1, 5, 0}, {3, 15, 0});
  EXPECT_TRUE(one == typed);
  EXPECT_FALSE(ParameterPath({1, 15, 0}) == typed || one.IsExactly(typed));
  EXPECT_TRUE(typed.IsExactly(ParameterPath(typed)));
  EXPECT_FALSE(two == other || two == one);
  EXPECT_TRUE(ParameterPath({1, 5, 0}, {0, 0, 0}, {3, 0, 0}) == one); // what is behind the end plays no part
  EXPECT_EQ(two[-1].id, 2);
  EXPECT_EQ(ParameterPath({1, 5, 0}, {0, 0, 0})[-1].id, 1);
  EXPECT_EQ(two[2], ParameterLevel());
  EXPECT_EQ(ParameterPath({1, 5, 0}, {0, 0, 0}, {3, 0, 0}).GetLevelCount(), 1);
}

TEST(ParameterPathTest, WritesItsLevelsAndReadsThoseOfOlderFiles)
{
  ParameterPath path({903, 23, 0}, {1000, 19, 5});
  EXPECT_EQ(ToHex(WriteToMemory([&](HyperFile& file) { path.Write(file); })),
            "01 00 00 00 01 00 00 00 02 0F 00 00 00 02 0F 00 00 03 87 0F 00 00 00 17 0F 00 00 00 00 "
            "0F 00 00 03 E8 0F 00 00 00 13 0F 00 00 00 05 02");
  const std::tuple<ByteWriter, bool, std::vector<ParameterLevel>> cases[] = {
      {ByteWriter().Start(1, 0).End(), true, {}},
      {ByteWriter().Start(1, 1).Long(1).Long(3).Long(19).End(), true, {{3, 19, 0}}},
      {ByteWriter().Start(1, 3).Long(1).Long(3).Long(19).Long(8).String(u"new").End(), true, {{3, 19, 8}}},
      {ByteWriter().Start(1, 2).Long(-4).End(), true, {}},
      {ByteWriter().Start(1, 2).Long(2147483647).Long(3).Long(19).Long(8).End(), false, {}},
      {ByteWriter().Start(2, 2).Long(0).End(), false, {}},
      {ByteWriter().Start(1, -1).End(), false, {}},
  };
  for (const auto& [body, isRead, levels] : cases) {
    MemoryReadFile source(ByteWriter().Header().Append(body.bytes).bytes);
    ParameterPath read(5);
    EXPECT_EQ(read.Read(source.file), isRead) << ToHex(body.bytes);
    if (!isRead)
      continue;
    ASSERT_EQ(read.GetStoredCount(), static_cast<Long>(levels.size()));
    for (std::size_t i = 0; i < levels.size(); ++i)
      EXPECT_EQ(read[static_cast<Long>(i)], levels[i]);
    EXPECT_EQ(source.file.GetPosition(), source.file.GetLength());
  }
}

TEST(ParameterPathTest, KeepsManyLevelsThroughCopiesMovesAndFailures)
{
  ParameterPath path;
  for (Long i = 1; i <= 20; ++i)
    EXPECT_TRUE(path.Append(i == 10 ? path[0] : ParameterLevel{i, i, i}));
  ParameterPath copy(path), shorter(3);
  EXPECT_TRUE(copy.IsExactly(path));
  shorter = copy;
  ParameterPath moved(std::move(copy));
  EXPECT_TRUE(moved.IsExactly(shorter));
  EXPECT_TRUE(moved.WithoutFirst(18)[0].id == 19 && moved[9].id == 1);
  counting_memory::FailAfter(0);
  ParameterPath failed(path);
  Bool appended = true;
  for (int i = 0; appended && i < 20; ++i)
    appended = path.Append({1, 1, 1});
  counting_memory::FailNever();
  EXPECT_EQ(failed.GetStoredCount(), 0);
  EXPECT_FALSE(appended);
}

} // namespace
