#include "source/k2v_file/pictures/run_coding.h"
#include "support/library.h"

namespace
{

constexpr Long kTexture = 0x42645478; // "BdTx"
constexpr Long kPixels = 0x42645678;  // "BdVx"
constexpr Long kHead = 0x42644C79;    // "BdLy"

Bytes Pack(const Bytes& bytes, LLong limit = 100000)
{
  Bytes packed(static_cast<std::size_t>(limit));
  const LLong size = PackRuns(bytes.data(), static_cast<LLong>(bytes.size()), packed.data(), limit);
  packed.resize(static_cast<std::size_t>(size));
  return packed;
}

// What comes out in hexadecimal; "-" for a coding that is refused.
std::string Unpack(const Bytes& packed, std::size_t size)
{
  Bytes bytes(size);
  const bool good =
      UnpackRuns(packed.data(), static_cast<LLong>(packed.size()), bytes.data(), static_cast<LLong>(size));
  return good ? ToHex(bytes) : "-";
}

// Keeps rows and what was asked in the order of the calls.
class Client : public K2VClient
{
 public:
  Bool CreateImage(Long w, Long h, Long d) override
  {
    Note("image " + std::to_string(w) + "x" + std::to_string(h) + " depth " + std::to_string(d));
    return !refusesImage;
  }
  Bool CreateAlpha(Long alpha, Long w, Long h) override
  {
    Note("alpha " + std::to_string(alpha) + " " + std::to_string(w) + "x" + std::to_string(h));
    return !refusesAlpha;
  }
  void SetAlphaLine(Long alpha, Long x, Long y, Long count, const UChar* buffer) override
  {
    if (count > 1000)
      return;
    Note("row " + std::to_string(alpha) + " at " + std::to_string(x) + "," + std::to_string(y) + ": " +
         ToHex(buffer, static_cast<std::size_t>(count)));
  }
  Long GetImageWidth() override { return width; }
  Long GetImageHeight() override { return height; }
  Long GetImageDepth(HyperFile&, Long, Long) override { return depth; }
  void GetImageLine(Long x, Long y, Long count, UChar* buffer) override
  {
    const Long components = depth / 2 * 2 == 2 ? 1 : 3;
    std::copy_n(image.begin() + (y * width + x) * components, count * components, buffer);
  }
  Long GetAlphaCount() override { return static_cast<Long>(alphas.size()); }
  void GetAlphaLine(Long alpha, Long x, Long y, Long count, UChar* buffer) override
  {
    std::copy_n(alphas[static_cast<std::size_t>(alpha)].begin() + y * width + x, count, buffer);
  }

  Long width = 0, height = 0, depth = 4;
  Bytes image;
  std::vector<Bytes> alphas;
  bool refusesImage = false, refusesAlpha = false;
  std::string calls;

 private:
  void Note(const std::string& call) { calls += (calls.empty() ? "" : "; ") + call; }
};

Bytes Save(Client& client)
{
  MemoryDescription description;
  Filename name;
  name.SetMemoryWrite(&description);
  K2VImageFilter filter;
  EXPECT_TRUE(filter.Save(name, client));
  const void* data = nullptr;
  LLong size = 0;
  EXPECT_TRUE(name.GetMemoryContinuous(data, size));
  const auto* first = static_cast<const std::uint8_t*>(data);
  return {first, first + size};
}

// Loads from a heap block of just the file's size; what the client was asked, or the first error's code.
std::string Load(const Bytes& bytes, Client& client)
{
  std::unique_ptr<std::uint8_t[]> block(new std::uint8_t[bytes.size()]);
  std::copy(bytes.begin(), bytes.end(), block.get());
  Filename name;
  name.SetMemoryRead(block.get(), static_cast<LLong>(bytes.size()));
  K2VImageFilter filter;
  if (filter.Load(name, client))
    return client.calls;
  return "error " + std::to_string(filter.GetProblem().code);
}

std::string Load(const Bytes& bytes)
{
  Client client;
  return Load(bytes, client);
}

ByteWriter& AddHead(ByteWriter& w, Long type, const Bytes& color)
{
  w.Start(kHead, 0).Long(type).Memory(color).Long(0).Real(1.0).Bool(false).Long(0).Long(0);
  return w.String(u"Alpha").Long(0).Long(0).Bool(false).End();
}

// A file of a 300 x 1 image with one alpha layer: its head, then `rows` in a block of that width and component count.
Bytes AlphaFile(Long type, Long width, Long height, Long components, const ByteWriter& rows)
{
  ByteWriter w;
  w.Header("Vlek").Start(502, 0).Start(kTexture, 1).Long(300).Long(1).Long(4).End();
  w.Start(599, 0).Start(110100, 0).Start(501, 0);
  AddHead(w, type, {1, 2, 3, 4, 5, 6});
  w.Start(kPixels, 1).Long(7).Long(5).Long(width).Long(height).Long(components).Append(rows.bytes).End();
  return w.End().End().End().End().bytes;
}

const char* const kMade = "image 300x1 depth 4; alpha 0 300x1";

} // namespace

TEST(RunCoding, PacksByHand)
{
  const std::tuple<const char*, Bytes, std::string> cases[] = {
      {"nothing", {}, ""},
      {"one", {7}, "00 07"},
      {"two alike are no run", {7, 7}, "01 07 07"},
      {"three are", {7, 7, 7}, "FE 07"},
      {"a run between others", FromHex("01 02 05 05 05 05 03"), "01 01 02 FD 05 00 03"},
      {"pairs stay plain", FromHex("01 01 02 02 03 03 03"), "03 01 01 02 02 FE 03"},
      {"300 alike", Bytes(300, 9), "81 09 81 09 D5 09"},
      {"two behind a whole run", Bytes(130, 9), "81 09 01 09 09"},
  };
  for (const auto& [name, bytes, packed] : cases) {
    SCOPED_TRACE(name);
    EXPECT_EQ(packed, ToHex(Pack(bytes)));
    if (!bytes.empty()) {
      EXPECT_EQ(ToHex(bytes), Unpack(Pack(bytes), bytes.size()));
      const auto size = static_cast<LLong>(Pack(bytes).size());
      EXPECT_EQ(Pack(bytes), Pack(bytes, size));
      EXPECT_EQ(Bytes(), Pack(bytes, size - 1)); // over the limit
    }
  }
  // Groups of plain bytes are full with 128.
  Bytes rising;
  for (int i = 0; i < 130; ++i)
    rising.push_back(static_cast<std::uint8_t>(i));
  const Bytes packed = Pack(rising);
  ASSERT_EQ(132u, packed.size());
  EXPECT_EQ(127, packed[0]);
  EXPECT_EQ("7F 01 80 81", ToHex(packed.data() + 128, 4));
}

TEST(RunCoding, BringsBackRandomRows)
{
  std::mt19937 random(42);
  for (int round = 0; round < 2000; ++round) {
    Bytes bytes(1 + random() % 700);
    const unsigned kinds = 1 + random() % 4; // few kinds make runs
    for (std::uint8_t& byte : bytes)
      byte = static_cast<std::uint8_t>(random() % kinds * 60);
    const Bytes packed = Pack(bytes, 2 * static_cast<LLong>(bytes.size()));
    ASSERT_FALSE(packed.empty());
    ASSERT_EQ(ToHex(bytes), Unpack(packed, bytes.size()));
    // Neither a byte more nor one less fits, nor a cut coding.
    ASSERT_EQ("-", Unpack(packed, bytes.size() + 1));
    ASSERT_EQ("-", Unpack(packed, bytes.size() - 1));
    ASSERT_EQ("-", Unpack(Bytes(packed.begin(), packed.end() - 1), bytes.size()));
  }
}

TEST(RunCoding, RefusesWhatDoesNotEndWithTheRow)
{
  EXPECT_EQ("05 05 05", Unpack(FromHex("80 FE 05"), 3)); // 128 means nothing
  EXPECT_EQ("-", Unpack(FromHex("FE 05 80"), 3));        // but must not stand behind the end
  EXPECT_EQ("-", Unpack(FromHex("FE"), 3));
  EXPECT_EQ("-", Unpack(FromHex("05 01 02"), 6));
  EXPECT_EQ("-", Unpack(FromHex("80 80"), 1));
}

TEST(PaintTextures, HaveTheseBytes)
{
  Client client;
  client.width = 4;
  client.height = 2;
  client.depth = 5; // the lowest bit is dropped
  client.image = FromHex("01 02 03 01 02 04 01 02 05 01 02 06 10 20 30 11 21 31 12 22 32 13 23 33");
  client.alphas = {FromHex("00 00 00 00 01 02 03 04"), FromHex("09 09 09 08 07 07 07 07")};
  ByteWriter w;
  w.Header("Vlek").Start(502, 0).Start(kTexture, 1).Long(4).Long(2).Long(4).End();
  w.Start(kPixels, 2).Long(0).Long(0).Long(4).Long(2).Long(3);
  w.UChar(1).Memory(FromHex("FD 01")).UChar(1).Memory(FromHex("FD 02")).UChar(0).Memory(FromHex("03 04 05 06"));
  w.UChar(0).Memory(FromHex("10 11 12 13")).UChar(0).Memory(FromHex("20 21 22 23"));
  w.UChar(0).Memory(FromHex("30 31 32 33")).End();
  w.Start(599, 0).Start(110100, 0).Start(501, 0);
  AddHead(w, 2, {0}).Start(kPixels, 1).Long(0).Long(0).Long(4).Long(2).Long(1);
  w.UChar(1).Memory(FromHex("FD 00")).UChar(0).Memory(FromHex("01 02 03 04")).End().End().Start(501, 0);
  AddHead(w, 2, {0}).Start(kPixels, 1).Long(0).Long(0).Long(4).Long(2).Long(1);
  // Four bytes packed to four are stored plain.
  w.UChar(0).Memory(FromHex("09 09 09 08")).UChar(1).Memory(FromHex("FD 07")).End().End().End().End().End();
  const Bytes saved = Save(client);
  EXPECT_EQ(ToHex(w.bytes), ToHex(saved));
  EXPECT_EQ("image 4x2 depth 4; alpha 0 4x2; row 0 at 0,0: 00 00 00 00; row 0 at 0,1: 01 02 03 04; "
            "alpha 1 4x2; row 1 at 0,0: 09 09 09 08; row 1 at 0,1: 07 07 07 07",
            Load(saved));
}

TEST(PaintTextures, WithoutAlphaHaveNoAlphaChunk)
{
  Client client;
  client.width = 2;
  client.height = 1;
  client.depth = 2;
  client.image = {8, 9};
  ByteWriter w;
  w.Header("Vlek").Start(502, 0).Start(kTexture, 1).Long(2).Long(1).Long(2).End();
  w.Start(kPixels, 2).Long(0).Long(0).Long(2).Long(1).Long(1).UChar(0).Memory(Bytes{8, 9}).End().End();
  EXPECT_EQ(ToHex(w.bytes), ToHex(Save(client)));
  // Of an unknown depth the pixel chunk stops, and its end is missing.
  client.depth = 8;
  client.alphas = {{1, 2}};
  ByteWriter cut;
  cut.Header("Vlek").Start(502, 0).Start(kTexture, 1).Long(2).Long(1).Long(8).End();
  cut.Start(kPixels, 2).Long(0).Long(0).Long(2).Long(1).End();
  EXPECT_EQ(ToHex(cut.bytes), ToHex(Save(client)));
}

TEST(PaintTextures, TurnRowsGreyByTheirType)
{
  const Bytes values = {10, 20, 31, 100, 200, 31};
  auto rows = [&](Long width, Long components) {
    ByteWriter w;
    for (Long c = 0; c < components; ++c) {
      Bytes plane;
      for (Long x = 0; x < width; ++x)
        plane.push_back(values[static_cast<std::size_t>((x * components + c) % 6)]);
      w.UChar(0).Memory(plane);
    }
    return w;
  };
  const std::tuple<Long, Long, Long, const char*> cases[] = {
      {2, 3, 1, "; row 0 at 7,5: 0A 14 1F"},
      {3, 2, 2, "; row 0 at 7,5: 14 64"},
      {4, 2, 3, "; row 0 at 7,5: 14 6E"}, // (10 + 20 + 31) / 3, (100 + 200 + 31) / 3
      {5, 1, 4, "; row 0 at 7,5: 32"},    // (20 + 31 + 100) / 3
      {1, 2, 1, ""},
      {6, 2, 3, ""},
      {5, 2, 3, ""}, // too few components
      {2, 0, 1, ""},
      {2, 2, 0, ""},
  };
  for (const auto& [type, width, components, row] : cases) {
    SCOPED_TRACE(std::to_string(type) + ", " + std::to_string(components));
    EXPECT_EQ(std::string(kMade) + row, Load(AlphaFile(type, width, 1, components, rows(width, components))));
  }
}

TEST(PaintTextures, ReadDamagedPlanesAsZeros)
{
  ByteWriter w;
  w.UChar(1).Memory(FromHex("FE 05")).UChar(1).Memory(FromHex("FD 05")).UChar(0).Memory(FromHex("05 05"));
  w.UChar(0).Memory(FromHex("01 02 03")).UChar(9).Memory(FromHex("07 07 07")).UChar(1).Memory(Bytes());
  const std::string row = "; row 0 at 7,";
  EXPECT_EQ(kMade + row + "5: 05 05 05" + row + "6: 00 00 00" + row + "7: 00 00 00" + row + "8: 01 02 03" + row +
                "9: 01 02 03" + row + "10: 00 00 00",
            Load(AlphaFile(2, 3, 6, 1, w)));
}

TEST(PaintTextures, FailOnWhatCannotBe)
{
  const Bytes start = ByteWriter().Header("Vlek").Start(502, 0).bytes;
  const ByteWriter empty;
  ByteWriter manyEmpty;
  for (int i = 0; i < 20000; ++i)
    manyEmpty.UChar(1).Memory(Bytes());
  ByteWriter lists;
  lists.Append(start).Start(599, 0);
  for (int i = 0; i < 4000; ++i)
    lists.Start(110100, 0);
  const std::tuple<const char*, Bytes, std::string> cases[] = {
      {"a scene file", ByteWriter().Header("Q7R6").bytes, "error -100"},
      {"pixels of an older form", ByteWriter().Append(start).Start(kPixels, 1).End().End().bytes, "error -7"},
      {"a string for a size", ByteWriter().Append(start).Start(kTexture, 1).String(u"4").End().End().bytes,
       "error -100"},
      {"lists in lists", lists.bytes, "error -106"},
      {"no rows", AlphaFile(2, 3, 1, 1, empty), "error -100"},
      {"wider than the file explains", AlphaFile(2, 2147483647, 1, 1, empty), "error -100"},
      {"more components than the file explains", AlphaFile(2, 3, 1, 2147483647, empty), "error -100"},
      {"rows of zeros without end", AlphaFile(2, 10000000, 20000, 1, manyEmpty), "error -100"},
  };
  for (const auto& [name, bytes, result] : cases) {
    SCOPED_TRACE(name);
    EXPECT_EQ(result, Load(bytes));
  }
  Client refuses;
  refuses.refusesImage = true;
  EXPECT_EQ("error -7", Load(AlphaFile(2, 3, 1, 1, empty), refuses));
}

// Rows that are packed as well as can be: 64 times the size of the file.
TEST(PaintTextures, TakeLittleMemoryForTheirRows)
{
  const std::tuple<Long, Long> cases[] = {{2, 1}, {3, 2}, {4, 3}, {5, 4}};
  for (const auto& [type, components] : cases) {
    Bytes plane;
    for (int i = 0; i < 100000 / components; ++i)
      plane.insert(plane.end(), {129, 7});
    ByteWriter row;
    for (Long i = 0; i < components; ++i)
      row.UChar(1).Memory(plane);
    const auto width = static_cast<Long>(plane.size() / 2 * 128);
    const Bytes file = AlphaFile(type, width, 1, components, row);
    const LLong peak = counting_memory::PeakOf([&] { EXPECT_EQ(kMade, Load(file)); });
    EXPECT_LE(peak, 100 * static_cast<LLong>(file.size())) << type;
  }
}

TEST(PaintTextures, OfOtherLevelsAreReadAsFarAsTheyGo)
{
  // Level 0 tells no depth; newer levels add values and chunks behind what is known.
  ByteWriter w;
  w.Header("Vlek").Start(502, 3).Start(kTexture, 0).Long(3).Long(2).End();
  w.Start(kPixels, 9).Long(0).Real(2).End().Start(12345, 0).Long(0).End();
  w.Start(599, 0).Start(110100, 0).Start(501, 0).Start(kPixels, 0).Long(0).End();
  w.Start(kHead, 4).Long(2).Memory(Bytes()).Long(0).Real(1.0).Bool(false).Long(0).Long(0).String(u"");
  w.Long(0).Long(0).Bool(false).String(u"new").End().End().End().End().End();
  EXPECT_EQ("image 3x2 depth 0; alpha 0 3x2", Load(w.bytes));
  // Of a layer that the client refuses only the head is dropped.
  Client client;
  client.refusesAlpha = true;
  const Bytes file = AlphaFile(2, 2, 1, 1, ByteWriter().UChar(0).Memory(Bytes{1, 2}));
  EXPECT_EQ(std::string(kMade) + "; row 0 at 7,5: 01 02", Load(file, client));
}

TEST(PaintTextures, SurviveCutsAndMemoryShortage)
{
  Client client;
  client.width = 5;
  client.height = 3;
  client.image.assign(45, 3);
  client.alphas = {Bytes(15, 1)};
  const Bytes whole = Save(client);
  const std::string all = Load(whole);
  for (std::size_t size = 1; size < whole.size(); ++size) {
    Client cut;
    const std::string result = Load(Bytes(whole.begin(), whole.begin() + static_cast<long>(size)), cut);
    EXPECT_TRUE(result.rfind("error", 0) == 0 || all.rfind(result, 0) == 0) << result;
  }
  EveryFailedAllocation(
      [&] {
        const std::string result = Load(whole);
        return result.rfind("error", 0) == 0 ? nullptr : std::make_unique<std::string>(result);
      },
      [](const auto& result) { return *result; });
}

TEST(PaintTextures, GoThroughFilesOnDisk)
{
  const TempFolder folder;
  const std::string path = folder / "Textur ä.paint";
  Client client;
  client.width = 700;
  client.height = 2;
  client.depth = 2;
  client.image.assign(1400, 7);
  client.alphas = {Bytes(1400, 255)};
  K2VImageFilter filter;
  EXPECT_TRUE(filter.Save(path.c_str(), client));
  ASSERT_TRUE(filter.Load(path.c_str(), client));
  EXPECT_TRUE(filter.GetWidth() == 700 && filter.GetHeight() == 2 && filter.GetDepth() == 2);
  EXPECT_FALSE(filter.Load((folder / "none").c_str(), client));
  EXPECT_EQ(FILEERROR_OPEN, filter.GetProblem().code);
  EXPECT_FALSE(filter.Save((folder / "none/file").c_str(), client));
}
