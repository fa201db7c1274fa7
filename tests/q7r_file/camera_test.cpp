// Cameras: the entries of a new one, and the parameters that are computed from them.
#include <cmath>
#include <string>
#include <tuple>
#include <vector>

#include <gtest/gtest.h>

#include "q7r_file/node_bytes.h"
#include "support/counting_memory.h"
#include "support/record_samples.h"
#include "support/scene_bytes.h"
#include "support/text.h"
#include "torvane/memory/owned.h"
#include "torvane/objects/base_object.h"
#include "torvane/objects/camera_object_data.h"
#include "torvane/tags/base_tag.h"
#include "torvane/values/ge_data.h"

namespace
{

using namespace _torvane_;

using ObjectPtr = Owned<BaseObject>;

ObjectPtr NewCamera() { return ObjectPtr(AllocObject(kObjectCamera)); }

GeData Get(BaseObject& camera, Long id)
{
  GeData value;
  EXPECT_TRUE(camera.GetParameterById(id, value)) << id;
  return value;
}

BaseContainer& Entries(const ObjectPtr& camera) { return camera->GetDataInstance(); }

} // namespace

TEST(Camera, IsNothingWithoutItsObject)
{
  const ObjectPtr camera = NewCamera();
  EXPECT_EQ(camera->GetDiskType(), 5154);
  EXPECT_FALSE(CameraObjectData().Init());
  GeData value;
  EXPECT_FALSE(CameraObjectData().GetParameterById(1008, value));
  EXPECT_FALSE(CameraObjectData().SetParameterById(1008, GeData(1.0)));
}

TEST(Camera, NumbersItsPresetsFromOne)
{
  struct List
  {
    Long id, storedId;
    Long start; // the position of a new camera's value
    Real tolerance;
    Bool outsideResult;
    std::vector<Real> values;
  };
  const List lists[] = {
      {1131, 1006, 3, 0.001, true, {4.8, 9.6, 36.0, 22.0, 52.5}},
      {1132, 500, 3, 0.001, true, {15.0, 25.0, 36.0, 50.0, 80.0, 135.0, 300.0}},
      {1200, 1201, 19, 0.001, true, {1.0, 1.1, 1.2, 1.4, 1.6, 1.8, 2.0, 2.2, 2.5, 2.8, 3.2,  3.5,  4.0,  4.5,
                                     5.0, 5.6, 6.3, 7.1, 8.0, 9.0, 10., 11., 13., 14., 16.0, 18.0, 20.0, 22.0}},
      {1215,
       1211,
       6,
       0.0001,
       true,
       {0.001, 0.002, 0.004, 0.008, 0.016666666666666666, 0.03333333333333333, 0.06666666666666667, 0.125, 0.25, 1.0,
        2.0, 4.0, 8.0, 15.0, 30.0}},
      {1232, 1231, 3, 0.001, true, {50, 100, 200, 400, 800, 1600, 3200, 6400}},
      {1310, 1311, 5, 0.001, false, {2000, 3000, 4500, 5500, 6500, 7500, 9000}}};
  for (const List& list : lists) {
    SCOPED_TRACE(list.id);
    const ObjectPtr camera = NewCamera();
    const Long before = Entries(camera).GetCount();
    EXPECT_EQ(Get(*camera, list.id).GetLong(), list.start);
    const Long count = static_cast<Long>(list.values.size());
    for (Long position = 1; position <= count; ++position) {
      EXPECT_TRUE(camera->GetObjectData()->SetParameterById(list.id, GeData(position)));
      const Real value = list.values[static_cast<std::size_t>(position - 1)];
      EXPECT_EQ(Entries(camera).GetReal(list.storedId), value);
      for (Real offset : {0.0, 0.9 * list.tolerance, -0.9 * list.tolerance}) {
        Entries(camera).SetReal(list.storedId, value + offset);
        EXPECT_EQ(Get(*camera, list.id).GetLong(), position) << offset;
      }
    }
    Entries(camera).SetReal(list.storedId, list.values[0] - 1.1 * list.tolerance);
    EXPECT_EQ(Get(*camera, list.id).GetLong(), 0);
    Entries(camera).SetReal(list.storedId, 77.0);
    for (Long position : {-1, 0, count + 1, 1000}) {
      EXPECT_EQ(camera->GetObjectData()->SetParameterById(list.id, GeData(position)), list.outsideResult);
      EXPECT_EQ(Entries(camera).GetReal(list.storedId), 77.0);
    }
    EXPECT_EQ(Entries(camera).GetCount(), before);
  }
}

TEST(Camera, RelatesFieldsOfViewToTheFocalLength)
{
  const DocumentPtr document = NewDocument();
  RenderData* render = document->GetFirstRenderData();
  BaseObject* camera = AllocObject(kObjectCamera);
  document->InsertObject(camera);
  BaseContainer& entries = camera->GetDataInstance();
  struct Case
  {
    Long id;
    Long lens;   // 5033 of the render settings
    Real aspect; // 6006
    Real factor;
  };
  constexpr Case kCases[] = {{1008, 1100, 2, 1}, {4600, 1100, 2, 0.5}, {4600, 1150, 2, 1}, {4600, 0, 0.25, 4}};
  for (const Case& c : kCases) {
    render->GetDataInstance().SetLong(5033, c.lens);
    render->GetDataInstance().SetReal(6006, c.aspect);
    entries.SetReal(500, 36);
    EXPECT_DOUBLE_EQ(Get(*camera, c.id).GetReal(), 2 * std::atan(0.5 * c.factor)) << c.id;
    entries.SetReal(1006, 20);
    EXPECT_TRUE(camera->SetParameterById(c.id, GeData(1.2)));
    EXPECT_DOUBLE_EQ(entries.GetReal(500), 10 / std::tan(0.6) * c.factor) << c.id;
    EXPECT_DOUBLE_EQ(Get(*camera, c.id).GetReal(), c.factor == 1 ? 1.2 : 2 * std::atan(std::tan(0.6))) << c.id;
    entries.SetReal(1006, 36);
    for (Real angle : {0.0, -1.0, std::nan("")}) {
      EXPECT_TRUE(camera->GetObjectData()->SetParameterById(c.id, GeData(angle)));
      EXPECT_DOUBLE_EQ(entries.GetReal(500), 10 / std::tan(0.6) * c.factor) << angle;
    }
    for (Real length : {0.0, -36.0}) {
      entries.SetReal(500, length);
      EXPECT_EQ(Get(*camera, c.id).GetType(), 0) << length;
    }
  }
  // Outside a document the vertical field has no factor.
  const ObjectPtr alone = NewCamera();
  EXPECT_DOUBLE_EQ(Get(*alone, 4600).GetReal(), 2 * std::atan(0.5));
  EXPECT_FALSE(entries.FindIndex(1008) >= 0 || entries.FindIndex(4600) >= 0);
}

TEST(Camera, TellsItsFocalLengthOn36MillimetreFilm)
{
  const std::tuple<Real, Real, const char*> kCases[] = {
      {50, 36, " 50 mm"},       {36, 36, " 36 mm"}, {100, 36, " 100 mm"}, {25, 24, " 37.5 mm"},
      {10, 32.4, " 11.111 mm"}, {0, 36, " 0 mm"},   {-10, 36, " -10 mm"}, {0.0001, 36, " 0 mm"}};
  const ObjectPtr camera = NewCamera();
  for (const auto& [length, width, text] : kCases) {
    Entries(camera).SetReal(500, length);
    Entries(camera).SetReal(1006, width);
    EXPECT_EQ(Get(*camera, 1133).GetString(), String(text));
  }
  Entries(camera).SetReal(1006, 0);
  Entries(camera).SetReal(500, 1);
  EXPECT_EQ(Get(*camera, 1133).GetString(), String(" inf mm"));
}

TEST(Camera, UsesATargetOnlyWhileItHasOne)
{
  const DocumentPtr document = NewDocument();
  BaseObject* camera = AllocObject(kObjectCamera);
  BaseObject* target = AllocObject(kObjectNull);
  document->InsertObject(camera);
  document->InsertObject(target);
  BaseContainer& entries = camera->GetDataInstance();
  auto stored = [&] {
    camera->SetParameterById(1009, GeData(true));
    const Bool read = Get(*camera, 1009).GetBool();
    EXPECT_EQ(entries.GetBool(1009), read); // reading it without a target resets it
    return read;
  };
  EXPECT_FALSE(stored());
  BaseTag* tag = camera->MakeTag(kTagTarget);
  EXPECT_FALSE(stored());
  tag->GetDataInstance().SetLink(kTargetLink, target);
  EXPECT_TRUE(stored());
  camera->SetParameterById(1009, GeData(false));
  EXPECT_FALSE(Get(*camera, 1009).GetBool());
  DeleteObj(target);
  EXPECT_FALSE(stored());
}

TEST(Camera, ComputesTheFocusPairWhenAnInputIsSet)
{
  struct Case
  {
    const char* what;
    Long projection, mode;
    Real rule, base, plane;
    Real nearValue, farValue;
  };
  // Focal length 18 and aperture 36: s is twice the plane's distance d, 2000. One value is g c s / d; two are d - e and
  // d + e with e = s d / (b g (1 + s / b / g)), b = 2 c.
  const Case cases[] = {
      {"no rule", 0, 1, 0, 5, 1000, 800, 1200},
      {"part of a rule", 0, 0, 0.9, 5, 1000, 800, 1200},
      {"a parallel view", 4, 0, 1, 5, 1000, 800, 1200},
      {"one value, first rule", 0, 0, 1, 5, 1000, 300, 300},
      {"one value, another rule", 0, 0, 2, 5, 1000, 230, 230},
      {"one value, any other", 0, 0, -7, 5, 1000, 230, 230},
      {"two values, first rule", 0, 1, 1, 5, 1000, 1000 - 2e6 / 2300, 1000 + 2e6 / 2300},
      {"two values, another rule", 0, 3, 2, 5, 1000, 1000 - 2e6 / 2230, 1000 + 2e6 / 2230},
  };
  for (const Case& c : cases) {
    SCOPED_TRACE(c.what);
    const ObjectPtr camera = NewCamera();
    Entries(camera).SetReal(500, 18);
    camera->SetParameterById(1001, GeData(c.projection));
    camera->SetParameterById(4202, GeData(c.mode));
    EXPECT_TRUE(camera->SetParameterById(4208, GeData(c.rule)));
    EXPECT_TRUE(camera->SetParameterById(4205, GeData(c.plane)));
    EXPECT_TRUE(camera->SetParameterById(4201, GeData(c.base)));
    EXPECT_EQ(Entries(camera).GetData(4208).GetType(), 19);
    EXPECT_EQ(Entries(camera).GetReal(4201), c.base);
    EXPECT_NEAR(Get(*camera, 4204).GetReal(), c.nearValue, 1e-9);
    EXPECT_NEAR(Get(*camera, 4206).GetReal(), c.farValue, 1e-9);
  }
  // Any of the three starts the calculation; the entries that it takes besides don't.
  for (Long id : {4201, 4205, 4208}) {
    const ObjectPtr camera = NewCamera();
    Entries(camera).SetReal(4208, 1);
    camera->SetParameterById(500, GeData(18.0));
    camera->SetParameterById(1006, GeData(18.0));
    EXPECT_EQ(Get(*camera, 4204).GetReal(), 800);
    camera->SetParameterById(id, GeData(id == 4201 ? 6.5 : id == 4205 ? 1000.0 : 1.0));
    EXPECT_NEAR(Get(*camera, 4204).GetReal(), 195, 1e-9) << id;
  }
}

TEST(Camera, KeepsWhatAFileHolds)
{
  const counting_memory::BalanceCheck balance;
  // The container of a file replaces the defaults, and the computed parameters work on it.
  const ObjectPtr read(NewObj<BaseObject>(kObjectGeneric));
  ASSERT_TRUE(ReadInto(*read, Record("[110050,0 L0 L0 [132,1 L-1 L500 L19 R50 L1006 L19 R25 ] C0 SC ] "
                                     "[110064,0 L5103 L0 SC R1 ] [110064,0 L5103 L0 SC [3,3 ] ]")));
  EXPECT_EQ(read->GetType(), kObjectCamera);
  EXPECT_EQ(Entries(read).GetCount(), 2);
  EXPECT_DOUBLE_EQ(Get(*read, 1008).GetReal(), 2 * std::atan(0.25));
  EXPECT_TRUE(read->Execute());
  const ObjectPtr clone(static_cast<BaseObject*>(read->MakeClone(0, nullptr)));
  EXPECT_EQ(Get(*clone, 1132).GetLong(), 4);
}
