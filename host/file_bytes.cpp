#include "host/file_bytes.h"

#include "host/model/composition.h"
#include "host/text.h"

#include <cerrno>
#include <fstream>
#include <system_error>
#include <utility>

#ifdef _WIN32
#ifndef NOMINMAX
#define NOMINMAX
#endif
#include <windows.h>
#else
#include <fcntl.h>
#include <sys/mman.h>
#include <sys/stat.h>
#include <unistd.h>
#endif

namespace host
{

#ifdef _WIN32

// The view outlives the handles that it was made through.
void FileBytes::Map(const std::filesystem::path& file)
{
  const HANDLE handle =
      CreateFileW(file.c_str(), GENERIC_READ, FILE_SHARE_READ, nullptr, OPEN_EXISTING, FILE_ATTRIBUTE_NORMAL, nullptr);
  if (handle == INVALID_HANDLE_VALUE)
    return;
  LARGE_INTEGER size{};
  if (GetFileSizeEx(handle, &size) && size.QuadPart > 0) {
    if (const HANDLE mapping = CreateFileMappingW(handle, nullptr, PAGE_READONLY, 0, 0, nullptr)) {
      mapped_ = static_cast<const char*>(MapViewOfFile(mapping, FILE_MAP_READ, 0, 0, 0));
      size_ = static_cast<std::size_t>(size.QuadPart);
      CloseHandle(mapping);
    }
  }
  CloseHandle(handle);
}

void FileBytes::Unmap() { UnmapViewOfFile(mapped_); }

#else

void FileBytes::Map(const std::filesystem::path& file)
{
  const int handle = open(file.c_str(), O_RDONLY | O_CLOEXEC);
  if (handle < 0)
    return;
  struct stat status = {};
  if (fstat(handle, &status) == 0 && S_ISREG(status.st_mode) && status.st_size > 0) {
    void* const place = mmap(nullptr, static_cast<std::size_t>(status.st_size), PROT_READ, MAP_PRIVATE, handle, 0);
    if (place != MAP_FAILED) {
      mapped_ = static_cast<const char*>(place);
      size_ = static_cast<std::size_t>(status.st_size);
    }
  }
  close(handle);
}

void FileBytes::Unmap() { munmap(const_cast<char*>(mapped_), size_); }

#endif

FileBytes::FileBytes(std::vector<char> bytes) : owned_(std::move(bytes)) {}

FileBytes::FileBytes(const std::filesystem::path& file)
{
  Map(file);
  if (mapped_)
    return;
  errno = 0;
  std::ifstream stream(file, std::ios::binary);
  std::vector<char> piece(65536);
  while (stream.read(piece.data(), static_cast<std::streamsize>(piece.size())) || stream.gcount() > 0)
    owned_.insert(owned_.end(), piece.begin(), piece.begin() + stream.gcount());
  if (!stream.is_open() || stream.bad()) // a folder opens, but is bad to read
    throw CompositionError(OneLine(PathToUtf8(file)),
                           errno ? std::generic_category().message(errno) : "cannot be read");
}

FileBytes::~FileBytes()
{
  if (mapped_)
    Unmap();
}

FileBytes::FileBytes(FileBytes&& other) noexcept
    : owned_(std::move(other.owned_)), mapped_(std::exchange(other.mapped_, nullptr)), size_(other.size_)
{}

} // namespace host
