#include "torvane/tags/selection_tag.h"

namespace _torvane_
{

Bool SelectionTag::ReadChunk(HyperFile& file, Long id, Long level)
{
  if (BaseTag::ReadChunk(file, id, level))
    return true;
  return id == kChunkSelect && (level < 0 || select_.ReadChunk(file, id, level));
}

void SelectionTag::WriteChunks(HyperFile& file)
{
  BaseTag::WriteChunks(file);
  select_.WriteChunks(file);
}

Bool SelectionTag::CopyTagData(BaseTag& destination, ULong, TransArray*)
{
  auto* target = NodeCast<SelectionTag>(&destination);
  return target && select_.CopySelect(target->select_);
}

} // namespace _torvane_
