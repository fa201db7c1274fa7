// Weights of joints: 16-bit values, runs that grow and split, and the forms of files.
#include "support/library.h"

namespace
{

std::string Runs(const JointWeightTable& table)
{
  std::string text;
  WeightRun run;
  for (Long i = 0; table.GetRun(i, run); ++i)
    text += std::to_string(run.first) + "-" + std::to_string(run.last) + "@" + std::to_string(run.offset) + " ";
  return text;
}

std::string Written(const JointWeightTable& table)
{
  return ToHex(WriteToMemory([&](HyperFile& file) { EXPECT_TRUE(table.Write(file)); }));
}

// The error of a read, 0 if all bytes were taken.
Long ReadTable(JointWeightTable& table, const Bytes& bytes, std::int32_t version = 13000)
{
  MemoryReadFile memory(ByteWriter().Header("Q7R6", version).Append(bytes).bytes);
  const bool read = table.Read(memory.file);
  EXPECT_EQ(read, memory.file.GetError() == 0);
  EXPECT_TRUE((!read || memory.file.GetFile().GetRemaining() == 0) && (read || table.GetRunCount() == 0));
  return memory.file.GetError();
}

ByteWriter TableOf(std::initializer_list<std::int32_t> runs, std::uint32_t values)
{
  ByteWriter writer;
  const auto count = static_cast<std::uint32_t>(runs.size());
  writer.Long(0).Long(0).Long(static_cast<std::int32_t>(count / 3));
  if (count > 0)
    writer.ArrayHead(3, count * 4);
  for (std::int32_t number : runs)
    writer.I32(number);
  writer.ULong(0).ULong(0).ULong(0).ULong(0).Long(0);
  if (count == 0)
    return writer;
  writer.Long(static_cast<std::int32_t>(values)).ArrayHead(2, values * 2);
  for (std::uint32_t i = 1; i <= values; ++i)
    writer.U16(static_cast<std::uint16_t>(i));
  return writer;
}

const std::string kEmptyList = "10 00000000 10 00000000 10 00000000 10 00000000 0F 00000000";

} // namespace

TEST(JointWeightTable, StoresWeightsInSixteenBits)
{
  const std::tuple<Real, Real> rows[] = {{1.0, 65535},
                                         {0.5, 32768},
                                         {2.0, 65535},
                                         {1e300, 65535},
                                         {1.0 / 65535, 1},
                                         {0.4999999 / 65535, 0},
                                         {0.5000001 / 65535, 1},
                                         {65534.4999 / 65535, 65534},
                                         {65534.5001 / 65535, 65535},
                                         {0.0, 0},
                                         {-1.0, 0},
                                         {-1e300, 0},
                                         {std::nan(""), 0}};
  JointWeightTable table;
  for (const auto& [weight, stored] : rows) {
    ASSERT_TRUE(table.WritePointWeight(7, weight));
    EXPECT_EQ(table.ReadPointWeight(7), stored / 65535.0) << weight;
    EXPECT_EQ(table.GetRunCount(), stored == 0 ? 0 : 1) << weight;
  }
  EXPECT_FALSE(table.WritePointWeight(-1, 1.0));
  EXPECT_EQ(table.ReadPointWeight(-1), 0.0);
}

TEST(JointWeightTable, LengthensJoinsShortensAndSplitsItsRuns)
{
  const std::tuple<Long, Real, const char*> steps[] = {{5, 1, "5-5@0 "},
                                                       {7, 1, "5-5@0 7-7@1 "},
                                                       {6, 1, "5-7@0 "},
                                                       {8, 1, "5-8@0 "},
                                                       {4, 1, "4-8@0 "},
                                                       {2147483647, 1, "4-8@0 2147483647-2147483647@5 "},
                                                       {6, 0, "4-5@0 7-8@2 2147483647-2147483647@4 "},
                                                       {0, 1, "0-0@0 4-5@1 7-8@3 2147483647-2147483647@5 "},
                                                       {4, 0, "0-0@0 5-5@1 7-8@2 2147483647-2147483647@4 "},
                                                       {8, 0, "0-0@0 5-5@1 7-7@2 2147483647-2147483647@3 "},
                                                       {5, 0, "0-0@0 7-7@1 2147483647-2147483647@2 "},
                                                       {5, 0, "0-0@0 7-7@1 2147483647-2147483647@2 "},
                                                       {2147483647, 0, "0-0@0 7-7@1 "},
                                                       {7, 0.5, "0-0@0 7-7@1 "}};
  JointWeightTable table;
  for (const auto& [point, weight, runs] : steps) {
    ASSERT_TRUE(table.WritePointWeight(point, weight));
    EXPECT_EQ(Runs(table), runs) << point;
  }
}

TEST(JointWeightTable, AgreesWithAPlainMapWhateverIsWritten)
{
  std::mt19937 random(11);
  JointWeightTable table;
  std::map<Long, Real> model;
  for (int i = 0; i < 4000; ++i) {
    if (i % 500 == 250) {
      ASSERT_TRUE(table.BeginEdit(20));
    }
    if (i % 500 == 350) {
      ASSERT_TRUE(table.EndEdit());
    }
    const Long point = static_cast<Long>(random() % 60);
    model[point] = static_cast<Real>(random() % 3 * (random() % 65536)) / 131070.0;
    ASSERT_TRUE(table.WritePointWeight(point, model[point]));
    model[point] = std::floor(model[point] * 65535 + 0.5) / 65535.0;
    const Long other = static_cast<Long>(random() % 70);
    ASSERT_EQ(table.ReadPointWeight(other), model.count(other) ? model[other] : 0.0) << i;
    if (i % 50 == 0) {
      // A file in between, and a copy, hold the same, also while the table is edited.
      JointWeightTable read;
      ASSERT_EQ(ReadTable(read, WriteToMemory([&](HyperFile& file) { table.Write(file); })), 0);
      JointWeightTable copy;
      ASSERT_TRUE(table.CopyTo(copy));
      EXPECT_EQ(copy.IsEdited(), table.IsEdited());
      for (Long j = 0; j < 70; ++j) {
        ASSERT_EQ(read.ReadPointWeight(j), table.ReadPointWeight(j)) << i;
        ASSERT_EQ(copy.ReadPointWeight(j), table.ReadPointWeight(j)) << i;
      }
    }
  }
}

TEST(JointWeightTable, StaysAsItWasWhenMemoryIsShort)
{
  JointWeightTable table;
  for (Long point = 0; point < 32; point += 2)
    ASSERT_TRUE(table.WritePointWeight(point, 1.0)); // the first capacity is used up
  const std::string before = Written(table);
  counting_memory::FailAfter(0);
  EXPECT_FALSE(table.WritePointWeight(40, 1.0) || table.BeginEdit(100));
  EXPECT_FALSE(counting_memory::WithoutMemory([&] { return table.WritePointWeight(40, 1.0); },
                                              1)); // the value found room, its run none
  EXPECT_EQ(Written(table), before);
  ASSERT_TRUE(table.BeginEdit(0));
  for (Long point = 1; point < 80; point += 2)
    ASSERT_TRUE(table.WritePointWeight(point, point % 4 == 1 ? 0.25 : 0.0));
  table.WritePointWeight(50, 0.25);
  const std::string edited = Written(table);
  EXPECT_FALSE(counting_memory::WithoutMemory([&] { return table.EndEdit(); }));
  EXPECT_EQ(Written(table), edited);
  EXPECT_TRUE(table.EndEdit());
  EXPECT_EQ(Written(table), edited);
}

TEST(JointWeightTable, WritesRunsListAndValues)
{
  JointWeightTable table;
  EXPECT_EQ(Written(table), ToHex(FromHex("0F 00000000 0F 00000000 0F 00000000" + kEmptyList)));
  table.WritePointWeight(4, 0.5);
  table.WritePointWeight(9, 1.0 / 65535);
  table.WritePointWeight(3, 1.0);
  EXPECT_EQ(Written(table), ToHex(FromHex("0F 00000000 0F 00000000 0F 00000002  8C 00000019 03"
                                          "00000003 00000004 00000000  00000009 00000009 00000002" +
                                          kEmptyList + "0F 00000003 8C 00000007 02 FFFF 8000 0001")));
  EXPECT_EQ(table.GetWeightCount(), 3);
}

TEST(JointWeightTable, ReadsPresentAndOldFilesAndKeepsWhatItDoesNotUse)
{
  const std::string head = "0F 0000000B 0F 0000000C 0F 00000001";
  const std::string runs = "00000003 00000004 00000000";
  const std::string list = "10 00000001 10 00000002 10 00000003 10 00000002 0F FFFFFFFC 0F 00000002";
  const std::string present = head + "8C 0000000D 03" + runs + list + "8C 00000009 03 00000007 FFFFFFF8" +
                              "0F 00000002 8C 00000005 02 FFFF 0001";
  const std::string old =
      head + "80 0000000C" + runs + list + "80 00000008 00000007 FFFFFFF8" + "0F 00000002 80 00000004 FFFF 0001";
  for (bool isOld : {false, true}) {
    JointWeightTable table;
    ASSERT_EQ(ReadTable(table, FromHex(isOld ? old : present), isOld ? 11599 : 13000), 0);
    EXPECT_EQ(table.ReadPointWeight(3), 1.0);
    EXPECT_EQ(table.ReadPointWeight(4), 1.0 / 65535);
    EXPECT_EQ(Written(table), ToHex(FromHex(present)));
    JointWeightTable copy;
    ASSERT_TRUE(table.CopyTo(copy));
    EXPECT_EQ(Written(copy), ToHex(FromHex(present)));
  }
  // The size of the values is twice their count, and runs and lists are as long as they say.
  const std::string start = head + "80 0000000C" + runs + kEmptyList;
  for (const char* bad : {"0F 00000002 80 00000005 FFFF 0001 00", "0F 00000003 80 00000004 FFFF 0001"}) {
    Bytes bytes = FromHex(start);
    const Bytes values = FromHex(bad);
    bytes.insert(bytes.end(), values.begin(), values.end());
    JointWeightTable table;
    EXPECT_EQ(ReadTable(table, bytes, 11599), -100);
  }
}

TEST(JointWeightTable, RefusesRunsThatAreNotSound)
{
  const std::uint32_t huge = 0xFFFFFFFFU;
  const std::pair<ByteWriter, bool> rows[] = {
      {TableOf({}, 0), true},
      {TableOf({3, 4, 0}, 2), true},
      {TableOf({3, 4, 1, 8, 8, 0}, 4), true}, // values in another order, and one too many
      {TableOf({3, 4, 0, 5, 5, 2}, 3), true}, // touching
      {TableOf({3, 4, 0}, 1), false},
      {TableOf({3, 4, -1}, 2), false},
      {TableOf({-1, 0, 0}, 2), false},
      {TableOf({4, 3, 0}, 2), false},
      {TableOf({3, 4, 0, 4, 4, 2}, 3), false},
      {TableOf({8, 8, 0, 3, 4, 1}, 3), false},
      {TableOf({3, 4, 0, 5, 6, 0}, 3), false}, // values of two runs
      {TableOf({0, 2147483647, 0}, 2), false},
      {TableOf({0, 0, 2147483647}, 2), false},
      {ByteWriter().Long(0).Long(0).Long(2147483647).ArrayHead(3, 12).Append(Bytes(40)), false},
      {ByteWriter().Long(0).Long(0).Long(-1).ArrayHead(3, 12).Append(Bytes(40)), false},
      {ByteWriter().Long(0).Long(0).Long(0).ULong(0).ULong(0).ULong(0).ULong(huge).Long(0).Long(-1), false},
      {ByteWriter().Long(0).Long(0).Long(0).ULong(0).ULong(0).ULong(0).ULong(2).Long(0).Long(1).ArrayHead(3, 4).I32(1),
       false},
  };
  for (const auto& [bytes, sound] : rows) {
    SCOPED_TRACE(ToHex(bytes.bytes));
    JointWeightTable table;
    Long error = 1;
    EXPECT_LT(counting_memory::PeakOf([&, &body = bytes.bytes] { error = ReadTable(table, body); }), 100000);
    EXPECT_EQ(error, sound ? 0 : -100);
  }
  // Values in another order stay so in a file until one changes.
  JointWeightTable table;
  ASSERT_EQ(ReadTable(table, rows[2].first.bytes), 0);
  EXPECT_EQ(Written(table), ToHex(rows[2].first.bytes));
  EXPECT_EQ(table.GetWeightCount(), 3);
  EXPECT_EQ(table.ReadPointWeight(3), 2 / 65535.0);
  ASSERT_TRUE(table.WritePointWeight(5, 9 / 65535.0));
  EXPECT_EQ(Runs(table), "3-5@0 8-8@3 ");
  const Real expected[] = {2, 3, 9, 0, 0, 1};
  for (Long i = 0; i < 6; ++i)
    EXPECT_EQ(table.ReadPointWeight(3 + i), expected[i] / 65535.0) << i;
}
