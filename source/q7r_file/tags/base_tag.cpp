#include "torvane/tags/base_tag.h"

#include "k2v_file/stream/chunk_visitor.h"
#include "k2v_file/values/container_defaults.h"
#include "q7r_file/nodes/node_data_chunk.h"
#include "q7r_file/types/node_types.h"
#include "torvane/hooks.h"

namespace _torvane_
{

namespace
{

constexpr ContainerDefault kTargetDefaults[] = {
    {kTargetLink, DefaultForm::kLink}, {kTargetUpLink, DefaultForm::kLink}, {kTargetFlag, DefaultForm::kBool, 1}};

} // namespace

BaseTag::BaseTag(Long type, Long pluginId) : BaseList2D(type), pluginId_(pluginId)
{
  if (type == kTagTarget)
    data_.SetDefaults(DefaultsOf<kTargetDefaults>());
}

BaseTag::~BaseTag() { DeleteObj(nodeData_); }

void BaseTag::RemoveFromList()
{
  BaseList2D::RemoveFromList();
  object_ = nullptr;
}

const void* BaseTag::GetEntryBytes(LLong& size) const
{
  size = 0;
  return nullptr;
}

void BaseTag::SetNodeData(NodeData* data) { ReplaceNodeData(*this, nodeData_, data); }

Bool BaseTag::ReadChunk(HyperFile& file, Long id, Long level)
{
  if (BaseList2D::ReadChunk(file, id, level))
    return true;
  if (id != kChunkNodeData)
    return false;
  ChunkReader reader(file, level);
  if (!ReadNodeDataHead(reader, pluginId_, name_))
    return false;
  return ReadNodeDataBody(file, id, level, pluginId_, {*this, nodeData_, raw_});
}

void BaseTag::WriteChunks(HyperFile& file)
{
  BaseList2D::WriteChunks(file);
  if (GetDiskType() != kTagPlugin)
    return;
  WriteChunk(file, kChunkNodeData, NodeDataLevel(nodeData_, raw_), [&](ChunkWriter& v) {
    if (VisitNodeDataHead(v, pluginId_, name_))
      WriteNodeDataBody(file, nodeData_, raw_);
  });
}

Bool BaseTag::CopyTagData(BaseTag&, ULong, TransArray*) { return true; }

// The destination's behaviour object comes from the client, or from the library for a type that the client leaves to
// it.
Bool BaseTag::CopyPluginData(BaseTag& destination, ULong flags, TransArray* translation)
{
  destination.pluginId_ = pluginId_;
  if (!nodeData_) {
    // What the destination was made with would be written in place of the bytes.
    DeleteObj(destination.nodeData_);
    return raw_.CopyTo(destination.raw_);
  }
  Bool known = false;
  NodeData* data = AllocNodeDataFor(destination, pluginId_, known);
  if (!known && !data)
    data = AllocTagDataOfType(pluginId_, known);
  if (known && !data)
    return false;
  if (!AttachNodeData(data, {destination, destination.nodeData_, destination.raw_}))
    return false;
  return !data || !known || nodeData_->CopyTo(*data, flags, translation);
}

Bool BaseTag::CopyTo(PrivateChunk& destination, ULong flags, TransArray* translation)
{
  auto* target = NodeCast<BaseTag>(&destination);
  if (!target)
    return false;
  if (target == this)
    return true;
  if (GetType() != target->GetType() || GetDiskType() != target->GetDiskType() ||
      !target->GetNodeKind().Is(GetNodeKind()))
    return false;
  if (!BaseList2D::CopyTo(*target, flags, translation))
    return false;
  if (!CopyTagData(*target, flags, translation))
    return false;
  return GetDiskType() != kTagPlugin || CopyPluginData(*target, flags, translation);
}

Bool BaseTag::GetParameter(const ParameterPath& path, GeData& value)
{
  const AllocationWatch watch;
  const Bool known = nodeData_ && nodeData_->GetParameter(path, value);
  return known || watch.Failed() ? !watch.Failed() : BaseList2D::GetParameter(path, value);
}

Bool BaseTag::SetParameter(const ParameterPath& path, const GeData& value)
{
  const AllocationWatch watch;
  const Bool known = nodeData_ && nodeData_->SetParameter(path, value);
  return known || watch.Failed() ? !watch.Failed() : BaseList2D::SetParameter(path, value);
}

BaseTag* BaseTag::MakeEmpty() const
{
  BaseTag* tag = MakeTag(GetType());
  if (tag && (tag->GetDiskType() != GetDiskType() || tag->GetType() != GetType())) {
    DeleteObj(tag);
    tag = NewObj<BaseTag>(GetDiskType(), GetPluginId());
  }
  return tag;
}

} // namespace _torvane_
