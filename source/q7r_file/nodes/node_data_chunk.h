// The chunk that holds what is particular to a node's type, for objects and tags alike: the type, a constant, the
// node's name, and then the values of its NodeData or the bytes that were kept for want of one.
#pragma once

#include "k2v_file/stream/chunk_visitor.h"
#include "torvane/nodes/private_chunk.h"
#include "torvane/stream/raw_chunk_body.h"

namespace _torvane_
{

class BaseList2D;
class String;

// The values that open the chunk.
template <class Visitor>
Bool VisitNodeDataHead(Visitor& v, Long& type, String& name)
{
  v.Long(type);
  v.ConstantLong(0);
  v.String(name);
  return v.Good();
}

// The same for a node that may have a name already, which then stays.
inline Bool ReadNodeDataHead(ChunkReader& v, Long& type, String& name)
{
  if (!name.Content())
    return VisitNodeDataHead(v, type, name);
  v.Long(type);
  v.ConstantLong(0);
  return v.Note(v.Good() && v.File().SkipString());
}

// Where a node keeps the content of the chunk: a NodeData, which the node owns, or else the bytes.
struct NodeDataSlot
{
  BaseList2D& node;
  NodeData*& data;
  RawChunkBody& raw;
};

// What the client's hook gives for a node of a type; data that are for nodes of another class count as none, and the
// type as unknown. A polygon object, whose chunks are its data's to read, gets the library's own when the client knows
// none.
NodeData* AllocNodeDataFor(const BaseList2D& node, Long type, Bool& known);

// Reads the rest of the chunk behind its opening values, the end tag included, into a NodeData of `type` that the
// client makes, or as bytes if the client doesn't know the type. What was there before goes. False when a NodeData
// can't be made or doesn't take the content: the stream then stands inside the chunk, for the caller to skip.
Bool ReadNodeDataBody(HyperFile& file, Long id, Long level, Long type, const NodeDataSlot& slot);

// Writes what stands behind the opening values.
void WriteNodeDataBody(HyperFile& file, NodeData* data, const RawChunkBody& raw);

// The level at which the chunk is to be written.
Long NodeDataLevel(const NodeData* data, const RawChunkBody& raw);

// Puts `data` (may be null) into a node's place for them, where the old ones are deleted.
void ReplaceNodeData(BaseList2D& node, NodeData*& place, NodeData* data);

// Puts `data` (may be null) into the slot in place of what was there and runs its Init; the node's container stays as
// it is. A data object that Init refuses is deleted: false.
Bool AttachNodeData(NodeData* data, const NodeDataSlot& slot);

} // namespace _torvane_
