// Keys, curves and tracks as bytes, composed value by value.
#pragma once

#include <string_view>

#include "q7r_file/node_bytes.h"
#include "support/record_samples.h"

namespace animation_test
{

// What every node writes first: a header with nothing but a name, a marker of zeros, and two words of node bits.
inline ByteWriter& Node(ByteWriter& w, std::u16string_view name = u"", std::int32_t word0 = 0, std::int32_t word1 = 0)
{
  w.Start(110050, 7).Long(0).Long(0).Start(132, 1).Long(-1).End().UChar(0).String(name);
  w.Long(0).Long(1).Long(0).Memory(std::string_view("alias2\0\0\0\0\0\0\0\0", 14));
  w.UChar(1).Memory(Bytes(16, 0)).Bool(false).End();
  return w.Start(110069, 2).Long(4).Long(word0).Long(word1).Long(0).Long(0).UChar(0).End();
}

// A key with its label: whole seconds, without tangents.
inline ByteWriter& Key(ByteWriter& w, double seconds, double value)
{
  w.Start(5352, 0);
  Node(w).Start(110416, 0).Time(seconds, 1).Time(0, 1).Time(0, 1);
  return w.Real(value).Real(0).Real(0).Long(1).Long(0).End().End();
}

// A curve with its chunk and at most one key.
inline ByteWriter& Curve(ByteWriter& w, bool hasKey = false, double seconds = 0, double value = 0)
{
  w.Start(110415, 0);
  Node(w);
  if (hasKey)
    Key(w.Start(110419, 0).Start(110100, 0), seconds, value).End().End();
  return w.End();
}

} // namespace animation_test
