#include "gltf/text.h"

#include <iterator>

#include <utf8.h>

namespace gltf
{

namespace fs = std::filesystem;

namespace
{

std::string ToBytes(const fs::path& path)
{
  const std::u8string text = path.generic_u8string();
  return {text.begin(), text.end()};
}

// The folder as it is reached without links, so that ".." leads where the reader thinks.
fs::path Resolved(const fs::path& folder)
{
  std::error_code error;
  const fs::path whole = fs::absolute(folder, error);
  const fs::path resolved = fs::weakly_canonical(whole, error);
  return error ? whole.lexically_normal() : resolved;
}

} // namespace

std::string ToUtf8(const _torvane_::String& text)
{
  std::string out;
  for (_torvane_::Long i = 0; i < text.GetLength(); ++i) {
    char32_t code = text[i];
    if (code >= 0xD800 && code < 0xDC00 && text[i + 1] >= 0xDC00 && text[i + 1] < 0xE000)
      code = 0x10000 + ((code - 0xD800) << 10) + (text[++i] - 0xDC00U);
    else if (code >= 0xD800 && code < 0xE000)
      code = 0xFFFD;
    utf8::append(code, std::back_inserter(out));
  }
  return out;
}

fs::path ToPath(const std::string& utf8) { return fs::path(std::u8string(utf8.begin(), utf8.end())); }

std::string PercentEncoded(const std::string& bytes)
{
  constexpr const char* kPlain = "ABCDEFGHIJKLMNOPQRSTUVWXYZabcdefghijklmnopqrstuvwxyz0123456789-._~/";
  constexpr const char* kDigits = "0123456789ABCDEF";
  std::string out;
  for (const char byte : bytes) {
    if (byte != '\0' && std::char_traits<char>::find(kPlain, std::char_traits<char>::length(kPlain), byte)) {
      out += byte;
      continue;
    }
    const auto code = static_cast<unsigned char>(byte);
    out += {'%', kDigits[code >> 4], kDigits[code & 15]};
  }
  return out;
}

std::string ToUri(const fs::path& file, const fs::path& folder)
{
  const fs::path whole = Resolved(file.parent_path()) / file.filename();
  const fs::path way = whole.lexically_relative(Resolved(folder));
  if (!way.empty())
    return PercentEncoded(ToBytes(way));
  const std::string bytes = PercentEncoded(ToBytes(whole));
  return (bytes.front() == '/' ? "file://" : "file:///") + bytes;
}

std::string LastPart(const std::string& path)
{
  const std::size_t place = path.find_last_of("/\\");
  return place == std::string::npos ? path : path.substr(place + 1);
}

} // namespace gltf
