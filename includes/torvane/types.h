// The number types of the scene format. Everything in the library is built from these.
#pragma once

#include <cstddef>
#include <cstdint>

namespace _torvane_
{

using Bool = bool; // In a file one byte, 0 or 1.
using Char = std::int8_t;
using UChar = std::uint8_t;
using Word = std::int16_t;
using UWord = std::uint16_t;
using Long = std::int32_t;
using ULong = std::uint32_t;
using LLong = std::int64_t;
using ULLong = std::uint64_t;
using SReal = float;
using Real = double;
using UniChar = std::uint16_t; // One UTF-16 code unit.

} // namespace _torvane_
