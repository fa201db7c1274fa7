// Composes files for the tests, value by value, from nothing but the file form: no class of the library takes part.
#pragma once

#include <bit>
#include <cctype>
#include <cstdint>
#include <string>
#include <string_view>
#include <type_traits>
#include <vector>

class ByteWriter
{
 public:
  std::vector<std::uint8_t> bytes;

  // Single-precision files hold a Real in 4 bytes.
  bool singlePrecision = false;

  // A header of the current form: magic, ident, version, precision byte.
  ByteWriter& Header(std::string_view ident = "Q7R6", std::int32_t version = 13000, std::uint8_t precision = 0)
  {
    singlePrecision = precision != 0;
    return Raw("QQ7R").Raw(ident).I32(version).U8(precision);
  }

  // Big-endian numbers and characters without a tag.
  ByteWriter& U8(std::uint8_t value) { return Big(value); }
  ByteWriter& I16(std::int16_t value) { return Big(static_cast<std::uint16_t>(value)); }
  ByteWriter& U16(std::uint16_t value) { return Big(value); }
  ByteWriter& I32(std::int32_t value) { return Big(static_cast<std::uint32_t>(value)); }
  ByteWriter& U32(std::uint32_t value) { return Big(value); }
  ByteWriter& I64(std::int64_t value) { return Big(static_cast<std::uint64_t>(value)); }
  ByteWriter& F32(float value) { return Big(std::bit_cast<std::uint32_t>(value)); }
  ByteWriter& F64(double value) { return Big(std::bit_cast<std::uint64_t>(value)); }
  ByteWriter& RawReal(double value) { return singlePrecision ? F32(static_cast<float>(value)) : F64(value); }
  ByteWriter& Raw(std::string_view characters)
  {
    bytes.insert(bytes.end(), characters.begin(), characters.end());
    return *this;
  }
  ByteWriter& Append(const std::vector<std::uint8_t>& block)
  {
    bytes.insert(bytes.end(), block.begin(), block.end());
    return *this;
  }

  // Values with their tags.
  ByteWriter& Start(std::int32_t id, std::int32_t level) { return U8(1).I32(id).I32(level); }
  ByteWriter& End() { return U8(2); }
  ByteWriter& Char(std::int8_t value) { return U8(11).U8(static_cast<std::uint8_t>(value)); }
  ByteWriter& UChar(std::uint8_t value) { return U8(12).U8(value); }
  ByteWriter& Word(std::int16_t value) { return U8(13).I16(value); }
  ByteWriter& UWord(std::uint16_t value) { return U8(14).U16(value); }
  ByteWriter& Long(std::int32_t value) { return U8(15).I32(value); }
  ByteWriter& ULong(std::uint32_t value) { return U8(16).U32(value); }
  ByteWriter& LLong(std::int64_t value) { return U8(17).I64(value); }
  ByteWriter& Real(double value) { return U8(19).RawReal(value); }
  ByteWriter& LReal(double value) { return U8(20).F64(value); }
  ByteWriter& Bool(bool value) { return U8(21).U8(value ? 1 : 0); }
  ByteWriter& Time(double numerator, double denominator) { return U8(22).RawReal(numerator).RawReal(denominator); }
  ByteWriter& Vector(double x, double y, double z) { return U8(23).RawReal(x).RawReal(y).RawReal(z); }
  ByteWriter& LVector(double x, double y, double z) { return U8(24).F64(x).F64(y).F64(z); }
  ByteWriter& SVector(float x, float y, float z) { return U8(27).F32(x).F32(y).F32(z); }
  // Offset x, y, z, then the axes.
  ByteWriter& Matrix(const double (&numbers)[12])
  {
    U8(25);
    for (double number : numbers)
      RawReal(number);
    return *this;
  }
  ByteWriter& IdentityMatrix() { return Matrix({0, 0, 0, 1, 0, 0, 0, 1, 0, 0, 0, 1}); }
  // Tag 29; files below version 11925 hold a 32-bit float under tag 19: OldSReal.
  ByteWriter& SReal(float value) { return U8(29).F32(value); }
  ByteWriter& OldSReal(float value) { return U8(19).F32(value); }
  ByteWriter& Memory(const std::vector<std::uint8_t>& block) { return Block(128, block); }
  ByteWriter& Memory(std::string_view characters)
  {
    return U8(128).U32(static_cast<std::uint32_t>(characters.size())).Raw(characters);
  }
  ByteWriter& Image(const std::vector<std::uint8_t>& block) { return Block(129, block); }
  ByteWriter& String(std::u16string_view text) { return Text(130, text); }
  ByteWriter& Filename(std::u16string_view text) { return Text(131, text); }
  // A length, then `block`, under any of the tags from 128 on.
  ByteWriter& Block(std::uint8_t tag, const std::vector<std::uint8_t>& block)
  {
    return U8(tag).U32(static_cast<std::uint32_t>(block.size())).Append(block);
  }
  // The start of an Array of the present order (version 11904 and above): the elements follow without tags.
  ByteWriter& ArrayHead(std::uint8_t type, std::uint32_t elementBytes)
  {
    return U8(140).U32(elementBytes + 1).U8(type);
  }
  // The older order: the type before the plain length.
  ByteWriter& OldArrayHead(std::uint8_t type, std::uint32_t elementBytes) { return U8(140).U8(type).U32(elementBytes); }

 private:
  template <class Bits>
  ByteWriter& Big(Bits bits)
  {
    static_assert(std::is_unsigned_v<Bits>);
    for (std::size_t shift = sizeof(Bits) * 8; shift > 0; shift -= 8)
      bytes.push_back(static_cast<std::uint8_t>(bits >> (shift - 8)));
    return *this;
  }
  ByteWriter& Text(std::uint8_t tag, std::u16string_view text)
  {
    U8(tag).U32(static_cast<std::uint32_t>(text.size() * 2));
    for (char16_t character : text)
      U16(character);
    return *this;
  }
};

// "01 FF": bytes as two-digit hexadecimal numbers, for comparisons that show what differs.
inline std::string ToHex(const std::uint8_t* data, std::size_t size)
{
  static constexpr char kDigits[] = "0123456789ABCDEF";
  std::string text;
  for (std::size_t i = 0; i < size; ++i) {
    if (i)
      text += ' ';
    text += kDigits[data[i] >> 4];
    text += kDigits[data[i] & 15];
  }
  return text;
}

inline std::string ToHex(const std::vector<std::uint8_t>& bytes) { return ToHex(bytes.data(), bytes.size()); }

// The bytes of pairs of hexadecimal digits; all else is passed over.
inline std::vector<std::uint8_t> FromHex(std::string_view text)
{
  std::vector<std::uint8_t> bytes;
  int high = -1;
  for (char c : text) {
    if (!std::isxdigit(static_cast<unsigned char>(c)))
      continue;
    const int digit = c <= '9' ? c - '0' : (c | 32) - 'a' + 10;
    if (high >= 0)
      bytes.push_back(static_cast<std::uint8_t>(high * 16 + digit));
    high = high < 0 ? digit : -1;
  }
  return bytes;
}
