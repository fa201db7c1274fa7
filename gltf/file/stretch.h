// A stretch of something long, in memory or put by in a temporary file: a large scene and the file that is made of it
// would else add up.
#pragma once

#include <cstddef>
#include <cstdio>
#include <memory>
#include <string>
#include <string_view>

namespace gltf
{

inline constexpr std::size_t kKeptInMemory = std::size_t{1} << 18; // bytes of something long that aren't put by

// Nameless: the system removes it when it is closed, however the program ends.
class TemporaryStore
{
 public:
  // False without a place for the file or room in it; nothing is taken any more then.
  bool Append(std::string_view bytes, long& place);
  // Throws std::runtime_error when the file can't be read.
  void Read(long place, char* bytes, std::size_t size) const;

 private:
  struct Close
  {
    void operator()(std::FILE* file) const { std::fclose(file); }
  };

  std::unique_ptr<std::FILE, Close> file_;
  long size_ = 0;
  bool takes_ = true;
};

class Stretch
{
 public:
  std::size_t Size() const { return size_; }
  void Reserve(std::size_t size) { bytes_.reserve(size); }
  void Append(std::string_view bytes);
  bool IsPutBy() const { return store_ != nullptr; }
  // To be called when it is whole. Where the store doesn't take it, it stays in memory.
  void PutBy(std::shared_ptr<TemporaryStore>& store);
  // `size` bytes from `offset` on, as long as they and `buffer` stay as they are. Throws as TemporaryStore::Read.
  std::string_view Get(std::size_t offset, std::size_t size, std::string& buffer) const;

 private:
  std::string bytes_; // empty when they are put by
  std::shared_ptr<TemporaryStore> store_;
  long place_ = 0;
  std::size_t size_ = 0;
};

} // namespace gltf
