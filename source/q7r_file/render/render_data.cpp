#include "torvane/render/render_data.h"

#include "k2v_file/stream/chunk_visitor.h"
#include "k2v_file/values/container_defaults.h"
#include "q7r_file/nodes/node_tools.h"
#include "q7r_file/render/render_defaults.h"
#include "torvane/hooks.h"

namespace _torvane_
{

namespace
{

constexpr ContainerDefault kMultipassDefaults[] = {{1002, DefaultForm::kLong, 1}};

} // namespace

RenderData::RenderData() : BaseList4D(kTypeRenderData)
{
  videoPosts_.SetOwner(this);
  multipasses_.SetOwner(this);
  SetRenderDefaults(data_);
}

Bool RenderData::MakeChildList()
{
  if (!children_)
    children_ = AllocRootRenderData();
  if (children_)
    children_->SetOwner(this);
  return children_ != nullptr;
}

void RenderData::WriteChunks(HyperFile& file)
{
  BaseList4D::WriteChunks(file);
  if (children_ && children_->HasContent())
    children_->WriteAsChunk(file, kChunkList);
  if (videoPosts_.HasContent())
    videoPosts_.WriteAsChunk(file, kChunkVideoPosts);
  if (multipasses_.HasContent())
    multipasses_.WriteAsChunk(file, kChunkMultipasses);
  WriteChunk(file, kChunkRenderExtra, 0, [this](ChunkWriter& v) { return v.Container(extraData_); });
}

Bool RenderData::ReadChunk(HyperFile& file, Long id, Long level)
{
  if (BaseList4D::ReadChunk(file, id, level))
    return true;
  switch (id) {
  case kChunkList:
    return MakeChildList() && children_->ReadChunks(file, false);
  case kChunkVideoPosts:
    return videoPosts_.ReadChunks(file, false);
  case kChunkMultipasses:
    return multipasses_.ReadChunks(file, false);
  case kChunkRenderExtra:
    return ReadChunkBody(file, level, [this](ChunkReader& v) { return v.Container(extraData_); });
  default:
    return false;
  }
}

Bool RenderData::CopyTo(PrivateChunk& destination, ULong flags, TransArray* translation)
{
  auto* target = NodeCast<RenderData>(&destination);
  if (!target)
    return false;
  if (!BaseList4D::CopyTo(destination, flags, translation) ||
      !videoPosts_.CopyTo(target->videoPosts_, flags, translation) ||
      !multipasses_.CopyTo(target->multipasses_, flags, translation) ||
      !extraData_.CopyTo(target->extraData_, flags, translation))
    return false;
  if ((flags & kCopyNoChildren) || !children_ || children_->IsEmpty())
    return true;
  return target->MakeChildList() && children_->CopyTo(*target->children_, flags, translation);
}

void RenderData::SetDocument(BaseDocument* document)
{
  if (document_ == document)
    return;
  BaseList4D::SetDocument(document);
  SetDocumentOfMembers(&videoPosts_, document);
  SetDocumentOfMembers(&multipasses_, document);
}

RenderData* AllocRenderData() { return NewObj<RenderData>(); }

MultipassObject::MultipassObject() : BaseList4D(kTypeMultipass) { data_.SetDefaults(DefaultsOf<kMultipassDefaults>()); }

void MultipassObject::WriteChunks(HyperFile& file)
{
  BaseList4D::WriteChunks(file);
  WriteChunk(file, kChunkMultipassData, 0, [this](ChunkWriter& v) { return v.Container(settings_); });
}

Bool MultipassObject::ReadChunk(HyperFile& file, Long id, Long level)
{
  if (BaseList4D::ReadChunk(file, id, level))
    return true;
  return id == kChunkMultipassData &&
         ReadChunkBody(file, level, [this](ChunkReader& v) { return v.Container(settings_); });
}

Bool MultipassObject::CopyTo(PrivateChunk& destination, ULong flags, TransArray* translation)
{
  auto* target = NodeCast<MultipassObject>(&destination);
  if (!target)
    return false;
  return BaseList4D::CopyTo(destination, flags, translation) && settings_.CopyTo(target->settings_, flags, translation);
}

BaseVideoPost::BaseVideoPost() : BaseList2D(kTypeVideoPost) {}

template <>
struct ChunkFields<BaseVideoPost>
{
  template <class Visitor>
  static Bool VisitHead(BaseVideoPost& post, Visitor& v)
  {
    v.Long(post.pluginId_);
    v.ConstantLong(0);
    if constexpr (Visitor::kReading) {
      String name;
      if (v.String(name) && !post.name_.Content())
        post.name_ = name;
    } else {
      v.String(post.name_);
    }
    return v.Good();
  }
};

void BaseVideoPost::WriteChunks(HyperFile& file)
{
  BaseList2D::WriteChunks(file);
  WriteChunk(file, kChunkNodeData, 0,
             [this](ChunkWriter& v) { return ChunkFields<BaseVideoPost>::VisitHead(*this, v); });
  WriteChunk(file, kChunkVideoPostData, 0, [this](ChunkWriter& v) { return v.Container(settings_); });
}

Bool BaseVideoPost::ReadChunk(HyperFile& file, Long id, Long level)
{
  if (BaseList2D::ReadChunk(file, id, level))
    return true;
  switch (id) {
  case kChunkNodeData:
    return ReadChunkBody(file, level,
                         [this](ChunkReader& v) { return ChunkFields<BaseVideoPost>::VisitHead(*this, v); });
  case kChunkVideoPostData:
    return ReadChunkBody(file, level, [this](ChunkReader& v) { return v.Container(settings_); });
  default:
    return false;
  }
}

Bool BaseVideoPost::CopyTo(PrivateChunk& destination, ULong flags, TransArray* translation)
{
  auto* target = NodeCast<BaseVideoPost>(&destination);
  if (!target)
    return false;
  target->pluginId_ = pluginId_;
  return BaseList2D::CopyTo(destination, flags, translation) && settings_.CopyTo(target->settings_, flags, translation);
}

} // namespace _torvane_
