// q7r export: plays the host for the exporter.
#include <algorithm>
#include <cctype>
#include <filesystem>
#include <memory>
#include <new>

#include "export_account.h"
#include "exporter/entry/message_table.h"
#include "exporter/entry/scene_writer.h"
#include "exporter/host_api/aegp_entry.h"
#include "footage.h"
#include "gltf_file.h"
#include "host/standalone_host.h"
#include "output/output_file.h"
#include "output/temporary_file.h"
#include "progress_bar.h"
#include "project_input.h"
#include "reproducible.h"
#include "standard_input.h"
#include "verbs.h"
#include "work_list.h"

namespace q7r
{

namespace
{

constexpr const char* kHelp = R"(Exports a composition of an After Effects project into a scene file.

Use it to turn a project (.aep, .aepx), or what its user published as Lottie JSON, into
a scene of cameras, lights and image planes. docs/projects.md and docs/composition.md
tell what is read. At the end it tells on standard error which layers the scene has and
which were left out, and why.

Pictures that aren't there are told once each; exit status 1 then, as for every
warning. Of a sequence of projects each becomes a scene of its name with -o FOLDER.

Examples: q7r export shot.aep shot.q7r --composition "Main"
          q7r export shots/*.aep -o scenes
          q7r export - - <shot.json >shot.q7r)";

struct Options
{
  ProjectOptions project;
  WorkOptions work;
  bool relative = false;
  bool reproducible = false;
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

// The plug-in, started once as an application does, whatever number of projects it then exports.
const host::StandaloneHost& Application()
{
  static const std::unique_ptr<host::StandaloneHost> application = [] {
    auto host = std::make_unique<host::StandaloneHost>(host::Project());
    if (const A_Err error = host->Start(EntryPointFunc))
      throw Failure("the exporter didn't start (error " + std::to_string(error) + ")");
    return host;
  }();
  return *application;
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
    TellWarning(message);
  });
  player.OnProgress([&](double share) { bar.Show(share); });
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

// Of several exports each account says whose it is.
void TellAccount(const host::Composition& composition, const SceneCounts& scene, const std::string& output)
{
  const std::string whose = ToldTogether::IsInForce() ? output + ": " : "";
  TellNote(whose + AccountText(composition, scene));
}

// Goes through the scene, which is kept in a temporary file meanwhile.
int ExportAsGltf(host::StandaloneHost& player, const host::Composition& composition, const Work& work)
{
  const std::unique_ptr<TemporaryFile> scene = MakePlainFile();
  const bool quiet = PlayExport(player, work.output, scene->Path().string());
  const DocumentPtr document = LoadScene(scene->Path().string());
  TellAccount(composition, CountScene(*document), work.output);
  const int status = WriteGltf(*document, work.input, work.output, GltfFormOf(work.output), {});
  return quiet ? status : kProblems;
}

bool IsGltf(const Work& work) { return GltfFormOf(work.output) != GltfForm::kNone; }

void RequireOutput(const Work& work, bool force)
{
  if (IsGltf(work))
    RequireGltfOutput(work.output, work.input, force);
  else
    RequireWritable(work.output, force);
}

int ExportOne(const Work& work, const Options& options)
{
  ProjectOptions input = options.project;
  input.file = work.input;
  Reproduction reproduction(options.reproducible);
  if (options.reproducible) {
    reproduction.Take(ReadInput(work.input));
    reproduction.Take(input.composition);
    reproduction.Begin();
  }
  host::Project project = ReadProjectToExport(input);
  if (options.relative && !IsGltf(work)) // a glTF file's are always
    MakeRelative(project, FolderOfOutput(work.output));
  const host::Composition& chosen = *project.root; // stays where it is when the project moves
  const bool isWarned = !project.warnings.empty();
  host::StandaloneHost player(std::move(project));
  player.TakePlugin(Application());
  if (IsGltf(work)) {
    const int status = ExportAsGltf(player, chosen, work);
    return isWarned ? kProblems : status;
  }
  bool quiet = true;
  WriteOutput(work.output, [&](const std::string& partial) {
    quiet = PlayExport(player, work.output, partial);
    TellAccount(chosen, ReadBack(partial, work.output), work.output);
    return std::string();
  });
  return quiet && !isWarned ? kDone : kProblems;
}

int Export(const Options& options)
{
  std::vector<Work> list = PlanWork(options.work, ".q7r");
  for (Work& work : list)
    work.output = WithSuffix(work.output);
  Application(); // before there are threads
  return DoWork(
      list, options.work.jobs, [&](const Work& work) { RequireOutput(work, options.work.force); },
      [&](const Work& work) { return ExportOne(work, options); });
}

} // namespace

void AddExport(CLI::App& program, int& status)
{
  auto options = std::make_shared<Options>();
  CLI::App* verb = program.add_subcommand("export", kHelp);
  AddWorkOptions(
      *verb, options->work, "PROJECT",
      "an After Effects project (.aep, .aepx) or a composition file, then the scene file to write; its "
      "suffix becomes .q7r (.glb, .gltf: as convert; .html: as view). With -o, as many projects as you like");
  AddProjectOptions(*verb, options->project);
  AddReproducibleOption(*verb, options->reproducible);
  verb->add_flag("--relative", options->relative, "write the paths of pictures relative to the scene file");
  verb->callback([options, &status] { status = Export(*options); });
}

} // namespace q7r
