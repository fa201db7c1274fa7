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
  bool verbose = false; // every warning, not one for each kind
};

// Adds --composition, --images, --samples and --verbose.
void AddProjectOptions(CLI::App& verb, ProjectOptions& options);

// Reads the composition that is meant and prints what it warns of. Throws Failure where there is none, or where several
// are there to choose from.
host::Project ReadProject(const ProjectOptions& options);

// The compositions as a table for people.
std::string CompositionTable(const std::vector<host::CompositionSummary>& compositions);

} // namespace q7r
