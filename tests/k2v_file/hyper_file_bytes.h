// Bytes of HyperFiles, for the tests of the value stream.
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

// A scene file of those values.
inline Bytes WithHeader(const Bytes& values, std::int32_t version = 13000, std::uint8_t precision = 0)
{
  return ByteWriter().Header("Q7R6", version, precision).Append(values).bytes;
}

} // namespace hyper_file_bytes
