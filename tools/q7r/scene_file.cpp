#include "scene_file.h"

#include <algorithm>
#include <cerrno>
#include <cstdio>
#include <filesystem>
#include <fstream>
#include <system_error>

#ifndef _WIN32
#include <fcntl.h>
#endif

#include "report.h"
#include "standard_input.h"

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
  if (path.empty())
    throw Failure(InputName(path), "is no file name");
  Filename name;
  if (IsStandard(path)) {
    const std::string& bytes = StandardInput();
    name.SetMemoryRead(bytes.data(), static_cast<LLong>(bytes.size()));
    return name;
  }
  // UTF-8 to UTF-16 by code points: the library's own decoder knows characters of the basic plane alone. The path is
  // made absolute because one that begins with "?" could stand for a connection or a stream.
  const std::filesystem::path absolute = std::filesystem::absolute(std::filesystem::path(path));
  std::u16string wide;
  try {
    wide = absolute.u16string();
  } catch (const std::filesystem::filesystem_error&) {
    wide = std::filesystem::path(OpenedName(absolute)).u16string();
  }
  name.SetString(String(reinterpret_cast<const UniChar*>(wide.data()), static_cast<Long>(wide.size())));
  return name;
}

std::string ReadInput(const std::string& path)
{
  if (IsStandard(path))
    return StandardInput();
  errno = 0;
  std::ifstream file(std::filesystem::path(path), std::ios::binary);
  std::string bytes;
  for (std::string block(1 << 16, '\0'); file;) {
    file.read(block.data(), static_cast<std::streamsize>(block.size()));
    bytes.append(block, 0, static_cast<std::size_t>(file.gcount()));
  }
  if (!file.is_open() || file.bad())
    throw Failure(InputName(path), std::generic_category().message(errno));
  return bytes;
}

namespace
{

// The first bytes of what isn't a scene file, and what that is.
struct OtherKind
{
  std::string_view start;
  const char* words;
};

constexpr OtherKind kOtherKinds[] = {
    {"\xFF\xD8\xFF", "a JPEG picture"},
    {"\x89PNG", "a PNG picture"},
    {"BM", "a BMP picture"},
    {"GIF8", "a GIF picture"},
    {{"II*\0", 4}, "a TIFF picture"},
    {{"MM\0*", 4}, "a TIFF picture"},
    {"RIFX", "an After Effects project, which q7r export takes"},
    {"<?xml", "XML"},
    {"IESNA", "a photometric file, which q7r ies reads"},
    {"glTF", "a glTF file"},
    {"PK\x03\x04", "a ZIP archive"},
    {"%PDF", "a PDF document"},
    {"{", "JSON; compositions of that kind go to q7r export"},
    {"[", "JSON"},
};

bool IsText(std::string_view bytes)
{
  return std::none_of(bytes.begin(), bytes.end(), [](unsigned char c) {
    return c == 0x7F || (c < 0x20 && c != '\t' && c != '\n' && c != '\r' && c != '\f' && c != '\v');
  });
}

// As many bytes as tell what a file is.
std::string FirstBytes(const std::string& path)
{
  constexpr std::size_t kEnough = 512;
  if (IsStandard(path))
    return StandardInput().substr(0, kEnough);
  std::ifstream file(std::filesystem::path(path), std::ios::binary);
  std::string bytes(kEnough, '\0');
  file.read(bytes.data(), static_cast<std::streamsize>(bytes.size()));
  bytes.resize(static_cast<std::size_t>(file.gcount()));
  return bytes;
}

// Why a file is no scene file at all; empty for one that at least begins as one.
std::string OtherKindText(const std::string& path)
{
  constexpr std::string_view kMagic = "Q7R"; // behind another letter
  const std::string bytes = FirstBytes(path);
  if (bytes.empty())
    return "not a scene file: it is empty";
  if (bytes.compare(1, kMagic.size(), kMagic) == 0)
    return {};
  const std::string_view text =
      std::string_view(bytes).substr(std::min(bytes.size(), bytes.find_first_not_of(" \t\r\n")));
  for (const OtherKind& kind : kOtherKinds) {
    if (bytes.starts_with(kind.start) || text.starts_with(kind.start))
      return std::string("not a scene file but ") + kind.words;
  }
  return IsText(bytes) ? "not a scene file but a text" : "not a scene file";
}

// The system's own words if it was the one that failed, else what the file is instead of a scene, else the library's.
Failure MakeFailure(const std::string& path, const FileProblem& problem, const String& text)
{
  const std::string name = InputName(path);
  if (problem.systemError != 0)
    return {name, std::generic_category().message(problem.systemError)};
  constexpr LLong kHeader = 13; // bytes
  if (problem.code != FILEERROR_MEMORY && problem.position <= kHeader) {
    if (const std::string other = OtherKindText(path); !other.empty())
      return {name, other};
  }
  return {name, ToUtf8(text), problem.position, problem.depth > 0 ? ToUtf8(GetChunkPathText(problem)) : ""};
}

} // namespace

Failure SceneFailure(const std::string& path, const FileProblem& problem)
{
  return MakeFailure(path, problem, GetProblemText(problem));
}

Failure SceneFailure(const std::string& path, const StreamWalker& walker)
{
  return MakeFailure(path, walker.GetProblem(), walker.GetProblemText());
}

std::string ProblemText(const std::string& path, const FileProblem& problem)
{
  return SceneFailure(path, problem).what();
}

std::string ProblemText(const std::string& path, const StreamWalker& walker)
{
  return SceneFailure(path, walker).what();
}

DocumentPtr LoadScene(const std::string& path, NodeSink* sink)
{
  FileProblem problem;
  DocumentPtr document(LoadDocument(ToFilename(path), LoadObjects | LoadMaterials, &problem, sink));
  if (!document)
    throw SceneFailure(path, problem);
  return document;
}

std::uintmax_t InputSize(const std::string& path)
{
  return IsStandard(path) ? StandardInput().size() : std::filesystem::file_size(path);
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
