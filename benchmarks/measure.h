// How everything here is measured: in processes of their own, so that no run meets memory that another one left behind;
// the best of three, beside the limits of the same machine. A file that is written is not there before: writing over an
// old one takes longer.
#pragma once

#include <benchmark/benchmark.h>

#include <algorithm>
#include <chrono>
#include <cstdint>
#include <filesystem>
#include <functional>
#include <random>
#include <stdexcept>
#include <string>

namespace benchmarks
{

using Seconds = std::chrono::duration<double>;

// What one run tells.
struct Run
{
  Seconds time{};
  std::int64_t memory = 0; // the most that the process had at once, in bytes above what it had when the run began
};

// The most memory that the process has had at once since ResetPeakMemory, in bytes; 0 where the system doesn't tell.
std::int64_t PeakMemory();
// The memory that the process has now.
std::int64_t PresentMemory();
void ResetPeakMemory();

// Runs `work()` here. What it gives is kept until the memory was looked at.
template <typename Work>
Run Measure(Work&& work)
{
  Run run;
  const std::int64_t before = PresentMemory();
  ResetPeakMemory();
  const auto start = std::chrono::steady_clock::now();
  work();
  run.time = std::chrono::steady_clock::now() - start;
  run.memory = PeakMemory() - before;
  return run;
}

// The quickest of three runs of `work()`, which gives a Run.
template <typename Work>
Run BestOfThree(Work&& work)
{
  Run best = work();
  for (int i = 1; i < 3; ++i) {
    const Run run = work();
    if (run.time < best.time)
      best = run;
  }
  return best;
}

// Runs `work` in a new process, which ends with it, and gives what it gives. An exception there is told on standard
// error; it and any other failure is a std::runtime_error here.
Run InFreshProcess(const std::function<Run()>& work);

// What only prepares, in a new process too: the memory that it takes goes with it.
inline void Prepare(const std::function<void()>& work)
{
  InFreshProcess([&] { return work(), Run(); });
}

// A benchmark's one iteration: `measure()` gives its Run. The counters "peak MB" and, where the first argument is twice
// that of the run before, "twice": how many times as long it took. To be registered with an argument, and with OneBest.
template <typename Measured>
Run RunOnce(benchmark::State& state, Measured&& measure)
{
  static double first = 0; // of the run before with the same kind of work
  static std::int64_t firstSize = 0;
  Run run;
  for ([[maybe_unused]] auto iteration : state) {
    try {
      run = measure();
    } catch (const std::exception& problem) {
      state.SkipWithError(problem.what());
      return run;
    }
    state.SetIterationTime(run.time.count());
  }
  state.counters["peak MB"] = static_cast<double>(run.memory) * 1e-6;
  if (first > 0 && state.range(0) == 2 * firstSize)
    state.counters["twice"] = run.time.count() / first;
  first = run.time.count();
  firstSize = state.range(0);
  return run;
}

// Three runs, each in a process of its own.
template <typename Work>
Run RunFresh(benchmark::State& state, Work&& work)
{
  return RunOnce(state, [&] { return BestOfThree([&] { return InFreshProcess(work); }); });
}

// `work()` in one process; it gives the best of its own runs, for work that has much to prepare.
template <typename Work>
Run RunTogether(benchmark::State& state, Work&& work)
{
  return RunOnce(state, [&] { return InFreshProcess(work); });
}

// Settings of every benchmark.
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

// A file that goes with the object.
class ScratchFile
{
 public:
  ScratchFile()
      : path_(std::filesystem::temp_directory_path() / ("q7r-benchmark-" + std::to_string(std::random_device()())))
  {}
  ~ScratchFile() { Remove(); }
  ScratchFile(const ScratchFile&) = delete;
  ScratchFile& operator=(const ScratchFile&) = delete;

  std::string Path() const { return path_.string(); }
  // To be called before it is written again.
  void Remove() const
  {
    std::error_code ignored;
    std::filesystem::remove(path_, ignored);
  }

 private:
  std::filesystem::path path_;
};

} // namespace benchmarks
