#include "torvane/math/crc.h"

namespace _torvane_
{

namespace
{

constexpr ULong kPolynomial32 = 0xEDB88320u;
constexpr ULLong kPolynomial64 = 0x42F0E1EBA9EA3693u;

// The geometry of an object is summed up whenever it is written, so sixteen bytes of a Crc32 are taken at once: table n
// tells what a byte does to the value when n more bytes follow it.
constexpr LLong kSlice = 16;

struct Tables
{
  ULong crc32[kSlice][256];
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
    tables.crc32[0][i] = low;
    tables.crc64[i] = high;
  }
  for (LLong n = 1; n < kSlice; ++n) {
    for (ULong i = 0; i < 256; ++i) {
      const ULong before = tables.crc32[n - 1][i];
      tables.crc32[n][i] = before >> 8 ^ tables.crc32[0][before & 255];
    }
  }
  return tables;
}

constexpr Tables kTables = MakeTables();

constexpr ULong Step(ULong value, UChar byte) { return kTables.crc32[0][(value ^ byte) & 255] ^ value >> 8; }

constexpr ULLong Step(ULLong value, UChar byte) { return kTables.crc64[value >> 56 ^ byte] ^ value << 8; }

template <class Value>
Value Run(Value value, const void* data, LLong size)
{
  const UChar* bytes = static_cast<const UChar*>(data);
  for (LLong i = 0; i < size; ++i)
    value = Step(value, bytes[i]);
  return value;
}

// Four bytes of a slice with `behind` more behind them; the value stands in the first four.
template <LLong behind>
inline ULong RunWord(ULong value, const UChar* bytes)
{
  const ULong word = value ^ (ULong{bytes[0]} | ULong{bytes[1]} << 8 | ULong{bytes[2]} << 16 | ULong{bytes[3]} << 24);
  return kTables.crc32[behind + 3][word & 255] ^ kTables.crc32[behind + 2][word >> 8 & 255] ^
         kTables.crc32[behind + 1][word >> 16 & 255] ^ kTables.crc32[behind][word >> 24];
}

} // namespace

void Crc32::Update(const void* data, LLong size) noexcept
{
  const UChar* bytes = static_cast<const UChar*>(data);
  ULong value = value_;
  for (; size >= kSlice; size -= kSlice, bytes += kSlice)
    value = RunWord<12>(value, bytes) ^ RunWord<8>(0, bytes + 4) ^ RunWord<4>(0, bytes + 8) ^ RunWord<0>(0, bytes + 12);
  value_ = Run(value, bytes, size);
}

void Crc32::UpdateByte(UChar byte) noexcept { value_ = Step(value_, byte); }

void Crc64::Update(const void* data, LLong size) noexcept { value_ = Run(value_, data, size); }

void Crc64::UpdateByte(UChar byte) noexcept { value_ = Step(value_, byte); }

} // namespace _torvane_
