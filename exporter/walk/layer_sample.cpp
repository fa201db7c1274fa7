#include "exporter/walk/layer_sample.h"

namespace exporter
{

namespace
{

void ReadNumber(HostCalls& host, const HostStream& stream, const A_Time& time, Real& number)
{
  AEGP_StreamVal2 value;
  if (ReadStream(host, stream.Get(), time, value))
    number = value.one_d;
}

void ReadVector(HostCalls& host, const HostStream& stream, const A_Time& time, Vector& vector)
{
  AEGP_StreamVal2 value;
  if (ReadStream(host, stream.Get(), time, value))
    vector = ToVector(value.three_d);
}

} // namespace

bool ReadRotation(HostCalls& host, const ExportContext& context, const A_Time& time, LayerSample& sample)
{
  ReadNumber(host, context.rotateXStream, time, sample.rotateX);
  ReadNumber(host, context.rotateYStream, time, sample.rotateY);
  ReadNumber(host, context.rotateZStream, time, sample.rotateZ);
  ReadVector(host, context.orientationStream, time, sample.orientation);
  return host.Good();
}

bool ReadLayerSample(HostCalls& host, const ExportContext& context, const HostStream& anchorStream,
                     const HostStream& scaleStream, const A_Time& time, const TransformRules& rules,
                     LayerSample& sample)
{
  ReadVector(host, context.positionStream, time, sample.position);
  ReadRotation(host, context, time, sample);
  if (anchorStream)
    ReadVector(host, anchorStream, time, sample.anchor);
  if (scaleStream && rules.useScale)
    ReadVector(host, scaleStream, time, sample.scale);
  return host.Good();
}

} // namespace exporter
