// What a process learns once and never forgets: the records of prepared_record.h.
#pragma once

#include <atomic>

#include "torvane/memory/spin_lock.h"

namespace _torvane_
{

// The one T of this process: a class with an operation Learn, which is called when the thing is first asked for. Null
// when that fails, for want of memory. Any thread may ask.
template <class T>
const T* GetLearned()
{
  static T learned;
  static std::atomic<Bool> ready{false};
  static ReadWriteSpinLock lock;
  if (ready.load(std::memory_order_acquire))
    return &learned;
  const WriteGuard guard(lock);
  if (!ready.load(std::memory_order_relaxed)) {
    T made;
    if (!made.Learn())
      return nullptr;
    learned = made;
    ready.store(true, std::memory_order_release);
  }
  return &learned;
}

} // namespace _torvane_
