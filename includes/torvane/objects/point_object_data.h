// What objects of points and of polygons hold beside their value tags: the selections of an editor, and n-gons.
#pragma once

#include "torvane/nodes/private_chunk.h"
#include "torvane/tags/base_select.h"

namespace _torvane_
{

class ChunkReader;
class ChunkWriter;

inline constexpr Long kChunkPointSelection = 110117;
inline constexpr Long kChunkHiddenPoints = 110118;
inline constexpr Long kChunkPolygonSelection = 110119;
inline constexpr Long kChunkHiddenPolygons = 110120;
inline constexpr Long kChunkEdgeSelection = 110128;
inline constexpr Long kChunkHiddenEdges = 110129;
inline constexpr Long kChunkPhongBreakEdges = 110132;
inline constexpr Long kChunkNgons = 110133;
inline constexpr Long kLevelNgons = 1;

// The edge list of one n-gon.
struct NgonEntry
{
  Long count;
  ULong* edges; // owned by the NgonData; null for none
};

// The n-gons of a polygon object, each as the list of its edges.
class NgonData
{
 public:
  NgonData() = default;
  ~NgonData() { FreeAll(); }
  NgonData(const NgonData&) = delete;
  NgonData& operator=(const NgonData&) = delete;

  Long GetCount() const { return count_; }
  // Null for an index out of range. Valid until the count changes.
  const NgonEntry* GetEntry(Long index) const { return index >= 0 && index < count_ ? &entries_[index] : nullptr; }
  // Replaces the edges of one n-gon by a copy of `count` numbers. False, with nothing changed, for an index out of
  // range and when memory is short.
  Bool SetEdges(Long index, const ULong* edges, Long count);

  // New entries are empty; those beyond a smaller count are freed, all of them for 0 and less. False, with nothing
  // changed, when memory is short.
  Bool Resize(Long count);
  void FreeAll();
  // The target becomes a copy; it is empty after a failure.
  Bool CopyTo(NgonData& target) const;

  // The values of chunk kChunkNgons. Reading replaces all entries; after a failure there are those that came.
  void Write(ChunkWriter& writer) const;
  Bool Read(ChunkReader& reader);

 private:
  NgonEntry* entries_ = nullptr; // owned
  Long count_ = 0;
};

// A selection and the chunk that holds it.
template <class Data>
struct SelectionChunk
{
  Long chunk;
  BaseSelect Data::*selection;
};

// The files give the selections no names: the names here stand for their place.
class PointObjectData : public NodeData
{
 public:
  static constexpr NodeKindOf<PointObjectData> kNodeKind{"point data", &NodeData::kNodeKind};
  const NodeKind& GetNodeKind() const override { return kNodeKind; }
  const NodeKind& GetOwnerKind() const override;

  Bool IsInstanceOf(Long type) const override { return type == kObjectPoint || NodeData::IsInstanceOf(type); }
  Long GetDiskType() const override { return kObjectPoint; }
  // A chunk for each selection that isn't empty.
  void WriteChunks(HyperFile& file) override;
  // Takes those chunks, and no others.
  Bool ReadData(HyperFile& file, Long id, Long level) override;
  // Copies the selections onto data of the same class alone; true for other data too.
  Bool CopyTo(PrivateChunk& destination, ULong flags, TransArray* translation) override;

  BaseSelect& GetPointSelection() { return pointSelection_; }
  BaseSelect& GetHiddenPoints() { return hiddenPoints_; }

 private:
  static const SelectionChunk<PointObjectData> kSelections[];

  BaseSelect pointSelection_;
  BaseSelect hiddenPoints_;
};

class PolygonObjectData : public PointObjectData
{
 public:
  static constexpr NodeKindOf<PolygonObjectData> kNodeKind{"polygon data", &PointObjectData::kNodeKind};
  const NodeKind& GetNodeKind() const override { return kNodeKind; }

  ~PolygonObjectData() override { DeleteObj(ngons_); }

  Bool IsInstanceOf(Long type) const override { return type == kObjectPolygon || PointObjectData::IsInstanceOf(type); }
  Long GetDiskType() const override { return kObjectPolygonLabel; }
  void WriteChunks(HyperFile& file) override;
  Bool ReadData(HyperFile& file, Long id, Long level) override;
  // As that of the base; the n-gons are left out with kCopyNoNgons.
  Bool CopyTo(PrivateChunk& destination, ULong flags, TransArray* translation) override;

  BaseSelect& GetPolygonSelection() { return polygonSelection_; }
  BaseSelect& GetHiddenPolygons() { return hiddenPolygons_; }
  BaseSelect& GetEdgeSelection() { return edgeSelection_; }
  BaseSelect& GetHiddenEdges() { return hiddenEdges_; }
  BaseSelect& GetPhongBreakEdges() { return phongBreakEdges_; }

  // Null while there are no n-gons.
  NgonData* GetNgons() const { return ngons_; }
  // A count below 1 frees the n-gons. False when memory is short.
  Bool ResizeNgons(Long count);

 private:
  static const SelectionChunk<PolygonObjectData> kSelections[];

  Bool MakeNgons();
  Bool ReadNgons(HyperFile& file, Long level);

  BaseSelect polygonSelection_;
  BaseSelect hiddenPolygons_;
  BaseSelect edgeSelection_;
  BaseSelect hiddenEdges_;
  BaseSelect phongBreakEdges_;
  NgonData* ngons_ = nullptr; // owned
};

} // namespace _torvane_
