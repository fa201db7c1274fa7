// q7r resave and q7r merge: load scene files and write the result.
#include <memory>
#include <vector>

#include "output/output_file.h"
#include "verbs.h"

namespace q7r
{

using namespace _torvane_;

namespace
{

constexpr const char* kResaveHelp =
    R"(Loads a scene file and writes it back in the current version. What the library doesn't
know (objects, tags, values of other programs) is written back byte for byte.

Use it to bring files of old versions up to date.

Example: q7r resave old.q7r new.q7r)";

constexpr const char* kMergeHelp =
    R"(Adds the materials, objects, render settings and layers of other scene files to one
and writes the result.

Example: q7r merge shot.q7r set.q7r props.q7r -o all.q7r)";

struct Options
{
  std::string input;
  std::vector<std::string> others;
  std::string output;
  bool force = false;
};

int Resave(const Options& options)
{
  RequireWritable(options.output, options.force);
  DocumentPtr document = LoadScene(options.input);
  WriteScene(*document, options.output);
  return kDone;
}

int Merge(const Options& options)
{
  RequireWritable(options.output, options.force);
  DocumentPtr document = LoadScene(options.input);
  for (const std::string& other : options.others) {
    FileProblem problem;
    if (!MergeDocument(document.get(), ToFilename(other), LoadObjects | LoadMaterials, &problem))
      throw Failure(ProblemText(other, problem));
  }
  WriteScene(*document, options.output);
  return kDone;
}

} // namespace

void AddResave(CLI::App& program, int& status)
{
  auto options = std::make_shared<Options>();
  CLI::App* verb = program.add_subcommand("resave", kResaveHelp);
  verb->add_option("IN", options->input, "the scene file to read")->required();
  verb->add_option("OUT", options->output, "the scene file to write")->required();
  verb->add_flag("--force", options->force, "replace an existing file without asking");
  verb->callback([options, &status] { status = Resave(*options); });
}

void AddMerge(CLI::App& program, int& status)
{
  auto options = std::make_shared<Options>();
  CLI::App* verb = program.add_subcommand("merge", kMergeHelp);
  verb->add_option("INTO", options->input, "the scene file to begin with")->required();
  verb->add_option("FILE", options->others, "scene files to add")->required();
  verb->add_option("-o,--output", options->output, "the scene file to write")->required();
  verb->add_flag("--force", options->force, "replace an existing file without asking");
  verb->callback([options, &status] { status = Merge(*options); });
}

} // namespace q7r
