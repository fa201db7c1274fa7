// The numbers that a file may begin with, and what each says about the header and the values behind it.
#pragma once

#include "torvane/stream/hyper_file.h"

namespace _torvane_
{

inline constexpr ULong kMagicCurrent = FourCharacters("QQ7R"); // what writers put down
inline constexpr ULong kMagicBugs = FourCharacters("XQ7R");    // what a writer asked for kBugsIdent puts down

struct FileMagic
{
  ULong number;
  Bool fullHeader;      // the version and the precision byte follow the ident
  Bool singlePrecision; // Real values are floats; a full header's precision byte decides in its place
};

// Null for a number that no file begins with.
const FileMagic* FindFileMagic(ULong number);

} // namespace _torvane_
