// The format document against what is read and written.
#include <cctype>
#include <fstream>

#include "support/library.h"

namespace
{

constexpr Long kLevelUntold = -1;

// The numbers in the first cells of the rows of the document's tables, each with the level that the second cell tells.
std::map<Long, Long> DocumentedChunks()
{
  std::map<Long, Long> chunks;
  std::ifstream document(TEST_SOURCE_DIR "/docs/format.md");
  for (std::string line; std::getline(document, line);) {
    const std::size_t end = line.find(" | ");
    if (line.rfind("| ", 0) != 0 || end == std::string::npos)
      continue;
    std::size_t digits = 0;
    while (std::isdigit(static_cast<unsigned char>(line[end + 3 + digits])))
      ++digits;
    const bool hasLevel = digits > 0 && line.compare(end + 3 + digits, 2, " |") == 0;
    const Long level = hasLevel ? std::stoi(line.substr(end + 3, digits)) : kLevelUntold;
    for (std::size_t i = 2; i < end; ++i) {
      if (!std::isdigit(static_cast<unsigned char>(line[i])))
        continue;
      std::size_t length = 0;
      const Long id = std::stoi(line.substr(i), &length);
      chunks[id] = level;
      i += length;
    }
  }
  return chunks;
}

// The chunks of a scene file, with their levels, outermost first.
std::vector<std::pair<Long, Long>> ChunksOf(const std::vector<std::uint8_t>& bytes)
{
  std::vector<std::pair<Long, Long>> chunks;
  MemoryReadFile memory(bytes);
  for (UChar tag = 0; memory.file.GetPosition() < memory.file.GetLength() && memory.file.ReadValueHeader(tag);) {
    Long id = 0, level = 0;
    if (tag == kTagChunkStart && memory.file.ReadChunkStart(id, level))
      chunks.emplace_back(id, level);
    else if (tag != kTagChunkEnd)
      memory.file.SkipValue(tag);
  }
  return chunks;
}

} // namespace

TEST(FormatDocument, TellsEveryChunkAndItsLevel)
{
  const std::map<Long, Long> documented = DocumentedChunks();
  for (const RecordSample& sample : RecordSamples()) {
    if (sample.chunk == 1027408) // a foreign one
      continue;
    EXPECT_TRUE(documented.contains(sample.chunk)) << sample.chunk;
    for (const RecordValue& value : ParseRecord(sample.body)) {
      const Long id = value.kind == '[' ? std::stoi(value.text) : 132;
      EXPECT_TRUE(id < 100 || documented.contains(id)) << id << " in " << sample.name;
    }
    const auto told = documented.find(sample.chunk);
    const bool written = sample.now != "-" && told != documented.end() && told->second != kLevelUntold;
    EXPECT_TRUE(!written || told->second == (sample.now == "same" ? sample.level : sample.nowLevel)) << sample.name;
  }
  // What a whole file has.
  const DocumentPtr document = NewDocument();
  BaseObject* camera = AllocObject(kObjectCamera);
  document->InsertObject(camera);
  document->SetSceneCamera(camera);
  camera->MakeTag(kTagTexture);
  for (const auto& [id, level] : ChunksOf(SaveToBytes(*document))) {
    const auto told = documented.find(id);
    ASSERT_TRUE(told != documented.end() || id == 0) << id;
    const bool isFrame = level == 0; // the frame of a document, a member or a list may have the number of another
    EXPECT_TRUE(isFrame || told->second == kLevelUntold || told->second == level) << id;
  }
}
