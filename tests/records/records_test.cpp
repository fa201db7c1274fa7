// What holds for every record, by the samples of them all.
#include "support/full_scene.h"
#include "support/library.h"
#include "support/scene_corpus.h"

namespace
{

using NodePtr = Owned<GeListNode>;

Bytes Chunk(Long id, Long level, const std::vector<RecordValue>& values, Long version = 13000)
{
  return ByteWriter().Start(id, level).Append(RecordBytes(values, version)).End().bytes;
}

bool Read(GeListNode& node, const RecordSample& sample, const Bytes& chunk, Long* error = nullptr)
{
  const Bytes whole = ByteWriter().Header("Q7R6", sample.version).Append(chunk).End().bytes;
  MemoryReadFile memory(whole);
  const bool read = node.ReadChunkLoop(memory.file, true);
  if (error)
    *error = memory.file.GetError();
  return read && memory.file.GetPosition() == static_cast<LLong>(whole.size());
}

// What the node writes in place of `like`: nothing if it is `like`, or else the first bytes that differ.
std::string Difference(GeListNode& node, const Bytes& like)
{
  const Bytes written = WriteToMemory([&](HyperFile& file) { node.WriteChunks(file); });
  const Bytes all = WithoutMarkers(written);
  for (const Bytes& bytes : {written, all}) {
    if (std::search(bytes.begin(), bytes.end(), like.begin(), like.end()) != bytes.end())
      return "";
  }
  auto place = std::search(all.begin(), all.end(), like.begin(), like.begin() + 9);
  auto wanted = like.begin();
  for (; place != all.end() && *place == *wanted; ++place, ++wanted) {
  }
  const auto next = [](const Bytes& bytes, auto from) {
    return ToHex(Bytes(from, from + std::min<std::ptrdiff_t>(bytes.end() - from, 20)));
  };
  return next(all, place) + " in place of " + next(like, wanted) + " at " + std::to_string(wanted - like.begin());
}

Bytes CurrentChunk(const RecordSample& sample)
{
  const bool same = sample.now == "same";
  return Chunk(sample.chunk, same ? sample.level : sample.nowLevel, ParseRecord(same ? sample.body : sample.now));
}

GeListNode* CopyOf(GeListNode& node, const RecordSample& sample)
{
  if (GeListNode* clone = node.MakeClone(0, nullptr))
    return clone;
  GeListNode* copy = sample.make(); // of a class that has no clones
  if (copy && !node.CopyWithTranslation(*copy, 0, nullptr))
    DeleteObj(copy);
  return copy;
}

// The values that are told to be a parameter or an entry, against it.
void CheckParameters(GeListNode& node, const std::vector<RecordValue>& values)
{
  int depth = 0;
  for (const RecordValue& value : values) {
    depth += value.kind == '[' ? 1 : value.kind == ']' ? -1 : 0;
    if (value.origin == ' ' || depth > 0)
      continue;
    SCOPED_TRACE(value.id);
    GeData data;
    if (value.origin == '%')
      data = NodeCast<BaseList2D>(&node)->GetDataInstance().GetData(value.id);
    else
      ASSERT_TRUE(node.GetParameterById(value.id, data));
    if (value.kind == 'S') {
      EXPECT_EQ(Utf8(data.GetString()), value.text);
      continue;
    }
    const double number = value.kind == 'V'   ? data.GetVector().x
                          : value.kind == 'T' ? data.GetTime().Get()
                                              : data.GetReal();
    EXPECT_EQ(number, std::stod(value.text));
  }
}

} // namespace

TEST(Records, AreKeptCopiedAndWrittenInTheCurrentForm)
{
  ASSERT_GT(RecordSamples().size(), 150U);
  for (const RecordSample& sample : RecordSamples()) {
    SCOPED_TRACE(sample.name);
    const auto values = ParseRecord(sample.body);
    const NodePtr node(sample.make());
    const bool read = Read(*node, sample, Chunk(sample.chunk, sample.level, values, sample.version));
    EXPECT_TRUE(read);
    if (!read)
      continue;
    CheckParameters(*node, values);
    if (sample.now == "-")
      continue;
    const Bytes now = CurrentChunk(sample);
    const NodePtr copy(CopyOf(*node, sample)); // before writing, which leaves check sums in objects
    EXPECT_EQ(Difference(*node, now), "");
    EXPECT_TRUE(copy && (Difference(*copy, now).empty() == sample.copied)) << Difference(*copy, now);
  }
}

// The files that fuzzing begins with have each record where it belongs: it is read there, and written again.
TEST(Records, StandInTheFilesForFuzzing)
{
  const std::vector<CorpusFile> files = SceneCorpus();
  std::size_t place = 0;
  for (const RecordSample& sample : RecordSamples()) {
    while (files[place].name.rfind("foreign-chunk-in", 0) == 0 || files[place].name.rfind("foreign-member", 0) == 0)
      ++place;
    const CorpusFile& file = files[place++];
    SCOPED_TRACE(file.name);
    const DocumentPtr document = LoadFromBytes(file.bytes);
    ASSERT_NE(document, nullptr);
    const bool isKept = sample.name.starts_with("weights"); // as it is, by the exporter's client
    const Bytes now = isKept ? Chunk(sample.chunk, sample.level, ParseRecord(sample.body)) : CurrentChunk(sample);
    EXPECT_TRUE(sample.now == "-" || Difference(*document, now).empty()) << Difference(*document, now);
  }
  for (const CorpusFile& file : files)
    EXPECT_NE(LoadFromBytes(file.bytes), nullptr) << file.name;
  EXPECT_EQ(files.back().name, "everything");
}

// Each value that is kept is kept by itself, whatever the others are.
TEST(Records, KeepEachValueByItself)
{
  for (const RecordSample& sample : RecordSamples()) {
    if (sample.now != "same")
      continue;
    const auto values = ParseRecord(sample.body);
    for (std::size_t i = 0; i < values.size(); ++i) {
      auto changed = values;
      if (!ChangeValue(changed[i]))
        continue;
      const Bytes chunk = Chunk(sample.chunk, sample.level, changed);
      const NodePtr node(sample.make());
      EXPECT_TRUE(Read(*node, sample, chunk)) << sample.name << ", value " << i;
      CheckParameters(*node, changed);
      EXPECT_EQ(Difference(*node, chunk), "") << sample.name << ", value " << i;
    }
  }
}

// Parameters that samples tell can be set to other values, each by itself.
TEST(Records, TakeTheParametersThatTheyTell)
{
  for (const RecordSample& sample : RecordSamples()) {
    SCOPED_TRACE(sample.name);
    const NodePtr node(sample.make());
    std::vector<RecordValue> values = ParseRecord(sample.body);
    Read(*node, sample, Chunk(sample.chunk, sample.level, values, sample.version));
    std::erase_if(values, [](const RecordValue& value) { return value.origin != '@' || value.kind == 'S'; });
    for (RecordValue& value : values) {
      ChangeValue(value);
      const double number = std::stod(value.text);
      EXPECT_TRUE(node->SetParameterById(value.id, value.kind == 'V'   ? GeData(Vector(number, 0, 0))
                                                   : value.kind == 'T' ? GeData(BaseTime(number))
                                                                       : GeData(number)));
    }
    CheckParameters(*node, values);
  }
}

TEST(Records, LeadTheirLinksToWhatIsReadBehindThem)
{
  const Bytes goal = Record("[110050,0 L0 L0 K C1 M61676F616C310000000000000005 S ] ]");
  for (const RecordSample& sample : RecordSamples()) {
    auto values = ParseRecord(sample.body);
    const auto isLink = [](const RecordValue& value) { return value.kind == 'k' && value.mark != '='; };
    const auto links = std::count_if(values.begin(), values.end(), isLink);
    if (links == 0 || sample.now == "-" || sample.version < 7500)
      continue;
    for (RecordValue& value : values)
      value.text = isLink(value) ? "5" : value.text;
    const Bytes chunk = Chunk(sample.chunk, sample.level, values, sample.version);
    const NodePtr node(sample.make());
    BaseList2D target;
    {
      MemoryReadFile memory(ByteWriter().Header("Q7R6", sample.version).Append(chunk).End().Append(goal).bytes);
      ASSERT_TRUE(node->ReadChunkLoop(memory.file, true) && target.ReadChunkLoop(memory.file, true)) << sample.name;
    }
    std::string written = ToHex(WriteToMemory([&](HyperFile& file) { node->WriteChunks(file); }));
    std::ptrdiff_t found = 0;
    for (std::size_t place = 0; (place = written.find("61 6C 69 61 73 32 ", place)) != std::string::npos; place += 18)
      found += written.compare(place + 18, 23, "00 00 00 00 00 00 00 00") != 0;
    EXPECT_EQ(found, links) << sample.name;
  }
}

TEST(Records, AreRefusedWhereverTheyAreCut)
{
  for (const RecordSample& sample : RecordSamples()) {
    const Bytes chunk = Chunk(sample.chunk, sample.level, ParseRecord(sample.body), sample.version);
    for (std::size_t cut = 0; cut < chunk.size(); ++cut) {
      const NodePtr node(sample.make());
      MemoryReadFile memory(ByteWriter()
                                .Header("Q7R6", sample.version)
                                .Append({chunk.begin(), chunk.begin() + static_cast<long>(cut)})
                                .bytes);
      ASSERT_FALSE(node->ReadChunkLoop(memory.file, true)) << sample.name << " cut at " << cut;
    }
  }
}

// A newer program may put more behind what is known.
TEST(Records, ReadPastWhatTheyDoNotKnow)
{
  for (const RecordSample& sample : RecordSamples()) {
    const NodePtr node(sample.make());
    const auto values = ParseRecord(sample.body + " [4,4 [5,5 Stext ] ]");
    EXPECT_TRUE(Read(*node, sample, Chunk(sample.chunk, sample.level, values, sample.version))) << sample.name;
  }
}

TEST(Records, TakeNoMemoryForCountsThatTheFileDoesNotHold)
{
  for (const RecordSample& sample : RecordSamples()) {
    auto values = ParseRecord(sample.body);
    for (RecordValue& value : values) {
      if (value.mark != '#')
        continue;
      const std::string before = value.text;
      for (const char* count : {"2147483647", "-1", "-2147483648", "40000", "1000000"}) {
        value.text = count;
        const Bytes chunk = Chunk(sample.chunk, sample.level, values, sample.version);
        const NodePtr node(sample.make());
        EXPECT_LT(counting_memory::PeakOf([&] { Read(*node, sample, chunk); }), 100000) << sample.name << ": " << count;
      }
      value.text = before;
    }
  }
}

TEST(Records, AreReadAndCopiedWholeOrNotAtAllWhenAnAllocationFails)
{
  for (const RecordSample& sample : RecordSamples()) {
    SCOPED_TRACE(sample.name);
    const Bytes chunk = Chunk(sample.chunk, sample.level, ParseRecord(sample.body), sample.version);
    const auto written = [](const NodePtr& node) {
      // The moment of its making is all that differs between two of these.
      if (auto* tag = NodeCast<BaseTag>(node.get()); tag && tag->GetType() == kTagCompositing)
        tag->GetDataInstance().SetLong(kCompositingClock, 0);
      return full_scene::Comparable(WriteToMemory([&](HyperFile& file) { node->WriteChunks(file); }));
    };
    EveryFailedAllocation(
        [&] {
          NodePtr node(sample.make());
          Long error = FILEERROR_NONE;
          const bool read = node && Read(*node, sample, chunk, &error);
          EXPECT_EQ(error, read || !node ? FILEERROR_NONE : FILEERROR_MEMORY);
          return read ? std::move(node) : nullptr;
        },
        written);
    const NodePtr node(sample.make());
    Read(*node, sample, chunk);
    // Straight onto a new node, without what an entry to copying does; and a node copied onto itself stays as it is.
    if (const NodePtr copy(sample.make()); node->CopyTo(*copy, 0, nullptr)) {
      EveryFailedAllocation(
          [&] {
            NodePtr made(sample.make());
            return made && node->CopyTo(*made, 0, nullptr) ? std::move(made) : nullptr;
          },
          written);
    }
    written(node); // leaves a check sum in an object
    const Bytes before = written(node);
    EXPECT_TRUE(node->CopyTo(*node, 0, nullptr) && written(node) == before);
    const bool hasClones = NodePtr(node->MakeClone(0, nullptr)) != nullptr;
    EveryFailedAllocation([&] { return NodePtr(hasClones ? node->MakeClone(0, nullptr) : CopyOf(*node, sample)); },
                          written);
  }
}

TEST(Records, OfSomeClassesNameNodesThatHaveNoName)
{
  const std::pair<GeListNode*, const char*> rows[] = {
      {MakeTag(kTagUVW), "UVW"},      {MakeTag(kTagTexture), "Texture"},        {AllocObject(kObjectSpline), "Spline"},
      {AllocObject(kObjectNull), ""}, {MakeMaterial(kMaterialStandard), "Mat"}, {MakeMaterial(kMaterialPlugin), ""}};
  for (const auto& [made, name] : rows) {
    const NodePtr node(made);
    auto& list = *NodeCast<BaseList2D>(node.get());
    for (const std::string& own : {std::string(), std::string("own")}) {
      list.SetName("before");
      const Bytes chunk = Record("[110050,0 L0 L0 K C0 S" + own + " ] [110069,2 L0 C0 ]");
      MemoryReadFile memory(ByteWriter().Header().Append(chunk).End().bytes);
      EXPECT_TRUE(node->ReadChunkLoop(memory.file, true));
      EXPECT_EQ(Utf8(list.GetName()), own.empty() ? name : own);
    }
  }
}
