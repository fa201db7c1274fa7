// Verbs that make a file of each of many: which goes where, several at a time.
#pragma once

#include <CLI/CLI.hpp>
#include <functional>
#include <string>
#include <vector>

namespace q7r
{

struct WorkOptions
{
  std::vector<std::string> files; // without `output` the last one is it
  std::string output;             // of a single file, or the folder for all
  unsigned jobs = 0;              // at a time; 0: as many as there are cores
  bool force = false;
};

// A file to read and the one to write.
struct Work
{
  std::string input;
  std::string output;
};

// Adds the files under the name `name`, --output, --jobs and --force.
void AddWorkOptions(CLI::App& verb, WorkOptions& options, const std::string& name, const std::string& what);

// IN OUT, several with -o FOLDER, or one with -o FILE; a new name without a suffix is a folder. In a folder a file
// keeps its name, with `suffix` (".q7r") in the place of its own unless that is null; the folder is made. Throws
// Failure.
std::vector<Work> PlanWork(const WorkOptions& options, const char* suffix);

// Does all of the work, several pieces at a time on threads of their own, with a line of progress on a terminal, and
// gives the worst status. What fails is told and left out. `prepare` is called before, for one after the other, since
// it may ask the user. A single piece is done on this thread, and throws.
int DoWork(const std::vector<Work>& all, unsigned jobs, const std::function<void(const Work&)>& prepare,
           const std::function<int(const Work&)>& work);

} // namespace q7r
