#include "q7r_file/nodes/node_data_chunk.h"

#include "torvane/hooks.h"
#include "torvane/nodes/base_list.h"
#include "torvane/objects/base_object.h"
#include "torvane/objects/point_object_data.h"
#include "torvane/stream/hyper_file.h"

namespace _torvane_
{

void ReplaceNodeData(BaseList2D& node, NodeData*& place, NodeData* data)
{
  if (data == place)
    return;
  DeleteObj(place);
  place = data;
  if (data)
    data->SetNode(&node);
}

Bool AttachNodeData(NodeData* data, const NodeDataSlot& slot)
{
  ReplaceNodeData(slot.node, slot.data, data);
  slot.raw.Free();
  if (!data)
    return true;
  // The container was read or copied before: the defaults that Init puts there must not come over it.
  BaseContainer present(std::move(slot.node.GetDataInstance()));
  const Bool made = data->Init();
  slot.node.GetDataInstance() = std::move(present);
  if (!made)
    DeleteObj(slot.data);
  return made;
}

NodeData* AllocNodeDataFor(const BaseList2D& node, Long type, Bool& known)
{
  NodeData* data = AllocNodeData(type, known);
  if (data && !node.GetNodeKind().Is(data->GetOwnerKind())) {
    DeleteObj(data);
    known = false;
  }
  if (data || known || type != kObjectPolygon || !NodeCast<BaseObject>(&node))
    return data;
  known = true;
  return NewObj<PolygonObjectData>();
}

namespace
{

// A hook knows the type and gives nothing. That is a failure; but what the file holds stays in the node, for where the
// failure passes for one that can be skipped. The end tag stays to be read.
void KeepUnreadBody(HyperFile& file, Long level, Long type, const NodeDataSlot& slot)
{
  const Bool isPolygon = type == kObjectPolygon && NodeCast<BaseObject>(&slot.node);
  AttachNodeData(isPolygon ? NewObj<PolygonObjectData>() : nullptr, slot);
  if (!isPolygon && slot.raw.Read(file, level) && !file.GetFile().Seek(-1, kSeekRelative))
    file.SetError(FILEERROR_SEEK);
}

} // namespace

Bool ReadNodeDataBody(HyperFile& file, Long id, Long level, Long type, const NodeDataSlot& slot)
{
  Bool known = false;
  NodeData* data = AllocNodeDataFor(slot.node, type, known);
  if (known && !data) {
    KeepUnreadBody(file, level, type, slot);
    return false;
  }
  if (!AttachNodeData(data, slot))
    return false;
  if (!data)
    return slot.raw.Read(file, level);
  if (known && !data->ReadData(file, id, level))
    return false;
  return file.SkipToEndChunk();
}

void WriteNodeDataBody(HyperFile& file, NodeData* data, const RawChunkBody& raw)
{
  if (data)
    data->WriteChunks(file);
  else
    raw.Write(file);
}

Long NodeDataLevel(const NodeData* data, const RawChunkBody& raw)
{
  return data ? data->GetChunkLevel() : raw.GetLevel();
}

} // namespace _torvane_
