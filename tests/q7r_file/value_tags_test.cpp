// Tags that hold arrays: their bytes, the layouts of older files, counts that lie, and their ways of copying.
#include "support/library.h"

namespace
{

// All numbers that the entries are made of.
template <class Number>
std::vector<Number> Numbers(const BaseArrayTag& tag)
{
  LLong size = 0;
  const auto* first = static_cast<const Number*>(tag.GetEntryBytes(size));
  return {first, first + size / static_cast<LLong>(sizeof(Number))};
}

std::unique_ptr<BaseArrayTag> Make(Long type)
{
  return std::unique_ptr<BaseArrayTag>(type == kTagOldVertexMap ? new VertexMapTag(type)
                                                                : static_cast<BaseArrayTag*>(MakeTag(type)));
}

// What a tag of a type holds, in its packing, and as numbers in memory: `number` tells their kind.
struct Layout
{
  Long type;
  std::string chunk;
  char number;
  std::vector<double> entries;

  Bytes Filled() const { return Record("[" + std::to_string(type) + ",0 " + chunk + " ]"); }
  Bytes Empty() const { return Record("[" + std::to_string(type) + ",0 L0 ]"); }
  std::unique_ptr<BaseArrayTag> Make() const
  {
    std::unique_ptr<BaseArrayTag> tag = ::Make(type);
    EXPECT_TRUE(ReadInto(*tag, Filled()));
    return tag;
  }
};

const Layout kLayouts[] = {
    {5600, "L3 A6:1,4,7 A6:2,5,8 A6:3,6,9", 'R', {1, 2, 3, 4, 5, 6, 7, 8, 9}},
    {5604, "L2 A3:0,3 A3:1,4 A3:2,5 A3:2,16909060", 'L', {0, 1, 2, 2, 3, 4, 5, 16909060}},
    {5617, "L1 V1,2,0 V0,0,-2", 'R', {1, 2, 0, 0, 0, -2}},
    {5672, "L2 L7 B1 L-1 B0", 'L', {7, 1, -1, 0}},
    {5682, "L2 A5:1,0.25", 'S', {1, 0.25}},
    {5711,
     "L1 A2:32000,-32000,0,1,-1,16000,32640,32767,-32768,0,0,31999",
     'W',
     {32000, -32000, 0, 1, -1, 16000, 32640, 32767, -32768, 0, 0, 31999}},
};

std::vector<double> EntriesOf(const BaseArrayTag& tag, char number)
{
  const auto doubles = [](const auto& numbers) { return std::vector<double>(numbers.begin(), numbers.end()); };
  return number == 'R'   ? doubles(Numbers<Real>(tag))
         : number == 'L' ? doubles(Numbers<Long>(tag))
         : number == 'S' ? doubles(Numbers<SReal>(tag))
                         : doubles(Numbers<Word>(tag));
}

// The count that stands first in a legacy value is in bytes.
ByteWriter Legacy(std::uint8_t tag, std::uint32_t length)
{
  ByteWriter writer;
  writer.U8(tag).U32(length);
  return writer;
}

} // namespace

TEST(ValueTags, WriteAndReadTheirEntriesInTheirOwnPacking)
{
  for (const Layout& layout : kLayouts) {
    EXPECT_EQ(ToHex(OwnChunks(*::Make(layout.type))), ToHex(layout.Empty()));
    auto tag = layout.Make();
    EXPECT_EQ(ToHex(OwnChunks(*tag)), ToHex(layout.Filled()));
    EXPECT_EQ(EntriesOf(*tag, layout.number), layout.entries) << layout.type;
  }
  // 32000 a unit; 1 and -1 for 1.28 and -1.92; 32640 and the limits of 16 bits; 31999 for 31999.9968.
  NormalTag normals;
  const Vector quad[4] = {{1, -1, 0}, {0.00004, -0.00006, 0.5}, {1.02, 1.1, -1.1}, {0, 0, 0.9999999}};
  EXPECT_TRUE(normals.ResizeTagArray(1) && normals.WritePolygonNormals(0, quad));
  EXPECT_EQ(EntriesOf(normals, 'W'), kLayouts[5].entries);
}

TEST(ValueTags, KeepOrDropTheirEntriesWhenAFileHasNone)
{
  for (const Layout& layout : kLayouts) {
    auto tag = layout.Make();
    const Long count = tag->GetCount();
    ASSERT_TRUE(ReadInto(*tag, Record("[" + std::to_string(layout.type) + ",-1 L1 L2 ]")));
    EXPECT_EQ(tag->GetCount(), count); // a level below 0: passed over
    ASSERT_TRUE(ReadInto(*tag, layout.Empty()));
    const bool drops = layout.type == kTagTangent || layout.type == kTagSegment;
    EXPECT_EQ(tag->GetCount(), drops ? 0 : count) << layout.type;
    const Bytes negative = Record("[" + std::to_string(layout.type) + ",0 L-3 ]");
    EXPECT_EQ(ReadError(*tag, negative), drops ? -100 : 0) << layout.type;
  }
}

TEST(ValueTags, ReportMemoryThatIsShortAndKeepTheirEntries)
{
  for (const Layout& layout : kLayouts) {
    auto tag = layout.Make();
    const auto entries = Numbers<UChar>(*tag);
    EXPECT_FALSE(counting_memory::WithoutMemory([&] { return tag->ResizeTagArray(100); }));
    EXPECT_EQ(Numbers<UChar>(*tag), entries);

    MemoryReadFile memory(ByteWriter().Header().Append(layout.Filled()).bytes);
    UChar header = 0;
    Long id = 0, level = 0;
    ASSERT_TRUE(memory.file.ReadValueHeader(header) && memory.file.ReadChunkStart(id, level));
    EXPECT_FALSE(counting_memory::WithoutMemory([&] { return tag->ReadChunk(memory.file, id, level); }));
    EXPECT_EQ(memory.file.GetError(), -7) << layout.type;
    EXPECT_TRUE(layout.type == kTagSegment || Numbers<UChar>(*tag) == entries) << layout.type;
  }
}

TEST(ValueTags, ResizeKeepingTheFirstEntriesAndClearingNewOnes)
{
  VertexMapTag map;
  EXPECT_TRUE(ReadInto(map, kLayouts[4].Filled()));
  ASSERT_TRUE(map.ResizeTagArray(4));
  EXPECT_EQ(Numbers<SReal>(map), (std::vector<SReal>{1.0F, 0.25F, 0.0F, 0.0F}));
  ASSERT_TRUE(map.ResizeTagArray(1));
  EXPECT_EQ(Numbers<SReal>(map), (std::vector<SReal>{1.0F}));
  EXPECT_FALSE(map.ResizeTagArray(-1));
  EXPECT_TRUE(map.ResizeTagArray(0) && map.GetArray() == nullptr);

  PolygonTag polygons;
  EXPECT_TRUE(ReadInto(polygons, kLayouts[1].Filled()) && polygons.ResizeTagArray(0) && polygons.ResizeTagArray(-9));
  EXPECT_EQ(polygons.GetCount(), 2);

  SegmentTag segments;
  EXPECT_FALSE(segments.ResizeTagArray(0) || segments.ResizeTagArray(-1));
  EXPECT_TRUE(ReadInto(segments, kLayouts[3].Filled()) && segments.ResizeTagArray(-1));
  EXPECT_EQ(segments.GetCount(), 2);
  EXPECT_TRUE(segments.ResizeTagArray(0) && segments.GetCount() == 0);

  TangentTag tangents;
  EXPECT_TRUE(ReadInto(tangents, kLayouts[2].Filled()) && tangents.ReplaceTagArray(2));
  EXPECT_EQ(Numbers<Real>(tangents), std::vector<Real>(12, 0.0));
}

TEST(ValueTags, ReadTheArraysOfOldFiles)
{
  PointTag points;
  ByteWriter pointArray = Legacy(133, 2 * 12);
  pointArray.F64(1).F64(2).F64(3).F64(4).F64(5).F64(6);
  ASSERT_TRUE(ReadInto(points, ByteWriter().Start(5600, 0).Append(pointArray.bytes).Long(9).End().bytes, 11924));
  EXPECT_EQ(Numbers<Real>(points), (std::vector<Real>{1, 2, 3, 4, 5, 6}));

  PolygonTag polygons;
  ByteWriter narrow = Legacy(134, 8);
  narrow.I32(1).U16(1).U16(2).U16(3).U16(0xFFFF);
  ASSERT_TRUE(ReadInto(polygons, ByteWriter().Start(5604, 0).Append(narrow.bytes).End().bytes, 11924));
  EXPECT_EQ(Numbers<Long>(polygons), (std::vector<Long>{1, 2, 3, 65535}));
  EXPECT_NE(ReadError(polygons, ByteWriter().Start(5604, 0).Long(1).End().bytes, 11924), 0);
  EXPECT_EQ(polygons.GetCount(), 0); // cleared before the array is looked at

  NormalTag normals;
  ByteWriter words = Legacy(135, 25 * 2);
  for (std::int16_t i = 0; i < 25; ++i)
    words.I16(static_cast<std::int16_t>(i * -1000));
  ASSERT_TRUE(ReadInto(normals, ByteWriter().Start(5711, 0).Append(words.bytes).End().bytes, 11924));
  EXPECT_EQ(normals.GetCount(), 2);
  Vector quad[4];
  ASSERT_TRUE(normals.ReadPolygonNormals(1, quad));
  EXPECT_EQ(quad[3], Vector(-21000.0 / 32000.0, -22000.0 / 32000.0, -23000.0 / 32000.0));
  EXPECT_FALSE(normals.ReadPolygonNormals(2, quad) || normals.WritePolygonNormals(-1, quad));
}

TEST(ValueTags, ReadOldVertexMapsByTypeAndVersion)
{
  const std::tuple<Long, Long, const char*, Long> rows[] = {
      {5682, 7499, "map", 1}, {5682, 7500, "mine", 1}, {5708, 7499, "mine", 2}, {5708, 11925, "mine", 2}};
  for (const auto& [type, version, name, count] : rows) {
    auto tag = Make(type);
    tag->ResizeTagArray(2);
    static_cast<VertexMapTag&>(*tag).GetArray()[0] = 1.0F;
    tag->SetName("mine");
    const char* body = version < 11925 ? " Smap X89000000043F000000 ]" : " L2 A5:0.5,0.5 ]";
    ASSERT_TRUE(ReadInto(*tag, Record("[" + std::to_string(type) + ",0" + body), version));
    EXPECT_TRUE(tag->GetName() == String(name) && tag->GetCount() == count);
    const bool read = type == 5682 || version == 11925;
    EXPECT_EQ(Numbers<SReal>(*tag)[0], read ? 0.5F : 1.0F);
    std::unique_ptr<GeListNode> clone(tag->MakeClone(0, nullptr));
    ASSERT_NE(clone, nullptr);
    EXPECT_EQ(Numbers<SReal>(static_cast<BaseArrayTag&>(*clone)), Numbers<SReal>(*tag));
  }
}

TEST(ValueTags, CopyOntoEmptyAndFilledTags)
{
  for (const Layout& layout : kLayouts) {
    const bool empties = layout.type == kTagNormal || layout.type == kTagVertexMap;
    auto source = layout.Make();
    auto empty = ::Make(layout.type);
    const auto entries = Numbers<UChar>(*source);
    ASSERT_TRUE(source->CopyWithTranslation(*empty, 0, nullptr));
    EXPECT_EQ(Numbers<UChar>(*empty), entries) << layout.type;
    EXPECT_TRUE(source->CopyWithTranslation(*source, 0, nullptr));

    // Onto a filled tag: those two are emptied themselves, and leave zeros there.
    auto filled = ::Make(layout.type);
    filled->ResizeTagArray(7);
    EXPECT_EQ(source->CopyWithTranslation(*filled, 0, nullptr), !empties) << layout.type;
    EXPECT_EQ(Numbers<UChar>(*filled), empties ? Bytes(entries.size(), 0) : entries) << layout.type;
    EXPECT_EQ(source->GetCount() == 0, empties) << layout.type;

    // From an empty one: polygons stay where they are.
    auto none = ::Make(layout.type);
    EXPECT_EQ(none->CopyWithTranslation(*empty, 0, nullptr), !empties);
    EXPECT_EQ(empty->GetCount() != 0, layout.type == kTagPolygon) << layout.type;
  }
}
