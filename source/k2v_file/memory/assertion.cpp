#include "torvane/memory/assertion.h"

#include <cstdio>

namespace _torvane_
{

namespace
{

void PrintAssertion(const char* module, Long line, const char* message)
{
  std::fprintf(stderr, "%s:%d: %s\n", module, static_cast<int>(line), message);
}

AssertionLog gAssertionLog = PrintAssertion;

} // namespace

AssertionLog SetAssertionLog(AssertionLog log)
{
  AssertionLog previous = gAssertionLog;
  gAssertionLog = log;
  return previous;
}

void ReportAssertion(const char* module, Long line, const char* message)
{
  if (gAssertionLog)
    gAssertionLog(module, line, message);
}

} // namespace _torvane_
