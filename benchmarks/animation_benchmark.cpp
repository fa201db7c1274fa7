// Keys: scenes full of them, and one long curve.
#include <cmath>
#include <cstdio>
#include <memory>

#include "exporter/walk/keyframes.h"
#include "machine_limits.h"
#include "measure.h"
#include "torvane/animation/ctrack.h"
#include "torvane/document/base_document.h"
#include "torvane/memory/owned.h"
#include "torvane/objects/base_object.h"

namespace
{

using namespace _torvane_;
using namespace benchmarks;

using DocumentPtr = Owned<BaseDocument>;

constexpr Long kVectors[] = {kObjectRelPos, kObjectRelRot, kObjectRelScale};
constexpr Long kKeysEach = 1000;
constexpr Long kTracksEach = 9;
constexpr Real kDegree = 3.141592653589793 / 180.0;

ParameterPath ComponentPath(Long vector, Long component)
{
  return {ParameterLevel{vector, kDataVector, 0}, ParameterLevel{kVectorX + component, kDataReal, 0}};
}

// Position, rotation and scale of object n at key k.
void FillValues(Long n, Long k, Real (&values)[kTracksEach])
{
  const Real s = 1.0 + 0.1 * std::sin(0.02 * k + n);
  const Real all[kTracksEach] = {0.1 * n + std::sin(0.01 * k + n),
                                 0.02 * k,
                                 std::cos(0.013 * k + n),
                                 0.1 * k * kDegree,
                                 0.002 * k + 0.005 * n,
                                 0.05 * k + n * kDegree,
                                 s,
                                 1.0 + 0.0001 * k,
                                 1.0 / s};
  std::copy(std::begin(all), std::end(all), values);
}

void Animate(BaseObject& object, Long n)
{
  CCurve* curves[kTracksEach];
  for (Long i = 0; i < kTracksEach; ++i) {
    CTrack* track = CTrack::Alloc(&object, ComponentPath(kVectors[i / 3], i % 3), "Track");
    object.InsertTrackLast(track);
    curves[i] = track->GetCurve(1, 1);
  }
  for (Long k = 0; k < kKeysEach; ++k) {
    Real values[kTracksEach];
    FillValues(n, k, values);
    for (Long i = 0; i < kTracksEach; ++i)
      curves[i]->AddKey(BaseTime(k, 30))->SetValue(curves[i], values[i]);
  }
}

DocumentPtr MakeAnimatedScene(Long objects)
{
  DocumentPtr document(CreateDocument());
  for (Long n = objects - 1; n >= 0; --n) { // the first one ends up on top
    BaseObject* object = AllocObject(kObjectNull);
    char name[20];
    std::snprintf(name, sizeof name, "anim_%03d", n);
    object->SetName(name);
    document->InsertObject(object);
    Animate(*object, n);
  }
  return document;
}

// Saves the document, or says on the benchmark that it can't.
Seconds Save(benchmark::State& state, BaseDocument& document, const ScratchFile& scratch)
{
  return TimeOf([&] {
    if (!SaveDocument(&document, Filename(scratch.Path().c_str()), 0))
      state.SkipWithError("the document can't be saved");
  });
}

Seconds Load(benchmark::State& state, const ScratchFile& scratch)
{
  DocumentPtr document;
  const Seconds time =
      TimeOf([&] { document.reset(LoadDocument(Filename(scratch.Path().c_str()), LoadObjects | LoadMaterials)); });
  if (!document)
    state.SkipWithError("the document can't be loaded");
  return time;
}

void WriteAnimatedScene(benchmark::State& state)
{
  const ScratchFile scratch;
  const auto objects = static_cast<Long>(state.range(0));
  const double keys = static_cast<double>(objects) * kTracksEach * kKeysEach;
  const std::int64_t before = PresentMemory();
  ResetPeakMemory();
  const DocumentPtr document = MakeAnimatedScene(objects);
  RunBest(state, [&] { return Save(state, *document, scratch); });
  SetRate(state, keys, ValueWriteLimit());
  state.counters["bytes/key"] = static_cast<double>(PeakMemory() - before) / keys;
}

void ReadAnimatedScene(benchmark::State& state)
{
  const ScratchFile scratch;
  const auto objects = static_cast<Long>(state.range(0));
  const double keys = static_cast<double>(objects) * kTracksEach * kKeysEach;
  Save(state, *MakeAnimatedScene(objects), scratch);
  RunBest(state, [&] { return Load(state, scratch); });
  SetRate(state, keys, ValueReadLimit());
}

BENCHMARK(WriteAnimatedScene)->Arg(300)->Arg(600)->Apply(OneBest);
BENCHMARK(ReadAnimatedScene)->Arg(300)->Arg(600)->Apply(OneBest);

// --- One curve

constexpr Long kManyFrames = 1000; // a second, so that a million keys end well before the last second of a curve

DocumentPtr MakeLongCurve(Long keys)
{
  DocumentPtr document(CreateDocument());
  BaseObject* object = AllocObject(kObjectNull);
  document->InsertObject(object);
  CTrack* track = CTrack::Alloc(object, ComponentPath(kObjectRelPos, 0), "Track");
  object->InsertTrackLast(track);
  CCurve* curve = track->GetCurve(1, 1);
  for (Long k = 0; k < keys; ++k)
    curve->AddKey(BaseTime(k, kManyFrames))->SetValue(curve, 0.001 * k);
  return document;
}

void SaveLongCurve(benchmark::State& state)
{
  const ScratchFile scratch;
  const DocumentPtr document = MakeLongCurve(static_cast<Long>(state.range(0)));
  RunBest(state, [&] { return Save(state, *document, scratch); });
  SetRate(state, static_cast<double>(state.range(0)));
}

void LoadLongCurve(benchmark::State& state)
{
  const ScratchFile scratch;
  Save(state, *MakeLongCurve(static_cast<Long>(state.range(0))), scratch);
  RunBest(state, [&] { return Load(state, scratch); });
  SetRate(state, static_cast<double>(state.range(0)));
}

// Values that change in every fourth frame: the two keys in the middle of each four are left out.
void ThinLongCurve(benchmark::State& state)
{
  const auto frames = static_cast<Long>(state.range(0));
  RunBest(state, [&] {
    const std::unique_ptr<BaseObject> object(AllocObject(kObjectNull));
    const Seconds time = TimeOf([&] {
      exporter::SampledTrack track(object.get(), ComponentPath(kObjectRelPos, 0), "Track");
      for (Long frame = 0; frame < frames; ++frame)
        track.Add(BaseTime(frame, kManyFrames), frame / 4);
      track.Finish();
    });
    const Long kept = object->GetFirstTrack() ? object->GetFirstTrack()->GetCurve(1, 0)->GetKeyCount() : 0;
    if (kept < frames / 2 || kept > frames / 2 + 2)
      state.SkipWithError("other keys were kept than expected");
    return time;
  });
  SetRate(state, static_cast<double>(frames));
}

BENCHMARK(SaveLongCurve)->Arg(500'000)->Arg(1'000'000)->Apply(OneBest);
BENCHMARK(LoadLongCurve)->Arg(500'000)->Arg(1'000'000)->Apply(OneBest);
BENCHMARK(ThinLongCurve)->Arg(1'000'000)->Arg(2'000'000)->Apply(OneBest);

} // namespace
