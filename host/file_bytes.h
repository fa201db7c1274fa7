// The bytes of a file, mapped into memory where the system can do that: only what is looked at is read.
#pragma once

#include <filesystem>
#include <string_view>
#include <vector>

namespace host
{

class FileBytes
{
 public:
  // Bytes of no file.
  explicit FileBytes(std::vector<char> bytes);
  // Throws CompositionError when the file can't be read. What can't be mapped, such as a pipe, is read to its end.
  explicit FileBytes(const std::filesystem::path& file);
  ~FileBytes();
  FileBytes(FileBytes&& other) noexcept;
  FileBytes(const FileBytes&) = delete;
  FileBytes& operator=(const FileBytes&) = delete;

  // Stays where it is as long as this or what it was moved to lives.
  std::string_view View() const
  {
    return mapped_ ? std::string_view(mapped_, size_) : std::string_view(owned_.data(), owned_.size());
  }

 private:
  void Map(const std::filesystem::path& file);
  void Unmap();

  std::vector<char> owned_;
  const char* mapped_ = nullptr;
  std::size_t size_ = 0;
};

} // namespace host
