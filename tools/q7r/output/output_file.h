// How every verb writes a file: beside its place under a name of its own, checked, and then moved there, so that a
// failure of any kind leaves what was there before. Everything here throws Failure, with the system's own words for
// the cause.
#pragma once

#include <filesystem>
#include <functional>
#include <memory>
#include <string>
#include <string_view>
#include <vector>

#include "listing/scene_counts.h"

namespace q7r
{

class TemporaryFile;

// False for "", ".", ".." and what ends with a separator.
bool HasFileName(const std::string& path);

// Something that exists and is written to, never replaced: a device, a pipe, standard output.
bool IsDevice(const std::string& path);

// The folder that an output will lie in. Where what goes into a device ends isn't known: then the folder of the shell.
std::filesystem::path FolderOfOutput(const std::string& path);

// Refuses a path that no file can be written to: a folder, one without a file name or in a folder that isn't there,
// and an existing file unless `force` is set; on a terminal the user is asked. To be called before the work begins.
void RequireWritable(const std::string& path, bool force);

// Fills the file `partial`, whose path is plain ASCII, checks what it wrote, and gives words about it for the user, or
// none. Throws Failure.
using FileWriter = std::function<std::string(const std::string& partial)>;

// Lets `write` make the file and puts it in its place. A link stays a link, and a file that is replaced hands on its
// rights. A device or pipe is written to. What was written is told in one line: "shot.q7r: 640 x 480 pixels, 12.3 KB".
void WriteOutput(const std::string& path, const FileWriter& write);

struct Output
{
  std::string path;
  FileWriter write;
};

// The same for files that belong together: none takes its place before all are written. When one can't take it, the
// others give theirs back.
void WriteOutputs(const std::vector<Output>& outputs);

// The same for bytes that are in memory.
void WriteOutput(const std::string& path, std::string_view bytes, const std::string& words = {});

// A temporary file for a scene that goes on into another file: its path is plain ASCII. Throws std::system_error.
std::unique_ptr<TemporaryFile> MakePlainFile();

// Reads a written scene back, node by node, and counts what it holds; `path` is the name that the user knows it by.
SceneCounts ReadBack(const std::string& partial, const std::string& path);

// Saves a document so.
void WriteScene(_torvane_::BaseDocument& document, const std::string& path);

} // namespace q7r
