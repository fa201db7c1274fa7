// The compositing, display and selection tags: what a new one holds, what old files hold, and what is copied.
#include <algorithm>
#include <chrono>
#include <string>
#include <thread>

#include <gtest/gtest.h>

#include "q7r_file/node_bytes.h"
#include "support/assertion_counter.h"
#include "support/counting_memory.h"
#include "torvane/tags/compositing_tag.h"
#include "torvane/tags/display_tag.h"
#include "torvane/tags/selection_tag.h"
#include "torvane/values/ge_data.h"

namespace
{

using namespace _torvane_;

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

TEST(CompositingTag, HasItsDefaultsAndItsOwnMoment)
{
  const auto start = std::chrono::steady_clock::now();
  CompositingTag first;
  const BaseContainer& data = first.GetDataInstance();
  EXPECT_EQ(Entries(data, {1000, 1003, 1017, 1126, 1129, 1142, 1004, 1005, 1143, 1153, 1156, 1158, 1131}),
            "1000=1 1003=1 1017=1 1126=1 1129=1 1142=1 1004=0 1005=0 1143=0 1153=0 1156=0 1158=0 1131=1");
  EXPECT_EQ(Entries(data, {1006, 1007, 1016, 1110, 1115, 1120, 1125, 1150, 1152, 1159, 1010, 1136}),
            "1006=0 1007=2 1016=0.1 1110=1 1115=6 1120=7 1125=12 1150=1 1152=1 1159=1 1010=- 1136=-");
  EXPECT_EQ(data.FindData(1144)->GetType(), kDataVector);
  EXPECT_EQ(data.GetCount(), 10 + 8 + 2 + 1 + 6 + 6 + 1 + 1 + 4 + 1);
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
    GeData value;
    ASSERT_TRUE(tag.GetParameterById(id, value)) << id;
    EXPECT_EQ(value.GetType(), real ? kDataReal : kDataLong) << id;
    EXPECT_EQ(value.GetLong(), id < 1007 || id == 1015 ? 1 : 0) << id;
    EXPECT_TRUE(tag.SetParameterById(id, real ? GeData(id + 0.5) : GeData(id)));
  }
  EXPECT_EQ(Entries(data, {1001, 1004, 1007, 1014, 1015}), "1001=- 1004=- 1007=- 1014=- 1015=1");
  tag.SetParameterById(1003, GeData(Long{7}));
  EXPECT_EQ(data.GetLong(1003), 7) << "what is not among them goes to the container";

  auto* clone = static_cast<DisplayTag*>(tag.MakeClone(0, nullptr));
  for (const Long id : {1001, 1002, 1007, 1008, 1009, 1010, 1012, 1014, 1015}) {
    GeData value;
    clone->GetParameterById(id, value);
    EXPECT_EQ(value.GetLong(), id);
  }
  GeData real;
  EXPECT_TRUE(clone->GetParameterById(1006, real) && real.GetReal() == 1006.5);
  DeleteObj(clone);
}

TEST(DisplayTag, HasItsDefaults)
{
  DisplayTag tag;
  const BaseContainer& data = tag.GetDataInstance();
  EXPECT_EQ(
      Entries(data, {1015, 10000, 10003, 10004, 10005, 10006, 10007, 10010, 10011, 30000, 30002, 30007, 30009}),
      "1015=1 10000=0 10003=12 10004=12 10005=3 10006=40 10007=40 10010=1 10011=5 30000=1 30002=0 30007=0 30009=2");
  EXPECT_EQ(data.GetTime(10001), BaseTime());
  EXPECT_EQ(data.GetTime(10002), BaseTime(3.0, 1.0));
  EXPECT_EQ(data.FindData(10009)->GetType(), kDataString);
  EXPECT_EQ(data.GetVector(20000), Vector(142 / 255.0, 173 / 255.0, 203 / 255.0));
  EXPECT_EQ(data.GetVector(20004), Vector(169 / 255.0, 153 / 255.0, 1.0));
  EXPECT_EQ(data.GetCount(), 24);
}

TEST(DisplayTag, TakesTheChunkOfOldFilesIntoItsContainer)
{
  struct Row
  {
    Long level;
    Long version;
    const char* entries;
  };
  const Row rows[] = {
      {0, 11610, "1001=1 1002=0 1010=- 1004=- 1007=1 1008=1 1009=1 1012=- 1006=- 1014=- 1015=1"},
      {1, 11610, "1001=1 1002=0 1010=1 1004=0.5 1007=1 1008=1 1009=1 1012=- 1006=- 1014=- 1015=1"},
      {2, 11610, "1001=1 1002=0 1010=1 1004=0.5 1007=0 1008=1 1009=0 1012=1 1006=0.25 1014=- 1015=1"},
      {3, 6000, "1001=1 1002=0 1010=1 1004=0.5 1007=0 1008=1 1009=0 1012=1 1006=0.25 1014=1 1015=0"},
      {3, 11611, "1001=- 1002=- 1010=- 1004=- 1007=- 1008=- 1009=- 1012=- 1006=- 1014=- 1015=1"},
  };
  for (const Row& row : rows) {
    ByteWriter chunk;
    chunk.Start(kChunkOldDisplay, row.level).Long(8).Bool(false).Bool(false).Bool(true).Bool(false);
    if (row.level >= 1)
      chunk.Bool(true).Real(0.5);
    if (row.level >= 2)
      chunk.Bool(false).Bool(true).Bool(false).Bool(false).Bool(true).Real(0.25).Vector(1, 2, 3);
    if (row.level >= 3)
      chunk.Bool(true).Bool(false);
    DisplayTag tag;
    EXPECT_TRUE(ReadInto(tag, chunk.Long(1).End().bytes, row.version)) << row.level;
    EXPECT_EQ(Entries(tag.GetDataInstance(), {1001, 1002, 1010, 1004, 1007, 1008, 1009, 1012, 1006, 1014, 1015}),
              row.entries)
        << row.level << " in " << row.version;
  }
}
