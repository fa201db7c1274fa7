// Loaded into a program before the C library: one of the calls that it makes to the system fails, or a signal comes
// instead. FAILING_CALL tells which, from 1; FAILING_SIGNAL the signal; FAILING_REPORT names a file that gets the
// number of calls when the program ends.
#ifndef _GNU_SOURCE
#define _GNU_SOURCE
#endif
#include <cerrno>
#include <csignal>
#include <cstdarg>
#include <cstdio>
#include <cstdlib>
#include <dlfcn.h>
#include <fcntl.h>
#include <stdio_ext.h>
#include <sys/stat.h>
#include <unistd.h>

namespace
{

int Setting(const char* name)
{
  const char* text = std::getenv(name);
  return text ? std::atoi(text) : 0;
}

int calls = 0;

bool Fails()
{
  static const int failing = Setting("FAILING_CALL");
  static const int signal = Setting("FAILING_SIGNAL");
  if (++calls != failing)
    return false;
  if (signal != 0)
    return ::raise(signal) != 0;
  errno = EIO;
  return true;
}

template <class Call>
Call* Real(Call*, const char* name)
{
  return reinterpret_cast<Call*>(::dlsym(RTLD_NEXT, name));
}

__attribute__((destructor)) void Report()
{
  const char* path = std::getenv("FAILING_REPORT");
  std::FILE* file = path ? std::fopen(path, "w") : nullptr;
  if (file) {
    std::fprintf(file, "%d", calls - 1);
    std::fclose(file);
  }
}

} // namespace

// NOLINTBEGIN(readability-inconsistent-declaration-parameter-name,bugprone-macro-parentheses)
#define FAILING(result, failure, name, parameters, arguments)                                                          \
  extern "C" result name parameters                                                                                    \
  {                                                                                                                    \
    static const auto real = Real(&name, #name);                                                                       \
    return Fails() ? failure : real arguments;                                                                         \
  }

// Closed all the same, as the system does.
#define FAILING_CLOSE(name, parameter)                                                                                 \
  extern "C" int name(parameter file)                                                                                  \
  {                                                                                                                    \
    static const auto real = Real(&name, #name);                                                                       \
    const int result = real(file);                                                                                     \
    return Fails() ? -1 : result;                                                                                      \
  }

#define FAILING_OPEN(name)                                                                                             \
  extern "C" int name(const char* path, int flags, ...)                                                                \
  {                                                                                                                    \
    static const auto real = Real(&name, #name);                                                                       \
    std::va_list more;                                                                                                 \
    va_start(more, flags);                                                                                             \
    const mode_t mode = (flags & O_CREAT) != 0 ? va_arg(more, mode_t) : 0;                                             \
    va_end(more);                                                                                                      \
    return Fails() ? -1 : real(path, flags, mode);                                                                     \
  }

FAILING_OPEN(open)
FAILING_OPEN(open64)
FAILING_CLOSE(close, int)
FAILING_CLOSE(fclose, std::FILE*)
FAILING(std::FILE*, nullptr, fopen, (const char* path, const char* mode), (path, mode))
FAILING(std::FILE*, nullptr, fopen64, (const char* path, const char* mode), (path, mode))
FAILING(std::FILE*, nullptr, fdopen, (int file, const char* mode), (file, mode))
FAILING(ssize_t, -1, read, (int file, void* bytes, std::size_t count), (file, bytes, count))
FAILING(ssize_t, -1, write, (int file, const void* bytes, std::size_t count), (file, bytes, count))
FAILING(int, -1, fsync, (int file), (file))
FAILING(int, -1, fchmod, (int file, mode_t mode), (file, mode))
FAILING(int, -1, rename, (const char* from, const char* to), (from, to))
FAILING(int, -1, stat, (const char* path, struct stat* status), (path, status))
FAILING(int, -1, stat64, (const char* path, struct stat64* status), (path, status))
FAILING(int, -1, lstat, (const char* path, struct stat* status), (path, status))
FAILING(int, -1, lstat64, (const char* path, struct stat64* status), (path, status))
FAILING(int, -1, fstat, (int file, struct stat* status), (file, status))
FAILING(int, -1, fstat64, (int file, struct stat64* status), (file, status))
FAILING(int, -1, fseeko, (std::FILE * file, off_t offset, int from), (file, offset, from))
FAILING(int, -1, fseeko64, (std::FILE * file, off64_t offset, int from), (file, offset, from))
FAILING(off_t, -1, ftello, (std::FILE * file), (file))
FAILING(off64_t, -1, ftello64, (std::FILE * file), (file))
FAILING(std::size_t, 0, fwrite, (const void* bytes, std::size_t size, std::size_t count, std::FILE* file),
        (bytes, size, count, file))
// NOLINTEND(readability-inconsistent-declaration-parameter-name,bugprone-macro-parentheses)

// Without something to write it asks nothing of the system.
extern "C" int fflush(std::FILE* file)
{
  static const auto real = Real(&fflush, "fflush");
  return file && ::__fpending(file) > 0 && Fails() ? EOF : real(file);
}

// The stream must know that it failed, or its end would be taken for that of the file.
extern "C" std::size_t fread(void* bytes, std::size_t size, std::size_t count, std::FILE* file)
{
  static const auto real = Real(&fread, "fread");
  if (!Fails())
    return real(bytes, size, count, file);
  file->_flags |= 0x20; // _IO_ERR_SEEN
  return 0;
}
