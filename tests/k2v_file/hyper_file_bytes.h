// Hexadecimal bytes and HyperFiles over them, for the tests of the value stream.
#pragma once

#include <functional>
#include <string>
#include <string_view>
#include <vector>

#include "support/byte_writer.h"
#include "support/memory_file.h"

namespace hyper_file_bytes
{

using Bytes = std::vector<std::uint8_t>;

// The bytes of a text such as "0F 00 ff"; blanks don't count.
inline Bytes FromHex(std::string_view text)
{
  Bytes bytes;
  std::string digits;
  for (char character : text) {
    if (character != ' ')
      digits += character;
  }
  for (std::size_t i = 0; i + 1 < digits.size(); i += 2)
    bytes.push_back(static_cast<std::uint8_t>(std::stoi(digits.substr(i, 2), nullptr, 16)));
  return bytes;
}

// A scene file of those values.
inline Bytes WithHeader(const Bytes& values, std::int32_t version = 13000, std::uint8_t precision = 0)
{
  return ByteWriter().Header("Q7R6", version, precision).Append(values).bytes;
}

} // namespace hyper_file_bytes
