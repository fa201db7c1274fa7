// What the library has reported to the assertion log in the running test. A test that fails prints it all.
#pragma once

#include <string>
#include <vector>

using Reports = std::vector<std::string>;

// The reports since the last call, as "module:line".
Reports TakeReports();
// Their number.
inline int CountReports() { return static_cast<int>(TakeReports().size()); }
