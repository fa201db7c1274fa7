// q7r resave and q7r merge: load scene files and write the result.
#include <memory>
#include <vector>

#include "output/output_file.h"
#include "reproducible.h"
#include "usage.h"
#include "verbs.h"
#include "work_list.h"

namespace q7r
{

using namespace _torvane_;

namespace
{

constexpr const char* kResaveHelp =
    R"(Loads a scene file and writes it back in the current version. What the library doesn't
know (objects, tags, values of other programs) is written back byte for byte.

Use it to bring files of old versions up to date.

Examples: q7r resave old.q7r new.q7r
          q7r resave old/*.q7r -o new)";

constexpr const char* kMergeHelp =
    R"(Adds the materials, objects, render settings and layers of other scene files to one
and writes the result.

Example: q7r merge shot.q7r set.q7r props.q7r -o all.q7r)";

struct ResaveOptions : WorkOptions
{
  bool reproducible = false;
};

struct MergeOptions
{
  bool reproducible = false;
  std::string input;
  std::vector<std::string> others;
  std::string output;
  bool force = false;
};

int ResaveOne(const Work& work, bool reproducible)
{
  Reproduction reproduction(reproducible);
  if (reproducible)
    reproduction.Take(ReadInput(work.input));
  reproduction.Begin();
  const DocumentPtr document = LoadScene(work.input);
  reproduction.TakeDate(*document);
  WriteScene(*document, work.output);
  return kDone;
}

int Resave(const ResaveOptions& options)
{
  return DoWork(
      PlanWork(options, nullptr), options.jobs, [&](const Work& work) { RequireWritable(work.output, options.force); },
      [&](const Work& work) { return ResaveOne(work, options.reproducible); });
}

int Merge(const MergeOptions& options)
{
  RequireWritable(options.output, options.force);
  Reproduction reproduction(options.reproducible);
  if (options.reproducible) {
    reproduction.Take(ReadInput(options.input));
    for (const std::string& other : options.others)
      reproduction.Take(ReadInput(other));
  }
  reproduction.Begin();
  const DocumentPtr document = LoadScene(options.input);
  reproduction.TakeDate(*document);
  for (const std::string& other : options.others) {
    FileProblem problem;
    if (!MergeDocument(document.get(), ToFilename(other), LoadObjects | LoadMaterials, &problem))
      throw SceneFailure(other, problem);
  }
  WriteScene(*document, options.output);
  return kDone;
}

} // namespace

void AddResave(CLI::App& program, int& status)
{
  auto options = std::make_shared<ResaveOptions>();
  CLI::App* verb = program.add_subcommand("resave", kResaveHelp);
  AddWorkOptions(*verb, *options, "SCENE",
                 "the scene file to read, then the one to write. With -o, as many scene files as you like");
  AddReproducibleOption(*verb, options->reproducible);
  AddTalkOptions(*verb);
  verb->callback([options, &status] { status = Resave(*options); });
}

void AddMerge(CLI::App& program, int& status)
{
  auto options = std::make_shared<MergeOptions>();
  CLI::App* verb = program.add_subcommand("merge", kMergeHelp);
  verb->add_option("INTO", options->input, "the scene file to begin with")->required();
  verb->add_option("FILE", options->others, "scene files to add")->required();
  verb->add_option("-o,--output", options->output, "the scene file to write")->required();
  verb->add_flag("--force", options->force, "replace an existing file without asking");
  AddReproducibleOption(*verb, options->reproducible);
  AddTalkOptions(*verb);
  verb->callback([options, &status] { status = Merge(*options); });
}

} // namespace q7r
