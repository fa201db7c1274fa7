#ifndef _WIN32

#define _FILE_OFFSET_BITS 64 // 64-bit positions on 32-bit systems too

#include "k2v_file/bytes/disk_file.h"

#include <cerrno>
#include <fcntl.h>
#include <sys/stat.h>
#include <unistd.h>

#include "k2v_file/text/utf8.h"
#include "torvane/bytes/base_file.h"
#include "torvane/memory/memory.h"

namespace _torvane_
{

namespace
{

constexpr Long kInlineCharacters = 1023;
constexpr LLong kBytesPerCharacter = 3; // at most; a surrogate pair has four for its two

constexpr Bool IsHighSurrogate(UniChar character) { return (character & 0xFC00) == 0xD800; }
constexpr Bool IsLowSurrogate(UniChar character) { return (character & 0xFC00) == 0xDC00; }

// A path as the system takes it: UTF-8 with a terminator. A surrogate pair becomes one form of four bytes; a lone
// surrogate keeps a form of three, which String decodes to the same character again.
class SystemPath
{
 public:
  explicit SystemPath(const String& path);
  ~SystemPath() { GeFree(block_); }
  SystemPath(const SystemPath&) = delete;
  SystemPath& operator=(const SystemPath&) = delete;

  // Null when memory is short and for a path that no file can have.
  const char* Get() const { return text_; }

 private:
  char inline_[kInlineCharacters * kBytesPerCharacter + 1];
  char* block_ = nullptr;
  const char* text_ = nullptr;
};

SystemPath::SystemPath(const String& path)
{
  const Long length = path.GetLength();
  char* place = inline_;
  if (length > kInlineCharacters) {
    block_ = static_cast<char*>(GeAllocNC(length * kBytesPerCharacter + 1));
    place = block_;
  }
  if (!place)
    return;
  const char* start = place;
  const UniChar* from = path.Data();
  for (Long i = 0; i < length; ++i) {
    ULong code = from[i];
    if (code == 0)
      return;
    if (IsHighSurrogate(from[i]) && i + 1 < length && IsLowSurrogate(from[i + 1]))
      code = 0x10000 + ((code & 0x3FF) << 10) + (from[++i] & 0x3FFU);
    place += PutUtf8(place, code);
  }
  *place = 0;
  text_ = start;
}

struct OpenRule
{
  int flags;
  const char* mode; // of the C stream
};

// One row per FileMode.
constexpr OpenRule kOpenRules[] = {
    {O_RDWR | O_CREAT, "r+b"},            // kFileReadWriteAtEnd
    {O_RDONLY, "rb"},                     // kFileRead
    {O_WRONLY | O_CREAT | O_TRUNC, "wb"}, // kFileWrite
    {O_RDWR | O_CREAT, "r+b"},            // kFileReadWrite
    {O_RDONLY, "rb"},                     // kFileReadAlias
    {O_RDONLY, "rb"},                     // kFileReadShared
};

constexpr mode_t kNewFileRights = 0666; // less what the process's mask takes away

int OpenDescriptor(const char* path, int flags)
{
  for (;;) {
    const int descriptor = ::open(path, flags | O_CLOEXEC, kNewFileRights);
    if (descriptor >= 0 || errno != EINTR)
      return descriptor;
  }
}

// Opening a directory for reading works; only reading from it would fail.
Bool MayBeOpened(int descriptor)
{
  struct stat status = {};
  if (::fstat(descriptor, &status) != 0)
    return false;
  errno = EISDIR;
  return !S_ISDIR(status.st_mode);
}

} // namespace

std::FILE* OpenDiskFile(const String& path, Long mode)
{
  const SystemPath systemPath(path);
  if (!systemPath.Get())
    return RefusePath();
  const int descriptor = OpenDescriptor(systemPath.Get(), kOpenRules[mode].flags);
  if (descriptor < 0)
    return nullptr;
  std::FILE* file = MayBeOpened(descriptor) ? ::fdopen(descriptor, kOpenRules[mode].mode) : nullptr;
  if (!file) {
    const int cause = errno;
    ::close(descriptor);
    errno = cause;
  }
  return file;
}

Bool SeekDiskFile(std::FILE* file, LLong position)
{
  return ::fseeko(file, static_cast<off_t>(position), SEEK_SET) == 0;
}

Bool MeasureDiskFile(std::FILE* file, LLong& length)
{
  if (::fseeko(file, 0, SEEK_END) != 0)
    return false;
  length = ::ftello(file);
  return length >= 0;
}

PathKind LookUpPath(const String& path)
{
  const SystemPath systemPath(path);
  struct stat status = {};
  if (!systemPath.Get() || ::stat(systemPath.Get(), &status) != 0)
    return PathKind::kNothing;
  return S_ISDIR(status.st_mode) ? PathKind::kDirectory : PathKind::kFile;
}

} // namespace _torvane_

#endif
