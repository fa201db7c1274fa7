// A mesh of a million points, saved and loaded: how far the file and the memory are from the machine's limits.
#include <cmath>
#include <memory>

#include "machine_limits.h"
#include "measure.h"
#include "torvane/document/base_document.h"
#include "torvane/memory/owned.h"
#include "torvane/objects/point_object.h"
#include "torvane/tags/value_tags.h"

namespace
{

using namespace _torvane_;
using namespace benchmarks;

constexpr Long kAround = 1000; // points around the tube
constexpr double kGeometryPerPoint = sizeof(Vector) + sizeof(PolygonCorners) + sizeof(PackedUVWQuad);

using DocumentPtr = Owned<BaseDocument>;

void FillPoints(Vector* points, Long rings)
{
  constexpr double kTurn = 2 * 3.141592653589793;
  for (Long i = 0; i < rings; ++i) {
    const double along = kTurn * i / rings;
    for (Long j = 0; j < kAround; ++j) {
      const double around = kTurn * j / kAround;
      const double distance = 10 + 3 * std::cos(around);
      *points++ = Vector(distance * std::cos(along), 3 * std::sin(around), distance * std::sin(along));
    }
  }
}

void FillPolygons(PolygonCorners* polygons, UVWTag& uvw, Long rings)
{
  for (Long i = 0; i < rings; ++i) {
    for (Long j = 0; j < kAround; ++j) {
      const Long nextI = (i + 1) % rings;
      const Long nextJ = (j + 1) % kAround;
      const Long index = i * kAround + j;
      polygons[index] = {index, nextI * kAround + j, nextI * kAround + nextJ, i * kAround + nextJ};
      auto corner = [&](Long a, Long b) { return Vector(double(a) / rings, double(b) / kAround, 0); };
      uvw.WritePolygonUVW(index, {corner(i, j), corner(nextI, j), corner(nextI, nextJ), corner(i, nextJ)});
    }
  }
}

// A torus that closes in both directions: as many quads as points.
DocumentPtr MakeTorus(Long rings)
{
  DocumentPtr document(CreateDocument());
  BaseObject* torus = AllocObject(kObjectPolygon);
  document->InsertObject(torus);
  const Long count = rings * kAround;
  if (!ResizePolygons(*torus, count, count, -1) || !AddUVWTag(*torus))
    return nullptr;
  FillPoints(GetPointTag(*torus)->GetArray(), rings);
  FillPolygons(GetPolygonTag(*torus)->GetArray(), *static_cast<UVWTag*>(torus->GetTag(kTagUVW)), rings);
  return document;
}

bool IsWhole(const BaseDocument& document, Long rings)
{
  const BaseObject* torus = document.GetFirstObject();
  const Long count = rings * kAround;
  const auto* uvw = torus ? static_cast<const UVWTag*>(torus->GetTag(kTagUVW)) : nullptr;
  Vector corners[4];
  return uvw && GetPointCount(*torus) == count && GetPolygonCount(*torus) == count && uvw->GetCount() == count &&
         GetPolygonTag(*torus)->GetArray()[count - 1].c == 0 && uvw->ReadPolygonUVW(count - 1, corners) &&
         corners[0].x == static_cast<double>(static_cast<float>(double(rings - 1) / rings));
}

// Doubles of geometry beside those of the limit; "memory" is the most that a run took, as a part of the geometry.
void SetMeshRate(benchmark::State& state, const Run& run, double limit)
{
  const double bytes = static_cast<double>(state.range(0)) * kAround * kGeometryPerPoint;
  SetRate(state, bytes / sizeof(double), limit);
  state.counters["memory"] = static_cast<double>(run.memory) / bytes;
}

Run Save(BaseDocument& document, const ScratchFile& scratch)
{
  scratch.Remove();
  return Measure([&] {
    FileProblem problem;
    if (!SaveDocument(&document, Filename(scratch.Path().c_str()), 0, &problem) || problem.code != FILEERROR_NONE)
      throw std::runtime_error("the document can't be saved");
  });
}

void SaveMesh(benchmark::State& state)
{
  const ScratchFile scratch;
  const Run run = RunTogether(state, [&] {
    const DocumentPtr document = MakeTorus(static_cast<Long>(state.range(0)));
    Save(*document, scratch);
    return BestOfThree([&] { return Save(*document, scratch); });
  });
  SetMeshRate(state, run, DoubleWriteLimit());
}

void LoadMesh(benchmark::State& state)
{
  const ScratchFile scratch;
  const Long rings = static_cast<Long>(state.range(0));
  Prepare([&] { Save(*MakeTorus(rings), scratch); });
  const Run run = RunFresh(state, [&] {
    DocumentPtr document;
    const Run load =
        Measure([&] { document.reset(LoadDocument(Filename(scratch.Path().c_str()), LoadObjects | LoadMaterials)); });
    if (!document || !IsWhole(*document, rings))
      throw std::runtime_error("the document came back otherwise");
    return load;
  });
  SetMeshRate(state, run, DoubleReadLimit());
}

BENCHMARK(SaveMesh)->Arg(1000)->Arg(2000)->Apply(OneBest);
BENCHMARK(LoadMesh)->Arg(1000)->Arg(2000)->Apply(OneBest);

} // namespace
