// Lights: their parameters, their body in every level and file version, and the measured distribution that they carry.
#include <map>
#include <set>
#include <sstream>

#include <gtest/gtest.h>

#include "q7r_file/ies_files.h"
#include "q7r_file/node_bytes.h"
#include "support/assertion_counter.h"
#include "support/counting_memory.h"
#include "support/scene_bytes.h"
#include "support/text.h"
#include "torvane/memory/owned.h"
#include "torvane/objects/base_object.h"
#include "torvane/objects/light_object_data.h"
#include "torvane/objects/unit_factors.h"
#include "torvane/values/ge_data.h"

namespace
{

using namespace _torvane_;

using ObjectPtr = Owned<BaseObject>;

ObjectPtr NewLight() { return ObjectPtr(AllocObject(kObjectLight)); }

LightObjectData& DataOf(const ObjectPtr& light) { return static_cast<LightObjectData&>(*light->GetObjectData()); }

GeData Get(const ObjectPtr& light, Long id)
{
  GeData value;
  EXPECT_TRUE(light->GetParameterById(id, value)) << id;
  return value;
}

// A value of its own for each parameter: L is a Long, R a Real, B a Bool, V a Vector. kLightKnotCount is 2.
Long LongOf(Long id) { return id == kLightKnotCount ? 2 : id; }
Real RealOf(Long id) { return id + 0.5; }
Bool BoolOf(Long id) { return id % 2 == 1; }
Vector VectorOf(Long id) { return {id + 0.25, id + 0.5, id - 0.25}; }

// The body of a light in file order. A letter and an id stand for a parameter, a letter and "=" for a value that isn't
// kept, "K" for the list of knots.
constexpr const char* kFirst = "R80002 R80003 R80000 R80001 L80013 L80014 L80015 B80007 B80008 B80009 B80010";
constexpr const char* kOldHead = "R=8 R=8 V=8 L=8";
constexpr const char* kOldRecord = "B=1 B=0 B=1 L=8 L=8 L=8 R=8 R=8 R=8 R=8 R=8 V=8 L=8";
constexpr const char* kMiddle =
    "R80004 R80005 R80006 B80011 B80012 "
    "R50016 R50001 R50002 R=50004.5 R50003 L50005 L50006 L50007 B50008 B50009 B50010 B50011 B50012 V50013 "
    "L60000 L60001 R60002 R=1 R60004 R60005 R60006 V60007 B60008 B70000 B70001 B70002 B70003 R70004 R70005 R70006 "
    "V=1 V=1 R70009 V70028 B=1 B=1 B70023 B=0 R=70009.5 R=10 R=90 R=100 R70019 R70020 R70021 "
    "V90000 R90001 L90002 L90003 L90004 L90005 B90006 B90008 B90007 B90009 R90010 R90011 R90012 R90013 L90014 "
    "B90015 B90016 B90017 B90018 B90019 B90020 R90021 R90022 R=90022.5 R90024 R90025 V=0 "
    "B90027 B90028 R90029 R90030 R90031 R90032";
// What came with the levels 1 to 4, and behind the extra block with level 5.
constexpr const char* kLevels[] = {"B70022 R=90032.5", "V60009 R60003 B50015",
                                   "B91000 B91003 B=0 R91001 R91004 R91007 R91008 L91002 L91005 L91006", "B90033"};
constexpr const char* kBehindExtra = "R50000 R70027";
constexpr const char* kLevel5 = "L1002";

void PutKnot(ByteWriter& w, int number)
{
  w.Real(number + 0.1).Real(number + 0.2).Vector(number, number + 1, number + 2).Long(number + 3);
}

void Put(ByteWriter& w, const std::string& list)
{
  std::istringstream words(list);
  for (std::string word; words >> word;) {
    const bool kept = word[1] != '=';
    const double number = std::stod(word.substr(kept ? 1 : 2));
    const Long id = static_cast<Long>(number);
    const Vector vector = kept ? VectorOf(id) : Vector(number, number, number);
    switch (word[0]) {
    case 'L':
      w.Long(kept ? LongOf(id) : id);
      break;
    case 'R':
      w.Real(kept ? RealOf(id) : number);
      break;
    case 'B':
      w.Bool(kept ? BoolOf(id) : id != 0);
      break;
    default:
      w.Vector(vector.x, vector.y, vector.z);
      break;
    }
  }
}

void PutExtraBlock(ByteWriter& w)
{
  PutKnot(w, 200);
  for (int i = 0; i < 5; ++i)
    w.Bool(i == 0)
        .Bool(i == 1)
        .Bool(i > 1)
        .Long(i)
        .Long(i + 10)
        .Real(i + 1)
        .Real(i + 2)
        .Real(i + 3)
        .Real(i + 4)
        .Real(i + 5)
        .Vector(i, 0.5, 1)
        .Long(i + 20);
  for (int i = 0; i < 5; ++i)
    PutKnot(w, 300 + i);
}

// The body up to the values of level `holds`, with two knots, without what stands for a distribution.
ByteWriter Body(Long holds, Long version = 13000)
{
  ByteWriter w;
  Put(w, kFirst);
  if (version < 7500)
    Put(w, kOldHead);
  PutKnot(w, 100);
  PutKnot(w, 110);
  for (int i = 0; version < 7500 && i < 5; ++i)
    Put(w, kOldRecord);
  for (int i = 0; version < 7500 && i < 5; ++i)
    Put(w, kOldHead);
  Put(w, kMiddle);
  for (Long level = 1; level <= 4 && level <= holds; ++level)
    Put(w, kLevels[level - 1]);
  if (version < 7500)
    return w;
  PutExtraBlock(w);
  Put(w, kBehindExtra);
  if (holds >= 5)
    Put(w, kLevel5);
  return w;
}

// Reads a light's chunk, and a chunk behind it that shows that the stream is in step, into a bare object.
ObjectPtr ReadLight(const Bytes& body, Long level, Long version = 13000)
{
  ObjectPtr light(NewObj<BaseObject>(kObjectGeneric));
  ByteWriter w;
  w.Start(110064, level).Long(kObjectLight).Long(0).String(u"L").Append(body).End();
  const bool read = ReadInto(*light, w.bytes, version);
  return read && light->GetType() == kObjectLight ? std::move(light) : nullptr;
}

template <class Visit>
void ForEachParameter(const Visit& visit)
{
  for (const LightParameterRange& range : kLightParameters) {
    for (Long id = range.first; id <= range.last; ++id)
      visit(id, range.kind);
  }
}

GeData OwnValue(Long id, LightKind kind)
{
  switch (kind) {
  case LightKind::kLong:
    return GeData(LongOf(id));
  case LightKind::kReal:
    return GeData(RealOf(id));
  case LightKind::kBool:
    return GeData(BoolOf(id));
  default:
    return GeData(VectorOf(id));
  }
}

void SetOwnValues(const ObjectPtr& light)
{
  ForEachParameter([&](Long id, LightKind kind) { EXPECT_TRUE(light->SetParameterById(id, OwnValue(id, kind))); });
}

// The ids whose value isn't the one that SetOwnValues gives.
std::set<Long> Differing(const ObjectPtr& light)
{
  std::set<Long> ids;
  ForEachParameter([&](Long id, LightKind kind) {
    if (!Get(light, id).IsEqual(OwnValue(id, kind)))
      ids.insert(id);
  });
  return ids;
}

// The body that a light writes.
Bytes BodyOf(const ObjectPtr& light)
{
  return WriteToMemory([&](HyperFile& file) { DataOf(light).WriteChunks(file); });
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
  EXPECT_EQ(light->fileVersion, 2);
  EXPECT_EQ(light->tiltMode, 1);
  EXPECT_EQ(Values(light->verticalAngles), (std::vector<double>{0, 180}));
  EXPECT_EQ(Values(light->horizontalAngles), (std::vector<double>{0}));
  EXPECT_EQ(Values(light->candela), (std::vector<double>{2, 2}));
  EXPECT_EQ(light->maxCandela, 2);
  EXPECT_NEAR(light->GetTotalFlux(), totalFlux, 1e-9);
}

void ExpectTexts(const IESLight& light)
{
  const char* expected[] = {"M", "LC", "", "", "la"};
  const String* texts[] = {&light.manufacturer, &light.luminaireCatalogue, &light.luminaire, &light.lampCatalogue,
                           &light.lamp};
  for (int i = 0; i < 5; ++i)
    EXPECT_EQ(*texts[i], String(expected[i])) << i;
  EXPECT_EQ(light.shape, 4);
  EXPECT_TRUE(light.size == Vector(1, 2, 3));
}

// The distribution as a file of a version of its form holds it.
ByteWriter Stored(Long version)
{
  ByteWriter w;
  auto number = [&](double value) { version < 4 ? w.LReal(value) : w.Real(value); };
  w.Long(version).Long(2).Long(1);
  number(2);
  w.Long(2).Long(1);
  for (double value : {0, 180, 0, 2, 2})
    number(value);
  if (version >= 2)
    w.String(u"M").String(u"LC").String(u"").String(u"").String(u"la").Long(4).Vector(1, 2, 3);
  if (version >= 3)
    number(0.5);
  return w;
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
    const GeData value = Get(light, id);
    if (kind == LightKind::kVector)
      EXPECT_TRUE(value.GetVector() == (id == 90000 ? Vector(1, 1, 1) : Vector())) << id;
    else
      EXPECT_EQ(value.GetReal(), others.contains(id) ? others.at(id) : 0.0) << id;
  });
  EXPECT_EQ(count, 99);
  EXPECT_EQ(DataOf(light).GetChunkLevel(), 6);
  EXPECT_EQ(light->GetDataInstance().GetCount(), 0);
}

TEST(Light, KeepsItsParametersApartAndLeavesOthersToTheObject)
{
  const ObjectPtr light = NewLight();
  SetOwnValues(light);
  EXPECT_EQ(Differing(light), std::set<Long>());
  EXPECT_EQ(light->GetDataInstance().GetCount(), 0);
  for (Long id : {1001, 50014, 60010, 70007, 70024, 80016, 90023, 90026, 90034, 91009}) {
    EXPECT_TRUE(light->SetParameterById(id, GeData(Long{7})));
    EXPECT_EQ(light->GetDataInstance().GetLong(id), 7) << id;
    EXPECT_EQ(Get(light, id).GetLong(), 7);
  }
  const ParameterPath green = {{kLightColor, kDataVector, 0}, {1001, kDataReal, 0}};
  GeData value;
  EXPECT_TRUE(light->SetParameter(green, GeData(0.125)));
  EXPECT_TRUE(light->GetParameter(green, value));
  EXPECT_EQ(value.GetReal(), 0.125);
  EXPECT_TRUE(Get(light, kLightColor).GetVector() == Vector(90000.25, 0.125, 89999.75));
  for (const auto& [asked, count] : {std::pair<Long, Long>{-1, 0}, {41, 40}, {40, 40}}) {
    light->SetParameterById(kLightKnotCount, GeData(asked));
    EXPECT_EQ(Get(light, kLightKnotCount).GetLong(), count);
  }
}

TEST(Light, ReadsTheBodiesOfEveryLevelAndVersion)
{
  // What differs without the values of a level. 91000 doesn't: its own value is the default.
  const std::set<Long> ofLevel[] = {
      {}, {70022}, {60009, 60003, 50015}, {91003, 91001, 91004, 91007, 91008, 91002, 91005, 91006}, {90033}, {1002}};
  for (Long version : {6000, 7499, 7500, 9419, 9420, 13000}) {
    for (Long level = 0; level <= 6; ++level) {
      // A chunk of a low level may hold what belongs to that level only, or all that the fifth has.
      for (Long holds : {level, Long{5}}) {
        if (holds < level && level != 6)
          continue;
        SCOPED_TRACE("version " + std::to_string(version) + ", level " + std::to_string(level) + ", with " +
                     std::to_string(holds));
        ByteWriter body = Body(holds, version);
        if (level >= 6 && version >= 7500)
          body.Bool(false);
        body.String(u"from a later level").Start(4, 4).End();
        const ObjectPtr light = ReadLight(body.bytes, level, version);
        ASSERT_NE(light, nullptr);
        std::set<Long> expected = {50004};
        for (Long above = holds + 1; above <= 5; ++above)
          expected.insert(ofLevel[above].begin(), ofLevel[above].end());
        if (version < 7500)
          expected.insert({50000, 70027, 70028, 1002});
        EXPECT_EQ(Differing(light), expected);
        EXPECT_EQ(Get(light, 70022).GetLong(), holds < 1);
        const BaseContainer& entries = light->GetDataInstance();
        EXPECT_EQ(entries.GetLong(100006, -1), version < 9420 && holds >= 1 ? 9003250 : -1);
        if (version < 7500) {
          EXPECT_EQ(Get(light, 70027).GetReal(), 70028.5);
          EXPECT_TRUE(Get(light, 70028).GetVector() == Vector(70028.25 / 70028.5, 1, 70027.75 / 70028.5));
        } else {
          EXPECT_EQ(DataOf(light).GetExtraBlock()->layers[1].numbers[4], 6);
          EXPECT_EQ(DataOf(light).GetExtraBlock()->knots[4].mode, 307);
        }
      }
    }
  }
}

TEST(Light, TurnsTheOldSizeFactorIntoASizeOfAtLeast16)
{
  const std::pair<double, Long> cases[] = {{0.0, 16},    {0.16, 16}, {0.5, 50},
                                           {2.507, 250}, {-3, 16},   {1e300, 2147483647}};
  for (const auto& [factor, size] : cases) {
    ByteWriter w = Body(0, 7000);
    w.Bool(true).Real(factor);
    const ObjectPtr light = ReadLight(w.bytes, 1, 7000);
    ASSERT_NE(light, nullptr);
    EXPECT_EQ(light->GetDataInstance().GetLong(100006), size) << factor;
  }
}

TEST(Light, KeepsFortyKnotsAndPassesOverTheRest)
{
  for (Long count : {-5, 0, 40, 45}) {
    ByteWriter w;
    w.Real(0).Real(0).Real(0).Real(0).Long(count).Long(0).Long(0).Bool(false).Bool(false).Bool(false).Bool(false);
    for (int i = 0; i < count; ++i)
      PutKnot(w, i);
    Put(w, kMiddle);
    for (const char* list : kLevels)
      Put(w, list);
    PutExtraBlock(w);
    Put(w, kBehindExtra);
    Put(w, kLevel5);
    const ObjectPtr light = ReadLight(w.bytes, 5);
    ASSERT_NE(light, nullptr) << count;
    EXPECT_EQ(Get(light, kLightKnotCount).GetLong(), std::clamp(count, Long{0}, Long{40}));
    EXPECT_EQ(DataOf(light).GetKnots()[39].mode, count >= 40 ? 42 : 0);
    EXPECT_EQ(Get(light, 1002).GetLong(), 1002);
  }
}

TEST(Light, CarriesItsDistributionThroughAFileAndBack)
{
  const ObjectPtr light = NewLight();
  SetOwnValues(light);
  DataOf(light).AdoptIES(MakeDistribution().release());
  const Bytes body = BodyOf(light);
  const std::string hex = "15 01  0F 00000004  0F 00000002  0F 00000001  13 4000000000000000  0F 00000002  0F 00000001"
                          "13 0000000000000000 13 4066800000000000  13 0000000000000000"
                          "13 4000000000000000 13 4000000000000000"
                          "82 00000002 004D  82 00000004 004C 0043  82 00000000  82 00000000  82 00000004 006C 0061"
                          "0F 00000004  17 3FF0000000000000 4000000000000000 4008000000000000  13 3FE0000000000000";
  const Bytes expected = FromHex(hex);
  ASSERT_GT(body.size(), expected.size());
  EXPECT_EQ(ToHex({body.end() - static_cast<long>(expected.size()), body.end()}), ToHex(expected));
  const ObjectPtr again = ReadLight(body, 6);
  ASSERT_NE(again, nullptr);
  ExpectDistribution(GetIESLight(again.get()), 0.5);
  ExpectTexts(*GetIESLight(again.get()));
  EXPECT_EQ(ToHex(BodyOf(again)).substr(0, 100), ToHex(body).substr(0, 100));
  // One that could not be read again is left out.
  GetIESLight(again.get())->candela.Append(1);
  EXPECT_EQ(BodyOf(again).back(), 0);
}

TEST(Light, ReadsTheOlderFormsOfADistribution)
{
  for (Long version = 1; version <= 5; ++version) {
    SCOPED_TRACE(version);
    const ObjectPtr light = ReadLight(Body(5).Bool(true).Append(Stored(version).bytes).bytes, 6);
    ASSERT_NE(light, nullptr);
    const IESLight* ies = GetIESLight(light.get());
    ExpectDistribution(ies, version < 3 ? 12.566370614359172 : 0.5);
    if (version >= 2)
      ExpectTexts(*ies);
    else
      EXPECT_EQ(ies->shape, -1);
  }
}

TEST(Light, LosesABadDistributionOnly)
{
  const ObjectPtr had = NewLight();
  for (const auto& [vertical, horizontal] : {std::pair<Long, Long>{-1, 1}, {1, -1}, {1025, 1}, {1, 2147483647}}) {
    ByteWriter w = Body(5);
    w.Bool(true).Long(4).Long(0).Long(1).Real(0).Long(vertical).Long(horizontal);
    const ObjectPtr light = ReadLight(w.bytes, 6);
    ASSERT_NE(light, nullptr) << vertical << " by " << horizontal;
    EXPECT_EQ(GetIESLight(light.get()), nullptr);
    EXPECT_EQ(Get(light, 1002).GetLong(), 1002);
  }
  // A table that the file doesn't hold takes no memory.
  counting_memory::ResetPeak();
  const LLong before = counting_memory::Get().bytes;
  AssertionCounter silent;
  const Bytes large = Body(5).Bool(true).Long(4).Long(0).Long(1).Real(0).Long(1024).Long(1024).Real(1).bytes;
  EXPECT_EQ(ReadLight(large, 6), nullptr);
  EXPECT_LT(counting_memory::Get().peakBytes - before, 100000);
}

TEST(Light, TakesADistributionWithItsEntriesInTheUnitOfTheDocument)
{
  struct Unit
  {
    Real scale;
    Long code;
    Real factor; // one metre in it
  };
  const Unit units[] = {{1, 0, 1},          {1, 1, 0.001},      {1, 2, 1},           {1, 3, 100},
                        {1, 4, 1000},       {1, 5, 1e6},        {1, 6, 1e9},         {1, 7, 1 / 1609.344},
                        {1, 8, 1 / 0.9144}, {1, 9, 1 / 0.3048}, {1, 10, 1 / 0.0254}, {2, 3, 50},
                        {0, 3, 1},          {100, 3, 1}};
  const IESPtr parsed = MakeDistribution();
  for (const Unit& unit : units) {
    const DocumentPtr document = NewDocument();
    GeData value;
    ASSERT_TRUE(value.SetType(kCustomUnitScale));
    auto& scale = static_cast<UnitScaleData&>(*value.GetCustom());
    scale.scale = unit.scale;
    scale.unit = unit.code;
    document->GetDataInstance().SetData(2117, value);
    const ObjectPtr light = NewLight();
    ASSERT_TRUE(SetIESLight(light.get(), parsed.get(), document.get()));
    const BaseContainer& entries = light->GetDataInstance();
    for (Long i = 0; i < 3; ++i)
      EXPECT_DOUBLE_EQ(entries.GetReal(100010 + i), (i + 1) * unit.factor) << unit.code;
    EXPECT_DOUBLE_EQ(Get(light, 90013).GetReal(), 0.5 * unit.factor);
  }
}

TEST(Light, SetsTypeEntriesAndParametersByADistribution)
{
  const counting_memory::BalanceCheck balance;
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
  EXPECT_EQ(entries.GetLong(90037), 1);
  EXPECT_EQ(entries.GetReal(90043), 2);
  const char* texts[] = {"M", "LC", "", "", "la"};
  for (Long i = 0; i < 5; ++i)
    EXPECT_EQ(entries.GetString(90050 + i), String(texts[i]));
  EXPECT_EQ(entries.GetReal(100012), 3);
  EXPECT_EQ(entries.GetLong(100015), 4);
  EXPECT_EQ(Get(light, 90002).GetLong(), 9);
  EXPECT_EQ(Get(light, 90013).GetReal(), 0.5);
  EXPECT_EQ(Get(light, 90014).GetLong(), 10);
  EXPECT_EQ(Get(light, 90025).GetReal(), 1000);
  // An unknown shape counts as 1; its own again, another and none.
  parsed->shape = -1;
  EXPECT_TRUE(SetIESLight(light.get(), parsed.get(), nullptr));
  EXPECT_EQ(entries.GetLong(100015), 1);
  EXPECT_TRUE(SetIESLight(light.get(), GetIESLight(light.get()), nullptr));
  EXPECT_NE(GetIESLight(light.get()), nullptr);
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
  AssertionCounter reports;
  EXPECT_EQ(GetUnitFactor(nullptr), 1.0);
  EXPECT_EQ(reports.Take(), 1);
  UnitScaleData unit(*FindCustomDataType(kCustomUnitScale));
  for (Long code : {-1, 11, 1000}) {
    unit.unit = code;
    unit.scale = 3;
    EXPECT_EQ(GetUnitFactor(&unit), 3.0);
  }
  EXPECT_EQ(ConvertUnits(&unit, nullptr), 3.0);
}
