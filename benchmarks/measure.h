// How everything here is measured: in one process, the best of three runs, beside the limits of the same machine.
#pragma once

#include <benchmark/benchmark.h>

#include <chrono>
#include <cstdint>
#include <filesystem>
#include <random>

namespace benchmarks
{

using Seconds = std::chrono::duration<double>;

// The time of `work()`.
template <typename Work>
Seconds TimeOf(Work&& work)
{
  const auto start = std::chrono::steady_clock::now();
  work();
  return std::chrono::steady_clock::now() - start;
}

// The shortest of three runs of `work()`, which gives its own time as Seconds.
template <typename Work>
Seconds BestOfThree(Work&& work)
{
  Seconds best = work();
  for (int i = 1; i < 3; ++i)
    best = std::min<Seconds>(best, work());
  return best;
}

// Runs a benchmark's one iteration: `work()` gives the time of one run as Seconds, which leaves out what it only
// prepares. To be registered with OneBest.
template <typename Work>
void RunBest(benchmark::State& state, Work&& work)
{
  for ([[maybe_unused]] auto iteration : state)
    state.SetIterationTime(BestOfThree(work).count());
}

// Settings of every benchmark of RunBest.
inline void OneBest(benchmark::internal::Benchmark* benchmark)
{
  benchmark->UseManualTime()->Iterations(1)->Unit(benchmark::kMillisecond);
}

// Sets "M/s" (millions of `things` a second) and, if there is a limit, "share": the part of the limit that is reached.
// `limit` is in things a second.
inline void SetRate(benchmark::State& state, double things, double limit = 0)
{
  constexpr auto kPerSecond = benchmark::Counter::kIsIterationInvariantRate;
  state.counters["M/s"] = benchmark::Counter(things * 1e-6, kPerSecond);
  if (limit > 0)
    state.counters["share"] = benchmark::Counter(things / limit, kPerSecond);
}

// The most memory that the process has had at once since ResetPeakMemory, in bytes; 0 where the system doesn't tell.
std::int64_t PeakMemory();
// The memory that the process has now.
std::int64_t PresentMemory();
void ResetPeakMemory();

// A file that goes with the object.
class ScratchFile
{
 public:
  ScratchFile()
      : path_(std::filesystem::temp_directory_path() / ("q7r-benchmark-" + std::to_string(std::random_device()())))
  {}
  ~ScratchFile()
  {
    std::error_code ignored;
    std::filesystem::remove(path_, ignored);
  }
  ScratchFile(const ScratchFile&) = delete;
  ScratchFile& operator=(const ScratchFile&) = delete;

  std::string Path() const { return path_.string(); }

 private:
  std::filesystem::path path_;
};

} // namespace benchmarks
