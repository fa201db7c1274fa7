// Scenes as glTF: nodes, and keys.
#include <cmath>
#include <memory>
#include <string>

#include "gltf/converter.h"
#include "measure.h"
#include "torvane/animation/ctrack.h"
#include "torvane/document/base_document.h"
#include "torvane/objects/base_object.h"

namespace
{

using namespace _torvane_;
using namespace benchmarks;

struct FreeDocument
{
  void operator()(BaseDocument* document) const { BaseDocument::Free(document); }
};
using DocumentPtr = std::unique_ptr<BaseDocument, FreeDocument>;

constexpr Long kKeysEach = 1000;
constexpr Long kTracksEach = 9;

// Planes under groups of a hundred.
DocumentPtr MakeNodes(Long count)
{
  DocumentPtr document(CreateDocument());
  BaseObject* group = nullptr;
  for (Long i = 0; i < count; ++i) {
    const bool isGroup = i % 100 == 0;
    BaseObject* object = AllocObject(isGroup ? kObjectNull : kObjectPlane);
    object->SetName(String(("object " + std::to_string(i % 1000)).c_str()));
    object->SetRelPos(Vector(0.25 * (i % 37), 0.1 * (i % 101), -0.3 * (i % 53)));
    object->SetRelRot(Vector(0.01 * (i % 311), 0.1, 0.0));
    if (isGroup) {
      document->InsertObject(object);
      group = object;
    } else {
      object->InsertUnderLast(group);
    }
  }
  return document;
}

// Every value another one, so that no key can go.
DocumentPtr MakeKeys(Long objects)
{
  DocumentPtr document(CreateDocument());
  for (Long n = 0; n < objects; ++n) {
    BaseObject* object = AllocObject(kObjectNull);
    document->InsertObject(object);
    for (Long i = 0; i < kTracksEach; ++i) {
      constexpr Long kVectors[] = {kObjectRelPos, kObjectRelRot, kObjectRelScale};
      const ParameterPath path = {ParameterLevel{kVectors[i / 3], kDataVector, 0},
                                  ParameterLevel{kVectorX + i % 3, kDataReal, 0}};
      CTrack* track = CTrack::Alloc(object, path, "Track");
      object->InsertTrackLast(track);
      CCurve* curve = track->GetCurve(1, 1);
      for (Long k = 0; k < kKeysEach; ++k)
        curve->AddKey(BaseTime(k, 30))->SetValue(curve, 1.0 + 0.5 * std::sin(0.1 * k + n + i));
    }
  }
  return document;
}

void ConvertDocument(benchmark::State& state, DocumentPtr (*make)(Long), double thingsEach)
{
  const auto count = static_cast<Long>(state.range(0));
  RunTogether(state, [&] {
    const DocumentPtr document = make(count);
    return BestOfThree([&] { return Measure([&] { benchmark::DoNotOptimize(gltf::Convert(*document, {})); }); });
  });
  SetRate(state, static_cast<double>(count) * thingsEach);
}

void ConvertNodes(benchmark::State& state) { ConvertDocument(state, MakeNodes, 1); }
void ConvertKeys(benchmark::State& state) { ConvertDocument(state, MakeKeys, kTracksEach * kKeysEach); }

BENCHMARK(ConvertNodes)->Arg(100'000)->Arg(200'000)->Apply(OneBest);
BENCHMARK(ConvertKeys)->Arg(150)->Arg(300)->Apply(OneBest);

} // namespace
