// q7r export: plays the host for the exporter.
#include <algorithm>
#include <cctype>
#include <cstdio>
#include <filesystem>
#include <memory>
#include <new>

#include "export_account.h"
#include "exporter/entry/message_table.h"
#include "exporter/entry/scene_writer.h"
#include "exporter/host_api/aegp_entry.h"
#include "gltf_file.h"
#include "host/standalone_host.h"
#include "output/output_file.h"
#include "output/temporary_file.h"
#include "progress_bar.h"
#include "project_input.h"
#include "verbs.h"

namespace q7r
{

namespace
{

constexpr const char* kHelp = R"(Exports a composition of an After Effects project into a scene file.

Use it to turn a project (.aep, .aepx), or what its user published as Lottie JSON, into
a scene of cameras, lights and image planes. docs/projects.md and docs/composition.md
tell what is read. At the end it tells on standard error which layers the scene has and
which were left out, and why.

Example: q7r export shot.aep shot.q7r --composition "Main")";

struct Options
{
  ProjectOptions project;
  std::string output;
  bool force = false;
};

// The exporter forces the suffix of the path that the save dialog gives. Here the path is given beforehand, so it is
// brought to that form at once: then the question about an existing file is about the file that is written. Bytes, not
// text: a name on the disk need not be UTF-8.
std::string WithSuffix(const std::string& path)
{
  constexpr std::size_t kLongest = 4; // a dot further from the end belongs to the name
  if (GltfFormOf(path) != GltfForm::kNone)
    return path;
  const std::size_t dot = path.find_last_of("./");
  if (!HasFileName(path) || IsDevice(path))
    return path;
  if (dot == std::string::npos || path[dot] != '.' || path.size() - dot > kLongest)
    return path + "." + exporter::kSceneSuffix;
  std::string suffix = path.substr(dot + 1);
  std::transform(suffix.begin(), suffix.end(), suffix.begin(), [](unsigned char c) { return std::tolower(c); });
  return suffix == exporter::kSceneSuffix ? path : path.substr(0, dot + 1) + exporter::kSceneSuffix;
}

// Plays one export into the file `partial`. True if the exporter showed no message.
bool PlayExport(host::StandaloneHost& player, const std::string& output, const std::string& partial)
{
  ProgressBar bar("reading layers");
  bool quiet = true;
  player.SetOutputPath(partial);
  player.OnAskOverwrite([] { return true; }); // the user was asked before
  player.OnReport([&](const std::string& message) {
    quiet = false;
    bar.Clear();
    std::fprintf(stderr, "%s\n", message.c_str());
  });
  player.OnProgress([&](double share) { bar.Show(share); });
  if (A_Err error = player.Start(EntryPointFunc))
    throw Failure(output + ": the exporter didn't start (error " + std::to_string(error) + ")");
  AEGP_Command command = player.FindCommand(exporter::GetMessage(exporter::Message::kMenuEntry));
  player.CallMenuHook();
  if (!command || !player.IsCommandEnabled(command))
    throw Failure(output + ": the exporter offers no export for this composition");
  const _torvane_::AllocationWatch watch;
  host::CommandResult result = player.CallCommandHook(command);
  if (watch.Failed())
    throw Failure(output + ": not enough memory");
  const _torvane_::FileProblem& problem = exporter::GetSceneFileProblem();
  if (problem.code != _torvane_::FILEERROR_NONE)
    throw Failure(ProblemText(output, problem));
  if (result.error != 0)
    throw Failure(output + ": can't be written (error " + std::to_string(result.error) + ")");
  return quiet;
}

void TellAccount(const host::Composition& composition, _torvane_::BaseDocument& document)
{
  std::fprintf(stderr, "%s\n", AccountText(composition, CountScene(document)).c_str());
}

// Goes through the scene, which is kept in a temporary file meanwhile.
int ExportAsGltf(host::StandaloneHost& player, const host::Composition& composition, const std::string& source,
                 const std::string& output)
{
  const std::unique_ptr<TemporaryFile> scene = MakePlainFile();
  const bool quiet = PlayExport(player, output, scene->Path().string());
  const DocumentPtr document = LoadScene(scene->Path().string());
  TellAccount(composition, *document);
  const int status = WriteGltf(*document, source, output, {});
  return quiet ? status : kProblems;
}

int Export(const Options& options)
{
  const std::string output = WithSuffix(options.output);
  const bool asGltf = GltfFormOf(output) != GltfForm::kNone;
  if (asGltf)
    RequireGltfOutput(output, options.project.file, options.force);
  else
    RequireWritable(output, options.force);
  host::Project project = ReadProject(options.project);
  const host::Composition& chosen = *project.root; // stays where it is when the project moves
  const bool isWarned = !project.warnings.empty();
  host::StandaloneHost player(std::move(project));
  if (asGltf) {
    const int status = ExportAsGltf(player, chosen, options.project.file, output);
    return isWarned ? kProblems : status;
  }
  bool quiet = true;
  WriteOutput(output, [&](const std::string& partial) {
    quiet = PlayExport(player, output, partial);
    const DocumentPtr document = ReadBack(partial, output);
    TellAccount(chosen, *document);
    return std::string();
  });
  return quiet && !isWarned ? kDone : kProblems;
}

} // namespace

void AddExport(CLI::App& program, int& status)
{
  auto options = std::make_shared<Options>();
  CLI::App* verb = program.add_subcommand("export", kHelp);
  verb->add_option("PROJECT", options->project.file, "an After Effects project (.aep, .aepx) or a composition file")
      ->required();
  verb->add_option("OUTPUT", options->output,
                   "the scene file to write; its suffix becomes .q7r (.glb, .gltf: as convert; .html: as view)")
      ->required();
  AddProjectOptions(*verb, options->project);
  verb->add_flag("--force", options->force, "replace an existing file without asking");
  verb->callback([options, &status] { status = Export(*options); });
}

} // namespace q7r
