#include <thread>

#include "support/library.h"

namespace
{

// Numbers whose doubles (or floats) hold nothing behind their first two bytes.
std::string Numbers(std::initializer_list<int> heads, std::size_t size)
{
  ByteWriter writer;
  for (int head : heads) {
    writer.U16(static_cast<std::uint16_t>(head));
    writer.bytes.resize(writer.bytes.size() + size - 2);
  }
  return ToHex(writer.bytes);
}
constexpr std::initializer_list<int> kOneToTwelve = {0x3FF0, 0x4000, 0x4008, 0x4010, 0x4014, 0x4018,
                                                     0x401C, 0x4020, 0x4022, 0x4024, 0x4026, 0x4028};
constexpr std::initializer_list<int> kOneToTwelveFloats = {0x3F80, 0x4000, 0x4040, 0x4080, 0x40A0, 0x40C0,
                                                           0x40E0, 0x4100, 0x4110, 0x4120, 0x4130, 0x4140};
const Matrix kMatrix{{1, 2, 3}, {4, 5, 6}, {7, 8, 9}, {10, 11, 12}};

struct ValueCase
{
  const char* name;
  std::string hex;
  std::function<bool(HyperFile&)> write;
  std::function<bool(HyperFile&)> readsSame;
};

template <class Value, class Write, class Read>
ValueCase Case(const char* name, const std::string& hex, Value value, Write write, Read read)
{
  return {name, hex, [=](HyperFile& file) { return (file.*write)(value); },
          [=](HyperFile& file) {
            Value found{};
            return (file.*read)(found) && found == value;
          }};
}

bool ReadsMemory(HyperFile& file, std::string_view expected)
{
  void* data = nullptr;
  LLong size = -1;
  bool same = file.ReadMemory(data, size) && static_cast<std::size_t>(size) == expected.size() &&
              (size == 0 ? data == nullptr : std::memcmp(data, expected.data(), expected.size()) == 0);
  GeFree(data);
  return same;
}

bool WritesImage(HyperFile& file, std::string_view encoded)
{
  Bitmap image;
  image.SetEncoded(encoded.data(), static_cast<LLong>(encoded.size()));
  return file.WriteImage(encoded.empty() ? nullptr : &image, 1104, nullptr, 0);
}

bool ReadsImage(HyperFile& file, std::string_view encoded)
{
  Bitmap image;
  return file.ReadImage(image) && static_cast<std::size_t>(image.GetEncodedSize()) == encoded.size() &&
         (encoded.empty() || std::memcmp(image.GetEncoded(), encoded.data(), encoded.size()) == 0);
}

bool ReadsChunk(HyperFile& file, UChar tag, Long id, Long level)
{
  UChar found = 0;
  Long foundId = 0, foundLevel = 0;
  return file.ReadValueHeader(found) && found == tag &&
         (tag == 2 || (file.ReadChunkStart(foundId, foundLevel) && foundId == id && foundLevel == level));
}

// Chunk marks come last.
std::vector<ValueCase> ValueCases()
{
  using H = HyperFile;
  const Vector vector{1, -2, 0.5};
  const std::initializer_list<int> doubles = {0x3FF0, 0xC000, 0x3FE0};
  return {
      Case("Char", "0B FE", Char{-2}, &H::WriteChar, &H::ReadChar),
      Case("UChar", "0C C8", UChar{200}, &H::WriteUChar, &H::ReadUChar),
      Case("Word", "0D FE D4", Word{-300}, &H::WriteWord, &H::ReadWord),
      Case("UWord", "0E AB CD", UWord{0xABCD}, &H::WriteUWord, &H::ReadUWord),
      Case("Long", "0F FF FF FF FE", Long{-2}, &H::WriteLong, &H::ReadLong),
      Case("ULong", "10 89 AB CD EF", ULong{0x89ABCDEF}, &H::WriteULong, &H::ReadULong),
      Case("LLong", "11 01 02 03 04 05 06 07 08", LLong{0x0102030405060708}, &H::WriteLLong, &H::ReadLLong),
      Case("Real", "13 3F F4 CC CC CC CC CC CD", 1.3, &H::WriteReal, &H::ReadReal),
      Case("LReal", "14 C0 04 00 00 00 00 00 00", -2.5, &H::WriteLReal, &H::ReadLReal),
      Case("Bool", "15 01", true, &H::WriteBool, &H::ReadBool),
      Case("Time", "16" + Numbers({0x3FF0, 0x403E}, 8), BaseTime(1, 30), &H::WriteTime, &H::ReadTime),
      Case("Vector", "17" + Numbers(doubles, 8), vector, &H::WriteVector, &H::ReadVector),
      Case("LVector", "18" + Numbers(doubles, 8), vector, &H::WriteLVector, &H::ReadLVector),
      Case("Matrix", "19" + Numbers(kOneToTwelve, 8), kMatrix, &H::WriteMatrix, &H::ReadMatrix),
      Case("LMatrix", "1A" + Numbers(kOneToTwelve, 8), kMatrix, &H::WriteLMatrix, &H::ReadLMatrix),
      Case("SVector", "1B" + Numbers({0x3F80, 0xC000, 0x3F00}, 4), vector, &H::WriteSVector, &H::ReadSVector),
      Case("SMatrix", "1C" + Numbers(kOneToTwelveFloats, 4), kMatrix, &H::WriteSMatrix, &H::ReadSMatrix),
      Case("SReal", "1D 3F C0 00 00", 1.5F, &H::WriteSReal, &H::ReadSReal),
      Case("String", "82 00 00 00 06 00 41 00 E9 20 AC", String("A\u00E9\u20AC", STRINGENCODING_UTF8), &H::WriteString,
           &H::ReadString),
      Case("empty String", "82 00 00 00 00", String(), &H::WriteString, &H::ReadString),
      Case("Filename", "83 00 00 00 06 00 61 00 2E 00 71", Filename("a.q"), &H::WriteFilename, &H::ReadFilename),
      {"Memory", "80 00 00 00 03 61 62 63", [](H& f) { return f.WriteMemory("abc", 3); },
       [](H& f) { return ReadsMemory(f, "abc"); }},
      {"empty Memory", "80 00 00 00 00", [](H& f) { return f.WriteMemory(nullptr, 0); },
       [](H& f) { return ReadsMemory(f, ""); }},
      {"Image", "81 00 00 00 02 FF D8", [](H& f) { return WritesImage(f, "\xFF\xD8"); },
       [](H& f) { return ReadsImage(f, "\xFF\xD8"); }},
      {"empty Image", "81 00 00 00 00", [](H& f) { return WritesImage(f, ""); },
       [](H& f) { return ReadsImage(f, ""); }},
      {"chunk start", "01 00 01 AD C8 00 00 00 02", [](H& f) { return f.WriteChunkStart(110024, 2); },
       [](H& f) { return ReadsChunk(f, 1, 110024, 2); }},
      {"chunk end", "02", [](H& f) { return f.WriteChunkEnd(); }, [](H& f) { return ReadsChunk(f, 2, 0, 0); }},
  };
}

const Real kNan = std::numeric_limits<Real>::quiet_NaN();
const Real kInfinity = std::numeric_limits<Real>::infinity();

} // namespace

TEST(HyperFile, WritesEachValueInItsBytesAndReadsItBack)
{
  for (const ValueCase& value : ValueCases()) {
    SCOPED_TRACE(value.name);
    Bytes expected = FromHex(value.hex);
    EXPECT_EQ(ToHex(WriteToMemory([&](HyperFile& file) { EXPECT_TRUE(value.write(file)); })), ToHex(expected));
    MemoryReadFile read(WithHeader(expected));
    EXPECT_TRUE(value.readsSame(read.file));
    EXPECT_EQ(read.file.GetPosition(), static_cast<LLong>(13 + expected.size()));
  }
}

TEST(HyperFile, FailsCleanlyWhereverAValueIsCut)
{
  for (const ValueCase& value : ValueCases()) {
    Bytes whole = WithHeader(FromHex(value.hex));
    for (std::size_t size = 13; size < whole.size(); ++size) {
      SCOPED_TRACE(std::string(value.name) + " cut to " + std::to_string(size));
      MemoryReadFile read(Bytes(whole.begin(), whole.begin() + static_cast<std::ptrdiff_t>(size)));
      EXPECT_FALSE(value.readsSame(read.file));
      EXPECT_EQ(read.file.GetError(), FILEERROR_READ);
      EXPECT_LE(read.file.GetProblem().position, static_cast<LLong>(size));
    }
  }
}

TEST(HyperFile, RefusesAValueOfAnotherTagAndEverythingAfterIt)
{
  std::vector<ValueCase> cases = ValueCases();
  cases.resize(cases.size() - 2);
  for (const ValueCase& value : cases) {
    SCOPED_TRACE(value.name);
    MemoryReadFile read(ByteWriter().Header().Long(1).U8(18).I64(0).Long(2).bytes);
    Long number = 0;
    EXPECT_TRUE(read.file.ReadLong(number));
    EXPECT_FALSE(value.readsSame(read.file));
    EXPECT_EQ(read.file.GetError(), FILEERROR_WRONG_VALUE);
    EXPECT_EQ(read.file.GetProblem().position, 18);
    LLong position = read.file.GetPosition();
    EXPECT_FALSE(value.readsSame(read.file));
    EXPECT_EQ(read.file.GetPosition(), position) << "the file was touched after the error";
    EXPECT_EQ(CountReports(), 1);
  }
}

TEST(HyperFile, HoldsRealsAsFloatsInSinglePrecision)
{
  auto write = [](HyperFile& file) {
    file.WriteReal(1);
    file.WriteTime(BaseTime(1, 2));
    file.WriteVector({1, 2, 3});
    file.WriteMatrix(kMatrix);
    file.WriteLReal(1);
  };
  MemoryDescription description;
  Filename name;
  name.SetMemoryWrite(&description);
  HyperFile file;
  ASSERT_TRUE(file.Open(kBugsIdent, name, kHyperFileWrite));
  EXPECT_TRUE(file.IsSinglePrecision());
  write(file);
  ASSERT_TRUE(file.Close());
  const void* data = nullptr;
  LLong size = 0;
  ASSERT_TRUE(name.GetMemoryContinuous(data, size));
  const auto* first = static_cast<const std::uint8_t*>(data);
  Bytes written(first, first + size);
  EXPECT_EQ(ToHex(written), ToHex(FromHex("58 51 37 52 00 00 00 00 13 3F 80 00 00 16 3F 80 00 00 40 00 00 00 17" +
                                          Numbers({0x3F80, 0x4000, 0x4040}, 4) + "19" + Numbers(kOneToTwelveFloats, 4) +
                                          "14 3F F0 00 00 00 00 00 00")));
  MemoryReadFile read(written, 0);
  Real real = 0;
  BaseTime time;
  Vector vector;
  Matrix matrix;
  EXPECT_TRUE(read.file.ReadReal(real) && read.file.ReadTime(time) && read.file.ReadVector(vector) &&
              read.file.ReadMatrix(matrix));
  EXPECT_TRUE(real == 1 && time == BaseTime(1, 2) && vector == Vector(1, 2, 3) && matrix == kMatrix);
}

TEST(HyperFile, OpensEachMagicWithItsPrecision)
{
  EXPECT_EQ(ToHex(WriteToMemory([](HyperFile&) {}, true)), "51 51 37 52 51 37 52 36 00 00 32 C8 00");
  for (const auto& [magic, single] :
       {std::tuple<const char*, bool>{"YQ7R", false}, {"XQ7R", true}, {"6Q7R", true}, {"AQ7R", true}, {"8Q7R", true}}) {
    MemoryReadFile read(ByteWriter().Raw(magic).Raw("Q7R6").Long(5).bytes);
    Long value = 0;
    EXPECT_TRUE(read.opened && read.file.ReadLong(value) && value == 5) << magic;
    EXPECT_EQ(read.file.IsSinglePrecision(), single) << magic;
    EXPECT_EQ(read.file.GetFileVersion(), 6000) << magic;
  }
  for (std::uint8_t precision : FromHex("00 01 07")) {
    MemoryReadFile read(ByteWriter().Header("Vlek", 7499, precision).bytes, kPaintTextureIdent);
    EXPECT_TRUE(read.opened && read.file.IsBefore7500() && read.file.IsSinglePrecision() == (precision != 0));
  }
}

TEST(HyperFile, KeepsTheVersionOfAnEarlierFileThatTellsOne)
{
  MemoryReadFile read(ByteWriter().Header("Q7R6", 9420).bytes);
  Bytes old = ByteWriter().Raw("YQ7RQ7R6").bytes;
  Filename name;
  name.SetMemoryRead(old.data(), static_cast<LLong>(old.size()));
  EXPECT_TRUE(read.file.Open(kSceneIdent, name, kHyperFileRead) && read.file.GetFileVersion() == 9420);
}

TEST(HyperFile, RefusesADamagedHeaderAndClosesTheFile)
{
  Bytes whole = ByteWriter().Header().bytes;
  std::vector<Bytes> damaged = {ByteWriter().Header("Vlek").Long(1).bytes, ByteWriter().Raw("ZQ7RQ7R6").Long(1).bytes,
                                ByteWriter().Raw("QQ7Rq7r6").I32(13000).U8(0).Long(1).bytes};
  for (std::ptrdiff_t size = 0; size < 13; ++size)
    damaged.emplace_back(whole.begin(), whole.begin() + size);
  for (const Bytes& bytes : damaged) {
    SCOPED_TRACE(ToHex(bytes));
    MemoryReadFile read(bytes);
    EXPECT_FALSE(read.opened);
    EXPECT_EQ(read.file.GetError(), FILEERROR_WRONG_VALUE);
    UChar byte = 0;
    EXPECT_EQ(read.file.GetFile().ReadBytes(&byte, 1), 0) << "still open";
  }
  HyperFile file;
  EXPECT_FALSE(file.Open(kSceneIdent, "/no/such/folder/file.q7r", kHyperFileRead));
  EXPECT_EQ(file.GetError(), FILEERROR_OPEN);
}

TEST(HyperFile, CleansNumbersThatAreNotFinite)
{
  Bytes written = WriteToMemory([](HyperFile& file) {
    file.WriteReal(kNan);
    file.WriteLReal(-kInfinity);
    file.WriteSReal(std::numeric_limits<SReal>::infinity());
    file.WriteVector({kNan, 1, kInfinity});
    file.WriteSVector({1e300, 1, 2}); // too large for a float
  });
  EXPECT_EQ(ToHex(written), ToHex(FromHex("13 00 00 00 00 00 00 00 00 14 00 00 00 00 00 00 00 00 1D 00 00 00 00 17" +
                                          Numbers({0, 0x3FF0, 0}, 8) + "1B" + Numbers({0, 0x3F80, 0x4000}, 4))));
  MemoryReadFile read(ByteWriter().Header().Real(kNan).LReal(kInfinity).SReal(NAN).Vector(1, kNan, -kInfinity).bytes);
  Real real = 5, wide = 5;
  SReal narrow = 5;
  Vector vector;
  EXPECT_TRUE(read.file.ReadReal(real) && read.file.ReadLReal(wide) && read.file.ReadSReal(narrow) &&
              read.file.ReadVector(vector));
  EXPECT_TRUE(real == 0 && wide == 0 && narrow == 0 && vector == Vector(1, 0, 0));
}

TEST(HyperFile, ReadsWhatOlderAndSloppyWritersLeft)
{
  SReal narrow = 0;
  MemoryReadFile before(ByteWriter().Header("Q7R6", 11924).OldSReal(2.5F).bytes);
  EXPECT_TRUE(before.file.ReadFloat(narrow) && narrow == 2.5F);
  MemoryReadFile other(ByteWriter().Header().U8(21).U8(7).Block(130, {0, 65, 0}).Block(130, {9}).Long(3).bytes);
  Bool flag = false;
  String text, empty("former");
  Long next = 0;
  EXPECT_TRUE(other.file.ReadBool(flag) && other.file.ReadString(text) && other.file.ReadString(empty) &&
              other.file.ReadLong(next));
  EXPECT_TRUE(flag && text == String("A") && empty == String() && next == 3);
  MemoryReadFile large(ByteWriter().Header().U8(139).I64(2).Raw("xy").bytes);
  EXPECT_TRUE(ReadsMemory(large.file, "xy"));
}

TEST(HyperFile, TakesNoMemoryForALengthThatTheFileCannotHold)
{
  for (std::uint8_t tag : FromHex("80 81 82 83 8B")) {
    MemoryReadFile read(ByteWriter().Header().U8(tag).U32(0x7FFFFFF0).U32(0).bytes);
    LLong before = counting_memory::Get().bytes;
    counting_memory::ResetPeak();
    String text;
    Filename name;
    EXPECT_FALSE(tag == 129   ? ReadsImage(read.file, "")
                 : tag == 130 ? read.file.ReadString(text)
                 : tag == 131 ? read.file.ReadFilename(name)
                              : ReadsMemory(read.file, ""));
    EXPECT_EQ(read.file.GetProblem().code, FILEERROR_READ);
    EXPECT_EQ(counting_memory::Get().peakBytes, before) << int{tag};
  }
  MemoryReadFile read(ByteWriter().Header().Long(1).Long(2).bytes);
  EXPECT_TRUE(read.file.HasRoomFor(2, 5));
  EXPECT_FALSE(read.file.HasRoomFor(3, 5));
  EXPECT_FALSE(MemoryReadFile(ByteWriter().Header().Long(1).bytes).file.HasRoomFor(-1, 1));
}

TEST(HyperFile, TakesMemoryAsBytesComeWhereTheLengthIsUnknown)
{
  const std::string block(400000, 'n');
  ByteWriter writer;
  writer.Header().Memory(block).String(std::u16string(50000, u'x')).U8(130).U32(0xFFFFFFF0).Raw(block);
  NetworkListener listener;
  NetworkConnection near, far;
  ASSERT_TRUE(listener.Listen() && near.Connect("127.0.0.1", listener.GetPort()) && listener.Accept(far));
  near.SetTimeout(5000);
  far.SetTimeout(5000);
  std::thread sender([&] {
    Filename name;
    name.SetIpConnection(&far);
    BaseFile file;
    file.Open(name, kFileWrite);
    file.WriteBytes(writer.bytes.data(), static_cast<LLong>(writer.bytes.size()));
    file.Close();
  });
  Filename name;
  name.SetIpConnection(&near);
  HyperFile file;
  String text;
  ASSERT_TRUE(file.Open(kSceneIdent, name, kHyperFileRead));
  EXPECT_TRUE(ReadsMemory(file, block) && file.ReadString(text) && text == String(50000, u'x'));
  counting_memory::ResetPeak();
  EXPECT_FALSE(file.ReadString(text));
  EXPECT_EQ(file.GetError(), FILEERROR_READ);
  EXPECT_LT(counting_memory::Get().peakBytes, 4'000'000);
  sender.join();
}

TEST(HyperFile, KeepsStepAcrossTheBorderOfTheDiskBuffer)
{
  TempFolder folder;
  Filename path((folder / "values.q7r").c_str());
  const std::string block(700, 'm');
  HyperFile file;
  ASSERT_TRUE(file.Open(kSceneIdent, path, kHyperFileWrite));
  ByteWriter expected;
  expected.Header();
  for (Long i = 0; i < 700; ++i) {
    file.WriteLong(i);
    file.WriteString(String(i, u'x'));
    file.WriteVector({Real(i), 2, 3});
    file.WriteMemory(block.data(), i);
    expected.Long(i).String(std::u16string(static_cast<std::size_t>(i), u'x')).Vector(i, 2, 3);
    expected.Memory(std::string_view(block).substr(0, static_cast<std::size_t>(i)));
  }
  ASSERT_TRUE(file.Close());
  EXPECT_EQ(ReadWholeFile(folder / "values.q7r"), expected.bytes);
  ASSERT_TRUE(file.Open(kSceneIdent, path, kHyperFileRead));
  for (Long i = 0; i < 700; ++i) {
    Long number = 0;
    String text;
    Vector vector;
    ASSERT_TRUE(file.ReadLong(number) && file.ReadString(text) && file.ReadVector(vector));
    ASSERT_TRUE(number == i && text == String(i, u'x') && vector == Vector(i, 2, 3));
    ASSERT_TRUE(ReadsMemory(file, std::string_view(block).substr(0, static_cast<std::size_t>(i))));
  }
}

TEST(HyperFile, CallsTheProgressHooksAtTheirIntervals)
{
  const auto record = [](Long number, void* numbers) { static_cast<std::vector<Long>*>(numbers)->push_back(number); };
  std::vector<Long> positions;
  Bytes bytes = WriteToMemory(
      [&](HyperFile& file) {
        file.SetWriteProgress(record, &positions);
        for (int i = 0; i < 100001; ++i)
          file.WriteChar(1);
      },
      true);
  EXPECT_EQ(positions, (std::vector<Long>{13 + 2 * 50001, 13 + 2 * 100001}));

  bytes.resize(13 + 2 * 1000); // 2013 bytes: a call when the counter has reached 4, which then goes on from 1
  std::vector<Long> percents;
  MemoryReadFile read(bytes);
  read.file.SetReadProgress(record, &percents);
  Char value = 0;
  for (int i = 0; i < 1000; ++i)
    read.file.ReadChar(value);
  ASSERT_EQ(percents.size(), 249u); // with values 5, 9, 13, ... 997
  EXPECT_EQ(percents.front(), 1);   // at 23
  EXPECT_EQ(percents.back(), 99);   // at 2007
}

TEST(HyperFile, RefusesWhatDoesNotFitItsMode)
{
  WriteToMemory([](HyperFile& file) {
    Long value = 0;
    EXPECT_FALSE(file.ReadChunkEndMark());
    EXPECT_EQ(file.GetError(), FILEERROR_WRITE);
    EXPECT_FALSE(file.ReadLong(value));
  });
  MemoryReadFile read(ByteWriter().Header().Long(1).bytes);
  EXPECT_TRUE(read.file.ReadChunkEndMark());
  EXPECT_FALSE(read.file.WriteLong(1));
  EXPECT_EQ(read.file.GetError(), FILEERROR_INVALID);
  HyperFile closed;
  EXPECT_FALSE(closed.WriteLong(1));
}

TEST(HyperFile, ReportsTheLineOfEachFailure)
{
  const auto at = [](Long line) { return Reports{"k2v_file:" + std::to_string(line)}; };
  MemoryReadFile read(ByteWriter().Header().Long(1).bytes);
  Real number = 0;
  EXPECT_FALSE(read.file.ReadReal(number));
  EXPECT_EQ(CountReports(), 1);
  read.file.SetError(FILEERROR_MEMORY);
  EXPECT_EQ(TakeReports(), at(__LINE__ - 1));
  EXPECT_FALSE(MemoryReadFile(ByteWriter().Header().bytes).file.Fail(FILEERROR_MEMORY, 0));
  EXPECT_EQ(TakeReports(), at(__LINE__ - 1));
}
