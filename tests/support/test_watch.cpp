// What holds for every test: it leaves no block of the library allocated, and what is reported to the assertion log is
// kept from standard error unless the test fails.
#include <iostream>
#include <mutex>
#include <utility>

#include <gtest/gtest.h>

#include "support/counting_memory.h"
#include "support/reports.h"
#include "torvane/memory/assertion.h"

namespace
{

std::mutex gMutex; // tests start threads
Reports gTaken, gReports;

void Keep(const char* module, _torvane_::Long line, const char*)
{
  const std::lock_guard lock(gMutex);
  gReports.push_back(std::string(module) + ":" + std::to_string(line));
}

class TestWatch final : public testing::EmptyTestEventListener
{
  void OnTestStart(const testing::TestInfo&) override
  {
    gTaken.clear();
    gReports.clear();
    _torvane_::SetAssertionLog(Keep);
    blocks_ = counting_memory::Get().blocks;
  }
  void OnTestEnd(const testing::TestInfo& test) override
  {
    EXPECT_EQ(counting_memory::Get().blocks, blocks_) << "library blocks were left allocated";
    TakeReports();
    for (const std::string& report : gTaken)
      std::cerr << (test.result()->Failed() ? "reported: " + report + "\n" : "");
  }

  _torvane_::LLong blocks_ = 0;
};

[[maybe_unused]] const bool kWatched = [] {
  testing::UnitTest::GetInstance()->listeners().Append(new TestWatch);
  return true;
}();

} // namespace

Reports TakeReports()
{
  const std::lock_guard lock(gMutex);
  gTaken.insert(gTaken.end(), gReports.begin(), gReports.end());
  return std::exchange(gReports, {});
}
