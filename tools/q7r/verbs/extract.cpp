// q7r extract: one composition of a project as a composition file.
#include <memory>

#include "host/text.h"
#include "host/writer/composition_writer.h"
#include "output/output_file.h"
#include "project_input.h"
#include "verbs/verbs.h"

namespace q7r
{

namespace
{

constexpr const char* kHelp = R"(Writes one composition of a project, and what it nests, as a composition file.

Use it to look at what a project holds, to change it by hand or by a program, or to
hand on a shot without the project. The file exports to the same scene. Keyframes stay
keyframes; what their easing can't say is added as one sample for each frame.

Example: q7r extract shot.aep --composition "Main" -o main.json)";

struct Options
{
  ProjectOptions project;
  std::string output;
  bool force = false;
};

int Extract(const Options& options)
{
  RequireWritable(options.output, options.force);
  const host::Project project = ReadProject(options.project);
  const host::CompositionText composition = host::WriteComposition(project);
  for (const std::string& warning : composition.warnings)
    TellWarning(options.output + ": " + warning);
  WriteOutput(options.output, composition.text);
  return project.warnings.empty() && composition.warnings.empty() ? kDone : kProblems;
}

} // namespace

void AddExtract(CLI::App& program, int& status)
{
  auto options = std::make_shared<Options>();
  CLI::App* verb = program.add_subcommand("extract", kHelp);
  verb->add_option("PROJECT", options->project.file, "an After Effects project (.aep, .aepx) or a composition file")
      ->required();
  verb->add_option("-o,--output", options->output, "the composition file to write")->required();
  AddProjectOptions(*verb, options->project);
  verb->add_flag("--force", options->force, "replace an existing file without asking");
  verb->callback([options, &status] { status = Extract(*options); });
}

} // namespace q7r
