#include "torvane/pictures/bitmap.h"

#include "torvane/memory/owned.h"
#include "torvane/pictures/bitmap_filters.h"

namespace _torvane_
{

Long Bitmap::Init(Long width, Long height, Long depth)
{
  if (width > kMaxImageSize || height > kMaxImageSize || (depth != kDepthGrey && depth != kDepthColor))
    return IMAGERESULT_FORMAT;
  Free();
  port_ = DrawPortCreate(depth);
  if (!port_)
    return IMAGERESULT_MEMORY;
  port_->SetOwner(this);
  Long result = port_->Init(width, height);
  if (result != IMAGERESULT_OK)
    DeleteObj(port_);
  return result;
}

void Bitmap::Free()
{
  DeleteObj(port_);
  GeFree(encoded_);
  encodedSize_ = 0;
}

void Bitmap::GetLine(Long x, Long y, Long count, void* buffer, LLong step) const
{
  if (port_)
    port_->GetLine(x, y, count, buffer, step);
}

void Bitmap::SetLine(Long x, Long y, Long count, const void* buffer, LLong step)
{
  if (port_)
    port_->SetLine(x, y, count, buffer, step);
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
  if (port_)
    return destination.Init(GetBw(), GetBh(), GetDepth()) == IMAGERESULT_OK && port_->CopyTo(*destination.port_);
  destination.Free();
  return true;
}

Bitmap* Bitmap::GetClone() const
{
  Owned<Bitmap> clone(NewObj<Bitmap>());
  return clone && CopyTo(*clone) ? clone.release() : nullptr;
}

Long Bitmap::Save(const Filename& name, Long format, const BaseContainer* settings, Long flags) const
{
  switch (format) {
  case kImageFormatBmp:
    return BmpSaver().Save(name, *this, settings, flags);
  case kImageFormatJpeg:
    return JpgSaver().Save(name, *this, settings, flags);
  default:
    return IMAGERESULT_MEMORY;
  }
}

Long Bitmap::LoadBmp(const Filename& name) { return BmpLoader().Load(name, *this, kFirstFrame); }

} // namespace _torvane_
