#include "k2v_file/stream/raw_values.h"

#include "k2v_file/stream/value_sizes.h"

namespace _torvane_
{

namespace
{

constexpr LLong kLengthSize = 4;

// The bytes behind a tag as they stand and as they will; false for a value that isn't there as a whole.
Bool MeasureBody(UChar tag, const UChar* body, LLong left, LLong& narrow, LLong& wide)
{
  if (tag < kTagMemory) {
    narrow = kBodySizeTable.size[1][tag];
    wide = kBodySizeTable.size[0][tag];
    return narrow != kNoValue && narrow <= left;
  }
  if (tag > kTagArray || left < kLengthSize)
    return false;
  narrow = wide = kLengthSize + static_cast<LLong>(bytes::GetBig<ULong>(body));
  return narrow <= left;
}

// The size of the converted block, which is written too if `target` isn't null.
LLong Convert(const UChar* source, LLong size, UChar* target)
{
  LLong written = 0;
  LLong position = 0;
  const auto copy = [&](LLong count) {
    if (target)
      GeCopyMem(target + written, source + position, count);
    written += count;
    position += count;
  };
  while (position < size) {
    LLong narrow = 0;
    LLong wide = 0;
    if (!MeasureBody(source[position], source + position + 1, size - position - 1, narrow, wide)) {
      copy(size - position); // not understood
      break;
    }
    if (narrow == wide) {
      copy(1 + narrow);
      continue;
    }
    copy(1);
    for (const LLong end = position + narrow; position < end; position += 4, written += 8) {
      if (target) {
        const Real number = bytes::CleanReal(bytes::GetBig<ULong>(source + position));
        bytes::PutBig(target + written, bytes::CleanBits(number));
      }
    }
  }
  return written;
}

} // namespace

Bool WidenReals(void*& block, LLong& size)
{
  const UChar* source = static_cast<const UChar*>(block);
  LLong wideSize = Convert(source, size, nullptr);
  if (wideSize == size)
    return true;
  void* wide = GeAllocNC(wideSize);
  if (!wide)
    return false;
  Convert(source, size, static_cast<UChar*>(wide));
  GeFree(block);
  block = wide;
  size = wideSize;
  return true;
}

} // namespace _torvane_
