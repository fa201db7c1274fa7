// Texture coordinates: the packed form bit by bit, and every layout that files held.
#include "support/library.h"

namespace
{

constexpr Real kSmallest = 1.0 / 32768.0; // what zero comes back as beside a third component

const char* const kQuad = "3E800000 3F400000  00000000 0000039F  C0004000 4CCC7B97  47C35000 C7C35000";

std::vector<ULong> Words(const UVWTag& tag)
{
  LLong size = 0;
  const auto* first = static_cast<const ULong*>(tag.GetEntryBytes(size));
  return {first, first + size / 4};
}

ByteWriter OldWords()
{
  ByteWriter writer;
  // 5000 x 0.0002, 500 x 0.002; -50 x 0.02, 5 x 0.2; zeros; a third component; and a word too many.
  writer.U8(135).U32(26).U16(0x1388).U16(0x21F4).U16(0).U16(0xC032).U16(0x6005).U16(0);
  return writer.U16(0).U16(0).U16(0).U16(0).U16(0).U16(0x1388).U16(7);
}

ByteWriter OldPoints()
{
  ByteWriter writer;
  writer.U8(133).U32(4 * 12); // counted as if in floats
  for (const Vector& point : {Vector(0.25, 0.75, 0), Vector(0, 0.5, 1), Vector(-1.5, 0.75, 0.1), Vector(2e5, -2e5, 0)})
    writer.F64(point.x).F64(point.y).F64(point.z);
  return writer;
}

} // namespace

TEST(PackedUVW, HoldsTheseBits)
{
  const Real nan = std::numeric_limits<Real>::quiet_NaN();
  const std::tuple<Vector, ULong, ULong, Vector> rows[] = {
      {{0.25, 0.75, 0.0}, 0x3E800000, 0x3F400000, {0.25, 0.75, 0.0}},
      // The lowest bit of v goes, that of u stays; a negative zero is a zero.
      {{0.1, 0.1, -0.0}, 0x3DCCCCCD, 0x3DCCCCCC, {0.1F, std::bit_cast<float>(0x3DCCCCCC), 0.0}},
      {{0.0, 0.5, 1.0}, 0, 0x0000039F, {kSmallest, 0.5, 1.0}},
      {{-1.5, 0.75, 0.1}, 0xC0004000, 0x4CCC7B97, {-1.5, 0.75, std::bit_cast<float>(0x3DCCCC00)}},
      {{200000.0, -200000.0, 0.0}, 0x47C35000, 0xC7C35000, {100000.0, -100000.0, 0.0}},
      // The largest exponent; a third component that is zero as a float, but not exactly.
      {{200000.0, 0.0, 5e-324}, 0x43500000, 0x0000F801, {100000.0, kSmallest, kSmallest}},
      // 2^-15 is the smallest that comes back; below it only the mantissa counts.
      {{kSmallest, -kSmallest, 0.75 * kSmallest}, 0x00008000, 0x40000001, {kSmallest, -kSmallest, 1.5 * kSmallest}},
      {{nan, -0.0, 0.0}, 0, 0x80000000, {0.0, -0.0, 0.0}},
  };
  for (const auto& [uvw, word0, word1, back] : rows) {
    const PackedUVW packed = PackUVW(uvw);
    EXPECT_EQ(packed.word0, word0) << uvw.x << ' ' << uvw.y << ' ' << uvw.z;
    EXPECT_EQ(packed.word1, word1) << uvw.x << ' ' << uvw.y << ' ' << uvw.z;
    EXPECT_EQ(UnpackUVW(packed), back) << uvw.x << ' ' << uvw.y << ' ' << uvw.z;
  }
}

TEST(UVWTag, ReadsTheLayoutsOfEveryVersionAndLevel)
{
  std::vector<ULong> quad;
  const Bytes quadBytes = FromHex(kQuad);
  for (std::size_t i = 0; i < quadBytes.size(); i += 4)
    quad.push_back(ULong{quadBytes[i]} << 24 | ULong{quadBytes[i + 1]} << 16 | ULong{quadBytes[i + 2]} << 8 |
                   quadBytes[i + 3]);
  const std::vector<ULong> ones = {0x3F800000, 0x3F800000, 0xBF800000, 0x3F800000, 0, 0, 0, 0x0000001F};
  const std::vector<ULong> raw = {0x7FFF7FFF, 0xFFFFFFFF, 1, 2, 3, 4, 5, 0x7FC00001}; // no floats at all
  ByteWriter floats;
  floats.U8(137).U32(36);
  for (ULong word : raw)
    floats.U32(word);
  floats.U32(6).Bool(true);
  const Bytes older = ByteWriter().Long(1).OldArrayHead(3, 32).Append(quadBytes).Bool(true).bytes;
  const Bytes newer = ByteWriter().Long(1).ArrayHead(3, 32).Append(quadBytes).Bool(true).bytes;
  const Bytes both = ByteWriter().Append(OldWords().bytes).Append(OldPoints().bytes).Bool(true).bytes;
  const Bytes noWords = ByteWriter().U8(135).U32(0).Append(OldPoints().bytes).Bool(true).bytes;
  const std::tuple<Long, Long, Bytes, std::vector<ULong>, Long> rows[] = {
      {11599, 0, OldWords().Bool(true).bytes, ones, 0},
      {11599, 1, both, quad, 0},
      {11599, 2, noWords, quad, 1},
      {7000, 3, both, quad, 1},
      {11600, 2, floats.bytes, raw, 1},
      {13000, 2, floats.bytes, raw, 1},
      {11600, 0, older, quad, 0},
      {11903, 1, older, quad, 0},
      {11904, 3, newer, quad, 1},
      {13000, 7, newer, quad, 1},
  };
  for (const auto& [version, level, body, words, parameter] : rows) {
    UVWTag tag;
    tag.ResizeTagArray(4);
    const Bytes chunk = ByteWriter().Start(5671, level).Append(body).Long(77).End().bytes;
    ASSERT_TRUE(ReadInto(tag, chunk, version)) << version << '/' << level;
    EXPECT_EQ(Words(tag), words) << version << '/' << level;
    EXPECT_EQ(ParameterOf(tag, 1000).GetLong(), parameter) << version << '/' << level;
  }
}

TEST(UVWTag, FailsOnBadArraysWithTheMemoryError)
{
  const Bytes bad[] = {ByteWriter().Long(2147483647).ArrayHead(3, 32).Append(Bytes(32)).bytes,
                       ByteWriter().Long(-1).ArrayHead(3, 0).bytes,
                       ByteWriter().Long(1).ArrayHead(3, 28).Append(Bytes(28)).Bool(true).bytes,
                       ByteWriter().Long(1).ArrayHead(5, 32).Append(Bytes(32)).Bool(true).bytes,
                       ByteWriter().Long(1).ArrayHead(3, 32).Append(Bytes(32)).bytes};
  for (std::size_t i = 0; i < 9; ++i) { // the last one at the higher level alone: below it ends there
    UVWTag tag;
    ByteWriter whole;
    whole.Header().Start(5671, i % 2 == 0 ? 3 : 1).Append(bad[i / 2]).End().End();
    MemoryReadFile memory(whole.bytes);
    UChar header = 0;
    Long id = 0, level = 0;
    ASSERT_TRUE(memory.file.ReadValueHeader(header) && memory.file.ReadChunkStart(id, level));
    EXPECT_FALSE(tag.ReadChunk(memory.file, id, level));
    EXPECT_EQ(memory.file.GetError(), -7) << i;
  }
  UVWTag tag;
  EXPECT_NE(ReadError(tag, ByteWriter().Start(5671, 2).U8(137).U32(0xFFFFFFFF).U32(1).End().bytes), 0);
}
