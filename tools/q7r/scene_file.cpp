#include "scene_file.h"

#include <cstdio>
#include <filesystem>
#include <iostream>

#ifdef _WIN32
#include <io.h>
#else
#include <unistd.h>
#endif

#include "torvane/stream/hyper_file.h"
#include "verbs/verbs.h"

namespace q7r
{

using namespace _torvane_;

namespace
{

void AppendUtf8(std::string& out, char32_t code)
{
  if (code < 0x80) {
    out += static_cast<char>(code);
  } else if (code < 0x800) {
    out += static_cast<char>(0xC0 | (code >> 6));
    out += static_cast<char>(0x80 | (code & 63));
  } else if (code < 0x10000) {
    out += static_cast<char>(0xE0 | (code >> 12));
    out += static_cast<char>(0x80 | ((code >> 6) & 63));
    out += static_cast<char>(0x80 | (code & 63));
  } else {
    out += static_cast<char>(0xF0 | (code >> 18));
    out += static_cast<char>(0x80 | ((code >> 12) & 63));
    out += static_cast<char>(0x80 | ((code >> 6) & 63));
    out += static_cast<char>(0x80 | (code & 63));
  }
}

bool IsTerminal()
{
#ifdef _WIN32
  return _isatty(0) != 0;
#else
  return isatty(0) != 0 && isatty(2) != 0;
#endif
}

} // namespace

Filename ToFilename(const std::string& path)
{
  // UTF-8 to UTF-16 by code points: the library's own decoder knows characters of the basic plane alone. The path is
  // made absolute because one that begins with "?" could stand for a connection or a stream.
  std::u16string wide = std::filesystem::absolute(std::filesystem::path(path)).u16string();
  Filename name;
  name.SetString(String(reinterpret_cast<const UniChar*>(wide.data()), static_cast<Long>(wide.size())));
  return name;
}

std::string ToUtf8(const String& text)
{
  std::string out;
  for (Long i = 0; i < text.GetLength(); ++i) {
    char32_t code = text[i];
    if (code >= 0xD800 && code < 0xDC00 && text[i + 1] >= 0xDC00 && text[i + 1] < 0xE000)
      code = 0x10000 + ((code - 0xD800) << 10) + (text[++i] - 0xDC00U);
    else if (code >= 0xD800 && code < 0xE000)
      code = 0xFFFD;
    AppendUtf8(out, code);
  }
  return out;
}

std::string ProblemText(const std::string& path, const FileProblem& problem)
{
  std::string text = path + ": ";
  if (problem.code != FILEERROR_OPEN)
    text += "byte " + std::to_string(problem.position) + ": ";
  return text + GetFileErrorText(problem.code);
}

DocumentPtr LoadScene(const std::string& path)
{
  FileProblem problem;
  DocumentPtr document(LoadDocument(ToFilename(path), LoadObjects | LoadMaterials, &problem));
  if (!document)
    throw Failure(ProblemText(path, problem));
  return document;
}

void WriteWhole(const std::string& path, const std::function<void(const std::string& partial)>& write)
{
  std::string partial = path + ".part";
  std::error_code error;
  try {
    write(partial);
  } catch (const Failure&) {
    std::filesystem::remove(partial, error);
    throw;
  }
  std::filesystem::rename(partial, path, error);
  if (error) {
    std::string reason = error.message();
    std::filesystem::remove(partial, error);
    throw Failure(path + ": " + reason);
  }
}

void WriteScene(BaseDocument& document, const std::string& path)
{
  WriteWhole(path, [&](const std::string& partial) {
    FileProblem problem;
    if (!SaveDocument(&document, ToFilename(partial), 0, &problem) || problem.code != FILEERROR_NONE)
      throw Failure(ProblemText(path, problem));
  });
  std::printf("%s: %s\n", path.c_str(), SizeText(std::filesystem::file_size(path)).c_str());
}

void VerifyScene(const std::string& path)
{
  HyperFile file;
  Bool good = file.Open(kSceneIdent, ToFilename(path), kHyperFileRead);
  LLong depth = 0;
  while (good && file.GetPosition() < file.GetLength()) {
    UChar tag = 0;
    good = file.ReadValueHeader(tag) && file.SkipValue(tag);
    depth += tag == kTagChunkStart ? 1 : tag == kTagChunkEnd ? -1 : 0;
  }
  if (!good)
    throw Failure(ProblemText(path, file.GetProblem()));
  if (depth != 0)
    throw Failure(path + ": byte " + std::to_string(file.GetPosition()) + ": the file ends inside a chunk");
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

bool AskReplace(const std::string& path)
{
  if (!IsTerminal())
    return false;
  std::cerr << path << " exists already. Replace it? [y/N] " << std::flush;
  std::string answer;
  return std::getline(std::cin, answer) && (answer == "y" || answer == "Y" || answer == "yes");
}

void RequireReplaceable(const std::string& path, bool force)
{
  if (!force && std::filesystem::exists(path) && !AskReplace(path))
    throw Failure(path + ": exists already; --force replaces it");
}

} // namespace q7r
