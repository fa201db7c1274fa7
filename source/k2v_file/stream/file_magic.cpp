#include "k2v_file/stream/file_magic.h"

namespace _torvane_
{

namespace
{

constexpr FileMagic kFileMagics[] = {
    {kMagicCurrent, true, false},
    {FourCharacters("YQ7R"), false, false},
    {kMagicBugs, false, true},
    {FourCharacters("6Q7R"), false, true},
    {FourCharacters("AQ7R"), false, true},
    {FourCharacters("8Q7R"), false, true},
};

} // namespace

const FileMagic* FindFileMagic(ULong number)
{
  for (const FileMagic& magic : kFileMagics) {
    if (magic.number == number)
      return &magic;
  }
  return nullptr;
}

Bool IsFileMagic(ULong magic) { return FindFileMagic(magic) != nullptr; }

} // namespace _torvane_
