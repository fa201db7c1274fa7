// The assertion log: where the library reports a broken invariant and then goes on.
#pragma once

#include "torvane/types.h"

namespace _torvane_
{

// Receives a report: the source module ("k2v_file", "q7r_file", "q7r_smart_link", ...), the line that the module
// gives the report, and a plain sentence. Module and line are how programs that read the log know a report again: where
// the sources write the line as a number, it belongs to the report and stays when code moves. Called on the thread that
// met the fault; must not throw.
using AssertionLog = void (*)(const char* module, Long line, const char* message);

// Replaces the log and gives the one that was in force. Null silences the log. The first log prints one line to
// standard error. Not meant to be called while other threads are inside the library.
AssertionLog SetAssertionLog(AssertionLog log);

// Sends one report to the log in force.
void ReportAssertion(const char* module, Long line, const char* message);

} // namespace _torvane_
