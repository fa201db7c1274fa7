#include "k2v_file/pictures/bmp_run_decoder.h"

#include <cstring>

#include "torvane/pictures/bitmap.h"

namespace _torvane_
{

namespace
{

// What stands behind a count of zero; any other number is a count of literal values.
enum Escape : UChar
{
  kEndOfLine = 0,
  kEndOfImage = 1,
  kDelta = 2,
};

constexpr LLong kEnd = -1; // there is nothing more to decode

} // namespace

BmpRunDecoder::BmpRunDecoder(UChar* row, Long width, Long height, Long bits, BmpLineSink sink, void* target)
    : row_(row),
      rowSize_(GetPaddedRowSize(width, bits)),
      width_(width),
      linesLeft_(height),
      bits_(bits),
      sink_(sink),
      target_(target)
{
  ClearRow();
}

void BmpRunDecoder::ClearRow() { std::memset(row_, 0, static_cast<std::size_t>(rowSize_)); }

void BmpRunDecoder::FinishLine()
{
  if (linesLeft_ < 1)
    return;
  --linesLeft_;
  sink_(target_, row_);
  ClearRow();
}

// The next pixel: `value`, or in a 4-bit image its high or low half, by turns from `number` 0 on.
void BmpRunDecoder::Put(UChar value, Long number)
{
  if (x_ >= width_)
    return;
  if (bits_ == 8) {
    row_[x_] = value;
  } else if (bits_ == 4) {
    int half = (number & 1) ? value & 15 : value >> 4;
    row_[x_ / 2] = static_cast<UChar>(row_[x_ / 2] | ((x_ & 1) ? half : half << 4));
  }
  ++x_;
}

void BmpRunDecoder::Decode(const UChar* codes, LLong size)
{
  LLong at = 0;
  while (size - at >= 2 && linesLeft_ > 0) {
    Long count = codes[at];
    if (count > 0) {
      for (Long i = 0; i < count; ++i)
        Put(codes[at + 1], i);
      at += 2;
      continue;
    }
    LLong taken = TakeEscape(codes + at + 1, size - at - 1);
    if (taken == kEnd)
      break;
    at += 1 + taken;
  }
  // The last line need not be ended by a code of its own.
  if (x_ > 0)
    FinishLine();
}

// What stands behind a count of zero, with `left` bytes, at least one. Gives the bytes taken, or kEnd.
LLong BmpRunDecoder::TakeEscape(const UChar* codes, LLong left)
{
  switch (codes[0]) {
  case kEndOfLine:
    FinishLine();
    x_ = 0;
    return 1;
  case kEndOfImage:
    return kEnd;
  case kDelta:
    if (left < 3)
      return kEnd;
    x_ = codes[1] < width_ - x_ ? x_ + codes[1] : width_;
    for (Long i = 0; i < codes[2]; ++i)
      FinishLine();
    return 3;
  default:
    return TakeLiterals(codes + 1, left - 1, codes[0]) + 1;
  }
}

// Literal values fill an even number of bytes. Those that the codes are too short for are left out.
LLong BmpRunDecoder::TakeLiterals(const UChar* codes, LLong left, Long count)
{
  Long perByte = bits_ == 4 ? 2 : 1;
  for (Long i = 0; i < count && i / perByte < left; ++i)
    Put(codes[i / perByte], i);
  LLong size = (count + perByte - 1) / perByte;
  return size + size % 2;
}

} // namespace _torvane_
