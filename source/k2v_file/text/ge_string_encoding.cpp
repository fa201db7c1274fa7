// Text to and from bytes.
#include "torvane/text/ge_string.h"

#include <cstring>

#include "k2v_file/text/utf8.h"
#include "torvane/memory/memory.h"

namespace _torvane_
{

namespace
{

// What a character becomes when it has no form of its own.
constexpr UniChar kSubstitute = u'_';
// What a byte reads as that neither stands for a character nor begins a pair.
constexpr UniChar kBadPair = 1;

// Windows-1252 differs from Latin-1 in these bytes only. 0: no character. The last byte, 255, has none either.
constexpr Long kFirstSpecial = 128;
constexpr UniChar kSpecials[32] = {0x20AC, 0,      0x201A, 0x0192, 0x201E, 0x2026, 0x2020, 0x2021,
                                   0x02C6, 0x2030, 0x0160, 0x2039, 0x0152, 0,      0x017D, 0,
                                   0,      0x2018, 0x2019, 0x201C, 0x201D, 0x2022, 0x2013, 0x2014,
                                   0x02DC, 0x2122, 0x0161, 0x203A, 0x0153, 0,      0x017E, 0x0178};
constexpr Long kSpecialCount = sizeof kSpecials / sizeof kSpecials[0];
constexpr ULong kCodePageSize = 255;

// The character of a code page entry, 0 for none. Pairs of bytes are numbers of two bytes; this code page has none.
constexpr UniChar CharOfCode(ULong code)
{
  if (code >= kFirstSpecial && code < kFirstSpecial + kSpecialCount)
    return kSpecials[code - kFirstSpecial];
  return code < kCodePageSize ? static_cast<UniChar>(code) : UniChar{0};
}

// The byte of a character, 0 for none.
constexpr UChar CodeOfChar(UniChar c)
{
  if (c < kFirstSpecial || (c >= kFirstSpecial + kSpecialCount && c < kCodePageSize))
    return static_cast<UChar>(c);
  for (Long i = 0; i < kSpecialCount; ++i) {
    if (kSpecials[i] == c)
      return static_cast<UChar>(kFirstSpecial + i);
  }
  return 0;
}

// ---- Writing

constexpr Long kMaxForm = 8; // the longest form of a character, "&#xXXXX;"

void PutHex(char* place, UniChar c)
{
  constexpr char kDigits[] = "0123456789ABCDEF";
  for (int shift = 12; shift >= 0; shift -= 4)
    *place++ = kDigits[(c >> shift) & 15];
}

// Writes the form of one character and gives its length.
Long EncodeChar(char* form, UniChar c, StringEncoding encoding)
{
  switch (encoding) {
  case STRINGENCODING_UTF8:
    return PutUtf8(form, c);
  case STRINGENCODING_ASCII:
    form[0] = static_cast<char>(c < 128 ? c : kSubstitute);
    return 1;
  case STRINGENCODING_ESCAPED:
  case STRINGENCODING_XML:
    if (c > 127) {
      Bool xml = encoding == STRINGENCODING_XML;
      std::memcpy(form, xml ? "&#x" : "\\u", xml ? 3 : 2);
      PutHex(form + (xml ? 3 : 2), c);
      if (xml)
        form[7] = ';';
      return xml ? 8 : 6;
    }
    [[fallthrough]];
  default:
    UChar code = CodeOfChar(c);
    form[0] = static_cast<char>(code ? code : kSubstitute);
    return 1;
  }
}

// ---- Reading

struct ByteText
{
  const UChar* at;
  const UChar* end;

  LLong Left() const { return end - at; }
};

Long HexDigit(UChar c)
{
  if (c >= '0' && c <= '9')
    return c - '0';
  UChar lower = static_cast<UChar>(c | 32);
  return lower >= 'a' && lower <= 'f' ? lower - 'a' + 10 : -1;
}

// Takes `lead`, four hexadecimal digits and `tail`, if they stand here.
Bool TakeEscape(ByteText& text, const char* lead, const char* tail, UniChar& c)
{
  std::size_t leadSize = std::strlen(lead);
  std::size_t tailSize = std::strlen(tail);
  if (text.Left() < static_cast<LLong>(leadSize + 4 + tailSize) || std::memcmp(text.at, lead, leadSize) != 0 ||
      std::memcmp(text.at + leadSize + 4, tail, tailSize) != 0)
    return false;
  Long value = 0;
  for (std::size_t i = 0; i < 4; ++i) {
    Long digit = HexDigit(text.at[leadSize + i]);
    if (digit < 0)
      return false;
    value = value * 16 + digit;
  }
  c = static_cast<UniChar>(value);
  text.at += leadSize + 4 + tailSize;
  return true;
}

UniChar TakeCodePage(ByteText& text)
{
  ULong code = *text.at++;
  UniChar c = CharOfCode(code);
  if (c != 0 || text.Left() < 1)
    return c;
  c = CharOfCode(code << 8 | *text.at);
  if (c == 0)
    return kBadPair;
  ++text.at;
  return c;
}

// The bytes that follow a lead byte.
Long Utf8Continuations(UChar lead)
{
  constexpr UChar kFirstLead[] = {192, 224, 240, 248, 252, 254};
  Long count = 0;
  while (count < 6 && lead >= kFirstLead[count])
    ++count;
  return count;
}

UniChar TakeUtf8(ByteText& text)
{
  UChar lead = *text.at++;
  Long more = Utf8Continuations(lead);
  if (more == 0 || text.Left() < more)
    return lead;
  const UChar* next = text.at;
  text.at += more;
  if (more == 1)
    return static_cast<UniChar>((lead & 31) << 6 | (next[0] & 63));
  if (more > 2)
    return kSubstitute;
  // An en dash stands for a line break.
  if (lead == 226 && next[0] == 128 && next[1] == 147)
    return u'\n';
  return static_cast<UniChar>((lead & 15) << 12 | (next[0] & 63) << 6 | (next[1] & 63));
}

UniChar TakeAscii(ByteText& text)
{
  UChar byte = *text.at++;
  return byte < 127 ? byte : kSubstitute;
}

Bool TakeAnyEscape(ByteText& text, StringEncoding encoding, UniChar& c)
{
  if (encoding == STRINGENCODING_UTF8)
    return false;
  return TakeEscape(text, "\\u", "", c) || (encoding == STRINGENCODING_XML && TakeEscape(text, "&#x", ";", c));
}

// What neither begins an escape nor differs between the encodings: almost all bytes of almost all texts.
inline Bool IsPlain(UChar byte) { return byte >= ' ' && byte < 127 && byte != '\\' && byte != '&'; }

inline UniChar TakeChar(ByteText& text, StringEncoding encoding)
{
  if (IsPlain(*text.at))
    return *text.at++;
  UniChar c = 0;
  if (!TakeAnyEscape(text, encoding, c))
    c = encoding == STRINGENCODING_UTF8    ? TakeUtf8(text)
        : encoding == STRINGENCODING_ASCII ? TakeAscii(text)
                                           : TakeCodePage(text);
  return c ? c : kSubstitute;
}

} // namespace

Long String::GetCStringLen(StringEncoding encoding) const noexcept
{
  char form[kMaxForm];
  LLong length = 0;
  for (Long i = 0; i < length_; ++i)
    length += EncodeChar(form, block_[i], encoding);
  constexpr LLong kMost = 0x7FFFFFFF;
  return static_cast<Long>(length < kMost ? length : kMost);
}

Long String::GetCString(char* buffer, Long size, StringEncoding encoding) const noexcept
{
  if (!buffer || size < 1)
    return 0;
  Long room = size - 1;
  Long written = 0;
  for (Long i = 0; i < length_ && written < room; ++i) {
    char form[kMaxForm];
    Long formSize = EncodeChar(form, block_[i], encoding);
    if (formSize > room - written) {
      if (encoding == STRINGENCODING_UTF8)
        continue;
      form[0] = static_cast<char>(kSubstitute);
      formSize = 1;
    }
    std::memcpy(buffer + written, form, static_cast<std::size_t>(formSize));
    written += formSize;
  }
  buffer[written] = 0;
  return written;
}

char* String::GetCStringCopy(StringEncoding encoding) const noexcept
{
  if (!Content())
    return nullptr;
  constexpr LLong kMostSize = 0x7FFFFFFF;
  LLong size = LLong{GetCStringLen(encoding)} + 2;
  char* copy = size <= kMostSize ? static_cast<char*>(GeAlloc(size)) : nullptr;
  if (copy)
    GetCString(copy, static_cast<Long>(size), encoding);
  return copy;
}

void String::SetCString(const char* text, Long length, StringEncoding encoding) noexcept
{
  std::size_t size = !text ? 0 : length < 0 ? std::strlen(text) : static_cast<std::size_t>(length);
  const UChar* begin = reinterpret_cast<const UChar*>(text);
  constexpr LLong kMost = 0x7FFFFFFF;
  LLong count = 0;
  for (ByteText rest{begin, begin + size}; rest.Left() > 0 && count < kMost; ++count)
    TakeChar(rest, encoding);
  UniChar* place = SetLengthNC(static_cast<Long>(count));
  ByteText rest{begin, begin + size};
  for (LLong i = 0; place && i < count; ++i)
    place[i] = TakeChar(rest, encoding);
}

} // namespace _torvane_
