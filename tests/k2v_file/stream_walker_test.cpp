#include "support/library.h"
#include "torvane/stream/stream_walker.h"

namespace
{

// One line for each value of a file, and then the problem if there is one.
std::vector<std::string> Walk(const std::vector<std::uint8_t>& bytes)
{
  Filename name;
  name.SetMemoryRead(bytes.data(), static_cast<LLong>(bytes.size()));
  StreamWalker walker;
  std::vector<std::string> lines;
  StreamValue value;
  for (bool good = walker.Open(name); good && walker.Next(value);) {
    std::string line =
        std::to_string(value.offset) + " " + Utf8(walker.GetPathText()) + " " + GetValueTagName(value.tag);
    for (Long i = 0; i < value.realCount; ++i)
      line += " " + Utf8(String::FromReal(value.reals[i]));
    line += " " + std::to_string(value.integer) + " " + std::to_string(value.size) + " " + Utf8(value.text);
    lines.push_back(line + ToHex(value.head, static_cast<std::size_t>(value.headCount)));
  }
  if (walker.GetProblem().code != FILEERROR_NONE)
    lines.push_back(Utf8(walker.GetProblemText()));
  return lines;
}

using Lines = std::vector<std::string>;

} // namespace

TEST(StreamWalker, TellsEachValueInEveryPrecisionAndVersion)
{
  for (std::uint8_t precision : std::vector<std::uint8_t>{0, 1}) {
    ByteWriter bytes;
    bytes.Header("Q7R6", 13000, precision).Start(5, 1).Char(-3).UWord(65535).LLong(-2).Bool(true).Vector(1, 2, 0.5);
    bytes.Start(6, 2).SReal(0.25).String(u"ab").Memory("xyz").ArrayHead(2, 4).U16(1).U16(2).End().End();
    const std::size_t real = precision ? 4 : 8;
    const auto at = [&](std::size_t offset, std::size_t reals) { return std::to_string(offset + reals * real); };
    EXPECT_EQ(Walk(bytes.bytes),
              (Lines{"13 - chunk 0 0 ", "22 5 Char -3 0 ", "24 5 UWord 65535 0 ", "27 5 LLong -2 0 ", "36 5 Bool 1 0 ",
                     "38 5 Vector 1 2 0.5 0 0 ", at(39, 3) + " 5 chunk 0 0 ", at(48, 3) + " 5/6 SReal 0.25 0 0 ",
                     at(53, 3) + " 5/6 String 0 4 ab", at(62, 3) + " 5/6 Memory 0 3 78 79 7A",
                     at(70, 3) + " 5/6 Array 2 2 00 01 00 02", at(80, 3) + " 5 end 0 0 ", at(81, 3) + " - end 0 0 "}));
  }
  // Old files: lengths by another element size, and the other order of an Array.
  ByteWriter old;
  old.Header("Q7R6", 11903).Start(5, 1).U8(133).U32(12).F64(1).F64(2).F64(3).U8(136).U32(44);
  old.bytes.resize(old.bytes.size() + 84, 0x61);
  old.OldArrayHead(5, 8).F32(1).F32(2).End();
  const std::string letters = " 61 61 61 61 61 61 61 61 61 61 61 61 61 61 61 61";
  EXPECT_EQ(Walk(old.bytes),
            (Lines{"13 - chunk 0 0 ", "22 5 old points 0 24 3F F0 00 00 00 00 00 00 40 00 00 00 00 00 00 00",
                   "51 5 old array 0 84" + letters, "140 5 Array 5 2 3F 80 00 00 40 00 00 00", "154 - end 0 0 "}));
}

TEST(StreamWalker, TellsWhereAndWhyAFileIsDamaged)
{
  const auto file = [] { return ByteWriter().Header().Start(5, 1).Start(6, 0); };
  const std::tuple<ByteWriter, const char*> rows[] = {
      {file().Long(1), "byte 36, in chunk 5/6: the file ends inside a chunk"},
      {file().U8(9), "byte 31, in chunk 5/6: no value begins with the byte 9"},
      {file().U8(15).U8(0), "byte 31, in chunk 5/6: the file ends inside a value"},
      {file().U8(130).U32(99).U8(0), "byte 31, in chunk 5/6: a text is longer than the file"},
      {file().U8(139).I64(-1), "byte 31, in chunk 5/6: a block is longer than the file"},
      {file().End().U8(1).I32(7), "byte 37, in chunk 5: the file ends inside a chunk's start"},
      {file().End().End().End(), "byte 33: a chunk ends that never began"},
  };
  for (const auto& [bytes, problem] : rows)
    EXPECT_EQ(Walk(bytes.bytes).back(), problem);
  const std::vector<std::uint8_t> cut = ByteWriter().Raw("QQ7R").bytes;
  Filename name;
  name.SetMemoryRead(cut.data(), static_cast<LLong>(cut.size()));
  StreamWalker walker;
  EXPECT_FALSE(walker.Open(name));
  EXPECT_EQ(Utf8(walker.GetProblemText()), "byte 4: a value is not of the expected kind");
}
