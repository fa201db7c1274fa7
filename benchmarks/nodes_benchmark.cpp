// Many small objects in a tree of three levels, each with a texture tag to one of a thousand materials: written and
// read as whole scene files, in nodes a second. Twice the groups are twice the nodes.
#include <cstdio>
#include <memory>
#include <vector>

#include "machine_limits.h"
#include "measure.h"
#include "torvane/document/base_document.h"
#include "torvane/materials/material.h"
#include "torvane/memory/owned.h"
#include "torvane/objects/base_object.h"
#include "torvane/tags/texture_tag.h"

namespace
{

using namespace _torvane_;
using namespace benchmarks;

constexpr int kSubsOfGroup = 27;
constexpr int kObjectsOfSub = 36;
constexpr int kNodesOfGroup = 1 + kSubsOfGroup * (1 + kObjectsOfSub);
constexpr std::size_t kMaterials = 1000;

using DocumentPtr = Owned<BaseDocument>;

using MaterialList = std::vector<BaseMaterial*>; // by number

template <typename... Numbers>
String Named(const char* form, Numbers... numbers)
{
  char name[40];
  std::snprintf(name, sizeof name, form, numbers...);
  return String(name);
}

// A null object, number `index` of the scene, with its texture tag.
BaseObject* MakeNode(const String& name, int index, const MaterialList& materials)
{
  BaseObject* object = AllocObject(kObjectNull);
  object->SetName(name);
  object->SetRelPos({0.25 * (index % 37) + 0.125, 0.1 * (index % 101), -0.3 * (index % 53)});
  object->SetRelRot({0.01 * (index % 311) + 0.1, 0, 0});
  object->SetRelScale({1 + 0.01 * (index % 7), 1 + 0.01 * (index % 5), 1 + 0.01 * (index % 3)});
  static_cast<TextureTag*>(object->MakeTag(kTagTexture))
      ->SetMaterial(materials[static_cast<std::size_t>(index) % kMaterials]);
  return object;
}

MaterialList AddMaterials(BaseDocument& document)
{
  MaterialList materials;
  for (std::size_t i = 0; i < kMaterials; ++i) {
    BaseMaterial* last = materials.empty() ? nullptr : materials.back();
    materials.push_back(AllocMaterial());
    materials.back()->SetName(Named("mat_%04d", static_cast<int>(i)));
    document.InsertMaterial(materials.back(), last);
  }
  return materials;
}

DocumentPtr MakeScene(int groups)
{
  DocumentPtr document(CreateDocument());
  const MaterialList materials = AddMaterials(*document);
  int index = 0;
  BaseObject* last = nullptr;
  for (int g = 0; g < groups; ++g) {
    BaseObject* group = MakeNode(Named("grp_%03d", g), index++, materials);
    document->InsertObject(group, last);
    last = group;
    for (int s = 0; s < kSubsOfGroup; ++s) {
      BaseObject* sub = MakeNode(Named("sub_%03d_%02d", g, s), index++, materials);
      sub->InsertUnderLast(group);
      for (int o = 0; o < kObjectsOfSub; ++o)
        MakeNode(Named("obj_%03d_%02d_%02d", g, s, o), index++, materials)->InsertUnderLast(sub);
    }
  }
  return document;
}

Run Write(BaseDocument& document, const ScratchFile& scratch)
{
  scratch.Remove();
  return Measure([&] {
    FileProblem problem;
    if (!SaveDocument(&document, Filename(scratch.Path().c_str()), 0, &problem) || problem.code != FILEERROR_NONE)
      throw std::runtime_error("the scene can't be written");
  });
}

// The last object of all must have come back with its material.
bool IsWhole(const BaseDocument& document, int groups)
{
  BaseObject* object = document.GetFirstObject();
  while (object && object->GetNext())
    object = object->GetNext();
  while (object && object->GetDown())
    object = static_cast<BaseObject*>(object->GetDownLast());
  auto* tag = object ? static_cast<TextureTag*>(object->GetTag(kTagTexture)) : nullptr;
  const BaseList2D* material = tag ? tag->GetMaterial(&document) : nullptr;
  const int lastIndex = groups * kNodesOfGroup - 1;
  return material && material->GetName() == Named("mat_%04d", lastIndex % static_cast<int>(kMaterials));
}

void SetNodeRate(benchmark::State& state)
{
  SetRate(state, static_cast<double>(state.range(0)) * kNodesOfGroup, NodeLimit());
}

void WriteNodes(benchmark::State& state)
{
  const ScratchFile scratch;
  RunTogether(state, [&] {
    const DocumentPtr document = MakeScene(static_cast<int>(state.range(0)));
    Write(*document, scratch); // draws the markers of the nodes
    return BestOfThree([&] { return Write(*document, scratch); });
  });
  SetNodeRate(state);
}

void ReadNodes(benchmark::State& state)
{
  const ScratchFile scratch;
  const int groups = static_cast<int>(state.range(0));
  Prepare([&] {
    const DocumentPtr document = MakeScene(groups);
    Write(*document, scratch);
    Write(*document, scratch); // most files hold the check sums of a write before
  });
  const Run run = RunFresh(state, [&] {
    DocumentPtr document;
    const Run load =
        Measure([&] { document.reset(LoadDocument(Filename(scratch.Path().c_str()), LoadObjects | LoadMaterials)); });
    if (!document || !IsWhole(*document, groups))
      throw std::runtime_error("the scene doesn't come back whole");
    return load;
  });
  SetNodeRate(state);
  state.counters["bytes/node"] = static_cast<double>(run.memory) / (static_cast<double>(groups) * kNodesOfGroup);
}

BENCHMARK(WriteNodes)->Arg(100)->Arg(200)->Apply(OneBest);
BENCHMARK(ReadNodes)->Arg(100)->Arg(200)->Apply(OneBest);

} // namespace
