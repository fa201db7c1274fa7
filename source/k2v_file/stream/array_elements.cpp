#include "k2v_file/stream/array_elements.h"

#include <cstring>
#include <type_traits>

#include "k2v_file/stream/wide_registers.h"
#include "torvane/stream/hyper_file.h"

namespace _torvane_
{

namespace
{

template <std::size_t Size>
using BitsOfSize =
    std::conditional_t<Size == 1, UChar,
                       std::conditional_t<Size == 2, UWord, std::conditional_t<Size == 4, ULong, ULLong>>>;

template <class Value>
void PackOne(UChar* packed, const UChar* memory)
{
  Value value;
  std::memcpy(&value, memory, sizeof value);
  if constexpr (std::is_floating_point_v<Value>)
    bytes::PutBig(packed, bytes::CleanBits(value));
  else
    bytes::PutBig(packed, value);
}

template <class Value, class Stored>
void UnpackOne(UChar* memory, const UChar* packed)
{
  auto bits = bytes::GetBig<BitsOfSize<sizeof(Stored)>>(packed);
  if constexpr (std::is_same_v<Value, SReal> && std::is_same_v<Stored, Real>) {
    // A double can be too large for a float.
    ULong narrow = bytes::CleanBits(static_cast<SReal>(bytes::CleanReal(bits)));
    std::memcpy(memory, &narrow, sizeof narrow);
  } else if constexpr (std::is_floating_point_v<Value>) {
    Value value = static_cast<Value>(bytes::CleanReal(bits));
    std::memcpy(memory, &value, sizeof value);
  } else {
    Value value = bits;
    std::memcpy(memory, &value, sizeof value);
  }
}

// Elements that stand close are taken 256 bytes at a time where the machine has registers that shuffle bytes: a loop of
// fixed length over a block, which compilers turn into a few instructions.
constexpr UChar Swap(UChar bits) { return bits; }
constexpr UWord Swap(UWord bits) { return static_cast<UWord>(bits >> 8 | bits << 8); }
constexpr ULong Swap(ULong bits) { return __builtin_bswap32(bits); }
constexpr ULLong Swap(ULLong bits) { return __builtin_bswap64(bits); }

// As bytes::CleanBits and CleanReal, for the bits alone.
template <class Value, class Bits>
constexpr Bits Clean(Bits bits)
{
  if constexpr (std::is_floating_point_v<Value>) {
    constexpr Bits kExponent = sizeof(Bits) == sizeof(ULLong) ? static_cast<Bits>(0x7FF0000000000000) : 0x7F800000;
    return (bits & kExponent) == kExponent ? 0 : bits;
  } else {
    return bits;
  }
}

// Takes whole blocks and gives how many elements that were. The two places may be the same.
template <class Value, Bool Packs>
WITH_WIDE_REGISTERS LLong SwapBlocks(UChar* to, const UChar* from, LLong count)
{
  using Bits = BitsOfSize<sizeof(Value)>;
  constexpr LLong kBlock = 256 / sizeof(Bits);
  const LLong blocks = count / kBlock;
  for (LLong n = 0; n < blocks; ++n) {
    Bits block[kBlock];
    std::memcpy(block, from + n * LLong{sizeof block}, sizeof block);
    for (Bits& bits : block)
      bits = Packs ? Swap(Clean<Value>(bits)) : Clean<Value>(Swap(bits));
    std::memcpy(to + n * LLong{sizeof block}, block, sizeof block);
  }
  return blocks * kBlock;
}

template <class Value>
void Pack(UChar* packed, const UChar* memory, LLong stride, LLong count)
{
  constexpr LLong kSize = sizeof(Value);
  LLong i = stride == kSize && HasWideRegisters() ? SwapBlocks<Value, true>(packed, memory, count) : 0;
  for (; i < count; ++i)
    PackOne<Value>(packed + i * kSize, memory + i * stride);
}

template <class Value, class Stored>
void Unpack(UChar* memory, const UChar* packed, LLong stride, LLong count)
{
  constexpr LLong kSize = sizeof(Stored);
  LLong i = 0;
  if constexpr (std::is_same_v<Value, Stored>) {
    if (stride == kSize && HasWideRegisters())
      i = SwapBlocks<Value, false>(memory, packed, count);
  }
  for (; i < count; ++i)
    UnpackOne<Value, Stored>(memory + i * stride, packed + i * kSize);
}

struct ElementType
{
  Long type;
  LLong size;
  PackElements pack;
  UnpackElements unpack;
};

constexpr ElementType kElementTypes[] = {
    {kArrayByte, 1, Pack<UChar>, Unpack<UChar, UChar>},  {kArrayWord, 2, Pack<UWord>, Unpack<UWord, UWord>},
    {kArrayLong, 4, Pack<ULong>, Unpack<ULong, ULong>},  {kArrayLLong, 8, Pack<ULLong>, Unpack<ULLong, ULLong>},
    {kArraySReal, 4, Pack<SReal>, Unpack<SReal, SReal>}, {kArrayLReal, 8, Pack<Real>, Unpack<Real, Real>},
};

const ElementType* FindType(Long type)
{
  for (const ElementType& entry : kElementTypes) {
    if (entry.type == type)
      return &entry;
  }
  return nullptr;
}

} // namespace

LLong GetElementSize(Long type)
{
  const ElementType* entry = FindType(type);
  return entry ? entry->size : 0;
}

PackElements FindPackElements(Long type)
{
  const ElementType* entry = FindType(type);
  return entry ? entry->pack : nullptr;
}

UnpackElements FindUnpackElements(Long type, Long storedType)
{
  if (type == kArrayLReal && storedType == kArraySReal)
    return Unpack<Real, SReal>;
  if (type == kArraySReal && storedType == kArrayLReal)
    return Unpack<SReal, Real>;
  if (type == kArrayLong && storedType == kArrayWord)
    return Unpack<ULong, UWord>;
  const ElementType* entry = type == storedType ? FindType(type) : nullptr;
  return entry ? entry->unpack : nullptr;
}

} // namespace _torvane_
