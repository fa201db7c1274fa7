#ifdef _WIN32

#include "temporary_file.h"

#ifndef NOMINMAX
#define NOMINMAX
#endif
#define WIN32_LEAN_AND_MEAN
#include <cerrno>
#include <fcntl.h>
#include <io.h>
#include <mutex>
#include <random>
#include <set>
#include <sys/stat.h>
#include <system_error>
#include <windows.h>

namespace q7r
{

namespace
{

namespace fs = std::filesystem;

// The files that are removed when the program is ended from the keyboard. The system calls the handler on a thread of
// its own.
std::mutex guardedMutex;
std::set<fs::path>& GuardedFiles()
{
  static std::set<fs::path> files;
  return files;
}

[[noreturn]] void ThrowLast() { throw std::system_error(static_cast<int>(::GetLastError()), std::system_category()); }

void Require(bool good)
{
  if (!good)
    ThrowLast();
}

[[noreturn]] void ThrowErrno() { throw std::system_error(errno, std::generic_category()); }

BOOL WINAPI RemoveAndEnd(DWORD)
{
  const std::lock_guard lock(guardedMutex);
  for (const fs::path& file : GuardedFiles())
    ::DeleteFileW(file.c_str());
  return FALSE; // the next handler ends the program
}

std::wstring RandomName()
{
  static std::random_device random;
  std::wstring name = L".q7r-";
  for (int i = 0; i < 12; ++i)
    name += L"0123456789abcdefghijklmnopqrstuvwxyz"[random() % 36];
  return name + L".q7r"; // the exporter puts this suffix onto every other name
}

} // namespace

TemporaryFile::TemporaryFile(const fs::path& folder, bool isPrivate)
{
  static const BOOL caught = ::SetConsoleCtrlHandler(RemoveAndEnd, TRUE);
  (void)caught;
  const std::lock_guard lock(guardedMutex);
  for (;;) {
    path_ = folder / RandomName();
    try {
      Create(isPrivate);
      return;
    } catch (const std::system_error&) {
      if (::GetLastError() != ERROR_FILE_EXISTS)
        throw;
    }
  }
}

void TemporaryFile::Create(bool)
{
  const HANDLE file =
      ::CreateFileW(path_.c_str(), GENERIC_WRITE, 0, nullptr, CREATE_NEW, FILE_ATTRIBUTE_NORMAL, nullptr);
  Require(file != INVALID_HANDLE_VALUE);
  ::CloseHandle(file);
  GuardedFiles().insert(path_);
  slot_ = 0;
}

TemporaryFile::~TemporaryFile()
{
  if (slot_ < 0)
    return;
  const std::lock_guard lock(guardedMutex);
  ::DeleteFileW(path_.c_str());
  GuardedFiles().erase(path_);
}

void TemporaryFile::Finish(std::optional<unsigned>) const
{
  const HANDLE file =
      ::CreateFileW(path_.c_str(), GENERIC_WRITE, 0, nullptr, OPEN_EXISTING, FILE_ATTRIBUTE_NORMAL, nullptr);
  Require(file != INVALID_HANDLE_VALUE);
  const bool flushed = ::FlushFileBuffers(file) != 0;
  const DWORD problem = ::GetLastError();
  ::CloseHandle(file);
  ::SetLastError(problem);
  Require(flushed);
}

void TemporaryFile::MoveTo(const fs::path& target)
{
  Require(::MoveFileExW(path_.c_str(), target.c_str(), MOVEFILE_REPLACE_EXISTING | MOVEFILE_WRITE_THROUGH) != 0);
  const std::lock_guard lock(guardedMutex);
  GuardedFiles().erase(path_);
  slot_ = -1;
}

void DoUndisturbed(const std::function<void()>& action)
{
  action(); // the keyboard's handler ends the program from a thread of its own
}

RawOutput::RawOutput(const fs::path& existing)
    : descriptor_(::_wopen(existing.c_str(), _O_WRONLY | _O_BINARY | _O_NOINHERIT))
{
  if (descriptor_ < 0)
    ThrowErrno();
}

RawOutput::RawOutput(int descriptor) : descriptor_(::_dup(descriptor))
{
  if (descriptor_ < 0)
    ThrowErrno();
  ::_setmode(descriptor_, _O_BINARY);
}

RawOutput::~RawOutput()
{
  if (descriptor_ >= 0)
    ::_close(descriptor_);
}

void RawOutput::Write(const char* bytes, std::size_t count)
{
  constexpr std::size_t kMost = 1U << 20; // of one call
  while (count > 0) {
    const int written = ::_write(descriptor_, bytes, static_cast<unsigned>(count < kMost ? count : kMost));
    if (written < 0)
      ThrowErrno();
    bytes += written;
    count -= static_cast<std::size_t>(written);
  }
}

void RawOutput::Close()
{
  const int descriptor = descriptor_;
  descriptor_ = -1;
  if (::_close(descriptor) != 0)
    ThrowErrno();
}

int DescriptorOf(const std::string& path) { return path == "-" ? 1 : -1; }

bool IsStandardOutput(const fs::path&) { return false; }

std::vector<fs::path> TemporaryFolders()
{
  std::error_code error;
  return {fs::temp_directory_path(error), L"C:\\Windows\\Temp", L"C:\\ProgramData"};
}

fs::path MakePrivateFolder()
{
  // Below a folder that is the user's own, as the first one is.
  for (const fs::path& folder : TemporaryFolders()) {
    const fs::path path = folder / fs::path(RandomName()).stem();
    if (!folder.empty() && ::CreateDirectoryW(path.c_str(), nullptr))
      return path;
  }
  ThrowLast();
}

void PrepareProcess() {}

} // namespace q7r

#endif
