#include "support/library.h"

#ifndef _WIN32
#include <fcntl.h>
#include <sys/stat.h>
#include <unistd.h>
#endif

namespace
{

Bytes RandomBytes(std::size_t size, unsigned seed)
{
  std::mt19937 random(seed);
  Bytes bytes(size);
  for (UChar& byte : bytes)
    byte = static_cast<UChar>(random());
  return bytes;
}

LLong SizeOf(const Bytes& bytes) { return static_cast<LLong>(bytes.size()); }

// A stream over a vector whose operations can be told to fail.
class VectorStream final : public FileStream
{
 public:
  explicit VectorStream(const Bytes& bytes) : bytes_(bytes) {}

  LLong Read(void* destination, LLong size) override
  {
    if (answer != 0)
      return answer;
    const LLong left = SizeOf(bytes_) - position_;
    const LLong got = std::max<LLong>(0, std::min(left, size));
    std::copy_n(bytes_.begin() + position_, got, static_cast<UChar*>(destination));
    position_ += got;
    return got;
  }
  Bool Seek(LLong position) override
  {
    position_ = position;
    return works;
  }
  Bool Stat(LLong& size) override
  {
    size = SizeOf(bytes_);
    return works;
  }

  bool works = true;
  LLong answer = 0; // what Read gives when it isn't 0

 private:
  Bytes bytes_;
  LLong position_ = 0;
};

class BaseFileTest : public testing::Test
{
 protected:
  // A name under which `bytes` can be read, for each kind of target that holds a known number of bytes.
  Filename NameOf(const std::string& target, const Bytes& bytes)
  {
    Filename name((folder / "file").c_str());
    if (target == "disk") {
      WriteWholeFile(folder / "file", bytes);
    } else if (target == "memory") {
      memory = std::make_unique<UChar[]>(bytes.size());
      std::copy(bytes.begin(), bytes.end(), memory.get());
      name.SetMemoryRead(memory.get(), SizeOf(bytes));
    } else {
      stream = std::make_unique<VectorStream>(bytes);
      name.SetStream(stream.get());
    }
    return name;
  }

  TempFolder folder;
  std::unique_ptr<UChar[]> memory;
  std::unique_ptr<VectorStream> stream;
};

TEST_F(BaseFileTest, NumbersTakeTheBytesOfTheFileOrder)
{
  using Act = std::function<Bool(BaseFile&)>;
  const std::tuple<Act, Act, const char*, const char*> kCases[] = {
#define NUMBER(Type, value, big, little)                                                                               \
  {[](BaseFile& f) { return f.Write##Type(value); },                                                                   \
   [](BaseFile& f) {                                                                                                   \
     Type v{};                                                                                                         \
     return f.Read##Type(v) && v == (value);                                                                           \
   },                                                                                                                  \
   big, little}
      NUMBER(Char, -2, "FE", "FE"),
      NUMBER(UChar, 0xA5, "A5", "A5"),
      NUMBER(Word, -2, "FF FE", "FE FF"),
      NUMBER(UWord, 0xFEDC, "FE DC", "DC FE"),
      NUMBER(Long, -16909060, "FE FD FC FC", "FC FC FD FE"),
      NUMBER(ULong, 0x89ABCDEFU, "89 AB CD EF", "EF CD AB 89"),
      NUMBER(LLong, -2, "FF FF FF FF FF FF FF FE", "FE FF FF FF FF FF FF FF"),
      NUMBER(ULLong, 0x8123456789ABCDEFU, "81 23 45 67 89 AB CD EF", "EF CD AB 89 67 45 23 81"),
      NUMBER(SReal, -1.5F, "BF C0 00 00", "00 00 C0 BF"),
      NUMBER(Real, 0.15625, "3F C4 00 00 00 00 00 00", "00 00 00 00 00 00 C4 3F"),
#undef NUMBER
  };
  for (const auto& [write, readsBack, big, little] : kCases) {
    for (Long order : {kByteOrderBig, kByteOrderLittle}) {
      const Filename name((folder / "number").c_str());
      BaseFile file;
      ASSERT_TRUE(file.Open(name, kFileWrite, false, order) && write(file) && file.Close());
      EXPECT_EQ(ToHex(ReadWholeFile(folder / "number")), order == kByteOrderBig ? big : little);
      ASSERT_TRUE(file.Open(name, kFileRead, false, order));
      EXPECT_TRUE(readsBack(file)) << big;
      EXPECT_FALSE(readsBack(file)) << "a number past the end";
      EXPECT_EQ(file.GetError(), FILEERROR_READ);
    }
  }
}

TEST_F(BaseFileTest, FloatsThatAreNotFiniteBecomeZeroInBothDirections)
{
  MemoryDescription written;
  Filename target;
  target.SetMemoryWrite(&written);
  BaseFile file;
  ASSERT_TRUE(file.Open(target, kFileWrite));
  const Real kInfinity = std::numeric_limits<Real>::infinity();
  ASSERT_TRUE(file.WriteReal(-kInfinity) && file.WriteReal(std::nan("")) && file.WriteSReal(std::nanf("")) &&
              file.WriteSReal(static_cast<SReal>(kInfinity)) && file.Close());
  const void* data = nullptr;
  LLong size = 0;
  ASSERT_TRUE(target.GetMemoryContinuous(data, size));
  EXPECT_EQ(Bytes(24, 0), Bytes(static_cast<const UChar*>(data), static_cast<const UChar*>(data) + size));

  const Bytes bytes = ByteWriter().U32(0x7F800000).U32(0xFFC00001).U32(0x7FF00000).U32(0).U32(0xFFF80000).U32(1).bytes;
  ASSERT_TRUE(file.Open(NameOf("memory", bytes), kFileRead));
  for (SReal value : {1.0F, 1.0F})
    EXPECT_TRUE(file.ReadSReal(value) && value == 0);
  for (Real value : {1.0, 1.0})
    EXPECT_TRUE(file.ReadReal(value) && value == 0);
}

// One random step of reading; `position` is what the file's must be.
void ReadPiece(BaseFile& file, const Bytes& bytes, LLong& position, std::mt19937& random)
{
  const LLong size = SizeOf(bytes);
  const auto below = [&random](LLong limit) { return static_cast<LLong>(random() % static_cast<ULong>(limit)); };
  const LLong count = below(4) != 0 ? below(40) : below(40000);
  Bytes got(static_cast<std::size_t>(count));
  switch (below(5)) {
  case 0: {
    const LLong target = below(size + 1);
    const Bool relative = below(2) == 0;
    ASSERT_TRUE(file.Seek(relative ? target - position : target, relative ? kSeekRelative : kSeekStart));
    position = target;
    break;
  }
  case 1: {
    const LLong near = std::min(size, std::max<LLong>(0, position + below(200) - 100));
    ASSERT_TRUE(file.Seek(near));
    position = near;
    break;
  }
  case 2:
    if (const UChar* window = file.ReadWindow(count)) {
      ASSERT_LE(position + count, size);
      ASSERT_TRUE(std::equal(window, window + count, bytes.begin() + position));
      file.CommitRead(count);
      position += count;
    }
    break;
  default: {
    const LLong expected = std::min(count, size - position);
    ASSERT_EQ(file.ReadBytes(got.data(), count, true), expected);
    ASSERT_TRUE(std::equal(got.begin(), got.begin() + expected, bytes.begin() + position));
    position += expected;
  }
  }
  ASSERT_EQ(file.GetPosition(), position);
  ASSERT_EQ(file.GetRemaining(), size - position);
}

TEST_F(BaseFileTest, RandomPiecesAreThoseOfAPlainBuffer)
{
  std::mt19937 random(20031);
  for (std::size_t size : {0U, 1U, 100U, 262142U, 262143U, 262144U, 262145U, 600000U}) {
    const Bytes bytes = RandomBytes(size, static_cast<unsigned>(size));
    for (const char* target : {"disk", "memory", "stream"}) {
      for (Long mode : {kFileRead, kFileReadWrite, kFileReadShared}) {
        if (mode == kFileReadWrite && target == std::string("memory"))
          continue;
        SCOPED_TRACE(target + std::to_string(size) + " in mode " + std::to_string(mode));
        BaseFile file;
        LLong position = 0;
        ASSERT_TRUE(file.Open(NameOf(target, bytes), mode));
        ASSERT_EQ(file.GetLength(), SizeOf(bytes));
        for (int i = 0; i < 400; ++i)
          ASSERT_NO_FATAL_FAILURE(ReadPiece(file, bytes, position, random));
        EXPECT_TRUE(file.Close());
      }
    }
  }
}

// One random step of writing, into the file and into `bytes`.
void WritePiece(BaseFile& file, Bytes& bytes, LLong& position, std::mt19937& random)
{
  const auto below = [&random](LLong limit) { return static_cast<LLong>(random() % static_cast<ULong>(limit)); };
  if (below(8) == 0) {
    position = below(SizeOf(bytes) + 1);
    ASSERT_TRUE(file.Seek(position));
  }
  const LLong count = below(4) != 0 ? below(30) : below(40000);
  const Bytes piece = RandomBytes(static_cast<std::size_t>(count), static_cast<unsigned>(random()));
  UChar* window = below(2) != 0 ? file.WriteWindow(count) : nullptr;
  if (window) {
    std::copy(piece.begin(), piece.end(), window);
    file.CommitWrite(count);
  } else {
    ASSERT_TRUE(file.WriteBytes(piece.data(), count));
  }
  if (SizeOf(bytes) < position + count)
    bytes.resize(static_cast<std::size_t>(position + count));
  std::copy(piece.begin(), piece.end(), bytes.begin() + position);
  position += count;
  ASSERT_EQ(file.GetPosition(), position);
}

TEST_F(BaseFileTest, RandomPiecesWrittenMakeTheFileOfAPlainBuffer)
{
  std::mt19937 random(77);
  for (Long mode : {kFileReadWriteAtEnd, kFileWrite, kFileReadWrite}) {
    SCOPED_TRACE(mode);
    Bytes bytes = RandomBytes(20000, 1);
    BaseFile file;
    ASSERT_TRUE(file.Open(NameOf("disk", bytes), mode));
    if (mode == kFileWrite)
      bytes.clear();
    LLong position = mode == kFileReadWriteAtEnd ? 20000 : 0;
    ASSERT_EQ(file.GetPosition(), position);
    for (int i = 0; i < 300; ++i) {
      ASSERT_NO_FATAL_FAILURE(WritePiece(file, bytes, position, random));
      if (mode == kFileReadWrite) {
        ASSERT_NO_FATAL_FAILURE(ReadPiece(file, bytes, position, random));
      }
    }
    ASSERT_TRUE(file.Close());
    EXPECT_TRUE(ReadWholeFile(folder / "file") == bytes);
  }
}

TEST_F(BaseFileTest, AReadToTheEndIsNoErrorAndOnePastItEndsTheFile)
{
  for (const char* target : {"disk", "memory", "stream"}) {
    SCOPED_TRACE(target);
    const Bytes bytes = RandomBytes(20000, 3);
    Bytes got(20001);
    BaseFile file;
    ASSERT_TRUE(file.Open(NameOf(target, bytes), kFileRead));
    EXPECT_EQ(file.ReadBytes(got.data(), 20000), 20000);
    EXPECT_EQ(file.ReadBytes(got.data(), 1, true), 0);
    EXPECT_EQ(file.ReadBytes(got.data(), 0, true), 0);
    EXPECT_EQ(file.ReadBytes(got.data(), 0), 1);
    EXPECT_EQ(file.GetError(), FILEERROR_NONE);
    EXPECT_TRUE(file.Seek(19999));
    EXPECT_EQ(file.ReadBytes(got.data(), 2), 0);
    EXPECT_EQ(file.GetError(), FILEERROR_READ);
    // The first error stays, and nothing works any more.
    file.SetError(FILEERROR_INVALID);
    EXPECT_EQ(file.GetError(), FILEERROR_READ);
    EXPECT_FALSE(file.Seek(0));
    EXPECT_TRUE(file.ReadBytes(got.data(), 1, true) == 0 && file.ReadBytes(got.data(), 0) == 0);
    EXPECT_FALSE(file.WriteBytes(got.data(), 0) || file.ReadWindow(1));
    EXPECT_TRUE(file.GetLength() == 0 && file.GetRemaining() == 0);
    EXPECT_FALSE(file.Close());
    EXPECT_EQ(file.GetPosition(), 20000);
    EXPECT_TRUE(file.Open(NameOf(target, bytes), kFileRead)) << "opening starts afresh";
  }
  EXPECT_EQ(CountReports(), 0);
}

TEST_F(BaseFileTest, ModesDecideWhatMayBeDone)
{
  // afterwards: the content "abc" after an "X" was written where that works
  const std::tuple<Long, Bool, Bool, Bool, Long, const char*> kCases[] = {
      {kFileReadWriteAtEnd, true, false, true, 0, "abcX"},
      {kFileRead, false, true, false, 1, "abc"},
      {kFileWrite, true, false, true, 2, "X"},
      {kFileReadWrite, true, true, true, 3, "Xbc"},
      {kFileReadAlias, false, true, false, 1, "abc"},
      {kFileReadShared, false, true, false, 1, "abc"}};
  for (const auto& [mode, opensMissing, reads, writes, modeKept, afterwards] : kCases) {
    SCOPED_TRACE(mode);
    BaseFile file;
    EXPECT_EQ(file.Open((folder / ("new" + std::to_string(mode))).c_str(), mode), opensMissing);
    EXPECT_EQ(file.GetError(), opensMissing ? FILEERROR_NONE : FILEERROR_OPEN);
    const Filename name = NameOf("disk", {'a', 'b', 'c'});
    UChar byte = 0;
    ASSERT_TRUE(file.Open(name, mode));
    EXPECT_EQ(file.GetMode(), modeKept);
    EXPECT_EQ(file.WriteBytes("X", 1), writes);
    EXPECT_EQ(file.GetError(), writes ? FILEERROR_NONE : FILEERROR_INVALID);
    file.Close();
    const Bytes bytes = ReadWholeFile(folder / "file");
    EXPECT_EQ(std::string(bytes.begin(), bytes.end()), afterwards);
    ASSERT_TRUE(file.Open(name, mode));
    EXPECT_EQ(file.ReadBytes(&byte, 1) == 1, reads);
    EXPECT_EQ(file.GetError(), reads ? FILEERROR_NONE : FILEERROR_INVALID);
    EXPECT_EQ(CountReports(), reads ? 0 : 1);
    ASSERT_TRUE(file.Open(name, mode));
    file.GetLength();
    EXPECT_EQ(file.GetError(), reads ? FILEERROR_NONE : FILEERROR_INVALID);
    EXPECT_EQ(file.Seek(0), reads) << "a length that may not be asked for closes the file";
  }
  for (Long mode : {6, -1}) {
    BaseFile file;
    EXPECT_FALSE(file.Open(NameOf("disk", {'a'}), mode));
    EXPECT_EQ(file.GetError(), FILEERROR_INVALID);
    EXPECT_EQ(CountReports(), 1);
  }
}

TEST_F(BaseFileTest, WhatCannotBeOpenedIsAnOpenFailure)
{
  String withZero((folder / "zero?x").c_str());
  withZero[withZero.GetLength() - 2] = 0;
  Filename noMemory;
  noMemory.SetMemoryRead(nullptr, 10);
  Filename readOnlyMemory;
  readOnlyMemory.SetMemoryRead("abc", 3);
  const struct
  {
    Filename name;
    Long mode;
  } kCases[] = {
      {Filename(), kFileRead},
      {Filename((folder / "none/file").c_str()), kFileWrite},
      {Filename(folder.Path().string().c_str()), kFileRead},
      {Filename(folder.Path().string().c_str()), kFileWrite},
      {Filename(folder.Path().string().c_str()), kFileReadWrite},
      {Filename(withZero), kFileWrite},
      {noMemory, kFileRead},
      {readOnlyMemory, kFileWrite},
  };
  for (const auto& each : kCases) {
    BaseFile file;
    EXPECT_FALSE(file.Open(each.name, each.mode)) << &each - kCases;
    EXPECT_EQ(file.GetError(), FILEERROR_OPEN);
  }
  const Filename name = NameOf("disk", Bytes(100));
  BaseFile file;
  const LLong before = counting_memory::Get().bytes;
  EXPECT_TRUE(file.Open(name, kFileRead));
  EXPECT_LT(counting_memory::Get().bytes - before, 1000) << "a short file takes a short buffer";
  EXPECT_FALSE(counting_memory::WithoutMemory([&] { return file.Open(name, kFileRead); },
                                              1)); // the copy of the name has its memory
  EXPECT_EQ(file.GetError(), FILEERROR_MEMORY);
}

TEST_F(BaseFileTest, MisuseIsInvalidAndSomeOfItIsReported)
{
  UChar byte = 0;
  const std::string kAny = "disk", kMemory = "memory", kStream = "stream";
  int number = 0;
  const std::tuple<std::string, std::function<void(BaseFile&)>, int> kCases[] = {
      {kAny, [](BaseFile& f) { f.Seek(-1); }, 1},
      {kAny, [](BaseFile& f) { f.Seek(-3, kSeekRelative); }, 1},
      {kAny, [](BaseFile& f) { f.Seek(std::numeric_limits<LLong>::max(), kSeekRelative); }, 1},
      {kAny, [](BaseFile& f) { f.Seek(1, 1); }, 1},
      {kAny, [&](BaseFile& f) { f.ReadBytes(&byte, -1); }, 1},
      {kAny, [&](BaseFile& f) { f.WriteBytes(&byte, 0); }, 0},
      {kMemory, [](BaseFile& f) { f.Seek(4); }, 0},
      {kMemory, [](BaseFile& f) { f.WriteChar(1); }, 0},
      {kAny, [](BaseFile& f) { f.Close(), f.Seek(1); }, 0},
      {kAny, [](BaseFile& f) { f.Close(), f.GetLength(); }, 0},
      {kAny, [&](BaseFile& f) { f.Close(), f.ReadBytes(&byte, 0); }, 1},
      {kStream, [](BaseFile& f) { f.Open(Filename(f.GetName()), kFileWrite), f.WriteChar(1); }, 0},
      {kAny, [](BaseFile& f) { f.Open(Filename(f.GetName()), kFileWrite), f.WriteBytes("", -1); }, 0},
  };
  for (const auto& [target, act, reports] : kCases) {
    SCOPED_TRACE(++number);
    BaseFile file;
    ASSERT_TRUE(file.Open(NameOf(target, {'a', 'b', 'c'}), kFileRead) && file.ReadUChar(byte));
    act(file);
    EXPECT_EQ(file.GetError(), FILEERROR_INVALID);
    EXPECT_EQ(CountReports(), reports);
    EXPECT_TRUE(file.Seek(0, kSeekRelative)) << "staying where one is works in any state";
  }
}

#ifndef _WIN32 // no such device
TEST_F(BaseFileTest, AFullDeviceFailsTheWriteThatMeetsIt)
{
  const Bytes large(300000);
  BaseFile file;
  ASSERT_TRUE(file.Open("/dev/full", kFileWrite) && file.WriteLong(1));
  EXPECT_FALSE(file.Close());
  EXPECT_EQ(file.GetError(), FILEERROR_WRITE) << "what was pending, at closing";
  ASSERT_TRUE(file.Open("/dev/full", kFileWrite) && file.WriteLong(1));
  EXPECT_FALSE(file.Seek(0));
  EXPECT_EQ(file.GetError(), FILEERROR_WRITE) << "what was pending, at positioning";
  ASSERT_TRUE(file.Open("/dev/full", kFileWrite));
  EXPECT_FALSE(file.WriteBytes(large.data(), SizeOf(large)));
  EXPECT_EQ(file.GetError(), FILEERROR_WRITE) << "more than the buffer, at once";
  ASSERT_TRUE(file.Open("/dev/full", kFileReadWrite) && file.WriteLong(1));
  EXPECT_FALSE(file.Close());
  EXPECT_EQ(file.GetError(), FILEERROR_CLOSE) << "what the C library held";
}
#endif

TEST_F(BaseFileTest, TargetsThatCannotBePositionedFailSo)
{
  BaseFile file;
#ifndef _WIN32
  const std::string pipe = folder / "pipe";
  ASSERT_EQ(mkfifo(pipe.c_str(), 0600), 0);
  const int writer = open(pipe.c_str(), O_RDWR);
  EXPECT_FALSE(file.Open(pipe.c_str(), kFileRead));
  EXPECT_EQ(file.GetError(), FILEERROR_SEEK);
  close(writer);
#endif
  for (Bool length : {false, true}) {
    ASSERT_TRUE(file.Open(NameOf("stream", Bytes(10)), kFileRead));
    stream->works = false;
    EXPECT_EQ(file.GetRemaining(), -1);
    EXPECT_EQ(file.GetError(), FILEERROR_NONE);
    EXPECT_FALSE(length ? file.GetLength() != 0 : file.Seek(1));
    EXPECT_EQ(file.GetError(), FILEERROR_SEEK);
  }
  for (LLong answer : {LLong{-1}, LLong{9}}) {
    ASSERT_TRUE(file.Open(NameOf("stream", Bytes(10)), kFileRead));
    stream->answer = answer;
    ULLong value = 0;
    EXPECT_EQ(file.ReadBytes(&value, 8, true), 0) << "a stream that fails or lies";
    EXPECT_EQ(file.GetError(), FILEERROR_READ);
  }
}

TEST_F(BaseFileTest, AMemoryTargetGrowsByDoubledBlocksAndLosesThemWithAnError)
{
  const Bytes bytes = RandomBytes(1 << 20, 9);
  MemoryDescription description;
  Filename name;
  name.SetMemoryWrite(&description);
  BaseFile file;
  ASSERT_TRUE(file.Open(name, kFileWrite));
  for (LLong at = 0; at < SizeOf(bytes); at += 4096)
    ASSERT_TRUE(file.WriteBytes(&bytes[static_cast<std::size_t>(at)], 4096));
  EXPECT_EQ(file.GetPosition(), SizeOf(bytes));
  ASSERT_TRUE(file.Close());
  std::vector<LLong> sizes;
  for (Long i = 0; i < name.GetMemory(); ++i) {
    const void* data = nullptr;
    ASSERT_TRUE(name.GetMemory(i, data, sizes.emplace_back()));
  }
  EXPECT_EQ(sizes, (std::vector<LLong>{50000, 100000, 200000, 400000, 298576}));

  Bytes got(bytes.size());
  ASSERT_TRUE(file.Open(name, kFileRead));
  EXPECT_EQ(file.ReadBytes(got.data(), SizeOf(got)), SizeOf(got));
  EXPECT_TRUE(got == bytes);

  ASSERT_TRUE(file.Open(name, kFileWrite));
  EXPECT_EQ(name.GetMemory(), 0) << "opening drops what was there";
  ASSERT_TRUE(file.WriteLong(1));
  EXPECT_FALSE(file.Seek(5));
  EXPECT_EQ(file.GetError(), FILEERROR_INVALID);
  EXPECT_EQ(name.GetMemory(), 0);

  ASSERT_TRUE(file.Open(name, kFileWrite));
  EXPECT_FALSE(counting_memory::WithoutMemory([&] { return file.WriteBytes(bytes.data(), 60000); },
                                              2)); // the table and the first block
  EXPECT_EQ(file.GetError(), FILEERROR_MEMORY);
  EXPECT_EQ(name.GetMemory(), 0);
}

#ifndef _WIN32 // nobody else may write to an open file
TEST_F(BaseFileTest, AFileThatChangesWhileItIsReadKeepsItsLength)
{
  const Bytes bytes = RandomBytes(400000, 5);
  const Filename name = NameOf("disk", bytes);
  Bytes got(400000);
  BaseFile file;
  UChar first = 0;
  ASSERT_TRUE(file.Open(name, kFileRead) && file.ReadUChar(first));
  ASSERT_EQ(truncate((folder / "file").c_str(), 100), 0);
  EXPECT_TRUE(file.Seek(262000));
  EXPECT_EQ(file.ReadBytes(got.data(), 144), 144) << "the buffer has it, the disk no longer";
  EXPECT_TRUE(std::equal(got.begin(), got.begin() + 144, bytes.begin() + 262000));
  EXPECT_EQ(file.GetRemaining(), 400000 - 262144);
  EXPECT_EQ(file.ReadBytes(got.data(), 10, true), 0);
  EXPECT_EQ(file.ReadBytes(got.data(), 120000), 0);
  EXPECT_EQ(file.GetError(), FILEERROR_READ);

  ASSERT_TRUE(file.Open(name, kFileReadShared));
  WriteWholeFile(folder / "file", bytes);
  EXPECT_EQ(file.ReadBytes(got.data(), 400000, true), 100);
  EXPECT_EQ(file.GetLength(), 100);
}
#endif

TEST_F(BaseFileTest, PositionsPastTwoGigabytesWork)
{
  constexpr LLong kFar = 5'000'000'000;
  const Filename name((folder / "large").c_str());
  BaseFile file;
  ASSERT_TRUE(file.Open(name, kFileWrite) && file.Seek(kFar) && file.WriteULong(0x01020304) && file.Close());
  ULong value = 0;
  for (Long mode : {kFileRead, kFileReadWrite}) {
    ASSERT_TRUE(file.Open(name, mode) && file.Seek(kFar) && file.ReadULong(value));
    EXPECT_EQ(value, 0x01020304U);
    EXPECT_TRUE(file.GetLength() == kFar + 4 && file.GetPosition() == kFar + 4);
  }
}

#ifndef _WIN32 // tests/windows has its system's
TEST_F(BaseFileTest, PathsReachTheSystemAsUtf8)
{
  const std::pair<std::u16string, const char*> kCases[] = {
      {u"\u00E9\u20AC", "\xC3\xA9\xE2\x82\xAC"},
      {u"a\U0001F600b", "a\360\237\230\200b"},
      {u"\xD83D\u00E9", "\xED\xA0\xBD\xC3\xA9"},     // the first half of a pair alone
      {u"\xDE00\xD83D", "\xED\xB8\x80\xED\xA0\xBD"}, // halves in the wrong order
  };
  for (const auto& [units, bytes] : kCases) {
    const std::u16string path = folder.Path().u16string() + u"/" + units;
    const Filename name(String(reinterpret_cast<const UniChar*>(path.data()), static_cast<Long>(path.size())));
    BaseFile file;
    ASSERT_TRUE(file.Open(name, kFileWrite) && file.WriteChar('x') && file.Close());
    EXPECT_EQ(ReadWholeFile(folder / bytes), Bytes{'x'});
    EXPECT_TRUE(GeFExist(name));
  }
  std::string longPath = folder.Path().string();
  for (int i = 0; i < 600; ++i)
    longPath += "/.";
  EXPECT_TRUE(BaseFile().Open((longPath + "/deep").c_str(), kFileWrite) && std::filesystem::exists(folder / "deep"));
}
#endif

TEST_F(BaseFileTest, ExistenceTellsFilesFromDirectories)
{
  const Filename file = NameOf("disk", {});
  const Filename directory(folder.Path().string().c_str());
  EXPECT_TRUE(GeFExist(file) && GeFExist(directory, true));
  EXPECT_FALSE(GeFExist(file, true) || GeFExist(directory));
  EXPECT_FALSE(GeFExist((folder / "none").c_str()) || GeFExist((folder / "none").c_str(), true) ||
               GeFExist(Filename(), true));
}

TEST_F(BaseFileTest, SceneFilesAreKnownByTheirFirstTwoNumbers)
{
  for (const char* magic : {"QQ7R", "YQ7R", "XQ7R", "6Q7R", "AQ7R", "8Q7R"}) {
    const Filename name = NameOf("disk", ByteWriter().Raw(magic).Raw("Q7R6").bytes);
    EXPECT_TRUE(IdentifyFile(name, 1)) << magic;
    EXPECT_FALSE(IdentifyFile(name, 0xFFFFFFFE)) << magic;
  }
  for (const char* start : {"", "QQ7R", "QQ7RQ7R", "QQ7RVlek", "7Q7RQ7R6", "R7QQQ7R6"})
    EXPECT_FALSE(IdentifyFile(NameOf("disk", ByteWriter().Raw(start).bytes), 1)) << start;
  EXPECT_FALSE(IdentifyFile((folder / "none").c_str(), 1));
}

TEST(FileErrors, EveryCodeHasItsOwnText)
{
  std::set<std::string> texts;
  for (Long code : {0, -1, -2, -3, -4, -5, -6, -7, -100, -103, -104, -105, -106, -99})
    texts.insert(GetFileErrorText(code));
  EXPECT_EQ(texts.size(), 14U);
}

} // namespace
