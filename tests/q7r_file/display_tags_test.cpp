// The compositing, display and selection tags: what a new one holds, what old files hold, and what is copied.
#include <chrono>
#include <thread>

#include "support/library.h"

namespace
{

// "1000=1 1016=0.5": the entries of these numbers, "-" where there is none.
std::string Entries(const BaseContainer& data, std::initializer_list<Long> ids)
{
  std::string text;
  for (const Long id : ids) {
    const GeData* value = data.FindData(id);
    char number[40] = "-";
    if (value)
      std::snprintf(number, sizeof number, "%g", value->GetType() == kDataReal ? value->GetReal() : value->GetLong());
    text += (text.empty() ? "" : " ") + std::to_string(id) + "=" + number;
  }
  return text;
}

} // namespace

TEST(CompositingTag, HasItsOwnMoment)
{
  const auto start = std::chrono::steady_clock::now();
  CompositingTag first;
  const BaseContainer& data = first.GetDataInstance();
  while (std::chrono::steady_clock::now() - start < std::chrono::milliseconds(2))
    std::this_thread::yield();
  CompositingTag second;
  const Long passed = second.GetDataInstance().GetLong(kCompositingClock) - data.GetLong(kCompositingClock);
  EXPECT_TRUE(passed >= 1 && passed < 60000) << passed;
}

TEST(DisplayTag, AnswersElevenParametersFromItsOwnSettings)
{
  DisplayTag tag;
  const BaseContainer& data = tag.GetDataInstance();
  for (const Long id : {1001, 1002, 1004, 1006, 1007, 1008, 1009, 1010, 1012, 1014, 1015}) {
    const bool real = id == 1004 || id == 1006;
    const GeData value = ParameterOf(tag, id);
    EXPECT_EQ(value.GetType(), real ? kDataReal : kDataLong) << id;
    EXPECT_EQ(value.GetLong(), id < 1007 || id == 1015 ? 1 : 0) << id;
    EXPECT_TRUE(tag.SetParameterById(id, real ? GeData(id + 0.5) : GeData(id)));
  }
  EXPECT_EQ(Entries(data, {1001, 1004, 1007, 1014, 1015}), "1001=- 1004=- 1007=- 1014=- 1015=1");
  tag.SetParameterById(1003, GeData(Long{7}));
  EXPECT_EQ(data.GetLong(1003), 7) << "what is not among them goes to the container";

  auto* clone = static_cast<DisplayTag*>(tag.MakeClone(0, nullptr));
  for (const Long id : {1001, 1002, 1007, 1008, 1009, 1010, 1012, 1014, 1015})
    EXPECT_EQ(ParameterOf(*clone, id).GetLong(), id);
  EXPECT_EQ(ParameterOf(*clone, 1006).GetReal(), 1006.5);
  DeleteObj(clone);
}

TEST(DisplayTag, TakesTheChunkOfOldFilesIntoItsContainer)
{
  const std::tuple<Long, Long, const char*> rows[] = {
      {0, 11610, "1001=1 1002=0 1010=- 1004=- 1007=1 1008=1 1009=1 1012=- 1006=- 1014=- 1015=1"},
      {1, 11610, "1001=1 1002=0 1010=1 1004=4 1007=1 1008=1 1009=1 1012=- 1006=- 1014=- 1015=1"},
      {2, 11610, "1001=1 1002=0 1010=1 1004=4 1007=0 1008=1 1009=0 1012=1 1006=5 1014=- 1015=1"},
      {3, 6000, "1001=1 1002=0 1010=1 1004=4 1007=0 1008=1 1009=0 1012=1 1006=5 1014=0 1015=1"},
      {3, 11611, "1001=- 1002=- 1010=- 1004=- 1007=- 1008=- 1009=- 1012=- 1006=- 1014=- 1015=1"},
  };
  for (const auto& [level, version, entries] : rows) {
    const std::string& body = FindRecordSample("old display " + std::to_string(level)).body;
    DisplayTag tag;
    EXPECT_TRUE(ReadInto(tag, Record("[110009," + std::to_string(level) + " " + body + " L1 ]"), version));
    EXPECT_EQ(Entries(tag.GetDataInstance(), {1001, 1002, 1010, 1004, 1007, 1008, 1009, 1012, 1006, 1014, 1015}),
              entries)
        << level << " in " << version;
  }
}
