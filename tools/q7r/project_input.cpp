#include "project_input.h"

#include <algorithm>
#include <cstdio>

#include "export_account.h"
#include "host/text.h"
#include "verbs/verbs.h"

namespace q7r
{

namespace
{

using Summaries = std::vector<host::CompositionSummary>;

constexpr std::size_t kMostNamed = 20; // in a message

std::filesystem::path ToPath(const std::string& path) { return std::filesystem::path(path); }

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
    throw Failure(options.file + ": there is no composition " + host::Quoted(options.composition) + "; it has " +
                  NamesOf(compositions));
  if (named != compositions.end() && std::count_if(compositions.begin(), compositions.end(), isNamed) > 1)
    std::fprintf(stderr, "warning: %s: several compositions are named %s; the one with the id %s is taken\n",
                 options.file.c_str(), host::Quoted(named->name).c_str(), named->id.c_str());
  return static_cast<std::size_t>(wanted - compositions.begin());
}

std::size_t Choose(const Summaries& compositions, const ProjectOptions& options)
{
  if (compositions.empty())
    throw Failure(options.file + ": has no composition");
  if (!options.composition.empty())
    return FindNamed(compositions, options);
  const auto active = std::find_if(compositions.begin(), compositions.end(), [](const auto& c) { return c.isActive; });
  if (active != compositions.end())
    return static_cast<std::size_t>(active - compositions.begin());
  if (compositions.size() > 1)
    throw Failure(options.file + ": please choose one of its compositions with --composition\n" +
                  CompositionTable(compositions));
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
  verb.add_flag("--verbose", options.verbose, "list every warning, not one for each kind");
}

host::Project ReadProject(const ProjectOptions& options)
{
  const std::filesystem::path path = ToPath(options.file);
  const std::unique_ptr<host::ProjectFile> file = host::OpenProjectFile(path);
  const std::size_t chosen = Choose(file->Compositions(), options);
  const host::ReadOptions more{ToPath(options.images), ToPath(options.samples)};
  host::Project project = host::ReadProject(*file, chosen, host::OneLine(host::PathToUtf8(path.filename())), more);
  for (const std::string& warning : options.verbose ? project.warnings : MergedWarnings(project.warnings))
    std::fprintf(stderr, "warning: %s\n", warning.c_str());
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
             Format(" (%.6g frames)", c.frames) + "  " + std::to_string(c.layers) + " layers, " +
             std::to_string(c.exported) + " exported" + (c.id.empty() ? "" : "  id " + host::OneLine(c.id)) + "\n";
  }
  return table;
}

} // namespace q7r
