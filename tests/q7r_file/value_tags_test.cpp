// Tags that hold arrays: their bytes, the layouts of older files, counts that lie, and their ways of copying.
#include <memory>

#include <gtest/gtest.h>

#include "q7r_file/tag_bytes.h"
#include "support/counting_memory.h"
#include "support/text.h"
#include "torvane/tags/value_tags.h"

namespace
{

using namespace _torvane_;

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

void Fill(PointTag& tag)
{
  tag.ResizeTagArray(3);
  for (Long i = 0; i < 3; ++i)
    tag.GetArray()[i] = Vector(1 + 3 * i, 2 + 3 * i, 3 + 3 * i);
}

void Fill(PolygonTag& tag)
{
  tag.ResizeTagArray(2);
  tag.GetArray()[0] = {0, 1, 2, 2};
  tag.GetArray()[1] = {3, 4, 5, 0x01020304};
}

void Fill(SegmentTag& tag)
{
  tag.ResizeTagArray(2);
  tag.GetArray()[0] = {7, 1};
  tag.GetArray()[1] = {-1, 0};
}

void Fill(TangentTag& tag)
{
  tag.ReplaceTagArray(1);
  tag.GetArray()[0] = {Vector(1, 2, 0), Vector(0, 0, -2)};
}

void Fill(VertexMapTag& tag)
{
  tag.ResizeTagArray(2);
  tag.GetArray()[0] = 1.0F;
  tag.GetArray()[1] = 0.25F;
}

void Fill(NormalTag& tag)
{
  tag.ResizeTagArray(1);
  const Vector quad[4] = {{1, -1, 0}, {0.00004, -0.00006, 0.5}, {1.02, 1.1, -1.1}, {0, 0, 0.9999999}};
  tag.WritePolygonNormals(0, quad);
}

struct Layout
{
  Long type;
  void (*fill)(BaseArrayTag&);
  const char* empty;
  const char* filled;
};

template <class Tag>
void FillAs(BaseArrayTag& tag)
{
  Fill(static_cast<Tag&>(tag));
}

const Layout kLayouts[] = {
    {5600, FillAs<PointTag>, "01 000015E0 00000000 0F 00000000 02",
     "01 000015E0 00000000 0F 00000003"
     "8C 00000019 06 3FF0000000000000 4010000000000000 401C000000000000"
     "8C 00000019 06 4000000000000000 4014000000000000 4020000000000000"
     "8C 00000019 06 4008000000000000 4018000000000000 4022000000000000 02"},
    {5604, FillAs<PolygonTag>, "01 000015E4 00000000 0F 00000000 02",
     "01 000015E4 00000000 0F 00000002  8C 00000009 03 00000000 00000003  8C 00000009 03 00000001 00000004"
     "8C 00000009 03 00000002 00000005  8C 00000009 03 00000002 01020304 02"},
    {5617, FillAs<TangentTag>, "01 000015F1 00000000 0F 00000000 02",
     "01 000015F1 00000000 0F 00000001  17 3FF0000000000000 4000000000000000 0000000000000000"
     "17 0000000000000000 0000000000000000 C000000000000000 02"},
    {5672, FillAs<SegmentTag>, "01 00001628 00000000 0F 00000000 02",
     "01 00001628 00000000 0F 00000002  0F 00000007 15 01  0F FFFFFFFF 15 00 02"},
    {5682, FillAs<VertexMapTag>, "01 00001632 00000000 0F 00000000 02",
     "01 00001632 00000000 0F 00000002  8C 00000009 05 3F800000 3E800000 02"},
    // 32000, -32000, 0; 1 and -1 for 1.28 and -1.92; 32640 and the limits of 16 bits; 31999 for 31999.9968
    {5711, FillAs<NormalTag>, "01 0000164F 00000000 0F 00000000 02",
     "01 0000164F 00000000 0F 00000001  8C 00000019 02 7D00 8300 0000  0001 FFFF 3E80  7F80 7FFF 8000  0000 0000 7CFF"
     "02"},
};

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
    auto tag = Make(layout.type);
    EXPECT_EQ(ToHex(OwnChunks(*tag)), ToHex(FromHex(layout.empty)));
    layout.fill(*tag);
    EXPECT_EQ(ToHex(OwnChunks(*tag)), ToHex(FromHex(layout.filled)));
    auto copy = Make(layout.type);
    ASSERT_TRUE(ReadInto(*copy, FromHex(layout.filled)));
    EXPECT_EQ(ToHex(OwnChunks(*copy)), ToHex(FromHex(layout.filled)));
    EXPECT_EQ(Numbers<UChar>(*copy), Numbers<UChar>(*tag)) << layout.type;
  }
}

TEST(ValueTags, KeepOrDropTheirEntriesWhenAFileHasNone)
{
  for (const Layout& layout : kLayouts) {
    auto tag = Make(layout.type);
    layout.fill(*tag);
    const Long count = tag->GetCount();
    ASSERT_TRUE(ReadInto(*tag, ByteWriter().Start(layout.type, -1).Long(1).Long(2).End().bytes));
    EXPECT_EQ(tag->GetCount(), count); // a level below 0: passed over
    ASSERT_TRUE(ReadInto(*tag, FromHex(layout.empty)));
    const bool drops = layout.type == kTagTangent || layout.type == kTagSegment;
    EXPECT_EQ(tag->GetCount(), drops ? 0 : count) << layout.type;
    const Bytes negative = ByteWriter().Start(layout.type, 0).Long(-3).End().bytes;
    EXPECT_EQ(ReadError(*tag, negative), drops ? -100 : 0) << layout.type;
  }
}

TEST(ValueTags, ReportMemoryThatIsShortAndKeepTheirEntries)
{
  for (const Layout& layout : kLayouts) {
    auto tag = Make(layout.type);
    layout.fill(*tag);
    const auto entries = Numbers<UChar>(*tag);
    counting_memory::FailAfter(0);
    EXPECT_FALSE(tag->ResizeTagArray(100));
    counting_memory::FailNever();
    EXPECT_EQ(Numbers<UChar>(*tag), entries);

    AssertionCounter silence;
    MemoryReadFile memory(ByteWriter().Header().Append(FromHex(layout.filled)).bytes);
    UChar header = 0;
    Long id = 0;
    Long level = 0;
    ASSERT_TRUE(memory.file.ReadValueHeader(header) && memory.file.ReadChunkStart(id, level));
    counting_memory::FailAfter(0);
    EXPECT_FALSE(tag->ReadChunk(memory.file, id, level));
    counting_memory::FailNever();
    EXPECT_EQ(memory.file.GetError(), -7) << layout.type;
    EXPECT_TRUE(layout.type == kTagSegment || Numbers<UChar>(*tag) == entries) << layout.type;
  }
}

TEST(ValueTags, ResizeKeepingTheFirstEntriesAndClearingNewOnes)
{
  VertexMapTag map;
  Fill(map);
  ASSERT_TRUE(map.ResizeTagArray(4));
  EXPECT_EQ(Numbers<SReal>(map), (std::vector<SReal>{1.0F, 0.25F, 0.0F, 0.0F}));
  ASSERT_TRUE(map.ResizeTagArray(1));
  EXPECT_EQ(Numbers<SReal>(map), (std::vector<SReal>{1.0F}));
  EXPECT_FALSE(map.ResizeTagArray(-1));
  EXPECT_TRUE(map.ResizeTagArray(0));
  EXPECT_EQ(map.GetArray(), nullptr);

  PolygonTag polygons;
  Fill(polygons);
  EXPECT_TRUE(polygons.ResizeTagArray(0) && polygons.ResizeTagArray(-9));
  EXPECT_EQ(polygons.GetCount(), 2);

  SegmentTag segments;
  EXPECT_FALSE(segments.ResizeTagArray(0) || segments.ResizeTagArray(-1));
  Fill(segments);
  EXPECT_TRUE(segments.ResizeTagArray(-1));
  EXPECT_EQ(segments.GetCount(), 2);
  EXPECT_TRUE(segments.ResizeTagArray(0));
  EXPECT_EQ(segments.GetCount(), 0);

  TangentTag tangents;
  Fill(tangents);
  EXPECT_TRUE(tangents.ReplaceTagArray(2));
  EXPECT_EQ(Numbers<Real>(tangents), std::vector<Real>(12, 0.0));
}

TEST(ValueTags, ReadTheArraysOfOldFiles)
{
  PointTag points;
  ByteWriter pointArray = Legacy(133, 2 * 12);
  pointArray.F64(1).F64(2).F64(3).F64(4).F64(5).F64(6);
  Fill(points);
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
  struct Row
  {
    Long type;
    Long version;
    const char* name;
    Long count;
  };
  const Row rows[] = {
      {5682, 7499, "map", 1}, {5682, 7500, "mine", 1}, {5708, 7499, "mine", 2}, {5708, 11925, "mine", 2}};
  for (const Row& row : rows) {
    auto tag = Make(row.type);
    FillAs<VertexMapTag>(*tag);
    tag->SetName("mine");
    ByteWriter chunk;
    chunk.Start(row.type, 0);
    if (row.version < 11925)
      chunk.String(u"map").U8(137).U32(4).F32(0.5F);
    else
      chunk.Long(2).ArrayHead(5, 8).F32(0.5F).F32(0.5F);
    ASSERT_TRUE(ReadInto(*tag, chunk.End().bytes, row.version));
    EXPECT_EQ(tag->GetName(), String(row.name));
    EXPECT_EQ(tag->GetCount(), row.count);
    const bool read = row.type == 5682 || row.version == 11925;
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
    auto source = Make(layout.type);
    auto empty = Make(layout.type);
    layout.fill(*source);
    const auto entries = Numbers<UChar>(*source);
    ASSERT_TRUE(source->CopyWithTranslation(*empty, 0, nullptr));
    EXPECT_EQ(Numbers<UChar>(*empty), entries) << layout.type;
    EXPECT_TRUE(source->CopyWithTranslation(*source, 0, nullptr));

    // Onto a filled tag: those two are emptied themselves, and leave zeros there.
    auto filled = Make(layout.type);
    filled->ResizeTagArray(7);
    EXPECT_EQ(source->CopyWithTranslation(*filled, 0, nullptr), !empties) << layout.type;
    EXPECT_EQ(Numbers<UChar>(*filled), empties ? Bytes(entries.size(), 0) : entries) << layout.type;
    EXPECT_EQ(source->GetCount() == 0, empties) << layout.type;

    // From an empty one: polygons stay where they are.
    auto none = Make(layout.type);
    EXPECT_EQ(none->CopyWithTranslation(*empty, 0, nullptr), !empties);
    EXPECT_EQ(empty->GetCount() != 0, layout.type == kTagPolygon) << layout.type;
  }
}
