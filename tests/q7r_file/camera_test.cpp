// Cameras: the entries of a new one, and the parameters that are computed from them.
#include "support/library.h"

namespace
{

ObjectPtr NewCamera() { return ObjectPtr(AllocObject(kObjectCamera)); }

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
  // start: the position of a new camera's value
  const std::tuple<Long, Long, Long, Real, Bool, std::vector<Real>> lists[] = {
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
  for (const auto& [id, storedId, start, tolerance, outsideResult, values] : lists) {
    SCOPED_TRACE(id);
    const ObjectPtr camera = NewCamera();
    const Long before = Entries(camera).GetCount();
    EXPECT_EQ(ParameterOf(*camera, id).GetLong(), start);
    const Long count = static_cast<Long>(values.size());
    for (Long position = 1; position <= count; ++position) {
      EXPECT_TRUE(camera->GetObjectData()->SetParameterById(id, GeData(position)));
      const Real value = values[static_cast<std::size_t>(position - 1)];
      EXPECT_EQ(Entries(camera).GetReal(storedId), value);
      for (Real offset : {0.0, 0.9 * tolerance, -0.9 * tolerance}) {
        Entries(camera).SetReal(storedId, value + offset);
        EXPECT_EQ(ParameterOf(*camera, id).GetLong(), position) << offset;
      }
    }
    Entries(camera).SetReal(storedId, values[0] - 1.1 * tolerance);
    EXPECT_EQ(ParameterOf(*camera, id).GetLong(), 0);
    Entries(camera).SetReal(storedId, 77.0);
    for (Long position : {-1, 0, count + 1, 1000}) {
      EXPECT_EQ(camera->GetObjectData()->SetParameterById(id, GeData(position)), outsideResult);
      EXPECT_EQ(Entries(camera).GetReal(storedId), 77.0);
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
  // lens: 5033 of the render settings; aspect: 6006
  constexpr std::tuple<Long, Long, Real, Real> kCases[] = {
      {1008, 1100, 2, 1}, {4600, 1100, 2, 0.5}, {4600, 1150, 2, 1}, {4600, 0, 0.25, 4}};
  for (const auto& [id, lens, aspect, factor] : kCases) {
    render->GetDataInstance().SetLong(5033, lens);
    render->GetDataInstance().SetReal(6006, aspect);
    entries.SetReal(500, 36);
    EXPECT_DOUBLE_EQ(ParameterOf(*camera, id).GetReal(), 2 * std::atan(0.5 * factor)) << id;
    entries.SetReal(1006, 20);
    EXPECT_TRUE(camera->SetParameterById(id, GeData(1.2)));
    EXPECT_DOUBLE_EQ(entries.GetReal(500), 10 / std::tan(0.6) * factor) << id;
    EXPECT_DOUBLE_EQ(ParameterOf(*camera, id).GetReal(), factor == 1 ? 1.2 : 2 * std::atan(std::tan(0.6))) << id;
    entries.SetReal(1006, 36);
    for (Real angle : {0.0, -1.0, std::nan("")}) {
      EXPECT_TRUE(camera->GetObjectData()->SetParameterById(id, GeData(angle)));
      EXPECT_DOUBLE_EQ(entries.GetReal(500), 10 / std::tan(0.6) * factor) << angle;
    }
    for (Real length : {0.0, -36.0}) {
      entries.SetReal(500, length);
      EXPECT_EQ(ParameterOf(*camera, id).GetType(), 0) << length;
    }
  }
  // Outside a document the vertical field has no factor.
  const ObjectPtr alone = NewCamera();
  EXPECT_DOUBLE_EQ(ParameterOf(*alone, 4600).GetReal(), 2 * std::atan(0.5));
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
    EXPECT_EQ(ParameterOf(*camera, 1133).GetString(), String(text));
  }
  Entries(camera).SetReal(1006, 0);
  Entries(camera).SetReal(500, 1);
  EXPECT_EQ(ParameterOf(*camera, 1133).GetString(), String(" inf mm"));
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
    const Bool read = ParameterOf(*camera, 1009).GetBool();
    EXPECT_EQ(entries.GetBool(1009), read); // reading it without a target resets it
    return read;
  };
  EXPECT_FALSE(stored());
  BaseTag* tag = camera->MakeTag(kTagTarget);
  EXPECT_FALSE(stored());
  tag->GetDataInstance().SetLink(kTargetLink, target);
  EXPECT_TRUE(stored());
  camera->SetParameterById(1009, GeData(false));
  EXPECT_FALSE(ParameterOf(*camera, 1009).GetBool());
  DeleteObj(target);
  EXPECT_FALSE(stored());
}

TEST(Camera, ComputesTheFocusPairWhenAnInputIsSet)
{
  // Focal length 18 and aperture 36: s is twice the plane's distance d, 2000. One value is g c s / d; two are d - e and
  // d + e with e = s d / (b g (1 + s / b / g)), b = 2 c.
  const std::tuple<const char*, Long, Long, Real, Real, Real, Real, Real> cases[] = {
      {"no rule", 0, 1, 0, 5, 1000, 800, 1200},
      {"part of a rule", 0, 0, 0.9, 5, 1000, 800, 1200},
      {"a parallel view", 4, 0, 1, 5, 1000, 800, 1200},
      {"one value, first rule", 0, 0, 1, 5, 1000, 300, 300},
      {"one value, another rule", 0, 0, 2, 5, 1000, 230, 230},
      {"one value, any other", 0, 0, -7, 5, 1000, 230, 230},
      {"two values, first rule", 0, 1, 1, 5, 1000, 1000 - 2e6 / 2300, 1000 + 2e6 / 2300},
      {"two values, another rule", 0, 3, 2, 5, 1000, 1000 - 2e6 / 2230, 1000 + 2e6 / 2230},
  };
  for (const auto& [what, projection, mode, rule, base, plane, nearValue, farValue] : cases) {
    SCOPED_TRACE(what);
    const ObjectPtr camera = NewCamera();
    Entries(camera).SetReal(500, 18);
    camera->SetParameterById(1001, GeData(projection));
    camera->SetParameterById(4202, GeData(mode));
    EXPECT_TRUE(camera->SetParameterById(4208, GeData(rule)) && camera->SetParameterById(4205, GeData(plane)));
    EXPECT_TRUE(camera->SetParameterById(4201, GeData(base)));
    EXPECT_EQ(Entries(camera).GetData(4208).GetType(), 19);
    EXPECT_EQ(Entries(camera).GetReal(4201), base);
    EXPECT_NEAR(ParameterOf(*camera, 4204).GetReal(), nearValue, 1e-9);
    EXPECT_NEAR(ParameterOf(*camera, 4206).GetReal(), farValue, 1e-9);
  }
  // Any of the three starts the calculation; the entries that it takes besides don't.
  for (Long id : {4201, 4205, 4208}) {
    const ObjectPtr camera = NewCamera();
    Entries(camera).SetReal(4208, 1);
    camera->SetParameterById(500, GeData(18.0));
    camera->SetParameterById(1006, GeData(18.0));
    EXPECT_EQ(ParameterOf(*camera, 4204).GetReal(), 800);
    camera->SetParameterById(id, GeData(id == 4201 ? 6.5 : id == 4205 ? 1000.0 : 1.0));
    EXPECT_NEAR(ParameterOf(*camera, 4204).GetReal(), 195, 1e-9) << id;
  }
}

TEST(Camera, KeepsWhatAFileHolds)
{
  // The container of a file replaces the defaults, and the computed parameters work on it.
  const ObjectPtr read(NewObj<BaseObject>(kObjectGeneric));
  ASSERT_TRUE(ReadInto(*read, Record("[110050,0 L0 L0 [132,1 L-1 L500 L19 R50 L1006 L19 R25 ] C0 SC ] "
                                     "[110064,0 L5103 L0 SC R1 ] [110064,0 L5103 L0 SC [3,3 ] ]")));
  EXPECT_EQ(read->GetType(), kObjectCamera);
  EXPECT_EQ(Entries(read).GetCount(), 2);
  EXPECT_DOUBLE_EQ(ParameterOf(*read, 1008).GetReal(), 2 * std::atan(0.25));
  EXPECT_TRUE(read->Execute());
  const ObjectPtr clone(static_cast<BaseObject*>(read->MakeClone(0, nullptr)));
  EXPECT_EQ(ParameterOf(*clone, 1132).GetLong(), 4);
}
