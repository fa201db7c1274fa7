// Whatever lacks memory fails or does all that it does with enough: nothing is left out without a word.
#include <fstream>

#include <gtest/gtest.h>

#include "q7r_file/node_bytes.h"
#include "support/every_failed_allocation.h"
#include "support/full_scene.h"
#include "support/temp_folder.h"

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
