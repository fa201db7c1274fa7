#include "q7r_file/objects/opaque_object_data.h"

#include "torvane/ids.h"
#include "torvane/objects/base_object.h"
#include "torvane/stream/hyper_file.h"

namespace _torvane_
{

const NodeKind& OpaqueObjectData::GetOwnerKind() const { return BaseObject::kNodeKind; }

Bool OpaqueObjectData::CopyTo(PrivateChunk& destination, ULong, TransArray*)
{
  auto* target = NodeCast<OpaqueObjectData>(&destination);
  return target && target->type_ == type_ && body_.CopyTo(target->body_);
}

Bool OpaqueObjectData::ReadData(HyperFile& file, Long id, Long level)
{
  if (id != kChunkNodeData || !body_.Read(file, level))
    return false;
  // The end tag was read with the body; who reads a node's data goes on to the end of the chunk and wants to find it.
  if (file.GetFile().Seek(-1, kSeekRelative))
    return true;
  file.SetError(FILEERROR_SEEK);
  return false;
}

} // namespace _torvane_
