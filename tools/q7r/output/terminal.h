// What a standard stream is connected with. What differs between systems stands here alone.
#pragma once

#ifdef _WIN32
#include <io.h>
#else
#include <unistd.h>
#endif

namespace q7r
{

enum class StandardStream : int
{
  kInput = 0,
  kOutput = 1,
  kError = 2,
};

inline bool IsTerminal(StandardStream stream)
{
#ifdef _WIN32
  return _isatty(static_cast<int>(stream)) != 0;
#else
  return isatty(static_cast<int>(stream)) != 0;
#endif
}

} // namespace q7r
