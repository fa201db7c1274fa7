// Gradients: their file forms, their parameters, and their colours against values worked out by hand.
#include "support/library.h"

namespace
{

struct Knot
{
  double position, bias;
  Vector color;
  double brightness = 1.0;
  Long id = 0;
};

void AddKnots(GradientData& gradient, std::initializer_list<Knot> knots)
{
  for (const Knot& knot : knots) {
    BaseContainer entry;
    entry.SetVector(kKnotColor, knot.color);
    entry.SetReal(kKnotBrightness, knot.brightness);
    entry.SetReal(kKnotPosition, knot.position);
    entry.SetReal(kKnotBias, knot.bias);
    entry.SetLong(kKnotId, knot.id);
    gradient.GetSettings().GetContainerInstance(kGradientKnots)->InsertData(0, GeData(entry));
  }
}

BaseContainer& KnotAt(GradientData& gradient, Long index)
{
  return *gradient.GetSettings().GetContainerInstance(kGradientKnots)->GetIndexData(index)->GetContainer();
}

// The settings of a gradient with those knots.
Bytes SettingsBytes(std::initializer_list<Knot> knots)
{
  std::string text = "[132,1 L-1 L1001 L132 [132,1 L-1 ";
  for (const Knot& knot : knots)
    text += "L0 L132 [132,1 L-1 L1000 L23 V" + std::to_string(knot.color.x) + "," + std::to_string(knot.color.y) + "," +
            std::to_string(knot.color.z) + " L1001 L19 R" + std::to_string(knot.brightness) + " L1004 L15 L" +
            std::to_string(knot.id) + " ] ";
  return Record(text + "] ]");
}

// Reads a container's value from its type on, with a Long 77 behind it that must be in step.
bool ReadValue(GeData& value, const Bytes& body, Long level, Long version = 13000)
{
  ByteWriter w;
  w.Header("Q7R6", version).Long(kCustomGradient).Start(0, level).Append(body).End().Long(77);
  MemoryReadFile memory(w.bytes);
  Long witness = 0;
  return value.Read(memory.file) && memory.file.ReadLong(witness) && witness == 77;
}

GradientData& GradientOf(const GeData& value)
{
  return static_cast<GradientData&>(*value.GetCustomDataType(kCustomGradient));
}

double RedAt(const GradientData& gradient, double position)
{
  Vector color(-1, -1, -1);
  EXPECT_TRUE(gradient.EvaluateGradient(position, color));
  return color.x;
}

const Vector kBlack, kWhite(1, 1, 1);

} // namespace

TEST(Gradient, ReadsEveryLevelAndVersion)
{
  const Vector half(0.5, 0.25, 0.125);
  const Bytes knots = SettingsBytes({{0, 0, half, 0.5, 0}, {1, 0, half, 0.25, 7}, {0, 0, half, 1, 0}});
  const Bytes both = ByteWriter().Append(knots).Bool(true).Append(knots).bytes;
  for (Long version : {11004, 11005, 13000}) {
    SCOPED_TRACE(version);
    const bool old = version == 11004;
    GeData value;
    ASSERT_TRUE(ReadValue(value, ByteWriter().Append(both).Real(1).bytes, 2, version));
    GradientData& gradient = GradientOf(value);
    EXPECT_EQ(gradient.IsFromOldFile(), old);
    EXPECT_FALSE(gradient.IsAlpha());
    ASSERT_TRUE(gradient.GetAlpha() && gradient.GetAlpha()->IsAlpha());
    const Long ids[] = {8, 7, 9};
    for (Long i = 0; i < 3; ++i) {
      EXPECT_TRUE(KnotAt(gradient, i).GetVector(kKnotColor) == half);
      EXPECT_EQ(KnotAt(gradient, i).GetLong(kKnotId), ids[i]);
      EXPECT_EQ(KnotAt(*gradient.GetAlpha(), i).GetLong(kKnotId), ids[i]);
      EXPECT_TRUE(KnotAt(*gradient.GetAlpha(), i).GetVector(kKnotColor) == (old ? kWhite : half));
    }
    EXPECT_EQ(KnotAt(*gradient.GetAlpha(), 1).GetReal(kKnotBrightness), old ? 0.125 : 0.25);
  }
  GeData value;
  ASSERT_TRUE(ReadValue(value, both, 0)); // nothing of it is read
  EXPECT_EQ(GradientOf(value).GetSettings().GetContainerInstance(kGradientKnots)->GetCount(), 0);
  EXPECT_EQ(GradientOf(value).GetAlpha(), nullptr);
}

TEST(Gradient, GivesAndTakesItsPartsByPath)
{
  GradientData gradient;
  AddKnots(gradient, {{0.5, 0.25, {1, 2, 3}, 0.75, 3}, {0, 0, kBlack, 1, 3}});
  constexpr Long kAlpha = 1000000000;
  // Of the knot of id 3, and then set to one more.
  const std::pair<ParameterPath, double> answered[] = {
      {1000, 0}, {10301, 0.75}, {10302, 0.5}, {10303, 0.25}, {{{10300}, {1001}}, 2}};
  const ParameterPath refused[] = {999,    9999,          10304,          10399,     10400, {{10300}, {1003}},
                                   kAlpha, kAlpha + 1000, kAlpha + 10301, kAlpha + 5};
  GeData value;
  for (const auto& [path, number] : answered) {
    ULong flags = 0;
    EXPECT_TRUE(gradient.GetGradientValue(path, value, flags));
    EXPECT_EQ(flags, 2U);
    EXPECT_EQ(value.GetReal(), number) << path[0].id;
    EXPECT_TRUE(gradient.SetParameter(path, GeData(number + 1)) && gradient.GetParameter(path, value));
    EXPECT_EQ(value.GetReal(), number + 1) << path[0].id;
  }
  EXPECT_TRUE(gradient.GetParameter(10300, value) && value.GetVector() == Vector(1, 3, 3));
  const GeData before(kCustomGradient, gradient);
  for (const ParameterPath& path : refused) {
    ULong flags = 0;
    EXPECT_FALSE(gradient.GetGradientValue(path, value, flags) || gradient.SetGradientValue(path, GeData(5.0), flags));
    EXPECT_EQ(flags, 0U) << path[0].id;
  }
  EXPECT_TRUE(gradient.IsEqual(*before.GetCustom()));

  AddKnots(*gradient.NeedAlpha(), {{0, 0, kBlack, 0.5, 3}});
  EXPECT_TRUE(gradient.SetParameter(kAlpha + 1000, GeData(4)) && gradient.SetParameter(kAlpha + 10301, GeData(0.1)));
  EXPECT_TRUE(gradient.SetParameter(kAlpha + 10300, GeData(kWhite)));
  EXPECT_EQ(gradient.GetAlpha()->GetSettings().GetLong(1000), 4);
  EXPECT_EQ(KnotAt(*gradient.GetAlpha(), 0).GetReal(kKnotBrightness), 0.1);
  EXPECT_TRUE(gradient.GetParameter(ParameterPath(), value)); // the whole
  GradientData other;
  EXPECT_TRUE(other.SetParameter(ParameterPath(), value) && !GradientsDiffer(other, gradient));
  EXPECT_FALSE(other.SetParameter(ParameterPath(), GeData(1.0)));
}

TEST(Gradient, CopiesAndComparesAllThatItHolds)
{
  GradientData gradient, other;
  AddKnots(gradient, {{0.5, 0.25, kWhite}});
  EXPECT_TRUE(GradientsDiffer(gradient, other) && CopyGradient(gradient, other) && !GradientsDiffer(gradient, other));
  gradient.NeedAlpha();
  EXPECT_TRUE(GradientsDiffer(gradient, other) && GradientsDiffer(other, gradient));
  EXPECT_TRUE(CopyGradient(gradient, other) && !GradientsDiffer(gradient, other) && other.GetAlpha()->IsAlpha());
  AddKnots(*gradient.GetAlpha(), {{0, 0, kBlack}});
  EXPECT_TRUE(GradientsDiffer(gradient, other) && GradientsDiffer(*GradientData().NeedAlpha(), GradientData()));

  other.GetSettings() = gradient.GetSettings();
  EXPECT_TRUE(other.PrepareGradient() && CopyGradient(GradientData(), other));
  EXPECT_EQ(TakeReports(), Reports{"int_customgui_gradient:107"});
  EXPECT_TRUE(other.GetAlpha() == nullptr && other.GetKnotCount() == 0);
}

TEST(Gradient, PreparesItsKnotsInOrderOfPosition)
{
  GradientData gradient;
  EXPECT_TRUE(gradient.PrepareGradient() && gradient.GetKnotCache() == nullptr);
  Vector color;
  EXPECT_FALSE(gradient.EvaluateGradient(0.5, color));

  AddKnots(gradient, {{0.9, 0, kWhite}, {0.1, 0, kWhite}, {0.5, 0, kWhite}, {0.1, 0.5, kWhite}});
  AddKnots(*gradient.NeedAlpha(), {{0, 0, {0.25, 1, 1}}});
  gradient.GetSettings().SetBool(kGradientCacheFlag, true);
  ASSERT_TRUE(gradient.PrepareGradient());
  ASSERT_EQ(gradient.GetKnotCount(), 4);
  const ULong order[] = {1, 3, 2, 0};
  for (Long i = 0; i < 4; ++i)
    EXPECT_EQ(gradient.GetKnotCache()[i].index, order[i]);
  EXPECT_TRUE(gradient.GetCacheFlag() && gradient.GetAlpha()->GetKnotCache()->color == Vector(0.25, 0.25, 0.25));

  // Enough knots for several rounds of the sort.
  GradientData many;
  for (unsigned i = 0; i < 500; ++i)
    AddKnots(many, {{(i * 7919U % 500U) / 500.0, 0, kBlack}});
  ASSERT_TRUE(many.PrepareGradient());
  for (Long i = 0; i < 500; ++i)
    EXPECT_EQ(many.GetKnotCache()[i].position, i / 500.0);

  const auto prepare = [&] {
    gradient.FreeGradientCache();
    const bool prepared = gradient.PrepareGradient();
    EXPECT_EQ(gradient.GetKnotCache() && gradient.GetAlpha()->GetKnotCache(), prepared); // both or none
    EXPECT_EQ(gradient.GetKnotCache() || gradient.GetAlpha()->GetKnotCache(), prepared);
    gradient.FreeGradientCache();
    return prepared;
  };
  EveryFailedAllocation(prepare);
}

TEST(Gradient, BlendsAsWorkedOutByHand)
{
  // Knots at 0.2 (red 0, bias 0.25), 0.6 (red 1 at brightness 2, bias 0.5) and 1.0 (red 0.5). In the first stretch
  // 0.3 is its quarter: the bias point, where half of 2 is reached.
  const std::tuple<Long, double, double> cases[] = {
      {0, 0.0, 0.0},  {0, 0.2, 0.0},   {0, 0.25, 0.5},  {0, 0.3, 1.0}, {0, 0.45, 1.5}, {0, 0.6, 2.0},
      {0, 0.8, 1.25}, {0, 0.9, 0.875}, {0, 1.0, 0.5},   {0, 7.0, 0.5}, {2, 0.3, 1.0},  {3, 0.25, 0.5},
      {1, 0.3, 0.5},  {4, 0.3, 0.5},   {5, 0.45, 1.25}, {6, 0.3, 0.5}, {7, 0.9, 0.875}};
  for (const auto& [mode, position, red] : cases) {
    GradientData gradient;
    AddKnots(gradient, {{1.0, 0.5, {0.5, 0, 0}}, {0.2, 0.25, kBlack}, {0.6, 0.5, {1, 0, 0}, 2.0}});
    gradient.GetSettings().SetLong(kGradientInterpolation, mode);
    ASSERT_TRUE(gradient.PrepareGradient());
    EXPECT_NEAR(RedAt(gradient, position), red, 1e-12) << "mode " << mode << " at " << position;
  }
  for (Long mode : {-1, 8}) {
    GradientData gradient;
    AddKnots(gradient, {{0, 0, kWhite}});
    gradient.GetSettings().SetLong(kGradientInterpolation, mode);
    Vector color;
    EXPECT_TRUE(gradient.PrepareGradient() && !gradient.EvaluateGradient(0.5, color));
  }
  // A bias at either end, and two knots at one place.
  for (double bias : {0.0, 1.0}) {
    GradientData gradient;
    AddKnots(gradient, {{0, bias, kBlack}, {1, 0.5, kWhite}, {1, 0.5, {3, 3, 3}}});
    ASSERT_TRUE(gradient.PrepareGradient());
    EXPECT_NEAR(RedAt(gradient, 0.5), bias == 0.0 ? 0.75 : 0.25, 1e-12);
    EXPECT_EQ(RedAt(gradient, 1.0), 3.0);
  }
}

TEST(Gradient, MirrorsItsKnotsAndTheirBiases)
{
  GradientData gradient;
  AddKnots(gradient, {{0.75, 0.125, {1, 0, 0}}, {0, 0.25, kBlack}, {1, 0.5, {0.5, 0, 0}}});
  ASSERT_TRUE(gradient.PrepareGradient());
  const double before[] = {RedAt(gradient, 0.1), RedAt(gradient, 0.3), RedAt(gradient, 0.8), RedAt(gradient, 0.95)};
  gradient.MirrorGradient();
  EXPECT_EQ(gradient.GetKnotCache(), nullptr);
  // Each bias is that of the stretch which the knot begins now; the last knot has what the first one had.
  const double expected[3][2] = {{0.25, 0.75}, {1, 0.5}, {0, 0.875}};
  for (Long i = 0; i < 3; ++i) {
    EXPECT_EQ(KnotAt(gradient, i).GetReal(kKnotPosition), expected[i][0]);
    EXPECT_EQ(KnotAt(gradient, i).GetReal(kKnotBias), expected[i][1]);
  }
  ASSERT_TRUE(gradient.PrepareGradient());
  const double after[] = {RedAt(gradient, 0.9), RedAt(gradient, 0.7), RedAt(gradient, 0.2), RedAt(gradient, 0.05)};
  for (int i = 0; i < 4; ++i)
    EXPECT_NEAR(after[i], before[i], 1e-12);

  // A file may have other things among the knots, and nothing else: only knots count.
  for (const bool hasKnot : {true, false}) {
    GradientData single;
    if (hasKnot)
      AddKnots(single, {{0.25, 0.25, kWhite}});
    single.GetSettings().GetContainerInstance(kGradientKnots)->SetLong(9, 2);
    ASSERT_TRUE(single.PrepareGradient());
    EXPECT_EQ(single.GetKnotCache() != nullptr, hasKnot);
    single.MirrorGradient();
    EXPECT_EQ(single.GetSettings().GetContainerInstance(kGradientKnots)->GetLong(9), 2);
    EXPECT_TRUE(!hasKnot || KnotAt(single, 0).GetReal(kKnotPosition) == 0.25);
    EXPECT_TRUE(!hasKnot || KnotAt(single, 0).GetReal(kKnotBias) == 0.25);
  }
}

TEST(Gradient, TakesItsOwnTransparencyAsTheWhole)
{
  GradientData gradient;
  AddKnots(gradient, {{0.5, 0, kBlack}});
  AddKnots(*gradient.NeedAlpha(), {{0.25, 0, kWhite}});
  EXPECT_TRUE(CopyGradient(*gradient.GetAlpha(), gradient));
  EXPECT_EQ(KnotAt(gradient, 0).GetReal(kKnotPosition), 0.25);
  EXPECT_TRUE(gradient.IsAlpha() && !gradient.GetAlpha());
}
