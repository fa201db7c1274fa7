#include "k2v_file/pictures/run_coding.h"

namespace _torvane_
{

namespace
{

constexpr LLong kMostInGroup = 128; // of a run as of plain bytes
constexpr LLong kShortestRun = 3;
constexpr LLong kRunBase = 257; // a run's control byte is this less its length
constexpr UChar kNothing = 128;

// How many bytes from the first on are alike, up to a whole group.
LLong CountAlike(const UChar* bytes, LLong size)
{
  LLong limit = size < kMostInGroup ? size : kMostInGroup;
  LLong count = 1;
  while (count < limit && bytes[count] == bytes[0])
    ++count;
  return count;
}

} // namespace

LLong PackRuns(const UChar* bytes, LLong size, UChar* packed, LLong limit)
{
  LLong written = 0;
  UChar* control = nullptr; // of the open group of plain bytes
  for (LLong i = 0; i < size;) {
    LLong alike = CountAlike(bytes + i, size - i);
    Bool run = alike >= kShortestRun;
    Bool opens = run || !control || *control == kMostInGroup - 1;
    if (written + (opens ? 2 : 1) > limit)
      return 0;
    if (run) {
      packed[written++] = static_cast<UChar>(kRunBase - alike);
      control = nullptr;
      i += alike - 1;
    } else if (opens) {
      control = packed + written++;
      *control = 0;
    } else {
      ++*control;
    }
    packed[written++] = bytes[i++];
  }
  return written;
}

Bool UnpackRuns(const UChar* packed, LLong packedSize, UChar* bytes, LLong size, LLong step)
{
  LLong read = 0;
  LLong written = 0;
  while (read < packedSize && written < size) {
    UChar control = packed[read++];
    if (control == kNothing)
      continue;
    Bool run = control > kNothing;
    LLong count = run ? kRunBase - control : control + 1;
    if (count > size - written || (run ? 1 : count) > packedSize - read)
      return false;
    for (LLong i = 0; i < count; ++i)
      bytes[(written + i) * step] = packed[read + (run ? 0 : i)];
    read += run ? 1 : count;
    written += count;
  }
  return read == packedSize && written == size;
}

} // namespace _torvane_
