// Values of a file as the bytes that they are there.
#pragma once

#include "torvane/types.h"

namespace _torvane_
{

// Replaces a block of values out of a single-precision file by the same values as a file that is written now holds
// them: each Real in 8 bytes. What isn't understood ends the conversion and stays as it is. False when memory is short:
// the block is then unchanged. The block is the caller's, made by GeAlloc or GeAllocNC.
Bool WidenReals(void*& block, LLong& size);

} // namespace _torvane_
