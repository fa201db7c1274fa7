// The layout of a document's views: panels, each with up to four draws. A draw is one view: its display settings, a
// camera of its own, and a link to the scene camera that it looks through.
#pragma once

#include "torvane/nodes/base_list.h"
#include "torvane/stream/chunk_fields.h"

namespace _torvane_
{

class BaseObject;

// Chunks of views.
inline constexpr Long kChunkBaseDraw = 110305;
inline constexpr Long kLevelBaseDraw = 2;
inline constexpr Long kChunkViewPanel = 110306;
inline constexpr Long kChunkBaseDrawRoot = 110124;

// Preferences of a draw. They have no data, and nothing of them stands in a file.
class BaseDrawPref : public PrivateChunk
{};

class BaseDraw : public BaseList2D
{
 public:
  static constexpr NodeKindOf<BaseDraw> kNodeKind{"draw", &BaseList2D::kNodeKind};
  const NodeKind& GetNodeKind() const override { return kNodeKind; }

  // With every default display setting.
  BaseDraw();
  ~BaseDraw() override;

  Bool ReadChunk(HyperFile& file, Long id, Long level) override;
  void WriteChunks(HyperFile& file) override;
  Bool CopyTo(PrivateChunk& destination, ULong flags, TransArray* translation) override;
  void SetDocument(BaseDocument* document) override;

  BaseDraw* GetNext() const { return NodeCast<BaseDraw>(BaseList2D::GetNext()); }
  GeAliasLink& GetSceneCamera() { return sceneCamera_; }
  // The draw's own camera, made when it is first asked for; null when memory is short.
  BaseObject* GetEditorCamera();
  Bool HasEditorCamera() const { return editorCamera_ != nullptr; }

 protected:
  GeListNode* MakeEmpty() const override { return NewObj<BaseDraw>(); }

 private:
  friend struct ChunkFields<BaseDraw>;

  BaseDrawPref pref_;
  GeAliasLink sceneCamera_;
  BaseObject* editorCamera_ = nullptr; // owned; null until it is needed
};

class ViewPanel : public BaseList2D
{
 public:
  static constexpr NodeKindOf<ViewPanel> kNodeKind{"view panel", &BaseList2D::kNodeKind};
  const NodeKind& GetNodeKind() const override { return kNodeKind; }

  ViewPanel();

  Bool ReadChunk(HyperFile& file, Long id, Long level) override;
  void WriteChunks(HyperFile& file) override;
  Bool CopyTo(PrivateChunk& destination, ULong flags, TransArray* translation) override;
  void SetDocument(BaseDocument* document) override;

  ViewPanel* GetNext() const { return NodeCast<ViewPanel>(BaseList2D::GetNext()); }
  RootBaseDraw& GetDraws() { return draws_; }
  BaseContainer& GetSettings() { return settings_; }

  // The draw of an index, which is brought into the range 0 to 3. A panel with fewer than four draws first gets four
  // new ones at the head of its list: the perspective view, then the three along the axes. Null when memory is short.
  BaseDraw* GetBaseDraw(Long index);

 protected:
  GeListNode* MakeEmpty() const override { return NewObj<ViewPanel>(); }

 private:
  Bool MakeDraws();

  RootBaseDraw draws_;
  BaseContainer settings_;
};

} // namespace _torvane_
