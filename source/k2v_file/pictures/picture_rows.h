// What the loaders and savers of pictures share.
#pragma once

#include "torvane/pictures/bitmap.h"

namespace _torvane_
{

// Asked before memory is taken for the size that a picture file claims. A flat picture may well be a thousand times
// its file, and small ones need no reason; beyond that the header is wrong or malicious.
inline Bool IsPictureInProportion(LLong pixelBytes, LLong fileBytes)
{
  constexpr LLong kAlwaysGranted = LLong{16} << 20;
  constexpr LLong kMostPerByte = 1024;
  return pixelBytes <= kAlwaysGranted || (pixelBytes - kAlwaysGranted) / kMostPerByte <= fileBytes;
}

// Fetches a whole row as red, green, blue; a grey picture has all three alike. `row` holds three bytes a pixel.
inline void GetColorRow(const Bitmap& bitmap, Long y, UChar* row)
{
  constexpr LLong kStep = 3;
  LLong size = kStep * bitmap.GetBw();
  bitmap.GetLine(0, y, bitmap.GetBw(), row, kStep);
  if (bitmap.GetDepth() != kDepthGrey)
    return;
  for (LLong i = 0; i < size; i += kStep) {
    row[i + 1] = row[i];
    row[i + 2] = row[i];
  }
}

// Between red, green, blue and the order of BMP files.
inline void SwapRedAndBlue(UChar* row, Long width)
{
  for (LLong i = 0; i < LLong{3} * width; i += 3) {
    UChar first = row[i];
    row[i] = row[i + 2];
    row[i + 2] = first;
  }
}

} // namespace _torvane_
