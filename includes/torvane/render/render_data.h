// Render settings: about 130 values in the node's container, video post effects and multipass objects.
#pragma once

#include "torvane/nodes/base_list.h"
#include "torvane/stream/chunk_fields.h"

namespace _torvane_
{

// Settings with a known meaning; the others stand by number among the defaults in render_defaults.cpp.
inline constexpr Long kRenderWidth = 5008;       // Real, pixels
inline constexpr Long kRenderHeight = 5009;      // Real, pixels
inline constexpr Long kRenderFrameMode = 5016;   // Long, the mode of the frame range: 1, and 2 in exported scenes
inline constexpr Long kRenderFrameFrom = 5017;   // BaseTime
inline constexpr Long kRenderFrameTo = 5018;     // BaseTime
inline constexpr Long kRenderFrameRate = 5020;   // Real, frames per second
inline constexpr Long kRenderFilmAspect = 6006;  // Real
inline constexpr Long kRenderPixelAspect = 6008; // Real

// Chunks of render settings.
inline constexpr Long kChunkVideoPosts = 110130;
inline constexpr Long kChunkMultipasses = 300001049;
inline constexpr Long kChunkRenderExtra = 300001047;
inline constexpr Long kChunkMultipassData = 300001048;
inline constexpr Long kChunkVideoPostData = 300001060;

class RenderData : public BaseList4D
{
 public:
  static constexpr NodeKindOf<RenderData> kNodeKind{"render settings", &BaseList4D::kNodeKind};
  const NodeKind& GetNodeKind() const override { return kNodeKind; }

  // With every default, in the order in which a file holds them.
  RenderData();

  Bool ReadChunk(HyperFile& file, Long id, Long level) override;
  void WriteChunks(HyperFile& file) override;
  Bool CopyTo(PrivateChunk& destination, ULong flags, TransArray* translation) override;
  void SetDocument(BaseDocument* document) override;

  RenderData* GetNext() const { return NodeCast<RenderData>(BaseList4D::GetNext()); }
  RenderData* GetDown() const { return NodeCast<RenderData>(BaseList4D::GetDown()); }
  RootVideoPost& GetVideoPosts() { return videoPosts_; }
  RootMultipass& GetMultipasses() { return multipasses_; }
  BaseContainer& GetExtraData() { return extraData_; }

 protected:
  GeListNode* MakeEmpty() const override { return NewObj<RenderData>(); }

 private:
  Bool MakeChildList();

  RootVideoPost videoPosts_;
  RootMultipass multipasses_;
  BaseContainer extraData_;
};

class MultipassObject : public BaseList4D
{
 public:
  static constexpr NodeKindOf<MultipassObject> kNodeKind{"multipass", &BaseList4D::kNodeKind};
  const NodeKind& GetNodeKind() const override { return kNodeKind; }

  MultipassObject();

  Bool ReadChunk(HyperFile& file, Long id, Long level) override;
  void WriteChunks(HyperFile& file) override;
  Bool CopyTo(PrivateChunk& destination, ULong flags, TransArray* translation) override;

  BaseContainer& GetSettings() { return settings_; }

 protected:
  GeListNode* MakeEmpty() const override { return NewObj<MultipassObject>(); }

 private:
  BaseContainer settings_;
};

class BaseVideoPost : public BaseList2D
{
 public:
  static constexpr NodeKindOf<BaseVideoPost> kNodeKind{"video post", &BaseList2D::kNodeKind};
  const NodeKind& GetNodeKind() const override { return kNodeKind; }

  BaseVideoPost();

  Bool ReadChunk(HyperFile& file, Long id, Long level) override;
  void WriteChunks(HyperFile& file) override;
  Bool CopyTo(PrivateChunk& destination, ULong flags, TransArray* translation) override;

  BaseContainer& GetSettings() { return settings_; }
  Long GetPluginId() const { return pluginId_; }
  void SetPluginId(Long id) { pluginId_ = id; }

 protected:
  GeListNode* MakeEmpty() const override { return NewObj<BaseVideoPost>(); }

 private:
  friend struct ChunkFields<BaseVideoPost>;

  BaseContainer settings_;
  Long pluginId_ = 0;
};

// A new set of render settings that the caller owns; null when memory is short.
RenderData* AllocRenderData();

} // namespace _torvane_
