// The tagged stream itself: single values, and whole arrays.
#include <vector>

#include "machine_limits.h"
#include "measure.h"
#include "torvane/stream/hyper_file.h"
#include "torvane/text/filename.h"

namespace
{

using namespace _torvane_;
using namespace benchmarks;

// Opens `file`, or says on the benchmark that it can't.
bool Open(benchmark::State& state, HyperFile& file, const ScratchFile& scratch, Long mode)
{
  if (file.Open(kSceneIdent, Filename(scratch.Path().c_str()), mode))
    return true;
  state.SkipWithError("the file can't be opened");
  return false;
}

Seconds WriteReals(benchmark::State& state, const ScratchFile& scratch)
{
  return TimeOf([&] {
    HyperFile file;
    if (!Open(state, file, scratch, kHyperFileWrite))
      return;
    for (LLong i = 0; i < state.range(0); ++i)
      file.WriteReal(static_cast<Real>(i));
    file.Close();
  });
}

Seconds ReadReals(benchmark::State& state, const ScratchFile& scratch)
{
  return TimeOf([&] {
    HyperFile file;
    if (!Open(state, file, scratch, kHyperFileRead))
      return;
    Real sum = 0;
    for (LLong i = 0; i < state.range(0); ++i) {
      Real value = 0;
      file.ReadReal(value);
      sum += value;
    }
    benchmark::DoNotOptimize(sum);
  });
}

void WriteTaggedReals(benchmark::State& state)
{
  const ScratchFile scratch;
  RunBest(state, [&] { return WriteReals(state, scratch); });
  SetRate(state, static_cast<double>(state.range(0)), ValueWriteLimit());
}

void ReadTaggedReals(benchmark::State& state)
{
  const ScratchFile scratch;
  WriteReals(state, scratch);
  RunBest(state, [&] { return ReadReals(state, scratch); });
  SetRate(state, static_cast<double>(state.range(0)), ValueReadLimit());
}

Seconds WriteArray(benchmark::State& state, const ScratchFile& scratch, const std::vector<double>& values)
{
  return TimeOf([&] {
    HyperFile file;
    if (!Open(state, file, scratch, kHyperFileWrite))
      return;
    file.WriteArray(values.data(), kArrayReal, sizeof(double), static_cast<LLong>(values.size()));
    file.Close();
  });
}

void WriteDoubleArray(benchmark::State& state)
{
  const ScratchFile scratch;
  const std::vector<double> values(static_cast<std::size_t>(state.range(0)), 1.0 / 3);
  RunBest(state, [&] { return WriteArray(state, scratch, values); });
  SetRate(state, static_cast<double>(state.range(0)), DoubleWriteLimit());
}

void ReadDoubleArray(benchmark::State& state)
{
  const ScratchFile scratch;
  const auto count = static_cast<std::size_t>(state.range(0));
  WriteArray(state, scratch, std::vector<double>(count, 1.0 / 3));
  RunBest(state, [&] {
    return TimeOf([&] {
      HyperFile file;
      if (!Open(state, file, scratch, kHyperFileRead))
        return;
      const std::unique_ptr<double[]> values(new double[count]); // fresh memory, as the limit's
      if (!file.ReadArray(values.get(), kArrayReal, sizeof(double), static_cast<LLong>(count)))
        state.SkipWithError("the array can't be read");
    });
  });
  SetRate(state, static_cast<double>(count), DoubleReadLimit());
}

BENCHMARK(WriteTaggedReals)->Arg(4'000'000)->Arg(8'000'000)->Apply(OneBest);
BENCHMARK(ReadTaggedReals)->Arg(4'000'000)->Arg(8'000'000)->Apply(OneBest);
BENCHMARK(WriteDoubleArray)->Arg(4'000'000)->Arg(8'000'000)->Apply(OneBest);
BENCHMARK(ReadDoubleArray)->Arg(4'000'000)->Arg(8'000'000)->Apply(OneBest);

} // namespace
