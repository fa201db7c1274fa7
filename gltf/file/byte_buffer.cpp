#include "gltf/file/byte_buffer.h"

#include <algorithm>
#include <string_view>

namespace gltf
{

void ByteBuffer::Append(const void* data, std::size_t size)
{
  std::string_view bytes(static_cast<const char*>(data), size);
  while (!bytes.empty()) {
    if (size_ % kBlock == 0) {
      if (size_ > kKeptInMemory)
        blocks_.back().PutBy(store_);
      blocks_.emplace_back();
    }
    const std::string_view part = bytes.substr(0, kBlock - blocks_.back().Size());
    blocks_.back().Append(part);
    bytes.remove_prefix(part.size());
    size_ += part.size();
  }
}

void ByteBuffer::Pad(std::size_t unit)
{
  constexpr std::uint8_t kZeros[16] = {};
  Append(kZeros, (unit - size_ % unit) % unit);
}

bool ByteBuffer::Holds(std::size_t offset, const void* data, std::size_t size) const
{
  if (offset > size_ || size > size_ - offset)
    return false;
  std::string_view bytes(static_cast<const char*>(data), size);
  std::string buffer;
  while (!bytes.empty()) {
    const std::size_t inBlock = offset % kBlock;
    const std::string_view part = bytes.substr(0, kBlock - inBlock);
    if (blocks_[offset / kBlock].Get(inBlock, part.size(), buffer) != part)
      return false;
    offset += part.size();
    bytes.remove_prefix(part.size());
  }
  return true;
}

} // namespace gltf
