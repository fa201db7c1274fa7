// Plain numbers in the byte order of the file.
#include "torvane/bytes/base_file.h"

#include <type_traits>

namespace _torvane_
{

// Any order but kByteOrderBig is little-endian. `value` keeps what it had when the read fails.
template <class Value>
Bool BaseFile::GetNumber(Value& value)
{
  using Bits = std::make_unsigned_t<Value>;
  constexpr LLong kSize = sizeof(Value);
  UChar own[sizeof(Value)];
  const UChar* place = ReadWindow(kSize);
  if (place)
    CommitRead(kSize);
  else if (ReadBytes(own, kSize) == kSize)
    place = own;
  else
    return false;
  value = static_cast<Value>(order_ == kByteOrderBig ? bytes::GetBig<Bits>(place) : bytes::GetLittle<Bits>(place));
  return true;
}

template <class Value>
Bool BaseFile::PutNumber(Value value)
{
  const auto bits = static_cast<std::make_unsigned_t<Value>>(value);
  UChar own[sizeof(Value)];
  if (order_ == kByteOrderBig)
    bytes::PutBig(own, bits);
  else
    bytes::PutLittle(own, bits);
  return WriteBytes(own, sizeof(Value));
}

Bool BaseFile::ReadChar(Char& value) { return GetNumber(value); }
Bool BaseFile::ReadUChar(UChar& value) { return GetNumber(value); }
Bool BaseFile::ReadWord(Word& value) { return GetNumber(value); }
Bool BaseFile::ReadUWord(UWord& value) { return GetNumber(value); }
Bool BaseFile::ReadLong(Long& value) { return GetNumber(value); }
Bool BaseFile::ReadULong(ULong& value) { return GetNumber(value); }
Bool BaseFile::ReadLLong(LLong& value) { return GetNumber(value); }
Bool BaseFile::ReadULLong(ULLong& value) { return GetNumber(value); }

Bool BaseFile::ReadSReal(SReal& value)
{
  ULong bits = 0;
  if (!GetNumber(bits))
    return false;
  value = bytes::CleanReal(bits);
  return true;
}

Bool BaseFile::ReadReal(Real& value)
{
  ULLong bits = 0;
  if (!GetNumber(bits))
    return false;
  value = bytes::CleanReal(bits);
  return true;
}

Bool BaseFile::WriteChar(Char value) { return PutNumber(value); }
Bool BaseFile::WriteUChar(UChar value) { return PutNumber(value); }
Bool BaseFile::WriteWord(Word value) { return PutNumber(value); }
Bool BaseFile::WriteUWord(UWord value) { return PutNumber(value); }
Bool BaseFile::WriteLong(Long value) { return PutNumber(value); }
Bool BaseFile::WriteULong(ULong value) { return PutNumber(value); }
Bool BaseFile::WriteLLong(LLong value) { return PutNumber(value); }
Bool BaseFile::WriteULLong(ULLong value) { return PutNumber(value); }
Bool BaseFile::WriteSReal(SReal value) { return PutNumber(bytes::CleanBits(value)); }
Bool BaseFile::WriteReal(Real value) { return PutNumber(bytes::CleanBits(value)); }

} // namespace _torvane_
