// A tag: a node that hangs on an object. BaseTag is the general tag; it also stands in for every tag type that the
// library can't interpret, whose bytes it keeps and writes back.
#pragma once

#include "torvane/nodes/base_list.h"
#include "torvane/stream/raw_chunk_body.h"

namespace _torvane_
{

class BaseObject;

// Entries of a target tag (5676).
inline constexpr Long kTargetLink = 1001;
inline constexpr Long kTargetUpLink = 1002;
inline constexpr Long kTargetFlag = 1003;

class BaseTag : public BaseList2D
{
 public:
  static constexpr NodeKindOf<BaseTag> kNodeKind{"tag", &BaseList2D::kNodeKind};
  const NodeKind& GetNodeKind() const override { return kNodeKind; }

  // `type` is the node type; `pluginId` the real type where the node type is kTagPlugin, else -1. A target tag (5676)
  // gets its two empty links and its flag.
  explicit BaseTag(Long type, Long pluginId = -1);
  ~BaseTag() override;

  Long GetType() const override { return type_ == kTagPlugin ? pluginId_ : type_; }
  Long GetDiskType() const override { return type_; }
  Bool ReadChunk(HyperFile& file, Long id, Long level) override;
  void WriteChunks(HyperFile& file) override;
  // Fails for a tag of another GetType.
  Bool CopyTo(PrivateChunk& destination, ULong flags, TransArray* translation) override;
  Bool GetParameter(const ParameterPath& path, GeData& value) override;
  Bool SetParameter(const ParameterPath& path, const GeData& value) override;
  void RemoveFromList() override; // the tag then has no object
  // Called once for a new tag that a file is to fill, before anything is read.
  virtual void PrepareToRead() {}

  BaseTag* GetNext() const { return NodeCast<BaseTag>(BaseList2D::GetNext()); }
  BaseObject* GetObject() const { return object_; }
  void SetObject(BaseObject* object) { object_ = object; }
  Long GetPluginId() const { return pluginId_; }
  NodeData* GetNodeData() const { return nodeData_; }
  // Replaces the behaviour object and sets its node; the tag owns it.
  void SetNodeData(NodeData* data);

  // The kept bytes of a plug-in tag without a NodeData.
  const void* GetRawData() const { return raw_.GetData(); }
  LLong GetRawSize() const { return raw_.GetSize(); }
  Long GetRawLevel() const { return raw_.GetLevel(); }

  // The entries of a value tag as one block of bytes; null and 0 for every other tag.
  virtual const void* GetEntryBytes(LLong& size) const;

 protected:
  // Copies what a class adds beyond its container.
  virtual Bool CopyTagData(BaseTag& destination, ULong flags, TransArray* translation);

  // A plug-in's type that is listed with another class, or is a label, gives a tag of this class all the same.
  BaseTag* MakeEmpty() const override;

  Bool CopyPluginData(BaseTag& destination, ULong flags, TransArray* translation);

  RawChunkBody raw_;             // of the chunk kChunkNodeData of a plug-in tag, when there is no behaviour object
  NodeData* nodeData_ = nullptr; // owned
  BaseObject* object_ = nullptr; // the object that holds the tag; not owned
  Long pluginId_ = -1;
};

// A new tag of a type, of the class that stands for it; null when memory is short. The caller owns it. The label
// kTagPlugin gives an empty plug-in tag, whose real type a file then tells.
BaseTag* MakeTag(Long type);

} // namespace _torvane_
