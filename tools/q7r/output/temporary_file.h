// A file that is being written and isn't yet where it belongs. What differs between systems stands in the two sources
// of this header.
#pragma once

#include <cstdint>
#include <filesystem>
#include <functional>
#include <optional>
#include <string>
#include <vector>

namespace q7r
{

// A new, empty file under a name that nobody else has. It is removed with this object, and when the program is ended
// by a signal (or, on Windows, from the keyboard), unless it was moved to its place.
class TemporaryFile
{
 public:
  // Makes the file in a folder that exists. One that takes the place of another is its owner's alone until it is
  // moved. Throws std::system_error.
  TemporaryFile(const std::filesystem::path& folder, bool isPrivate);
  ~TemporaryFile();
  TemporaryFile(const TemporaryFile&) = delete;
  TemporaryFile& operator=(const TemporaryFile&) = delete;

  const std::filesystem::path& Path() const { return path_; }

  // Brings what was written to the disk and gives the file the rights `mode`, if there are any to keep. Throws
  // std::system_error.
  void Finish(std::optional<unsigned> mode) const;
  // Puts the file in the place of `target`, in the same folder. Throws std::system_error; then nothing has changed.
  void MoveTo(const std::filesystem::path& target);

 private:
  void Create(bool isPrivate);

  std::filesystem::path path_;
  std::string guarded_; // the path as the one who cleans up after a signal takes it
  int slot_ = -1;       // where he finds it
};

// Does something that no signal (on Windows: but for those of the keyboard) may end in the middle.
void DoUndisturbed(const std::function<void()>& action);

// A file that is open for writing from its start, without a buffer. Throws std::system_error.
class RawOutput
{
 public:
  explicit RawOutput(const std::filesystem::path& existing);
  explicit RawOutput(int descriptor); // writes behind what was written there; the descriptor stays open
  ~RawOutput();
  RawOutput(const RawOutput&) = delete;
  RawOutput& operator=(const RawOutput&) = delete;

  void Write(const char* bytes, std::size_t count);
  void Close();

 private:
  int descriptor_;
};

// The number of the open file that a path like "-", "/dev/stdout" or "/dev/fd/3" stands for; -1 for all others.
int DescriptorOf(const std::string& path);

// Both are open on one and the same file.
bool IsStandardOutput(const std::filesystem::path& path);

// Folders for temporary files, the one that the user has set first.
std::vector<std::filesystem::path> TemporaryFolders();

// Makes a folder in one of them that nobody else can look into; it stays. Throws std::system_error.
std::filesystem::path MakePrivateFolder();

// To be called once, first of all: a standard stream that is closed doesn't become the next file that is opened, and a
// file that grows too long is an error like others.
void PrepareProcess();

} // namespace q7r
