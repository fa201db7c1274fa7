// q7r export: plays the host for the exporter.
#include <cstdio>
#include <filesystem>
#include <memory>

#include "exporter/host_api/aegp_entry.h"
#include "host/standalone_host.h"
#include "progress_bar.h"
#include "scene_file.h"
#include "verbs.h"

namespace q7r
{

namespace
{

constexpr const char* kHelp = R"(Exports a composition (Lottie JSON) into a scene file.

Use it to turn what After Effects users publish as Lottie into a scene of cameras,
lights and image planes. docs/composition.md tells which keys are read.

Example: q7r export shot.json shot.q7r --composition "Main")";

constexpr const char* kMenuEntry = "KORVEX Exporter...";
constexpr const char* kSuffix = "q7r";

struct Options
{
  std::string composition;
  std::string output;
  std::string name; // of the composition to export; empty for the root
  bool force = false;
};

// The exporter forces the suffix of the path that the save dialog gives. Here the path is given beforehand, so it is
// brought to that form at once: then the question about an existing file is about the file that is written.
std::string WithSuffix(const std::string& path)
{
  _torvane_::Filename output = ToFilename(path);
  if (!output.CheckSuffix(kSuffix))
    output.SetSuffix(kSuffix);
  return (std::filesystem::path(path).parent_path() / ToUtf8(output.GetFileString())).string(); // as it was given
}

// What must hold before the exporter is asked, since it answers all of it with a number.
void RequireWritable(const std::string& output)
{
  std::filesystem::path folder = std::filesystem::path(output).parent_path();
  if (!folder.empty() && !std::filesystem::is_directory(folder))
    throw Failure(output + ": there is no folder " + folder.string());
  if (std::filesystem::is_directory(output))
    throw Failure(output + ": is a folder");
}

// Plays one export. True if the exporter showed no message.
bool PlayExport(host::StandaloneHost& player, const Options& options, const std::string& output)
{
  ProgressBar bar("reading layers");
  bool quiet = true;
  bool refused = false;
  player.SetOutputPath(std::filesystem::absolute(output).string());
  player.OnAskOverwrite([&] {
    refused = !options.force && !AskReplace(output);
    return !refused;
  });
  player.OnReport([&](const std::string& message) {
    quiet = false;
    bar.Clear();
    std::fprintf(stderr, "%s\n", message.c_str());
  });
  player.OnProgress([&](double share) { bar.Show(share); });
  if (A_Err error = player.Start(EntryPointFunc))
    throw Failure(output + ": the exporter didn't start (error " + std::to_string(error) + ")");
  AEGP_Command command = player.FindCommand(kMenuEntry);
  player.CallMenuHook();
  if (!command || !player.IsCommandEnabled(command))
    throw Failure(output + ": the exporter offers no export for this composition");
  host::CommandResult result = player.CallCommandHook(command);
  if (refused)
    throw Failure(output + ": exists already; --force replaces it");
  if (result.error != 0)
    throw Failure(output + ": can't be written (error " + std::to_string(result.error) + ")");
  return quiet;
}

int Export(const Options& options)
{
  host::Project project = host::LoadComposition(options.composition);
  for (const std::string& warning : project.warnings)
    std::fprintf(stderr, "warning: %s\n", warning.c_str());
  host::StandaloneHost player(std::move(project));
  if (!options.name.empty() && !player.ActivateComposition(options.name))
    throw Failure(options.composition + ": there is no composition \"" + options.name + "\"");
  std::string output = WithSuffix(options.output);
  RequireWritable(output);
  bool quiet = PlayExport(player, options, output);
  VerifyScene(output);
  std::printf("%s: %s\n", output.c_str(), SizeText(std::filesystem::file_size(output)).c_str());
  return quiet ? kDone : kProblems;
}

} // namespace

void AddExport(CLI::App& program, int& status)
{
  auto options = std::make_shared<Options>();
  CLI::App* verb = program.add_subcommand("export", kHelp);
  verb->add_option("COMPOSITION", options->composition, "the composition file")->required();
  verb->add_option("OUTPUT", options->output, "the scene file to write; its suffix becomes .q7r")->required();
  verb->add_option("--composition", options->name, "export the nested composition of this name or id");
  verb->add_flag("--force", options->force, "replace an existing file without asking");
  verb->callback([options, &status] { status = Export(*options); });
}

} // namespace q7r
