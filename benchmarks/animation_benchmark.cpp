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
constexpr double kKeyDoubles = 247.0 / sizeof(double); // that a key takes in a file
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

void SetKey(CCurve& curve, const BaseTime& time, Real value)
{
  KeyValues key;
  key.time = time;
  key.value = value;
  curve.SetKeyValues(key);
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
      SetKey(*curves[i], BaseTime(k, 30), values[i]);
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

Run Save(BaseDocument& document, const ScratchFile& scratch)
{
  scratch.Remove();
  return Measure([&] {
    if (!SaveDocument(&document, Filename(scratch.Path().c_str()), 0))
      throw std::runtime_error("the document can't be saved");
  });
}

Run Load(const ScratchFile& scratch)
{
  DocumentPtr document;
  return Measure([&] {
    document.reset(LoadDocument(Filename(scratch.Path().c_str()), LoadObjects | LoadMaterials));
    if (!document)
      throw std::runtime_error("the document can't be loaded");
  });
}

// Makes the document, and saves it once before what counts: that draws the markers of its nodes.
template <typename Make>
Run SaveMade(const ScratchFile& scratch, Make&& make)
{
  const DocumentPtr document = make();
  Save(*document, scratch);
  return BestOfThree([&] { return Save(*document, scratch); });
}

double KeysOf(const benchmark::State& state) { return static_cast<double>(state.range(0)) * kTracksEach * kKeysEach; }

void WriteAnimatedScene(benchmark::State& state)
{
  const ScratchFile scratch;
  RunTogether(state,
              [&] { return SaveMade(scratch, [&] { return MakeAnimatedScene(static_cast<Long>(state.range(0))); }); });
  SetRate(state, KeysOf(state), DoubleWriteLimit() / kKeyDoubles);
}

void ReadAnimatedScene(benchmark::State& state)
{
  const ScratchFile scratch;
  Prepare([&] { Save(*MakeAnimatedScene(static_cast<Long>(state.range(0))), scratch); });
  const Run run = RunFresh(state, [&] { return Load(scratch); });
  SetRate(state, KeysOf(state), DoubleReadLimit() / kKeyDoubles);
  state.counters["bytes/key"] = static_cast<double>(run.memory) / KeysOf(state);
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
    SetKey(*curve, BaseTime(k, kManyFrames), 0.001 * k);
  return document;
}

void SaveLongCurve(benchmark::State& state)
{
  const ScratchFile scratch;
  RunTogether(state,
              [&] { return SaveMade(scratch, [&] { return MakeLongCurve(static_cast<Long>(state.range(0))); }); });
  SetRate(state, static_cast<double>(state.range(0)));
}

void LoadLongCurve(benchmark::State& state)
{
  const ScratchFile scratch;
  Prepare([&] { Save(*MakeLongCurve(static_cast<Long>(state.range(0))), scratch); });
  RunFresh(state, [&] { return Load(scratch); });
  SetRate(state, static_cast<double>(state.range(0)));
}

// Values that change in every fourth frame: the two keys in the middle of each four are left out.
void ThinLongCurve(benchmark::State& state)
{
  const auto frames = static_cast<Long>(state.range(0));
  RunFresh(state, [&] {
    const std::unique_ptr<BaseObject> object(AllocObject(kObjectNull));
    const Run run = Measure([&] {
      exporter::SampledTrack track(object.get(), ComponentPath(kObjectRelPos, 0), "Track");
      for (Long frame = 0; frame < frames; ++frame)
        track.Add(BaseTime(frame, kManyFrames), frame / 4);
      track.Finish();
    });
    const Long kept = object->GetFirstTrack() ? object->GetFirstTrack()->GetCurve(1, 0)->GetKeyCount() : 0;
    if (kept < frames / 2 || kept > frames / 2 + 2)
      throw std::runtime_error("other keys were kept than expected");
    return run;
  });
  SetRate(state, static_cast<double>(frames));
}

BENCHMARK(SaveLongCurve)->Arg(500'000)->Arg(1'000'000)->Apply(OneBest);
BENCHMARK(LoadLongCurve)->Arg(500'000)->Arg(1'000'000)->Apply(OneBest);
BENCHMARK(ThinLongCurve)->Arg(1'000'000)->Arg(2'000'000)->Apply(OneBest);

} // namespace
