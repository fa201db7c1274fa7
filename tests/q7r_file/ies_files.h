// Photometric files in memory.
#pragma once

#include "support/library.h"

using IESPtr = _torvane_::Owned<_torvane_::IESLight>;

// What LoadIESFile makes of a file with this text, which lies in a heap block of just its size. `light` stays on
// failure.
inline _torvane_::Long LoadText(const std::string& text, IESPtr& light)
{
  const std::unique_ptr<char[]> block(new char[text.size()]);
  std::copy(text.begin(), text.end(), block.get());
  _torvane_::Filename name;
  name.SetMemoryRead(block.get(), static_cast<_torvane_::LLong>(text.size()));
  _torvane_::IESLight* loaded = light.release();
  const _torvane_::Long result = _torvane_::LoadIESFile(loaded, name);
  light.reset(loaded);
  return result;
}

// The distribution of a text, or null.
inline IESPtr LoadText(const std::string& text)
{
  IESPtr light;
  LoadText(text, light);
  return light;
}

inline std::vector<double> Values(const _torvane_::GeTempDynArray<_torvane_::Real>& array)
{
  return {array.begin(), array.end()};
}

inline void Assign(_torvane_::GeTempDynArray<_torvane_::Real>& array, const std::vector<double>& values)
{
  array.Flush();
  for (double value : values)
    array.Append(value);
}
