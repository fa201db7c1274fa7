// Compositions as the verbs take them: from a composition file or a project, by name, with what a user adds.
#pragma once

#include <CLI/CLI.hpp>
#include <string>
#include <vector>

#include "host/reader/project_file.h"

namespace q7r
{

struct ProjectOptions
{
  std::string file;
  std::string composition; // name or id; empty: the one that is in front
  std::string images;
  std::string samples;
};

// Adds --composition, --images and --samples, and --quiet and --verbose.
void AddProjectOptions(CLI::App& verb, ProjectOptions& options);

// Opens a file, or standard input. Throws host::CompositionError and Failure.
std::unique_ptr<host::ProjectFile> OpenProject(const std::string& file);

// Reads the composition that is meant and tells what it warns of. Throws Failure where there is none, or where several
// are there to choose from.
host::Project ReadProject(const ProjectOptions& options);

// The same for an export: also tells, once each, the pictures of its layers that aren't there.
host::Project ReadProjectToExport(const ProjectOptions& options);

// The compositions as a table for people.
std::string CompositionTable(const std::vector<host::CompositionSummary>& compositions);

} // namespace q7r
