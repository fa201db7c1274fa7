#include "torvane/shaders/base_shader.h"

#include "k2v_file/stream/chunk_visitor.h"
#include "q7r_file/nodes/node_data_chunk.h"

namespace _torvane_
{

namespace
{

// The level at which the chunk of a type is written when no file has told one.
constexpr Long LevelOfType(Long type)
{
  switch (type) {
  case 1012161:
    return 5;
  case 1012166:
    return 6;
  default:
    return 0;
  }
}

} // namespace

BaseShader::BaseShader(Long type) : BaseList4D(type) { MakeChildList(); }

Bool BaseShader::MakeChildList()
{
  if (!children_)
    children_ = NewObj<RootShader>();
  if (children_)
    children_->SetOwner(this);
  return children_ != nullptr;
}

Bool BaseShader::IsInstanceOf(Long type) const { return type == kShaderLabel || BaseList4D::IsInstanceOf(type); }

// The list of a material has an owner too.
BaseShader* BaseShader::GetUp() const { return listHead_ ? NodeCast<BaseShader>(listHead_->GetOwner()) : nullptr; }

Bool BaseShader::ReadTypeData(HyperFile& file, Long level)
{
  Long type = 0;
  String name;
  ChunkReader reader(file, level);
  if (!VisitNodeDataHead(reader, type, name) || !raw_.Read(file, level))
    return false;
  SetType(type);
  hasReadLevel_ = true;
  return true;
}

// The children count only when all of them were read.
Bool BaseShader::ReadChildren(HyperFile& file)
{
  RootShader read;
  read.SetOwner(this);
  if (!read.ReadChunks(file, false) || !MakeChildList())
    return false;
  while (BaseList2D* child = read.GetFirst())
    children_->InsertLast(child);
  return true;
}

Bool BaseShader::ReadChunk(HyperFile& file, Long id, Long level)
{
  if (BaseList4D::ReadChunk(file, id, level))
    return true;
  switch (id) {
  case kChunkNodeData:
    return ReadTypeData(file, level);
  case kChunkList:
    return ReadChildren(file);
  default:
    return false;
  }
}

Long BaseShader::GetTypeDataLevel() const { return hasReadLevel_ ? raw_.GetLevel() : LevelOfType(type_); }

void BaseShader::WriteChunks(HyperFile& file)
{
  BaseList4D::WriteChunks(file);
  WriteChunk(file, kChunkNodeData, GetTypeDataLevel(), [&](ChunkWriter& v) {
    if (VisitNodeDataHead(v, type_, name_))
      raw_.Write(file);
  });
  if (GetDown())
    children_->WriteChunks(file);
}

Bool BaseShader::CopyTo(PrivateChunk& destination, ULong flags, TransArray* translation)
{
  auto* target = NodeCast<BaseShader>(&destination);
  if (!target)
    return false;
  target->SetType(GetType());
  target->hasReadLevel_ = hasReadLevel_;
  return raw_.CopyTo(target->raw_) && BaseList4D::CopyTo(destination, flags, translation);
}

Bool BaseShader::CloneChildren(BaseShader& clone, ULong flags, TransArray* translation)
{
  for (BaseShader* child = GetDown(); child; child = child->GetNext()) {
    auto* copy = clone.children_ ? NodeCast<BaseShader>(child->MakeClone(flags, translation)) : nullptr;
    if (!copy)
      return false;
    clone.children_->InsertLast(copy);
  }
  return !children_ || !clone.children_ || children_->CopyKeptChunks(*clone.children_);
}

// Links between the shader and its children are translated together, so the translation starts here.
GeListNode* BaseShader::MakeClone(ULong flags, TransArray* translation)
{
  AliasTranslator translator;
  if (!translation) {
    if (!translator.MakeTranslator())
      return nullptr;
    translation = translator.GetArray();
  }
  auto* clone = NewObj<BaseShader>();
  if (!clone)
    return nullptr;
  if (!CopyWithTranslation(*clone, flags, translation) ||
      (!(flags & kCopyNoChildren) && !CloneChildren(*clone, flags, translation))) {
    DeleteObj(clone);
    return nullptr;
  }
  translator.Finish(true);
  return clone;
}

Filename BaseShader::BitmapFilename() const
{
  return type_ == kShaderBitmap ? data_.GetFilename(kBitmapFilename) : Filename();
}

void BaseShader::SetBitmapFilename(const Filename& filename)
{
  if (type_ == kShaderBitmap)
    data_.SetFilename(kBitmapFilename, filename);
}

BaseShader* MakeShader(Long type) { return NewObj<BaseShader>(type); }

} // namespace _torvane_
