// What a file may ask for: at most 100 bytes of the library's memory for each of its bytes.
#include "support/library.h"

namespace
{

constexpr double kMostPerByte = 100.0;

// A part of a file that repeats, within chunks of these ids (each of level 0, but 110418 of 3, 110050 of 7).
struct Crowd
{
  std::string name;
  std::vector<Long> within;
  std::vector<std::uint8_t> unit;
  std::vector<std::uint8_t> before = {};
};

std::vector<std::uint8_t> FileOf(const Crowd& crowd, int count)
{
  ByteWriter file;
  file.Header().Start(110059, 0);
  for (Long id : crowd.within)
    file.Start(id, id == 110418 ? 3 : id == 110050 ? 7 : 0);
  file.Append(crowd.before);
  for (int i = 0; i < count; ++i)
    file.Append(crowd.unit);
  for (std::size_t i = 0; i <= crowd.within.size(); ++i)
    file.End();
  return file.bytes;
}

LLong PeakOfLoad(const std::vector<std::uint8_t>& file)
{
  return counting_memory::PeakOf([&] { LoadFromBytes(file); });
}

std::vector<Crowd> Crowds()
{
  std::vector<Crowd> crowds;
  const auto members = [&](const std::string& name, std::vector<Long> within, std::initializer_list<Long> labels) {
    for (Long label : labels)
      crowds.push_back({name + " " + std::to_string(label), within, ByteWriter().Start(label, 0).End().bytes});
  };
  const std::vector<Long> objects = {110107, 110100};
  const auto inObject = [&](std::vector<Long> more) {
    more.insert(more.begin(), {110107, 110100, 5140});
    return more;
  };
  members("object", objects,
          {5100, 5101, 5102, 5103, 5108, 5137, 5140, 5154, 5156, 5168, 1001091, 1011146, 1011194, 1019362, 1019363});
  members("tag", inObject({110108, 110100}),
          {5600, 5604, 5613, 5616, 5617, 5629, 5637, 5671, 5672, 5673, 5674, 5676, 5682, 5691, 5701, 5708, 5711, 99,
           1019365});
  members("track", inObject({110417, 110100}), {5350});
  members("key", inObject({110417, 110100, 5350, 110418, 110415, 110419, 110100}), {5352});
  members("material", {110308, 110100}, {5703, 5705});
  members("shader", {110308, 110100, 5703, 110131, 110100}, {5707});
  members("render settings", {110106, 110100}, {110304});
  members("video post", {110106, 110100, 110304, 110130, 110100}, {110066});
  members("multipass", {110106, 110100, 110304, 300001049, 110100}, {300001048});
  members("layer", {110134, 110100}, {100004801});
  members("view panel", {110123, 110100}, {110306});
  members("draw", {110123, 110100, 110306, 110124, 110100}, {110305});
  members("foreign chunk", inObject({}), {77});
  const auto entry = [&](const std::string& name, const std::vector<std::uint8_t>& value) {
    crowds.push_back({"entry " + name, inObject({110050}), ByteWriter().Long(7).Append(value).bytes,
                      ByteWriter().Long(0).Long(0).Start(132, 1).Long(-1).bytes});
  };
  const ByteWriter emptyChunk = ByteWriter().Start(0, 9).End();
  entry("nil", ByteWriter().Long(0).bytes);
  entry("vector", ByteWriter().Long(23).Vector(1, 2, 3).bytes);
  entry("text", ByteWriter().Long(130).String(u"").bytes);
  entry("file name", ByteWriter().Long(131).Filename(u"").bytes);
  entry("link", ByteWriter().Long(133).Memory(std::string("alias2") + std::string(8, '\0')).bytes);
  entry("container", ByteWriter().Long(132).Start(132, 1).Long(-1).End().bytes);
  for (Long type : {1000997, 1009290, 1024869, 200000275, 3000000})
    entry(std::to_string(type), ByteWriter().Long(type).Append(emptyChunk.bytes).bytes);
  const std::vector<std::uint8_t> none = ByteWriter().Start(132, 1).Long(-1).End().bytes;
  entry("gradient", ByteWriter().Long(1000481).Start(0, 1).Append(none).Bool(false).End().bytes);
  entry("gradient with transparency",
        ByteWriter().Long(1000481).Start(0, 1).Append(none).Bool(true).Append(none).End().bytes);
  entry("blend layers", ByteWriter().Long(1011131).Start(0, 2).Long(0).Long(3).Long(2).End().bytes);
  const char* settings[] = {"L R B L L3", "L R k", "R R R",
                            "R R R B",    "R L",   "L [132,1 L-1 L1 L1000481 [0,1 [132,1 L-1 ] B ] ] B B",
                            "R R",        "R R",   "L R L B R R R",
                            "R B B V0 V0"};
  for (int type = 1; type <= 10; ++type) {
    const std::string layer = "L" + std::to_string(type) + " B S L L " + settings[type - 1] + " B";
    crowds.push_back({"blend layer " + std::to_string(type), inObject({110050}), RecordBytes(ParseRecord(layer)),
                      RecordBytes(ParseRecord("L L [132,1 L-1 L7 L1011131 [0,2 L1100 L3"))});
  }
  crowds.push_back(
      {"identifier", inObject({110068}), ByteWriter().Long(7).Memory("").bytes, ByteWriter().Long(1100).bytes});
  return crowds;
}

} // namespace

TEST(MemoryBound, HoldsForCrowdsOfTheSmallestParts)
{
  for (const Crowd& crowd : Crowds()) {
    const std::vector<std::uint8_t> few = FileOf(crowd, 100);
    const std::vector<std::uint8_t> many = FileOf(crowd, 1100);
    const auto more = static_cast<double>(PeakOfLoad(many) - PeakOfLoad(few));
    EXPECT_LE(more, kMostPerByte * static_cast<double>(many.size() - few.size())) << crowd.name;
    EXPECT_GT(more, 0.0) << crowd.name << " wasn't read";
  }
}

// One weight on the last point of all, from 71 bytes; and as many weights as there can be pages.
TEST(MemoryBound, HoldsForWeightsThatAreEdited)
{
  for (const int runs : {1, 2000}) {
    ByteWriter bytes;
    bytes.Header().Long(0).Long(0).Long(runs).ArrayHead(3, static_cast<std::uint32_t>(runs * 12));
    for (int i = runs; i > 0; --i)
      bytes.I32(INT32_MAX - i * 1024).I32(INT32_MAX - i * 1024).I32(runs - i);
    bytes.ULong(0).ULong(0).ULong(0).ULong(0).Long(0);
    bytes.Long(runs).ArrayHead(2, static_cast<std::uint32_t>(runs * 2));
    for (int i = 0; i < runs; ++i)
      bytes.U16(65535);
    const LLong before = counting_memory::Get().bytes;
    counting_memory::ResetPeak();
    JointWeightTable table;
    MemoryReadFile file(bytes.bytes);
    ASSERT_TRUE(table.Read(file.file)) << runs;
    ASSERT_TRUE(table.BeginEdit(0));
    EXPECT_EQ(table.ReadPointWeight(INT32_MAX - 1024), 1.0);
    ASSERT_TRUE(table.WritePointWeight(INT32_MAX, 0.5) && table.EndEdit());
    EXPECT_EQ(table.GetWeightCount(), runs + 1);
    EXPECT_LE(counting_memory::Get().peakBytes - before, (1 << 20) + 100 * static_cast<LLong>(bytes.bytes.size()));
  }
}
