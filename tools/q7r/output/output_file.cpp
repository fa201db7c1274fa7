#include "output_file.h"

#include <algorithm>
#include <cerrno>
#include <cstdio>
#include <iostream>
#include <memory>
#include <system_error>

#include "json_output.h"
#include "report.h"
#include "standard_input.h"
#include "standard_output.h"
#include "temporary_file.h"
#include "terminal.h"

namespace q7r
{

using namespace _torvane_;

namespace
{

namespace fs = std::filesystem;

constexpr int kMaxLinks = 40; // as the system follows

std::string OutputName(const std::string& path) { return IsStandard(path) ? "standard output" : InputName(path); }

[[noreturn]] void Fail(const std::string& path, const std::error_code& error)
{
  throw Failure(OutputName(path), error.message());
}

// Where an output belongs.
struct Place
{
  fs::path file; // no link, unless it is a device
  fs::file_status status;
  int descriptor = -1; // of an output that is open already

  bool Exists() const { return fs::exists(status); }
  // Something that is written to, and not replaced.
  bool IsDevice() const { return descriptor >= 0 || (Exists() && !fs::is_regular_file(status)); }
  fs::path Folder() const { return file.has_parent_path() ? file.parent_path() : fs::path("."); }
};

// The status of what a path leads to; throws unless it is there or certainly isn't.
fs::file_status StatusOf(const std::string& path, const fs::path& file, bool followLinks)
{
  std::error_code error;
  const fs::file_status status = followLinks ? fs::status(file, error) : fs::symlink_status(file, error);
  if (status.type() == fs::file_type::none)
    Fail(path, error);
  return status;
}

// Follows the links by hand: the last one may lead to a file that doesn't exist yet.
fs::path FollowLinks(const std::string& path)
{
  fs::path file(path);
  for (int links = 0; fs::is_symlink(StatusOf(path, file, false)); ++links) {
    std::error_code error;
    const fs::path target = fs::read_symlink(file, error);
    if (error || links == kMaxLinks)
      Fail(path, error ? error : std::make_error_code(std::errc::too_many_symbolic_link_levels));
    file = file.parent_path() / target;
  }
  return file;
}

Place FindPlace(const std::string& path)
{
  Place place;
  place.descriptor = DescriptorOf(path);
  if (place.descriptor >= 0)
    return place;
  place.file = path;
  place.status = StatusOf(path, path, true);
  if (place.IsDevice())
    return place;
  place.file = FollowLinks(path);
  return place;
}

// A path that the library's every way of reading a path takes as it stands.
bool IsPlain(const fs::path& path)
{
  const auto& text = path.native();
  return std::all_of(text.begin(), text.end(), [](auto c) { return c >= 0x20 && c < 0x7F; });
}

void Copy(const fs::path& source, RawOutput& output)
{
  const std::unique_ptr<std::FILE, int (*)(std::FILE*)> file(std::fopen(source.string().c_str(), "rb"), std::fclose);
  std::string block(1 << 16, '\0');
  for (bool more = file != nullptr; more;) {
    const std::size_t count = std::fread(block.data(), 1, block.size(), file.get());
    more = count == block.size();
    output.Write(block.data(), count);
  }
  if (!file || std::ferror(file.get()))
    throw std::system_error(errno, std::generic_category());
  output.Close();
}

void TellWritten(ValueSink& json, const std::string& path, std::uintmax_t size, const std::string& words)
{
  json.Key("written");
  json.BeginObject(ValueSink::Layout::kLine);
  json.Member("file", path);
  json.Member("size", size);
  if (!words.empty())
    json.Member("summary", words);
  json.EndObject();
}

// "shot.q7r: 640 x 480 pixels, 12.3 KB".
void TellWritten(const std::string& path, const fs::path& partial, const std::string& words)
{
  if (TheTalk().quiet)
    return;
  const std::uintmax_t size = fs::file_size(partial);
  if (TheTalk().json)
    PrintJson([&](ValueSink& json) { TellWritten(json, path, size, words); });
  else
    PrintLine(path + ": " + (words.empty() ? "" : words + ", ") + SizeText(size));
  FlushStandardOutput();
}

void WriteDevice(const Place& place, const std::string& path, const FileWriter& write)
{
  const std::unique_ptr<TemporaryFile> partial = MakePlainFile();
  const std::string words = write(partial->Path().string());
  const bool isTaken = place.descriptor >= 0 || IsStandardOutput(place.file);
  const auto output =
      place.descriptor >= 0 ? std::make_unique<RawOutput>(place.descriptor) : std::make_unique<RawOutput>(place.file);
  Copy(partial->Path(), *output);
  if (!isTaken)
    TellWritten(path, partial->Path(), words);
}

// A file that is written, checked and on the disk beside its place.
class StagedFile
{
 public:
  StagedFile(const Place& place, const FileWriter& write)
      : place_(place), file_(fs::absolute(place.Folder()), place.Exists())
  {
    std::optional<unsigned> mode;
    if (place.Exists())
      mode = static_cast<unsigned>(place.status.permissions()) & 0777U;
    if (IsPlain(file_.Path())) {
      words_ = write(file_.Path().string());
    } else {
      const std::unique_ptr<TemporaryFile> partial = MakePlainFile();
      words_ = write(partial->Path().string());
      RawOutput output(file_.Path());
      Copy(partial->Path(), output);
    }
    file_.Finish(mode);
  }

  void Tell(const std::string& path) const { TellWritten(path, file_.Path(), words_); }
  void Move() { file_.MoveTo(place_.file); }

  // Gives what it will replace a second name, to put it back by. Not every file system can.
  void KeepOld()
  {
    if (!place_.Exists())
      return;
    old_ = std::make_unique<TemporaryFile>(fs::absolute(place_.Folder()), true);
    std::error_code error;
    fs::remove(old_->Path(), error);
    fs::create_hard_link(place_.file, old_->Path(), error);
    if (error)
      old_.reset();
  }

  void PutBack()
  {
    std::error_code error;
    if (old_)
      fs::rename(old_->Path(), place_.file, error);
    else if (!place_.Exists())
      fs::remove(place_.file, error);
  }

 private:
  Place place_;
  TemporaryFile file_;
  std::unique_ptr<TemporaryFile> old_;
  std::string words_;
};

// What the system answers is told of the file.
template <class Action>
void DoFor(const std::string& path, Action&& action)
{
  try {
    action();
  } catch (const std::system_error& error) {
    Fail(path, error.code());
  }
}

// Moves each to its place, the last one first.
void MoveAll(const std::vector<Output>& outputs, std::vector<std::unique_ptr<StagedFile>>& files)
{
  for (std::size_t i = files.size(); i-- > 0;) {
    if (!files[i])
      continue;
    try {
      DoFor(outputs[i].path, [&] {
        if (i > 0)
          files[i]->KeepOld();
        files[i]->Move();
      });
    } catch (const Failure&) {
      for (std::size_t moved = i + 1; moved < files.size(); ++moved) {
        if (files[moved])
          files[moved]->PutBack();
      }
      throw;
    }
  }
}

bool AskReplace(const std::string& path)
{
  if (!IsTerminal(StandardStream::kInput) || !IsTerminal(StandardStream::kError))
    return false;
  std::cerr << path << " exists already. Replace it? [y/N] " << std::flush;
  std::string answer;
  return std::getline(std::cin, answer) && (answer == "y" || answer == "Y" || answer == "yes");
}

} // namespace

std::unique_ptr<TemporaryFile> MakePlainFile()
{
  std::error_code problem = std::make_error_code(std::errc::no_such_file_or_directory);
  for (const fs::path& folder : TemporaryFolders()) {
    if (folder.empty() || !IsPlain(folder))
      continue;
    try {
      return std::make_unique<TemporaryFile>(folder, true);
    } catch (const std::system_error& error) {
      problem = error.code();
    }
  }
  throw std::system_error(problem);
}

bool HasFileName(const std::string& path)
{
  const fs::path name = fs::path(path).filename();
  return !name.empty() && name != "." && name != "..";
}

bool IsDevice(const std::string& path)
{
  std::error_code error;
  const fs::file_status status = fs::status(path, error);
  return DescriptorOf(path) >= 0 || (fs::exists(status) && !fs::is_regular_file(status) && !fs::is_directory(status));
}

fs::path FolderOfOutput(const std::string& path)
{
  return IsDevice(path) ? fs::current_path() : fs::absolute(path).parent_path();
}

void RequireWritable(const std::string& path, bool force)
{
  if (!HasFileName(path))
    throw Failure(OutputName(path), "is no file name");
  const Place place = FindPlace(path);
  if (fs::is_directory(place.status))
    throw Failure(path, "is a folder");
  if (place.IsDevice())
    return;
  if (!place.Exists() && !fs::is_directory(StatusOf(path, place.Folder(), true)))
    throw Failure(path, "there is no folder " + place.Folder().string());
  if (place.Exists() && !force && !AskReplace(path))
    throw Failure(path, "exists already; --force replaces it");
}

void WriteOutput(const std::string& path, const FileWriter& write) { WriteOutputs({{path, write}}); }

void WriteOutputs(const std::vector<Output>& outputs)
{
  std::vector<std::unique_ptr<StagedFile>> files(outputs.size());
  for (std::size_t i = 0; i < outputs.size(); ++i) {
    const Output& output = outputs[i];
    DoFor(output.path, [&] {
      const Place place = FindPlace(output.path);
      if (place.IsDevice())
        WriteDevice(place, output.path, output.write);
      else
        files[i] = std::make_unique<StagedFile>(place, output.write);
    });
  }
  // Said before they are moved, so that a full standard output is found while the old files are still there.
  for (std::size_t i = 0; i < outputs.size(); ++i) {
    if (files[i])
      DoFor(outputs[i].path, [&] { files[i]->Tell(outputs[i].path); });
  }
  DoUndisturbed([&] { MoveAll(outputs, files); });
}

void WriteOutput(const std::string& path, std::string_view bytes, const std::string& words)
{
  WriteOutput(path, [&](const std::string& partial) {
    RawOutput output{fs::path(partial)};
    output.Write(bytes.data(), bytes.size());
    output.Close();
    return words;
  });
}

SceneCounts ReadBack(const std::string& partial, const std::string& path)
{
  try {
    SceneCounts counts;
    CountFile(partial, counts);
    return counts;
  } catch (const Failure& failure) {
    throw Failure(path, failure.Message() + " (what was written can't be read back)", failure.Offset(), failure.Path());
  }
}

void WriteScene(BaseDocument& document, const std::string& path)
{
  WriteOutput(path, [&](const std::string& partial) {
    FileProblem problem;
    if (!SaveDocument(&document, ToFilename(partial), 0, &problem) || problem.code != FILEERROR_NONE)
      throw Failure(ProblemText(path, problem));
    ReadBack(partial, path);
    return std::string();
  });
}

} // namespace q7r
