#include "browser.h"

#ifdef _WIN32

#ifndef NOMINMAX
#define NOMINMAX
#endif
#include <cstdint>
#include <windows.h>

#include <shellapi.h>

namespace q7r
{

bool OpenInBrowser(const std::filesystem::path& file)
{
  constexpr std::intptr_t kGreatestError = 32;
  const HINSTANCE result =
      ::ShellExecuteW(nullptr, L"open", std::filesystem::absolute(file).c_str(), nullptr, nullptr, SW_SHOWNORMAL);
  return reinterpret_cast<std::intptr_t>(result) > kGreatestError;
}

} // namespace q7r

#else

#include <algorithm>
#include <cerrno>
#include <chrono>
#include <cstdlib>
#include <fcntl.h>
#include <iterator>
#include <spawn.h>
#include <string>
#include <sys/wait.h>
#include <thread>
#include <unistd.h>

namespace q7r
{

namespace
{

constexpr char kOpener[] = "xdg-open";

// Without one, the opener would look for a browser of the terminal.
bool HasDesktop()
{
  const char* const names[] = {"DISPLAY", "WAYLAND_DISPLAY"};
  return std::any_of(std::begin(names), std::end(names), [](const char* name) {
    const char* value = std::getenv(name);
    return value && *value != '\0';
  });
}

// In a session of its own, so that a key press here doesn't end the browser, and without our streams. -1 if there is no
// such program.
pid_t Start(std::string program, std::string argument)
{
  posix_spawn_file_actions_t files;
  posix_spawnattr_t attributes;
  ::posix_spawn_file_actions_init(&files);
  ::posix_spawnattr_init(&attributes);
  for (const int stream : {STDIN_FILENO, STDOUT_FILENO, STDERR_FILENO})
    ::posix_spawn_file_actions_addopen(&files, stream, "/dev/null", O_RDWR, 0);
  ::posix_spawnattr_setflags(&attributes, POSIX_SPAWN_SETSID);
  char* const arguments[] = {program.data(), argument.data(), nullptr};
  pid_t child = -1;
  const int problem = ::posix_spawnp(&child, program.c_str(), &files, &attributes, arguments, ::environ);
  ::posix_spawnattr_destroy(&attributes);
  ::posix_spawn_file_actions_destroy(&files);
  return problem == 0 ? child : -1;
}

// False if the program ends soon with a failure. It may be the browser itself, which goes on.
bool IsContent(pid_t child)
{
  constexpr auto kPause = std::chrono::milliseconds(20);
  constexpr int kPauses = 150;
  int status = 0;
  for (int i = 0; i < kPauses; ++i) {
    const pid_t ended = ::waitpid(child, &status, WNOHANG);
    if (ended == child)
      return WIFEXITED(status) && WEXITSTATUS(status) == 0;
    if (ended < 0 && errno != EINTR)
      return false;
    std::this_thread::sleep_for(kPause);
  }
  return true;
}

} // namespace

bool OpenInBrowser(const std::filesystem::path& file)
{
  if (!HasDesktop())
    return false;
  const pid_t child = Start(kOpener, std::filesystem::absolute(file).string());
  return child > 0 && IsContent(child);
}

} // namespace q7r

#endif
