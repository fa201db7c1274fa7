// Patterns for names.
#pragma once

#include <string_view>

namespace q7r
{

// True if a name fits a pattern: "*" for any text, "?" for one character, all else for itself.
bool Fits(std::string_view name, std::string_view pattern);

} // namespace q7r
