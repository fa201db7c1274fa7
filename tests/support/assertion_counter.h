// Counts the reports to the assertion log and keeps them from standard error while it lives.
#pragma once

#include "torvane/memory/assertion.h"

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
  // The line that the last report gave.
  _torvane_::Long GetLastLine() const { return lastLine_; }

 private:
  static void CountOne(const char*, _torvane_::Long line, const char*)
  {
    ++count_;
    lastLine_ = line;
  }

  static inline int count_ = 0;
  static inline _torvane_::Long lastLine_ = 0;
  _torvane_::AssertionLog previous_;
};
