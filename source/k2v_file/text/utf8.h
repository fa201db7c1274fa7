// UTF-8, as texts and the names of files have it.
#pragma once

#include "torvane/types.h"

namespace _torvane_
{

// Writes the form of a code point, and gives its length: one to three bytes for one of 16 bits, else four.
inline Long PutUtf8(char* place, ULong code)
{
  const auto put = [&place](ULong byte) { *place++ = static_cast<char>(static_cast<UChar>(byte)); };
  const Long more = code < 0x80 ? 0 : code < 0x800 ? 1 : code < 0x10000 ? 2 : 3;
  constexpr ULong kLeads[] = {0, 0xC0, 0xE0, 0xF0};
  put(kLeads[more] | code >> 6 * more);
  for (Long i = more - 1; i >= 0; --i)
    put(0x80 | (code >> 6 * i & 0x3F));
  return more + 1;
}

} // namespace _torvane_
