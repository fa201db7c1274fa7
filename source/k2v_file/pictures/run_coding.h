// The run coding of paint textures. A control byte c from 0 to 127 is followed by c + 1 plain bytes; one from 129 to
// 255 by a single byte, which stands 257 - c times; 128 means nothing.
#pragma once

#include "torvane/types.h"

namespace _torvane_
{

// Packs `size` bytes: three or more alike become runs. Gives the packed size; 0 when it would go over `limit`, and for
// no bytes.
LLong PackRuns(const UChar* bytes, LLong size, UChar* packed, LLong limit);

// Unpacks just `size` bytes, each `step` bytes behind the one before. False unless the coding ends right there; what
// was unpacked before the fault then stays.
Bool UnpackRuns(const UChar* packed, LLong packedSize, UChar* bytes, LLong size, LLong step = 1);

} // namespace _torvane_
