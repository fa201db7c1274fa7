// Lights: their parameters, what becomes of old ones, and the measured distribution that they carry.
#include "q7r_file/ies_files.h"
#include "support/library.h"
#include "torvane/objects/unit_factors.h"

namespace
{

ObjectPtr NewLight() { return ObjectPtr(AllocObject(kObjectLight)); }

LightObjectData& DataOf(const ObjectPtr& light) { return static_cast<LightObjectData&>(*light->GetObjectData()); }

// Reads a light's chunk, and a chunk behind it that shows that the stream is in step, into a bare object.
ObjectPtr ReadLight(const std::string& body, Long level, Long version = 13000)
{
  ObjectPtr light(NewObj<BaseObject>(kObjectGeneric));
  const Bytes chunk = Record("[110064," + std::to_string(level) + " " + body + " ]", version);
  const bool read = ReadInto(*light, chunk, version);
  return read && light->GetType() == kObjectLight ? std::move(light) : nullptr;
}

// A light of level 5 whose body goes on.
std::string WithMore(const std::string& more) { return FindRecordSample("light 5").body + " " + more; }

template <class Visit>
void ForEachParameter(const Visit& visit)
{
  for (const LightParameterRange& range : kLightParameters) {
    for (Long id = range.first; id <= range.last; ++id)
      visit(id, range.kind);
  }
}

IESPtr MakeDistribution()
{
  IESPtr light(NewObj<IESLight>());
  light->fileVersion = 2;
  light->tiltMode = 1;
  light->manufacturer = "M";
  light->luminaireCatalogue = "LC";
  light->lamp = "la";
  light->shape = 4;
  light->size = Vector(1, 2, 3);
  Assign(light->verticalAngles, {0, 180});
  Assign(light->horizontalAngles, {0});
  Assign(light->candela, {2, 2});
  light->maxCandela = 2;
  light->SetTotalFlux(0.5);
  return light;
}

void ExpectDistribution(const IESLight* light, double totalFlux)
{
  ASSERT_NE(light, nullptr);
  EXPECT_TRUE(light->fileVersion == 2 && light->tiltMode == 1);
  EXPECT_EQ(Values(light->verticalAngles), (std::vector<double>{0, 180}));
  EXPECT_EQ(Values(light->horizontalAngles), (std::vector<double>{0}));
  EXPECT_EQ(Values(light->candela), (std::vector<double>{2, 2}));
  EXPECT_EQ(light->maxCandela, 2);
  EXPECT_NEAR(light->GetTotalFlux(), totalFlux, 1e-9);
}

} // namespace

TEST(Light, StartsWithItsDefaults)
{
  const ObjectPtr light = NewLight();
  const std::map<Long, double> others = {
      {90001, 1},   {90006, 1},  {90007, 1}, {90008, 1},   {90011, 0.5235987755982988},
      {90013, 100}, {90018, 1},  {90022, 1}, {90025, 500}, {90030, 10},
      {90031, 90},  {90032, 100}};
  int count = 0;
  ForEachParameter([&](Long id, LightKind kind) {
    ++count;
    const GeData value = ParameterOf(*light, id);
    if (kind == LightKind::kVector)
      EXPECT_TRUE(value.GetVector() == (id == 90000 ? Vector(1, 1, 1) : Vector())) << id;
    else
      EXPECT_EQ(value.GetReal(), others.contains(id) ? others.at(id) : 0.0) << id;
  });
  EXPECT_EQ(count, 99);
  EXPECT_EQ(DataOf(light).GetChunkLevel(), 6);
  EXPECT_EQ(light->GetDataInstance().GetCount(), 0);
}

TEST(Light, LeavesOtherParametersToTheObject)
{
  const ObjectPtr light = NewLight();
  ForEachParameter([&](Long id, LightKind) { EXPECT_TRUE(light->SetParameterById(id, GeData(Long{1}))); });
  EXPECT_EQ(light->GetDataInstance().GetCount(), 0);
  for (Long id : {1001, 50014, 60010, 70007, 70024, 80016, 90023, 90026, 90034, 91009}) {
    EXPECT_TRUE(light->SetParameterById(id, GeData(Long{7})));
    EXPECT_EQ(light->GetDataInstance().GetLong(id), 7) << id;
    EXPECT_EQ(ParameterOf(*light, id).GetLong(), 7);
  }
  const ParameterPath green = {{kLightColor, kDataVector, 0}, {1001, kDataReal, 0}};
  GeData value;
  EXPECT_TRUE(light->SetParameterById(kLightColor, GeData(Vector(1, 2, 3))));
  EXPECT_TRUE(light->SetParameter(green, GeData(0.125)) && light->GetParameter(green, value));
  EXPECT_EQ(value.GetReal(), 0.125);
  EXPECT_TRUE(ParameterOf(*light, kLightColor).GetVector() == Vector(1, 0.125, 3));
  for (const auto& [asked, count] : {std::pair<Long, Long>{-1, 0}, {41, 40}, {40, 40}}) {
    light->SetParameterById(kLightKnotCount, GeData(asked));
    EXPECT_EQ(ParameterOf(*light, kLightKnotCount).GetLong(), count);
  }
}

TEST(Light, TurnsTheOldSizeFactorIntoASizeOfAtLeast16)
{
  const std::tuple<double, Long, Long> rows[] = {{0.0, 7000, 16},    {0.16, 7000, 16}, {0.5, 7000, 50},
                                                 {2.507, 7000, 250}, {-3, 7000, 16},   {1e9, 9419, 2147483647},
                                                 {0.5, 9419, 50},    {0.5, 9420, -1}};
  for (const auto& [oldFactor, version, size] : rows) {
    const std::string body = FindRecordSample(version < 7500 ? "light 0 before 7500" : "light 0").body;
    const std::string middle = "R=64@90032";
    const std::size_t place = body.find(middle) + middle.size();
    const std::string factor = " B0 R" + std::to_string(oldFactor);
    const ObjectPtr light = ReadLight(body.substr(0, place) + factor + body.substr(place), 1, version);
    ASSERT_NE(light, nullptr) << version;
    EXPECT_EQ(light->GetDataInstance().GetLong(100006, -1), size) << oldFactor;
    if (version < 7500) { // which tell strength and colour as one
      EXPECT_EQ(ParameterOf(*light, 70027).GetReal(), 42.5);
      EXPECT_TRUE(ParameterOf(*light, 70028).GetVector() == Vector(42 / 42.5, 1, 41.75 / 42.5));
    }
  }
}

TEST(Light, LosesABadDistributionOnly)
{
  for (const auto& [vertical, horizontal] : {std::pair<Long, Long>{-1, 1}, {1, -1}, {1025, 1}, {1, 2147483647}}) {
    const std::string size = "L" + std::to_string(vertical) + " L" + std::to_string(horizontal);
    const ObjectPtr light = ReadLight(WithMore("B1 L4 L0 L1 R0 " + size), 6);
    ASSERT_NE(light, nullptr) << vertical << " by " << horizontal;
    EXPECT_EQ(GetIESLight(light.get()), nullptr);
    EXPECT_EQ(ParameterOf(*light, 1002).GetLong(), 93);
  }
  const auto load = [] { EXPECT_EQ(ReadLight(WithMore("B1 L4 L0 L1 R0 L1024 L1024 R1"), 6), nullptr); };
  EXPECT_LT(counting_memory::PeakOf(load), 100000) << "a table that the file doesn't hold";
}

TEST(Light, TakesADistributionWithItsEntriesInTheUnitOfTheDocument)
{
  const std::tuple<Real, Long, Real> units[] = {
      {1, 0, 1},   {1, 1, 0.001},        {1, 2, 1},          {1, 3, 100},        {1, 4, 1000},        {1, 5, 1e6},
      {1, 6, 1e9}, {1, 7, 1 / 1609.344}, {1, 8, 1 / 0.9144}, {1, 9, 1 / 0.3048}, {1, 10, 1 / 0.0254}, {2, 3, 50},
      {0, 3, 1},   {100, 3, 1}};
  const IESPtr parsed = MakeDistribution();
  for (const auto& [number, code, metre] : units) {
    const DocumentPtr document = NewDocument();
    GeData value;
    ASSERT_TRUE(value.SetType(kCustomUnitScale));
    auto& scale = static_cast<UnitScaleData&>(*value.GetCustom());
    scale.scale = number;
    scale.unit = code;
    document->GetDataInstance().SetData(2117, value);
    const ObjectPtr light = NewLight();
    ASSERT_TRUE(SetIESLight(light.get(), parsed.get(), document.get()));
    const BaseContainer& entries = light->GetDataInstance();
    for (Long i = 0; i < 3; ++i)
      EXPECT_DOUBLE_EQ(entries.GetReal(100010 + i), (i + 1) * metre) << code;
    EXPECT_DOUBLE_EQ(ParameterOf(*light, 90013).GetReal(), 0.5 * metre);
  }
}

TEST(Light, SetsTypeEntriesAndParametersByADistribution)
{
  const ObjectPtr light = NewLight();
  IESPtr parsed = MakeDistribution();
  parsed->maxCandela = 77;
  ASSERT_TRUE(SetIESLight(light.get(), parsed.get(), nullptr));
  // Both are normalised.
  ExpectDistribution(parsed.get(), 12.566370614359172);
  ExpectDistribution(GetIESLight(light.get()), 12.566370614359172);
  EXPECT_NE(GetIESLight(light.get()), parsed.get());
  const BaseContainer& entries = light->GetDataInstance();
  EXPECT_TRUE(entries.GetBool(90042) && entries.GetBool(90046));
  EXPECT_TRUE(entries.GetLong(90037) == 1 && entries.GetReal(90043) == 2);
  const char* texts[] = {"M", "LC", "", "", "la"};
  for (Long i = 0; i < 5; ++i)
    EXPECT_EQ(entries.GetString(90050 + i), String(texts[i]));
  EXPECT_TRUE(entries.GetReal(100012) == 3 && entries.GetLong(100015) == 4);
  EXPECT_EQ(ParameterOf(*light, 90002).GetLong(), 9);
  EXPECT_EQ(ParameterOf(*light, 90013).GetReal(), 0.5);
  EXPECT_EQ(ParameterOf(*light, 90014).GetLong(), 10);
  EXPECT_EQ(ParameterOf(*light, 90025).GetReal(), 1000);
  // An unknown shape counts as 1; its own again, another and none.
  parsed->shape = -1;
  EXPECT_TRUE(SetIESLight(light.get(), parsed.get(), nullptr));
  EXPECT_EQ(entries.GetLong(100015), 1);
  EXPECT_TRUE(SetIESLight(light.get(), GetIESLight(light.get()), nullptr));
  ASSERT_NE(GetIESLight(light.get()), nullptr);
  // One that could not be read again is left out of a file.
  EXPECT_NE(BytesOf(DataOf(light)).back(), 0);
  GetIESLight(light.get())->candela.Append(1);
  EXPECT_EQ(BytesOf(DataOf(light)).back(), 0);
  EXPECT_TRUE(SetIESLight(light.get(), nullptr, nullptr));
  EXPECT_EQ(GetIESLight(light.get()), nullptr);

  const ObjectPtr camera(AllocObject(kObjectCamera));
  const ObjectPtr bare(NewObj<BaseObject>(kObjectLight));
  for (BaseObject* other : {static_cast<BaseObject*>(nullptr), camera.get(), bare.get()}) {
    EXPECT_FALSE(SetIESLight(other, parsed.get(), nullptr));
    EXPECT_EQ(GetIESLight(other), nullptr);
  }
}

TEST(Light, CountsUnknownAndMissingUnitsAsMetres)
{
  EXPECT_EQ(GetUnitFactor(nullptr), 1.0);
  EXPECT_EQ(CountReports(), 1);
  UnitScaleData unit(*FindCustomDataType(kCustomUnitScale));
  for (Long code : {-1, 11, 1000}) {
    unit.unit = code;
    unit.scale = 3;
    EXPECT_EQ(GetUnitFactor(&unit), 3.0);
  }
  EXPECT_EQ(ConvertUnits(&unit, nullptr), 3.0);
}
