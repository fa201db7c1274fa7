// q7r check: walks and loads a scene file and says what is wrong and where.
#include <cstdio>
#include <memory>

#include "file_list.h"
#include "listing/json_text.h"
#include "output/standard_output.h"
#include "scene_file.h"
#include "standard_input.h"
#include "torvane/stream/stream_walker.h"
#include "verbs.h"

namespace q7r
{

using namespace _torvane_;

namespace
{

constexpr const char* kHelp = R"(Walks every value of a scene file and loads it, and tells what is wrong and where.
Prints one line for each problem; exit status 1 when there is one, 2 when the file is
no scene file or can't be read at all.

Example: q7r check shot.q7r)";

struct Options : FileList
{};

// Walks the values; the message of the first fault, or nothing.
std::string WalkProblem(const std::string& file, long long& values)
{
  StreamWalker walker;
  if (!walker.Open(ToFilename(file)))
    throw SceneFailure(file, walker);
  StreamValue value;
  while (walker.Next(value)) {
    if (value.tag != kTagChunkStart && value.tag != kTagChunkEnd && walker.GetDepth() == 0)
      return InputName(file) + ": byte " + std::to_string(value.offset) + ": a value outside all chunks";
    ++values;
  }
  if (walker.GetProblem().systemError != 0) // nothing that the file could be blamed for
    throw SceneFailure(file, walker);
  return walker.GetProblem().code == FILEERROR_NONE ? "" : ProblemText(file, walker);
}

int Check(const std::string& file, const Options& options)
{
  std::vector<std::string> problems;
  long long values = 0;
  std::string walk = WalkProblem(file, values);
  if (!walk.empty())
    problems.push_back(walk);
  FileProblem problem;
  DocumentPtr document(LoadDocument(ToFilename(file), LoadObjects | LoadMaterials, &problem));
  if (problem.systemError != 0)
    throw SceneFailure(file, problem);
  if (!document)
    problems.push_back(ProblemText(file, problem) + " (the scene can't be loaded)");
  if (options.json) {
    PrintLine(Json{{"values", values}, {"problems", problems}}.dump(1, ' ', false, Json::error_handler_t::replace));
  } else {
    for (const std::string& line : problems)
      PrintLine(line);
    if (problems.empty())
      PrintFormatted("%s: good, %lld values\n", InputName(file).c_str(), values);
  }
  return problems.empty() ? kDone : kProblems;
}

} // namespace

void AddCheck(CLI::App& program, int& status)
{
  auto options = std::make_shared<Options>();
  options->headed = false; // each line begins with its file
  CLI::App* verb = program.add_subcommand("check", kHelp);
  AddFileList(*verb, *options, "a scene file", "as one JSON object");
  verb->callback([options, &status] {
    status = ShowEach(*options, [&](const std::string& file) { return Check(file, *options); });
  });
}

} // namespace q7r
