#include "q7r_file/nodes/node_data_chunk.h"

#include "torvane/hooks.h"
#include "torvane/nodes/base_list.h"
#include "torvane/stream/hyper_file.h"

namespace _torvane_
{

Bool AttachNodeData(NodeData* data, NodeDataSlot slot)
{
  DeleteObj(slot.data);
  slot.raw.Free();
  if (!data)
    return true;
  data->SetNode(&slot.node);
  slot.data = data;
  if (data->Init())
    return true;
  DeleteObj(slot.data);
  return false;
}

NodeData* AllocNodeDataFor(const BaseList2D& node, Long type, Bool& known)
{
  NodeData* data = AllocNodeData(type, known);
  if (!data || node.GetNodeKind().Is(data->GetOwnerKind()))
    return data;
  DeleteObj(data);
  known = false;
  return nullptr;
}

Bool ReadNodeDataBody(HyperFile& file, Long id, Long level, Long type, NodeDataSlot slot)
{
  Bool known = false;
  NodeData* data = AllocNodeDataFor(slot.node, type, known);
  if (known && !data) {
    DeleteObj(slot.data);
    slot.raw.Free();
    return false;
  }
  // The container was read from an earlier chunk: the defaults that Init puts there must not come over it.
  BaseContainer loaded(std::move(slot.node.GetDataInstance()));
  Bool attached = AttachNodeData(data, slot);
  slot.node.GetDataInstance() = std::move(loaded);
  if (!attached)
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
