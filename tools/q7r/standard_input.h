// Standard input and output as files of the command line: "-" names them. A file of that name is "./-".
#pragma once

#include <string>

namespace q7r
{

inline bool IsStandard(const std::string& path) { return path == "-"; }

// More bytes are a failure: they are all held in memory.
inline constexpr std::size_t kMostInput = std::size_t{4} << 30;

// All bytes of standard input, read to its end by the first call and kept until the program ends. Throws Failure. Not
// for several threads at once.
const std::string& StandardInput();

// How messages name an input: as it was given, or "standard input".
inline std::string InputName(const std::string& path)
{
  return IsStandard(path) ? "standard input" : path.empty() ? "\"\"" : path;
}

} // namespace q7r
