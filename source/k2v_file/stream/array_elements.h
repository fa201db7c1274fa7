// The elements of Array values between memory, where they stand a stride apart, and the packed big-endian form of a
// file.
#pragma once

#include "torvane/types.h"

namespace _torvane_
{

// The bytes of an element of an ArrayType in a file and in memory; 0 for a type that no array has.
LLong GetElementSize(Long type);

// `count` elements from memory to `packed`.
using PackElements = void (*)(UChar* packed, const UChar* memory, LLong stride, LLong count);
// Null for an unknown type.
PackElements FindPackElements(Long type);

// `count` elements from `packed` to memory. The two may be the same place when both sizes and the stride are equal.
using UnpackElements = void (*)(UChar* memory, const UChar* packed, LLong stride, LLong count);
// Floats and doubles become one another, and words become longs, taken as unsigned; for any other pair of different
// types the result is null.
UnpackElements FindUnpackElements(Long type, Long storedType);

} // namespace _torvane_
