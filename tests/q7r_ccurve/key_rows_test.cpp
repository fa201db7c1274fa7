// Keys as rows against keys as nodes, and prepared records against the general way.
#include <filesystem>
#include <fstream>
#include <iterator>

#include "support/full_scene.h"
#include "support/library.h"
#include "torvane/stream/prepared_record.h"

namespace
{

class GeneralWay
{
 public:
  explicit GeneralWay(bool on) { PreparedRecord::SetEnabled(!on); }
  ~GeneralWay() { PreparedRecord::SetEnabled(true); }
};

KeyValues Value(Long frame, Real value)
{
  KeyValues key;
  key.time = BaseTime(frame, 25);
  key.value = value;
  key.switches = kKeyMaskAutomatic | kKeyMaskClamp;
  return key;
}

KeyValues Odd(Long frame)
{
  KeyValues key = Value(frame, -0.0);
  key.leftTime = BaseTime::Raw(-0.0, 3);
  key.rightTime = BaseTime(1, 8);
  key.leftValue = std::numeric_limits<Real>::quiet_NaN();
  key.rightValue = -1e300;
  key.interpolation = -7;
  key.switches = 0xFFFFFFFF;
  return key;
}

CCurve& AddCurve(BaseDocument& document)
{
  BaseObject* object = AllocObject(kObjectNull);
  document.InsertObject(object);
  CTrack* track = CTrack::Alloc(object, {{903, 23, 0}, {1000, 19, 0}}, "Track");
  object->InsertTrackLast(track);
  return *track->GetCurve(1, 1);
}

// Curves of plain keys with and without tangents, and curves in which one key or another is not plain.
Bytes SceneOfCurves()
{
  const DocumentPtr document = NewDocument();
  for (Long special = 0; special < 10; ++special) {
    CCurve& curve = AddCurve(*document);
    for (Long frame = 0; frame < 40; ++frame)
      EXPECT_TRUE(curve.SetKeyValues(frame % 7 == special ? Odd(frame) : Value(frame, frame * 0.25)));
    CKey* key = special >= 4 ? curve.GetKey(20) : nullptr;
    switch (special) {
    case 4:
      key->SetName("named");
      break;
    case 5:
      key->SetGeData(&curve, GeData(String("a text")));
      break;
    case 6:
      key->GetDataInstance().SetLong(1, 2);
      break;
    case 7:
      key->ChangeNBit(127, 1);
      break;
    case 8:
      key->GetLinkInstance().SetLink(document->GetFirstObject());
      break;
    case 9:
      key->SetInfo(0x80000002);
      break;
    default:
      break;
    }
  }
  return SaveToBytes(*document);
}

std::vector<Bytes> SceneFiles()
{
  std::vector<Bytes> files = {SceneOfCurves(), SaveToBytes(*full_scene::MakeFullScene())};
  for (const auto& entry : std::filesystem::recursive_directory_iterator(TEST_SOURCE_DIR "/fuzz/corpus")) {
    std::ifstream file(entry.path(), std::ios::binary);
    if (entry.is_regular_file())
      files.emplace_back(std::istreambuf_iterator<char>(file), std::istreambuf_iterator<char>());
  }
  return files;
}

// What is saved of a file that was loaded; with `asNodes` every key was asked for. Nothing if it can't be loaded.
Bytes Resaved(const Bytes& bytes, bool asNodes)
{
  Filename name;
  name.SetMemoryRead(bytes.data(), static_cast<LLong>(bytes.size()));
  const DocumentPtr document(LoadDocument(name, LoadObjects | LoadMaterials));
  if (!document)
    return {};
  if (asNodes) {
    const char* broken = DocumentInvariants::FindBroken(*document); // looks at every key
    EXPECT_EQ(broken, nullptr) << broken;
  }
  return full_scene::SavedScene(*document);
}

TEST(KeyRows, AllWaysOfReadingAndWritingGiveTheSameBytes)
{
  const std::vector<Bytes> files = SceneFiles();
  ASSERT_GT(files.size(), 2U);
  for (const Bytes& file : files) {
    const Bytes quick = Resaved(file, false);
    EXPECT_TRUE(quick == Resaved(file, true)) << &file - files.data();
    const GeneralWay general(true);
    EXPECT_TRUE(quick == Resaved(file, false)) << &file - files.data();
  }
  EXPECT_TRUE(Resaved(files[0], false) == full_scene::Comparable(files[0]));
}

// Each byte of a record in turn is another one: both ways read the same, or fail alike.
TEST(KeyRows, ARecordThatIsDamagedIsReadAsInTheGeneralWay)
{
  CCurve curve;
  for (Long frame = 0; frame < 3; ++frame)
    curve.SetKeyValues(Value(frame, frame));
  const Bytes bytes = WriteToMemory([&](HyperFile& file) { curve.WriteAsChunk(file, 110415); }, true);
  EXPECT_TRUE(bytes == WriteToMemory([&](HyperFile& file) { curve.WriteAsChunk(file, 110415); }, true)); // markers stay
  auto read = [](const Bytes& damaged) {
    MemoryReadFile memory(damaged);
    UChar tag = 0;
    Long id = 0, level = 0;
    CCurve copy;
    memory.file.ReadValueHeader(tag);
    memory.file.ReadChunkStart(id, level);
    copy.ReadChunkLoop(memory.file, true);
    memory.file.Close(); // links that lead nowhere become empty
    const Bytes again = WriteToMemory([&](HyperFile& file) { copy.WriteChunks(file); });
    return std::tuple(memory.file.GetError(), memory.file.GetProblem().position, WithoutMarkers(again));
  };
  for (std::size_t place = 22; place < bytes.size(); ++place) {
    for (const int change : {0x01, 0x80}) {
      Bytes damaged = bytes;
      damaged[place] = static_cast<std::uint8_t>(damaged[place] ^ change);
      const auto quick = read(damaged);
      const GeneralWay general(true);
      EXPECT_TRUE(read(damaged) == quick) << place;
    }
  }
}

TEST(KeyRows, ProgressIsToldAtTheSamePlaces)
{
  CCurve curve;
  for (Long frame = 0; frame < 9000; ++frame)
    curve.SetKeyValues(Value(frame, frame));
  std::vector<Long> told[2];
  for (const bool generally : {false, true}) {
    const GeneralWay way(generally);
    auto note = [](Long number, void* list) { static_cast<std::vector<Long>*>(list)->push_back(number); };
    const Bytes bytes = WriteToMemory(
        [&](HyperFile& file) {
          file.SetWriteProgress(note, &told[generally]);
          curve.WriteChunks(file);
        },
        true);
    MemoryReadFile memory(bytes);
    memory.file.SetReadProgress(note, &told[generally]);
    CCurve copy;
    copy.ReadChunkLoop(memory.file, true);
    EXPECT_EQ(copy.GetKeyCount(), 9000);
  }
  EXPECT_GT(told[0].size(), 50U);
  EXPECT_EQ(told[0], told[1]);
}

bool AreEqual(const CCurve& a, const CCurve& b)
{
  CKey ofA, ofB;
  for (Long i = 0; i < a.GetKeyCount(); ++i) {
    KeyValues x, y;
    if (!a.GetKeyValues(i, x) || !b.GetKeyValues(i, y) || !a.PeekKey(i, ofA)->IsEqual(*b.PeekKey(i, ofB)) ||
        x.time != y.time || x.value != y.value || x.leftTime != y.leftTime || x.rightValue != y.rightValue ||
        x.interpolation != y.interpolation || x.switches != y.switches ||
        a.GetTangents(i).rightValue != b.GetTangents(i).rightValue)
      return false;
  }
  KeyValues none;
  return a.GetKeyCount() == b.GetKeyCount() && a.GetValue(0.77) == b.GetValue(0.77) &&
         !a.GetKeyValues(a.GetKeyCount(), none) && !a.GetKeyValues(-1, none) && !a.PeekKey(a.GetKeyCount(), ofA) &&
         !a.PeekKey(-1, ofA);
}

TEST(KeyRows, ChangeAndEvaluateLikeNodes)
{
  CCurve rows, nodes;
  nodes.AddKey(BaseTime(0, 1));
  rows.SetKeyValues({});
  std::mt19937 random(3);
  for (int round = 0; round < 500; ++round) {
    const auto frame = static_cast<Long>(random() % 60);
    KeyValues key = Value(frame, static_cast<Real>(random() % 5));
    if (round % 9 == 0) {
      key.rightTime = BaseTime(1, 50);
      key.rightValue = 2;
      key.switches = 0;
    }
    Long places[2] = {-2, -2};
    if (random() % 4 == 0) {
      EXPECT_EQ(rows.DelKey(frame), nodes.DelKey(frame));
    } else {
      EXPECT_TRUE(rows.SetKeyValues(key, &places[0]) && nodes.SetKeyValues(key, &places[1]));
      EXPECT_EQ(places[0], places[1]);
    }
    ASSERT_TRUE(AreEqual(rows, nodes)) << round;
  }
  KeyValues late;
  late.time = BaseTime(10001, 1);
  EXPECT_FALSE(rows.SetKeyValues(late) || nodes.SetKeyValues(late));
  const Owned<GeListNode> copy(rows.MakeClone(0, nullptr));
  EXPECT_TRUE(copy && AreEqual(*NodeCast<CCurve>(copy.get()), nodes));
  CKey* key = rows.GetKey(3); // from here on nodes
  EXPECT_TRUE(key->GetCurve() == &rows && key->GetNext() == rows.GetKey(4));
  EXPECT_TRUE(AreEqual(rows, nodes));
}

TEST(KeyRows, TakeFewBytesAndAskForNoNodeToBeLookedAt)
{
  constexpr Long kKeys = 10000;
  CCurve curve;
  for (Long frame = 0; frame < kKeys; ++frame)
    curve.SetKeyValues(Value(frame, frame));
  const Bytes bytes = WriteToMemory([&](HyperFile& file) { curve.WriteChunks(file); }, true);
  MemoryReadFile memory(bytes);
  const LLong before = counting_memory::Get().bytes;
  CCurve read;
  ASSERT_TRUE(read.ReadChunkLoop(memory.file, true) || memory.file.GetError() == FILEERROR_NONE);
  const LLong rows = counting_memory::Get().bytes - before;
  EXPECT_EQ(read.GetKeyCount(), kKeys);
  EXPECT_LE(rows, 64 * kKeys + 4096);
  CKey scratch;
  EXPECT_EQ(read.PeekKey(9, scratch), &scratch);
  read.GetValue(100.0);
  EXPECT_EQ(counting_memory::Get().bytes - before, rows);
  ASSERT_TRUE(read.GetKey(0));
  EXPECT_GT(counting_memory::Get().bytes - before, rows);
}

} // namespace
