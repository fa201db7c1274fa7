#include "torvane/memory/spin_lock.h"

#ifdef _WIN32
#include <windows.h>
#else
#include <sched.h>
#endif

namespace _torvane_
{

namespace
{

// Lets time go by: first the few cycles of a look at the word, then the rest of the thread's turn, so that a holder
// without a core of its own can go on.
class Spinner
{
 public:
  void Wait() noexcept
  {
    if (++rounds_ < kBusyRounds)
      return;
    rounds_ = 0;
#ifdef _WIN32
    SwitchToThread();
#else
    sched_yield();
#endif
  }

 private:
  static constexpr Long kBusyRounds = 64;
  Long rounds_ = 0;
};

} // namespace

void ReadWriteSpinLock::EnterRead() noexcept
{
  Spinner spinner;
  ULong word = word_.load(std::memory_order_relaxed);
  for (;;) {
    if ((word & (kWriter | kWaiting)) == 0) {
      if (word_.compare_exchange_weak(word, word + kReader, std::memory_order_acquire, std::memory_order_relaxed))
        return;
    } else {
      spinner.Wait();
      word = word_.load(std::memory_order_relaxed);
    }
  }
}

void ReadWriteSpinLock::EnterWrite() noexcept
{
  Spinner spinner;
  ULong word = word_.load(std::memory_order_relaxed);
  for (;;) {
    if (word == 0 || word == kWaiting) {
      if (word_.compare_exchange_weak(word, kWriter, std::memory_order_acquire, std::memory_order_relaxed))
        return;
    } else if ((word & (kWriter | kWaiting)) == 0) {
      // Readers are inside: no more may come.
      word_.compare_exchange_weak(word, word | kWaiting, std::memory_order_relaxed, std::memory_order_relaxed);
    } else {
      spinner.Wait();
      word = word_.load(std::memory_order_relaxed);
    }
  }
}

} // namespace _torvane_
