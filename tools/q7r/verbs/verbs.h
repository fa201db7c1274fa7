// The verbs of the command line. Each adds itself to the program; when it was chosen it runs inside the parse.
#pragma once

#include <CLI/CLI.hpp>

#include "report.h"

namespace q7r
{

void AddExport(CLI::App& program, int& status);
void AddInfo(CLI::App& program, int& status);
void AddTree(CLI::App& program, int& status);
void AddDump(CLI::App& program, int& status);
void AddCheck(CLI::App& program, int& status);
void AddResave(CLI::App& program, int& status);
void AddMerge(CLI::App& program, int& status);
void AddPreview(CLI::App& program, int& status);
void AddIES(CLI::App& program, int& status);
void AddCompositions(CLI::App& program, int& status);
void AddExtract(CLI::App& program, int& status);
void AddConvert(CLI::App& program, int& status);
void AddView(CLI::App& program, int& status);
void AddDiff(CLI::App& program, int& status);

} // namespace q7r
