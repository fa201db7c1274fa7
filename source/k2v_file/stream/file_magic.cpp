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

Bool IdentifyFile(const Filename& name, ULong flags)
{
  constexpr ULong kIdentifyScenes = 1;
  if ((flags & kIdentifyScenes) == 0)
    return false;
  BaseFile file;
  ULong magic = 0;
  ULong ident = 0;
  return file.Open(name, kFileRead) && file.GetLength() > 0 && file.ReadULong(magic) && file.ReadULong(ident) &&
         IsFileMagic(magic) && ident == kSceneIdent;
}

} // namespace _torvane_
