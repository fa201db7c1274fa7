// Render flags of an object. All of them are entries of the tag's container.
#pragma once

#include "torvane/tags/base_tag.h"

namespace _torvane_
{

inline constexpr Long kCompositingClock = 1157; // Long: milliseconds of a clock when the tag was made

class CompositingTag : public BaseTag
{
 public:
  static constexpr NodeKindOf<CompositingTag> kNodeKind{"compositing tag", &BaseTag::kNodeKind};
  const NodeKind& GetNodeKind() const override { return kNodeKind; }

  // With every default.
  CompositingTag();

  // Sets the clock to 0, which it stays unless an old file's values come, which lack it.
  void PrepareToRead() override;

  // Also takes the tag's own chunk of old files, whose values become entries.
  Bool ReadChunk(HyperFile& file, Long id, Long level) override;

 private:
  void StartClock();
};

} // namespace _torvane_
