// A lock in one 32-bit word for things that are read often and held shortly: many readers, or one writer. Who has to
// wait spins. A waiting writer keeps new readers out.
#pragma once

#include <atomic>

#include "torvane/types.h"

namespace _torvane_
{

// Neither side may be entered again by a thread that is inside.
class ReadWriteSpinLock
{
 public:
  ReadWriteSpinLock() = default;
  ReadWriteSpinLock(const ReadWriteSpinLock&) = delete;
  ReadWriteSpinLock& operator=(const ReadWriteSpinLock&) = delete;

  void EnterRead() noexcept;
  void LeaveRead() noexcept { word_.fetch_sub(kReader, std::memory_order_release); }
  void EnterWrite() noexcept;
  void LeaveWrite() noexcept { word_.fetch_and(~kWriter, std::memory_order_release); }

  // The word as it is now; other threads may change it at any time. 0: free. kWriter: a writer is inside. kWaiting: a
  // writer waits for the readers to leave. Above them the readers inside, in steps of kReader.
  ULong GetWord() const noexcept { return word_.load(std::memory_order_relaxed); }

  static constexpr ULong kWriter = 1;
  static constexpr ULong kWaiting = 2;
  static constexpr ULong kReader = 4;

 private:
  std::atomic<ULong> word_{0};
};

// Holds one side of a lock while it lives.
class ReadGuard
{
 public:
  explicit ReadGuard(ReadWriteSpinLock& lock) noexcept : lock_(lock) { lock_.EnterRead(); }
  ~ReadGuard() { lock_.LeaveRead(); }
  ReadGuard(const ReadGuard&) = delete;
  ReadGuard& operator=(const ReadGuard&) = delete;

 private:
  ReadWriteSpinLock& lock_;
};

class WriteGuard
{
 public:
  explicit WriteGuard(ReadWriteSpinLock& lock) noexcept : lock_(lock) { lock_.EnterWrite(); }
  ~WriteGuard() { lock_.LeaveWrite(); }
  WriteGuard(const WriteGuard&) = delete;
  WriteGuard& operator=(const WriteGuard&) = delete;

 private:
  ReadWriteSpinLock& lock_;
};

} // namespace _torvane_
