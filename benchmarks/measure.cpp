#include "measure.h"

#include <cstdio>
#include <fstream>

#include <sys/wait.h>
#include <unistd.h>

namespace benchmarks
{

namespace
{

// A size in kB out of the system's page about this process.
std::int64_t StatusSize(const std::string& name)
{
  std::ifstream status("/proc/self/status");
  for (std::string line; std::getline(status, line);) {
    if (line.compare(0, name.size(), name) == 0)
      return std::stoll(line.substr(name.size())) * 1024;
  }
  return 0;
}

// The child's part: never returns. What the parent prepared, files for one, is not its to clean up.
[[noreturn]] void RunAndTell(const std::function<Run()>& work, int pipe)
{
  int status = 1;
  try {
    const Run run = work();
    status = ::write(pipe, &run, sizeof run) == sizeof run ? 0 : 1;
  } catch (const std::exception& problem) {
    std::fprintf(stderr, "%s\n", problem.what());
  }
  ::_exit(status);
}

} // namespace

std::int64_t PeakMemory() { return StatusSize("VmHWM:"); }
std::int64_t PresentMemory() { return StatusSize("VmRSS:"); }
void ResetPeakMemory() { std::ofstream("/proc/self/clear_refs") << "5"; }

Run InFreshProcess(const std::function<Run()>& work)
{
  int ends[2];
  if (::pipe(ends) != 0)
    throw std::runtime_error("there is no pipe");
  const pid_t child = ::fork();
  if (child == 0)
    RunAndTell(work, ends[1]);
  ::close(ends[1]);
  Run run;
  const bool told = child > 0 && ::read(ends[0], &run, sizeof run) == sizeof run;
  ::close(ends[0]);
  int status = 1;
  if (child > 0)
    ::waitpid(child, &status, 0);
  if (!told || status != 0)
    throw std::runtime_error("the measured work failed");
  return run;
}

} // namespace benchmarks
