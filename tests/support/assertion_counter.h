// Counts the reports to the assertion log and keeps them from standard error while it lives.
#pragma once

#include "torvane/assertion.h"

class AssertionCounter
{
 public:
  AssertionCounter() : previous_(_torvane_::SetAssertionLog(CountOne)) { count_ = 0; }
  ~AssertionCounter() { _torvane_::SetAssertionLog(previous_); }
  AssertionCounter(const AssertionCounter&) = delete;
  AssertionCounter& operator=(const AssertionCounter&) = delete;

  // The reports since the last call.
  int Take()
  {
    const int count = count_;
    count_ = 0;
    return count;
  }

 private:
  static void CountOne(const char*, _torvane_::Long, const char*) { ++count_; }

  static inline int count_ = 0;
  _torvane_::AssertionLog previous_;
};
