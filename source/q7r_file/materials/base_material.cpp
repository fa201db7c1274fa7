#include "torvane/materials/base_material.h"

#include "k2v_file/stream/chunk_visitor.h"
#include "q7r_file/materials/material_defaults.h"
#include "q7r_file/nodes/node_data_chunk.h"

namespace _torvane_
{

namespace
{

constexpr Long kChunkPreview = 110012;
constexpr Long kLevelPreview = 2;
constexpr Long kLevelPluginData = 5;

constexpr Long kPreviewQuality = 95;

// Materials of the 3D application that bear a label of their own in a file. Readers don't look at it.
constexpr Long kLabelledTypes[] = {8803, 8808, 1011014, 1011117, 1011118, 1011119, 1011120, 1011121, 1011122, 1017730};

String LabelOf(Long pluginType)
{
  String label("Mat");
  for (Long type : kLabelledTypes) {
    if (type == pluginType)
      label = String("Mat ") + String::FromLong(type);
  }
  return label;
}

} // namespace

BaseMaterial::BaseMaterial(Long type, Long pluginType) : BaseList2D(type), pluginType_(pluginType)
{
  SetBaseMaterialDefaults(data_);
}

Bool BaseMaterial::IsInstanceOf(Long type) const { return type == GetType() || BaseList2D::IsInstanceOf(type); }

template <>
struct ChunkFields<BaseMaterial>
{
  template <class Visitor>
  static Bool VisitPreview(BaseMaterial& material, Visitor& v)
  {
    if (v.VersionBelow(kVersionNodeHeader) || !Visitor::kReading)
      v.String(material.name_);
    else
      v.EmptyString(); // the node's header has told it
    // The preview, and two pictures that nothing holds any more.
    if constexpr (Visitor::kReading) {
      Bitmap dropped;
      v.Note(v.Good() && v.File().ReadImage(material.preview_) && v.File().ReadImage(dropped) &&
             v.File().ReadImage(dropped));
    } else {
      BaseContainer settings;
      settings.SetLong(kImageJpegQuality, kPreviewQuality);
      for (Bitmap* image : {&material.preview_, static_cast<Bitmap*>(nullptr), static_cast<Bitmap*>(nullptr)})
        v.Note(v.Good() && v.File().WriteImage(image, kImageFormatJpeg, &settings, 0));
    }
    if (v.Level() >= 1 && v.VersionBelow(kVersionNodeHeader))
      v.template Skip<BaseContainer>();
    if (v.Level() >= 2)
      v.ConstantBool(false);
    return v.Good();
  }
};

Bool BaseMaterial::ReadPluginData(HyperFile& file, Long level)
{
  String label;
  ChunkReader reader(file, level);
  return VisitNodeDataHead(reader, pluginType_, label) && raw_.Read(file, level);
}

// Content goes back at the level that it came with.
Long BaseMaterial::GetPluginLevel() const { return raw_.GetSize() > 0 ? raw_.GetLevel() : kLevelPluginData; }

void BaseMaterial::WritePluginData(HyperFile& file)
{
  WriteChunk(file, kChunkNodeData, GetPluginLevel(), [&](ChunkWriter& v) {
    String label = LabelOf(pluginType_);
    if (VisitNodeDataHead(v, pluginType_, label))
      raw_.Write(file);
  });
}

Bool BaseMaterial::ReadChunk(HyperFile& file, Long id, Long level)
{
  if (BaseList2D::ReadChunk(file, id, level))
    return true;
  switch (id) {
  case kChunkPreview:
    if (level < 0)
      return file.SkipToEndChunk();
    return ReadChunkBody(file, level,
                         [this](ChunkReader& v) { return ChunkFields<BaseMaterial>::VisitPreview(*this, v); });
  case kChunkNodeData:
    return ReadPluginData(file, level);
  default:
    return false;
  }
}

// The shaders stand before everything else of a material.
void BaseMaterial::WriteChunks(HyperFile& file)
{
  if (GetShaders())
    GetShaderRoot()->WriteAsChunk(file, kChunkShaders);
  if (preview_.GetEncodedSize() <= 0 && preview_.GetBw() < 1)
    SetBit(kMaterialNoPreview);
  BaseList2D::WriteChunks(file);
  if (GetDiskType() == kMaterialPlugin)
    WritePluginData(file);
  WriteChunk(file, kChunkPreview, kLevelPreview,
             [this](ChunkWriter& v) { return ChunkFields<BaseMaterial>::VisitPreview(*this, v); });
}

Bool BaseMaterial::CopyTo(PrivateChunk& destination, ULong flags, TransArray* translation)
{
  auto* target = NodeCast<BaseMaterial>(&destination);
  if (!target)
    return false;
  if (!(flags & kCopyNoMaterialExtra) && !preview_.CopyTo(target->preview_))
    return false;
  if (!BaseList2D::CopyTo(destination, flags, translation))
    return false;
  if (type_ != kMaterialPlugin)
    return true;
  target->pluginType_ = pluginType_;
  return raw_.CopyTo(target->raw_);
}

GeListNode* BaseMaterial::MakeEmpty() const
{
  BaseMaterial* material = MakeMaterial(GetType());
  if (material && material->GetDiskType() != GetDiskType()) {
    DeleteObj(material);
    material = NewObj<BaseMaterial>(GetDiskType(), pluginType_);
  }
  return material;
}

} // namespace _torvane_
