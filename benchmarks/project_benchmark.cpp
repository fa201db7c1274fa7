// After Effects projects: a file as large as real ones get, with thousands of layers, most of which nobody asks for.
// "50 MB" is the time for each 50 MB of the file, in seconds. The file is in the system's cache, as after a copy.
#include <fstream>
#include <stdexcept>
#include <string>

#include "host/reader/project_file.h"
#include "measure.h"
#include "tests/host/project_bytes.h"

namespace
{

using namespace benchmarks;
namespace pb = project_bytes;

constexpr unsigned kLayersEach = 100; // in a composition
constexpr unsigned kSolid = 900'000;

// What effects, masks and texts take in real projects: chunks that a reader passes over.
pb::Node Effects(std::size_t bytes)
{
  std::vector<pb::Node> nodes;
  for (std::size_t size = 0; size < bytes; size += 1024)
    nodes.push_back(pb::List("sspc", {pb::Chunk("fnam", "effect"), pb::Chunk("pard", std::string(1000, '\x01'))}));
  return pb::List("tdgp", std::move(nodes));
}

// A 3D layer with a path of ten keyframes and a turn, and the weight of its effects.
pb::Node AnimatedLayer(unsigned id, std::size_t bytes)
{
  pb::Layer layer{.id = id, .name = "Layer " + std::to_string(id), .source = kSolid};
  std::vector<std::string> path, turn;
  for (unsigned k = 0; k < 10; ++k) {
    const double x = 100.0 * k + id;
    path.push_back(pb::WideKey(k * 25600, pb::kBezier, pb::kBezier, {x, 2 * x, 3 * x}, {10, 0.3, 10, 0.3}, {-30, 5, 0},
                               {30, 5, 0}));
    turn.push_back(pb::PlainKey(k * 25600, pb::kBezier, pb::kBezier, {x}, {{5, 0.3, 5, 0.3}}));
  }
  pb::Add(layer.transform, "ADBE Position", pb::Body({.components = 3, .form = 0x0E, .keys = path}));
  pb::Add(layer.transform, "ADBE Rotate Z", pb::Body({.keys = turn}));
  layer.more = {pb::MatchName("ADBE Effect Parade"), Effects(bytes)};
  return pb::MakeLayer(layer);
}

std::string Project(unsigned layers, std::size_t bytesEach, bool isXml)
{
  std::vector<pb::Node> items;
  const float color[3] = {0.1F, 0.2F, 0.3F};
  items.push_back(pb::Solid(kSolid, "Solid", 400, 200, color));
  for (unsigned first = 0; first < layers; first += kLayersEach) {
    pb::Comp composition{.id = first + 1, .name = "Shot " + std::to_string(first)};
    for (unsigned i = 0; i < kLayersEach; ++i)
      composition.layers.push_back(AnimatedLayer(first + i + 1, bytesEach));
    items.push_back(pb::MakeItem(composition));
  }
  return isXml ? pb::XmlFile(pb::Root(std::move(items))) : pb::BinaryFile(pb::Root(std::move(items)));
}

// All layers in one composition, each of which is built.
std::string OneComposition(unsigned layers, std::size_t bytesEach)
{
  pb::Comp composition;
  for (unsigned i = 0; i < layers; ++i)
    composition.layers.push_back(AnimatedLayer(i + 1, bytesEach));
  const float color[3] = {0.1F, 0.2F, 0.3F};
  return pb::BinaryFile(pb::Root({pb::Solid(kSolid, "Solid", 400, 200, color), pb::MakeItem(composition)}));
}

// From the name of the file to the composition: what `q7r compositions` does, then what an export begins with.
void Open(benchmark::State& state, const std::string& bytes, const char* suffix)
{
  const ScratchFile scratch;
  const std::string path = scratch.Path() + suffix;
  std::ofstream(path, std::ios::binary) << bytes;
  const Run run = RunFresh(state, [&] {
    return Measure([&] {
      const std::unique_ptr<host::ProjectFile> file = host::OpenProjectFile(path);
      const std::size_t compositions = file->Compositions().size();
      if (file->Read(compositions - 1).layers.empty())
        throw std::runtime_error("nothing was read");
    });
  });
  std::filesystem::remove(path);
  state.counters["MB"] = static_cast<double>(bytes.size()) * 1e-6;
  state.counters["50 MB"] = run.time.count() / (static_cast<double>(bytes.size()) / 50e6);
}

void OpenProject(benchmark::State& state)
{
  Open(state, Project(static_cast<unsigned>(state.range(0)), 8192, false), ".aep");
}
void OpenProjectOfOneComposition(benchmark::State& state)
{
  Open(state, OneComposition(static_cast<unsigned>(state.range(0)), 8192), ".aep");
}
void OpenXmlProject(benchmark::State& state)
{
  Open(state, Project(static_cast<unsigned>(state.range(0)), 2048, true), ".aepx");
}

BENCHMARK(OpenProject)->Arg(10'000)->Arg(20'000)->Apply(OneBest);
BENCHMARK(OpenProjectOfOneComposition)->Arg(10'000)->Arg(20'000)->Apply(OneBest);
BENCHMARK(OpenXmlProject)->Arg(10'000)->Arg(20'000)->Apply(OneBest);

} // namespace
