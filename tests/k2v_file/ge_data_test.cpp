#include "support/library.h"

namespace
{

GeData Custom(Long type)
{
  GeData value;
  EXPECT_TRUE(value.SetType(type));
  return value;
}

GeData ThreeNumbers(Long first, Long second, Bool third)
{
  GeData value = Custom(kCustomThreeNumbers);
  auto* numbers = static_cast<ThreeNumbersData*>(value.GetCustom());
  numbers->first = first;
  numbers->second = second;
  numbers->third = third;
  return value;
}

BaseContainer SmallContainer()
{
  BaseContainer container(7);
  container.InsertData(1, GeData(true));
  container.InsertData(2, GeData(static_cast<void*>(nullptr))); // left out of the file
  return container;
}

std::string Written(const GeData& value)
{
  return ToHex(WriteToMemory([&](HyperFile& file) { EXPECT_TRUE(value.Write(file)); }));
}

// Values of every kind with their bytes in a file.
struct Form
{
  GeData value;
  std::string hex;
};

std::vector<Form> Forms()
{
  const std::string zero = "00 00 00 00 00 00 00 00 ";
  const std::string one = "3F F0 00 00 00 00 00 00 ";
  std::string matrix =
      "0F 00 00 00 19 19 " + zero + zero + zero + one + zero + zero + zero + one + zero + zero + zero + one;
  matrix.pop_back();
  return {
      {GeData(), "0F 00 00 00 00"},
      {GeData(static_cast<void*>(nullptr)), "0F 00 00 00 0E"},
      {GeData(-2), "0F 00 00 00 0F 0F FF FF FF FE"},
      {GeData(true), "0F 00 00 00 0F 0F 00 00 00 01"},
      {GeData(1.5), "0F 00 00 00 13 13 3F F8 00 00 00 00 00 00"},
      {GeData(BaseTime(1.0, 25.0)), "0F 00 00 00 16 16 3F F0 00 00 00 00 00 00 40 39 00 00 00 00 00 00"},
      {GeData(Vector(1, -2, 0.5)),
       "0F 00 00 00 17 17 3F F0 00 00 00 00 00 00 C0 00 00 00 00 00 00 00 3F E0 00 00 00 00 00 00"},
      {GeData(Matrix()), matrix},
      {GeData(LLong{0x123456789A}), "0F 00 00 00 1A 11 00 00 00 12 34 56 78 9A"},
      {GeData(String("A\xE9")), "0F 00 00 00 82 82 00 00 00 04 00 41 00 E9"},
      {GeData(Filename("x")), "0F 00 00 00 83 83 00 00 00 02 00 78"},
      {GeData(SmallContainer()),
       "0F 00 00 00 84 01 00 00 00 84 00 00 00 01 0F 00 00 00 07 0F 00 00 00 01 0F 00 00 00 0F 0F 00 00 00 01 02"},
      {GeData(GeAliasLink()), "0F 00 00 00 85 80 00 00 00 0E 61 6C 69 61 73 32 00 00 00 00 00 00 00 00"},
      {Custom(kCustomUnitScale),
       "0F 0B EB C3 13 01 00 00 00 00 00 00 00 00 13 3F F0 00 00 00 00 00 00 0F 00 00 00 03 02"},
      {ThreeNumbers(1, 2, true), "0F 00 0F 66 D9 01 00 00 00 00 00 00 00 00 0F 00 00 00 02 0F 00 00 00 01 15 01 02"},
      {Custom(1011153), "0F 00 0F 6D D1 01 00 00 00 00 00 00 00 07 02"},
  };
}

TEST(GeData, WritesEachKindAsItsTypeAndValueAndReadsItBack)
{
  for (const Form& form : Forms()) {
    SCOPED_TRACE(form.value.GetType());
    EXPECT_EQ(Written(form.value), form.hex);
    ByteWriter bytes;
    bytes.Header().Append(WriteToMemory([&](HyperFile& file) { form.value.Write(file); })).Long(99);
    MemoryReadFile source(bytes.bytes);
    GeData read(3);
    ASSERT_TRUE(read.Read(source.file));
    EXPECT_TRUE(read.GetType() == form.value.GetType() && form.hex == Written(read));
    Long next = 0;
    EXPECT_TRUE(source.file.ReadLong(next) && next == 99);
  }
}

TEST(GeData, GivesEveryListedCustomTypeItsLevel)
{
  const std::pair<Long, Long> levels[] = {{1000481, 1},   {1000997, 0},   {1009060, 3},   {1009290, 2},
                                          {1009369, 0},   {1009398, 0},   {1011131, 2},   {1011153, 7},
                                          {1018397, 0},   {1019655, 1},   {1019660, 3},   {1024869, 0},
                                          {100004811, 0}, {180000104, 0}, {200000275, 0}, {450000019, 0}};
  for (auto [type, level] : levels)
    EXPECT_EQ(Custom(type).GetCustom()->GetChunkLevel(), level) << type;
  GeData value(1);
  EXPECT_FALSE(value.SetType(1000480));
  EXPECT_EQ(value.GetType(), kDataNil);
}

TEST(GeData, TurnsOldTypesIntoCurrentOnesAndReportsTypesThatDoNotExist)
{
  const std::pair<Long, Long> types[] = {{3, 23}, {7, 130}, {12, 130}, {400006001, 15}, {25, 25}, {256, 256}, {0, 0}};
  GeData value;
  for (auto [asked, given] : types) {
    EXPECT_TRUE(value.SetType(asked) && value.GetType() == given);
  }
  EXPECT_EQ(CountReports(), 0);
  value.SetType(42);
  EXPECT_EQ(value.GetType(), 42);
  EXPECT_EQ(CountReports(), 1);
  EXPECT_EQ(GeData(value).GetType(), 42);
  value.SetType(kDataMatrix);
  EXPECT_EQ(value.GetMatrix(), Matrix());
}

TEST(GeData, GivesANeutralValueAndReportsItWhenAskedForAnotherType)
{
  const GeData text(String("a"));
  EXPECT_TRUE(text.GetLong() == 0 && text.GetReal() == 0.0 && text.GetLLong() == 0 && !text.GetPointer());
  EXPECT_TRUE(text.GetVector() == Vector() && text.GetMatrix() == Matrix() && text.GetTime() == BaseTime());
  EXPECT_FALSE(text.GetFilename().Content() || text.GetContainer() || GeData(1).GetString().Content());
  EXPECT_EQ(CountReports(), 10);
  EXPECT_TRUE(GeData().GetLong() == 0 && !GeData().GetString().Content() && GeData(5).GetReal() == 5.0);
  EXPECT_EQ(CountReports(), 0);
}

TEST(GeData, TruncatesARealTowardsZeroAndKeepsItWithinALong)
{
  const Real infinity = std::numeric_limits<Real>::infinity();
  const std::pair<Real, Long> cases[] = {
      {2.9, 2},        {-2.9, -2},          {2147483647.5, INT_MAX}, {3e9, INT_MAX},
      {-3e9, INT_MIN}, {infinity, INT_MAX}, {std::nan(""), 0},       {-2147483648.5, INT_MIN}};
  for (auto [real, whole] : cases)
    EXPECT_EQ(GeData(real).GetLong(), whole) << real;
}

TEST(GeData, ComparesByTypeAndValueWithItsOldExceptions)
{
  EXPECT_TRUE(GeData().IsEqual(GeData()) && GeData(2).IsEqual(GeData(2.0)) && GeData(2.0).IsEqual(GeData(2)));
  EXPECT_FALSE(GeData(2).IsEqual(GeData(2.5)) || GeData(2).IsEqual(GeData(LLong{2})));
  EXPECT_FALSE(GeData(std::nan("")).IsEqual(GeData(std::nan(""))));
  EXPECT_FALSE(GeData(String("a")).IsEqual(GeData(String("a"))));
  EXPECT_TRUE(GeData(Filename("Abc")).IsEqual(GeData(Filename("aBC"))));
  EXPECT_TRUE(GeData(BaseTime(1.0, 2.0)).IsEqual(GeData(BaseTime::Raw(2.0, 4.0))));
  EXPECT_TRUE(GeData(SmallContainer()).IsEqual(GeData(SmallContainer())));
  EXPECT_TRUE(ThreeNumbers(1, 2, true).IsEqual(ThreeNumbers(1, 2, true)));
  EXPECT_FALSE(ThreeNumbers(1, 2, true).IsEqual(ThreeNumbers(1, 3, true)));
  GeAliasGoal a, b;
  GeAliasLink toA, alsoToA, toB;
  toA.SetLinkGoal(&a);
  alsoToA.SetLinkGoal(&a);
  toB.SetLinkGoal(&b);
  EXPECT_TRUE(GeData(toA).IsEqual(GeData(alsoToA)));
  EXPECT_FALSE(GeData(toA).IsEqual(GeData(toB)));
}

TEST(GeData, StoresACopyInTheObjectOfTheSameKindButReplacesContainers)
{
  GeData vector(Vector(1, 2, 3));
  const Vector* place = &vector.GetVector();
  vector.CopyFrom(GeData(Vector(4, 5, 6)), 0, nullptr);
  EXPECT_EQ(&vector.GetVector(), place);
  EXPECT_EQ(vector.GetVector(), Vector(4, 5, 6));
  GeData container((BaseContainer(1)));
  const BaseContainer* old = container.GetContainer();
  container.CopyFrom(GeData(SmallContainer()), 0, nullptr);
  EXPECT_NE(container.GetContainer(), old);
  // A value may be copied and moved out of the container that it is to replace.
  container = *container.GetContainer()->FindData(1);
  EXPECT_EQ(container.GetLong(), 1);
  container = GeData(SmallContainer());
  container = std::move(*container.GetContainer()->FindData(1));
  EXPECT_EQ(container.GetLong(), 1);
}

TEST(GeData, ReportsALinkThatIsCopiedWithoutATranslation)
{
  GeAliasGoal goal;
  GeAliasLink link;
  link.SetLinkGoal(&goal);
  GeData source(link), copy;
  EXPECT_TRUE(copy.CopyFrom(source, 0, nullptr));
  EXPECT_EQ(CountReports(), 1);
  EXPECT_EQ(copy.GetAliasLink()->GetLinkGoal(), &goal);
  EXPECT_EQ(GeData(source).GetAliasLink()->GetLinkGoal(), &goal);
  EXPECT_EQ(CountReports(), 0);
}

// Reads one value out of a file of that version; gives what it writes back, or "failed".
std::string ReadAndWrite(ByteWriter body, Long version)
{
  ByteWriter bytes;
  bytes.Header("Q7R6", version).Append(body.bytes);
  MemoryReadFile source(bytes.bytes);
  GeData value;
  if (!value.Read(source.file)) {
    EXPECT_EQ(value.GetRawType(), kDataNil);
    return "failed";
  }
  EXPECT_EQ(source.file.GetPosition(), source.file.GetLength());
  return Written(value);
}

TEST(GeData, KeepsAnUnknownCustomValueByteForByte)
{
  ByteWriter body;
  body.Long(1000486).Start(0, 6).String(u"x").Start(5, 0).U8(140).U32(3).U8(1).U8(9).U8(8).End().Real(2.5).End();
  EXPECT_EQ(ReadAndWrite(body, 13000), ToHex(body.bytes));
  EXPECT_EQ(ReadAndWrite(body, 11599), ToHex(body.bytes)); // one of those that old files keep
  ByteWriter bytes;
  bytes.Header().Append(body.bytes);
  MemoryReadFile source(bytes.bytes);
  GeData value;
  ASSERT_TRUE(value.Read(source.file));
  EXPECT_EQ(value.GetType(), kDataNil);
  GeData copy(value);
  EXPECT_EQ(copy.GetUnknown()->type, 1000486);
  EXPECT_EQ(Written(copy), ToHex(body.bytes));
}

TEST(GeData, DropsOtherUnknownValuesOfOldFilesButTheirFrame)
{
  ByteWriter body, empty;
  body.Long(1000487).Start(0, 6).Real(2.5).End();
  empty.Long(1000487).Start(0, -1).End();
  EXPECT_EQ(ReadAndWrite(body, 11599), ToHex(empty.bytes));
  EXPECT_EQ(ReadAndWrite(body, 11600), ToHex(body.bytes));
  EXPECT_EQ(ReadAndWrite(empty, 13000), ToHex(empty.bytes));
}

TEST(GeData, KeepsTheBytesAndTheLevelOfAnOpaqueCustomValueInEveryVersion)
{
  for (Long type : {1011153, kCustomUnitScale}) {
    ByteWriter body;
    body.Long(type).Start(0, 9).Real(2.5).Long(1).Bool(true).End();
    EXPECT_EQ(ReadAndWrite(body, 13000), ToHex(body.bytes));
    EXPECT_EQ(ReadAndWrite(body, 7400), ToHex(body.bytes));
  }
  ByteWriter newer, known;
  newer.Long(kCustomThreeNumbers).Start(0, 1).Long(5).Long(6).Bool(false).String(u"more").End();
  known.Long(kCustomThreeNumbers).Start(0, 0).Long(5).Long(6).Bool(false).End();
  EXPECT_EQ(ReadAndWrite(newer, 13000), ToHex(known.bytes));
}

TEST(GeData, TakesTheUnitScaleOfASinglePrecisionFile)
{
  ByteWriter bytes;
  bytes.Header("Q7R6", 13000, 1).Long(kCustomUnitScale).Start(0, 0).Real(0.25).Long(4).End();
  MemoryReadFile source(bytes.bytes);
  GeData value;
  ASSERT_TRUE(value.Read(source.file));
  auto* units = static_cast<UnitScaleData*>(value.GetCustomDataType(kCustomUnitScale));
  EXPECT_TRUE(units->scale == 0.25 && units->unit == 4);
  EXPECT_EQ(value.GetCustomDataType(kCustomGradient), nullptr);
}

// What a kept body holds in a file of that version and precision, and what it must hold in a current one: in another
// form it would throw everything behind it out of step.
ByteWriter KeptBody(Long type, std::int32_t version, std::uint8_t precision, bool current)
{
  const bool single = precision != 0;
  const bool columns = single || version < 11925;
  ByteWriter body;
  body.Header("Q7R6", current ? 13000 : version, current ? 0 : precision).Long(type).Start(0, 3).Long(7).Real(0.5);
  body.Time(1, 25).Vector(1, 2, 3).Start(9, 0).IdentityMatrix().String(u"x").LReal(3.5).End().Memory("ab");
  // Two points by count and by bytes; an old array of two elements of 44 bytes that take 84.
  body.U8(133).U32(current && columns ? 48 : 24);
  for (int i = 0; i < (columns ? 6 : 3); ++i)
    body.RawReal(i + 0.5);
  const int bytes = !single && columns ? 168 : 88;
  body.U8(136).U32(current ? static_cast<std::uint32_t>(bytes) : 88);
  body.bytes.resize(body.bytes.size() + static_cast<std::size_t>(bytes), 0x61);
  if (version < 11904 && !current)
    body.OldArrayHead(5, 8).F32(1).F32(2);
  else
    body.ArrayHead(5, 8).F32(1).F32(2);
  // An old container with another one in it, whose lengths tell the bytes behind them.
  const std::uint32_t inner = 5 + 5 + 1 + (body.singlePrecision ? 4 : 8) + 5;
  body.U8(132).U32(5 + 5 + 5 + 5 + inner + 5 + 7 + 5).Long(3).I32(1).U8(128).I32(2).U8(132);
  body.U8(132).U32(inner).Long(4).I32(1).U8(19).Real(0.25).I32(-1).U8(3);
  body.I32(3).U8(130).String(u"y").I32(-1).U8(3);
  // One of another form is left as it is.
  return body.Block(132, {15, 0, 0, 0, 1, 0, 0, 0, 1, 19, 19, 0, 0}).Real(0.75).End();
}

// They would become truth values.
static_assert(!std::is_constructible_v<GeData, const char*> && !std::is_constructible_v<GeData, GeData*> &&
              std::is_constructible_v<GeData, void*>);

TEST(GeData, KeepsBodiesInTheFormThatCurrentFilesHave)
{
  for (auto [version, precision] : {std::pair{13000, 1}, {13000, 0}, {11924, 0}, {11924, 1}, {11903, 0}, {11903, 1}}) {
    for (Long type : {1011153, 1000486}) {
      SCOPED_TRACE(std::to_string(version) + "/" + std::to_string(precision) + " " + std::to_string(type));
      const auto single = static_cast<std::uint8_t>(precision);
      MemoryReadFile source(KeptBody(type, version, single, false).bytes);
      GeData value;
      ASSERT_TRUE(value.Read(source.file));
      const auto written = WriteToMemory([&](HyperFile& file) { value.Write(file); }, true);
      EXPECT_EQ(ToHex(written), ToHex(KeptBody(type, version, single, true).bytes));
      MemoryReadFile again(written);
      Long id = 0;
      EXPECT_TRUE(again.file.ReadLong(id) && again.file.ExpectTag(kTagChunkStart) &&
                  again.file.SkipValue(kTagChunkStart));
      EXPECT_TRUE(again.file.SkipToEndChunk() && again.file.GetPosition() == again.file.GetLength());
    }
  }
}

TEST(GeData, PassesOverAnOldMemoryValueAndRefusesOtherTypes)
{
  ByteWriter memory;
  memory.Long(128).Memory("12345");
  EXPECT_EQ(ReadAndWrite(memory, 13000), "0F 00 00 00 00");
  for (Long type : {3, 7, 16, 129, 134, 256, 257, 999999, -1})
    EXPECT_EQ(ReadAndWrite(ByteWriter().Long(type).Long(1), 13000), "failed") << type;
  EXPECT_EQ(ReadAndWrite(ByteWriter().Long(kDataReal).Long(1), 13000), "failed");
  EXPECT_EQ(ReadAndWrite(ByteWriter().Long(kDataLink).Memory(""), 13000), "failed");
}

} // namespace
