// Several exports at a time, of one plug-in that was started once, each on a thread and with a host of its own.
#include <thread>

#include "exporter/host_api/aegp_entry.h"
#include "host/standalone_host.h"
#include "support/library.h"

namespace
{

constexpr DateTime kDate = {2001, 2, 3, 4, 5, 6};

std::string CompositionOf(std::size_t number)
{
  const std::string wide = std::to_string(100 + number);
  return R"({"fr":25,"ip":0,"op":60,"w":)" + wide + R"(,"h":50,"nm":"Shot )" + wide + R"(","assets":[
    {"id":"a","u":"","p":"a.png","w":9,"h":9},{"id":"n","nm":"In","layers":[
    {"ddd":1,"ty":3,"nm":"N","ks":{}},{"ddd":1,"ty":2,"refId":"a","nm":"P","ks":{}}]}],"layers":[
    {"ddd":1,"ty":13,"nm":"Eye","ks":{"p":{"a":1,"k":[{"t":0,"s":[1,2,3]},{"t":60,"s":[)" +
         wide + R"(,5,6]}]}}},
    {"ddd":1,"ty":0,"refId":"n","w":9,"h":9,"nm":"In","ks":{}},
    {"ddd":1,"ty":1,"nm":"Wall","sw":9,"sh":9,"sc":"#fff","ks":{"rz":{"a":1,"k":[{"t":0,"s":[0]},{"t":60,"s":[350]}]}}}]})";
}

// The bytes of an export, loaded and saved again as well.
Bytes Export(const host::StandaloneHost& started, std::size_t number, const std::string& file)
{
  const ReproducibleRun run(number, kDate);
  host::StandaloneHost host(host::LoadCompositionText(CompositionOf(number), "c.json", "/"));
  host.TakePlugin(started);
  host.SetOutputPath(file);
  EXPECT_EQ(host.CallMenuHook(), 0);
  EXPECT_EQ(host.CallCommandHook(host.FindCommand("KORVEX Exporter...")).error, 0);
  EXPECT_TRUE(host.Reports().empty());
  const Filename name(file.c_str());
  const Owned<BaseDocument> document(LoadDocument(name, LoadObjects | LoadMaterials));
  EXPECT_TRUE(document && SaveDocument(document.get(), Filename((file + ".again.q7r").c_str()), 0));
  Bytes bytes = ReadWholeFile(file);
  const Bytes again = ReadWholeFile(file + ".again.q7r");
  bytes.insert(bytes.end(), again.begin(), again.end());
  return bytes;
}

TEST(ParallelExport, MakesWhatASingleOneMakes)
{
  constexpr std::size_t kThreads = 4;
  constexpr std::size_t kEach = 6;
  const TempFolder folder;
  host::StandaloneHost started((host::Project()));
  ASSERT_EQ(started.Start(EntryPointFunc), 0);
  std::vector<Bytes> made(kThreads * kEach);
  std::vector<std::thread> threads;
  for (std::size_t thread = 0; thread < kThreads; ++thread)
    threads.emplace_back([&, thread] {
      for (std::size_t i = thread * kEach; i < (thread + 1) * kEach; ++i)
        made[i] = Export(started, i, folder / (std::to_string(i) + ".q7r"));
    });
  for (std::thread& thread : threads)
    thread.join();
  for (std::size_t i = 0; i < made.size(); ++i) {
    EXPECT_GT(made[i].size(), 1000U);
    EXPECT_TRUE(made[i] == Export(started, i, folder / ("single-" + std::to_string(i) + ".q7r"))) << i;
  }
}

TEST(ReproducibleRun, IsOfItsThreadAndGivesWayToTheOneBefore)
{
  Bytes first(16), second(16), again(16), other(16), outside(16);
  ReproducibleRun outer(1, kDate);
  CreateUuid(first.data());
  CreateUuid(second.data());
  {
    const ReproducibleRun inner(1, {1999, 1, 1, 0, 0, 0});
    CreateUuid(again.data());
    DateTime now;
    GetDateTimeNow(now);
    EXPECT_EQ(now.year, 1999);
  }
  EXPECT_EQ(ReproducibleRun::GetCurrent(), &outer);
  {
    const ReproducibleRun inner(2, kDate);
    CreateUuid(other.data());
  }
  std::thread([&] {
    EXPECT_EQ(ReproducibleRun::GetCurrent(), nullptr);
    CreateUuid(outside.data());
  }).join();
  EXPECT_EQ(first, again);
  EXPECT_NE(first, second);
  EXPECT_NE(first, other);
  EXPECT_NE(first, outside);
}

} // namespace
