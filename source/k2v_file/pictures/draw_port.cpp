#include "torvane/pictures/draw_port.h"

#include "torvane/memory/assertion.h"
#include "torvane/pictures/bitmap.h"

namespace _torvane_
{

namespace
{

constexpr Long kFallbackBits = 16;
constexpr LLong kColorBytes = 3;

} // namespace

Bool IndependentDrawPort::CopyTo(DrawPort& destination) const
{
  UChar* target = PixelsOf(destination);
  if (!pixels_ || !target)
    return false;
  if (width_ != destination.GetWidth() || height_ != destination.GetHeight() || bits_ != destination.GetBits() ||
      rowSize_ != destination.GetRowSize() || depth_ != destination.GetDepth())
    return false;
  if (this != &destination)
    GeCopyMem(target, pixels_, rowSize_ * height_);
  return true;
}

void IndependentDrawPort::FreeStore()
{
  GeFree(pixels_);
  width_ = 0;
  height_ = 0;
  rowSize_ = 0;
}

Long IndependentDrawPort::Init(Long width, Long height)
{
  width = width < 1 ? 1 : width;
  height = height < 1 ? 1 : height;
  if (bits_ < 1) {
    ReportAssertion("k2v_file", __LINE__, "a draw port has no bit count");
    bits_ = kFallbackBits;
  }
  LLong rowSize = GetPaddedRowSize(width, bits_);
  auto* pixels = static_cast<UChar*>(GeAlloc(rowSize * height));
  if (!pixels)
    return IMAGERESULT_MEMORY;
  if (pixels_)
    FreeStore();
  pixels_ = pixels;
  width_ = width;
  height_ = height;
  rowSize_ = rowSize;
  return IMAGERESULT_OK;
}

Long DrawPort_RGB24::GetLine(Long x, Long y, Long count, void* buffer, LLong step) const
{
  const UChar* pixel = pixels_ + y * rowSize_ + x * kColorBytes;
  auto* place = static_cast<UChar*>(buffer);
  for (Long i = 0; i < count; ++i, pixel += kColorBytes, place += step) {
    place[0] = pixel[0];
    place[1] = pixel[1];
    place[2] = pixel[2];
  }
  return count;
}

Long DrawPort_RGB24::SetLine(Long x, Long y, Long count, const void* buffer, LLong step)
{
  UChar* pixel = pixels_ + y * rowSize_ + x * kColorBytes;
  const auto* place = static_cast<const UChar*>(buffer);
  for (Long i = 0; i < count; ++i, pixel += kColorBytes, place += step) {
    pixel[0] = place[0];
    pixel[1] = place[1];
    pixel[2] = place[2];
  }
  return count;
}

Long DrawPort_GREY8::GetLine(Long x, Long y, Long count, void* buffer, LLong step) const
{
  const UChar* pixel = pixels_ + y * rowSize_ + x;
  auto* place = static_cast<UChar*>(buffer);
  for (Long i = 0; i < count; ++i, place += step)
    *place = pixel[i];
  return count;
}

Long DrawPort_GREY8::SetLine(Long x, Long y, Long count, const void* buffer, LLong step)
{
  UChar* pixel = pixels_ + y * rowSize_ + x;
  const auto* place = static_cast<const UChar*>(buffer);
  for (Long i = 0; i < count; ++i, place += step)
    pixel[i] = *place;
  return count;
}

DrawPort* DrawPortCreate(Long depth)
{
  switch (depth) {
  case kDepthGrey:
    return NewObj<DrawPort_GREY8>();
  case kDepthColor:
    return NewObj<DrawPort_RGB24>();
  default:
    return nullptr;
  }
}

} // namespace _torvane_
