// Numbers as people read them.
#pragma once

#include <cstdio>
#include <string>

namespace q7r
{

// As short as it goes with so many digits that count, at most 17; there is no "-0".
inline std::string NumberText(double number, int digits = 10)
{
  char text[40];
  std::snprintf(text, sizeof text, "%.*g", digits, number + 0.0);
  return text;
}

} // namespace q7r
