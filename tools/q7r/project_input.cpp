#include "project_input.h"

#include <algorithm>
#include <cstdio>

#include "export_account.h"
#include "footage.h"
#include "host/text.h"
#include "report.h"
#include "standard_input.h"
#include "usage.h"

namespace q7r
{

namespace
{

using Summaries = std::vector<host::CompositionSummary>;

constexpr std::size_t kMostNamed = 20; // in a message

std::filesystem::path ToPath(const std::string& path) { return std::filesystem::path(path); }

// In messages.
std::string NameOf(const std::string& file)
{
  return IsStandard(file) || file.empty() ? InputName(file) : host::OneLine(host::PathToUtf8(ToPath(file)));
}

std::string NamesOf(const Summaries& compositions)
{
  std::string names;
  for (std::size_t i = 0; i < compositions.size() && i < kMostNamed; ++i)
    names += (i > 0 ? ", " : "") + host::Quoted(compositions[i].name) +
             (compositions[i].id.empty() ? "" : " (" + host::OneLine(compositions[i].id) + ")");
  return names + (compositions.size() > kMostNamed ? ", ..." : "");
}

// By name, else by id.
std::size_t FindNamed(const Summaries& compositions, const ProjectOptions& options)
{
  const auto isNamed = [&](const auto& c) { return c.name == options.composition; };
  const auto named = std::find_if(compositions.begin(), compositions.end(), isNamed);
  const auto wanted =
      named != compositions.end() ? named : std::find_if(compositions.begin(), compositions.end(), [&](const auto& c) {
        return c.id == options.composition;
      });
  if (wanted == compositions.end())
    throw Failure(NameOf(options.file),
                  "there is no composition " + host::Quoted(options.composition) + "; it has " + NamesOf(compositions));
  if (named != compositions.end() && std::count_if(compositions.begin(), compositions.end(), isNamed) > 1)
    TellWarning(NameOf(options.file) + ": several compositions are named " + host::Quoted(named->name) +
                "; the one with the id " + named->id + " is taken");
  return static_cast<std::size_t>(wanted - compositions.begin());
}

std::size_t Choose(const Summaries& compositions, const ProjectOptions& options)
{
  if (compositions.empty())
    throw Failure(NameOf(options.file), "has no composition");
  if (!options.composition.empty())
    return FindNamed(compositions, options);
  const auto active = std::find_if(compositions.begin(), compositions.end(), [](const auto& c) { return c.isActive; });
  if (active != compositions.end())
    return static_cast<std::size_t>(active - compositions.begin());
  if (compositions.size() > 1)
    throw Failure(NameOf(options.file),
                  "please choose one of its compositions with --composition\n" + CompositionTable(compositions));
  return 0;
}

std::string Format(const char* format, double number)
{
  char text[64];
  std::snprintf(text, sizeof text, format, number);
  return text;
}

} // namespace

void AddProjectOptions(CLI::App& verb, ProjectOptions& options)
{
  verb.add_option("--composition", options.composition,
                  "the composition of this name or id; without it, the one that was in front when the project was "
                  "saved, or the file's only one");
  verb.add_option("--images", options.images, "look here, and in all folders below, for footage that was moved");
  verb.add_option("--samples", options.samples,
                  "take the samples of this composition file, in place of expressions that aren't run");
  AddTalkOptions(verb, "list every warning, not one for each kind");
}

std::unique_ptr<host::ProjectFile> OpenProject(const std::string& file)
{
  if (file.empty())
    throw Failure(NameOf(file), "is no file name");
  if (!IsStandard(file))
    return host::OpenProjectFile(ToPath(file));
  const std::string& bytes = StandardInput();
  return host::OpenProjectFile(host::FileBytes(std::vector<char>(bytes.begin(), bytes.end())), NameOf(file),
                               std::filesystem::current_path());
}

host::Project ReadProject(const ProjectOptions& options)
{
  const std::unique_ptr<host::ProjectFile> file = OpenProject(options.file);
  const std::size_t chosen = Choose(file->Compositions(), options);
  const host::ReadOptions more{ToPath(options.images), ToPath(options.samples)};
  host::Project project = host::ReadProject(*file, chosen, NameOf(options.file), more);
  for (const std::string& warning : TheTalk().verbose ? project.warnings : MergedWarnings(project.warnings))
    TellWarning(warning);
  return project;
}

host::Project ReadProjectToExport(const ProjectOptions& options)
{
  host::Project project = ReadProject(options);
  if (!options.images.empty()) // what isn't there was told when it was looked for
    return project;
  const std::vector<std::string> missing = MissingPictures(project);
  const std::size_t told = TheTalk().verbose ? missing.size() : std::min(missing.size(), kMostNamed);
  for (std::size_t i = 0; i < missing.size(); ++i) {
    project.warnings.push_back(NameOf(options.file) + ": the picture " + host::Quoted(missing[i]) + " is not there");
    if (i < told)
      TellWarning(project.warnings.back());
  }
  if (told < missing.size())
    TellWarning(NameOf(options.file) + ": " + std::to_string(missing.size() - told) +
                " more pictures are not there; --verbose lists them");
  return project;
}

std::string CompositionTable(const Summaries& compositions)
{
  std::size_t width = 4;
  for (const host::CompositionSummary& c : compositions)
    width = std::max(width, host::OneLine(c.name).size());
  std::string table;
  for (const host::CompositionSummary& c : compositions) {
    std::string name = host::OneLine(c.name);
    name.resize(width, ' ');
    table += (c.isActive ? "* " : "  ") + name + "  " + std::to_string(c.width) + " x " + std::to_string(c.height) +
             "  " + Format("%.6g fps", c.frameRate) + "  " + Format("%.6g s", c.seconds) +
             Format(" (%.6g frames)", c.frames) + "  " + std::to_string(c.layers) +
             (c.layers == 1 ? " layer, " : " layers, ") + std::to_string(c.exported) + " exported" +
             (c.id.empty() ? "" : "  id " + host::OneLine(c.id)) + "\n";
  }
  return table;
}

} // namespace q7r
