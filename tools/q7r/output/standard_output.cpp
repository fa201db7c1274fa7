#include "standard_output.h"

#include <atomic>
#include <cerrno>
#include <cstdarg>
#include <cstdio>
#include <string>
#include <system_error>

#include "report.h"

namespace q7r
{

namespace
{

// Further attempts would tell another cause, or none.
std::atomic<bool> isBroken = false;

void Require(bool good)
{
  const int error = errno;
  if (good || isBroken.exchange(true))
    return;
  throw Failure("standard output: " + (error ? std::generic_category().message(error) : "can't be written"));
}

} // namespace

bool IsStandardOutputBroken() { return isBroken; }

void Print(std::string_view text)
{
  errno = 0;
  Require(std::fwrite(text.data(), 1, text.size(), stdout) == text.size());
}

void PrintLine(std::string_view text)
{
  Print(std::string(text) + '\n'); // in one piece, since several threads may tell something
}

void PrintFormatted(const char* format, ...)
{
  std::va_list arguments;
  va_start(arguments, format);
  errno = 0;
  const int count = std::vfprintf(stdout, format, arguments); // NOLINT(clang-analyzer-valist.Uninitialized)
  va_end(arguments);
  Require(count >= 0);
}

void FlushStandardOutput()
{
  errno = 0;
  const bool flushed = std::fflush(stdout) == 0;
  Require(flushed && !std::ferror(stdout));
}

} // namespace q7r
