// Standard output, where a result that can't be written is a failure. Everything here throws Failure.
#pragma once

#include <string_view>

namespace q7r
{

void Print(std::string_view text);
void PrintLine(std::string_view text);

#if defined(__GNUC__) && !defined(_WIN32)
[[gnu::format(printf, 1, 2)]]
#endif
void PrintFormatted(const char* format, ...);

// True once something could not be written: nothing that is printed arrives any more.
bool IsStandardOutputBroken();

// Writes what is pending. Also finds what went wrong with what others printed there.
void FlushStandardOutput();

} // namespace q7r
