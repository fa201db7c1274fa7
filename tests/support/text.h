// Library texts in the tests' own string types.
#pragma once

#include <algorithm>
#include <ostream>
#include <string>

#include "torvane/text/ge_string.h"

inline std::u16string Units(const _torvane_::String& text)
{
  return std::u16string(text.Data(), text.Data() + text.GetLength());
}

inline _torvane_::String FromUnits(const std::u16string& units)
{
  _torvane_::String text;
  if (_torvane_::UniChar* place = text.SetLengthNC(static_cast<_torvane_::Long>(units.size())))
    std::copy(units.begin(), units.end(), place);
  return text;
}

// As UTF-8.
inline std::string Utf8(const _torvane_::String& text)
{
  std::string bytes(static_cast<std::size_t>(text.GetCStringLen(_torvane_::STRINGENCODING_UTF8)) + 1, '\0');
  text.GetCString(bytes.data(), static_cast<_torvane_::Long>(bytes.size()), _torvane_::STRINGENCODING_UTF8);
  bytes.pop_back();
  return bytes;
}

namespace _torvane_
{
inline void PrintTo(const String& text, std::ostream* out) { *out << '"' << Utf8(text) << '"'; }
} // namespace _torvane_
