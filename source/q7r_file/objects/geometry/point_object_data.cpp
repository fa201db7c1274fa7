#include "torvane/objects/point_object_data.h"

#include "k2v_file/stream/chunk_visitor.h"
#include "q7r_file/nodes/node_tools.h"
#include "torvane/objects/base_object.h"

namespace _torvane_
{

namespace
{

template <class Data, std::size_t count>
void WriteSelections(HyperFile& file, Data& data, const SelectionChunk<Data> (&rows)[count])
{
  for (const SelectionChunk<Data>& row : rows) {
    BaseSelect& selection = data.*row.selection;
    if (selection.SegmentCount() == 0)
      continue;
    WriteChunk(file, row.chunk, 0, [&](ChunkWriter& v) { selection.WriteChunks(v.File()); });
  }
}

// Null for the id of another chunk.
template <class Data, std::size_t count>
BaseSelect* FindSelection(Data& data, const SelectionChunk<Data> (&rows)[count], Long id)
{
  for (const SelectionChunk<Data>& row : rows) {
    if (row.chunk == id)
      return &(data.*row.selection);
  }
  return nullptr;
}

template <class Data, std::size_t count>
Bool CopySelections(const Data& source, Data& target, const SelectionChunk<Data> (&rows)[count])
{
  Bool copied = true;
  for (const SelectionChunk<Data>& row : rows)
    copied = copied && (source.*row.selection).CopySelect(target.*row.selection);
  return copied;
}

} // namespace

constexpr SelectionChunk<PointObjectData> PointObjectData::kSelections[] = {
    {kChunkPointSelection, &PointObjectData::pointSelection_},
    {kChunkHiddenPoints, &PointObjectData::hiddenPoints_},
};

// In the order of a file.
constexpr SelectionChunk<PolygonObjectData> PolygonObjectData::kSelections[] = {
    {kChunkPolygonSelection, &PolygonObjectData::polygonSelection_},
    {kChunkHiddenPolygons, &PolygonObjectData::hiddenPolygons_},
    {kChunkEdgeSelection, &PolygonObjectData::edgeSelection_},
    {kChunkHiddenEdges, &PolygonObjectData::hiddenEdges_},
    {kChunkPhongBreakEdges, &PolygonObjectData::phongBreakEdges_},
};

const NodeKind& PointObjectData::GetOwnerKind() const { return BaseObject::kNodeKind; }

void PointObjectData::WriteChunks(HyperFile& file)
{
  NodeData::WriteChunks(file);
  WriteSelections(file, *this, kSelections);
}

Bool PointObjectData::ReadData(HyperFile& file, Long id, Long)
{
  BaseSelect* selection = FindSelection(*this, kSelections, id);
  return selection && ReadInnerChunk(file, *selection);
}

Bool PointObjectData::CopyTo(PrivateChunk& destination, ULong flags, TransArray* translation)
{
  if (!NodeData::CopyTo(destination, flags, translation))
    return false;
  auto* target = NodeCast<PointObjectData>(&destination);
  const Bool bothPolygons = NodeCast<PolygonObjectData>(target) && NodeCast<PolygonObjectData>(this);
  const Bool neither = !NodeCast<PolygonObjectData>(target) && !NodeCast<PolygonObjectData>(this);
  return !target || (!bothPolygons && !neither) || CopySelections(*this, *target, kSelections);
}

void PolygonObjectData::WriteChunks(HyperFile& file)
{
  PointObjectData::WriteChunks(file);
  WriteSelections(file, *this, kSelections);
  if (ngons_ && ngons_->GetCount() > 0)
    WriteChunk(file, kChunkNgons, kLevelNgons, [this](ChunkWriter& v) { ngons_->Write(v); });
}

Bool PolygonObjectData::ReadData(HyperFile& file, Long id, Long level)
{
  if (PointObjectData::ReadData(file, id, level))
    return true;
  if (id == kChunkNgons)
    return ReadNgons(file, level);
  BaseSelect* selection = FindSelection(*this, kSelections, id);
  return selection && ReadInnerChunk(file, *selection);
}

Bool PolygonObjectData::MakeNgons()
{
  if (!ngons_)
    ngons_ = NewObj<NgonData>();
  return ngons_ != nullptr;
}

Bool PolygonObjectData::ReadNgons(HyperFile& file, Long level)
{
  if (!MakeNgons())
    return false;
  return ReadChunkBody(file, level, [this](ChunkReader& v) { return v.Level() != kLevelNgons || ngons_->Read(v); });
}

Bool PolygonObjectData::ResizeNgons(Long count)
{
  if (count >= 1)
    return MakeNgons() && ngons_->Resize(count);
  DeleteObj(ngons_);
  return true;
}

Bool PolygonObjectData::CopyTo(PrivateChunk& destination, ULong flags, TransArray* translation)
{
  if (!PointObjectData::CopyTo(destination, flags, translation))
    return false;
  auto* target = NodeCast<PolygonObjectData>(&destination);
  if (!target)
    return true;
  if (!CopySelections(*this, *target, kSelections))
    return false;
  if ((flags & kCopyNoNgons) || !ngons_ || ngons_->GetCount() == 0)
    return true;
  return target->MakeNgons() && ngons_->CopyTo(*target->ngons_);
}

} // namespace _torvane_
