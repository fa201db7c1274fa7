#include "name_pattern.h"

namespace q7r
{

bool Fits(std::string_view name, std::string_view pattern)
{
  std::size_t n = 0;
  std::size_t p = 0;
  std::size_t star = std::string_view::npos; // where a "*" stood last, and where its text ends
  std::size_t end = 0;
  while (n < name.size()) {
    if (p < pattern.size() && pattern[p] == '*') {
      star = p++;
      end = n;
    } else if (p < pattern.size() && (pattern[p] == '?' || pattern[p] == name[n])) {
      ++p;
      // One character of UTF-8 for "?".
      for (++n; pattern[p - 1] == '?' && n < name.size() && (static_cast<unsigned char>(name[n]) & 0xC0) == 0x80;)
        ++n;
    } else if (star != std::string_view::npos) {
      p = star + 1;
      n = ++end;
    } else {
      return false;
    }
  }
  return pattern.find_first_not_of('*', p) == std::string_view::npos;
}

} // namespace q7r
