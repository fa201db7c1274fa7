// Photometric files: lines, words and numbers, what the parser makes of them, and the light that a table gives in each
// direction.
#include "q7r_file/ies_files.h"
#include "support/library.h"

namespace
{

constexpr double kTurn = 3.141592653589793 / 180.0;

// What stands behind the counts of a table of two vertical angles and one horizontal angle.
const std::string kOpening = " 1 2 0 0 0  1 1 1 ";
const std::string kTable = "0 90  0  100 50\n";
const std::string kNumbers = "1 -1 1 2 1" + kOpening + kTable;
const std::string kHead = "IESNA91\nTILT=NONE\n";

void ExpectUnreadable(const std::string& text)
{
  IESPtr light(NewObj<IESLight>());
  const IESLight* before = light.get();
  EXPECT_EQ(LoadText(text, light), -5) << text.substr(0, 200);
  EXPECT_EQ(light.get(), before);
}

// The first intensity of the table of a text that makes 100 of it when all is well; NaN when it can't be read.
double FirstValue(const std::string& text)
{
  const IESPtr light = LoadText(text);
  return light && light->candela.GetCount() > 0 ? light->candela[0] : std::nan("");
}

std::string Repeat(const char* text, int count)
{
  std::string all;
  for (int i = 0; i < count; ++i)
    all += text;
  return all;
}

// A distribution of a full table.
IESPtr Table(const std::vector<double>& vertical, const std::vector<double>& horizontal,
             const std::vector<double>& candela)
{
  IESPtr light(NewObj<IESLight>());
  Assign(light->verticalAngles, vertical);
  Assign(light->horizontalAngles, horizontal);
  Assign(light->candela, candela);
  light->maxCandela = *std::max_element(candela.begin(), candela.end());
  return light;
}

// The direction of a file's angles, in degrees.
Vector Direction(double vertical, double horizontal)
{
  const double z = -std::cos(vertical * kTurn) / 0.999999;
  const double side = std::sin(vertical * kTurn);
  return {side * std::sin(horizontal * kTurn), side * std::cos(horizontal * kTurn), z};
}

} // namespace

TEST(IESFile, TellsTheShapeAndSizeOfTheOpeningByTheirSigns)
{
  struct Row
  {
    int x, l, h;
    Long shape;
    Vector size;
  };
  constexpr Row kRows[] = {{1, 1, 0, 1, {2, 3, 0}},  {1, 0, 1, 1, {2, 4, 0}},  {0, 1, 1, 1, {4, 3, 0}},
                           {1, 1, 1, 4, {2, 3, 4}},  {-1, 0, 0, 0, {2, 2, 2}}, {-1, 0, -1, 2, {2, 2, 2}},
                           {-1, 0, 1, 3, {2, 2, 4}}, {0, 1, -1, 8, {3, 4, 4}}, {1, 0, -1, 8, {2, 4, 4}},
                           {-1, 1, 1, 0, {2, 3, 0}}, {1, -1, 1, 0, {2, 3, 0}}, {-1, 1, -1, 2, {2, 3, 4}},
                           {1, -1, -1, 2, {2, 3, 4}}};
  int known = 0;
  for (int signs = 0; signs < 27; ++signs) {
    const Row asked = {signs / 9 - 1, signs / 3 % 3 - 1, signs % 3 - 1, -1, {}};
    const Row* row = std::find_if(std::begin(kRows), std::end(kRows),
                                  [&](const Row& r) { return r.x == asked.x && r.l == asked.l && r.h == asked.h; });
    known += row != std::end(kRows);
    const Row& expected = row == std::end(kRows) ? asked : *row;
    const std::string opening =
        std::to_string(2 * asked.x) + " " + std::to_string(3 * asked.l) + " " + std::to_string(4 * asked.h);
    for (int unit : {1, 2, 0}) {
      const IESPtr light = LoadText(kHead + "1 -1 1 0 0 1 " + std::to_string(unit) + " " + opening + " 1 1 1");
      ASSERT_NE(light, nullptr) << opening;
      EXPECT_EQ(light->shape, expected.shape) << opening;
      const Vector size = expected.size * (unit == 1 ? 0.3048 : 1.0);
      EXPECT_TRUE(light->size == size) << opening << " in unit " << unit << ": " << light->size.x << " "
                                       << light->size.y << " " << light->size.z;
    }
  }
  EXPECT_EQ(known, 13);
}

TEST(IESFile, ReadsNumbersInEveryLegalFormAndNoOther)
{
  const std::map<std::string, double> legal = {
      {"2", 200},    {"-2", -200},      {"0.5", 50},    {".5", 50},     {"5.", 500},   {"007", 700},
      {"2e1", 2000}, {"2E1", 2000},     {"2e+1", 2000}, {"20e-1", 200}, {"-.25", -25}, {"2.5E-1", 25},
      {"1e0", 100},  {"12.5e1", 12500}, {"0e9999", 0},  {"1e-9999", 0}, {"-0", 0},     {"0.1", 10}};
  for (const auto& [text, value] : legal)
    EXPECT_DOUBLE_EQ(FirstValue(kHead + "1 -1 " + text + " 2 1" + kOpening + kTable), value) << text;
  for (const char* text : {"+1",  "--1", "1-2", "1-",   "1.2.3", "1e2e3", "1e2.5", "1e",  "1e+", "e5",    ".",    "-",
                           "-e1", "x",   "1x",  "0x10", "1;",    "1e999", "nan",   "inf", "1e-", "1e--2", "1\xA0"})
    ExpectUnreadable(kHead + "1 -1 " + text + " 2 1" + kOpening + kTable);
  // A product that no number holds.
  ExpectUnreadable(kHead + "1 -1 1e300 2 1" + kOpening + "0 90 0 1e300 50");
  // Integers lose what stands behind the point.
  EXPECT_EQ(FirstValue(kHead + "1.9 -1 1 2.9 1.2 1.5 2.7 0 0 0  1 1 1 " + kTable), 100);
}

TEST(IESFile, TakesNumbersAcrossLinesAndSeparators)
{
  for (const char* separator : {" ", "\t", ",", "=", ", ", " \t ", "\n", "\r\n", "\n\n", "\r\n \r\n", ",\n", "= "}) {
    std::string text = kHead;
    for (const char* number : {"1", "-1", "1", "2", "1", "1", "2", "0", "0", "0", "1", "1", "1", "0", "90", "0", "100"})
      text += std::string(number) + separator;
    EXPECT_EQ(FirstValue(text + "50"), 100) << testing::PrintToString(separator);
  }
  // An empty word is no number.
  for (const char* start : {"1,,-1 1", "1 , -1 1", ",1 -1 1", "1 -1 =1"})
    ExpectUnreadable(kHead + start + " 2 1" + kOpening + kTable);
  // A zero byte ends its line.
  const std::string zero(1, '\0');
  EXPECT_EQ(FirstValue(kHead + "1 -1 1 2 1" + zero + " none of this\n" + kOpening + kTable), 100);
  // What follows the table isn't looked at, and a number too few is missed.
  EXPECT_EQ(FirstValue(kHead + kNumbers + "and so on"), 100);
  ExpectUnreadable(kHead + "1 -1 1 2 1" + kOpening + "0 90 0 100");
}

TEST(IESFile, CutsLongLinesAndWords)
{
  // 512 characters are a line, what remains is the next one: there a keyword counts again.
  IESPtr light = LoadText("[LAMP] " + std::string(505, 'x') + "[LUMCAT] behind\n" + kHead + kNumbers);
  ASSERT_NE(light, nullptr);
  EXPECT_TRUE(light->lamp.GetLength() == 505 && light->luminaireCatalogue == String("behind"));
  // A number on the border becomes two: 12 is read as 1 and 2.
  EXPECT_EQ(FirstValue(kHead + std::string(511, ' ') + "12 1 2 1" + kOpening + kTable), 100);
  // Of a word 256 characters count.
  EXPECT_EQ(FirstValue(kHead + "1 -1 " + std::string(256, '0') + "5 2 1" + kOpening + kTable), 0);
  EXPECT_EQ(FirstValue(kHead + "1 -1 " + std::string(255, '0') + "5 2 1" + kOpening + kTable), 500);
  // Lines across the borders of the reader's own buffer.
  for (int length : {1000, 1006, 1007, 1008, 1023, 1024, 1025, 2040}) {
    std::string pad = kHead.substr(0, 8);
    while (static_cast<int>(pad.size()) < length)
      pad += "x" + std::string(static_cast<std::size_t>(std::min(99, length - static_cast<int>(pad.size()))), 'y') +
             "\r\n";
    EXPECT_EQ(FirstValue(pad + kHead.substr(8) + kNumbers), 100) << length;
  }
}

TEST(IESFile, TakesVersionAndTextsFromTheirExactKeywords)
{
  const std::map<std::string, Long> versions = {{"IESNA91", 1},
                                                {"IESNA:LM-63-1995", 2},
                                                {"IESNA:LM-63-2002", 0},
                                                {"iesna91", 0},
                                                {"IESNA86", 0},
                                                {"\t IESNA91", 1},
                                                {"IESNA91 and more", 1},
                                                {"IESNA91x", 0},
                                                {"", 0},
                                                {"IESNA91\nIESNA:LM-63-1995", 2}};
  for (const auto& [line, version] : versions) {
    const IESPtr light = LoadText(line + "\nTILT=NONE\n" + kNumbers);
    ASSERT_NE(light, nullptr) << line;
    EXPECT_EQ(light->fileVersion, version) << line;
    EXPECT_EQ(light->tiltMode, 1) << line;
  }
  const IESPtr light =
      LoadText("[MANUFAC] \t Sun & Co, Moon=2 \n[LUMCAT]=L-1\n[LUMINAIRE] first\n[LUMINAIRE] Disc\n"
               "[LAMPCAT]\n[LAMP]\ta\\u00e9\n[lamp] no\n[LAMP]no\n[MORE] no\nx [LAMP] no\nnot a keyword\n" +
               kHead + kNumbers);
  ASSERT_NE(light, nullptr);
  EXPECT_EQ(light->manufacturer, String("Sun & Co, Moon=2 "));
  EXPECT_TRUE(light->luminaireCatalogue == String("L-1") && light->luminaire == String("Disc"));
  EXPECT_EQ(light->lampCatalogue, String());
  EXPECT_EQ(Units(light->lamp), u"a\u00E9");
}

TEST(IESFile, ReadsOrRefusesTheTiltOfTheLamp)
{
  for (const char* data : {"1 2 0 90 1 0.5 ", "2 0 ", "1 1 0\n1 ", "1 -3 "}) {
    const IESPtr light = LoadText(std::string("IESNA91\nTILT=INCLUDE\n") + data + kNumbers);
    ASSERT_NE(light, nullptr) << data;
    EXPECT_TRUE(light->tiltMode == 2 && light->candela[0] == 100);
  }
  EXPECT_EQ(FirstValue("IESNA91\n TILT NONE\n" + kNumbers), 100);
  for (const char* line : {"TILT", "TILT=", "TILT=none", "TILT=lamp.tlt", "TILT==NONE", "TILT=TILT", "TILT=IESNA91"})
    ExpectUnreadable(std::string("IESNA91\n") + line + "\n" + kNumbers);
  for (const char* data : {"", "1", "1 x", "1 2 0 90 1", "1 2147483647 0"})
    ExpectUnreadable(std::string("IESNA91\nTILT=INCLUDE\n") + data);
}

TEST(IESFile, RefusesCountsOutOfRangeAndTablesThatEndEarly)
{
  const std::tuple<int, int, Long> kCases[] = {{0, 0, 1},    {0, 1, 1},    {1, 0, 1},     {1, 1, 1},
                                               {1024, 1, 1}, {1, 1024, 1}, {1025, 1, -5}, {1, 1025, -5},
                                               {-1, 1, -5},  {1, -1, -5},  {1025, 0, -5}, {0, 1025, -5}};
  for (const auto& [vertical, horizontal, result] : kCases) {
    const int table = std::max(vertical, 0) * std::max(horizontal, 0);
    const std::string counts = std::to_string(vertical) + " " + std::to_string(horizontal);
    const std::string head = kHead + "1 -1 1 " + counts + kOpening + Repeat("1 ", vertical) + Repeat("2\n", horizontal);
    IESPtr light;
    EXPECT_EQ(LoadText(head + Repeat("3 ", table), light), result) << counts;
    if (result == 1) {
      EXPECT_TRUE(light->GetVerticalCount() == vertical && light->GetHorizontalCount() == horizontal) << counts;
      EXPECT_EQ(light->candela.GetCount(), table);
      EXPECT_EQ(light->maxCandela, table > 0 ? 3 : 0);
    }
    if (table > 0)
      ExpectUnreadable(head + Repeat("3 ", table - 1));
  }
  // The counts are looked at behind the opening: it must be there first.
  ExpectUnreadable(kHead + "1 -1 1 1 1 1 2 0 0 0 1 1");
  EXPECT_LT(counting_memory::PeakOf([] { ExpectUnreadable(kHead + "1 -1 1 1024 1024" + kOpening + "1 2 3"); }), 20000);
}

TEST(IESFile, MultipliesTheTableByItsFactors)
{
  const IESPtr light = LoadText(kHead + "3 1000 2 2 2 1 2 0 0 0  1.5 7 4  0 90  0 90  10 20 30 -5");
  ASSERT_NE(light, nullptr);
  EXPECT_EQ(Values(light->candela), (std::vector<double>{120, 240, 360, -60}));
  EXPECT_EQ(Values(light->verticalAngles), (std::vector<double>{0, 90}));
  EXPECT_EQ(light->maxCandela, 360);
  // Lines alone are a file without a table.
  const IESPtr none = LoadText("IESNA91\n[LAMP] only");
  ASSERT_NE(none, nullptr);
  EXPECT_TRUE(none->lamp == String("only") && none->candela.GetCount() == 0);
  EXPECT_EQ(none->GetTotalFlux(), 12.566370614359172);
}

TEST(IESFile, LooksForItsMarkInTheFirst1024Bytes)
{
  const std::string data = "\nTILT=NONE\n" + kNumbers;
  const std::map<std::string, Long> files = {{"", -2},
                                             {"IES", -2},
                                             {"TILT=NO", -2}, // seven bytes from the end
                                             {"TILT=NON", -5},
                                             {"xTiLtabcd", 1},
                                             {"iesnxxxx", 1},
                                             {"plain text of another kind", -2},
                                             {std::string(1015, '\n') + data, 1},
                                             {std::string(1016, 'x') + "\nTILT=NONE\n" + kNumbers, -2},
                                             {std::string(1015, 'x') + "\nTILT=NONE\n" + kNumbers, 1}};
  for (const auto& [text, result] : files) {
    IESPtr light;
    EXPECT_EQ(LoadText(text, light), result) << text.size() << ": " << text.substr(0, 30);
  }
}

TEST(IESFile, ToldFailuresLeaveTheTargetAlone)
{
  const TempFolder folder;
  IESLight* light = nullptr;
  EXPECT_EQ(LoadIESFile(light, Filename((folder / "none.ies").c_str())), -1);
  EXPECT_EQ(light, nullptr);
  std::map<Long, int> results;
  EveryFailedAllocation(
      [&, text = "[LAMP] x\n" + kHead + kNumbers] {
        IESPtr target(NewObj<IESLight>());
        const IESLight* before = target.get();
        const Long result = LoadText(text, target);
        EXPECT_TRUE(result == 1 || target.get() == before);
        ++results[result];
        return result == 1 ? std::move(target) : nullptr;
      },
      [](const IESPtr& read) { return std::make_pair(Utf8(read->lamp), read->candela.GetCount()); });
  EXPECT_TRUE(results[-3] > 0 && results[1] > 0 && !results.contains(-5));
  std::map<std::string, Long> sentences;
  for (Long result : {1, -1, -2, -3, -5, -4})
    sentences[GetIESResultText(result)] = result;
  EXPECT_EQ(sentences.size(), 6U);
}

// The samples once more, by the generator's rule: those that fall into the lower half, out of all.
TEST(IESLight, SumsTheSameDirectionsEachTime)
{
  std::uint32_t seed = 117641;
  auto draw = [&seed] {
    seed = ((seed + 1) * 69069U) & 0x7FFFFFFFU;
    return seed / 2147483649.0 * 2.0 - 1.0;
  };
  int below = 0;
  double heights = 0;
  for (int i = 0; i < 65536;) {
    const double x = draw(), y = draw(), z = draw();
    const double length = std::sqrt(x * x + y * y + z * z);
    if (length > 1.0)
      continue;
    ++i;
    below += z <= 0.0;
    heights += std::acos(-0.999999 * z / length) / kTurn / 180.0;
  }
  constexpr double kSample = 0.00019174759848570515;
  const IESPtr lower = LoadText(kHead + "1 -1 3 2 1" + kOpening + "0 90 0 200 200");
  EXPECT_NEAR(lower->GetTotalFlux(), below * kSample, 1e-9);
  EXPECT_NEAR(lower->GetLumens(), 600 * 6.2831853, 38); // 1 %
  const IESPtr all = LoadText(kHead + "1 -1 1 2 1" + kOpening + "0 180 0 7 7");
  EXPECT_NEAR(all->GetTotalFlux(), 12.566370614359172, 1e-9);
  const IESPtr slope = LoadText(kHead + "1 -1 1 2 1" + kOpening + "0 180 0 0 50");
  EXPECT_NEAR(slope->GetTotalFlux(), heights * kSample, 1e-9);
}

TEST(IESLight, FoldsHorizontalAnglesByTheSymmetryOfItsTable)
{
  // rows: a row has one value all along
  const std::tuple<std::vector<double>, std::vector<double>, std::map<double, double>> cases[] = {
      {{0}, {10}, {{0, 10}, {90, 10}, {200, 10}}},
      {{0, 44}, {10, 20}, {{0, 10}, {44, 10}, {200, 10}}},
      {{0, 90}, {10, 20}, {{0, 10}, {45, 15}, {90, 20}, {135, 15}, {180, 10}, {225, 15}, {270, 20}, {315, 15}}},
      {{0, 134}, {20, 87}, {{100, 60}, {300, 50}}},
      {{0, 135}, {0, 135}, {{100, 100}, {300, 60}}},
      {{0, 90, 180}, {10, 20, 40}, {{45, 15}, {135, 30}, {180, 40}, {225, 30}, {270, 20}, {315, 15}}},
      {{90, 180, 270}, {10, 20, 40}, {{90, 10}, {180, 20}, {0, 20}, {270, 40}, {315, 30}, {45, 15}}},
      {{0, 224}, {0, 224}, {{200, 160}, {300, 60}}},
      {{0, 225}, {0, 450}, {{100, 200}, {200, 400}, {300, 600}}}, // beyond the last angle the slope goes on
      {{0, 90, 180, 270, 360},
       {10, 20, 30, 40, 10},
       {{45, 15}, {225, 35}, {270, 40}, {315, 25}, {350, 40 - 80 / 3.0}}}};
  for (const auto& [angles, rows, expected] : cases) {
    std::vector<double> candela;
    for (double row : rows)
      candela.insert(candela.end(), 3, row);
    const IESPtr light = Table({0, 90, 180}, angles, candela);
    for (const auto& [angle, value] : expected)
      EXPECT_NEAR(light->SampleIESLight(Direction(60, angle)) * light->maxCandela, value, 1e-9)
          << angles.size() << " angles up to " << angles.back() << ", at " << angle;
  }
  // Exactly sideways.
  const IESPtr light = Table({0, 180}, {0, 90, 180, 270, 360}, {1, 1, 2, 2, 3, 3, 4, 4, 1, 1});
  const std::pair<Vector, double> axes[] = {{{0, 1, 0}, 1}, {{1, 0, 0}, 2}, {{0, -1, 0}, 3}, {{-1, 0, 0}, 4}};
  for (const auto& [direction, value] : axes)
    EXPECT_NEAR(light->SampleIESLight(direction) * 4, value, 1e-12);
}

TEST(IESLight, FollowsACubicThroughItsVerticalAngles)
{
  const IESPtr light = Table({0, 30, 90, 180}, {0}, {100, 60, 20, 40});
  const std::map<double, double> expected = {{0.5, 0.9932969135802469},
                                             {10, 0.8567901234567902},
                                             {30, 0.6},
                                             {50, 0.42320987654320985},
                                             {75, 0.24875},
                                             {90, 0.2},
                                             {135, 0.26},
                                             {170, 0.3742661179698217}};
  for (const auto& [angle, value] : expected)
    EXPECT_NEAR(light->SampleIESLight(Direction(angle, 77)), value, 1e-9) << angle;
  // The cubic may pass below 0, the light can't; over the middle it rises from 0 to 90.
  const IESPtr steep = Table({0, 30, 90, 180}, {0}, {0, 0, 90, 0});
  EXPECT_EQ(steep->SampleIESLight(Direction(20, 0)), 0.0);
  EXPECT_NEAR(steep->SampleIESLight(Direction(50, 0)), 0.35802469135802467, 1e-9);
  // Poles, and what lies outside the table.
  for (const IESPtr& one : {Table({0, 180}, {0}, {8, 8}), Table({0, 90, 180}, {0, 90}, {8, 8, 8, 8, 8, 8})}) {
    EXPECT_NEAR(one->SampleIESLight({0, 0, -1}), 1.0, 1e-12);
    EXPECT_NEAR(one->SampleIESLight({0, 0, 1}), 1.0, 1e-12);
  }
  const IESPtr band = Table({30, 60}, {0}, {5, 5});
  for (const auto& [angle, value] : std::map<double, double>{{29.9, 0}, {30.1, 1}, {59.9, 1}, {60.1, 0}})
    EXPECT_NEAR(band->SampleIESLight(Direction(angle, 10)), value, 1e-12) << angle;
}

TEST(IESLight, GivesNoLightWithoutAUsableTable)
{
  const Vector down(0, 0, -1);
  EXPECT_EQ(IESLight().SampleIESLight(down), 0.0);
  EXPECT_EQ(Table({0, 180}, {}, {1})->SampleIESLight(down), 0.0);
  EXPECT_EQ(Table({}, {0}, {1})->SampleIESLight(down), 0.0);
  EXPECT_EQ(Table({0, 180}, {0, 90}, {1, 1, 1})->SampleIESLight(down), 0.0); // a value too few
  EXPECT_EQ(Table({0, 180}, {0}, {0, 0})->SampleIESLight(down), 0.0);        // nothing to relate to
  EXPECT_EQ(Table({0, 180}, {0}, {-4, -4})->SampleIESLight(down), 0.0);
  EXPECT_TRUE(std::isfinite(Table({40, 40, 40}, {5, 5}, {1, 2, 3, 4, 5, 6})->SampleIESLight(Direction(40, 5))));
  EXPECT_EQ(Table({0, 180}, {0}, {4, 4})->SampleIESLight({0, 0, std::numeric_limits<double>::quiet_NaN()}), 0.0);
}
