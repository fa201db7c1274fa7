#include "support/library.h"

namespace
{

// The path with the platform's separators.
Filename Path(const std::string& path)
{
  String text(path.c_str(), STRINGENCODING_UTF8);
  for (Long i = 0; path.rfind("preset://", 0) != 0 && i < text.GetLength(); ++i) {
    if (text[i] == u'/')
      text[i] = kPathSeparator;
  }
  return Filename(text);
}

std::string Portable(const String& text)
{
  std::string path = Utf8(text);
  for (char& c : path)
    c = c == static_cast<char>(kPathSeparator) ? '/' : c;
  return path;
}

TEST(Filename, DropsOneSeparatorAndThenBlanksAtTheEnd)
{
  const std::pair<const char*, const char*> rows[] = {
      {"a/b/", "a/b"}, {"a//", "a/"}, {"name  ", "name"}, {"a/ ", "a/"}, {"", ""}, {"preset://x/", "preset://x"},
  };
  for (const auto& [given, kept] : rows)
    EXPECT_EQ(Portable(Path(given).GetString()), kept);
  EXPECT_EQ(Units(Filename("\xC3\xA9").GetString()), u"\u00E9");
}

TEST(Filename, TakesPathsApartAndPutsThemTogether)
{
  using Texts = std::tuple<const char*, const char*, const char*>;
  for (const auto& [path, directory, file] :
       {Texts{"a/b/c.d", "a/b", "c.d"}, {"c", "", "c"}, {"/c", "", "c"}, {"preset://a/b", "preset://a", "b"}}) {
    EXPECT_EQ(Portable(Path(path).GetDirectory().GetString()), directory);
    EXPECT_EQ(Portable(Path(path).GetFile().GetString()), file);
  }
  for (const auto& [left, right, result] : {Texts{"a/b", "x/c.d", "a/b/c.d"},
                                            {"", "x/c.d", "c.d"},
                                            {"a", "c", "a/c"},
                                            {"preset://a", "c", "preset://a/c"}}) {
    EXPECT_EQ(Portable((Path(left) + Path(right)).GetString()), result);
    Filename grown = Path(left);
    grown.Append(Path(right));
    EXPECT_EQ(Portable(grown.GetString()), result);
  }
}

TEST(Filename, CutsAndComparesSuffixes)
{
  const std::array<const char*, 4> rows[] = {{"a.txt", "a", "a", "a.q7r"},
                                             {"a.sixsix", "a", "a", "a.q7r"},
                                             {"a.seven77", "a.seven77", "a", "a.seven77.q7r"},
                                             {"a.b/c", "a.b/c", "a.b/c", "a.b/c.q7r"},
                                             {"a.b.c", "a.b", "a.b", "a.b.q7r"},
                                             {".c", "", "", ".q7r"},
                                             {"", "", "", ".q7r"}};
  for (const auto& [path, cleared, completely, withSuffix] : rows) {
    Filename clear = Path(path), complete = clear, set = clear;
    clear.ClearSuffix();
    complete.ClearSuffixComplete();
    set.SetSuffix("q7r");
    EXPECT_EQ(Portable(clear.GetString()), cleared);
    EXPECT_EQ(Portable(complete.GetString()), completely);
    EXPECT_EQ(Portable(set.GetString()), withSuffix);
  }
  EXPECT_TRUE(Path("a/b.Q7R").CheckSuffix("q7r") && Path("a.longsuffix").CheckSuffix("LONGSUFFIX"));
  EXPECT_FALSE(Path("a.q7rx").CheckSuffix("q7r") || Path("q7r").CheckSuffix("q7r"));
  EXPECT_FALSE(Path("a.b/q7r").CheckSuffix("b/q7r"));
}

TEST(Filename, IgnoresTheCaseOfLettersAndUmlautsOnly)
{
  EXPECT_TRUE(Filename("Az\xC3\xA4") == Filename("aZ\xC3\x84"));
  EXPECT_FALSE(Filename("\xC3\xA9") == Filename("\xC3\x89"));
}

TEST(Filename, WritesPointersThatItReadsBack)
{
  auto* connection = reinterpret_cast<NetworkConnection*>(std::uintptr_t{0x1234ABCD});
  auto* stream = reinterpret_cast<FileStream*>(std::uintptr_t{0xFEDCBA9876543210});
  Filename name;
  name.SetIpConnection(connection);
  EXPECT_EQ(Utf8(name.GetString()), "?ipc0x000000001234ABCD");
  EXPECT_TRUE(Filename(name).GetIpConnection() == connection && !name.GetStream());
  name.SetStream(stream);
  EXPECT_EQ(Utf8(name.GetString()), "?_is0xFEDCBA9876543210");
  EXPECT_TRUE(name.GetStream() == stream && name.GetIpConnection() == nullptr);
  for (const char* other : {"", "?_is", "?_is0x", "?_is0xzz", "ipc0x12"})
    EXPECT_EQ(Filename(other).GetStream(), nullptr) << other;
}

TEST(Filename, SharesReadMemoryWithItsCopies)
{
  const char bytes[] = "bytes";
  Filename copy;
  {
    Filename name("preset://x");
    EXPECT_TRUE(name.IsPreset());
    name.SetMemoryRead(bytes, 5);
    EXPECT_FALSE(name.IsPreset());
    copy = name;
    copy = Filename(std::move(name));
  }
  ASSERT_TRUE(copy.IsMemory());
  EXPECT_EQ(copy.GetMemoryDescription()->flags, kMemoryMayRead);
  const void* data = nullptr;
  LLong size = 0;
  EXPECT_EQ(copy.GetMemory(), 1);
  EXPECT_TRUE(copy.GetMemory(0, data, size));
  EXPECT_TRUE(data == bytes && size == 5);
  EXPECT_FALSE(copy.GetMemory(1, data, size));
  copy.ClearMemory();
  EXPECT_FALSE(copy.IsMemory());
  EXPECT_EQ(copy.GetMemory(), 0);
}

TEST(Filename, LeavesWrittenBlocksToTheDescription)
{
  MemoryDescription description;
  EXPECT_EQ(description.flags, kMemoryOwnsBlock);
  description.flags = kMemoryMayRead;
  description.data = "not its own";
  std::vector<UChar> bytes(160000);
  for (std::size_t i = 0; i < bytes.size(); ++i)
    bytes[i] = static_cast<UChar>(i * 7 >> 3);
  {
    Filename name;
    name.SetMemoryWrite(&description);
    EXPECT_EQ(description.flags, 6);
    EXPECT_EQ(description.data, nullptr); // what it does not own it must not free
    Filename copy = name;
    EXPECT_TRUE(copy.GetMemoryDescription()->writer.Write(bytes.data(), 160000));
  }
  Filename reader;
  reader.SetMemoryWrite(&description);
  ASSERT_EQ(reader.GetMemory(), 3);
  const void* data = nullptr;
  LLong size = 0;
  EXPECT_FALSE(counting_memory::WithoutMemory([&] { return reader.GetMemoryContinuous(data, size); }));
  EXPECT_EQ(reader.GetMemory(), 3);
  ASSERT_TRUE(reader.GetMemoryContinuous(data, size));
  const UChar* joined = static_cast<const UChar*>(data);
  EXPECT_EQ(std::vector<UChar>(joined, joined + size), bytes);
  EXPECT_EQ(reader.GetMemory(), 1);
  // What is written then comes behind the joined block.
  EXPECT_TRUE(description.writer.Write("end", 3));
  ASSERT_TRUE(reader.GetMemoryContinuous(data, size));
  EXPECT_EQ(size, 160003);
  EXPECT_EQ(static_cast<const char*>(data)[160002], 'd');
  description.Clear();
  EXPECT_FALSE(reader.GetMemoryContinuous(data, size));
}

TEST(MemoryBlockWriter, DoublesItsBlocksWithinTheirLimits)
{
  MemoryBlockWriter writer;
  EXPECT_EQ(writer.GetBlockCount(), 0);
  const std::vector<UChar> chunk(9999, 1);
  LLong total = 0;
  for (; total < 9000000; total += 9999)
    ASSERT_TRUE(writer.Write(chunk.data(), 9999));
  const LLong sizes[] = {50000, 100000, 200000, 400000, 800000, 1600000, 2000000, 2000000};
  LLong sum = 0;
  for (Long n = 0; n < 8; ++n) {
    const void* data = nullptr;
    LLong size = 0;
    ASSERT_TRUE(writer.GetBlock(n, data, size));
    EXPECT_EQ(size, sizes[n]);
    sum += size;
  }
  const void* data = nullptr;
  LLong size = 0;
  ASSERT_TRUE(writer.GetBlock(8, data, size));
  EXPECT_EQ(size, total - sum);
  EXPECT_EQ(writer.GetSize(), total);
  EXPECT_FALSE(writer.GetBlock(9, data, size) || writer.GetBlock(-1, data, size));
  writer.Clear();
  EXPECT_EQ(writer.GetBlockCount(), 0);
}

TEST(MemoryBlockWriter, KeepsWhatFittedWhenMemoryRunsOut)
{
  for (LLong allowed = 0; allowed < 3; ++allowed) { // the table, the first block, the second block
    MemoryBlockWriter writer;
    std::vector<UChar> bytes(60000, 2);
    EXPECT_FALSE(counting_memory::WithoutMemory([&] { return writer.Write(bytes.data(), 60000); }, allowed));
    EXPECT_EQ(writer.GetSize(), allowed < 2 ? 0 : 50000);
    EXPECT_FALSE(writer.Write(bytes.data(), -1));
    EXPECT_TRUE(writer.Write(nullptr, 0) && writer.Write(bytes.data(), 16));
    EXPECT_EQ(writer.GetSize(), allowed < 2 ? 16 : 50016);
  }
}

TEST(MemoryBlockWriter, KeepsTheOrderOfBytesAcrossBlocks)
{
  MemoryBlockWriter writer;
  for (UChar i = 0; i < 250; ++i) {
    const std::vector<UChar> part(997, i);
    ASSERT_TRUE(writer.Write(part.data(), 997));
  }
  LLong position = 0;
  const void* data = nullptr;
  LLong size = 0;
  for (Long n = 0; writer.GetBlock(n, data, size); ++n) {
    for (LLong i = 0; i < size; ++i, ++position)
      ASSERT_EQ(static_cast<const UChar*>(data)[i], position / 997) << position;
  }
  EXPECT_EQ(position, 250 * 997);
}

} // namespace
