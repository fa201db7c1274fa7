// A named set of polygons, points or edges of its object.
#pragma once

#include "torvane/tags/base_select.h"
#include "torvane/tags/base_tag.h"

namespace _torvane_
{

class SelectionTag : public BaseTag
{
 public:
  static constexpr NodeKindOf<SelectionTag> kNodeKind{"selection tag", &BaseTag::kNodeKind};
  const NodeKind& GetNodeKind() const override { return kNodeKind; }

  // `type` tells of what: kTagPolygonSelection, kTagPointSelection or kTagEdgeSelection.
  explicit SelectionTag(Long type) : BaseTag(type) {}

  // A selection chunk of a negative level gives true and stays unread.
  Bool ReadChunk(HyperFile& file, Long id, Long level) override;
  void WriteChunks(HyperFile& file) override;

  BaseSelect& GetSelect() { return select_; }
  const BaseSelect& GetSelect() const { return select_; }

 protected:
  Bool CopyTagData(BaseTag& destination, ULong flags, TransArray* translation) override;

 private:
  BaseSelect select_;
};

} // namespace _torvane_
