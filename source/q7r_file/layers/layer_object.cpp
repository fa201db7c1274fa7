#include "torvane/layers/layer_object.h"

#include "k2v_file/stream/chunk_visitor.h"
#include "q7r_file/nodes/node_tools.h"
#include "torvane/hooks.h"

namespace _torvane_
{

LayerObject::LayerObject() : BaseList4D(kTypeLayer) { MakeChildList(); }

Bool LayerObject::MakeChildList()
{
  if (!children_)
    children_ = AllocRootLayer();
  if (children_)
    children_->SetOwner(this);
  return children_ != nullptr;
}

template <>
struct ChunkFields<LayerObject>
{
  // The first flag stands behind the colour: it came last.
  template <class Visitor>
  static Bool VisitBody(LayerObject& layer, Visitor& v)
  {
    for (Long i = 1; i < kLayerFlagCount; ++i)
      v.Bool(layer.look_.flags[i]);
    v.Vector(layer.look_.color);
    if (v.Level() >= 1)
      v.Bool(layer.look_.flags[0]);
    return v.Good();
  }
};

void LayerObject::WriteChunks(HyperFile& file)
{
  BaseList4D::WriteChunks(file);
  if (children_ && children_->HasContent())
    children_->WriteAsChunk(file, kChunkList);
  WriteChunk(file, kChunkLayer, kLevelLayer,
             [this](ChunkWriter& v) { return ChunkFields<LayerObject>::VisitBody(*this, v); });
}

Bool LayerObject::ReadChunk(HyperFile& file, Long id, Long level)
{
  if (BaseList4D::ReadChunk(file, id, level))
    return true;
  if (id == kChunkLayer)
    return ReadChunkBody(file, level, [this](ChunkReader& v) { return ChunkFields<LayerObject>::VisitBody(*this, v); });
  return id == kChunkList && MakeChildList() && children_->ReadChunks(file, false);
}

Bool LayerObject::CopyTo(PrivateChunk& destination, ULong flags, TransArray* translation)
{
  auto* target = NodeCast<LayerObject>(&destination);
  if (!target)
    return false;
  if (target == this)
    return true;
  if (!BaseList4D::CopyTo(destination, flags, translation))
    return false;
  target->look_ = look_;
  if ((flags & kCopyNoChildren) || !children_)
    return true;
  for (LayerObject* child = GetDown(); child; child = child->GetNext()) {
    auto* clone = NodeCast<LayerObject>(child->MakeClone(flags, translation));
    if (!clone)
      return false;
    if (!target->MakeChildList() || !clone->InsertUnderLast(target)) {
      DeleteObj(clone);
      return false;
    }
  }
  return !target->children_ || children_->CopyKeptChunks(*target->children_);
}

Bool LayerObject::GetParameter(const ParameterPath& path, GeData& value)
{
  Long id = path[0].id;
  if (id >= kLayerFirstFlag && id < kLayerFirstFlag + kLayerFlagCount) {
    value = GeData(look_.flags[id - kLayerFirstFlag]);
    return true;
  }
  return id == kLayerColor ? GetVectorParameter(look_.color, path, value) : BaseList4D::GetParameter(path, value);
}

Bool LayerObject::SetParameter(const ParameterPath& path, const GeData& value)
{
  Long id = path[0].id;
  if (id >= kLayerFirstFlag && id < kLayerFirstFlag + kLayerFlagCount) {
    look_.flags[id - kLayerFirstFlag] = value.GetBool();
    return true;
  }
  return id == kLayerColor ? SetVectorParameter(look_.color, path, value) : BaseList4D::SetParameter(path, value);
}

LayerObject* AllocLayer() { return NewObj<LayerObject>(); }

} // namespace _torvane_
