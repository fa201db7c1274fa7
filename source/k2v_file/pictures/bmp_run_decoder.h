// The run coding of BMP files.
#pragma once

#include "torvane/types.h"

namespace _torvane_
{

// Receives each finished line, in file order, at most as many as the picture is high.
using BmpLineSink = void (*)(void* target, const UChar* row);

// Decodes pairs of count and value. Pixels are written to the row in images of 8 and 4 bits; in 4-bit ones two share a
// byte, high nibble first. Other images have no form of runs: their lines come out zero.
class BmpRunDecoder
{
 public:
  // `row` has GetPaddedRowSize(width, bits) bytes; it stays the caller's.
  BmpRunDecoder(UChar* row, Long width, Long height, Long bits, BmpLineSink sink, void* target);

  // Up to the code for the end of the image, the last line, or the end of the codes.
  void Decode(const UChar* codes, LLong size);

 private:
  void Put(UChar value, Long number);
  LLong TakeEscape(const UChar* codes, LLong left);
  LLong TakeLiterals(const UChar* codes, LLong left, Long count);
  void FinishLine();
  void ClearRow();

  UChar* row_;
  LLong rowSize_;
  Long width_;
  Long linesLeft_;
  Long bits_;
  BmpLineSink sink_;
  void* target_;
  Long x_ = 0;
};

} // namespace _torvane_
