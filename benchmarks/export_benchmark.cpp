// The export: what the exporter adds to the host's own reads.
#include <latch>
#include <memory>
#include <string>
#include <thread>
#include <vector>

#include "exporter/entry/host_calls.h"
#include "exporter/host_api/aegp_entry.h"
#include "exporter/walk/composition.h"
#include "host/standalone_host.h"
#include "measure.h"
#include "torvane/document/base_document.h"
#include "torvane/memory/owned.h"

namespace
{

using namespace benchmarks;
using _torvane_::BaseDocument;

// The streams that a plane is sampled from.
constexpr AEGP_LayerStream kStreams[] = {
    AEGP_LayerStream_POSITION,    AEGP_LayerStream_ROTATE_X,    AEGP_LayerStream_ROTATE_Y, AEGP_LayerStream_ROTATE_Z,
    AEGP_LayerStream_ORIENTATION, AEGP_LayerStream_ANCHORPOINT, AEGP_LayerStream_SCALE};

// Two eased keys over the whole length.
std::string Eased(const std::string& from, const std::string& to, std::int64_t frames)
{
  return R"({"k":[{"t":0,"s":)" + from + R"(,"o":{"x":0.4,"y":0},"i":{"x":0.6,"y":1}},{"t":)" + std::to_string(frames) +
         R"(,"s":)" + to + "}]}";
}

// Solids whose every stream changes in every frame.
std::string Composition(std::int64_t layers, std::int64_t frames)
{
  std::string list;
  for (std::int64_t i = 0; i < layers; ++i) {
    const std::string n = std::to_string(i + 1);
    list += (i ? "," : "") + std::string(R"({"ty":1,"ddd":1,"nm":"Solid )") + n +
            R"(","sw":100,"sh":50,"sc":"#804020","ks":{"p":)" + Eased("[" + n + ",0,0]", "[900,500,700]", frames) +
            R"(,"a":)" + Eased("[0,0,0]", "[100,50,10]", frames) + R"(,"s":)" +
            Eased("[100,100,100]", "[150,70,90]", frames) + R"(,"or":)" + Eased("[0,0,0]", "[50,20,80]", frames) +
            R"(,"rx":)" + Eased("[0]", "[360]", frames) + R"(,"ry":)" + Eased("[0]", "[" + n + "]", frames) +
            R"(,"rz":)" + Eased("[0]", "[720]", frames) + "}}";
  }
  return R"({"w":1920,"h":1080,"fr":25,"ip":0,"op":)" + std::to_string(frames) + R"(,"layers":[)" + list + "]}";
}

// Solids that stand still, each in a place of its own.
std::string StaticComposition(std::int64_t layers)
{
  std::string list;
  for (std::int64_t i = 0; i < layers; ++i) {
    const std::string n = std::to_string(i + 1);
    list += (i ? "," : "") + std::string(R"({"ty":1,"ddd":1,"nm":"Solid )") + n +
            R"(","sw":100,"sh":50,"sc":"#804020","ks":{"p":{"k":[)" + n + R"(,20,30]},"rz":{"k":)" + n + "}}}";
  }
  return R"({"w":1920,"h":1080,"fr":25,"ip":0,"op":250,"layers":[)" + list + "]}";
}

// Reads what an export of the composition reads for its samples, and nothing else.
void ReadAllSamples(host::StandaloneHost& host, A_long layers, A_long frames)
{
  exporter::ExportSuites suites(host.Basic());
  exporter::HostCalls calls(suites);
  AEGP_ItemH item = nullptr;
  AEGP_CompH composition = nullptr;
  calls(&AEGP_ItemSuite13::AEGP_GetActiveItem, &item);
  calls(&AEGP_CompSuite15::AEGP_GetCompFromItem, item, &composition);
  for (A_long i = 0; i < layers; ++i) {
    AEGP_LayerH layer = nullptr;
    calls(&AEGP_LayerSuite13::AEGP_GetCompLayerByIndex, composition, i, &layer);
    exporter::HostStream streams[std::size(kStreams)];
    for (std::size_t s = 0; s < std::size(kStreams); ++s)
      streams[s].Open(calls, layer, kStreams[s]);
    for (A_long frame = 0; frame <= frames; ++frame) {
      for (const exporter::HostStream& stream : streams) {
        AEGP_StreamVal2 value = {};
        exporter::ReadStream(calls, stream.Get(), {frame, 25}, value);
        benchmark::DoNotOptimize(value);
      }
    }
    for (exporter::HostStream& stream : streams)
      stream.Dispose(calls);
  }
}

void Export(BaseDocument& document)
{
  if (!exporter::ExportComposition(&document))
    throw std::runtime_error("the export failed");
}

// The same work with a host that has the composition. It is made by the process that measures: what it leaves of memory
// in this one would pass to those of all later benchmarks.
template <typename Work>
auto WithHost(const std::string& composition, Work work)
{
  return [&composition, work] {
    host::StandaloneHost host(host::LoadCompositionText(composition, "benchmark.json", "/"));
    host.Start(EntryPointFunc);
    return work(host);
  };
}

// "host ns": the host's reads for one sample of one layer. "exporter/host" is what the exporter takes on top of them,
// for the conversion, nine keys, and the scene around them, as a part of that.
void ExportAnimatedLayers(benchmark::State& state)
{
  const std::int64_t layers = state.range(0);
  const std::int64_t frames = state.range(1);
  const std::string composition = Composition(layers, frames);
  const Run reads = BestOfThree([&] {
    return InFreshProcess(WithHost(composition, [&](host::StandaloneHost& host) {
      return Measure([&] { ReadAllSamples(host, static_cast<A_long>(layers), static_cast<A_long>(frames)); });
    }));
  });
  const Run run = RunFresh(state, WithHost(composition, [](host::StandaloneHost&) {
                             const _torvane_::Owned<BaseDocument> document(BaseDocument::Alloc());
                             return Measure([&] { Export(*document); });
                           }));
  state.counters["host ns"] = reads.time.count() / static_cast<double>(layers * (frames + 1)) * 1e9;
  state.counters["exporter/host"] = (run.time - reads.time) / reads.time;
}

// As many exports at once as the argument says, each in a thread of its own; "work" is how many exports' time goes by
// in the time of one.
void ExportInThreads(benchmark::State& state)
{
  constexpr std::int64_t kFrames = 2000;
  static double alone = 0; // the time of the first argument, one thread
  const std::string composition = Composition(50, kFrames);
  host::StandaloneHost first(host::LoadCompositionText(composition, "benchmark.json", "/"));
  first.Start(EntryPointFunc);
  const Run run = RunFresh(state, [&] {
    std::latch ready(state.range(0) + 1);
    std::vector<std::thread> threads;
    for (std::int64_t i = 0; i < state.range(0); ++i) {
      threads.emplace_back([&] {
        host::StandaloneHost host(host::LoadCompositionText(composition, "benchmark.json", "/"));
        const _torvane_::Owned<BaseDocument> document(BaseDocument::Alloc());
        ready.arrive_and_wait();
        Export(*document);
      });
    }
    ready.arrive_and_wait();
    return Measure([&] {
      for (std::thread& thread : threads)
        thread.join();
    });
  });
  if (state.range(0) == 1)
    alone = run.time.count();
  state.counters["work"] = static_cast<double>(state.range(0)) * alone / run.time.count();
}

// From the composition to the closed file, a layer, its material and its tag at a time.
void ExportStaticLayers(benchmark::State& state)
{
  const ScratchFile scratch;
  const std::string composition = StaticComposition(state.range(0));
  RunFresh(state, WithHost(composition, [&](host::StandaloneHost&) {
             scratch.Remove();
             const _torvane_::Owned<BaseDocument> document(BaseDocument::Alloc());
             return Measure([&] {
               Export(*document);
               if (!SaveDocument(document.get(), _torvane_::Filename(scratch.Path().c_str()), 0))
                 throw std::runtime_error("the scene can't be saved");
             });
           }));
  SetRate(state, static_cast<double>(state.range(0)));
}

BENCHMARK(ExportInThreads)->Arg(1)->Arg(2)->Apply(OneBest);
BENCHMARK(ExportStaticLayers)->Arg(10'000)->Arg(20'000)->Apply(OneBest);
BENCHMARK(ExportAnimatedLayers)
    ->Args({100, 1000})
    ->Args({200, 1000})
    ->Args({100, 2000})
    ->Args({100, 10'000})
    ->Apply(OneBest);

} // namespace
