// Values of a file as the bytes that they are there.
#pragma once

#include "k2v_file/stream/value_forms.h"

namespace _torvane_
{

// Replaces a block of values out of a file by the same values as a file that is written now holds them: each Real in 8
// bytes, the lengths of legacy arrays as they are, the parts of an Array in their present order. What isn't understood
// ends the conversion and stays as it is. False when memory is short: the block is then unchanged. The block is the
// caller's, made by GeAlloc or GeAllocNC.
Bool ModernizeValues(void*& block, LLong& size, const FileForm& file);

// The same for a block that was just read from `file`, which takes the error of a failure.
Bool ModernizeValues(void*& block, LLong& size, HyperFile& file);

} // namespace _torvane_
