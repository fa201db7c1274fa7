#include "host/text.h"

#include <algorithm>

namespace host
{

namespace
{

constexpr char32_t kReplacement = 0xFFFD;
constexpr std::size_t kMaxQuoted = 200; // bytes

struct Decoded
{
  char32_t character;
  std::size_t length; // bytes
};

// The character at the front of a text that isn't empty.
Decoded DecodeFront(std::string_view text)
{
  const auto byte = [&](std::size_t i) { return static_cast<unsigned char>(text[i]); };
  const unsigned char lead = byte(0);
  if (lead < 0x80)
    return {lead, 1};
  const std::size_t length = lead >= 0xF0 ? 4 : lead >= 0xE0 ? 3 : 2;
  if (lead < 0xC2 || lead > 0xF4 || text.size() < length)
    return {kReplacement, 1};
  char32_t character = lead & (0x7Fu >> length);
  for (std::size_t i = 1; i < length; ++i) {
    if ((byte(i) & 0xC0) != 0x80)
      return {kReplacement, 1};
    character = (character << 6) | (byte(i) & 0x3Fu);
  }
  constexpr char32_t kSmallest[5] = {0, 0, 0x80, 0x800, 0x10000};
  if (character < kSmallest[length] || character > 0x10FFFF || (character >= 0xD800 && character < 0xE000))
    return {kReplacement, 1};
  return {character, length};
}

} // namespace

std::u16string ToUtf16(std::string_view utf8)
{
  std::u16string result;
  result.reserve(utf8.size());
  while (!utf8.empty()) {
    const auto [character, length] = DecodeFront(utf8);
    utf8.remove_prefix(length);
    if (character < 0x10000) {
      result.push_back(static_cast<char16_t>(character));
    } else {
      result.push_back(static_cast<char16_t>(0xD800 + ((character - 0x10000) >> 10)));
      result.push_back(static_cast<char16_t>(0xDC00 + ((character - 0x10000) & 0x3FF)));
    }
  }
  return result;
}

std::string PathToUtf8(const std::filesystem::path& path)
{
  const std::u8string text = path.u8string();
  return {text.begin(), text.end()};
}

std::filesystem::path PathFromUtf8(std::string_view utf8) { return std::u8string(utf8.begin(), utf8.end()); }

std::string OneLine(std::string_view text)
{
  std::string result(text);
  std::replace_if(
      result.begin(), result.end(), [](char c) { return static_cast<unsigned char>(c) < 0x20 || c == 0x7F; }, ' ');
  return result;
}

std::string Quoted(std::string_view text)
{
  if (text.size() <= kMaxQuoted)
    return '"' + OneLine(text) + '"';
  // Between two characters.
  std::size_t length = kMaxQuoted;
  while (length > 0 && (static_cast<unsigned char>(text[length]) & 0xC0) == 0x80)
    --length;
  return '"' + OneLine(text.substr(0, length)) + "...\"";
}

} // namespace host
