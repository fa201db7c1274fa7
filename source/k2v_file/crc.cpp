#include "torvane/crc.h"

namespace _torvane_
{

namespace
{

constexpr ULong kPolynomial32 = 0xEDB88320u;
constexpr ULLong kPolynomial64 = 0x42F0E1EBA9EA3693u;

struct Tables
{
  ULong crc32[256];
  ULLong crc64[256];
};

constexpr Tables MakeTables()
{
  Tables tables{};
  for (ULong i = 0; i < 256; ++i) {
    ULong low = i;
    ULLong high = ULLong{i} << 56;
    for (int bit = 0; bit < 8; ++bit) {
      low = low & 1 ? low >> 1 ^ kPolynomial32 : low >> 1;
      high = high >> 63 ? high << 1 ^ kPolynomial64 : high << 1;
    }
    tables.crc32[i] = low;
    tables.crc64[i] = high;
  }
  return tables;
}

constexpr Tables kTables = MakeTables();

constexpr ULong Step(ULong value, UChar byte) { return kTables.crc32[(value ^ byte) & 255] ^ value >> 8; }

constexpr ULLong Step(ULLong value, UChar byte) { return kTables.crc64[value >> 56 ^ byte] ^ value << 8; }

template <class Value>
Value Run(Value value, const void* data, LLong size)
{
  const UChar* bytes = static_cast<const UChar*>(data);
  for (LLong i = 0; i < size; ++i)
    value = Step(value, bytes[i]);
  return value;
}

} // namespace

void Crc32::Update(const void* data, LLong size) noexcept { value_ = Run(value_, data, size); }

void Crc32::UpdateByte(UChar byte) noexcept { value_ = Step(value_, byte); }

void Crc64::Update(const void* data, LLong size) noexcept { value_ = Run(value_, data, size); }

void Crc64::UpdateByte(UChar byte) noexcept { value_ = Step(value_, byte); }

} // namespace _torvane_
