// Whatever lacks memory fails or does all that it does with enough: nothing is left out without a word.
#include <fstream>

#include "support/full_scene.h"
#include "support/library.h"

namespace
{

using namespace full_scene;

const auto kSaved = [](const DocumentPtr& document) { return SavedScene(*document); };

TEST(FailedAllocations, FailALoadOrTakeNothingFromIt)
{
  const Bytes whole = SaveToBytes(*MakeFullScene());
  FileProblem problem;
  EveryFailedAllocation(
      [&] {
        DocumentPtr document = LoadFromBytes(whole, 3, &problem);
        EXPECT_EQ(problem.code, document ? FILEERROR_NONE : FILEERROR_MEMORY);
        return document;
      },
      kSaved);
}

TEST(FailedAllocations, FailACopyOrTakeNothingFromIt)
{
  const DocumentPtr document = MakeFullScene();
  EveryFailedAllocation([&] { return DocumentPtr(static_cast<BaseDocument*>(document->MakeClone(0, nullptr))); },
                        kSaved);
}

TEST(FailedAllocations, FailALoadOrASave)
{
  const Bytes whole = SaveToBytes(*MakeFullScene());
  const TempFolder folder;
  const std::string path = folder / "saved.q7r";
  EveryFailedAllocation(
      [&] {
        FileProblem problem;
        const DocumentPtr document = LoadFromBytes(whole);
        SaveDocument(document.get(), Filename(path.c_str()), 0, &problem);
        return document && problem.code == FILEERROR_NONE;
      },
      [&](bool) {
        std::ifstream file(path, std::ios::binary);
        return Comparable({std::istreambuf_iterator<char>(file), {}});
      });
}

TEST(FailedAllocations, FailAMerge)
{
  const Bytes whole = SaveToBytes(*MakeFullScene());
  EveryFailedAllocation(
      [&] {
        DocumentPtr target = NewDocument();
        Filename name;
        name.SetMemoryRead(whole.data(), static_cast<LLong>(whole.size()));
        return target && MergeDocument(target.get(), name, 3) ? std::move(target) : nullptr;
      },
      kSaved);
}

std::string TextOf(const GeData& value)
{
  switch (value.GetType()) {
  case kDataLong:
  case kDataReal:
    return std::to_string(value.GetReal());
  case kDataVector:
    return std::to_string(value.GetVector().x) + " " + std::to_string(value.GetVector().z);
  case kDataTime:
    return std::to_string(value.GetTime().Get());
  case kDataString:
    return Utf8(value.GetString());
  case kDataFilename:
    return Utf8(value.GetFilename().GetString());
  default:
    return "type " + std::to_string(value.GetType()) + (value.GetLink() ? " linked" : "");
  }
}

// Another value of the same type.
GeData Another(const GeData& value, BaseList2D& target)
{
  GeAliasLink link;
  link.SetLink(&target);
  switch (value.GetType()) {
  case kDataVector:
    return GeData(value.GetVector() + Vector(0.25, 0.25, 0.25));
  case kDataTime:
    return GeData(BaseTime(7, 25));
  case kDataString:
    return GeData(String(kText));
  case kDataFilename:
    return GeData(Filename(kText));
  case kDataLink:
    return GeData(link);
  default:
    return value.GetType() == kDataReal ? GeData(value.GetReal() + 0.25) : GeData(value.GetLong() == 0 ? 1 : 0);
  }
}

// Each parameter that a node answers, got and set by itself.
template <class Make>
void ExpectWholeParameters(Make&& make)
{
  using NodePtr = std::unique_ptr<BaseList2D>;
  const NodePtr node(make());
  BaseList2D target;
  const auto text = [](const auto& value) { return TextOf(*value); };
  for (const auto& [first, last] : {std::pair<Long, Long>{1, 5300},
                                    {50000, 50020},
                                    {60000, 60010},
                                    {70000, 70030},
                                    {80000, 80016},
                                    {90000, 90034},
                                    {91000, 91010}}) {
    for (Long id = first; id < last; ++id) {
      GeData value;
      if (!node->GetParameterById(id, value) || value.GetType() == kDataNil || value.GetType() == kDataContainer)
        continue;
      SCOPED_TRACE(std::string(node->GetNodeKind().name) + " parameter " + std::to_string(id));
      const GeData other = Another(value, target);
      const auto get = [id](BaseList2D& from) {
        auto got = std::make_unique<GeData>();
        return from.GetParameter(ParameterPath(id), *got) ? std::move(got) : nullptr;
      };
      EveryFailedAllocation([&] { return get(*node); }, text);
      const NodePtr whole(make());
      if (whole->SetParameter(ParameterPath(id), other)) {
        EveryFailedAllocation(
            [&] {
              NodePtr made(make());
              return made && made->SetParameter(ParameterPath(id), other) ? std::move(made) : nullptr;
            },
            [&](const NodePtr& made) { return TextOf(*get(*made)); });
      }
    }
  }
}

TEST(FailedAllocations, FailToGetOrToSetAParameterOrDoItWhole)
{
  for (Long type : {kObjectLight, kObjectCamera, kObjectNull})
    ExpectWholeParameters([type] { return AllocObject(type); });
  for (Long type : {kTagTexture, kTagDisplay, kTagUVW, kTagWeight})
    ExpectWholeParameters([type] { return MakeTag(type); });
  ExpectWholeParameters([] { return NewObj<CTrack>(); });
  ExpectWholeParameters([] { return NewObj<CKey>(); });
  ExpectWholeParameters([] { return AllocLayer(); });
  ExpectWholeParameters([] { return NewDocument().release(); });
}

// The bytes that a new node writes.
template <class Make>
void ExpectWholeOrNone(Make&& make)
{
  using Node = std::remove_pointer_t<decltype(make())>;
  EveryFailedAllocation([&] { return std::unique_ptr<Node>(make()); },
                        [](const auto& node) { return Comparable(BytesOf(*node)); });
}

TEST(FailedAllocations, MakeWholeNodesOrNone)
{
  for (Long type : {kObjectPolygon, kObjectSpline, kObjectLight, kObjectCamera, kObjectNull, kObjectPlane,
                    kObjectPointBased, kObjectJoint, kObjectSky, kObjectGeneric})
    ExpectWholeOrNone([type] { return AllocObject(type); });
  for (Long type : {kTagPoint, kTagTexture, kTagDisplay, kTagUVW, kTagWeight, kTagTarget, kTagPlugin})
    ExpectWholeOrNone([type] { return MakeTag(type); });
  // This one holds the time at which it was made.
  EveryFailedAllocation([] { return std::unique_ptr<BaseTag>(MakeTag(kTagCompositing)); });
  for (Long type : {kMaterialStandard, kMaterialPlugin, Long{1234567}})
    ExpectWholeOrNone([type] { return MakeMaterial(type); });
  ExpectWholeOrNone([] { return MakeShader(kShaderBitmap); });
  ExpectWholeOrNone([] { return AllocLayer(); });
  ExpectWholeOrNone([] { return AllocRenderData(); });
  EveryFailedAllocation(NewDocument, kSaved);
}

} // namespace
