// Keeps the reports to the assertion log, as "module:line", while it lives.
#pragma once

#include <string>
#include <vector>

#include "torvane/memory/assertion.h"

class AssertionRecord
{
 public:
  AssertionRecord() : previous_(_torvane_::SetAssertionLog(Record)) { reports_.clear(); }
  ~AssertionRecord() { _torvane_::SetAssertionLog(previous_); }
  AssertionRecord(const AssertionRecord&) = delete;
  AssertionRecord& operator=(const AssertionRecord&) = delete;

  const std::vector<std::string>& Reports() const { return reports_; }

 private:
  static void Record(const char* module, _torvane_::Long line, const char*)
  {
    reports_.push_back(std::string(module) + ":" + std::to_string(line));
  }

  static inline std::vector<std::string> reports_;
  _torvane_::AssertionLog previous_;
};
