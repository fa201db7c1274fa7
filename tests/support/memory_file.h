// HyperFiles over bytes in memory.
#pragma once

#include <algorithm>
#include <cstdint>
#include <functional>
#include <memory>
#include <vector>

#include <gtest/gtest.h>

#include "torvane/stream/hyper_file.h"
#include "torvane/text/filename.h"

// A file open for reading over a copy of the bytes, in a heap block of just their size, so that a sanitizer sees every
// read past the end.
class MemoryReadFile
{
 public:
  explicit MemoryReadFile(const std::vector<std::uint8_t>& bytes, _torvane_::ULong ident = _torvane_::kSceneIdent,
                          _torvane_::BaseDocument* document = nullptr)
      : block_(new std::uint8_t[bytes.size()]), file(document)
  {
    std::copy(bytes.begin(), bytes.end(), block_.get());
    name_.SetMemoryRead(block_.get(), static_cast<_torvane_::LLong>(bytes.size()));
    opened = file.Open(ident, name_, _torvane_::kHyperFileRead);
  }

 private:
  std::unique_ptr<std::uint8_t[]> block_;
  _torvane_::Filename name_;

 public:
  _torvane_::HyperFile file;
  bool opened = false;
};

// The bytes that `write` leaves in a new scene file, without the 13 bytes of the header unless `withHeader` is set.
inline std::vector<std::uint8_t> WriteToMemory(const std::function<void(_torvane_::HyperFile&)>& write,
                                               bool withHeader = false)
{
  _torvane_::MemoryDescription description;
  _torvane_::Filename name;
  name.SetMemoryWrite(&description);
  {
    _torvane_::HyperFile file;
    EXPECT_TRUE(file.Open(_torvane_::kSceneIdent, name, _torvane_::kHyperFileWrite));
    write(file);
    file.Close();
  }
  const void* data = nullptr;
  _torvane_::LLong size = 0;
  if (!name.GetMemoryContinuous(data, size))
    return {};
  const auto* first = static_cast<const std::uint8_t*>(data);
  return {first + (withHeader ? 0 : 13), first + size};
}
