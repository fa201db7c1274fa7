#include "torvane/math/crc.h"

#include <utility>

#if defined(__x86_64__) && defined(__GNUC__)
#include <immintrin.h>
#define HAS_CARRYLESS_PRODUCTS __builtin_cpu_supports("pclmul")
#else
#define HAS_CARRYLESS_PRODUCTS false
#endif

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

// ---- Long blocks by carry-less products: a sum is the rest of a division of polynomials over two elements, so that 16
// bytes may stand for all before them if they are multiplied by the rest that the distance leaves.

constexpr LLong kFold = 64; // bytes at a time, in four lanes

// The rest of x to the power of `exponent`, as the products of reflected numbers need it: reflected, one place up.
constexpr ULLong RestOfPower(int exponent)
{
  ULong rest = 0x80000000; // 1, reflected
  for (int i = 0; i < exponent; ++i)
    rest = rest & 1 ? rest >> 1 ^ kPolynomial32 : rest >> 1;
  return ULLong{rest} << 1;
}

#if defined(__x86_64__) && defined(__GNUC__)

__attribute__((target("pclmul"))) inline __m128i Fold(__m128i lane, __m128i factors, __m128i next)
{
  return _mm_xor_si128(
      next, _mm_xor_si128(_mm_clmulepi64_si128(lane, factors, 0x00), _mm_clmulepi64_si128(lane, factors, 0x11)));
}

inline __m128i LoadLane(const UChar* bytes) { return _mm_loadu_si128(reinterpret_cast<const __m128i*>(bytes)); }

// Takes `size` bytes, a multiple of kFold that isn't 0.
__attribute__((target("pclmul"))) ULong RunFolds(ULong value, const UChar* bytes, LLong size)
{
  constexpr auto factorsOf = [](int bits) {
    return std::pair{static_cast<long long>(RestOfPower(bits - 32)), static_cast<long long>(RestOfPower(bits + 32))};
  };
  constexpr auto kFar = factorsOf(8 * kFold);
  constexpr auto kNear = factorsOf(128);
  const __m128i far = _mm_set_epi64x(kFar.first, kFar.second);
  const __m128i near = _mm_set_epi64x(kNear.first, kNear.second);
  __m128i lanes[4];
  for (int i = 0; i < 4; ++i)
    lanes[i] = LoadLane(bytes + 16 * i);
  lanes[0] = _mm_xor_si128(lanes[0], _mm_cvtsi32_si128(static_cast<int>(value)));
  for (bytes += kFold, size -= kFold; size > 0; bytes += kFold, size -= kFold) {
    for (int i = 0; i < 4; ++i)
      lanes[i] = Fold(lanes[i], far, LoadLane(bytes + 16 * i));
  }
  for (int i = 1; i < 4; ++i)
    lanes[i] = Fold(lanes[i - 1], near, lanes[i]);
  UChar rest[16];
  _mm_storeu_si128(reinterpret_cast<__m128i*>(rest), lanes[3]);
  return Run(ULong{0}, rest, sizeof rest);
}

#else

ULong RunFolds(ULong value, const UChar* bytes, LLong size) { return Run(value, bytes, size); }

#endif

} // namespace

void Crc32::Update(const void* data, LLong size) noexcept
{
  const UChar* bytes = static_cast<const UChar*>(data);
  ULong value = value_;
  if (size >= kFold && HAS_CARRYLESS_PRODUCTS) {
    const LLong folded = size / kFold * kFold;
    value = RunFolds(value, bytes, folded);
    bytes += folded;
    size -= folded;
  }
  for (; size >= kSlice; size -= kSlice, bytes += kSlice)
    value = RunWord<12>(value, bytes) ^ RunWord<8>(0, bytes + 4) ^ RunWord<4>(0, bytes + 8) ^ RunWord<0>(0, bytes + 12);
  value_ = Run(value, bytes, size);
}

void Crc32::UpdateByte(UChar byte) noexcept { value_ = Step(value_, byte); }

void Crc64::Update(const void* data, LLong size) noexcept { value_ = Run(value_, data, size); }

void Crc64::UpdateByte(UChar byte) noexcept { value_ = Step(value_, byte); }

} // namespace _torvane_
