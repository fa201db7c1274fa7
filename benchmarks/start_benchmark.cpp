// The program itself: how long it takes to start, and to tell about a scene.
#include <string>
#include <vector>

#include <fcntl.h>
#include <spawn.h>
#include <sys/wait.h>
#include <unistd.h>

#include "measure.h"
#include "torvane/document/base_document.h"
#include "torvane/memory/owned.h"
#include "torvane/objects/base_object.h"

namespace
{

using namespace benchmarks;
using namespace _torvane_;

// Runs q7r with its output thrown away.
void RunProgram(const std::vector<std::string>& arguments)
{
  std::vector<char*> words{const_cast<char*>(Q7R_PROGRAM)};
  for (const std::string& argument : arguments)
    words.push_back(const_cast<char*>(argument.c_str()));
  words.push_back(nullptr);
  posix_spawn_file_actions_t actions;
  posix_spawn_file_actions_init(&actions);
  posix_spawn_file_actions_addopen(&actions, STDOUT_FILENO, "/dev/null", O_WRONLY, 0);
  pid_t child = 0;
  int status = 1;
  const bool started = posix_spawn(&child, Q7R_PROGRAM, &actions, nullptr, words.data(), environ) == 0;
  posix_spawn_file_actions_destroy(&actions);
  if (!started || waitpid(child, &status, 0) != child || status != 0)
    throw std::runtime_error("q7r failed");
}

void StartProgram(benchmark::State& state)
{
  RunFresh(state, [] { return Measure([] { RunProgram({"--version"}); }); });
}

void TellAboutNodes(benchmark::State& state)
{
  const ScratchFile scratch;
  Prepare([&] {
    const Owned<BaseDocument> document(CreateDocument());
    for (std::int64_t i = 0; i < state.range(0); ++i)
      document->InsertObject(AllocObject(kObjectNull));
    if (!SaveDocument(document.get(), Filename(scratch.Path().c_str()), 0))
      throw std::runtime_error("the scene can't be saved");
  });
  RunFresh(state, [&] { return Measure([&] { RunProgram({"info", scratch.Path()}); }); });
  SetRate(state, static_cast<double>(state.range(0)));
}

BENCHMARK(StartProgram)->Arg(1)->Apply(OneBest);
BENCHMARK(TellAboutNodes)->Arg(100'000)->Arg(200'000)->Apply(OneBest);

} // namespace
