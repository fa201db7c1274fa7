// The headers of a BMP file: numbers are little-endian.
#pragma once

#include "torvane/types.h"

namespace _torvane_
{

inline constexpr UWord kBmpSignature = 0x4D42; // "BM"
inline constexpr ULong kBmpInfoSize = 40;
inline constexpr ULong kBmpHeaderSize = 54; // both headers
inline constexpr UWord kBmpBits = 24;

inline constexpr ULong kBmpPlain = 0;
inline constexpr ULong kBmpRuns8 = 1;
inline constexpr ULong kBmpRuns4 = 2;

struct BmpHeader
{
  UWord signature = 0;
  ULong fileSize = 0;
  UWord reserved[2] = {0, 0};
  ULong pixelOffset = 0;

  ULong infoSize = 0;
  ULong width = 0;  // signed in truth; negative ones count without their sign
  ULong height = 0; // signed in truth; from 1 on the rows stand from the bottom up
  UWord planes = 0;
  UWord bits = 0;
  ULong compression = 0;
  ULong imageSize = 0;
  ULong resolution[2] = {0, 0}; // in pixels a metre
  ULong colorsUsed = 0;
  ULong colorsImportant = 0;

  // Calls `number` with each value in file order.
  template <class Visitor>
  void Visit(Visitor&& number)
  {
    number(signature);
    number(fileSize);
    number(reserved[0]);
    number(reserved[1]);
    number(pixelOffset);
    number(infoSize);
    number(width);
    number(height);
    number(planes);
    number(bits);
    number(compression);
    number(imageSize);
    number(resolution[0]);
    number(resolution[1]);
    number(colorsUsed);
    number(colorsImportant);
  }
};

} // namespace _torvane_
