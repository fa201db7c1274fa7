// Materials: the surfaces of objects. BaseMaterial is the general one, and the class of every material whose type the
// library doesn't interpret; material.h adds the standard surface.
#pragma once

#include "torvane/nodes/base_list.h"
#include "torvane/pictures/bitmap.h"
#include "torvane/stream/chunk_fields.h"
#include "torvane/stream/raw_chunk_body.h"

namespace _torvane_
{

class Material;

class BaseMaterial : public BaseList2D
{
 public:
  static constexpr NodeKindOf<BaseMaterial> kNodeKind{"material", &BaseList2D::kNodeKind};
  const NodeKind& GetNodeKind() const override { return kNodeKind; }

  // The node type `type` is kMaterialStandard or kMaterialPlugin; `pluginType` is the real type behind the latter.
  explicit BaseMaterial(Long type, Long pluginType = -1);

  Bool IsInstanceOf(Long type) const override;
  Bool ReadChunk(HyperFile& file, Long id, Long level) override;
  // Also sets the info bit kMaterialNoPreview of a material without a preview.
  void WriteChunks(HyperFile& file) override;
  // With kCopyNoMaterialExtra the destination keeps its preview.
  Bool CopyTo(PrivateChunk& destination, ULong flags, TransArray* translation) override;
  // The type that the outside sees: that of the plug-in for kMaterialPlugin.
  Long GetType() const override { return type_ == kMaterialPlugin ? pluginType_ : type_; }
  Long GetDiskType() const override { return type_; }
  // A hook for clients.
  virtual Bool Execute() { return true; }

  BaseMaterial* GetNext() const { return NodeCast<BaseMaterial>(BaseList2D::GetNext()); }
  BaseMaterial* GetPrev() const { return NodeCast<BaseMaterial>(BaseList2D::GetPrev()); }

  // What a plug-in's material holds behind its type and name; empty for others.
  const RawChunkBody& GetRawBody() const { return raw_; }

  // The picture that is written with the material; empty on a new one.
  Bitmap& GetPreview() { return preview_; }
  const Bitmap& GetPreview() const { return preview_; }

 protected:
  // A plug-in's type that bears the number of the standard material gives a material of this class all the same.
  GeListNode* MakeEmpty() const override;

 private:
  friend struct ChunkFields<BaseMaterial>;

  Bool ReadPluginData(HyperFile& file, Long level);
  void WritePluginData(HyperFile& file);
  Long GetPluginLevel() const;

  Long pluginType_;
  RawChunkBody raw_; // what a plug-in's material holds behind its type and name
  Bitmap preview_;
};

// Info bit of a material that was written without a preview.
inline constexpr ULong kMaterialNoPreview = 32;

// A new material that the caller owns: a Material for kMaterialStandard, a BaseMaterial for any other type. Null when
// memory is short.
BaseMaterial* MakeMaterial(Long type);

} // namespace _torvane_
