// A scene layer: a named group that nodes can be assigned to, with the display switches that apply to its members.
#pragma once

#include "torvane/math/vector.h"
#include "torvane/nodes/base_list.h"
#include "torvane/stream/chunk_fields.h"

namespace _torvane_
{

inline constexpr Long kLayerFirstFlag = 1000; // parameters 1000 to 1008: the nine flags
inline constexpr Long kLayerFlagCount = 9;
inline constexpr Long kLayerColor = 1009;

class LayerObject : public BaseList4D
{
 public:
  static constexpr NodeKindOf<LayerObject> kNodeKind{"layer", &BaseList4D::kNodeKind};
  const NodeKind& GetNodeKind() const override { return kNodeKind; }

  // Makes its (empty) child list through the client's hook.
  LayerObject();

  Bool ReadChunk(HyperFile& file, Long id, Long level) override;
  void WriteChunks(HyperFile& file) override;
  Bool CopyTo(PrivateChunk& destination, ULong flags, TransArray* translation) override;
  // 1000 to 1008: a flag; 1009: the colour, or one component with a second level of 1000 to 1002.
  Bool GetParameter(const ParameterPath& path, GeData& value) override;
  Bool SetParameter(const ParameterPath& path, const GeData& value) override;
  // A hook for clients.
  virtual Bool Execute() { return false; }

  LayerObject* GetDown() const { return NodeCast<LayerObject>(BaseList4D::GetDown()); }
  LayerObject* GetNext() const { return NodeCast<LayerObject>(BaseList4D::GetNext()); }

  Bool GetFlag(Long index) const { return look_.flags[index]; } // 0 to 8
  void SetFlag(Long index, Bool value) { look_.flags[index] = value; }
  const Vector& GetColor() const { return look_.color; }

 protected:
  GeListNode* MakeEmpty() const override { return NewObj<LayerObject>(); }

 private:
  friend struct ChunkFields<LayerObject>;

  Bool MakeChildList();

  struct Look
  {
    Bool flags[kLayerFlagCount] = {false, true, true, true, false, true, true, true, true};
    Vector color = Vector(1.0, 1.0, 1.0);
  };

  Look look_;
};

// A new layer that the caller owns; null when memory is short.
LayerObject* AllocLayer();

} // namespace _torvane_
