// Reports of this module, with the lines that its log readers know.
#pragma once

#include "torvane/memory/assertion.h"

namespace _torvane_
{

inline constexpr Long kLineOfFraction = 95;
inline constexpr Long kLineOfDateToTime = 417;
inline constexpr Long kLineOfTimeToDate = 484;

inline void ReportBaseTime(Long line, const char* message) { ReportAssertion("q7r_basetime", line, message); }

} // namespace _torvane_
