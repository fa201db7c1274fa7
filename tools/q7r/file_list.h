// Verbs that look into several files: one after the other, and on behind one that is bad.
#pragma once

#include <CLI/CLI.hpp>
#include <functional>
#include <string>
#include <vector>

namespace q7r
{

struct FileList
{
  std::vector<std::string> files;
  bool json = false;
  bool headed = true; // the text of each of several files has the file above it
};

// Adds FILE, which may stand several times, "-" for standard input, and --json.
void AddFileList(CLI::App& verb, FileList& list, const std::string& what, const std::string& json);

// Lets `show` print each file and gives the worst status. Of several files each document of JSON
// follows the one before, in the order of the files. A file that fails is told of and left out.
int ShowEach(const FileList& list, const std::function<int(const std::string& file)>& show);

} // namespace q7r
