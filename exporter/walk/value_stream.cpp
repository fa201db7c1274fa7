#include "exporter/walk/value_stream.h"

namespace exporter
{

using namespace _torvane_;

namespace
{

constexpr const char* kColorTrackNames[] = {"Color.R", "Color.G", "Color.B"};

void SetFirstValue(ExportContext& context, const ValueStream& row, const StreamSampling& sampling,
                   const AEGP_StreamVal2& value, const AEGP_StreamVal2& second)
{
  const auto [first, other, third] = ValueConverter(context, sampling).Convert(value, second);
  BaseObject& object = *context.object;
  if (row.mode == SampleMode::kColor)
    object.SetParameterById(row.parameter.id, Vector(first, other, third));
  else if (row.mode == SampleMode::kSwitch)
    object.SetParameterById(row.parameter.id, static_cast<Long>(first));
  else
    object.SetParameterById(row.parameter.id, row.firstValue ? row.firstValue(value.one_d) : first);
  if (row.secondParameter.id != 0)
    object.SetParameterById(row.secondParameter.id, other);
}

void ExportTracks(ExportContext& context, HostCalls& host, AEGP_StreamRefH stream, const ValueStream& row,
                  const StreamSampling& sampling)
{
  BaseObject* object = context.object;
  if (row.mode == SampleMode::kColor) {
    VectorTracks tracks(object, row.parameter.id, kColorTrackNames);
    if (tracks)
      SampleStream(context, host, stream, tracks.All(), sampling);
    return;
  }
  const bool two = row.secondParameter.id != 0;
  SampledTrack tracks[] = {{object, row.parameter.id, row.parameter.trackName},
                           {two ? object : nullptr, row.secondParameter.id, row.secondParameter.trackName}};
  if (!two || tracks[1])
    SampleStream(context, host, stream, {tracks, two ? 2U : 1U}, sampling);
}

} // namespace

void ExportValueStream(ExportContext& context, HostCalls& host, const ValueStream& row, Real width)
{
  const bool hasSecond = row.secondStream != AEGP_LayerStream_NONE;
  HostStream stream;
  HostStream second;
  stream.Open(host, context.layer, row.stream);
  if (hasSecond)
    second.Open(host, context.layer, row.secondStream);
  if (!stream || (hasSecond && !second))
    return;
  const StreamSampling sampling = {
      .mode = row.mode, .divisor = row.divisor, .secondStream = second.Get(), .width = width};
  AEGP_StreamVal2 value = {};
  AEGP_StreamVal2 secondValue = {};
  bool read = ReadStream(host, stream.Get(), context.workAreaStart, value);
  if (hasSecond)
    read = ReadStream(host, second.Get(), context.workAreaStart, secondValue);
  if (read)
    SetFirstValue(context, row, sampling, value, secondValue);
  if (row.mode == SampleMode::kColor) {
    AEGP_StreamType type = 0;
    host(&AEGP_StreamSuite9::AEGP_GetStreamType, stream.Get(), &type); // only its failure counts
  }
  if (row.mode != SampleMode::kSwitch) {
    const bool firstVaries = StreamVaries(host, stream.Get()) > 0;
    const bool secondVaries = StreamVaries(host, second.Get()) > 0;
    if (firstVaries || secondVaries)
      ExportTracks(context, host, stream.Get(), row, sampling);
  }
  stream.Dispose(host);
  second.Dispose(host);
}

} // namespace exporter
