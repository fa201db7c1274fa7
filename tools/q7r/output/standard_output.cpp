#include "standard_output.h"

#include <cerrno>
#include <cstdarg>
#include <cstdio>
#include <system_error>

#include "verbs/verbs.h"

namespace q7r
{

namespace
{

// Further attempts would tell another cause, or none.
bool isBroken = false;

void Require(bool good)
{
  const int error = errno;
  if (good || isBroken)
    return;
  isBroken = true;
  throw Failure("standard output: " + (error ? std::generic_category().message(error) : "can't be written"));
}

} // namespace

void Print(std::string_view text)
{
  errno = 0;
  Require(std::fwrite(text.data(), 1, text.size(), stdout) == text.size());
}

void PrintLine(std::string_view text)
{
  Print(text);
  Print("\n");
}

void PrintFormatted(const char* format, ...)
{
  std::va_list arguments;
  va_start(arguments, format);
  errno = 0;
  const int count = std::vfprintf(stdout, format, arguments);
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
