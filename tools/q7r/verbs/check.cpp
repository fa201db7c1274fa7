// q7r check: walks and loads a scene file and says what is wrong and where.
#include <filesystem>
#include <memory>
#include <vector>

#include "checks/scene_checks.h"
#include "file_list.h"
#include "output/json_output.h"
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
Of a scene that can be read it also tells what is odd, as warnings: missing pictures, no
objects, links to nothing, parameters out of their range, names that a list of objects
or layers has more than once. Prints a line for each; exit status 1 when there is one, 2 when the file is no scene
file or can't be read at all.

Example: q7r check shot.q7r)";

struct Options : FileList
{};

// Walks the values; the message of the first fault, or nothing.
std::string WalkProblem(const std::string& file, long long& values, LinkCheck& links)
{
  StreamWalker walker;
  if (!walker.Open(ToFilename(file)))
    throw SceneFailure(file, walker);
  StreamValue value;
  while (walker.Next(value)) {
    if (value.tag != kTagChunkStart && value.tag != kTagChunkEnd && walker.GetDepth() == 0)
      return InputName(file) + ": byte " + std::to_string(value.offset) + ": a value outside all chunks";
    ++values;
    links.See(value);
  }
  if (walker.GetProblem().systemError != 0) // nothing that the file could be blamed for
    throw SceneFailure(file, walker);
  return walker.GetProblem().code == FILEERROR_NONE ? "" : ProblemText(file, walker);
}

struct Findings
{
  long long values = 0;
  std::vector<std::string> problems;
  std::vector<SceneWarning> warnings;

  bool AreNone() const { return problems.empty() && warnings.empty(); }
};

Findings Look(const std::string& file)
{
  Findings findings;
  LinkCheck links;
  const std::string walk = WalkProblem(file, findings.values, links);
  if (!walk.empty())
    findings.problems.push_back(walk);
  FileProblem problem;
  const DocumentPtr document(LoadDocument(ToFilename(file), LoadObjects | LoadMaterials, &problem));
  if (problem.systemError != 0)
    throw SceneFailure(file, problem);
  if (!document)
    findings.problems.push_back(ProblemText(file, problem) + " (the scene can't be loaded)");
  if (findings.problems.empty()) {
    links.AddWarnings(findings.warnings);
    AddSceneWarnings(*document, std::filesystem::absolute(file).parent_path(), findings.warnings);
  }
  return findings;
}

void PrintFindings(const std::string& file, const Findings& findings)
{
  const std::string name = InputName(file);
  for (const std::string& line : findings.problems)
    PrintLine(line);
  if (TheTalk().quiet)
    return;
  for (const SceneWarning& warning : findings.warnings)
    PrintLine(name + ": warning: " + (warning.path.empty() ? "" : warning.path + ": ") + warning.message);
  if (findings.AreNone())
    PrintFormatted("%s: good, %lld values\n", name.c_str(), findings.values);
}

void TellFindings(ValueSink& json, const Findings& findings)
{
  json.Member("values", findings.values);
  json.Key("problems");
  json.BeginArray();
  for (const std::string& line : findings.problems)
    json.Text(line);
  json.EndArray();
  json.Key("warnings");
  json.BeginArray();
  for (const SceneWarning& warning : findings.warnings) {
    json.BeginObject(ValueSink::Layout::kLine);
    json.Member("kind", warning.kind);
    json.Member("path", warning.path);
    json.Member("message", warning.message);
    json.EndObject();
  }
  json.EndArray();
}

int Check(const std::string& file, const Options& options)
{
  const Findings findings = Look(file);
  if (options.json)
    PrintJson([&](ValueSink& json) { TellFindings(json, findings); });
  else
    PrintFindings(file, findings);
  return findings.AreNone() ? kDone : kProblems;
}

} // namespace

void AddCheck(CLI::App& program, int& status)
{
  auto options = std::make_shared<Options>();
  options->headed = false; // each line begins with its file
  CLI::App* verb = program.add_subcommand("check", kHelp);
  AddFileList(*verb, *options, "a scene file", "as one JSON object (docs/json.md)");
  verb->add_flag("--quiet", TheTalk().quiet, "print what is wrong alone, no warnings and nothing for a good file");
  verb->callback([options, &status] {
    status = ShowEach(*options, [&](const std::string& file) { return Check(file, *options); });
  });
}

} // namespace q7r
