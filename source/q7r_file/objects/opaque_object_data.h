// Object data whose values the library doesn't interpret: it keeps and hands on the bytes.
#pragma once

#include "torvane/nodes/private_chunk.h"
#include "torvane/stream/raw_chunk_body.h"

namespace _torvane_
{

class OpaqueObjectData : public NodeData
{
 public:
  static constexpr NodeKindOf<OpaqueObjectData> kNodeKind{"opaque data", &NodeData::kNodeKind};
  const NodeKind& GetNodeKind() const override { return kNodeKind; }
  const NodeKind& GetOwnerKind() const override;

  // `type` is that of the owner object; `level` and an empty body are what a new object writes.
  OpaqueObjectData(Long type, Long level, Long diskType) : type_(type), diskType_(diskType) { body_.SetEmpty(level); }

  Bool IsInstanceOf(Long type) const override { return type == type_ || NodeData::IsInstanceOf(type); }
  Long GetDiskType() const override { return diskType_; }
  Long GetChunkLevel() const override { return body_.GetLevel(); }
  void WriteChunks(HyperFile& file) override { body_.Write(file); }
  // Fails for data of another type.
  Bool CopyTo(PrivateChunk& destination, ULong flags, TransArray* translation) override;
  // Takes the rest of the node data chunk, whatever the version of the file, and leaves its end tag to the caller.
  Bool ReadData(HyperFile& file, Long id, Long level) override;

 private:
  Long type_;
  Long diskType_;
  RawChunkBody body_;
};

} // namespace _torvane_
