#include "measure.h"

#include <fstream>
#include <string>

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

} // namespace

std::int64_t PeakMemory() { return StatusSize("VmHWM:"); }
std::int64_t PresentMemory() { return StatusSize("VmRSS:"); }
void ResetPeakMemory() { std::ofstream("/proc/self/clear_refs") << "5"; }

} // namespace benchmarks
