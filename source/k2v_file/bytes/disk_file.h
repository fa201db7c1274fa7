// The operating system's file calls: paths of UTF-16 characters, 64-bit positions, and the sharing rules where there
// are any.
#pragma once

#include <cerrno>
#include <cstdio>

#include "torvane/text/ge_string.h"
#include "torvane/types.h"

namespace _torvane_
{

// Opens `path` in a FileMode. The stream is not inherited by child processes. Null, with the
// cause in errno, when that fails, for a directory and for a path that holds a character 0. The caller closes the
// stream with fclose.
std::FILE* OpenDiskFile(const String& path, Long mode);

// What OpenDiskFile gives for a path that the system has no form of.
inline std::FILE* RefusePath()
{
  errno = EINVAL;
  return nullptr;
}

// Whether what lies between a file's end and a place behind it that is written to costs nothing. Windows fills it with
// zeros.
#ifdef _WIN32
inline constexpr Bool kFilesHaveHoles = false;
#else
inline constexpr Bool kFilesHaveHoles = true;
#endif

// Positions the stream, from its start.
Bool SeekDiskFile(std::FILE* file, LLong position);

// The length of the file; the stream stands at its end then.
Bool MeasureDiskFile(std::FILE* file, LLong& length);

enum class PathKind : UChar
{
  kNothing,
  kFile, // all that is no directory
  kDirectory,
};

PathKind LookUpPath(const String& path);

} // namespace _torvane_
