// q7r: scene files from compositions, and tools for scene files.
#include <cstdio>
#include <exception>
#include <iostream>
#include <new>
#include <sstream>

#include "output/standard_output.h"
#include "output/temporary_file.h"
#include "torvane/memory/assertion.h"
#include "torvane/memory/memory.h"
#include "verbs/verbs.h"

namespace
{

constexpr const char* kDescription = R"(Exports compositions into .q7r scene files and works on such files.

Results go to standard output, messages to standard error. Exit status: 0 done;
1 done, but problems were reported; 2 not done.)";

int Run(int argc, char** argv)
{
  CLI::App program(kDescription, "q7r");
  program.allow_windows_style_options(false); // "/..." is a path everywhere
  program.set_version_flag("--version", "q7r 1.0.0 (scene file version 13000)");
  program.require_subcommand(1);
  int status = q7r::kDone;
  for (auto add :
       {q7r::AddExport, q7r::AddInfo, q7r::AddTree, q7r::AddDump, q7r::AddCheck, q7r::AddResave, q7r::AddMerge,
        q7r::AddPreview, q7r::AddIES, q7r::AddCompositions, q7r::AddExtract, q7r::AddConvert, q7r::AddView})
    add(program, status);
  try {
    program.parse(argc, argv);
  } catch (const CLI::ParseError& error) {
    std::ostringstream help;
    const int result = program.exit(error, help, std::cerr);
    q7r::Print(help.str());
    return result == 0 ? q7r::kDone : q7r::kNotDone;
  }
  return status;
}

} // namespace

int main(int argc, char** argv)
{
  // The library's own reports are for its developers; what matters to a user comes as an error.
  _torvane_::SetAssertionLog(nullptr);
  q7r::PrepareProcess();
  try {
    // What any part of the library could not allocate may be missing from what was printed.
    const _torvane_::AllocationWatch watch;
    const int status = Run(argc, argv);
    q7r::FlushStandardOutput();
    if (watch.Failed() && status != q7r::kNotDone)
      throw std::bad_alloc();
    return status;
  } catch (const std::bad_alloc&) {
    std::fputs("q7r: not enough memory\n", stderr);
    return q7r::kNotDone;
  } catch (const std::exception& error) {
    std::fprintf(stderr, "q7r: %s\n", error.what());
    return q7r::kNotDone;
  }
}
