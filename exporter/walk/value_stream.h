// Streams of cameras and lights whose values are parameters: a row for each.
#pragma once

#include "exporter/walk/keyframes.h"

namespace exporter
{

// A parameter that takes a number of a stream, and the name of its track.
struct StreamParameter
{
  _torvane_::Long id = 0;
  const char* trackName = nullptr; // null: never animated
};

struct ValueStream
{
  AEGP_LayerStream stream;
  StreamParameter parameter; // of a colour: the Vector parameter; its tracks have names of their own
  SampleMode mode;
  Real divisor = 1.0;
  Real (*firstValue)(Real value) = nullptr; // null: what the parameter holds is converted as the samples are
  StreamParameter secondParameter = {};     // takes the second number of the mode
  AEGP_LayerStream secondStream = AEGP_LayerStream_NONE;
};

// Sets the parameters of the context's object to the value at the work area's start, and makes tracks where the stream
// or its second one varies. Nothing happens when the layer lacks one of them. `width` is that of the composition, for a
// field of view.
void ExportValueStream(ExportContext& context, HostCalls& host, const ValueStream& row, Real width = 0.0);

} // namespace exporter
