// The value tags: tags that hold one array of equal entries, an entry for each point, polygon or segment of an object.
#pragma once

#include "torvane/math/vector.h"
#include "torvane/stream/chunk_fields.h"
#include "torvane/stream/hyper_file.h"
#include "torvane/tags/base_tag.h"

namespace _torvane_
{

// What all value tags have in common. The tag owns its array.
class BaseArrayTag : public BaseTag
{
 public:
  static constexpr NodeKindOf<BaseArrayTag> kNodeKind{"value tag", &BaseTag::kNodeKind};
  const NodeKind& GetNodeKind() const override { return kNodeKind; }

  ~BaseArrayTag() override;

  // Takes the chunk whose id is the tag's type. A count that the file cannot hold is an error before memory is taken.
  Bool ReadChunk(HyperFile& file, Long id, Long level) override;
  void WriteChunks(HyperFile& file) override;
  Bool CopyTo(PrivateChunk& destination, ULong flags, TransArray* translation) override;
  const void* GetEntryBytes(LLong& size) const override;

  // The number of entries.
  Long GetCount() const { return count_; }
  // Gives the array `count` entries: the first ones keep their values, new ones are zero. False, with nothing changed,
  // when memory is short and for a negative count.
  virtual Bool ResizeTagArray(Long count);

 protected:
  BaseArrayTag(Long type, LLong entrySize) : BaseTag(type), entrySize_(entrySize) {}

  // The content of the tag's own chunk.
  virtual Bool ReadEntries(HyperFile& file, Long level) = 0;
  virtual void WriteEntries(HyperFile& file) = 0;
  virtual Long GetEntriesLevel() const { return 0; }
  // `target` is a tag of this class and not this one. The common way: resize it and copy the bytes.
  virtual Bool CopyEntries(BaseArrayTag& target);
  // The way of tags that drop what the target has even if there is nothing to copy.
  Bool CopyEntriesAfresh(BaseArrayTag& target);
  // The way of tags that a copy onto a filled tag empties: `target` then gets zeroed entries, this tag loses its own,
  // and the copy fails. Without entries on both sides there is nothing to do.
  Bool CopyEntriesOntoEmpty(BaseArrayTag& target);

  // Frees the old entries and takes over the block.
  void AdoptEntries(void* block, LLong count);
  void FreeEntries() { AdoptEntries(nullptr, 0); }
  // A new block for a count that a file tells, if the file can hold so many entries of at least `leastSize` bytes; else
  // false, with the error of `file` set.
  Bool MakeEntries(HyperFile& file, LLong count, LLong leastSize, void*& block) const;

  void* block_ = nullptr; // null while there are no entries
  Long count_ = 0;
  const LLong entrySize_;
};

// How the entries stand in a file as bulk values: so many arrays, the first of which begins at the start of the block
// and each other one `step` bytes behind the one before.
struct ColumnLayout
{
  Long elementType; // an ArrayType
  Long columns;
  LLong step;
  LLong stride; // from one element to the next in memory
  LLong elementsPerEntry;
  LLong leastEntrySize; // bytes in a file
};

// A value tag whose array stands column by column in files from version 11925 on, and as one legacy value in older
// ones. A count of 0 or less leaves the tag as it is.
class ColumnTag : public BaseArrayTag
{
 protected:
  ColumnTag(Long type, LLong entrySize, const ColumnLayout& layout) : BaseArrayTag(type, entrySize), layout_(layout) {}

  Bool ReadEntries(HyperFile& file, Long level) override;
  void WriteEntries(HyperFile& file) override;
  // The legacy value of a file below version 11925.
  virtual Bool ReadOldEntries(HyperFile& file) = 0;

 private:
  const ColumnLayout& layout_;
};

// Adds the array by its type of entry.
template <class Entry, class Base>
class ArrayTag : public Base
{
 public:
  // The entries; null while there are none. Valid until the count changes.
  Entry* GetArray() { return static_cast<Entry*>(this->block_); }
  const Entry* GetArray() const { return static_cast<const Entry*>(this->block_); }

 protected:
  template <class... Args>
  explicit ArrayTag(Long type, Args&&... args) : Base(type, static_cast<LLong>(sizeof(Entry)), args...)
  {}
};

// A value tag whose entries stand in a file one behind the other, each as its values.
template <class Entry>
class RowTag : public ArrayTag<Entry, BaseArrayTag>
{
 protected:
  using ArrayTag<Entry, BaseArrayTag>::ArrayTag;

  Bool ReadEntries(HyperFile& file, Long level) override;
  void WriteEntries(HyperFile& file) override;
  Bool CopyEntries(BaseArrayTag& target) override { return this->CopyEntriesAfresh(target); }
};

// ---------------------------------------------------------------------------------------------------------------

// The points of an object.
class PointTag : public ArrayTag<Vector, ColumnTag>
{
 public:
  static constexpr NodeKindOf<PointTag> kNodeKind{"point tag", &BaseArrayTag::kNodeKind};
  const NodeKind& GetNodeKind() const override { return kNodeKind; }

  PointTag();

 protected:
  Bool ReadOldEntries(HyperFile& file) override;
};

// Four point numbers; those of a triangle end with the third one twice.
using PolygonCorners = LegacyPolygon;

// The polygons of an object.
class PolygonTag : public ArrayTag<PolygonCorners, ColumnTag>
{
 public:
  static constexpr NodeKindOf<PolygonTag> kNodeKind{"polygon tag", &BaseArrayTag::kNodeKind};
  const NodeKind& GetNodeKind() const override { return kNodeKind; }

  PolygonTag();

  // A count below 1 does nothing and gives true.
  Bool ResizeTagArray(Long count) override;

 protected:
  Bool ReadOldEntries(HyperFile& file) override;
};

// One run of the points of a spline.
struct SplineSegment
{
  Long points; // how many
  Long closed; // 1 or 0
};

// The segments of a spline.
class SegmentTag : public RowTag<SplineSegment>
{
 public:
  static constexpr NodeKindOf<SegmentTag> kNodeKind{"segment tag", &BaseArrayTag::kNodeKind};
  const NodeKind& GetNodeKind() const override { return kNodeKind; }

  SegmentTag();

  // False when the tag has no entries and gets none; -1 leaves the entries of a filled tag as they are.
  Bool ResizeTagArray(Long count) override;

 protected:
  Bool ReadEntries(HyperFile& file, Long level) override;
};

// The two tangents of a spline point, relative to the point.
struct TangentPair
{
  Vector left;
  Vector right;
};

// The tangents of a spline, a pair for each point.
class TangentTag : public RowTag<TangentPair>
{
 public:
  static constexpr NodeKindOf<TangentTag> kNodeKind{"tangent tag", &BaseArrayTag::kNodeKind};
  const NodeKind& GetNodeKind() const override { return kNodeKind; }

  TangentTag();

  // Drops the entries and makes `count` new ones of zeros. False, with the old ones kept, when memory is short and for
  // a negative count.
  Bool ReplaceTagArray(Long count);
};

// A weight for each point.
class VertexMapTag : public ArrayTag<SReal, ColumnTag>
{
 public:
  static constexpr NodeKindOf<VertexMapTag> kNodeKind{"vertex map", &BaseArrayTag::kNodeKind};
  const NodeKind& GetNodeKind() const override { return kNodeKind; }

  // The other type is kTagOldVertexMap, which holds no array in files below version 11925.
  explicit VertexMapTag(Long type = kTagVertexMap);

 protected:
  BaseTag* MakeEmpty() const override { return NewObj<VertexMapTag>(GetType()); }
  Bool ReadOldEntries(HyperFile& file) override;
  Bool CopyEntries(BaseArrayTag& target) override { return CopyEntriesOntoEmpty(target); }
};

// ---------------------------------------------------------------------------------------------------------------

// The normals at the four corners of a polygon: x, y, z of each as fixed point numbers.
struct PackedNormals
{
  Word components[12];
};

// 1.0 as a fixed point number.
inline constexpr Real kNormalScale = 32000.0;

class NormalTag : public ArrayTag<PackedNormals, ColumnTag>
{
 public:
  static constexpr NodeKindOf<NormalTag> kNodeKind{"normal tag", &BaseArrayTag::kNodeKind};
  const NodeKind& GetNodeKind() const override { return kNodeKind; }

  NormalTag();

  // The normals of polygon `index`; false for an index out of range. Writing truncates toward zero; what lies outside
  // of the 16-bit range (about -1.024 to 1.024) becomes its limit.
  Bool ReadPolygonNormals(Long index, Vector (&quad)[4]) const;
  Bool WritePolygonNormals(Long index, const Vector (&quad)[4]);

 protected:
  Bool ReadOldEntries(HyperFile& file) override;
  Bool CopyEntries(BaseArrayTag& target) override { return CopyEntriesOntoEmpty(target); }
};

// ---------------------------------------------------------------------------------------------------------------

// One texture coordinate in two words. The lowest bit of `word1` tells the form. 0: u and v as 32-bit floats, the
// lowest bit of v cleared; w is 0. 1: all three with 15 bits of mantissa and an exponent from 2^-15 to 2^16; a smaller
// number, zero among them, comes back with the exponent -15, as about 0.0000305.
struct PackedUVW
{
  ULong word0;
  ULong word1;
};

// Packs a coordinate, whose components are first brought into -100000 to 100000. A NaN becomes 0.
PackedUVW PackUVW(const Vector& uvw);
Vector UnpackUVW(const PackedUVW& packed);

// The coordinates at the corners of a polygon.
struct PackedUVWQuad
{
  PackedUVW corners[4];
};

inline constexpr Long kUVWParameter = 1000; // Long: a field of the tag

class UVWTag : public ArrayTag<PackedUVWQuad, BaseArrayTag>
{
 public:
  static constexpr NodeKindOf<UVWTag> kNodeKind{"texture coordinates", &BaseArrayTag::kNodeKind};
  const NodeKind& GetNodeKind() const override { return kNodeKind; }

  UVWTag();

  Bool ReadChunk(HyperFile& file, Long id, Long level) override;
  Bool GetParameter(const ParameterPath& path, GeData& value) override;
  Bool SetParameter(const ParameterPath& path, const GeData& value) override;

  // The coordinates of polygon `index`; false for an index out of range.
  Bool ReadPolygonUVW(Long index, Vector (&quad)[4]) const;
  Bool WritePolygonUVW(Long index, const Vector (&quad)[4]);

 protected:
  Long GetEntriesLevel() const override;
  Bool ReadEntries(HyperFile& file, Long level) override;
  void WriteEntries(HyperFile& file) override;
  // Fails when either tag has no entries.
  Bool CopyEntries(BaseArrayTag& target) override;

 private:
  friend struct ChunkFields<UVWTag>;

  Bool ReadOldEntries(HyperFile& file, Long level);
  Bool ReadFloatEntries(HyperFile& file);
  Bool ReadPointEntries(HyperFile& file);
  template <class CornerAt>
  Bool FillEntries(HyperFile& file, LLong quads, const CornerAt& cornerAt);

  Long parameter_ = 0; // kUVWParameter; a file holds whether it is 0
};

} // namespace _torvane_
