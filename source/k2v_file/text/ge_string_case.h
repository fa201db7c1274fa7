// The case rule of String: the ASCII letters and the three German umlauts, and no other character.
#pragma once

#include "torvane/types.h"

namespace _torvane_
{

inline constexpr UniChar kCaseStep = 32;

constexpr UniChar UpperChar(UniChar c)
{
  Bool lower = (c >= u'a' && c <= u'z') || c == 228 || c == 246 || c == 252;
  return lower ? static_cast<UniChar>(c - kCaseStep) : c;
}

constexpr UniChar LowerChar(UniChar c)
{
  Bool upper = (c >= u'A' && c <= u'Z') || c == 196 || c == 214 || c == 220;
  return upper ? static_cast<UniChar>(c + kCaseStep) : c;
}

// Where case counts.
constexpr UniChar SameChar(UniChar c) { return c; }

} // namespace _torvane_
