#include "q7r_file/nodes/node_tools.h"

#include "torvane/hyper_file.h"

namespace _torvane_
{

Real* ComponentOf(Vector& vector, Long id)
{
  switch (id) {
  case kVectorX:
    return &vector.x;
  case kVectorY:
    return &vector.y;
  case kVectorZ:
    return &vector.z;
  default:
    return nullptr;
  }
}

Bool ReadInnerChunk(HyperFile& file, PrivateChunk& inner)
{
  UChar tag = 0;
  if (!file.ReadValueHeader(tag))
    return false;
  if (tag == kTagChunkEnd)
    return true;
  if (tag != kTagChunkStart) {
    file.SetError(FILEERROR_WRONG_VALUE);
    return false;
  }
  Long id = 0;
  Long level = 0;
  if (!file.ReadChunkStart(id, level))
    return false;
  // What nobody takes is passed over with the rest of the inner chunk.
  if (!inner.ReadChunk(file, id, level) && !file.SkipToEndChunk())
    return false;
  return file.SkipToEndChunk();
}

Bool GetVectorParameter(const Vector& vector, const ParameterPath& path, GeData& value)
{
  Vector copy = vector;
  Long component = path[1].id;
  if (component == 0)
    value = GeData(vector);
  else if (const Real* place = ComponentOf(copy, component))
    value = GeData(*place);
  return true;
}

Bool SetVectorParameter(Vector& vector, const ParameterPath& path, const GeData& value)
{
  Long component = path[1].id;
  if (component == 0)
    vector = value.GetVector();
  else if (Real* place = ComponentOf(vector, component))
    *place = value.GetReal();
  return true;
}

} // namespace _torvane_
