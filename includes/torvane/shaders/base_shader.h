// Shaders: nodes that work out the image of a channel. They live in the shader list of the node that uses them and may
// have child shaders. The library interprets one type, the bitmap shader, and keeps all others as they come.
#pragma once

#include "torvane/nodes/base_list.h"
#include "torvane/stream/raw_chunk_body.h"
#include "torvane/text/filename.h"

namespace _torvane_
{

inline constexpr Long kShaderBitmap = 5833; // the type of a bitmap shader

// Parameters of a bitmap shader.
inline constexpr Long kBitmapFilename = 1000;
inline constexpr Long kBitmapLastFrame = 2001;

class BaseShader : public BaseList4D
{
 public:
  static constexpr NodeKindOf<BaseShader> kNodeKind{"shader", &BaseList4D::kNodeKind};
  const NodeKind& GetNodeKind() const override { return kNodeKind; }

  // Makes the list of children.
  explicit BaseShader(Long type = kShaderBitmap);

  Bool IsInstanceOf(Long type) const override;
  Bool ReadChunk(HyperFile& file, Long id, Long level) override;
  void WriteChunks(HyperFile& file) override;
  // The destination becomes a shader of this type.
  Bool CopyTo(PrivateChunk& destination, ULong flags, TransArray* translation) override;
  // Copies the children too unless kCopyNoChildren is set.
  GeListNode* MakeClone(ULong flags, TransArray* translation) override;

  BaseShader* GetUp() const; // null for a shader that isn't below another one
  BaseShader* GetDown() const { return NodeCast<BaseShader>(BaseList4D::GetDown()); }
  BaseShader* GetNext() const { return NodeCast<BaseShader>(BaseList4D::GetNext()); }
  BaseShader* GetPrev() const { return NodeCast<BaseShader>(BaseList4D::GetPrev()); }

  // What stands behind type and name in a file.
  const RawChunkBody& GetRawBody() const { return raw_; }

  // The file of a bitmap shader; an empty name for any other type.
  Filename BitmapFilename() const;
  Bool HasBitmapFilename() const { return BitmapFilename().Content(); }
  // Does nothing on a shader of another type.
  void SetBitmapFilename(const Filename& filename);

 private:
  Bool MakeChildList();
  Bool ReadTypeData(HyperFile& file, Long level);
  Bool ReadChildren(HyperFile& file);
  Bool CloneChildren(BaseShader& clone, ULong flags, TransArray* translation);
  Long GetTypeDataLevel() const;

  RawChunkBody raw_;          // what stands behind type and name in a file
  Bool hasReadLevel_ = false; // the level of `raw_` came from a file
};

// A new shader that the caller owns; null when memory is short.
BaseShader* MakeShader(Long type);

} // namespace _torvane_
