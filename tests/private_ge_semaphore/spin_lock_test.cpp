// The lock of many readers or one writer, and the weight table that it guards, on several threads.
#include <atomic>
#include <thread>

#include "support/library.h"

namespace
{

using Lock = ReadWriteSpinLock;

// Comes back when the word has that value.
void AwaitWord(const Lock& lock, ULong word)
{
  while (lock.GetWord() != word)
    std::this_thread::yield();
}

void RunAll(std::vector<std::thread>& threads)
{
  for (std::thread& thread : threads)
    thread.join();
}

} // namespace

TEST(ReadWriteSpinLock, CountsItsReadersInStepsOfFour)
{
  Lock lock;
  lock.EnterRead();
  EXPECT_EQ(lock.GetWord(), 4U);
  lock.EnterRead();
  EXPECT_EQ(lock.GetWord(), 8U);
  lock.LeaveRead();
  lock.LeaveRead();
  EXPECT_EQ(lock.GetWord(), 0U);
  lock.EnterWrite();
  EXPECT_EQ(lock.GetWord(), 1U);
  lock.LeaveWrite();
  EXPECT_EQ(lock.GetWord(), 0U);
}

TEST(ReadWriteSpinLock, AWaitingWriterComesBeforeNewReaders)
{
  Lock lock;
  std::atomic<int> step{0};
  int writerStep = 0, readerStep = 0;
  lock.EnterRead();
  std::thread writer([&] {
    WriteGuard guard(lock);
    writerStep = ++step;
  });
  AwaitWord(lock, 4 | 2);
  std::thread reader([&] {
    ReadGuard guard(lock);
    readerStep = ++step;
  });
  std::this_thread::sleep_for(std::chrono::milliseconds(20));
  EXPECT_EQ(step.load(), 0);
  EXPECT_EQ(lock.GetWord(), 4U | 2U);
  lock.LeaveRead();
  writer.join();
  reader.join();
  EXPECT_EQ(writerStep, 1);
  EXPECT_EQ(readerStep, 2);
  EXPECT_EQ(lock.GetWord(), 0U);
}

TEST(ReadWriteSpinLock, KeepsWritersApartFromOneAnotherAndFromReaders)
{
  Lock lock;
  Long first = 0; // plain numbers: only the lock keeps them together
  Long second = 0;
  std::atomic<int> torn{0};
  std::vector<std::thread> threads;
  threads.reserve(4);
  constexpr Long kRounds = 2000;
  for (int i = 0; i < 2; ++i) {
    threads.emplace_back([&] {
      for (Long round = 0; round < kRounds; ++round) {
        WriteGuard guard(lock);
        ++first;
        ++second;
      }
    });
    threads.emplace_back([&] {
      for (Long round = 0; round < kRounds; ++round) {
        ReadGuard guard(lock);
        torn += first != second;
      }
    });
  }
  RunAll(threads);
  EXPECT_EQ(torn.load(), 0);
  EXPECT_EQ(first, 2 * kRounds);
  EXPECT_EQ(lock.GetWord(), 0U);
}

TEST(JointWeightTableThreads, ReadersSeeOnlyWholeStatesOfAWriter)
{
  // The writer makes, splits and removes a run over and over; each value that a reader can meet was written.
  JointWeightTable table;
  std::atomic<bool> done{false};
  std::atomic<int> wrong{0};
  std::vector<std::thread> threads;
  threads.reserve(4);
  for (int i = 0; i < 3; ++i) {
    threads.emplace_back([&, i] {
      while (!done) {
        const Real weight = table.ReadPointWeight(50 + i * 10);
        wrong += weight != 0.0 && weight != 1.0;
        const auto bytes = WriteToMemory([&](HyperFile& file) { table.Write(file); });
        wrong += bytes.size() < 40;
        WeightRun run{};
        if (table.GetRun(0, run))
          wrong += run.first > run.last || run.offset != 0;
        std::this_thread::yield();
      }
    });
  }
  for (int round = 0; round < 30; ++round) {
    if (round % 3 == 0) {
      ASSERT_TRUE(table.BeginEdit(100));
    }
    for (Long point = 0; point < 100; ++point)
      ASSERT_TRUE(table.WritePointWeight(point, 1.0));
    if (round % 3 == 1) {
      ASSERT_TRUE(table.EndEdit());
    }
    for (Long point = 99; point >= 0; point -= 1 + round % 2)
      ASSERT_TRUE(table.WritePointWeight(point, 0.0));
    if (round % 10 == 9)
      table.Flush();
  }
  done = true;
  RunAll(threads);
  EXPECT_EQ(wrong.load(), 0);
}

TEST(JointWeightTableThreads, CopiesInOppositeDirectionsEnd)
{
  JointWeightTable tables[2];
  for (JointWeightTable& table : tables)
    ASSERT_TRUE(table.WritePointWeight(5, 1.0));
  std::vector<std::thread> threads;
  threads.reserve(4);
  for (int i = 0; i < 2; ++i) {
    threads.emplace_back([&, i] {
      for (int round = 0; round < 500; ++round)
        EXPECT_TRUE(tables[i].CopyTo(tables[1 - i]));
    });
  }
  RunAll(threads);
  EXPECT_EQ(tables[0].ReadPointWeight(5), 1.0);
  EXPECT_EQ(tables[1].ReadPointWeight(5), 1.0);
}
