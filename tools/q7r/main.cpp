// q7r: scene files from compositions, and tools for scene files.
#include <algorithm>
#include <exception>
#include <new>
#include <sstream>

#include "output/standard_output.h"
#include "output/temporary_file.h"
#include "torvane/memory/assertion.h"
#include "torvane/memory/memory.h"
#include "usage.h"
#include "verbs/verbs.h"

namespace
{

constexpr const char* kDescription = R"(Exports compositions into .q7r scene files and works on such files.

Results go to standard output, messages to standard error; - stands for standard
input or output wherever a file does. Exit status:

  0  done
  1  done, but something was warned of, or check or diff found something
  2  not done, or not with each of several files

q7r VERB --help tells more of a verb.)";

// "q7r help export" is "q7r export --help".
std::vector<std::string> ArgumentsOf(int argc, char** argv)
{
  std::vector<std::string> arguments(argv + std::min(argc, 1), argv + argc);
  if (!arguments.empty() && arguments.front() == "help") {
    arguments.erase(arguments.begin());
    arguments.emplace_back("--help");
  }
  return arguments;
}

// Verbs that list something have an option of their own.
void AddJson(CLI::App& program)
{
  for (CLI::App* verb : program.get_subcommands({})) {
    if (!verb->get_option_no_throw("--json"))
      verb->add_flag("--json")->description("tell what was written, and failures, as JSON (docs/json.md)");
  }
}

int Run(const std::vector<std::string>& arguments)
{
  CLI::App program(kDescription, "q7r");
  program.formatter(q7r::HelpFormat());
  program.allow_windows_style_options(false); // "/..." is a path everywhere
  program.set_version_flag("-V,--version", "q7r 1.0.0 (scene file version 13000)");
  program.require_subcommand(1);
  // Known before the arguments are understood: they may be what is wrong.
  q7r::TheTalk().json = std::find(arguments.begin(), arguments.end(), "--json") != arguments.end();
  int status = q7r::kDone;
  for (auto add : {q7r::AddExport, q7r::AddInfo, q7r::AddTree, q7r::AddDump, q7r::AddCheck, q7r::AddResave,
                   q7r::AddMerge, q7r::AddPreview, q7r::AddIES, q7r::AddCompositions, q7r::AddExtract, q7r::AddConvert,
                   q7r::AddView, q7r::AddDiff})
    add(program, status);
  AddJson(program);
  q7r::RequireVerb(program, arguments);
  try {
    program.parse(std::vector<std::string>(arguments.rbegin(), arguments.rend())); // taken from the end
  } catch (const CLI::ParseError& error) {
    if (error.get_exit_code() != static_cast<int>(CLI::ExitCodes::Success))
      throw q7r::Failure(q7r::UsageText(program, error, arguments));
    std::ostringstream help;
    program.exit(error, help, help);
    q7r::Print(help.str());
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
    const int status = Run(ArgumentsOf(argc, argv));
    q7r::FlushStandardOutput();
    if (watch.Failed() && status != q7r::kNotDone)
      throw std::bad_alloc();
    return status;
  } catch (const std::exception&) {
    return q7r::TellFailure();
  }
}
