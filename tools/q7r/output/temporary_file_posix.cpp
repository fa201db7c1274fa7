#ifndef _WIN32

#include "temporary_file.h"

#include <atomic>
#include <cerrno>
#include <charconv>
#include <csignal>
#include <cstdlib>
#include <fcntl.h>
#include <mutex>
#include <random>
#include <sys/stat.h>
#include <system_error>
#include <unistd.h>

namespace q7r
{

namespace
{

namespace fs = std::filesystem;

constexpr int kEndings[] = {SIGHUP, SIGINT, SIGQUIT, SIGPIPE, SIGTERM, SIGXCPU};
constexpr int kMaxTemporaries = 256; // at a time

// The files that a signal removes. A handler can't take a lock, hence a table of a fixed size.
std::atomic<const char*> guardedFiles[kMaxTemporaries];
static_assert(std::atomic<const char*>::is_always_lock_free);

[[noreturn]] void Throw(int error) { throw std::system_error(error, std::generic_category()); }

int Require(int result)
{
  if (result < 0)
    Throw(errno);
  return result;
}

// A handler that was reset by its first call: raised again, the signal ends the program as it would have.
void RemoveAndEnd(int signal)
{
  for (const std::atomic<const char*>& file : guardedFiles) {
    if (const char* path = file.load())
      ::unlink(path);
  }
  ::raise(signal);
}

void CatchEndings()
{
  for (int signal : kEndings) {
    struct sigaction action = {};
    if (::sigaction(signal, nullptr, &action) != 0 || action.sa_handler != SIG_DFL)
      continue; // somebody wants to live on, as under nohup
    action.sa_handler = RemoveAndEnd;
    action.sa_flags = static_cast<int>(SA_RESETHAND);
    ::sigaction(signal, &action, nullptr);
  }
}

// Signals that come meanwhile wait for its end.
class SignalPause
{
 public:
  SignalPause()
  {
    sigset_t endings;
    ::sigemptyset(&endings);
    for (int signal : kEndings)
      ::sigaddset(&endings, signal);
    ::pthread_sigmask(SIG_BLOCK, &endings, &before_);
  }
  ~SignalPause() { ::pthread_sigmask(SIG_SETMASK, &before_, nullptr); }
  SignalPause(const SignalPause&) = delete;
  SignalPause& operator=(const SignalPause&) = delete;

 private:
  sigset_t before_ = {};
};

int TakeSlot(const char* path)
{
  for (int slot = 0; slot < kMaxTemporaries; ++slot) {
    const char* none = nullptr;
    if (guardedFiles[slot].compare_exchange_strong(none, path))
      return slot;
  }
  return -1;
}

std::string RandomName()
{
  static std::mutex mutex;
  static std::random_device random;
  constexpr char kDigits[] = "0123456789abcdefghijklmnopqrstuvwxyz";
  const std::lock_guard lock(mutex);
  std::string name = ".q7r-";
  for (int i = 0; i < 12; ++i)
    name += kDigits[random() % 36];
  return name + ".q7r"; // the exporter puts this suffix onto every other name
}

} // namespace

TemporaryFile::TemporaryFile(const fs::path& folder, bool isPrivate)
{
  static const bool caught = (CatchEndings(), true);
  (void)caught;
  for (;;) {
    path_ = folder / RandomName();
    guarded_ = path_.string();
    try {
      Create(isPrivate);
      return;
    } catch (const std::system_error& error) {
      if (error.code() != std::errc::file_exists)
        throw;
    }
  }
}

void TemporaryFile::Create(bool isPrivate)
{
  const SignalPause pause;                       // none comes between the making of the file and its entry in the table
  const mode_t rights = isPrivate ? 0600 : 0666; // less what the process's mask takes away
  const int descriptor = Require(::open(guarded_.c_str(), O_WRONLY | O_CREAT | O_EXCL | O_CLOEXEC, rights));
  slot_ = TakeSlot(guarded_.c_str());
  const int problem = ::close(descriptor) != 0 ? errno : slot_ < 0 ? EMFILE : 0;
  if (problem == 0)
    return;
  ::unlink(guarded_.c_str());
  if (slot_ >= 0)
    guardedFiles[slot_] = nullptr;
  Throw(problem);
}

TemporaryFile::~TemporaryFile()
{
  if (slot_ < 0)
    return;
  ::unlink(guarded_.c_str());
  guardedFiles[slot_] = nullptr;
}

void TemporaryFile::Finish(std::optional<unsigned> mode) const
{
  const int descriptor = Require(::open(guarded_.c_str(), O_RDWR | O_CLOEXEC));
  struct stat status = {};
  int problem = 0;
  if (mode && (::fstat(descriptor, &status) != 0 ||
               ((status.st_mode & 0777U) != *mode && ::fchmod(descriptor, static_cast<mode_t>(*mode)) != 0)))
    problem = errno;
  else if (::fsync(descriptor) != 0 && errno != EINVAL) // not every file system has it
    problem = errno;
  if (::close(descriptor) != 0 && problem == 0)
    problem = errno;
  if (problem != 0)
    Throw(problem);
}

void TemporaryFile::MoveTo(const fs::path& target)
{
  Require(::rename(guarded_.c_str(), target.c_str()));
  guardedFiles[slot_] = nullptr;
  slot_ = -1;
  // The work is done: a folder that can't be brought to the disk by itself (or be read) doesn't undo it.
  const fs::path folder = target.parent_path();
  const int descriptor = ::open(folder.empty() ? "." : folder.c_str(), O_RDONLY | O_DIRECTORY | O_CLOEXEC);
  if (descriptor >= 0) {
    ::fsync(descriptor);
    ::close(descriptor);
  }
}

void DoUndisturbed(const std::function<void()>& action)
{
  const SignalPause pause;
  action();
}

RawOutput::RawOutput(const fs::path& existing)
    : descriptor_(Require(::open(existing.c_str(), O_WRONLY | O_NOCTTY | O_CLOEXEC)))
{}

RawOutput::RawOutput(int descriptor) : descriptor_(Require(::fcntl(descriptor, F_DUPFD_CLOEXEC, 3))) {}

RawOutput::~RawOutput()
{
  if (descriptor_ >= 0)
    ::close(descriptor_);
}

void RawOutput::Write(const char* bytes, std::size_t count)
{
  while (count > 0) {
    const ssize_t written = ::write(descriptor_, bytes, count);
    if (written < 0 && errno == EINTR)
      continue;
    Require(written < 0 ? -1 : 0);
    bytes += written;
    count -= static_cast<std::size_t>(written);
  }
}

void RawOutput::Close()
{
  const int descriptor = descriptor_;
  descriptor_ = -1;
  Require(::close(descriptor));
}

int DescriptorOf(const std::string& path)
{
  if (path == "-" || path == "/dev/stdout")
    return STDOUT_FILENO;
  if (path == "/dev/stderr")
    return STDERR_FILENO;
  for (const std::string folder : {"/dev/fd/", "/proc/self/fd/"}) {
    int number = -1;
    const char* end = path.data() + path.size();
    if (path.starts_with(folder) && std::from_chars(path.data() + folder.size(), end, number).ptr == end)
      return number;
  }
  return -1;
}

bool IsStandardOutput(const fs::path& path)
{
  struct stat one = {};
  struct stat other = {};
  return ::stat(path.c_str(), &one) == 0 && ::fstat(STDOUT_FILENO, &other) == 0 && one.st_dev == other.st_dev &&
         one.st_ino == other.st_ino;
}

std::vector<fs::path> TemporaryFolders()
{
  std::error_code error;
  return {fs::temp_directory_path(error), "/tmp", "/var/tmp", "/dev/shm"};
}

fs::path MakePrivateFolder()
{
  for (const fs::path& folder : TemporaryFolders()) {
    std::string path = (folder / "q7r-XXXXXX").string();
    if (!folder.empty() && ::mkdtemp(path.data()))
      return path;
  }
  Throw(errno);
}

void PrepareProcess()
{
  // Opened the wrong way round, so that writing to it (or reading from it) still fails.
  for (int stream : {STDIN_FILENO, STDOUT_FILENO, STDERR_FILENO}) {
    if (::fcntl(stream, F_GETFD) < 0)
      (void)::open("/dev/null", stream == STDIN_FILENO ? O_WRONLY : O_RDONLY);
  }
  std::signal(SIGXFSZ, SIG_IGN);
}

} // namespace q7r

#endif
