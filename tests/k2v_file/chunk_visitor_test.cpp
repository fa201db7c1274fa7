#include "source/k2v_file/stream/chunk_visitor.h"
#include "support/library.h"

namespace
{

enum class Kind : UWord
{
  kPlain = 0,
  kFancy = 40000,
};

struct Sample
{
  Long number = 0;
  bool flag = false;
  Long wideFlag = 0;
  Kind kind = Kind::kPlain;
  Real length = 0;
  Vector place;
  Matrix frame;
  BaseTime time;
  String name;
  Filename path;
  BaseContainer data;
  GeAliasLink link;
  GeAliasGoal goal;
  void* block = nullptr;
  LLong blockSize = 0;
  UChar small = 0;
  Word word = 0;
  LLong large = 0;
  SReal narrow = 0;

  ~Sample() { GeFree(block); }

  template <class Visitor>
  Bool Visit(Visitor& v)
  {
    v.Long(number);
    v.Bool(flag);
    v.Bool(wideFlag);
    v.LongInto(kind);
    v.ConstantReal(1.0);
    v.Real(length);
    v.Vector(place);
    v.Matrix(frame);
    v.Time(time);
    v.String(name);
    v.EmptyContainer();
    v.Container(data);
    if (v.VersionBelow(7500))
      v.template Skip<Real, Vector, BaseContainer>();
    v.Goal(goal);
    if (v.Level() < 2)
      return v.Good();
    v.Filename(path);
    v.Memory(block, blockSize);
    v.UChar(small);
    v.Word(word);
    v.LLong(large);
    v.SReal(narrow);
    v.ConstantLong(-1);
    v.EmptyString();
    return v.Good();
  }
};

ByteWriter FirstLevel(bool old)
{
  ByteWriter writer;
  writer.Long(5).Bool(true).Bool(true).Long(40000).Real(1).Real(2.5).Vector(1, 2, 3).IdentityMatrix();
  writer.Time(1, 30).String(u"n").Start(132, 1).Long(0).End().Start(132, 1).Long(8).Long(1).Long(15).Long(3).End();
  if (old)
    writer.Real(7).Vector(7, 7, 7).Start(132, 1).Long(7).End();
  return writer.UChar(0);
}

bool Read(HyperFile& file, Long level, Sample& sample)
{
  return ReadChunkBody(file, level, [&](auto& v) { return sample.Visit(v); });
}

} // namespace

TEST(ChunkVisitor, WritesAndReadsARecordByOneList)
{
  Sample sample;
  sample.number = 5;
  sample.flag = true;
  sample.wideFlag = 12;
  sample.kind = Kind::kFancy;
  sample.length = 2.5;
  sample.place = {1, 2, 3};
  sample.time = BaseTime(1, 30);
  sample.name = String("n");
  sample.path = Filename("p");
  sample.data = BaseContainer(8);
  sample.data.SetLong(1, 3);
  sample.block = GeAlloc(2);
  sample.blockSize = 2;
  sample.small = 200;
  sample.word = -2;
  sample.large = 1LL << 40;
  sample.narrow = 0.5F;
  ByteWriter second;
  second.Filename(u"p").Memory(Bytes{0, 0}).UChar(200).Word(-2).LLong(1LL << 40).SReal(0.5F).Long(-1).String(u"");
  Bytes written = WriteToMemory(
      [&](HyperFile& file) { EXPECT_TRUE(WriteChunk(file, 110050, 2, [&](auto& v) { return sample.Visit(v); })); });
  ByteWriter expected;
  expected.Start(110050, 2).Append(FirstLevel(false).bytes).Append(second.bytes).End();
  EXPECT_EQ(ToHex(written), ToHex(expected.bytes));

  // Behind the values that are known stands one of a newer writer.
  MemoryReadFile read(
      ByteWriter().Header().Append(FirstLevel(false).bytes).Append(second.bytes).Vector(1, 1, 1).End().Long(77).bytes);
  Sample found;
  Long next = 0;
  ASSERT_TRUE(Read(read.file, 2, found) && read.file.ReadLong(next) && next == 77);
  EXPECT_TRUE(found.number == 5 && found.flag && found.wideFlag == 1 && found.kind == Kind::kFancy);
  EXPECT_TRUE(found.length == 2.5 && found.place == Vector(1, 2, 3) && found.time == BaseTime(1, 30));
  EXPECT_TRUE(found.name == String("n") && found.path == Filename("p") && found.data.GetLong(1) == 3);
  EXPECT_TRUE(found.blockSize == 2 && found.small == 200 && found.word == -2 && found.large == 1LL << 40);
  EXPECT_EQ(found.narrow, 0.5F);
}

TEST(ChunkVisitor, DropsValuesThatOnlyOldFilesHold)
{
  MemoryReadFile read(ByteWriter().Header("Q7R6", 7499).Append(FirstLevel(true).bytes).End().Long(77).bytes);
  Sample found;
  Long next = 0;
  EXPECT_TRUE(Read(read.file, 1, found) && read.file.ReadLong(next) && next == 77);
  EXPECT_TRUE(found.number == 5 && found.data.GetLong(1) == 3 && found.small == 0);
}

TEST(ChunkVisitor, StopsAtTheFirstFailureAndKeepsWhatItDidNotReach)
{
  MemoryReadFile read(ByteWriter().Header().Long(5).Bool(true).Real(1).Bool(true).End().bytes);
  Sample found;
  found.wideFlag = 9;
  EXPECT_FALSE(Read(read.file, 2, found));
  EXPECT_TRUE(found.number == 5 && found.flag && found.wideFlag == 9 && found.length == 0);
  EXPECT_EQ(read.file.GetError(), FILEERROR_WRONG_VALUE);
  // A container can fail without setting the file's error: nothing more may be read all the same.
  MemoryReadFile stray(ByteWriter().Header().Start(132, 1).Long(5).Real(1).Real(2).bytes);
  BaseContainer container;
  Real unread = 0;
  EXPECT_FALSE(ReadChunkBody(stray.file, 0, [&](auto& v) {
    v.Container(container);
    v.Real(unread);
  }));
  EXPECT_TRUE(unread == 0 && stray.file.GetError() == FILEERROR_NONE);
}
