// Array values, and the arrays of old files.
#include "support/library.h"

#ifndef _WIN32
#include <sys/stat.h>
#endif

#include <future>

namespace
{

constexpr LLong kSizes[] = {0, 1, 2, 4, 8, 4, 8, 8};

struct ArrayCase
{
  Long type;
  const char* elements; // two of them, as they lie in this machine's memory
  const char* hex;
};

constexpr ArrayCase kArrayCases[] = {
    {kArrayByte, "01 FF", "8C 00 00 00 03 01 01 FF"},
    {kArrayWord, "02 01 FE FF", "8C 00 00 00 05 02 01 02 FF FE"},
    {kArrayLong, "04 03 02 01 FE FF FF FF", "8C 00 00 00 09 03 01 02 03 04 FF FF FF FE"},
    {kArrayLLong, "08 07 06 05 04 03 02 01 00 00 00 00 00 00 00 80",
     "8C 00 00 00 11 04 01 02 03 04 05 06 07 08 80 00 00 00 00 00 00 00"},
    {kArraySReal, "00 00 80 3F 00 00 20 C0", "8C 00 00 00 09 05 3F 80 00 00 C0 20 00 00"},
    {kArrayLReal, "00 00 00 00 00 00 F0 3F 00 00 00 00 00 00 04 C0",
     "8C 00 00 00 11 06 3F F0 00 00 00 00 00 00 C0 04 00 00 00 00 00 00"},
    {kArrayReal, "00 00 00 00 00 00 F0 3F 00 00 00 00 00 00 04 C0",
     "8C 00 00 00 11 06 3F F0 00 00 00 00 00 00 C0 04 00 00 00 00 00 00"},
};

void Collect(Long number, void* numbers) { static_cast<std::vector<Long>*>(numbers)->push_back(number); }

} // namespace

TEST(HyperFileArray, WritesAndReadsEachTypeInItsBytesAtAnyStride)
{
  for (const ArrayCase& row : kArrayCases) {
    LLong size = kSizes[row.type];
    for (LLong stride : {size, size + 3}) {
      SCOPED_TRACE("type " + std::to_string(row.type) + " stride " + std::to_string(stride));
      Bytes elements = FromHex(row.elements);
      Bytes memory(static_cast<std::size_t>(2 * stride), 0xAA);
      std::copy_n(elements.begin(), size, memory.begin());
      std::copy_n(elements.begin() + size, size, memory.begin() + stride);
      Bytes hex = FromHex(row.hex);
      EXPECT_EQ(ToHex(WriteToMemory([&](HyperFile& file) { file.WriteArray(memory.data(), row.type, stride, 2); })),
                ToHex(hex));
      Bytes found(memory.size(), 0xAA);
      MemoryReadFile read(WithHeader(hex));
      EXPECT_TRUE(read.file.ReadArray(found.data(), row.type, stride, 2));
      EXPECT_EQ(ToHex(found), ToHex(memory));

      Bytes old = hex; // the type first, then the plain length
      std::swap(old[1], old[5]);
      old[5] = static_cast<std::uint8_t>(2 * size);
      old[4] = 0;
      std::fill(found.begin(), found.end(), std::uint8_t{0xAA});
      MemoryReadFile before(WithHeader(old, 11903));
      EXPECT_TRUE(before.file.ReadArray(found.data(), row.type, stride, 2));
      EXPECT_EQ(ToHex(found), ToHex(memory));
    }
  }
}

TEST(HyperFileArray, ConvertsFloatsAndDoublesAndNothingElse)
{
  for (std::uint8_t stored = 0; stored <= 8; ++stored) {
    for (Long wanted = 0; wanted <= 8; ++wanted) {
      Long plain = wanted == 7 ? 6 : wanted;
      LLong size = stored >= 1 && stored <= 6 ? kSizes[stored] : 8;
      ByteWriter writer;
      writer.Header().ArrayHead(stored, 8);
      for (int i = 0; i < 8; ++i)
        writer.U8(0x41); // a float of about 12, a double of about 2261634
      Bytes bytes = writer.Long(77).bytes;
      bool valid = stored >= 1 && stored <= 6 && wanted >= 1 && wanted <= 7;
      bool fits = valid && (stored == plain || (stored >= 5 && plain >= 5));
      SCOPED_TRACE("stored " + std::to_string(stored) + " wanted " + std::to_string(wanted));
      MemoryReadFile read(bytes);
      Real memory[8] = {};
      EXPECT_EQ(read.file.ReadArray(memory, wanted, fits ? kSizes[wanted] : 8, 8 / size), fits);
      Long next = 0;
      EXPECT_EQ(read.file.ReadLong(next) && next == 77, fits);
      EXPECT_EQ(read.file.GetError(), fits ? FILEERROR_NONE : FILEERROR_WRONG_VALUE);
      if (fits && stored == 5 && plain == 6) {
        EXPECT_TRUE(memory[0] == 12.078431129455566 && memory[1] == memory[0]);
      }
      SReal first = 0;
      std::copy_n(reinterpret_cast<const char*>(memory), sizeof first, reinterpret_cast<char*>(&first));
      if (fits && stored == 6 && plain == 5) {
        EXPECT_EQ(first, static_cast<SReal>(2261634.5098039214));
      }
    }
  }
}

TEST(HyperFileArray, CleansNumbersThatAreNotFinite)
{
  const Real wide[] = {1, std::nan(""), -std::numeric_limits<Real>::infinity()};
  const SReal narrow[] = {std::numeric_limits<SReal>::infinity(), 2};
  EXPECT_EQ(WriteToMemory([&](HyperFile& file) {
              file.WriteArray(wide, kArrayReal, 8, 3);
              file.WriteArray(narrow, kArraySReal, 4, 2);
            }),
            ByteWriter().ArrayHead(6, 24).F64(1).F64(0).F64(0).ArrayHead(5, 8).F32(0).F32(2).bytes);
  MemoryReadFile read(
      ByteWriter().Header().ArrayHead(6, 24).F64(wide[1]).F64(wide[2]).F64(1).ArrayHead(6, 16).F64(1e300).F64(3).bytes);
  Real doubles[3] = {9, 9, 9};
  SReal floats[2] = {9, 9};
  EXPECT_TRUE(read.file.ReadArray(doubles, kArrayLReal, 8, 3) && read.file.ReadArray(floats, kArraySReal, 4, 2));
  EXPECT_TRUE(doubles[0] == 0 && doubles[1] == 0 && doubles[2] == 1 && floats[0] == 0 && floats[1] == 3);
}

// Elements that stand close are taken in blocks, those further apart one by one.
TEST(HyperFileArray, TakesBlocksAsItTakesSingleElements)
{
  constexpr LLong kCount = 613;
  std::mt19937 random(7);
  for (const Long type : {kArrayByte, kArrayWord, kArrayLong, kArrayLLong, kArraySReal, kArrayLReal}) {
    SCOPED_TRACE(type);
    const auto size = static_cast<std::size_t>(kSizes[type]);
    Bytes close(kCount * size);
    Bytes apart(kCount * size * 2, 0xAA);
    for (std::size_t i = 0; i < close.size(); ++i) {
      const bool high = i % size + 2 >= size && i / size % 3 == 0; // of an infinity or a number that is none
      close[i] = high ? std::uint8_t{0xFF} : static_cast<std::uint8_t>(random());
      apart[i / size * size * 2 + i % size] = close[i];
    }
    auto write = [&](const Bytes& from, LLong stride) {
      return WriteToMemory([&](HyperFile& file) { file.WriteArray(from.data(), type, stride, kCount); });
    };
    Bytes written = write(close, kSizes[type]);
    EXPECT_TRUE(written == write(apart, 2 * kSizes[type]));
    std::copy(close.begin(), close.end(), written.begin() + 6); // unclean in the file too
    MemoryReadFile first(WithHeader(written)), second(WithHeader(written));
    ASSERT_TRUE(first.file.ReadArray(close.data(), type, kSizes[type], kCount));
    ASSERT_TRUE(second.file.ReadArray(apart.data(), type, 2 * kSizes[type], kCount));
    for (std::size_t i = 0; i < close.size(); ++i)
      ASSERT_EQ(close[i], apart[i / size * size * 2 + i % size]) << i;
  }
}

TEST(HyperFileArray, RefusesACountOrLengthThatDoesNotMatch)
{
  // length: as it stands in the file
  for (const auto& [length, count, error] : {std::tuple<ULong, LLong, Long>{9, 3, -100},
                                             {9, 1, -100},
                                             {9, -2, -100},
                                             {0, 0, -100},
                                             {0xFFFFFFFF, 2, -100},
                                             {0xFFFFFFFD, 0x3FFFFFFF, FILEERROR_READ},
                                             {13, 3, FILEERROR_READ}}) {
    SCOPED_TRACE(length);
    MemoryReadFile read(ByteWriter().Header().U8(140).U32(length).U8(3).I32(1).I32(2).bytes);
    Long memory[2] = {};
    EXPECT_FALSE(read.file.ReadArray(memory, kArrayLong, 4, count));
    EXPECT_EQ(read.file.GetError(), error);
    EXPECT_EQ(read.file.GetProblem().position, 13);
  }
  for (Long type : {0, 8, -1}) {
    EXPECT_TRUE(WriteToMemory([&](HyperFile& file) {
                  EXPECT_FALSE(file.WriteArray(&type, type, 4, 1));
                  EXPECT_EQ(file.GetError(), FILEERROR_WRONG_VALUE);
                }).empty());
  }
  EXPECT_TRUE(WriteToMemory([&](HyperFile& file) {
                EXPECT_FALSE(file.WriteArray(kSizes, kArrayLReal, 0, 0x20000000)); // 4 GB
                EXPECT_EQ(file.GetError(), FILEERROR_WRONG_VALUE);
              }).empty());
}

TEST(HyperFileArray, PutsAndTakesLongColumnsTogetherAsOneByOne)
{
  constexpr LLong kRows = 100000;
  std::vector<Vector> points(kRows);
  for (std::size_t i = 0; i < points.size(); ++i)
    points[i] = {std::sin(double(i)), double(i), i % 1000 == 0 ? std::nan("") : -1.5 * double(i)};
  const auto note = [](Long place, void* list) { static_cast<std::vector<Long>*>(list)->push_back(place); };
  std::vector<Long> oneByOne; // where progress is told
  const Bytes whole = WithHeader(WriteToMemory([&](HyperFile& file) {
    file.SetWriteProgress(note, &oneByOne);
    file.WriteChar(1);
    for (Real* first : {&points[0].x, &points[0].y, &points[0].z})
      file.WriteArray(first, kArrayReal, sizeof(Vector), kRows);
    file.WriteLong(5);
  }));
  const TempFolder folder;
  std::vector<std::string> paths = {folder / "columns.q7r", folder / "told.q7r"}; // the second tells its progress
#ifndef _WIN32
  paths.push_back(folder / "pipe");
  paths.push_back("/dev/full");
  ASSERT_EQ(mkfifo(paths[2].c_str(), 0600), 0);
  auto piped = std::async(std::launch::async, [&] { return ReadWholeFile(paths[2]); });
#endif
  for (std::size_t i = 0; i < paths.size(); ++i) {
    SCOPED_TRACE(paths[i]);
    HyperFile file;
    ASSERT_TRUE(file.Open(kSceneIdent, Filename(paths[i].c_str()), kHyperFileWrite));
    std::vector<Long> told;
    if (i == 1)
      file.SetWriteProgress(note, &told);
    file.WriteChar(1);
    const Bool written = file.WriteColumns(points.data(), kArrayReal, sizeof(Vector), kRows, 3, sizeof(Real));
    EXPECT_EQ(file.WriteLong(5) && file.Close(), i < 3);
    EXPECT_EQ(written, i < 3);
    EXPECT_EQ(told, i == 1 ? oneByOne : std::vector<Long>());
    EXPECT_EQ(file.GetError(), i < 3 ? FILEERROR_NONE : FILEERROR_WRITE);
    EXPECT_TRUE(i > 1 || ReadWholeFile(paths[i]) == whole);
  }
#ifndef _WIN32
  EXPECT_TRUE(piped.get() == whole);
#endif
  const std::size_t last = whole.size() - 5 - (6 + 8 * kRows); // where the last column begins
  // What is damaged, by how much, and how many bytes are left of the file.
  for (const auto& [place, change, left] : {std::tuple<std::size_t, int, std::size_t>{last, 0, whole.size()},
                                            {last, 1, whole.size()},
                                            {last + 4, 8, whole.size()},
                                            {last + 5, -1, whole.size()},
                                            {last, 0, last + 400000},
                                            {last, 0, last + 3}}) {
    SCOPED_TRACE(::testing::Message() << place << ' ' << change << ' ' << left);
    Bytes bytes(whole.begin(), whole.begin() + static_cast<std::ptrdiff_t>(left));
    if (place < left)
      bytes[place] = static_cast<std::uint8_t>(bytes[place] + change);
    WriteWholeFile(folder / "columns.q7r", bytes);
    const Filename path((folder / "columns.q7r").c_str());
    std::vector<Vector> together(kRows);
    std::vector<Vector> single(kRows);
    HyperFile files[2];
    for (HyperFile& file : files) {
      Char one = 0;
      ASSERT_TRUE(file.Open(kSceneIdent, path, kHyperFileRead) && file.ReadChar(one));
    }
    const Bool read = files[0].ReadColumns(together.data(), kArrayReal, sizeof(Vector), kRows, 3, sizeof(Real));
    for (Real* first : {&single[0].x, &single[0].y, &single[0].z})
      files[1].ReadArray(first, kArrayReal, sizeof(Vector), kRows);
    EXPECT_EQ(files[0].GetError(), files[1].GetError());
    EXPECT_EQ(files[0].GetProblem().position, files[1].GetProblem().position);
    EXPECT_EQ(read, change == 0 && left == whole.size());
    Long five = 0;
    EXPECT_TRUE(!read || (together == single && files[0].ReadLong(five) && five == 5));
  }
}

TEST(HyperFileArray, PassesLargeArraysThroughPiecesOnDisk)
{
  TempFolder folder;
  Filename path((folder / "array.q7r").c_str());
  std::vector<Vector> points(30000);
  ByteWriter expected;
  expected.Header().Char(1).ArrayHead(6, 720000);
  for (std::size_t i = 0; i < points.size(); ++i) {
    points[i] = {std::sin(double(i)), double(i), -1.5 * double(i)};
    expected.F64(points[i].x).F64(points[i].y).F64(points[i].z);
  }
  expected.ArrayHead(5, 120000);
  for (const Vector& point : points)
    expected.F32(static_cast<float>(point.y));
  expected.Long(5);
  WriteWholeFile(folder / "array.q7r", expected.bytes);
  HyperFile file;
  Char one = 0;
  Long five = 0;
  std::vector<Vector> found(points.size());
  std::vector<Vector> heights(points.size());
  ASSERT_TRUE(file.Open(kSceneIdent, path, kHyperFileRead) && file.ReadChar(one));
  ASSERT_TRUE(file.ReadArray(found.data(), kArrayReal, 8, 90000));
  ASSERT_TRUE(file.ReadArray(&heights[0].y, kArrayReal, sizeof(Vector), 30000));
  ASSERT_TRUE(file.ReadLong(five) && five == 5);
  EXPECT_EQ(found, points);
  for (std::size_t i = 0; i < points.size(); ++i)
    ASSERT_EQ(heights[i].y, points[i].y);

  std::vector<SReal> floats(points.size());
  for (std::size_t i = 0; i < points.size(); ++i)
    floats[i] = static_cast<SReal>(points[i].y);
  ASSERT_TRUE(file.Open(kSceneIdent, path, kHyperFileWrite) && file.WriteChar(1));
  ASSERT_TRUE(file.WriteArray(points.data(), kArrayReal, 8, 90000));
  ASSERT_TRUE(file.WriteArray(floats.data(), kArraySReal, 4, 30000));
  ASSERT_TRUE(file.WriteLong(5) && file.Close());
  EXPECT_TRUE(ReadWholeFile(folder / "array.q7r") == expected.bytes);
}

TEST(HyperFileArray, CountsEveryElementForTheProgressHooks)
{
  std::vector<UChar> elements(120000, 1);
  std::vector<Long> positions;
  Bytes bytes = WriteToMemory(
      [&](HyperFile& file) {
        file.WriteArray(elements.data(), kArrayByte, 1, 120000); // counted, though nobody listens yet
        file.SetWriteProgress(Collect, &positions);
        file.WriteChar(1);
        file.WriteArray(elements.data(), kArrayByte, 1, 120000);
      },
      true);
  // Of 50001, 100001, 150001, ... values in all, two were due before anybody listened.
  const Long first = 13 + 6 + 120000 + 2 + 6;
  EXPECT_EQ(positions, (std::vector<Long>{first + 30000, first + 80000}));

  // By the rule, value by value: a call when the counter has reached the threshold, from where it goes on at 1.
  std::vector<Long> expected;
  const auto length = static_cast<LLong>(bytes.size());
  LLong counter = 0;
  auto tick = [&](LLong position, bool listening) {
    if (counter >= length / 500) {
      if (listening)
        expected.push_back(static_cast<Long>(100 * position / length));
      counter = 0;
    }
    ++counter;
  };
  for (Long i = 1; i <= 120000; ++i)
    tick(19 + i, false);
  tick(19 + 120000 + 2, true);
  for (Long i = 1; i <= 120000; ++i)
    tick(first + i, true);
  MemoryReadFile read(bytes);
  std::vector<Long> percents;
  Char one = 0;
  ASSERT_TRUE(read.file.ReadArray(elements.data(), kArrayByte, 1, 120000));
  read.file.SetReadProgress(Collect, &percents);
  ASSERT_TRUE(read.file.ReadChar(one) && read.file.ReadArray(elements.data(), kArrayByte, 1, 120000));
  EXPECT_EQ(percents, expected);
}

TEST(HyperFileLegacyArray, ReadsEachKindInBothPrecisions)
{
  for (std::uint8_t precision : FromHex("00 01")) {
    ByteWriter writer;
    writer.Header("Q7R6", 6500, precision);
    writer.U8(133).U32(2 * 12 + 5).RawReal(1).RawReal(2).RawReal(3).RawReal(-1).RawReal(0).RawReal(0.5);
    writer.U8(134).U32(16).I32(1).U16(1).U16(2).U16(3).U16(0xFFFF).U16(5).U16(6).U16(7).U16(8);
    writer.U8(134).U32(16).I32(0).I32(-1).I32(2).I32(3).I32(70000);
    writer.U8(135).U32(4).U16(7).U16(0xFFFE);
    writer.U8(137).U32(8).F32(1.5F).F32(NAN);
    writer.U8(133).U32(0).U8(134).U32(0).I32(0).U8(135).U32(1).U8(137).U32(3);
    MemoryReadFile read(writer.bytes);
    HyperFile& file = read.file;
    Vector* points = nullptr;
    LegacyPolygon* narrow = nullptr;
    LegacyPolygon* wide = nullptr;
    UWord* words = nullptr;
    SReal* floats = nullptr;
    LLong counts[5] = {};
    ASSERT_TRUE(file.ReadLegacyPointArray(points, counts[0]) && file.ReadLegacyPolygonArray(narrow, counts[1]) &&
                file.ReadLegacyPolygonArray(wide, counts[2]) && file.ReadLegacyWordArray(words, counts[3]) &&
                file.ReadLegacyFloatArray(floats, counts[4]));
    EXPECT_EQ(std::vector<LLong>(counts, counts + 5), (std::vector<LLong>{2, 2, 1, 2, 2}));
    EXPECT_TRUE(points[0] == Vector(1, 2, 3) && points[1] == Vector(-1, 0, 0.5));
    EXPECT_TRUE(narrow[0].a == 1 && narrow[0].d == 0xFFFF && narrow[1].d == 8);
    EXPECT_TRUE(wide[0].a == -1 && wide[0].c == 3 && wide[0].d == 70000);
    EXPECT_TRUE(words[0] == 7 && words[1] == 0xFFFE && floats[0] == 1.5F && floats[1] == 0);
    GeFree(points);
    GeFree(narrow);
    GeFree(wide);
    GeFree(words);
    GeFree(floats);
    // Lengths of less than an element give no block.
    EXPECT_TRUE(file.ReadLegacyPointArray(points, counts[0]) && file.ReadLegacyPolygonArray(wide, counts[2]) &&
                file.ReadLegacyWordArray(words, counts[3]));
    EXPECT_TRUE(!points && !wide && !words && counts[0] + counts[2] + counts[3] == 0);
  }
}

TEST(HyperFileLegacyArray, TakesNoMemoryForALengthThatTheFileCannotHold)
{
  for (std::uint8_t tag : FromHex("85 86 87 89")) {
    MemoryReadFile read(ByteWriter().Header("Q7R6", 6500).U8(tag).U32(0xFFFFFFF0).I64(0).bytes);
    Vector* points = nullptr;
    LegacyPolygon* polygons = nullptr;
    UWord* words = nullptr;
    SReal* floats = nullptr;
    LLong count = 0;
    LLong before = counting_memory::Get().bytes;
    counting_memory::ResetPeak();
    EXPECT_FALSE(tag == 133   ? read.file.ReadLegacyPointArray(points, count)
                 : tag == 134 ? read.file.ReadLegacyPolygonArray(polygons, count)
                 : tag == 135 ? read.file.ReadLegacyWordArray(words, count)
                              : read.file.ReadLegacyFloatArray(floats, count));
    EXPECT_EQ(read.file.GetError(), FILEERROR_READ);
    EXPECT_EQ(counting_memory::Get().peakBytes, before);
  }
}
