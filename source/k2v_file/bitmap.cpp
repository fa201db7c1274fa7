#include "torvane/bitmap.h"

namespace _torvane_
{

void Bitmap::Free()
{
  GeFree(encoded_);
  encodedSize_ = 0;
}

Long Bitmap::SetEncoded(const void* data, LLong size)
{
  if (!data)
    return IMAGERESULT_NULL;
  void* copy = GeAllocNC(size);
  if (!copy)
    return IMAGERESULT_MEMORY;
  GeCopyMem(copy, data, size);
  AdoptEncoded(copy, size);
  return IMAGERESULT_OK;
}

void Bitmap::AdoptEncoded(void*& data, LLong size)
{
  Free();
  encoded_ = data;
  encodedSize_ = size;
  data = nullptr;
}

Bool Bitmap::CopyTo(Bitmap& destination) const
{
  if (&destination == this)
    return true;
  if (encoded_)
    return destination.SetEncoded(encoded_, encodedSize_) == IMAGERESULT_OK;
  destination.Free();
  return true;
}

Bitmap* Bitmap::GetClone() const
{
  Bitmap* clone = NewObj<Bitmap>();
  if (clone && !CopyTo(*clone))
    DeleteObj(clone);
  return clone;
}

Long Bitmap::Save(const Filename&, Long, const BaseContainer*, Long) const
{
  // Without pixels there is nothing to encode.
  return IMAGERESULT_FORMAT;
}

} // namespace _torvane_
