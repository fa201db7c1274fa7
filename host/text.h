// Texts of the host.
#pragma once

#include <filesystem>
#include <string>
#include <string_view>

namespace host
{

// UTF-8 as UTF-16, with surrogate pairs. Bytes that are no UTF-8 become U+FFFD.
std::u16string ToUtf16(std::string_view utf8);

// A path as UTF-8, and back.
std::string PathToUtf8(const std::filesystem::path& path);
std::filesystem::path PathFromUtf8(std::string_view utf8);

// A foreign text as it can stand in a message of one line: in double quotes, without control characters, and cut when
// it is long.
std::string Quoted(std::string_view text);
// The same without the quotes and uncut.
std::string OneLine(std::string_view text);

} // namespace host
