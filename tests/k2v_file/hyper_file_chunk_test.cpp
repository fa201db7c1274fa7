// Skipping, raw chunks and containers.
#include "support/library.h"

namespace
{

// The bytes behind each tag: with Reals of 8 bytes and of 4.
struct BodyRow
{
  std::uint8_t tag;
  std::size_t wide, narrow;
};
constexpr BodyRow kBodies[] = {{11, 1, 1},   {12, 1, 1},   {13, 2, 2},   {14, 2, 2},   {15, 4, 4},
                               {16, 4, 4},   {17, 8, 8},   {18, 8, 8},   {19, 8, 4},   {20, 8, 8},
                               {21, 1, 1},   {22, 16, 8},  {23, 24, 12}, {24, 24, 24}, {25, 96, 48},
                               {26, 96, 96}, {27, 12, 12}, {28, 48, 48}, {29, 4, 4}};

// A body that is taken for tags of no meaning if it isn't passed over as a whole.
ByteWriter& Filler(ByteWriter& writer, std::size_t size)
{
  writer.bytes.resize(writer.bytes.size() + size, 0x09);
  return writer;
}

bool SkipsTo77(HyperFile& file)
{
  Long next = 0;
  return file.SkipToEndChunk() && file.ReadLong(next) && next == 77;
}

// A chunk's rest: one value of each kind, a nested chunk, and the end tag.
Bytes OneOfEach(bool single)
{
  ByteWriter writer;
  for (const BodyRow& row : kBodies)
    Filler(writer.U8(row.tag), single ? row.narrow : row.wide);
  writer.Start(5, 1).Start(6, 0).Long(1).End().End();
  for (std::uint8_t tag = 128; tag <= 140; ++tag)
    Filler(writer.U8(tag).U32(tag == 139 ? 0 : 300), tag == 139 ? 0 : 300);
  return writer.End().bytes;
}

Bytes SmallContainerBytes() { return Record("[132,1 L9 L1 L15 L-7 L2 L132 [132,1 L10 L4 L19 R1.5 ] L1 L130 Sab ]"); }

} // namespace

TEST(HyperFileSkip, PassesOverEveryValueInMemoryAndOnDisk)
{
  TempFolder folder;
  Filename path((folder / "skip.q7r").c_str());
  for (std::uint8_t precision : FromHex("00 01")) {
    Bytes rest = OneOfEach(precision != 0);
    ByteWriter writer;
    writer.Header("Q7R6", 13000, precision);
    const int kRepeats = 30; // more than the file buffer holds
    for (int i = 0; i < kRepeats; ++i)
      writer.Append(rest).Long(77);
    WriteWholeFile(folder / "skip.q7r", writer.bytes);
    MemoryReadFile read(writer.bytes);
    HyperFile disk;
    ASSERT_TRUE(disk.Open(kSceneIdent, path, kHyperFileRead));
    for (int i = 0; i < kRepeats; ++i)
      ASSERT_TRUE(SkipsTo77(read.file) && SkipsTo77(disk)) << i;
  }
}

TEST(HyperFileSkip, CountsSomeOldArraysByAnotherElementSize)
{
  const std::tuple<std::int32_t, std::uint8_t, std::uint8_t, std::uint32_t, std::size_t> rows[] = {
      {11924, 0, 133, 25, 50},   {11925, 0, 133, 25, 25},   {11924, 1, 133, 25, 25},  {11924, 0, 136, 100, 168},
      {11925, 0, 136, 100, 100}, {11924, 1, 136, 100, 100}, {11924, 0, 134, 100, 100}};
  for (const auto& [version, precision, tag, length, body] : rows) {
    ByteWriter writer;
    writer.Header("Q7R6", version, precision).U8(tag).U32(length);
    MemoryReadFile read(Filler(writer, body).End().Long(77).bytes);
    EXPECT_TRUE(SkipsTo77(read.file)) << version << " " << int{tag};
  }
  // Of a large memory block only the upper half of the length is read.
  MemoryReadFile large(ByteWriter().Header().U8(139).I64(3).Raw("abc").End().Long(77).bytes);
  EXPECT_FALSE(large.file.SkipToEndChunk());
  EXPECT_EQ(large.file.GetError(), FILEERROR_PREMATURE_END);
}

TEST(HyperFileSkip, TellsAChunkThatDoesNotEnd)
{
  const std::tuple<Bytes, Long, Long> rows[] = {
      {ByteWriter().Long(1).bytes, FILEERROR_NONE, FILEERROR_NONE}, // ends between values: no error
      {ByteWriter().Start(1, 1).End().bytes, FILEERROR_NONE, FILEERROR_NONE},
      {{}, FILEERROR_PREMATURE_END, FILEERROR_READ},
      {ByteWriter().Long(1).U8(15).U8(0).bytes, FILEERROR_PREMATURE_END, FILEERROR_READ},
      {ByteWriter().U8(128).U32(0xFFFFFFFF).I64(0).bytes, FILEERROR_PREMATURE_END, FILEERROR_READ},
      {ByteWriter().U8(30).End().bytes, FILEERROR_PREMATURE_END, FILEERROR_WRONG_VALUE},
      {ByteWriter().U8(141).U32(0).End().bytes, FILEERROR_PREMATURE_END, FILEERROR_WRONG_VALUE},
      {ByteWriter().U8(0).End().bytes, FILEERROR_PREMATURE_END, FILEERROR_WRONG_VALUE},
  };
  TempFolder folder;
  Filename path((folder / "cut.q7r").c_str());
  for (const auto& [rest, error, cause] : rows) {
    SCOPED_TRACE(ToHex(rest));
    MemoryReadFile read(WithHeader(rest));
    WriteWholeFile(folder / "cut.q7r", WithHeader(rest));
    HyperFile disk;
    ASSERT_TRUE(disk.Open(kSceneIdent, path, kHyperFileRead));
    for (HyperFile* file : {&read.file, &disk}) {
      EXPECT_FALSE(file->SkipToEndChunk());
      EXPECT_EQ(file->GetError(), error);
      EXPECT_EQ(file->GetProblem().code, cause);
    }
  }
}

TEST(HyperFileSkip, HasNoLimitOfDepth)
{
  ByteWriter writer;
  writer.Header();
  for (int i = 0; i < 200000; ++i)
    writer.Start(1, 0);
  writer.bytes.resize(writer.bytes.size() + 200001, 2);
  MemoryReadFile read(writer.Long(77).bytes);
  EXPECT_TRUE(SkipsTo77(read.file) && read.file.GetChunkDepth() == -1);
}

TEST(HyperFileRawChunk, ComesBackByteForByte)
{
  for (bool withoutEnd : {false, true}) {
    for (bool empty : {false, true}) {
      ByteWriter body;
      if (!empty)
        body.Append(OneOfEach(false));
      Bytes rest = empty ? ByteWriter().End().bytes : body.bytes;
      MemoryReadFile read(ByteWriter().Header().Append(rest).Long(77).bytes);
      void* data = nullptr;
      LLong size = 0;
      Long next = 0;
      ASSERT_TRUE(read.file.ReadRawChunk(data, size, withoutEnd));
      EXPECT_TRUE(read.file.ReadLong(next) && next == 77) << "the end tag was not consumed";
      EXPECT_EQ(size, static_cast<LLong>(rest.size()) - (withoutEnd ? 1 : 0));
      EXPECT_EQ(data == nullptr, size == 0);
      Bytes written = WriteToMemory([&](HyperFile& file) { file.WriteRawChunk(data, size, withoutEnd); });
      if (withoutEnd)
        written.push_back(2);
      EXPECT_EQ(ToHex(written), ToHex(rest));
      GeFree(data);
    }
  }
  EXPECT_EQ(ToHex(WriteToMemory([](HyperFile& file) { file.WriteRawChunk(nullptr, 0, false); })), "02");
  EXPECT_EQ(ToHex(WriteToMemory([](HyperFile& file) { file.WriteRawChunk(nullptr, 0, true); })), "");
}

TEST(HyperFileRawChunk, FailsWithoutALeakWhereverItIsCut)
{
  Bytes whole = ByteWriter().Header().Long(1).Memory("abc").End().bytes;
  for (std::size_t size = 13; size < whole.size(); ++size) {
    MemoryReadFile read(Bytes(whole.begin(), whole.begin() + static_cast<std::ptrdiff_t>(size)));
    void* data = nullptr;
    LLong count = 0;
    bool between = size == 18 || size == 26; // the walk then ends without an error
    EXPECT_EQ(read.file.ReadRawChunk(data, count, false), between) << size;
    GeFree(data);
  }
}

TEST(HyperFileContainer, WritesEveryKindThatCanBeReadAgain)
{
  BaseContainer container(9);
  container.SetLong(1, -7);
  container.SetPointer(3, &container);
  container.InsertData(3, GeData())->SetType(kDataRawBlock);
  BaseContainer nested(10);
  nested.SetReal(4, 1.5);
  container.SetContainer(2, nested);
  container.InsertData(1, GeData(String("ab")));
  Bytes written = WriteToMemory([&](HyperFile& file) { EXPECT_TRUE(file.WriteContainer(container)); });
  EXPECT_EQ(ToHex(written), ToHex(SmallContainerBytes()));
  EXPECT_EQ(ToHex(Bytes(written.begin(), written.begin() + 24)),
            "01 00 00 00 84 00 00 00 01 0F 00 00 00 09 0F 00 00 00 01 0F 00 00 00 0F");
  MemoryReadFile read(ByteWriter().Header().Append(written).Long(77).bytes);
  BaseContainer found;
  found.SetLong(50, 1);
  Long next = 0;
  EXPECT_TRUE(read.file.ReadContainer(found, true) && read.file.ReadLong(next) && next == 77);
  ASSERT_EQ(found.GetCount(), 3);
  EXPECT_EQ(found.GetId(), 9);
  EXPECT_TRUE(found.GetLong(1) == -7 && found.GetContainerInstance(2)->GetReal(4) == 1.5 &&
              found.GetIndexData(2)->GetString() == String("ab"));
}

TEST(HyperFileContainer, ReplacesElementsUnlessItIsFlushed)
{
  MemoryReadFile read(WithHeader(SmallContainerBytes()));
  BaseContainer container(1);
  container.SetReal(1, 3.5);
  container.SetLong(50, 1);
  EXPECT_TRUE(read.file.ReadContainer(container, false));
  ASSERT_EQ(container.GetCount(), 3); // 1, which was read twice, 50 and 2
  EXPECT_TRUE(container.GetString(1) == String("ab") && container.GetLong(50) == 1 && container.FindData(2));
}

TEST(HyperFileContainer, RefusesWhatIsNoContainer)
{
  const std::tuple<const char*, bool, Long> rows[] = {{"[132,0 L5 ]", true, FILEERROR_NONE},
                                                      {"[133,1 L5 ]", false, FILEERROR_WRONG_VALUE},
                                                      {"L5", false, FILEERROR_WRONG_VALUE},
                                                      {"[132,1 R5 ]", false, FILEERROR_WRONG_VALUE},
                                                      {"[132,1 L5 R1 ]", false, FILEERROR_NONE}};
  for (const auto& [values, good, error] : rows) {
    SCOPED_TRACE(values);
    MemoryReadFile read(WithHeader(Record(values)));
    BaseContainer container(3);
    EXPECT_EQ(read.file.ReadContainer(container, true), good);
    EXPECT_EQ(read.file.GetError(), error);
    if (good) { // a level below 1 leaves the rest unread
      Long unread = 0;
      EXPECT_TRUE(container.GetId() == 3 && read.file.ReadLong(unread) && unread == 5);
    }
  }
}

TEST(HyperFileContainer, LimitsTheDepthOfNesting)
{
  for (int depth : {HyperFile::kMaxLoopDepth, HyperFile::kMaxLoopDepth + 1, 100000}) {
    for (bool legacy : {false, true}) {
      ByteWriter writer;
      writer.Header("Q7R6", 13000);
      for (int i = 0; i < depth; ++i) {
        if (legacy)
          writer.U8(132).U32(0).Long(1).I32(2).U8(i + 1 < depth ? 132 : 128);
        else
          writer.Start(132, 1).Long(1).Long(2).Long(i + 1 < depth ? 132 : 0);
      }
      for (int i = 0; i < depth; ++i)
        legacy ? writer.I32(-1).U8(3) : writer.End();
      MemoryReadFile read(writer.bytes);
      BaseContainer container;
      bool fits = depth <= HyperFile::kMaxLoopDepth;
      EXPECT_EQ(read.file.ReadContainer(container, true), fits) << depth << legacy;
      EXPECT_EQ(read.file.GetError(), fits ? FILEERROR_NONE : FILEERROR_TOO_DEEP);
      EXPECT_TRUE(!fits || read.file.GetPosition() == static_cast<LLong>(writer.bytes.size()));
    }
  }
}

TEST(HyperFileContainer, ReadsTheOldFormOfEveryKind)
{
  auto compose = [](std::int32_t endId) {
    ByteWriter writer;
    writer.Header("Q7R6", 7000).U8(132).U32(12345).Long(9);
    writer.I32(1).U8(15).Long(-7).I32(2).U8(19).Real(1.5).I32(3).U8(22).Time(1, 25).I32(4).U8(23).Vector(1, 2, 3);
    writer.I32(5).U8(25).IdentityMatrix().I32(6).U8(128).I32(7).U8(130).String(u"ab").I32(8).U8(131).Filename(u"f");
    writer.I32(9).U8(132).U8(132).U32(0).Long(20).I32(1).U8(15).Long(8).I32(-1).U8(3);
    writer.I32(10).U8(99).I32(1).U8(15).Long(11); // 99: no kind that is known
    return writer.I32(endId).U8(3).Long(77).bytes;
  };
  for (bool flush : {true, false}) {
    MemoryReadFile read(compose(-1));
    BaseContainer container, former(5);
    former.SetLong(30, 3);
    container.SetContainer(9, former);
    Long next = 0;
    ASSERT_TRUE(read.file.ReadContainer(container, flush) && read.file.ReadLong(next) && next == 77);
    EXPECT_EQ(CountReports(), 1);
    EXPECT_EQ(container.GetId(), 9);
    EXPECT_EQ(container.GetCount(), flush ? 10 : 9);
    EXPECT_EQ(container.GetLong(1), flush ? -7 : 11);
    EXPECT_TRUE(container.GetReal(2) == 1.5 && container.GetTime(3) == BaseTime(1, 25) &&
                container.GetVector(4) == Vector(1, 2, 3) && container.GetMatrix(5) == Matrix());
    EXPECT_TRUE(container.FindIndex(6) >= 0 && container.GetData(6).GetType() == kDataNil);
    EXPECT_TRUE(container.GetString(7) == String("ab") && container.GetFilename(8) == Filename("f"));
    // A nested container that is there is filled up, not replaced.
    const BaseContainer* nested = container.GetContainerInstance(9);
    ASSERT_TRUE(nested);
    EXPECT_TRUE(nested->GetId() == 20 && nested->GetLong(1) == 8 && (nested->GetLong(30) == 3) == !flush);
  }
  MemoryReadFile wrongEnd(compose(0));
  BaseContainer container;
  EXPECT_FALSE(wrongEnd.file.ReadContainer(container, true));
}

// Old containers with many entries, with many containers, and with one container in many parts: the work grows as the
// file does.
TEST(HyperFileContainer, FindsTheElementsOfOldContainersWithoutASearch)
{
  const int count = 20000;
  const auto end = [](ByteWriter& writer) { writer.I32(-1).U8(3); };
  const auto open = [](ByteWriter& writer, int id) { writer.I32(id).U8(132).U8(132).U32(0).Long(1); };
  for (int shape = 0; shape < 4; ++shape) {
    ByteWriter writer;
    writer.Header("Q7R6", 7000).U8(132).U32(0).Long(9);
    if (shape == 0)
      open(writer, 5);
    for (int i = count; i > 0; --i) {
      if (shape > 0)
        open(writer, shape == 1 ? i : 5);
      if (shape > 1)
        open(writer, shape == 2 ? i : 6);
      writer.I32(i).U8(15).Long(i);
      for (int level = 0; level < shape && level < 2; ++level)
        end(writer);
    }
    if (shape == 0)
      end(writer);
    end(writer);
    MemoryReadFile read(writer.bytes);
    BaseContainer container;
    ASSERT_TRUE(read.file.ReadContainer(container, true)) << shape;
    EXPECT_LE(read.file.GetLookupCount(), 12LL * count) << shape;
    const BaseContainer* inner = shape == 1 ? &container : container.GetContainerInstance(5);
    inner = shape == 3 ? inner->GetContainerInstance(6) : inner;
    EXPECT_TRUE(inner->GetCount() == count && inner->GetIndexId(0) == count);
  }
}
