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

void Open(HyperFile& file, const ScratchFile& scratch, Long mode)
{
  if (mode == kHyperFileWrite)
    scratch.Remove();
  if (!file.Open(kSceneIdent, Filename(scratch.Path().c_str()), mode))
    throw std::runtime_error("the file can't be opened");
}

void WriteReals(const ScratchFile& scratch, LLong count)
{
  HyperFile file;
  Open(file, scratch, kHyperFileWrite);
  for (LLong i = 0; i < count; ++i)
    file.WriteReal(static_cast<Real>(i));
  file.Close();
}

void ReadReals(const ScratchFile& scratch, LLong count)
{
  HyperFile file;
  Open(file, scratch, kHyperFileRead);
  Real sum = 0;
  for (LLong i = 0; i < count; ++i) {
    Real value = 0;
    file.ReadReal(value);
    sum += value;
  }
  benchmark::DoNotOptimize(sum);
}

void WriteArray(const ScratchFile& scratch, const std::vector<double>& values)
{
  HyperFile file;
  Open(file, scratch, kHyperFileWrite);
  file.WriteArray(values.data(), kArrayReal, sizeof(double), static_cast<LLong>(values.size()));
  file.Close();
}

void ReadArray(const ScratchFile& scratch, std::size_t count)
{
  HyperFile file;
  Open(file, scratch, kHyperFileRead);
  const std::unique_ptr<double[]> values(new double[count]); // fresh memory, as the limit's
  if (!file.ReadArray(values.get(), kArrayReal, sizeof(double), static_cast<LLong>(count)))
    throw std::runtime_error("the array can't be read");
}

void WriteTaggedReals(benchmark::State& state)
{
  const ScratchFile scratch;
  RunFresh(state, [&] { return Measure([&] { WriteReals(scratch, state.range(0)); }); });
  SetRate(state, static_cast<double>(state.range(0)), ValueWriteLimit());
}

void ReadTaggedReals(benchmark::State& state)
{
  const ScratchFile scratch;
  Prepare([&] { WriteReals(scratch, state.range(0)); });
  RunFresh(state, [&] { return Measure([&] { ReadReals(scratch, state.range(0)); }); });
  SetRate(state, static_cast<double>(state.range(0)), ValueReadLimit());
}

void WriteDoubleArray(benchmark::State& state)
{
  const ScratchFile scratch;
  RunTogether(state, [&] {
    const std::vector<double> values(static_cast<std::size_t>(state.range(0)), 1.0 / 3);
    return BestOfThree([&] { return Measure([&] { WriteArray(scratch, values); }); });
  });
  SetRate(state, static_cast<double>(state.range(0)), DoubleWriteLimit());
}

void ReadDoubleArray(benchmark::State& state)
{
  const ScratchFile scratch;
  const auto count = static_cast<std::size_t>(state.range(0));
  Prepare([&] { WriteArray(scratch, std::vector<double>(count, 1.0 / 3)); });
  RunFresh(state, [&] { return Measure([&] { ReadArray(scratch, count); }); });
  SetRate(state, static_cast<double>(count), DoubleReadLimit());
}

BENCHMARK(WriteTaggedReals)->Arg(4'000'000)->Arg(8'000'000)->Apply(OneBest);
BENCHMARK(ReadTaggedReals)->Arg(4'000'000)->Arg(8'000'000)->Apply(OneBest);
BENCHMARK(WriteDoubleArray)->Arg(4'000'000)->Arg(8'000'000)->Apply(OneBest);
BENCHMARK(ReadDoubleArray)->Arg(4'000'000)->Arg(8'000'000)->Apply(OneBest);

} // namespace
