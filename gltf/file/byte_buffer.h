// The binary part of a file as it grows: in blocks, so that growing copies nothing.
#pragma once

#include <cstddef>
#include <cstdint>
#include <memory>
#include <string>
#include <vector>

#include "gltf/file/stretch.h"

namespace gltf
{

class ByteBuffer
{
 public:
  std::size_t Size() const { return size_; }
  void Append(const void* data, std::size_t size);
  // Zeros up to a multiple of `unit`.
  void Pad(std::size_t unit);
  // Whether the bytes from `offset` on are those of `data`; false beyond the end. Throws as Stretch::Get.
  bool Holds(std::size_t offset, const void* data, std::size_t size) const;
  // Hands each run of bytes, in order, to `take(data, size)`. Throws as Stretch::Get.
  template <class Take>
  void ForEachBlock(Take&& take) const
  {
    std::string buffer;
    for (const Stretch& block : blocks_)
      take(reinterpret_cast<const std::uint8_t*>(block.Get(0, block.Size(), buffer).data()), block.Size());
  }

 private:
  static constexpr std::size_t kBlock = std::size_t{1} << 20;

  std::vector<Stretch> blocks_; // all but the last of kBlock bytes
  std::size_t size_ = 0;
  std::shared_ptr<TemporaryStore> store_;
};

} // namespace gltf
