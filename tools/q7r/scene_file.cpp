#include "scene_file.h"

#include <cerrno>
#include <cstdio>
#include <filesystem>
#include <fstream>
#include <system_error>

#ifndef _WIN32
#include <fcntl.h>
#endif

#include "verbs/verbs.h"

namespace q7r
{

using namespace _torvane_;

namespace
{

// A name in plain characters for a file whose own name isn't text.
std::string OpenedName(const std::filesystem::path& path)
{
#ifndef _WIN32
  // Open until the program ends: nobody knows how often the name is used.
  const int descriptor = ::open(path.c_str(), O_RDONLY | O_CLOEXEC);
  if (descriptor >= 0)
    return "/dev/fd/" + std::to_string(descriptor);
#endif
  throw Failure(path.string() + ": " + std::generic_category().message(errno));
}

} // namespace

Filename ToFilename(const std::string& path)
{
  // UTF-8 to UTF-16 by code points: the library's own decoder knows characters of the basic plane alone. The path is
  // made absolute because one that begins with "?" could stand for a connection or a stream.
  const std::filesystem::path absolute = std::filesystem::absolute(std::filesystem::path(path));
  std::u16string wide;
  try {
    wide = absolute.u16string();
  } catch (const std::filesystem::filesystem_error&) {
    wide = std::filesystem::path(OpenedName(absolute)).u16string();
  }
  Filename name;
  name.SetString(String(reinterpret_cast<const UniChar*>(wide.data()), static_cast<Long>(wide.size())));
  return name;
}

std::string ReadInput(const std::string& path)
{
  errno = 0;
  std::ifstream file(std::filesystem::path(path), std::ios::binary);
  std::string bytes;
  for (std::string block(1 << 16, '\0'); file;) {
    file.read(block.data(), static_cast<std::streamsize>(block.size()));
    bytes.append(block, 0, static_cast<std::size_t>(file.gcount()));
  }
  if (!file.is_open() || file.bad())
    throw Failure(path + ": " + std::generic_category().message(errno));
  return bytes;
}

namespace
{

// The system's own words, if it was the one that failed, else the library's.
std::string ReasonText(const FileProblem& problem, const String& text)
{
  return problem.systemError != 0 ? std::generic_category().message(problem.systemError) : ToUtf8(text);
}

} // namespace

std::string ProblemText(const std::string& path, const FileProblem& problem)
{
  return path + ": " + ReasonText(problem, GetProblemText(problem));
}

std::string ProblemText(const std::string& path, const StreamWalker& walker)
{
  return path + ": " + ReasonText(walker.GetProblem(), walker.GetProblemText());
}

DocumentPtr LoadScene(const std::string& path)
{
  FileProblem problem;
  DocumentPtr document(LoadDocument(ToFilename(path), LoadObjects | LoadMaterials, &problem));
  if (!document)
    throw Failure(ProblemText(path, problem));
  return document;
}

std::string SizeText(std::uintmax_t bytes)
{
  if (bytes < 1000)
    return std::to_string(bytes) + " bytes";
  const char* units[] = {"KB", "MB", "GB", "TB"};
  double size = static_cast<double>(bytes) / 1000.0;
  int unit = 0;
  while (size >= 1000.0 && unit < 3) {
    size /= 1000.0;
    ++unit;
  }
  char buffer[40];
  std::snprintf(buffer, sizeof buffer, "%.1f %s", size, units[unit]);
  return buffer;
}

} // namespace q7r
