#include "k2v_file/stream/array_elements.h"

#include <cstring>
#include <type_traits>

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

template <class Value>
void Pack(UChar* packed, const UChar* memory, LLong stride, LLong count)
{
  constexpr LLong kSize = sizeof(Value);
  if (stride == kSize) { // a loop of its own, so that it becomes a plain run of swaps
    for (LLong i = 0; i < count; ++i)
      PackOne<Value>(packed + i * kSize, memory + i * kSize);
  } else {
    for (LLong i = 0; i < count; ++i)
      PackOne<Value>(packed + i * kSize, memory + i * stride);
  }
}

template <class Value, class Stored>
void Unpack(UChar* memory, const UChar* packed, LLong stride, LLong count)
{
  constexpr LLong kSize = sizeof(Stored);
  constexpr LLong kMemorySize = sizeof(Value);
  if (stride == kMemorySize) {
    for (LLong i = 0; i < count; ++i)
      UnpackOne<Value, Stored>(memory + i * kMemorySize, packed + i * kSize);
  } else {
    for (LLong i = 0; i < count; ++i)
      UnpackOne<Value, Stored>(memory + i * stride, packed + i * kSize);
  }
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
