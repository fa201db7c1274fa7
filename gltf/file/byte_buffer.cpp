#include "gltf/file/byte_buffer.h"

#include <algorithm>
#include <cstring>

namespace gltf
{

void ByteBuffer::Append(const void* data, std::size_t size)
{
  const auto* bytes = static_cast<const std::uint8_t*>(data);
  while (size > 0) {
    if (size_ % kBlock == 0)
      blocks_.emplace_back();
    std::vector<std::uint8_t>& block = blocks_.back();
    const std::size_t part = std::min(size, kBlock - block.size());
    block.insert(block.end(), bytes, bytes + part);
    bytes += part;
    size -= part;
    size_ += part;
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
  const auto* bytes = static_cast<const std::uint8_t*>(data);
  while (size > 0) {
    const std::size_t inBlock = offset % kBlock;
    const std::size_t part = std::min(size, kBlock - inBlock);
    if (std::memcmp(blocks_[offset / kBlock].data() + inBlock, bytes, part) != 0)
      return false;
    offset += part;
    bytes += part;
    size -= part;
  }
  return true;
}

} // namespace gltf
