#include "host/text.h"

#include <algorithm>
#include <iterator>

#include <utf8.h>

namespace host
{

namespace
{

constexpr char16_t kReplacement = 0xFFFD;
constexpr std::size_t kMaxQuoted = 200; // bytes

} // namespace

std::u16string ToUtf16(std::string_view utf8)
{
  std::u16string result;
  result.reserve(utf8.size());
  const char* at = utf8.data();
  const char* const end = at + utf8.size();
  for (;;) {
    const char* const bad = utf8::find_invalid(at, end);
    utf8::utf8to16(at, bad, std::back_inserter(result));
    if (bad == end)
      return result;
    result.push_back(kReplacement);
    at = bad + 1;
  }
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
